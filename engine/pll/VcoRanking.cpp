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
constexpr ToleranceKey kDigit = (1u << kKeyBits) - 1;
static_assert(kTolerances < kDigit && kKeyBits * (MAX_OUTPUTS - 1) < 32);

constexpr double kNoLimit = std::numeric_limits<double>::infinity();

// What two frequencies that are computed in different ways may differ by, relative.
constexpr double kRounding = 1e-12;

// No VCO below it, in MHz, has an M and a D; so its key does not matter.
constexpr double kSmallestVco = 1e-200;

// A stretch of VCO frequencies, MHz, with one key.
struct Stretch {
  double low;
  double high;
  ToleranceKey key;
  bool isServed;
};
using Stretches = std::vector<Stretch>;

// Visits the upper ends, in rising order, of the stretches of output n alone, and their digits.
// Some have the same end or the same digit as the one before.
template <typename Visit>
void VisitDigits(const VorkelImp& imp, int n, Visit visit) {
  const double f = imp.requests.reqOutFreq[static_cast<std::size_t>(n)];
  const OutputRange range = RangeOfOutput(imp.pllLimits, n);
  if (range.min <= range.max && std::isfinite(f)) {
    if (std::signbit(f)) {
      // A negative request, -0 among them, takes a divider of 1 and keeps every tolerance.
      visit(range.min, kTolerances);
      visit(range.max, 0);
    } else if (f > 0.0) {
      const double first = std::floor(imp.pll.minAdjVco / f) - 1.0;
      for (double divider = std::clamp(first, 1.0, kLargestDivider);
           divider <= kLargestDivider && (divider - 1.0) * f <= imp.pll.maxAdjVco; divider += 1.0) {
        const double end = divider == kLargestDivider ? kNoLimit : (divider + 0.5) * f;
        const double served = std::min(divider * range.max, end);
        visit(std::min(divider * range.min, end), kTolerances);
        for (int digit = kTolerances - 1; digit >= 1; --digit) {
          visit(std::min(divider * f * (1.0 - Tolerance(digit)), served), digit + 1);
        }
        for (int digit = 1; digit < kTolerances; ++digit) {
          visit(std::min(divider * f * (1.0 + Tolerance(digit)), served), digit);
        }
        visit(end, kTolerances);
      }
    }
  }
  visit(kNoLimit, kTolerances);
}

// Appends the digit of output n to the keys and cuts the stretches where it changes.
Stretches CutByOutput(const VorkelImp& imp, int n, const Stretches& stretches) {
  Stretches cut;
  cut.reserve(2 * stretches.size());
  auto stretch = stretches.begin();
  double low = stretch->low;
  VisitDigits(imp, n, [&](double high, int digit) {
    while (stretch != stretches.end() && low < high) {
      const double end = std::min(high, stretch->high);
      const bool isServed = stretch->isServed && digit < kTolerances;
      const ToleranceKey key =
          stretch->key << kKeyBits | static_cast<ToleranceKey>(stretch->isServed ? digit : 0);
      if (!cut.empty() && cut.back().key == key) {
        cut.back().high = end;
      } else {
        cut.push_back({low, end, key, isServed});
      }
      low = end;
      if (end == stretch->high) ++stretch;
    }
  });
  return cut;
}

// The VCO range in stretches; none when it is empty.
Stretches FindStretches(const VorkelImp& imp, int count) {
  const double low = std::max(imp.pll.minAdjVco, kSmallestVco);
  if (!(low <= imp.pll.maxAdjVco)) return {};
  Stretches stretches = {{low, imp.pll.maxAdjVco, 0, true}};
  for (int n = 1; n < count; ++n) stretches = CutByOutput(imp, n, stretches);
  return stretches;
}

// The multiples, MHz, of the outputs after output 0 that lie in the VCO range, rising.
std::vector<double> FindMultiples(const VorkelImp& imp, int count) {
  std::vector<double> multiples;
  for (int n = 1; n < count; ++n) {
    const double f = imp.requests.reqOutFreq[static_cast<std::size_t>(n)];
    if (!(f > 0.0 && std::isfinite(f))) continue;
    const double first = std::floor(imp.pll.minAdjVco / f);
    for (double divider = std::max(first, 1.0); divider <= kLargestDivider; divider += 1.0) {
      if (divider * f > imp.pll.maxAdjVco * (1.0 + kRounding)) break;
      multiples.push_back(divider * f);
    }
  }
  std::sort(multiples.begin(), multiples.end());
  multiples.erase(std::unique(multiples.begin(), multiples.end()), multiples.end());
  return multiples;
}

// The smallest key that a VCO in the stretch and at the point can have.
ToleranceKey KeyOfPoint(const VorkelImp& imp, int count, const Stretch& stretch, double point) {
  ToleranceKey key = stretch.key;
  for (int n = count - 1, shift = 0; n >= 1; --n, shift += kKeyBits) {
    const double ratio = point / imp.requests.reqOutFreq[static_cast<std::size_t>(n)];
    const bool isMultiple = std::fabs(ratio - std::round(ratio)) <= kRounding * ratio;
    if (isMultiple && (key >> shift & kDigit) == 1) key &= ~(kDigit << shift);
  }
  return key;
}

}  // namespace

VcoRanking RankVcos(const VorkelImp& imp, const Run& run) {
  using Kind = RankedRange::Kind;
  VcoRanking ranking;
  const VcoWindows windows = FindVcoWindows(imp, run);
  if (windows.empty()) return ranking;
  const std::vector<double> multiples = FindMultiples(imp, run.count);

  auto window = windows.begin();
  auto multiple = multiples.begin();
  for (const Stretch& stretch : FindStretches(imp, run.count)) {
    const Kind kind = stretch.isServed ? Kind::kServed : Kind::kUnserved;
    ranking.push_back({stretch.low, stretch.high, stretch.key, kind});
    while (window != windows.end() && window->high < stretch.low) ++window;
    auto accepted = window;
    auto add = [&](double low, double high, ToleranceKey key) {
      while (accepted != windows.end() && accepted->high < low) ++accepted;
      for (auto w = accepted; stretch.isServed && w != windows.end() && w->low <= high; ++w) {
        ranking.push_back({std::max(low, w->low), std::min(high, w->high), key, Kind::kAccepted});
      }
    };
    add(stretch.low, stretch.high, stretch.key);

    accepted = window;
    while (multiple != multiples.end() && *multiple < stretch.low * (1.0 - kRounding)) ++multiple;
    for (auto point = multiple; point != multiples.end(); ++point) {
      if (*point > stretch.high * (1.0 + kRounding)) break;
      const ToleranceKey key = KeyOfPoint(imp, run.count, stretch, *point);
      ranking.push_back({*point, *point, key, kind});
      add(*point, *point, key);
    }
  }
  std::sort(ranking.begin(), ranking.end(), [](const RankedRange& a, const RankedRange& b) {
    return std::tie(a.key, a.kind, a.low) < std::tie(b.key, b.kind, b.low);
  });
  return ranking;
}

}  // namespace Ip::Pll
