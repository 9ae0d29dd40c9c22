// An explanation as text. The first three lines answer: whether it is possible, what is in the way,
// and what comes nearest. Below them stands what each primitive has to say.
//
// Tested by explain_text_test.cpp.
#ifndef VORKEL_PLANNER_REPORT_EXPLAINTEXT_H_
#define VORKEL_PLANNER_REPORT_EXPLAINTEXT_H_

#include <string>

#include "planner/Device.h"
#include "planner/explain/Explain.h"
#include "planner/report/Style.h"

namespace planner::report {

// `own_inputs` tells that the user has named the input clocks that were tried.
std::string ExplainText(const explain::Explanation& explanation, const Device& device,
                        const Style& style, const Calls& calls, bool own_inputs);

// The same as data: JSON, or a Tcl dict.
std::string ExplainJson(const explain::Explanation& explanation, const Device& device);
std::string ExplainTcl(const explain::Explanation& explanation, const Device& device);

}  // namespace planner::report

#endif  // VORKEL_PLANNER_REPORT_EXPLAINTEXT_H_
