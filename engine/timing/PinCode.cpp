#include "engine/timing/PinCode.h"

namespace Ip {

namespace {

struct PinCode {
  const char* name;
  int code;
};

constexpr PinCode kPinCodes[] = {
    {"CLK0", 1},     {"CLK90", 2},  {"CLK180", 3},   {"CLK270", 4}, {"CLK2X", 5},
    {"CLK2X180", 7}, {"CLKFX", 8}, {"CLKFX180", 9}, {"CLKDV", 10},
};
constexpr int kUnknownPin = 12;

}  // namespace

int CalculatorPinCode(const Port::StringBase& pin) {
  for (const PinCode& known : kPinCodes) {
    if (pin.Compare(known.name, Port::CompareType::kExact) == 0) return known.code;
  }
  return kUnknownPin;
}

}  // namespace Ip
