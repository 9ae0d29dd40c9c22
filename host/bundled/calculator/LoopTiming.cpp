#include "host/bundled/calculator/LoopTiming.h"

#include <algorithm>
#include <cmath>

#include "hardware/Loop.h"

namespace Calculator {
namespace {

constexpr double kVcoPhases = hardware::kEighths;
constexpr double kFullCycle = 360.0;  // degrees
constexpr double kHalf = 50.0;        // percent

}  // namespace

// Multiplied before it is divided, a request half-way between two steps comes out as exactly
// that.
double PhaseOnStep(double requested, double divider) {
  const double steps = divider * kVcoPhases;  // in a full cycle
  // Without the sign of a 0 from below.
  return std::floor(requested * steps / kFullCycle + 0.5) / steps * kFullCycle + 0.0;
}

double DutyOnStep(double requested, double divider, double largest_count) {
  if (divider == 1.0) return kHalf;
  const double wanted = requested == 0.0 ? kHalf : requested;
  // In half VCO cycles.
  const double cycle = 2.0 * divider;
  double shortest = 2.0;
  double longest = cycle - 1.0;
  if (divider > largest_count) {
    shortest = cycle - 2.0 * largest_count;
    longest = std::min(2.0 * largest_count + 1.0, cycle);
  }
  const double steps = std::floor(wanted * cycle / 100.0 - shortest + 0.5);
  const double high = shortest + std::clamp(steps, 0.0, std::floor(longest - shortest));
  return high / cycle * 100.0;
}

}  // namespace Calculator
