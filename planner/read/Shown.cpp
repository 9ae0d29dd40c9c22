// Tested by shown_test.cpp.
#include "planner/read/Shown.h"

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <numeric>

#include "host/bundled/port/ShownText.h"
#include "planner/read/Letters.h"

namespace planner::read {

namespace {

void AppendHex(std::uint32_t value, int digits, std::string* text) {
  constexpr std::string_view kDigits = "0123456789abcdef";
  for (int shift = 4 * (digits - 1); shift >= 0; shift -= 4) {
    *text += kDigits[(value >> shift) & 15];
  }
}

std::string Escaped(std::string_view text, std::size_t most) {
  std::string shown;
  std::size_t count = 0;
  for (std::size_t place = 0; place < text.size(); ++count) {
    if (count == most) return shown + "...";
    const Letter letter = LetterAt(text, place);
    if (!letter.is_valid) {
      shown += "\\x";
      AppendHex(static_cast<unsigned char>(text[place]), 2, &shown);
    } else if (Port::MovesText(letter.code)) {
      const bool is_short = letter.code < 0x100;
      shown += is_short ? "\\x" : "\\u";
      AppendHex(letter.code, is_short ? 2 : 4, &shown);
    } else {
      shown += text.substr(place, letter.size);
    }
    place += letter.size;
  }
  return shown;
}

std::size_t Distance(std::string_view one, std::string_view other) {
  // Rows of the table of distances between beginnings of the two: this one and the two above.
  std::vector<std::size_t> row(other.size() + 1), above, next(other.size() + 1);
  std::iota(row.begin(), row.end(), std::size_t{0});
  for (std::size_t i = 0; i < one.size(); ++i) {
    next[0] = i + 1;
    for (std::size_t j = 0; j < other.size(); ++j) {
      const std::size_t changed = row[j] + (one[i] == other[j] ? 0 : 1);
      next[j + 1] = std::min({changed, row[j + 1] + 1, next[j] + 1});
      if (i > 0 && j > 0 && one[i] == other[j - 1] && one[i - 1] == other[j]) {
        next[j + 1] = std::min(next[j + 1], above[j - 1] + 1);
      }
    }
    above = row;
    row = next;
  }
  return row.back();
}

}  // namespace

std::string Shown(std::string_view text, std::size_t most) { return Escaped(text, most); }
std::string ShownWhole(std::string_view text) { return Escaped(text, text.size()); }

std::string Enumerated(std::span<const std::string> names, std::string_view last) {
  std::string text;
  for (std::size_t i = 0; i < names.size(); ++i) {
    if (i > 0 && i + 1 == names.size()) {
      text.append(" ").append(last).append(" ");
    } else if (i > 0) {
      text += ", ";
    }
    text += names[i];
  }
  return text;
}

std::string Nearest(std::string_view name, std::span<const std::string> names) {
  if (name.size() > kMostShown) return "";
  std::size_t least = name.size() > 8 ? 3 : name.size() > 2 ? 2 : 0;
  std::string nearest;
  for (const std::string& candidate : names) {
    const std::size_t distance = Distance(name, candidate);
    if (distance < least) {
      least = distance;
      nearest = candidate;
    }
  }
  return nearest;
}

std::string DidYouMean(std::string_view name, std::span<const std::string> names) {
  const std::string nearest = Nearest(name, names);
  return nearest.empty() ? "" : "; did you mean " + nearest + "?";
}

}  // namespace planner::read
