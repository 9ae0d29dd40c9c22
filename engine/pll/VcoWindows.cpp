#include "engine/pll/VcoWindows.h"

#include <algorithm>
#include <cmath>
#include <limits>

#include "engine/pll/MultiplierSearch.h"
#include "engine/pll/OutputDividers.h"

namespace Ip::Pll {

namespace {

constexpr double kMargin = 1e-9;  // relative
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

// Where an M and a D are found: for each M the values of D before rounding that the VCO range,
// the PFD range and the bounds of D leave, as far as they lie near a whole number.
VcoWindows WindowsOfMAndD(const VorkelImp& imp, const Run& run) {
  const double inFreq = run.inFreq;
  const PllLimits& limits = imp.pllLimits;
  const double pfdMax = PfdMaximum(imp);
  VcoWindows found;
  if (!(inFreq > 0.0 && pfdMax > 0.0)) return found;
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
      if (low <= high && low > 0.0) found.push_back(Widened(inFreq * m / high, inFreq * m / low));
    }
  }
  std::sort(found.begin(), found.end(),
            [](const VcoWindow& a, const VcoWindow& b) { return a.low < b.low; });
  VcoWindows windows;
  for (const VcoWindow& window : found) Append(windows, window);
  return windows;
}

}  // namespace

void Intersect(const VcoWindows& a, const VcoWindows& b, VcoWindows& common) {
  common.clear();
  for (std::size_t i = 0, j = 0; i < a.size() && j < b.size();) {
    Append(common, {std::max(a[i].low, b[j].low), std::min(a[i].high, b[j].high)});
    a[i].high < b[j].high ? ++i : ++j;
  }
}

void FindOutputWindows(const VorkelImp& imp, int n, int tolerance, VcoWindows& windows) {
  const double f = imp.requests.reqOutFreq[static_cast<std::size_t>(n)];
  const OutputRange range = RangeOfOutput(imp.pllLimits, n);
  windows.clear();
  // A negative request, -0 among them, takes a divider of 1 and keeps every tolerance.
  if (std::signbit(f) && std::isfinite(f)) Append(windows, Widened(range.min, range.max));
  if (!(f > 0.0) || !std::isfinite(f)) return;
  const double slowest = f * (1.0 - Tolerance(tolerance));
  const double fastest = f * (1.0 + Tolerance(tolerance));
  for (double divider = 1.0; divider <= kLargestDivider; divider += 1.0) {
    // Ratios that round to the divider, frequencies within the tolerance, the output range.
    const double low = std::max({divider == 1.0 ? 0.0 : (divider - 0.5) * f, divider * slowest,
                                 divider * range.min});
    const double high = std::min({divider == kLargestDivider ? kNoLimit : (divider + 0.5) * f,
                                  divider * fastest, divider * range.max});
    Append(windows, Widened(low, high));
  }
}

VcoWindows FindVcoWindows(const VorkelImp& imp, const Run& run) {
  VcoWindows windows = WindowsOfMAndD(imp, run);
  VcoWindows ofOutput;
  VcoWindows common;
  for (int n = 1; n < run.count && !windows.empty(); ++n) {
    FindOutputWindows(imp, n, kTolerances - 1, ofOutput);
    Intersect(windows, ofOutput, common);
    windows.swap(common);
  }
  return windows;
}

}  // namespace Ip::Pll
