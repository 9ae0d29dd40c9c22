#include "engine/Trace.h"

#include <cstdarg>
#include <cstdio>

namespace Ip {

Trace::~Trace() {
  if (on_) std::fflush(stdout);
}

void Trace::Print(const char* format, ...) const {
  std::va_list arguments;
  va_start(arguments, format);
  std::vprintf(format, arguments);
  va_end(arguments);
}

}  // namespace Ip
