// Tested by trace_test.cpp.
#include "engine/Trace.h"

#include <cerrno>
#include <cstdarg>
#include <cstdio>
#include <system_error>

#include "engine/CLocale.h"
#include "engine/Messages.h"

namespace Ip {

Trace::~Trace() {
  if (!on_) return;
  if (error_ == 0 && std::fflush(stdout) != 0) error_ = errno;
  if (error_ == 0) return;
  try {
    Message()->issueError("Internal trace error -- could not write to standard output: %s\n",
                          std::generic_category().message(error_).c_str());
  } catch (...) {
    // No memory for the message: there is nobody else to tell.
  }
}

void Trace::Print(const char* format, ...) const {
  if (error_ != 0) return;
  const CLocale cLocale;
  std::va_list arguments;
  va_start(arguments, format);
  if (std::vprintf(format, arguments) < 0) error_ = errno;
  va_end(arguments);
}

}  // namespace Ip
