// Messages on standard error, one line each, the severity and the category first:
//
//   ERROR:DesignEntry: Internal GetSpdKeyValue() error -- keyword is empty
//
// The text can hold what a script passed. A line break in it must not look like the end of
// the message, so all control characters are shown escaped.
//
// Tested by message_manager_test.cpp.
#include <cstdarg>
#include <cstdio>
#include <string>
#include <string_view>

#include "host/Port_MsgManData.h"
#include "host/bundled/port/ShownText.h"

namespace {

// The formatted text; the bare format where printf can make none, of 2 GiB for example.
[[gnu::format(printf, 1, 0)]] std::string Format(const char* format, va_list arguments) {
  va_list again;
  va_copy(again, arguments);
  const int length = std::vsnprintf(nullptr, 0, format, arguments);
  std::string text;
  if (length < 0) {
    text = format;
  } else {
    text.resize(static_cast<std::size_t>(length));
    std::vsnprintf(text.data(), text.size() + 1, format, again);
  }
  va_end(again);
  return text;
}

class StandardErrorMessage final : public Port_MsgManData {
 public:
  explicit StandardErrorMessage(const char* category) : category_(category) {}

  [[gnu::format(printf, 2, 3)]] void issueError(const char* format, ...) override {
    va_list arguments;
    va_start(arguments, format);
    const std::string text = Format(format, arguments);
    va_end(arguments);
    Write("ERROR:", text);
  }

 private:
  void Write(std::string_view severity, std::string_view text) const {
    if (text.ends_with('\n')) text.remove_suffix(1);
    std::string line(severity);
    if (category_ != nullptr) line += Port::Escaped(category_);
    line += ": ";
    line += Port::Escaped(text);
    line += '\n';
    // One write, so that lines of several processes on one terminal do not mix.
    std::fwrite(line.data(), 1, line.size(), stderr);
  }

  const char* category_;
};

}  // namespace

Port_MsgManData::~Port_MsgManData() = default;

std::unique_ptr<Port_MsgManData> Port_MsgManData::createObject(const char* category,
                                                               const char* /*source*/, int /*line*/,
                                                               const char* /*revision*/) {
  return std::make_unique<StandardErrorMessage>(category);
}
