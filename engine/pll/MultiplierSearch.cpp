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

}  // namespace

bool SearchMAndD(VcoCandidate& candidate, double pfdMin, double pfdMax, bool integerStep,
                 const Run& run) {
  const double inFreq = run.inFreq;
  const Trace& trace = run.trace;
  const bool hasGap = run.prim == kTsyn;
  TRACE(trace, "DLL - RK --> _prim = %d \n", VorkelImp::_prim);
  double m = 1.0;
  for (int trial = 0; trial < kTrials; ++trial) {
    if (trial == 1) m = 2.0;
    if (trial > 1) m += integerStep ? kIntegerStep : kFractionalStep;
    if (hasGap && m >= kTsynGapBegin && m < kTsynGapEnd) {
      m = kTsynGapEnd;
    } else if (m > kLargestM) {
      return false;
    }
    const double realD = inFreq * m / candidate.vco;
    if (!(realD > kDAbove && realD < kDBelow)) continue;
    const double pfd = inFreq / realD;
    if (!(pfd >= pfdMin && pfd <= pfdMax)) continue;
    const int d = RoundToInt(realD);
    const double remainder = std::fabs(d - realD);
    if (!(remainder < kLargestRemainder)) continue;

    candidate.m = m;
    candidate.d = static_cast<std::uint32_t>(d);
    if (remainder == 0.0) {
      TRACE(trace, "DLL-- For VCO = %f: M = %f, D = (float) %f, (int) %d\n", candidate.vco, m,
            realD, d);
    } else {
      TRACE(trace, "DLL-- For VCO = %f: M = %f, D = (float) %f, (int) %d; remainder = %f\n",
            candidate.vco, m, realD, d, remainder);
    }
    return true;
  }
  return false;
}

bool CalculateMAndD(VorkelImp& imp, bool integerStep, const Run& run) {
  VcoCandidateTable& candidates = imp.pll._vcoCandidates;
  const Trace& trace = run.trace;
  TRACE(trace, "DLL------- Calculating M and D\n");
  const double pfdMax = PfdMaximum(imp);
  if (imp.lowBandwidth) {
    TRACE(trace, "DLL  --- Using _maxPfdLowB (%f) for PFD max\n", pfdMax);
  }
  for (const int slot : candidates.Occupied()) {
    if (!SearchMAndD(candidates[slot], imp.pllLimits.pfdMin, pfdMax, integerStep, run)) {
      candidates.Empty(slot);
    }
  }
  if (candidates.Occupied().IsEmpty()) {
    TRACE(trace, "DLL------------ No valid M and D was found!\n");
    return false;
  }
  return true;
}

}  // namespace Ip::Pll
