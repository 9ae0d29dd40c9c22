// Tested by locale_test.cpp of engine and binding.
#include "engine/CLocale.h"

namespace Ip {

#ifdef _WIN32

// Windows has no locales of threads but those that a thread asks for.
CLocale::CLocale() noexcept
    : mode_before_(_configthreadlocale(_ENABLE_PER_THREAD_LOCALE)),
      before_(setlocale(LC_ALL, nullptr)) {
  setlocale(LC_ALL, "C");
}

CLocale::~CLocale() {
  setlocale(LC_ALL, before_.c_str());
  _configthreadlocale(mode_before_);
}

#else

namespace {

// Never freed: threads can use it until the process ends.
locale_t OfC() noexcept {
  static const locale_t c = newlocale(LC_ALL_MASK, "C", nullptr);
  return c;
}

}  // namespace

CLocale::CLocale() noexcept : before_(uselocale(OfC())) {}

CLocale::~CLocale() { uselocale(before_); }

#endif

}  // namespace Ip
