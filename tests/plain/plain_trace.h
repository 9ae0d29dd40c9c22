// Trace sink of the plain solvers: a text that grows by printf-style lines.

#ifndef TESTS_PLAIN_PLAIN_TRACE_H_
#define TESTS_PLAIN_PLAIN_TRACE_H_

#include <cstdarg>
#include <cstdio>
#include <string>

namespace plain {

// Collects the trace of a run. A sink that is off makes no text, so that long searches which
// nobody looks at stay cheap.
class Trace {
 public:
  explicit Trace(bool on) : on_(on) {}

  bool On() const { return on_; }
  const std::string& Text() const { return text_; }
  void Clear() { text_.clear(); }

  // Appends the formatted text; does nothing when the sink is off.
  [[gnu::format(printf, 2, 3)]] void Print(const char* format, ...) {
    if (!on_) return;
    std::va_list arguments;
    va_start(arguments, format);
    std::va_list second;
    va_copy(second, arguments);
    const int length = std::vsnprintf(nullptr, 0, format, arguments);
    va_end(arguments);
    if (length > 0) {
      const std::size_t old_size = text_.size();
      const std::size_t added = static_cast<std::size_t>(length);
      // One place more than the text: vsnprintf writes a closing zero.
      text_.resize(old_size + added + 1);
      std::vsnprintf(text_.data() + old_size, added + 1, format, second);
      text_.resize(old_size + added);
    }
    va_end(second);
  }

 private:
  bool on_;
  std::string text_;
};

}  // namespace plain

#endif  // TESTS_PLAIN_PLAIN_TRACE_H_
