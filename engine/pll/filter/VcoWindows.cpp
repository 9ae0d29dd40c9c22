#include "engine/pll/filter/VcoWindows.h"

#include <algorithm>
#include <cmath>
#include <limits>

#include "engine/pll/MultiplierSearch.h"
#include "engine/pll/filter/Rounding.h"

namespace Ip::Pll {

namespace {

constexpr double kNoLimit = std::numeric_limits<double>::infinity();

VcoWindow Widened(double low, double high) {
  return {low * (1.0 - kMargin), high * (1.0 + kMargin)};
}

// Adds a window behind those that are there; `window.low` is not below theirs.
void Append(VcoWindows& windows, const VcoWindow& window) {
  if (!(window.low <= window.high)) return;
  if (!windows.empty() && window.low <= windows.back().high) {
    windows.back().high = std::max(windows.back().high, window.high);
  } else {
    windows.push_back(window);
  }
}

// Visits, for each M, the values of D before rounding that the VCO range, the PFD range and the
// bounds of D leave, as far as they lie near a whole number: the VCO frequencies that they make.
// Ends when `visit` returns false.
template <typename Visit>
void VisitWindows(const VorkelImp& imp, const Run& run, Visit visit) {
  const double inFreq = run.inFreq;
  const PllLimits& limits = imp.pllLimits;
  const double pfdMax = PfdMaximum(imp);
  if (!(inFreq > 0.0 && pfdMax > 0.0)) return;
  // A VCO at or below 0, which a negative second input clock lets in, has no D.
  const double minVco = std::max(imp.pll.minAdjVco, inFreq / kDBelow);
  const double dOfPfdMin = limits.pfdMin > 0.0 ? inFreq / limits.pfdMin : kNoLimit;
  for (double m = 1.0; m <= kLargestM; m += 1.0) {
    if (run.prim == kTsyn && m >= kTsynGapBegin && m < kTsynGapEnd) continue;
    const double dLow = std::max({inFreq * m / imp.pll.maxAdjVco, inFreq / pfdMax, kDAbove});
    const double dHigh = std::min({inFreq * m / minVco, dOfPfdMin, kDBelow});
    const VcoWindow wide = Widened(dLow, dHigh);
    for (double d = std::round(wide.low); d <= std::round(wide.high); d += 1.0) {
      const double low = std::max(wide.low, d - kLargestRemainder);
      const double high = std::min(wide.high, d + kLargestRemainder);
      if (!(low <= high && low > 0.0)) continue;
      if (!visit(Widened(inFreq * m / high, inFreq * m / low))) return;
    }
  }
}

}  // namespace

bool HasVcoWindow(const VorkelImp& imp, const Run& run) {
  bool has = false;
  VisitWindows(imp, run, [&](const VcoWindow&) {
    has = true;
    return false;
  });
  return has;
}

VcoWindows FindVcoWindows(const VorkelImp& imp, const Run& run) {
  VcoWindows found;
  VisitWindows(imp, run, [&](const VcoWindow& window) {
    found.push_back(window);
    return true;
  });
  std::sort(found.begin(), found.end(),
            [](const VcoWindow& a, const VcoWindow& b) { return a.low < b.low; });
  VcoWindows windows;
  for (const VcoWindow& window : found) Append(windows, window);
  return windows;
}

}  // namespace Ip::Pll
