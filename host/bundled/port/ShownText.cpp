#include "host/bundled/port/ShownText.h"

#include <cstdio>

namespace Port {
namespace {

unsigned char ByteAt(std::string_view text, std::size_t index) {
  return index < text.size() ? static_cast<unsigned char>(text[index]) : 0;
}

bool IsContinuation(unsigned char byte) { return (byte & 0xc0) == 0x80; }

// The control characters of ASCII, and those of 8 bits.
bool IsControl(unsigned char byte) { return byte < 0x20 || (byte >= 0x7f && byte < 0xa0); }

// Whether a letter of three bytes has no width, or turns what follows: U+200B to U+200F, U+2028 to
// U+202E, U+2060 to U+206F and U+FEFF.
bool TurnsText(std::string_view letter) {
  if (letter == "\xef\xbb\xbf") return true;
  const auto last = static_cast<unsigned char>(letter[2]);
  if (letter.starts_with("\xe2\x80")) {
    return (last >= 0x8b && last <= 0x8f) || (last >= 0xa8 && last <= 0xae);
  }
  return letter.starts_with("\xe2\x81") && last >= 0xa0 && last <= 0xaf;
}

// How many bytes the letter has that begins at the index; 1 where none of several bytes does.
std::size_t LetterSize(std::string_view text, std::size_t index) {
  const unsigned char first = ByteAt(text, index);
  const std::size_t size = first >= 0xf0 ? 4 : first >= 0xe0 ? 3 : first >= 0xc2 ? 2 : 1;
  for (std::size_t i = 1; i < size; ++i) {
    if (!IsContinuation(ByteAt(text, index + i))) return 1;
  }
  return size;
}

void AppendControl(unsigned char byte, std::string* line) {
  constexpr char kDigits[] = "0123456789abcdef";
  switch (byte) {
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
      *line += "\\x";
      *line += kDigits[byte >> 4];
      *line += kDigits[byte & 15];
  }
}

// Of a letter of three bytes.
void AppendNumber(std::string_view letter, std::string* line) {
  const unsigned number = (ByteAt(letter, 0) & 0x0fu) << 12 | (ByteAt(letter, 1) & 0x3fu) << 6 |
                          (ByteAt(letter, 2) & 0x3fu);
  char text[8];
  std::snprintf(text, sizeof text, "\\u%04x", number);
  *line += text;
}

}  // namespace

std::string Escaped(std::string_view text) {
  constexpr unsigned char kLeadOfControls = 0xc2;
  std::string line;
  for (std::size_t i = 0; i < text.size();) {
    const std::size_t size = LetterSize(text, i);
    const unsigned char last = ByteAt(text, i + size - 1);
    const bool may_control = size == 1 || (size == 2 && ByteAt(text, i) == kLeadOfControls);
    if (may_control && IsControl(last)) {
      AppendControl(last, &line);
    } else if (size == 3 && TurnsText(text.substr(i, size))) {
      AppendNumber(text.substr(i, size), &line);
    } else {
      line += text.substr(i, size);
    }
    i += size;
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
