#include "host/bundled/calculator/LoopArguments.h"

#include <limits>
#include <string>
#include <utility>
#include <vector>

#include "hardware/Loop.h"
#include "host/bundled/calculator/Slack.h"

namespace Calculator {
namespace {

using Device::Primitive;

constexpr double kLargestM = hardware::kLargestM;
constexpr double kLargestD = hardware::kLargestD;
constexpr double kLargestDivider = hardware::kLargestDivider;

// The TSYN counts in eighths, with gaps in front of these.
constexpr double kEighth = 1.0 / hardware::kEighths;
constexpr double kLeastFractionalM = hardware::kSmallestTsynM;
constexpr double kLeastFractionalDivider = hardware::kSmallestFractionalDivider;

// Where the limits stand among the figures of a grade.
std::size_t IndexOf(std::string_view keyword) { return *Device::FindKeyword(keyword); }

const LoopArguments::Limit kVcoMin = {IndexOf("VCOCLK_FREQ_MIN"), IndexOf("TSYN_VCOCLK_FREQ_MIN")};
const LoopArguments::Limit kVcoMax = {IndexOf("VCOCLK_FREQ_MAX"), IndexOf("TSYN_VCOCLK_FREQ_MAX")};
const LoopArguments::Limit kPfdMin = {IndexOf("CLKPFD_FREQ_MIN"), IndexOf("TSYN_CLKPFD_FREQ_MIN")};
const LoopArguments::Limit kPfdMax = {IndexOf("CLKPFD_FREQ_MAX"), IndexOf("TSYN_CLKPFD_FREQ_MAX")};
const std::size_t kPfdMaxOfLow = IndexOf("TSYN_CLKPFD_FREQ_MAX_LBW");
const std::size_t kLargestCount = IndexOf("O_MAX_HT_LT");

bool IsTsynValue(double value, double least, double largest) {
  return value == 1.0 || (IsWithin(value, least, largest) && IsMultiple(value, kEighth));
}

bool IsM(Primitive primitive, double m) {
  return primitive == Device::kTsyn ? IsTsynValue(m, kLeastFractionalM, kLargestM)
                                    : IsWhole(m, 1.0, kLargestM);
}

std::string RangeOfM(Primitive primitive) {
  return primitive == Device::kTsyn ? "1 or from 5 to 64 in steps of 0.125"
                                    : "a whole number from 1 to 64";
}

bool IsOutputDivider(Primitive primitive, double divider) {
  return primitive == Device::kTsyn ? IsTsynValue(divider, kLeastFractionalDivider, kLargestDivider)
                                    : IsWhole(divider, 1.0, kLargestDivider);
}

std::string RangeOfOutputDivider(Primitive primitive) {
  return primitive == Device::kTsyn ? "1 or from 2 to 128 in steps of 0.125"
                                    : "a whole number from 1 to 128";
}

std::vector<Primitive> LoopPrimitives(const Device::Grade& grade, std::string_view device_name) {
  std::vector<Primitive> primitives;
  for (const Primitive primitive : {Device::kPll, Device::kTsyn}) {
    if (grade.Has(primitive)) primitives.push_back(primitive);
  }
  if (primitives.empty()) {
    throw ArgumentError("Device " + std::string(device_name) + " has neither PLL nor TSYN.");
  }
  return primitives;
}

}  // namespace

Bandwidth BandwidthOf(std::string_view text) {
  if (text == "LOW") return Bandwidth::kLow;
  if (text == "HIGH") return Bandwidth::kHigh;
  if (text == "OPTIMIZED") return Bandwidth::kOptimized;
  Refuse("Bandwidth is \"" + std::string(text) + "\"", "LOW, HIGH or OPTIMIZED");
}

bool IsFractional(double value) { return !IsMultiple(value, 1.0); }

LoopArguments::LoopArguments(const Device::Grade& grade, std::string_view device_name)
    : grade_(grade), candidates_(LoopPrimitives(grade, device_name)) {}

void LoopArguments::CheckM(double m) {
  candidates_.Keep(
      [m] { return Statement("M", m); },
      [m](Primitive primitive) { return IsM(primitive, m); }, RangeOfM);
}

void LoopArguments::CheckD(double d) const { CheckWhole("D", d, 1.0, kLargestD); }

void LoopArguments::CheckOutputDivider(double divider) {
  candidates_.Keep(
      [divider] { return Statement("Output divider", divider); },
      [divider](Primitive primitive) { return IsOutputDivider(primitive, divider); },
      RangeOfOutputDivider);
}

void LoopArguments::CheckFeedbackDivider(double divider) {
  if (divider == 0.0) return;
  candidates_.Keep(
      [divider] { return Statement("Feedback divider", divider); },
      [divider](Primitive primitive) { return IsOutputDivider(primitive, divider); },
      [](Primitive primitive) { return "0 (none) or " + RangeOfOutputDivider(primitive); });
}

void LoopArguments::CheckRequestedPhase(double degrees) const {
  CheckWithin("Requested phase", degrees, "degrees", -360.0, 360.0);
}

void LoopArguments::CheckRequestedDuty(double percent) const {
  CheckWithin("Requested duty cycle", percent, "percent", 0.0, 100.0);
}

void LoopArguments::CheckInputJitter(double picoseconds) const {
  CheckWithin("Input jitter", picoseconds, "ps", 0.0, kLargestInputJitter);
}

double LoopArguments::CheckLargestCount(double count, double divider) const {
  // The longest high time, half a VCO cycle more than the count, must reach the shortest.
  const double least = divider == 1.0 ? 0.5 : (divider - 0.5) / 2.0;
  const double largest = count == 0.0 ? *grade_.figures[kLargestCount] : count;
  if (IsWithin(largest, least, std::numeric_limits<double>::max())) return largest;
  if (count == 0.0) {
    Refuse(Statement("Output divider", divider), "at most " + NumberText(2.0 * largest + 0.5) +
                                                     ", as high and low counts end at " +
                                                     NumberText(largest));
  }
  Refuse(Statement("Largest high or low count", count),
         "0 (the device's) or a finite number from " + NumberText(least) +
             " for an output divider of " + NumberText(divider));
}

double LoopArguments::Of(const Limit& limit, Primitive primitive) const {
  return *grade_.figures[primitive == Device::kTsyn ? limit.tsyn : limit.pll];
}

void LoopArguments::CheckPfd(double pfd, Bandwidth bandwidth) {
  // Only the TSYN has a limit of its own for a narrow loop.
  const auto highest = [&](Primitive primitive) {
    const bool low = primitive == Device::kTsyn && bandwidth == Bandwidth::kLow;
    return low ? *grade_.figures[kPfdMaxOfLow] : Of(kPfdMax, primitive);
  };
  candidates_.Keep(
      [pfd] { return "PFD frequency (input frequency / D) is " + FrequencyText(pfd); },
      [&](Primitive primitive) {
        return IsWithinLimits(pfd, Of(kPfdMin, primitive), highest(primitive));
      },
      [&](Primitive primitive) {
        return FrequencyRange(Of(kPfdMin, primitive), highest(primitive));
      });
}

void LoopArguments::CheckVco(double vco) {
  candidates_.Keep(
      [vco] { return "VCO frequency (input frequency x M / D) is " + FrequencyText(vco); },
      [&](Primitive primitive) {
        return IsWithinLimits(vco, Of(kVcoMin, primitive),
                              Of(kVcoMax, primitive));
      },
      [&](Primitive primitive) {
        return FrequencyRange(Of(kVcoMin, primitive),
                              Of(kVcoMax, primitive));
      });
}

}  // namespace Calculator
