// Answers in the formats that the commands share: all but text.
//
// Tested by formats.test.
#ifndef VORKEL_CLI_FORMATS_H_
#define VORKEL_CLI_FORMATS_H_

#include <string>
#include <vector>

#include "cli/Call.h"
#include "planner/Answer.h"
#include "planner/report/Json.h"

namespace cli {

// An answer in a format for a design: SDC, or one of Hdl.h. Throws Failure as HdlText does.
std::string DesignText(const Call& call, const planner::Answer& answer);

// Answers as JSON or a Tcl dict, or one of them in a format for a design. `front_cut` is that of
// the plan that they are of.
std::string InFormat(const Call& call, const std::vector<planner::report::Entry>& entries,
                     const planner::Answer& answer,
                     const std::vector<planner::Primitive>& front_cut = {});

}  // namespace cli

#endif  // VORKEL_CLI_FORMATS_H_
