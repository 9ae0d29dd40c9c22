// The formats verilog, vhdl and testbench.
//
// Tested by tests/hdl/names.test.
#ifndef VORKEL_CLI_HDL_H_
#define VORKEL_CLI_HDL_H_

#include <string>
#include <vector>

#include "cli/Call.h"
#include "planner/Answer.h"

namespace cli {

// What is wrong with the options --name and --language, which no other format takes.
std::vector<std::string> HdlMistakes(const Call& call);

// An answer in the format of the call, which is one of these. Throws Failure when its request
// cannot be written exactly.
std::string HdlText(const Call& call, const planner::Answer& answer);

}  // namespace cli

#endif  // VORKEL_CLI_HDL_H_
