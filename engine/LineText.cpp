#include "engine/LineText.h"

#include <charconv>
#include <cstddef>
#include <cstring>
#include <system_error>

#include "engine/FixedText.h"

namespace Ip {

namespace {

// A line on its way. Null as a position is a line that has failed.
class Line {
 public:
  Line(char* to, const char* end) : to_(to), end_(end) {}

  char* to() const { return to_; }

  void Add(const char* text, std::size_t size) {
    if (!HasRoom(size)) return;
    std::memcpy(to_, text, size);
    to_ += size;
  }

  template <typename Whole>
  void Add(Whole number) {
    if (!HasRoom(kLongestFixed)) return;
    to_ = std::to_chars(to_, to_ + kLongestFixed, number).ptr;
  }

  void Add(double number, char* (*write)(double, char*)) {
    if (HasRoom(kLongestFixed)) to_ = write(number, to_);
  }

  void Fail() { to_ = nullptr; }

 private:
  bool HasRoom(std::size_t size) {
    if (to_ != nullptr && static_cast<std::size_t>(end_ - to_) < size) Fail();
    return to_ != nullptr;
  }

  char* to_;
  const char* end_;
};

// The length of "N.3f" at the beginning of a format, with N from 1 to 5; 0 when it begins
// otherwise. Three decimals make five characters at least, so no such width adds blanks.
std::size_t ThreeDecimals(const char* format) {
  const bool is = format[0] >= '1' && format[0] <= '5' && format[1] == '.' && format[2] == '3' &&
                  format[3] == 'f';
  return is ? 4 : 0;
}

}  // namespace

char* WriteLine(char* to, const char* end, const char* format, std::va_list arguments) {
  Line line(to, end);
  while (line.to() != nullptr) {
    const std::size_t plain = std::strcspn(format, "%");
    line.Add(format, plain);
    format += plain;
    if (*format == '\0') return line.to();
    ++format;
    if (const std::size_t length = ThreeDecimals(format); length != 0) {
      line.Add(va_arg(arguments, double), WriteFixed3);
      format += length;
      continue;
    }
    switch (*format++) {
      case 'f': line.Add(va_arg(arguments, double), WriteFixed6); break;
      case 'd': line.Add(va_arg(arguments, int)); break;
      case 'u': line.Add(va_arg(arguments, unsigned)); break;
      case 's': {
        const char* const text = va_arg(arguments, const char*);
        line.Add(text, std::strlen(text));
        break;
      }
      case 'c': {
        const char letter = static_cast<char>(va_arg(arguments, int));
        line.Add(&letter, 1);
        break;
      }
      default: line.Fail(); break;
    }
  }
  return nullptr;
}

}  // namespace Ip
