// How the text of a request is written.
//
// Tested by form_test.cpp.
#ifndef VORKEL_PLANNER_READ_FORM_H_
#define VORKEL_PLANNER_READ_FORM_H_

#include <string_view>

namespace planner::read {

enum class Form { kJson, kToml, kTcl };

// By the ending of the file's name, or else by how the text begins: a brace or a bracket is JSON,
// a name with an equals sign behind it TOML, all else Tcl.
Form FormOf(std::string_view name, std::string_view text);

}  // namespace planner::read

#endif  // VORKEL_PLANNER_READ_FORM_H_
