// Tested by request_toml_test.cpp.
#include "planner/read/RequestToml.h"

#include <algorithm>
#include <cstddef>
#include <string>
#include <utility>
#include <vector>

#include "host/bundled/device/Toml.h"
#include "planner/read/Letters.h"
#include "planner/read/RequestTree.h"

namespace planner::read {

namespace {

// Each dot of a dotted name nests one table in another, and a reader that follows the nesting
// must not run out of stack.
constexpr std::ptrdiff_t kMostDots = 4096;

Position PositionOf(const toml::source_region& source) {
  return {static_cast<int>(source.begin.line), static_cast<int>(source.begin.column)};
}

// Turns what is parsed into nodes. Numbers are taken from the text: as doubles they would not be
// what their decimals say.
class Builder {
 public:
  explicit Builder(std::string_view text) {
    for (std::size_t end = 0; end != std::string_view::npos;) {
      end = text.find('\n');
      lines_.push_back(text.substr(0, end));
      if (end != std::string_view::npos) text.remove_prefix(end + 1);
    }
  }

  Node Of(const toml::node& node) const {
    Node result;
    result.position = PositionOf(node.source());
    if (const toml::table* table = node.as_table()) {
      result.type = NodeType::kObject;
      for (auto&& [key, value] : *table) {
        result.members.push_back({std::string(key.str()), PositionOf(key.source()), Of(value)});
      }
      // The table sorts by name.
      std::stable_sort(result.members.begin(), result.members.end(),
                       [](const Member& one, const Member& other) {
                         return std::pair(one.position.line, one.position.column) <
                                std::pair(other.position.line, other.position.column);
                       });
    } else if (const toml::array* array = node.as_array()) {
      result.type = NodeType::kArray;
      for (const toml::node& item : *array) result.items.push_back(Of(item));
    } else if (const auto* text = node.as_string()) {
      result.type = NodeType::kString;
      result.text = text->get();
    } else if (const auto* truth = node.as_boolean()) {
      result.type = NodeType::kBoolean;
      result.truth = truth->get();
    } else if (const auto* whole = node.as_integer()) {
      result.type = NodeType::kNumber;
      result.text = NumberAt(result.position, std::to_string(whole->get()));
    } else if (const auto* real = node.as_floating_point()) {
      result.type = NodeType::kNumber;
      result.text = NumberAt(result.position, std::to_string(real->get()));
    } else {
      result.type = NodeType::kDate;
    }
    return result;
  }

 private:
  // The number that is written at a place, without the underscores between its digits. `parsed`
  // is for 0x1f and its like, which are whole.
  std::string NumberAt(Position position, std::string parsed) const {
    const std::string_view line = lines_.at(static_cast<std::size_t>(position.line - 1));
    std::size_t begin = 0;
    for (int column = 1; column < position.column && begin < line.size(); ++column) {
      begin += LetterAt(line, begin).size;
    }
    const std::string_view rest = line.substr(begin);
    std::string number(rest.substr(0, rest.find_first_of(" \t\r,]}#")));
    std::erase(number, '_');
    const bool has_base =
        number.size() > 2 && number[0] == '0' && Lower(number[1]) >= 'a' && Lower(number[1]) != 'e';
    return has_base ? parsed : number;
  }

  std::vector<std::string_view> lines_;
};

Mistake SyntaxMistake(std::string_view file, Position position, std::string reason) {
  Mistake mistake;
  mistake.kind = MistakeKind::kSyntax;
  mistake.fault = SyntaxFault::kOther;
  mistake.place.file = file;
  mistake.place.line = position.line;
  mistake.place.column = position.column;
  mistake.other = std::move(reason);
  return mistake;
}

}  // namespace

Draft ReadToml(std::string_view text, std::string_view file, Mistakes* mistakes) {
  if (std::count(text.begin(), text.end(), '.') > kMostDots) {
    mistakes->push_back(SyntaxMistake(file, {1, 1}, "it has more dots than any request"));
    return {};
  }
  const toml::parse_result parsed = Device::ParseToml(text);
  if (!parsed) {
    const toml::parse_error& error = parsed.error();
    mistakes->push_back(
        SyntaxMistake(file, PositionOf(error.source()), std::string(error.description())));
    return {};
  }
  Node node = Builder(text).Of(parsed.table());
  node.position = {1, 1};
  return ReadTree(node, file, Naming::kEntries, mistakes);
}

}  // namespace planner::read
