// Tested by form_test.cpp.
#include "planner/read/Form.h"

#include <algorithm>
#include <cstddef>

#include "planner/read/Letters.h"

namespace planner::read {

namespace {

bool HasEnding(std::string_view name, std::string_view ending) {
  return name.size() > ending.size() &&
         IsSameWord(name.substr(name.size() - ending.size()), ending);
}

// The text from its first line on that is neither empty nor a comment.
std::string_view Beginning(std::string_view text) {
  constexpr std::string_view kEncodingMark = "\xef\xbb\xbf";
  if (text.substr(0, kEncodingMark.size()) == kEncodingMark) {
    text.remove_prefix(kEncodingMark.size());
  }
  for (;;) {
    while (!text.empty() && IsBlank(text.front())) text.remove_prefix(1);
    if (text.empty() || text.front() != '#') return text;
    text.remove_prefix(std::min(text.find('\n'), text.size()));
  }
}

bool IsNameAndEquals(std::string_view text) {
  std::size_t place = 0;
  while (place < text.size() && (IsDigit(text[place]) || text[place] == '_' || text[place] == '-' ||
                                 (Lower(text[place]) >= 'a' && Lower(text[place]) <= 'z'))) {
    ++place;
  }
  if (place == 0) return false;
  while (place < text.size() && (text[place] == ' ' || text[place] == '\t')) ++place;
  return place < text.size() && text[place] == '=';
}

}  // namespace

Form FormOf(std::string_view name, std::string_view text) {
  if (HasEnding(name, ".json")) return Form::kJson;
  if (HasEnding(name, ".toml")) return Form::kToml;
  if (HasEnding(name, ".tcl")) return Form::kTcl;
  const std::string_view beginning = Beginning(text);
  if (!beginning.empty() && (beginning.front() == '{' || beginning.front() == '[')) {
    return Form::kJson;
  }
  return IsNameAndEquals(beginning) ? Form::kToml : Form::kTcl;
}

}  // namespace planner::read
