// Tested by request_tcl_test.cpp.
#include "planner/read/RequestTcl.h"

#include <cstddef>
#include <stdexcept>
#include <string>
#include <utility>

#include "planner/read/JsonTree.h"
#include "planner/read/RequestTree.h"

namespace planner::read {

namespace {

const Node& Need(const Node& object, std::string_view name, NodeType type) {
  const Node* node = object.Find(name);
  if (!node || node->type != type)
    throw std::invalid_argument("an answer without " + std::string(name));
  return *node;
}

int LineOf(const Node& node) {
  if (node.type != NodeType::kNumber) throw std::invalid_argument("an answer without a line");
  return std::stoi(node.text);
}

// The mistake that the script ends with.
Mistake ScriptMistake(const Node& error, std::string_view file) {
  Mistake mistake;
  mistake.kind = MistakeKind::kScript;
  mistake.place.file = file;
  mistake.place.line = LineOf(Need(error, "line", NodeType::kNumber));
  mistake.text = Need(error, "message", NodeType::kString).text;
  if (const Node* name = error.Find("name")) {
    mistake.other = name->text;
    for (const Node& command : Need(error, "commands", NodeType::kArray).items) {
      mistake.known.push_back(command.text);
    }
  }
  return mistake;
}

// A value and all in it are on a line of the script.
void Place(int line, Node* node) {
  node->position.line = line;
  for (Member& member : node->members) Place(line, &member.value);
}

// Gives each entry of a request the line of the script that says it; of lists the last one counts.
void PlaceAll(const Node& lines, Node* request) {
  for (Member& member : request->members) {
    const Node* line = lines.Find(member.name);
    if (!line) throw std::invalid_argument("an answer without the line of " + member.name);
    Node& value = member.value;
    if (value.type != NodeType::kArray) {
      Place(LineOf(*line), &value);
      continue;
    }
    if (value.items.empty() || line->items.size() != value.items.size()) {
      throw std::invalid_argument("an answer with other lines than " + member.name);
    }
    for (std::size_t i = 0; i < value.items.size(); ++i) {
      Place(LineOf(line->items[i]), &value.items[i]);
    }
    value.position.line = LineOf(line->items.back());
  }
}

}  // namespace

Draft ReadTclAnswer(std::string_view answer, std::string_view file, Mistakes* mistakes) {
  Mistakes ignored;
  const std::optional<Node> root = ReadJsonTree(answer, file, &ignored);
  if (!root) throw std::invalid_argument("an answer that is no JSON");
  if (const Node* error = root->Find("error")) {
    mistakes->push_back(ScriptMistake(*error, file));
    return {};
  }
  Node request = Need(*root, "request", NodeType::kObject);
  PlaceAll(Need(*root, "lines", NodeType::kObject), &request);
  return ReadTree(request, file, Naming::kCommands, mistakes);
}

}  // namespace planner::read
