#include "engine/timing/LongWalks.h"

#include <algorithm>
#include <cmath>
#include <limits>

#include "engine/timing/OutputSteps.h"

namespace Ip {

namespace {

// Walks of up to so many steps are walked: the window takes as long.
constexpr double kLongestPhaseWalk = 16;
constexpr double kLongestDutyWalk = 128;

// Steps looked at on either side of the request. A quotient below 2^40 is off by less than one, so
// that its whole part is off by one at the most; those from there on get some more.
constexpr int kWindow = 8;
constexpr int kNarrowWindow = 3;
constexpr double kNarrow = 1099511627776.0;  // 2^40

// Less than the step of any divider.
constexpr double kSmallestPhaseStep = 1e-307;

// From here on not every whole number is a double.
constexpr double kAllWhole = 9007199254740992.0;  // 2^53

double WholeAfter(double k) {
  return k < kAllWhole ? k + 1.0 : std::nextafter(k, std::numeric_limits<double>::infinity());
}

double WholeBefore(double k) { return k <= kAllWhole ? k - 1.0 : std::nextafter(k, 0.0); }

// The plain walk over multiples of a small step, begun a few of them before `phase`.
//
// Upward: the multiples grow, so their distances from the request fall up to it and rise after
// it; what the walk holds when it comes to the window is no nearer than the window's first.
// Downward: up to the request the walk holds some multiple not above it. Which one does not
// matter, since the first multiple above the request replaces each of them, and no later one
// replaces that; where there is none above, the last multiple does.
double WalkWindow(double phase, double step, bool positive) {
  const double end = positive ? std::min(phase, 360.0) : std::min(phase + 360.0, 360.0);
  double k = std::floor(end / step);
  const int window = k < kNarrow ? kNarrowWindow : kWindow;
  for (int i = 0; i < window && k > 0.0; ++i) k = WholeBefore(k);
  k = std::max(k, 0.0);
  double best = positive ? k * step : k * step - 360.0;
  for (int i = 0; i < 2 * window && k * step <= 360.0; ++i, k = WholeAfter(k)) {
    const double candidate = positive ? k * step : k * step - 360.0;
    if (candidate == phase) return candidate;
    const double bestDistance =
        positive ? std::fabs(best - phase) : std::fabs(candidate - best);
    if (bestDistance >= std::fabs(candidate - phase)) best = candidate;
  }
  return best;
}

// What `duty` has become when additions of `step` have brought it to the last value that lies
// more than a few steps below `end`.
//
// Doubles of one binade lie evenly, so an addition that stays in a binade always adds the same:
// the step rounded to that grid. (A step that ends in half a grid unit goes to the even
// neighbour, and does so alike from the second addition on.) Whole binades are skipped by one
// multiplication, which is exact.
double AddUpTo(double duty, double step, double end) {
  end -= kWindow * step;
  while (duty < end) {
    const double binadeEnd = std::ldexp(1.0, std::ilogb(duty) + 1);
    const double once = duty + step;
    const double twice = once + step;
    const double added = once - duty;
    if (added == 0.0) break;
    const double additions = std::floor((std::min(binadeEnd, end) - duty) / added) - 2.0;
    if (additions < 1.0 || twice - once != added) {
      duty = once;
    } else {
      duty += additions * added;
    }
  }
  return duty;
}

// Where a walk stops coming nearer to `requested`: at the request itself or, for one below the
// range, at the last double whose rounded distance is still that of the lowest value. A request
// that is far below has many of these, and the walk takes the last.
double LastNearest(double requested, const DutyRange& range) {
  if (!(requested < range.lowest)) return std::min(requested, range.highest);
  const double least = range.lowest - requested;
  if (range.highest - requested <= least) return range.highest;
  double near = range.lowest;
  double far = range.highest;
  for (;;) {
    const double middle = near + (far - near) / 2.0;
    if (middle <= near || middle >= far) return near;
    (middle - requested <= least ? near : far) = middle;
  }
}

// The walk of a negative divider goes down from `lowest` for ever, unless it meets the request.
// Additions round alike on both sides of 0.
double MeetBelow(double requested, const DutyRange& range) {
  double duty = -AddUpTo(-range.lowest, -range.step, -requested);
  for (int i = 0; i < 3 * kWindow && duty >= requested; ++i, duty += range.step) {
    if (duty == requested) return duty;
  }
  return 0.0;
}

}  // namespace

double NearestPhaseStepOfAny(double phase, double step, bool positive) {
  if (phase == 0.0 || !std::isfinite(step)) return 0.0;
  if (step < 0.0) {
    // The multiples run away from the range; only the first one is in it.
    return !positive && phase == -360.0 ? phase : 0.0;
  }
  if (360.0 / step <= kLongestPhaseWalk || step == 0.0) {
    return NearestPhaseStep(phase, step, positive);
  }
  if (step < kSmallestPhaseStep) return 0.0;  // no divider's
  // Nothing replaces the first multiple for a request below the range, nor for a NaN.
  if (!positive && !(phase > -360.0)) return -360.0;
  return WalkWindow(phase, step, positive);
}

double NearestDutyCycleOfAny(double percent, double divider, double maxHighLowCount) {
  if (percent == 0.0 || divider == 0.0) return 0.0;
  if (divider == 1.0) return 0.5;
  const double requested = percent / 100.0;
  DutyRange range = DutyRangeOf(divider, maxHighLowCount);
  // Written so that NaN is caught.
  if (!(range.lowest <= range.highest)) return 0.0;
  if (range.step < 0.0) return MeetBelow(requested, range);
  // A step that does not move the upper end leaves the walk standing somewhere below it.
  if (range.step == 0.0 || range.highest + range.step == range.highest) return 0.0;
  if ((range.highest - range.lowest) / range.step > kLongestDutyWalk) {
    range.lowest = AddUpTo(range.lowest, range.step, LastNearest(requested, range));
    // Beyond the request no step comes nearer.
    range.highest = std::min(range.highest, range.lowest + 3 * kWindow * range.step);
  }
  return NearestDutyStep(requested, range);
}

}  // namespace Ip
