// The values of a file with their places: what JSON and TOML have in common.
#ifndef VORKEL_PLANNER_READ_TREE_H_
#define VORKEL_PLANNER_READ_TREE_H_

#include <string>
#include <string_view>
#include <vector>

namespace planner::read {

enum class NodeType { kObject, kArray, kString, kNumber, kBoolean, kNull, kDate };

// As mistakes name it.
constexpr std::string_view Name(NodeType type) {
  switch (type) {
    case NodeType::kObject:
      return "object";
    case NodeType::kArray:
      return "array";
    case NodeType::kString:
      return "string";
    case NodeType::kNumber:
      return "number";
    case NodeType::kBoolean:
      return "boolean";
    case NodeType::kNull:
      return "null";
    case NodeType::kDate:
      break;
  }
  return "date";
}

// Line and column from 1; columns are counted in letters.
struct Position {
  int line = 1;
  int column = 1;
  bool operator==(const Position&) const = default;
};

struct Member;

struct Node {
  NodeType type = NodeType::kNull;
  Position position;
  std::string text;             // of a string; of a number as it is written
  bool truth = false;           // of a boolean
  std::vector<Member> members;  // of an object, as they follow each other, each name once
  std::vector<Node> items;      // of an array

  // Nothing when there is no such member.
  const Node* Find(std::string_view name) const;
};

struct Member {
  std::string name;
  Position position;  // of the name
  Node value;
};

inline const Node* Node::Find(std::string_view name) const {
  for (const Member& member : members) {
    if (member.name == name) return &member.value;
  }
  return nullptr;
}

}  // namespace planner::read

#endif  // VORKEL_PLANNER_READ_TREE_H_
