// Requests from the values of a file, JSON or TOML (see RequestJson.h for the entries), or from
// what a script has said.
//
// Tested by request_json_test.cpp, request_toml_test.cpp and request_tcl_test.cpp.
#ifndef VORKEL_PLANNER_READ_REQUESTTREE_H_
#define VORKEL_PLANNER_READ_REQUESTTREE_H_

#include <string_view>

#include "planner/read/Draft.h"
#include "planner/read/Tree.h"

namespace planner::read {

// How places name the entries: a script has a command `input` for each of the inputs, and options
// with a dash, and tells no columns.
enum class Naming { kEntries, kCommands };

Draft ReadTree(const Node& root, std::string_view file, Naming naming, Mistakes* mistakes);

}  // namespace planner::read

#endif  // VORKEL_PLANNER_READ_REQUESTTREE_H_
