// The feedback multiplier M and the input divider D of each candidate: the smallest M for
// which a whole D gives the candidate's VCO and the phase-frequency detector is in its range.
//
// Tested by multiplier_search_test.cpp.

#include "engine/pll/MultiplierSearch.h"

#include <cmath>

#include "engine/Numbers.h"
#include "engine/pll/Stages.h"
#include "hardware/Loop.h"

namespace Ip::Pll {

namespace {

constexpr int kTrials = 498;  // fractional steps from 1 to 64: 1, 2 and then 62 x 8
constexpr double kIntegerStep = 1.0;
constexpr double kFractionalStep = 0.125;

// What the search counts with is what the hardware has.
static_assert(kLargestM == hardware::kLargestM);
static_assert(kTsynGapEnd == hardware::kSmallestTsynM);
static_assert(kDBelow == hardware::kLargestD + 0.5);
static_assert(kFractionalStep * hardware::kEighths == 1.0);

// Whether M gives the candidate a whole D and a PFD frequency in its range; takes both then.
bool TakeM(VcoCandidate& candidate, double m, double pfdMin, double pfdMax, const Run& run) {
  const double realD = run.inFreq * m / candidate.vco;
  if (!(realD > kDAbove && realD < kDBelow)) return false;
  const double pfd = run.inFreq / realD;
  if (!(pfd >= pfdMin && pfd <= pfdMax)) return false;
  const int d = RoundToInt(realD);
  const double remainder = std::fabs(d - realD);
  if (!(remainder < kLargestRemainder)) return false;

  candidate.m = m;
  candidate.d = static_cast<std::uint32_t>(d);
  if (remainder == 0.0) {
    TRACE(run.trace, "DLL-- For VCO = %f: M = %f, D = (float) %f, (int) %d\n", candidate.vco, m,
          realD, d);
  } else {
    TRACE(run.trace, "DLL-- For VCO = %f: M = %f, D = (float) %f, (int) %d; remainder = %f\n",
          candidate.vco, m, realD, d, remainder);
  }
  return true;
}

bool IsInGap(double m, const Run& run) {
  return run.prim == kTsyn && m >= kTsynGapBegin && m < kTsynGapEnd;
}

// The smallest M by going through all.
bool WalkM(VcoCandidate& candidate, double pfdMin, double pfdMax, double step, const Run& run) {
  double m = 1.0;
  for (int trial = 0; trial < kTrials; ++trial) {
    if (trial == 1) m = 2.0;
    if (trial > 1) m += step;
    if (IsInGap(m, run)) {
      m = kTsynGapEnd;
    } else if (m > kLargestM) {
      return false;
    }
    if (TakeM(candidate, m, pfdMin, pfdMax, run)) return true;
  }
  return false;
}

// Frequencies, MHz, between which the quotients of two are far from the ends of what a double
// can be.
constexpr double kSmallestUsual = 1e-100;
constexpr double kLargestUsual = 1e100;

bool IsUsual(double frequency) {
  return frequency >= kSmallestUsual && frequency <= kLargestUsual;
}

// The same by going through D, of which there are mostly fewer. With D an M can be no other than
// the one nearest to D x VCO / input: that, being at most 64, is off by at most 64 x 0.0005, a
// quarter of the smallest step, roundings included. And a larger D has no smaller M.
bool WalkD(VcoCandidate& candidate, double pfdMin, double pfdMax, double step, const Run& run) {
  if (!(pfdMin <= pfdMax && pfdMax > 0.0)) return false;
  const double ratio = candidate.vco / run.inFreq;
  // With room for the remainder and for roundings.
  const double first = std::floor(std::fmax(run.inFreq / pfdMax - 1.0, 1.0));
  const double last = pfdMin > 0.0 ? run.inFreq / pfdMin + 1.0 : kDBelow;
  // How far D x VCO / input may be from M, with the same room.
  const double furthest = 2.0 * kLargestRemainder * ratio;
  const double perStep = 1.0 / step;  // exact: a power of 2
  for (double d = first; d < kDBelow && d <= last; d += 1.0) {
    const double realM = d * ratio;
    if (realM >= kLargestM + 1.0) return false;
    const double m = static_cast<int>(realM * perStep + 0.5) * step;
    if (std::fabs(m - realM) > furthest) continue;
    if (m > kLargestM) return false;
    const bool exists = m == 1.0 || (m >= 2.0 && !IsInGap(m, run));
    if (exists && TakeM(candidate, m, pfdMin, pfdMax, run)) return true;
  }
  return false;
}

}  // namespace

bool SearchMAndD(VcoCandidate& candidate, double pfdMin, double pfdMax, bool integerStep,
                 const Run& run) {
  TRACE(run.trace, "DLL - RK --> _prim = %d \n", VorkelImp::_prim);
  // No D makes a VCO below 0 of an input above 0.
  if (candidate.vco < 0.0 && run.inFreq > 0.0) return false;
  const double step = integerStep ? kIntegerStep : kFractionalStep;
  const bool isUsual = IsUsual(run.inFreq) && IsUsual(candidate.vco);
  return (isUsual ? WalkD : WalkM)(candidate, pfdMin, pfdMax, step, run);
}

namespace {

// Finds M and D of the candidate in a slot, or drops it.
bool TakeOrDrop(VorkelImp& imp, int slot, bool integerStep, const Run& run) {
  VcoCandidate& candidate = imp.pll._vcoCandidates[slot];
  if (!SearchMAndD(candidate, imp.pllLimits.pfdMin, PfdMaximum(imp), integerStep, run)) {
    imp.pll._vcoCandidates.Empty(slot);
    return false;
  }
  candidate.ClearWhatIsLeft(run.count);
  return true;
}

}  // namespace

bool CalculateMAndD(VorkelImp& imp, bool integerStep, const Run& run, int enough) {
  VcoCandidateTable& candidates = imp.pll._vcoCandidates;
  const Trace& trace = run.trace;
  TRACE(trace, "DLL------- Calculating M and D\n");
  if (imp.lowBandwidth) {
    TRACE(trace, "DLL  --- Using _maxPfdLowB (%f) for PFD max\n", PfdMaximum(imp));
  }
  int found = 0;
  for (const int slot : candidates.Occupied()) {
    if (found == enough) {
      candidates.Empty(slot);
    } else if (TakeOrDrop(imp, slot, integerStep, run)) {
      ++found;
    }
  }
  if (found == 0) {
    TRACE(trace, "DLL------------ No valid M and D was found!\n");
    return false;
  }
  return true;
}

void FindFirstValidVcos(VorkelImp& imp, double outFreq0, const Div0Steps& steps, const Run& run,
                        int enough) {
  int found = 0;
  VisitVcos(imp.pll, steps, outFreq0, [&](int slot, double vco) {
    imp.pll._vcoCandidates.Put(slot, vco, steps[slot]);
    if (TakeOrDrop(imp, slot, true, run)) ++found;
    return found < enough;
  });
}

}  // namespace Ip::Pll
