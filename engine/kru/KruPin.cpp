#include "engine/kru/KruPin.h"

#include "hardware/Kru.h"

namespace Ip {

namespace {

constexpr bool IsSame(KruPin code, hardware::Pin pin) {
  return static_cast<int>(code) == static_cast<int>(pin);
}

// The codes of the search are those of the hardware's table.
static_assert(IsSame(KruPin::NONE, hardware::Pin::kNone));
static_assert(IsSame(KruPin::CLK0, hardware::Pin::kClk0));
static_assert(IsSame(KruPin::CLK90, hardware::Pin::kClk90));
static_assert(IsSame(KruPin::CLK180, hardware::Pin::kClk180));
static_assert(IsSame(KruPin::CLK270, hardware::Pin::kClk270));
static_assert(IsSame(KruPin::CLKDV, hardware::Pin::kClkdv));
static_assert(IsSame(KruPin::CLK2X, hardware::Pin::kClk2x));
static_assert(IsSame(KruPin::CLK2X180, hardware::Pin::kClk2x180));
static_assert(IsSame(KruPin::CLKFX, hardware::Pin::kClkfx));
static_assert(IsSame(KruPin::CLKFX180, hardware::Pin::kClkfx180));
static_assert(IsSame(KruPin::CLKFXDV, hardware::Pin::kClkfxdv));

}  // namespace

Port::StringBase KruPinName(KruPin pin) {
  switch (pin) {
    case KruPin::NONE: break;
    case KruPin::CLK0: return "CLK0";
    case KruPin::CLK90: return "CLK90";
    case KruPin::CLK180: return "CLK180";
    case KruPin::CLK270: return "CLK270";
    case KruPin::CLKDV: return "CLKDV";
    case KruPin::CLK2X: return "CLK2X";
    case KruPin::CLK2X180: return "CLK2X180";
    case KruPin::CLKFX: return "CLKFX";
    case KruPin::CLKFX180: return "CLKFX180";
    case KruPin::CLKFXDV: return "CLKFXDV";
  }
  return "NONE";
}

}  // namespace Ip
