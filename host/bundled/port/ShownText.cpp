#include "host/bundled/port/ShownText.h"

#include <cstdio>

namespace Port {
namespace {

unsigned char ByteAt(std::string_view text, std::size_t index) {
  return index < text.size() ? static_cast<unsigned char>(text[index]) : 0;
}

bool IsContinuation(unsigned char byte) { return (byte & 0xc0) == 0x80; }

// How many bytes the letter has that begins at the index; 1 where none of several bytes does.
std::size_t LetterSize(std::string_view text, std::size_t index) {
  const unsigned char first = ByteAt(text, index);
  const std::size_t size = first >= 0xf0 ? 4 : first >= 0xe0 ? 3 : first >= 0xc2 ? 2 : 1;
  for (std::size_t i = 1; i < size; ++i) {
    if (!IsContinuation(ByteAt(text, index + i))) return 1;
  }
  return size;
}

// The number of a letter of one, two or three bytes; 0xff, which moves nothing, of a longer one.
char32_t NumberOf(std::string_view letter) {
  const auto bits = [&](std::size_t i) { return char32_t{ByteAt(letter, i)} & 0x3f; };
  switch (letter.size()) {
    case 1: return ByteAt(letter, 0);
    case 2: return (bits(0) & 0x1f) << 6 | bits(1);
    case 3: return (bits(0) & 0x0f) << 12 | bits(1) << 6 | bits(2);
    default: return 0xff;
  }
}

void AppendNumber(char32_t number, std::string* line) {
  switch (number) {
    case '\n':
      *line += "\\n";
      return;
    case '\r':
      *line += "\\r";
      return;
    case '\t':
      *line += "\\t";
      return;
    default:
      char text[12];
      std::snprintf(text, sizeof text, number < 0x100 ? "\\x%02x" : "\\u%04x",
                    static_cast<unsigned>(number));
      *line += text;
  }
}

}  // namespace

std::string Escaped(std::string_view text) {
  std::string line;
  for (std::size_t i = 0; i < text.size();) {
    const std::string_view letter = text.substr(i, LetterSize(text, i));
    const char32_t number = NumberOf(letter);
    if (MovesText(number)) {
      AppendNumber(number, &line);
    } else {
      line += letter;
    }
    i += letter.size();
  }
  return line;
}

std::string Shown(std::string_view text, std::size_t most) {
  if (text.size() <= most) return Escaped(text);
  // Not in the middle of a letter, which has up to three bytes behind the first.
  std::size_t end = most;
  for (int i = 0; i < 3 && end > 0 && IsContinuation(ByteAt(text, end)); ++i) --end;
  return Escaped(text.substr(0, end)) + "...";
}

}  // namespace Port
