// How data become a text in JSON.
//
// Tested by json_text_test.cpp.
#ifndef VORKEL_PLANNER_REPORT_JSONTEXT_H_
#define VORKEL_PLANNER_REPORT_JSONTEXT_H_

#include <nlohmann/json_fwd.hpp>
#include <string>

namespace planner::report {

// On one line, or with steps of `indent` blanks. Bytes that are no UTF-8, in a text of others, are
// replaced; letters that move the cursor of a terminal, or turn what follows, are written as their
// numbers.
std::string JsonText(const nlohmann::ordered_json& data, int indent = -1);

}  // namespace planner::report

#endif  // VORKEL_PLANNER_REPORT_JSONTEXT_H_
