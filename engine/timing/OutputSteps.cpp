#include "engine/timing/OutputSteps.h"

#include <cmath>

namespace Ip {

double PhaseStep(double divider) { return 1.0 / (divider * 8.0) * 360.0; }

// The two directions compare differently: upward the best so far against the request,
// downward the best so far against the multiple at hand. Both are meant exactly so.
double NearestPhaseStep(double phase, double step, bool positive) {
  if (phase == 0.0 || step == 0.0) return 0.0;
  double best = 0.0;
  for (int k = 0; k * step <= 360.0; ++k) {
    const double candidate = positive ? k * step : k * step - 360.0;
    if (candidate == phase) return candidate;
    if (k == 0) best = candidate;
    const double bestDistance =
        positive ? std::fabs(best - phase) : std::fabs(candidate - best);
    if (bestDistance >= std::fabs(candidate - phase)) best = candidate;
  }
  return best;
}

DutyRange DutyRangeOf(double divider, double maxHighLowCount) {
  double lowest = 1.0 / divider;
  double highest = (divider - 0.5) / divider;
  if (divider > maxHighLowCount) {
    lowest = (divider - maxHighLowCount) / divider;
    highest = (maxHighLowCount + 0.5) / divider;
  }
  if (highest > 1.0) highest = 1.0;
  return {lowest, highest, 0.5 / divider};
}

// The rounding errors of the additions add up, too, as the comparisons with the request and
// with the upper end expect.
double NearestDutyStep(double requested, const DutyRange& range) {
  if (range.highest < range.lowest) return 0.0;
  double best = range.lowest;
  for (double duty = range.lowest; duty <= range.highest; duty += range.step) {
    if (duty == requested) return duty;
    if (std::fabs(best - requested) >= std::fabs(duty - requested)) best = duty;
  }
  return best;
}

double NearestDutyCycle(double percent, double divider, double maxHighLowCount) {
  if (percent == 0.0 || divider == 0.0) return 0.0;
  if (divider == 1.0) return 0.5;
  return NearestDutyStep(percent / 100.0, DutyRangeOf(divider, maxHighLowCount));
}

}  // namespace Ip
