// Requests from the values of a file, JSON or TOML (see RequestJson.h for the entries).
//
// Tested by request_json_test.cpp and request_toml_test.cpp.
#ifndef VORKEL_PLANNER_READ_REQUESTTREE_H_
#define VORKEL_PLANNER_READ_REQUESTTREE_H_

#include <string_view>

#include "planner/read/Draft.h"
#include "planner/read/Tree.h"

namespace planner::read {

Draft ReadTree(const Node& root, std::string_view file, Mistakes* mistakes);

}  // namespace planner::read

#endif  // VORKEL_PLANNER_READ_REQUESTTREE_H_
