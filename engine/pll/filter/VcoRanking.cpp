#include "engine/pll/filter/VcoRanking.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <vector>

#include "engine/pll/OutputDividers.h"
#include "engine/pll/filter/Rounding.h"
#include "engine/pll/filter/VcoWindows.h"

namespace Ip::Pll {

namespace {

constexpr double kNoLimit = std::numeric_limits<double>::infinity();

// A stretch of VCO frequencies, MHz, with one key; or a point.
struct Stretch {
  double low;
  double high;
  KeyDigits digits;
};
using Stretches = std::vector<Stretch>;

// The widest tolerance that is worth a visit below the multiple, and one or two more: wider ones
// end where the divider before still has the VCO, half a divider below.
int WidestBelow(double divider) {
  return std::min(kTolerances - 1, static_cast<int>(50.0 / divider) + 2);
}

// Visits the ends, in rising order, of the stretches that a divider of an output makes, with the
// digit below each end. `f` is the requested frequency and `end`, the last of them, the VCO at
// which the next divider takes over, MHz. Tolerances count from the widest below the multiple, at
// most -26, to the widest above it.
template <typename Visit>
void VisitDivider(double divider, double f, const OutputRange& range, double end, Visit visit) {
  const double served = std::min(divider * range.max, end);
  visit(std::min(divider * range.min, end), kTolerances);
  for (int t = -WidestBelow(divider); t < kTolerances; ++t) {
    if (t == 0) continue;
    const double x = divider * f * (t < 0 ? 1.0 - Tolerance(-t) : 1.0 + Tolerance(t));
    visit(std::min(x, served), t < 0 ? 1 - t : t);
    if (x <= served * (1.0 + kRounding)) continue;
    if (served == end) return;
    break;
  }
  visit(end, kTolerances);
}

// The same for all dividers of output n that the VCO range can need. The last end is infinite.
template <typename Visit>
void VisitEnds(const VorkelImp& imp, const Run& run, int n, Visit visit) {
  const double f = imp.requests.reqOutFreq[static_cast<std::size_t>(n)];
  const OutputRange range = RangeOfOutput(imp.pllLimits, run.prim, n);
  if (range.min <= range.max && std::isfinite(f)) {
    if (std::signbit(f)) {
      // A negative request, -0 among them, takes a divider of 1 and keeps every tolerance.
      visit(range.min, kTolerances);
      visit(range.max, 0);
    } else if (f > 0.0) {
      const double first = std::floor(imp.pll.minAdjVco / f) - 1.0;
      for (double divider = std::clamp(first, 1.0, kLargestDivider);
           divider <= kLargestDivider && (divider - 1.0) * f <= imp.pll.maxAdjVco; divider += 1.0) {
        VisitDivider(divider, f, range,
                     divider == kLargestDivider ? kNoLimit : (divider + 0.5) * f, visit);
      }
    }
  }
  visit(kNoLimit, kTolerances);
}

// Appends the digit of output n to the keys and cuts the stretches where it changes. Where ends
// meet goes to `points`.
Stretches CutByOutput(const VorkelImp& imp, const Run& run, int n, const Stretches& stretches,
                      std::vector<double>& points) {
  Stretches cut;
  cut.reserve(2 * stretches.size());
  auto stretch = stretches.begin();
  double low = stretch->low;
  VisitEnds(imp, run, n, [&](double high, int digit) {
    if (AreClose(high, low)) points.push_back(low);
    while (stretch != stretches.end() && low < high) {
      if (AreClose(high, stretch->high)) points.push_back(high);
      Stretch piece = {low, std::min(high, stretch->high), stretch->digits};
      piece.digits.Append(digit);
      low = piece.high;
      if (low == stretch->high) ++stretch;
      if (!cut.empty() && cut.back().digits == piece.digits) {
        cut.back().high = piece.high;
      } else {
        cut.push_back(piece);
      }
    }
  });
  return cut;
}

// The VCO range in stretches, none when it is empty; and where ends meet.
Stretches FindStretches(const VorkelImp& imp, const Run& run, std::vector<double>& points) {
  const double low = std::max(imp.pll.minAdjVco, kSmallestFrequency);
  if (!(low <= imp.pll.maxAdjVco && std::isfinite(low))) return {};
  Stretches stretches = {{low, imp.pll.maxAdjVco, {}}};
  for (int n = 1; n < run.count; ++n) stretches = CutByOutput(imp, run, n, stretches, points);
  return stretches;
}

// Adds the multiples, MHz, of the outputs after output 0 that lie in the VCO range.
void AddMultiples(const VorkelImp& imp, int count, std::vector<double>& points) {
  for (int n = 1; n < count; ++n) {
    const double f = imp.requests.reqOutFreq[static_cast<std::size_t>(n)];
    if (!(f > 0.0 && std::isfinite(f))) continue;
    const double first = std::floor(imp.pll.minAdjVco / f);
    for (double divider = std::max(first, 1.0); divider <= kLargestDivider; divider += 1.0) {
      if (divider * f > imp.pll.maxAdjVco * (1.0 + kRounding)) break;
      points.push_back(divider * f);
    }
  }
}

// The smallest digit of an output that a VCO has which may be the point, but for rounding.
int DigitOfPoint(double point, double f, const OutputRange& range) {
  const OutputRange wide = {range.min - kSlack * std::fabs(range.min),
                            range.max + kSlack * std::fabs(range.max)};
  int digit = kTolerances;
  for (const double vco : {point * (1.0 - kRounding), point * (1.0 + kRounding)}) {
    const OutputFit fit = FitOutput(vco, f, wide);
    const bool isMultiple = fit.tolerance == 1 && fit.diff <= kSlack * f;
    digit = std::min(digit, isMultiple ? 0 : fit.tolerance);
  }
  return digit;
}

Stretch MakePoint(const VorkelImp& imp, const Run& run, double point) {
  Stretch made = {point, point, {}};
  for (int n = 1; n < run.count; ++n) {
    made.digits.Append(DigitOfPoint(point, imp.requests.reqOutFreq[static_cast<std::size_t>(n)],
                                  RangeOfOutput(imp.pllLimits, run.prim, n)));
  }
  return made;
}

// The stretches and the points, rising.
Stretches FindStretchesAndPoints(const VorkelImp& imp, const Run& run) {
  std::vector<double> points;
  Stretches all = FindStretches(imp, run, points);
  if (all.empty()) return all;
  AddMultiples(imp, run.count, points);
  std::sort(points.begin(), points.end());
  points.erase(std::unique(points.begin(), points.end()), points.end());
  const auto stretches = static_cast<std::ptrdiff_t>(all.size());
  for (const double point : points) all.push_back(MakePoint(imp, run, point));
  std::inplace_merge(all.begin(), all.begin() + stretches, all.end(),
                     [](const Stretch& a, const Stretch& b) { return a.low < b.low; });
  return all;
}

// The ranges, which are rising, by key and kind. They are sorted as one number each, which is a lot
// faster.
VcoRanking Sorted(const VcoRanking& rising) {
  std::vector<std::uint64_t> order;
  order.reserve(rising.size());
  for (const RankedRange& range : rising) {
    const auto kind = static_cast<std::uint64_t>(range.kind);
    order.push_back((std::uint64_t{range.key} << 2 | kind) << 32 | order.size());
  }
  std::sort(order.begin(), order.end());
  VcoRanking sorted;
  sorted.reserve(rising.size());
  for (const std::uint64_t entry : order) sorted.push_back(rising[entry & 0xffffffffu]);
  return sorted;
}

}  // namespace

VcoRanking RankVcos(const VorkelImp& imp, const Run& run) {
  VcoRanking ranking;
  const VcoWindows windows = FindVcoWindows(imp, run);
  if (windows.empty()) return ranking;
  auto window = windows.begin();
  for (const Stretch& stretch : FindStretchesAndPoints(imp, run)) {
    using Kind = RankedRange::Kind;
    const auto& [key, isServed] = stretch.digits;
    ranking.push_back({stretch.low, stretch.high, key, isServed ? Kind::kServed : Kind::kUnserved});
    if (!isServed) continue;
    while (window != windows.end() && window->high < stretch.low) ++window;
    if (ranking.back().IsPoint()) {
      if (window != windows.end() && window->low <= stretch.low) {
        ranking.back().kind = Kind::kAccepted;
      }
      continue;
    }
    for (auto w = window; w != windows.end() && w->low <= stretch.high; ++w) {
      ranking.push_back({std::max(stretch.low, w->low), std::min(stretch.high, w->high), key,
                         Kind::kAccepted});
    }
  }
  return Sorted(ranking);
}

}  // namespace Ip::Pll
