// Tested by requests.test.
#include "tcl/RequestTree.h"

#include <algorithm>
#include <array>
#include <cctype>
#include <string>
#include <string_view>
#include <vector>

#include "tcl/Failure.h"
#include "tcl/Objects.h"

namespace tcl {

namespace {

using planner::read::Node;
using planner::read::NodeType;
using std::string;

constexpr std::array<std::string_view, 6> kSwitches = {"exact",    "feedback", "prefer_max_vco",
                                                       "int_div0", "engine",   "any_order"};

Node TextNode(string text) {
  Node node;
  node.type = NodeType::kString;
  node.text = std::move(text);
  return node;
}

bool IsSwitch(std::string_view name) {
  return std::find(kSwitches.begin(), kSwitches.end(), name) != kSwitches.end();
}

// A unit that stands as a word behind its number: no number, and no "-" of an unused output.
bool IsUnit(const string& word) {
  return !word.empty() && (std::isalpha(static_cast<unsigned char>(word[0])) != 0 ||
                           word[0] == '%' || (static_cast<unsigned char>(word[0]) & 0x80U) != 0);
}

// The entries of a list of values.
std::vector<string> Values(Tcl_Obj* object) {
  const string text = Text(object);
  const auto items = List(object);
  if (!items || text.find(',') != string::npos) return {text};
  std::vector<string> values;
  for (Tcl_Obj* const item : *items) {
    const string word = Text(item);
    if (IsUnit(word) && !values.empty()) {
      values.back() += " " + word;
    } else {
      values.push_back(word);
    }
  }
  return values;
}

// "27, 50" is a list of two, as in options.
std::vector<string> Separated(const std::vector<string>& values) {
  std::vector<string> all;
  for (const string& value : values) {
    for (std::size_t start = 0;;) {
      const std::size_t comma = value.find(',', start);
      all.push_back(value.substr(start, comma - start));
      if (comma == string::npos) break;
      start = comma + 1;
    }
  }
  return all;
}

Node ObjectOf(Tcl_Obj* dict);

// An output: a dict when its first word is the name of an entry.
Node OutputOf(Tcl_Obj* object) {
  const auto items = List(object);
  if (!items || items->size() < 2 || items->size() % 2 != 0 || !IsUnit(Text(items->front()))) {
    return TextNode(Text(object));
  }
  return ObjectOf(object);
}

// A list of outputs without braces can end in a unit, or be one output with its unit.
Node OutputsOf(Tcl_Obj* object) {
  Node node;
  node.type = NodeType::kArray;
  const auto items = List(object);
  const bool has_dicts = items && std::any_of(items->begin(), items->end(), [](Tcl_Obj* item) {
                           return OutputOf(item).type == NodeType::kObject;
                         });
  if (has_dicts) {
    for (Tcl_Obj* const item : *items) node.items.push_back(OutputOf(item));
  } else {
    for (string& value : Separated(Values(object))) node.items.push_back(TextNode(value));
  }
  return node;
}

Node ListNode(Tcl_Obj* object) {
  Node node;
  node.type = NodeType::kArray;
  for (string& value : Separated(Values(object))) node.items.push_back(TextNode(value));
  return node;
}

Node ValueOf(const string& name, Tcl_Obj* object) {
  if (name == "inputs") return ListNode(object);
  if (name == "outputs") return OutputsOf(object);
  if (!IsSwitch(name)) return TextNode(Text(object));
  const auto truth = Boolean(object);
  if (!truth) return TextNode(Text(object));
  Node node;
  node.type = NodeType::kBoolean;
  node.truth = *truth;
  return node;
}

Node ObjectOf(Tcl_Obj* dict) {
  Node node;
  node.type = NodeType::kObject;
  const auto entries = Dict(dict);
  for (const auto& [name, value] : *entries) {
    if (!Text(value).empty()) node.members.push_back({name, {}, ValueOf(name, value)});
  }
  return node;
}

}  // namespace

Node TreeOf(Tcl_Obj* request) {
  if (!Dict(request)) {
    throw Failure::OfUsage("no_dict", Text(request),
                           "the request is no dict, and no option: \"" + Text(request) + "\"");
  }
  return ObjectOf(request);
}

string WithCommas(Tcl_Obj* list) {
  string text;
  for (const string& value : Values(list)) text += (text.empty() ? "" : ",") + value;
  return text;
}

}  // namespace tcl
