#include "host/bundled/calculator/KruArguments.h"

#include <algorithm>
#include <span>
#include <string>
#include <utility>
#include <vector>

#include "hardware/Kru.h"
#include "host/bundled/calculator/Slack.h"

namespace Calculator {
namespace {

using Device::Primitive;

constexpr double kLeastM = hardware::kSmallestKruM;
constexpr double kLeastD = 1.0;

// The largest M and the largest D.
double LargestRatioPart(Primitive primitive) {
  return hardware::LargestKruRatioPart(primitive == Device::kKruClkgen
                                           ? hardware::Primitive::kKruClkgen
                                           : hardware::Primitive::kKruSp);
}

bool IsOneOf(std::span<const int> halves, double divide) {
  return std::any_of(halves.begin(), halves.end(),
                     [divide](int one) { return one == 2.0 * divide; });
}

// The divides of CLKDV, or those of CLKFXDV: that pin has no code, but a script may hand its
// divide on.
bool IsDivide(Primitive primitive, double divide) {
  return primitive == Device::kKruClkgen ? IsOneOf(hardware::kClkfxdvHalves, divide)
                                         : IsOneOf(hardware::kClkdvHalves, divide);
}

std::string RangeOfDivide(Primitive primitive) {
  return primitive == Device::kKruClkgen
             ? "2, 4, 8, 16 or 32"
             : "from 2 to 8 in steps of 0.5 or a whole number from 9 to 17";
}

}  // namespace

KruArguments::KruArguments(const Device::Grade& grade, std::vector<Primitive> primitives)
    : grade_(grade), candidates_(std::move(primitives)) {}

KruArguments KruArguments::Any(const Device::Grade& grade, std::string_view device_name) {
  std::vector<Primitive> primitives;
  for (const Primitive primitive : {Device::kKruSp, Device::kKruClkgen}) {
    if (grade.Has(primitive)) primitives.push_back(primitive);
  }
  if (primitives.empty()) {
    throw ArgumentError("Device " + std::string(device_name) +
                        " has neither KRU_SP nor KRU_CLKGEN.");
  }
  return {grade, std::move(primitives)};
}

KruArguments KruArguments::Certain(const Device::Grade& grade, std::string_view device_name,
                                   Primitive primitive) {
  if (!grade.Has(primitive)) {
    throw ArgumentError("Device " + std::string(device_name) + " has no " +
                        std::string(Device::PrimitiveName(primitive)) + ".");
  }
  return {grade, {primitive}};
}

const KruPin& KruArguments::CheckPin(int code) {
  pin_ = &PinOf(code);
  candidates_.Keep(
      [this] { return "Pin is " + std::string(pin_->name); },
      [this](Primitive primitive) {
        return primitive == Device::kKruSp || pin_->source == KruSource::kSynthesiser;
      },
      [](Primitive primitive) {
        return primitive == Device::kKruSp ? AllPins() : SynthesiserPins();
      });
  return *pin_;
}

void KruArguments::CheckFlag(std::string_view what, bool flag) {
  if (!flag) return;
  candidates_.Keep(
      [what] { return std::string(what) + " is true"; },
      [](Primitive primitive) { return primitive == Device::kKruSp; },
      [](Primitive) { return std::string("false"); });
}

void KruArguments::CheckRatioPart(std::string_view what, double value, double lowest) {
  const bool optional = pin_->source != KruSource::kSynthesiser;
  if (optional && value == 0.0) return;
  candidates_.Keep(
      [=] { return Statement(what, value); },
      [=](Primitive primitive) { return IsWhole(value, lowest, LargestRatioPart(primitive)); },
      [=](Primitive primitive) {
        return (optional ? "0 (none) or " : "") + std::string("a whole number from ") +
               NumberText(lowest) + " to " + NumberText(LargestRatioPart(primitive));
      });
}

void KruArguments::CheckM(double m) { CheckRatioPart("M", m, kLeastM); }

void KruArguments::CheckD(double d) { CheckRatioPart("D", d, kLeastD); }

void KruArguments::CheckDivide(double divide) {
  const bool optional = pin_->source != KruSource::kDivider;
  if (optional && divide == 0.0) return;
  candidates_.Keep(
      [=] { return Statement("CLKDV divide", divide); },
      [=](Primitive primitive) { return IsDivide(primitive, divide); },
      [=](Primitive primitive) {
        return (optional ? "0 (none), " : "") + RangeOfDivide(primitive);
      });
}

void KruArguments::CheckFrequency(double frequency) const {
  const std::string keyword =
      "D_KRU_" + std::string(pin_->frequency) + "_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_";
  const double lowest = 1000.0 / *grade_.Figure(keyword + "MAXPERIOD");
  const double highest = 1000.0 / *grade_.Figure(keyword + "MINPERIOD");
  if (IsWithinLimits(frequency, lowest, highest)) return;
  const std::string what(pin_->source == KruSource::kDivider ? "Delay-line" : pin_->name);
  Refuse(what + " frequency is " + FrequencyText(frequency), FrequencyRange(lowest, highest));
}

}  // namespace Calculator
