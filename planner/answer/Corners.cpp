// Tested by corners_test.cpp.
#include "planner/answer/Corners.h"

namespace planner::answer {

namespace {

void Narrow(Range* range, const Rational& tolerance) { *range = Narrowed(*range, tolerance); }

void NarrowAll(LoopLimits* limits, const Rational& tolerance) {
  for (Range* range :
       {&limits->vco, &limits->pfd, &limits->pfd_low, &limits->output, &limits->output_1}) {
    Narrow(range, tolerance);
  }
}

void NarrowAll(PinLimits* limits, const Rational& tolerance) {
  for (auto* const ranges : {&limits->usual, &limits->doubled}) {
    for (auto& [pin, range] : *ranges) Narrow(&range, tolerance);
  }
}

}  // namespace

Rational CornerFactor(const Rational& ppm) { return 1 + ppm / 1'000'000; }

Range Narrowed(const Range& range, const Rational& tolerance) {
  if (tolerance == Rational(0)) return range;
  return {range.lowest / CornerFactor(-tolerance), range.highest / CornerFactor(tolerance)};
}

Device Narrowed(Device device, const Rational& tolerance) {
  if (device.pll) NarrowAll(&*device.pll, tolerance);
  if (device.tsyn) NarrowAll(&*device.tsyn, tolerance);
  if (device.kru_sp) NarrowAll(&*device.kru_sp, tolerance);
  if (device.kru_clkgen) NarrowAll(&*device.kru_clkgen, tolerance);
  return device;
}

}  // namespace planner::answer
