#include "engine/Trace.h"

#include <algorithm>
#include <cstdarg>
#include <cstdio>
#include <string_view>

#include "engine/CLocale.h"
#include "engine/LineText.h"
#include "engine/StandardOutput.h"

namespace Ip {

namespace {

constinit thread_local int loss_of_last = kWritten;

// More than any line has: the largest double takes 316 characters, and no line has ten.
constexpr std::size_t kLongestLine = 4096;

// As printf writes it in the C locale; the number of characters.
std::size_t PrintLine(char* to, const char* format, std::va_list arguments) {
  const CLocale cLocale;
  const int length = std::vsnprintf(to, kLongestLine, format, arguments);
  return std::min(static_cast<std::size_t>(std::max(length, 0)), kLongestLine - 1);
}

}  // namespace

Trace::Trace(bool on) : on_(on) {
  if (on_) loss_of_last = kWritten;
}

Trace::~Trace() { Write(); }

int Trace::LossOfLast() { return loss_of_last; }

void Trace::Write() const {
  if (used_ == 0) return;
  loss_of_last = WriteToStandardOutput(std::string_view(block_.data(), used_));
  if (loss_of_last != kWritten) on_ = false;
  used_ = 0;
}

void Trace::Print(const char* format, ...) const {
  if (block_.size() - used_ < kLongestLine) Write();
  if (!on_) return;
  char* const line = block_.data() + used_;
  std::va_list arguments;
  va_start(arguments, format);
  const char* const end = WriteLine(line, line + kLongestLine, format, arguments);
  va_end(arguments);
  if (end != nullptr) {
    used_ += static_cast<std::size_t>(end - line);
    return;
  }
  va_start(arguments, format);
  used_ += PrintLine(line, format, arguments);
  va_end(arguments);
}

}  // namespace Ip
