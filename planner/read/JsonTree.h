// JSON (RFC 8259) as a tree with places.
//
// Readers of JSON as values tell neither where a value stands nor how a number is written, and of
// a mistake only a sentence. This one keeps all of it, for files of some pages.
//
// Tested by json_tree_test.cpp.
#ifndef VORKEL_PLANNER_READ_JSONTREE_H_
#define VORKEL_PLANNER_READ_JSONTREE_H_

#include <optional>
#include <string>
#include <string_view>

#include "planner/read/Mistake.h"
#include "planner/read/Tree.h"

namespace planner::read {

// The value that a text is. Of a text that is no JSON, or has a name twice in an object, the
// first mistake (kSyntax) is added, and there is none. A mark of the encoding may come first.
std::optional<Node> ReadJsonTree(std::string_view text, std::string_view file, Mistakes* mistakes);

}  // namespace planner::read

#endif  // VORKEL_PLANNER_READ_JSONTREE_H_
