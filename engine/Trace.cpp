#include "engine/Trace.h"

#include <cstdarg>
#include <cstdio>

#include "engine/CLocale.h"

namespace Ip {

Trace::~Trace() {
  if (on_) std::fflush(stdout);
}

void Trace::Print(const char* format, ...) const {
  const CLocale cLocale;
  std::va_list arguments;
  va_start(arguments, format);
  std::vprintf(format, arguments);
  va_end(arguments);
}

}  // namespace Ip
