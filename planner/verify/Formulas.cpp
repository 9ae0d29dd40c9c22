// Tested by formulas_test.cpp.
#include "planner/verify/Formulas.h"

#include "hardware/Loop.h"

namespace planner::verify {

using hardware::Pin;

namespace {

Rational InUnits(const Rational& error, const Rational& tolerance, const Rational& usual) {
  return error.Absolute() / (tolerance == Rational(0) ? usual : tolerance);
}

}  // namespace

Rational Ppm(const Rational& actual, const Rational& wanted) {
  return 1'000'000 * (actual - wanted) / wanted;
}

Rational Turned(Rational degrees) {
  degrees -= 360 * (degrees / 360).Floor();
  return degrees > Rational(180) ? degrees - 360 : degrees;
}

std::vector<Rational> CornersOf(const Rational& input, const Rational& tolerance) {
  if (tolerance == Rational(0)) return {input};
  const Rational off = input * tolerance / 1'000'000;
  return {input - off, input + off};
}

std::vector<Rational> CornersOf(const std::vector<Rational>& inputs, const Rational& tolerance) {
  std::vector<Rational> corners;
  for (const Rational& input : inputs) {
    for (const Rational& one : CornersOf(input, tolerance)) corners.push_back(one);
  }
  return corners;
}

Rational MarginIn(const Range& range, const Rational& frequency) {
  const Rational none = 0;
  const Rational below = range.highest == none ? -frequency : 1 - frequency / range.highest;
  if (range.lowest == none) return below;
  const Rational above = frequency / range.lowest - 1;
  return above < below ? above : below;
}

Rational PpmInUnits(const Rational& error, const Rational& tolerance) {
  return InUnits(error, tolerance, 100);
}

Rational DegreesInUnits(const Rational& error, const Rational& tolerance) {
  return InUnits(error, tolerance, Rational(1, 2));
}

Rational PointsInUnits(const Rational& error, const Rational& tolerance) {
  return InUnits(error, tolerance, Rational(1, 2));
}

Rational PsInUnits(const Rational& jitter, const Rational& allowed) {
  return InUnits(jitter, allowed, 1);
}

Rational VcoOf(const Rational& input, int m, int d) { return input * m / (hardware::kEighths * d); }

Rational PfdOf(const Rational& input, int d) { return input / d; }

Rational FrequencyOf(const Rational& vco, int divider) {
  return vco * hardware::kEighths / divider;
}

// A step is an eighth of a VCO period, and a period of the output is divider / 8 of them.
Rational PhaseOf(int step, int divider) { return Rational(step) * 360 / divider; }

// A high time is counted in halves of a VCO period.
Rational DutyOf(int high_time, int divider) {
  return Rational(high_time, 2) * 100 * hardware::kEighths / divider;
}

Rational FrequencyOf(const Rational& input, Pin pin, const hardware::KruRatios& set) {
  const Rational line = set.divide_by_2 ? input / 2 : input;
  switch (pin) {
    case Pin::kClk2x:
    case Pin::kClk2x180:
      return line * 2;
    case Pin::kClkdv:
      return line / Rational(set.divide_halves, 2);
    case Pin::kClkfx:
    case Pin::kClkfx180:
      return line * set.m / set.d;
    case Pin::kClkfxdv:
      return line * set.m / set.d / Rational(set.divide_halves, 2);
    default:
      return line;
  }
}

Rational PhaseOf(Pin pin, int phase_shift) {
  Rational phase = Rational(phase_shift) * 360 / hardware::kShiftSteps;
  if (pin == Pin::kClk90) phase += 90;
  if (pin == Pin::kClk180 || pin == Pin::kClk2x180 || pin == Pin::kClkfx180) phase += 180;
  if (pin == Pin::kClk270) phase += 270;
  return phase - 360 * (phase / 360).Floor();
}

// A divide of N and a half takes 2 N + 1 halves of the input; of these it is high for N.
Rational DutyOf(Pin pin, int divide_halves) {
  if (pin != Pin::kClkdv || divide_halves % 2 == 0) return 50;
  const int whole = divide_halves / 2;
  return Rational(100) * whole / (2 * whole + 1);
}

bool HasM(Pin pin) { return pin == Pin::kClkfx || pin == Pin::kClkfx180 || pin == Pin::kClkfxdv; }

bool HasDivide(Pin pin) { return pin == Pin::kClkdv || pin == Pin::kClkfxdv; }

}  // namespace planner::verify
