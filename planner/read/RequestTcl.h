// Requests in Tcl, as the program cli/tcl_request.tcl has read them: it answers what a script says
// as JSON, with the line of each entry, or what is wrong with the script.
//
// Tested by request_tcl_test.cpp.
#ifndef VORKEL_PLANNER_READ_REQUESTTCL_H_
#define VORKEL_PLANNER_READ_REQUESTTCL_H_

#include <string_view>

#include "planner/read/Draft.h"

namespace planner::read {

// `answer` is that of the program, `file` names the script in places. Throws std::invalid_argument
// for an answer that the program does not give.
Draft ReadTclAnswer(std::string_view answer, std::string_view file, Mistakes* mistakes);

}  // namespace planner::read

#endif  // VORKEL_PLANNER_READ_REQUESTTCL_H_
