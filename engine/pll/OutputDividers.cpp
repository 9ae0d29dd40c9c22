// The dividers of outputs 1 and later: whole numbers, found for each candidate within a
// relative tolerance that starts at 0 for every output and widens until a candidate has one.
//
// The divider of a candidate does not depend on the tolerance, so one evaluation tells the
// narrowest tolerance that the candidate keeps; the candidates that keep the narrowest of all
// are those that the widening would stop at.
//
// Tested by output_dividers_test.cpp.

#include "engine/pll/OutputDividers.h"

#include <algorithm>
#include <array>
#include <cmath>

#include "engine/Numbers.h"
#include "engine/pll/Stages.h"
#include "hardware/Loop.h"

namespace Ip::Pll {

namespace {

constexpr double kSmallestDivider = 1.0;
static_assert(kLargestDivider == hardware::kLargestDivider);
constexpr double kToleranceStep = 0.01;  // a fraction of the requested frequency

// The tolerances, and the one that comes after the last.
constexpr std::array<double, kTolerances + 1> MakeTolerances() {
  std::array<double, kTolerances + 1> tolerances{};
  double tolerance = 0.0;
  for (double& entry : tolerances) {
    entry = tolerance;
    tolerance += kToleranceStep;
  }
  return tolerances;
}
constexpr std::array<double, kTolerances + 1> kToleranceValues = MakeTolerances();

}  // namespace

int FirstTolerance(double error) {
  if (!(error <= kToleranceValues[kTolerances - 1])) return kTolerances;
  // The number may be one off; begin before it.
  int index = error > 0.0 ? std::max(static_cast<int>(error * 100.0) - 1, 0) : 0;
  while (!(error <= kToleranceValues[static_cast<std::size_t>(index)])) ++index;
  return index;
}

namespace {

// Keeps the candidates that serve output n at the smallest tolerance at which any does.
bool FindDivider(VorkelImp& imp, int n, const Run& run) {
  const Trace& trace = run.trace;
  const auto output = static_cast<std::size_t>(n);
  VcoCandidateTable& candidates = imp.pll._vcoCandidates;
  const double requested = imp.requests.reqOutFreq[output];
  const OutputRange range = RangeOfOutput(imp.pllLimits, run.prim, n);
  TRACE(trace, "DLL----- Looking for valid div%d from remaining VCOs\n", n);

  int narrowest = kTolerances;
  VcoCandidateTable::Slots qualified;
  for (const int slot : candidates.Occupied()) {
    VcoCandidate& candidate = candidates[slot];
    const OutputFit fit = FitOutput(candidate.vco, requested, range);
    if (fit.tolerance == kTolerances || fit.tolerance > narrowest) continue;
    if (fit.tolerance < narrowest) {
      narrowest = fit.tolerance;
      qualified.Clear();
    }
    candidate.divN[output] = static_cast<std::uint32_t>(fit.divider);
    candidate.freqDiff[output] = fit.diff;
    qualified.Insert(slot);
  }

  for (int tolerance = 0; tolerance < narrowest; ++tolerance) {
    TRACE(trace, "DLL------ Can't find a clkout%d_divide, so upping threshold to %1.3f!\n", n,
          kToleranceValues[static_cast<std::size_t>(tolerance) + 1]);
  }
  if (narrowest == kTolerances) {
    TRACE(trace, "DLL-- Can't find a clkout%d_divide for all possible thresholds!\n", n);
    return false;
  }
  candidates.KeepOnly(qualified);
  if (!trace.On()) return true;
  for (const int slot : qualified) {
    const VcoCandidate& candidate = candidates[slot];
    const double diff = candidate.freqDiff[output];
    if (diff == 0.0) {
      trace.Print("DLL ---------- for VCO = %f: div%d = %u\n", candidate.vco, n,
                  candidate.divN[output]);
    } else {
      trace.Print("DLL ---------- for VCO = %f: div%d = %u (diff = %1.3f)\n", candidate.vco, n,
                  candidate.divN[output], diff);
    }
  }
  return true;
}

}  // namespace

double Tolerance(int number) { return kToleranceValues[static_cast<std::size_t>(number)]; }

// Output 1 of a PLL may drive an I/O clock, which goes higher; that the others may not is
// meant so.
OutputRange RangeOfOutput(const PllLimits& limits, int prim, int n) {
  const bool ioClock = prim == kPll && n == 1;
  return {limits.clkoutMin, ioClock ? limits.clkoutMaxIo : limits.clkoutMax};
}

OutputFit FitOutput(double vco, double requested, const OutputRange& range) {
  double ratio = vco / requested;
  if (ratio < kSmallestDivider) ratio = kSmallestDivider;
  if (ratio > kLargestDivider) ratio = kLargestDivider;
  const int divider = RoundToInt(ratio);
  const double actual = vco / divider;
  const double diff = std::fabs(actual - requested);
  const bool inRange = actual >= range.min && actual <= range.max;
  return {divider, diff, inRange ? FirstTolerance(diff / requested) : kTolerances};
}

bool FindOutputDividers(VorkelImp& imp, const Run& run) {
  for (int n = 1; n < run.count; ++n) {
    if (!FindDivider(imp, n, run)) return false;
  }
  return true;
}

}  // namespace Ip::Pll
