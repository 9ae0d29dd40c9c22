// Tested by request_json_test.cpp.
#include "planner/read/RequestJson.h"

#include "planner/read/JsonTree.h"
#include "planner/read/RequestTree.h"

namespace planner::read {

Draft ReadJson(std::string_view text, std::string_view file, Mistakes* mistakes) {
  const std::optional<Node> root = ReadJsonTree(text, file, mistakes);
  return root ? ReadTree(*root, file, Naming::kEntries, mistakes) : Draft{};
}

}  // namespace planner::read
