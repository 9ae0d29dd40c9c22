#include "engine/pll/VcoRanking.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <tuple>

#include "engine/pll/OutputDividers.h"
#include "engine/pll/VcoWindows.h"

namespace Ip::Pll {

namespace {

constexpr int kKeyBits = 5;  // for tolerance numbers 0 to kTolerances
static_assert(kTolerances < (1 << kKeyBits) && kKeyBits * (MAX_OUTPUTS - 1) < 32);

constexpr double kNoLimit = std::numeric_limits<double>::infinity();

// What two frequencies that are computed in different ways may differ by, relative; and how far
// bounds are moved to leave room for a VCO that is moved by that.
constexpr double kRounding = 1e-12;
constexpr double kSlack = 4.0 * kRounding;

bool AreClose(double a, double b) { return std::fabs(a - b) <= kRounding * std::fabs(b); }

// No candidate lies below it, in MHz, and above 0: output 0, shifted by a fudge, is 0 or as large
// as the rounding of the fudge at least.
constexpr double kSmallestVco = 1e-200;

// A stretch of VCO frequencies, MHz, with one key; or a point.
struct Stretch {
  double low;
  double high;
  ToleranceKey key;
  bool isServed;

  void AppendDigit(int digit) {
    key = key << kKeyBits | static_cast<ToleranceKey>(isServed ? digit : 0);
    isServed = isServed && digit < kTolerances;
  }
};
using Stretches = std::vector<Stretch>;

// Visits the ends, in rising order, of the stretches that a divider of an output makes, with the
// digit below each end. `f` is the requested frequency and `end`, the last of them, the VCO at
// which the next divider takes over, MHz. Tolerances count from the widest below the multiple, -26,
// to the widest above it.
template <typename Visit>
void VisitDivider(double divider, double f, const OutputRange& range, double end, Visit visit) {
  const double served = std::min(divider * range.max, end);
  visit(std::min(divider * range.min, end), kTolerances);
  for (int t = 1 - kTolerances; t < kTolerances; ++t) {
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
      Stretch piece = {low, std::min(high, stretch->high), stretch->key, stretch->isServed};
      piece.AppendDigit(digit);
      low = piece.high;
      if (low == stretch->high) ++stretch;
      if (!cut.empty() && cut.back().key == piece.key) {
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
  const double low = std::max(imp.pll.minAdjVco, kSmallestVco);
  if (!(low <= imp.pll.maxAdjVco && std::isfinite(low))) return {};
  Stretches stretches = {{low, imp.pll.maxAdjVco, 0, true}};
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
  Stretch made = {point, point, 0, true};
  for (int n = 1; n < run.count; ++n) {
    made.AppendDigit(DigitOfPoint(point, imp.requests.reqOutFreq[static_cast<std::size_t>(n)],
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
  for (const double point : points) all.push_back(MakePoint(imp, run, point));
  std::sort(all.begin(), all.end(),
            [](const Stretch& a, const Stretch& b) { return a.low < b.low; });
  return all;
}

}  // namespace

VcoRanking RankVcos(const VorkelImp& imp, const Run& run) {
  VcoRanking ranking;
  const VcoWindows windows = FindVcoWindows(imp, run);
  if (windows.empty()) return ranking;
  auto window = windows.begin();
  for (const Stretch& stretch : FindStretchesAndPoints(imp, run)) {
    using Kind = RankedRange::Kind;
    ranking.push_back({stretch.low, stretch.high, stretch.key,
                       stretch.isServed ? Kind::kServed : Kind::kUnserved});
    if (!stretch.isServed) continue;
    while (window != windows.end() && window->high < stretch.low) ++window;
    for (auto w = window; w != windows.end() && w->low <= stretch.high; ++w) {
      ranking.push_back({std::max(stretch.low, w->low), std::min(stretch.high, w->high),
                         stretch.key, Kind::kAccepted});
    }
  }
  std::sort(ranking.begin(), ranking.end(), [](const RankedRange& a, const RankedRange& b) {
    return std::tie(a.key, a.kind, a.low) < std::tie(b.key, b.kind, b.low);
  });
  return ranking;
}

}  // namespace Ip::Pll
