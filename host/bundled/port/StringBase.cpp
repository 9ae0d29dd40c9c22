// Tested by string_base_test.cpp.
#include <algorithm>

#include "host/Port_StringBase.h"

namespace Port {
namespace {

unsigned char FoldCase(char c) {
  const auto byte = static_cast<unsigned char>(c);
  return byte >= 'A' && byte <= 'Z' ? static_cast<unsigned char>(byte - 'A' + 'a') : byte;
}

int CompareFolded(std::string_view a, std::string_view b) {
  const std::size_t common = std::min(a.size(), b.size());
  for (std::size_t i = 0; i < common; ++i) {
    const int difference = FoldCase(a[i]) - FoldCase(b[i]);
    if (difference != 0) return difference;
  }
  if (a.size() == b.size()) return 0;
  return a.size() < b.size() ? -1 : 1;
}

}  // namespace

int StringBase::Compare(std::string_view other, CompareType type) const {
  return type == CompareType::kExact ? View().compare(other) : CompareFolded(View(), other);
}

bool StringBase::NextTokenRange(std::string_view separators, std::size_t* position,
                                std::size_t* begin, std::size_t* end) const {
  const std::size_t first = text_.find_first_not_of(separators, *position);
  if (first == std::string::npos) return false;
  const std::size_t behind = std::min(text_.find_first_of(separators, first), text_.size());
  *begin = first;
  *end = behind;
  *position = behind;
  return true;
}

StringBase StringBase::Substring(std::size_t begin, std::size_t end) const {
  const std::size_t last = std::min(end, text_.size());
  if (begin >= last) return StringBase();
  return StringBase(View().substr(begin, last - begin));
}

void StringBase::Trim(std::string_view set, TrimMode mode) {
  if (mode != TrimMode::kLeading) text_.erase(text_.find_last_not_of(set) + 1);
  if (mode != TrimMode::kTrailing) text_.erase(0, text_.find_first_not_of(set));
}

}  // namespace Port
