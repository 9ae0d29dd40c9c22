// The letters of a text in UTF-8.
#ifndef VORKEL_PLANNER_READ_LETTERS_H_
#define VORKEL_PLANNER_READ_LETTERS_H_

#include <cstddef>
#include <string_view>

namespace planner::read {

struct Letter {
  char32_t code = 0;
  std::size_t size = 1;  // bytes
  bool is_valid = true;  // false: the byte is no letter in UTF-8, and stands for itself
};

// The letter that begins at a place in a text, which is not its end.
inline Letter LetterAt(std::string_view text, std::size_t place) {
  const auto byte = [&](std::size_t i) { return static_cast<unsigned char>(text[i]); };
  const unsigned char first = byte(place);
  if (first < 0x80) return {first, 1, true};
  const Letter invalid{first, 1, false};
  const std::size_t size = first >= 0xf0 ? 4 : first >= 0xe0 ? 3 : 2;
  if (first < 0xc2 || first > 0xf4 || place + size > text.size()) return invalid;
  char32_t code = first & (0xff >> (size + 1));
  for (std::size_t i = 1; i < size; ++i) {
    if ((byte(place + i) & 0xc0) != 0x80) return invalid;
    code = code << 6 | (byte(place + i) & 0x3f);
  }
  constexpr char32_t kSmallest[] = {0x80, 0x800, 0x10000};
  if (code < kSmallest[size - 2] || code > 0x10ffff || (code >= 0xd800 && code < 0xe000)) {
    return invalid;
  }
  return {code, size, true};
}

inline bool IsUtf8(std::string_view text) {
  for (std::size_t place = 0; place < text.size();) {
    const Letter letter = LetterAt(text, place);
    if (!letter.is_valid) return false;
    place += letter.size;
  }
  return true;
}

// How many letters a text has; a byte that is none counts as one.
inline std::size_t LetterCount(std::string_view text) {
  std::size_t count = 0;
  for (std::size_t place = 0; place < text.size(); ++count) place += LetterAt(text, place).size;
  return count;
}

inline bool IsBlank(char letter) { return letter == ' ' || (letter >= '\t' && letter <= '\r'); }

// The text without blanks at its ends.
inline std::string_view Trimmed(std::string_view text) {
  while (!text.empty() && IsBlank(text.front())) text.remove_prefix(1);
  while (!text.empty() && IsBlank(text.back())) text.remove_suffix(1);
  return text;
}

// ASCII letters only, whatever the locale.
constexpr char Lower(char letter) {
  return letter >= 'A' && letter <= 'Z' ? static_cast<char>(letter + ('a' - 'A')) : letter;
}
inline bool IsDigit(char letter) { return letter >= '0' && letter <= '9'; }

// Whether two texts are the same in any case.
inline bool IsSameWord(std::string_view one, std::string_view other) {
  if (one.size() != other.size()) return false;
  for (std::size_t i = 0; i < one.size(); ++i) {
    if (Lower(one[i]) != Lower(other[i])) return false;
  }
  return true;
}

}  // namespace planner::read

#endif  // VORKEL_PLANNER_READ_LETTERS_H_
