#include "host/bundled/calculator/KruPin.h"

#include <vector>

#include "host/bundled/calculator/Argument.h"

namespace Calculator {
namespace {

// CLKDV has no limits of its own here: its frequency depends on the divide, but the line must
// run at that of CLK0.
constexpr KruPin kPins[] = {
    {1, "CLK0", KruSource::kTap, 0.0, "CLK0"},
    {2, "CLK90", KruSource::kTap, 0.25, "CLK90"},
    {3, "CLK180", KruSource::kTap, 0.5, "CLK0"},
    {4, "CLK270", KruSource::kTap, 0.75, "CLK90"},
    {5, "CLK2X", KruSource::kDoubler, 0.0, "CLK2X"},
    {7, "CLK2X180", KruSource::kDoubler, 0.5, "CLK2X"},
    {8, "CLKFX", KruSource::kSynthesiser, 0.0, "CLKFX"},
    {9, "CLKFX180", KruSource::kSynthesiser, 0.5, "CLKFX"},
    {10, "CLKDV", KruSource::kDivider, 0.0, "CLK0"},
};

std::string Listed(const std::vector<std::string_view>& names) {
  std::string text;
  for (std::size_t i = 0; i < names.size(); ++i) {
    if (i > 0) text += i + 1 == names.size() ? " or " : ", ";
    text += names[i];
  }
  return text;
}

}  // namespace

const KruPin& PinOf(int code) {
  for (const KruPin& pin : kPins) {
    if (pin.code == code) return pin;
  }
  Refuse("Pin is unknown (code " + std::to_string(code) + ")", AllPins());
}

std::string AllPins() {
  std::vector<std::string_view> names;
  for (const KruPin& pin : kPins) names.push_back(pin.name);
  return Listed(names);
}

std::string SynthesiserPins() {
  std::vector<std::string_view> names;
  for (const KruPin& pin : kPins) {
    if (pin.source == KruSource::kSynthesiser) names.push_back(pin.name);
  }
  return Listed(names);
}

}  // namespace Calculator
