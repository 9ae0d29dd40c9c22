// The dividers of outputs 1 and later: whole numbers, found for each candidate within a
// relative tolerance that starts at 0 for every output and widens until a candidate has one.
//
// Tested by output_dividers_test.cpp.

#include <cmath>

#include "engine/Numbers.h"
#include "engine/pll/Stages.h"

namespace Ip::Pll {

namespace {

constexpr double kSmallestDivider = 1.0;
constexpr double kLargestDivider = 128.0;
constexpr double kToleranceStep = 0.01;  // a fraction of the requested frequency
constexpr int kTolerances = 27;          // 0.00, 0.01, ... 0.26

// The highest frequency of output n. Output 1 of a PLL may drive an I/O clock, which goes
// higher; that the others may not is meant so.
double OutputMaximum(const PllLimits& limits, int n) {
  return VorkelImp::_prim == kPll && n == 1 ? limits.clkoutMaxIo : limits.clkoutMax;
}

// Tries output n on one candidate; on success stores its divider.
bool TryDivider(VcoCandidate& candidate, int n, double requested, double tolerance,
                const PllLimits& limits, const Trace& trace) {
  double ratio = candidate.vco / requested;
  if (ratio < kSmallestDivider) ratio = kSmallestDivider;
  if (ratio > kLargestDivider) ratio = kLargestDivider;
  const int divider = RoundToInt(ratio);
  const double actual = candidate.vco / divider;
  const double diff = std::fabs(actual - requested);
  // Written so that a NaN, which a request can be, fails.
  if (!(diff / requested <= tolerance)) return false;
  if (!(actual >= limits.clkoutMin && actual <= OutputMaximum(limits, n))) return false;

  const auto output = static_cast<std::size_t>(n);
  candidate.divN[output] = static_cast<std::uint32_t>(divider);
  candidate.freqDiff[output] = diff;
  if (diff == 0.0) {
    TRACE(trace, "DLL ---------- for VCO = %f: div%d = %d\n", candidate.vco, n, divider);
  } else {
    TRACE(trace, "DLL ---------- for VCO = %f: div%d = %d (diff = %1.3f)\n", candidate.vco, n,
          divider, diff);
  }
  return true;
}

// Keeps the candidates that serve output n at the smallest tolerance at which any does.
bool FindDivider(VorkelImp& imp, int n, const Trace& trace) {
  VcoCandidateTable& candidates = imp.pll._vcoCandidates;
  const double requested = imp.requests.reqOutFreq[static_cast<std::size_t>(n)];
  TRACE(trace, "DLL----- Looking for valid div%d from remaining VCOs\n", n);
  double tolerance = 0.0;
  for (int retries = 0; retries < kTolerances; ++retries) {
    VcoCandidateTable::Slots qualified;
    for (const int slot : candidates.Occupied()) {
      if (TryDivider(candidates[slot], n, requested, tolerance, imp.pllLimits, trace)) {
        qualified.Insert(slot);
      }
    }
    if (!qualified.IsEmpty()) {
      candidates.KeepOnly(qualified);
      return true;
    }
    tolerance += kToleranceStep;
    TRACE(trace, "DLL------ Can't find a clkout%d_divide, so upping threshold to %1.3f!\n", n,
          tolerance);
  }
  TRACE(trace, "DLL-- Can't find a clkout%d_divide for all possible thresholds!\n", n);
  return false;
}

}  // namespace

bool FindOutputDividers(VorkelImp& imp, int count, const Trace& trace) {
  for (int n = 1; n < count; ++n) {
    if (!FindDivider(imp, n, trace)) return false;
  }
  return true;
}

}  // namespace Ip::Pll
