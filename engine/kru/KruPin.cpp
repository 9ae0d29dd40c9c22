#include "engine/kru/KruPin.h"

namespace Ip {

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
