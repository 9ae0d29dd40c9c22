#include "host/bundled/device/FigureText.h"

namespace Device {
namespace {

// A mark of the encoding at the beginning of a text, which has no column.
constexpr std::string_view kByteOrderMark = "\xEF\xBB\xBF";

// A column is a character, which begins with any byte but 10xxxxxx.
bool BeginsCharacter(char byte) { return (static_cast<unsigned char>(byte) & 0xC0) != 0x80; }

}  // namespace

FigureText::FigureText(std::string_view text) : text_(text) {
  if (text_.starts_with(kByteOrderMark)) text_.remove_prefix(kByteOrderMark.size());
  lines_.push_back(0);
  for (std::size_t i = 0; i < text_.size(); ++i) {
    if (text_[i] == '\n') lines_.push_back(i + 1);
  }
}

std::string_view FigureText::From(SourcePosition position) const {
  if (position.line < 1 || position.line > lines_.size()) return {};
  std::string_view rest = text_.substr(lines_[position.line - 1]);
  // In front of the first character that begins in that column.
  unsigned column = 0;
  for (std::size_t i = 0; i < rest.size(); ++i) {
    if (BeginsCharacter(rest[i]) && ++column == position.column) return rest.substr(i);
  }
  return {};
}

std::string FigureText::DecimalAt(SourcePosition position) const {
  std::string decimal;
  for (const char c : From(position)) {
    if ((c >= '0' && c <= '9') || c == '.' || c == '-') {
      decimal += c;
    } else if (c == 'e' || c == 'E') {
      decimal += 'e';
    } else if (c != '_' && c != '+') {
      break;
    }
  }
  return decimal;
}

}  // namespace Device
