// Tested by locale_test.cpp of engine and binding.
#include "engine/CLocale.h"

namespace Ip {

namespace {

// Never freed: threads can use it until the process ends.
locale_t OfC() noexcept {
  static const locale_t c = newlocale(LC_ALL_MASK, "C", nullptr);
  return c;
}

}  // namespace

CLocale::CLocale() noexcept : before_(uselocale(OfC())) {}

CLocale::~CLocale() { uselocale(before_); }

}  // namespace Ip
