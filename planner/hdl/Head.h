// The comment at the head of what is generated.
#ifndef VORKEL_PLANNER_HDL_HEAD_H_
#define VORKEL_PLANNER_HDL_HEAD_H_

#include <string>
#include <string_view>

#include "planner/Answer.h"
#include "planner/Device.h"
#include "planner/Request.h"

namespace planner::hdl {

// Lines of comment, `mark` ("//", "--") before each of the text.
std::string Comment(std::string_view mark, std::string_view text);

// What a file is (`title`, a sentence), the request as a request file has it, and the report on the
// answer: settings, figures, errors and what is off.
std::string Head(std::string_view mark, const std::string& title, const Request& request,
                 const Device& device, const Answer& answer);

}  // namespace planner::hdl

#endif  // VORKEL_PLANNER_HDL_HEAD_H_
