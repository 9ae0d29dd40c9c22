// Range, VCO candidates, output dividers, M and D of the plain PLL/TSYN solver.

#include <cmath>

#include "plain_numbers.h"
#include "plain_pll.h"
#include "plain_pll_stages.h"

namespace plain {
namespace {

constexpr double kMaxDivider = 128.0;
constexpr int kDividerTries = 27;
constexpr double kDividerToleranceStep = 0.01;  // fraction of the requested frequency
constexpr int kMultiplierTrials = 498;
constexpr double kMaxM = 64.0;
constexpr double kMaxRemainder = 0.0005;

}  // namespace

int PrepareVcoRange(const PllRequest& request, const PllLimits& limits, RequestLists& lists,
                    PllState& state, Trace& trace) {
  if (!ParseList(request.outFreqs, request.count, kMaxOutputs, lists.outFreq)) return kBadRequest;
  if (request.inFreq == 0.0) return kBadRequest;
  const bool known_primitive = request.prim == kPrimPll || request.prim == kPrimTsyn;
  if (!known_primitive || !limits.readable) return kNoLimits;

  state.minAdjVco = limits.vcoMin;
  state.maxAdjVco = limits.vcoMax;
  if (request.inFreq2 != 0.0) {
    // M and D serve both input clocks, so the VCO must stay in range for the other one, too.
    if (request.inFreq >= request.inFreq2) {
      state.minAdjVco = limits.vcoMin * (request.inFreq / request.inFreq2);
    } else {
      state.maxAdjVco = limits.vcoMax / (request.inFreq2 / request.inFreq);
    }
  }
  state.minM = state.minAdjVco / request.inFreq;
  state.maxM = state.maxAdjVco / request.inFreq;
  trace.Print("DLL---- minAdjVco = %f\n", state.minAdjVco);
  trace.Print("DLL---- maxAdjVco = %f\n", state.maxAdjVco);
  trace.Print("DLL---- minM = %f\n", state.minM);
  trace.Print("DLL---- maxM = %f\n", state.maxM);
  if (state.minM > state.maxM || state.minAdjVco > state.maxAdjVco) {
    trace.Print("DLL---- There is no valid working range for either VCO or M!\n");
    return kEmptyRange;
  }
  return kSolved;
}

int EnumerateVcoCandidates(double outFreq0, double fudge, bool integerMode, PllState& state,
                           Trace& trace) {
  trace.Print("DLL--- Using fudged oFreq = %3.3f (ofreq: %3.3f, fudge: %2.3f)\n", outFreq0 + fudge,
              outFreq0, fudge);
  int created = 0;
  double step = 0.0;
  for (std::size_t k = 0; k < kMaxVcoCandidates; ++k) {
    if (k == 0) {
      step = 1.0;
    } else if (k == 1) {
      step = 2.0;
    } else {
      step += integerMode ? 1.0 : 0.125;
    }
    if (step > kMaxDivider) break;

    const double vco = (fudge + outFreq0) * step;
    if (!InRange(vco, state.minAdjVco, state.maxAdjVco)) continue;
    trace.Print("DLL----- Found valid VCO = %4.3f and div0 = %3.3f (ofreq0_fudge = %1.3f)\n", vco,
                step, fudge);
    VcoCandidate candidate;
    candidate.vco = vco;
    candidate.div0 = integerMode ? WholeNumber(step + 0.5) : step;
    state.candidates[k] = candidate;
    ++created;
  }
  if (created == 0) {
    trace.Print("DLL----- NO VCO/Div0 pairs found for ofreq0_fudge = %1.3f!\n", fudge);
  }
  return created;
}

namespace {

// One try at one tolerance: gives a divider of output n to every candidate that has one, and marks
// it. Returns how many were marked.
int TryOutputDivider(int n, double tolerance, const PllLimits& limits, const RequestLists& lists,
                     PllState& state, std::vector<bool>& marked, Trace& trace) {
  const double requested = lists.outFreq[n];
  // Output 1 of a PLL alone may drive an I/O clock.
  const double max_output =
      state.prim == kPrimPll && n == 1 ? limits.clkoutMaxIo : limits.clkoutMax;
  int qualified = 0;
  for (std::size_t k = 0; k < state.candidates.size(); ++k) {
    if (!state.candidates[k]) continue;
    VcoCandidate& candidate = *state.candidates[k];
    double ratio = candidate.vco / requested;
    if (ratio < 1.0) ratio = 1.0;
    if (ratio > kMaxDivider) ratio = kMaxDivider;
    const int divider = WholeNumber(ratio + 0.5);
    const double actual = candidate.vco / divider;
    const double diff = std::fabs(actual - requested);
    if (!(diff / requested <= tolerance)) continue;
    if (!(actual >= limits.clkoutMin && actual <= max_output)) continue;

    candidate.divN[n] = divider;
    candidate.freqDiff[n] = diff;
    marked[k] = true;
    ++qualified;
    if (diff == 0.0) {
      trace.Print("DLL ---------- for VCO = %f: div%d = %d\n", candidate.vco, n, divider);
    } else {
      trace.Print("DLL ---------- for VCO = %f: div%d = %d (diff = %1.3f)\n", candidate.vco, n,
                  divider, diff);
    }
  }
  return qualified;
}

bool FindDividersOfOutput(int n, const PllLimits& limits, const RequestLists& lists,
                          PllState& state, Trace& trace) {
  double tolerance = 0.0;
  std::vector<bool> marked(state.candidates.size(), false);
  trace.Print("DLL----- Looking for valid div%d from remaining VCOs\n", n);
  int retries = 0;
  while (TryOutputDivider(n, tolerance, limits, lists, state, marked, trace) == 0) {
    tolerance += kDividerToleranceStep;
    trace.Print("DLL------ Can't find a clkout%d_divide, so upping threshold to %1.3f!\n", n,
                tolerance);
    ++retries;
    if (retries == kDividerTries) {
      trace.Print("DLL-- Can't find a clkout%d_divide for all possible thresholds!\n", n);
      return false;
    }
  }
  for (std::size_t k = 0; k < state.candidates.size(); ++k) {
    if (!marked[k]) state.candidates[k].reset();
  }
  return true;
}

}  // namespace

bool FindOutputDividers(int count, const PllLimits& limits, const RequestLists& lists,
                        PllState& state, Trace& trace) {
  for (int n = 1; n < count; ++n) {
    if (!FindDividersOfOutput(n, limits, lists, state, trace)) return false;
  }
  return true;
}

namespace {

// Finds M and D of one candidate; false when it has none.
bool SearchMAndD(VcoCandidate& candidate, double inFreq, double pfdMin, double pfdMax,
                 bool integerStep, int prim, Trace& trace) {
  trace.Print("DLL - RK --> _prim = %d \n", prim);
  double m = 0.0;
  for (int i = 0; i < kMultiplierTrials; ++i) {
    if (i == 0) {
      m = 1.0;
    } else if (i == 1) {
      m = 2.0;
    } else {
      m += integerStep ? 1.0 : 0.125;
    }
    if (prim == kPrimTsyn && m >= 2.0 && m < 5.0) {
      m = 5.0;  // a TSYN has no multiplier between 1 and 5
    } else if (m > kMaxM) {
      return false;
    }

    const double d = inFreq * m / candidate.vco;
    if (!(0.5 < d && d < 80.5)) continue;
    if (!InRange(inFreq / d, pfdMin, pfdMax)) continue;
    const int whole_d = WholeNumber(d + 0.5);
    const double remainder = std::fabs(whole_d - d);
    if (!(remainder < kMaxRemainder)) continue;

    candidate.m = m;
    candidate.d = whole_d;
    if (remainder == 0.0) {
      trace.Print("DLL-- For VCO = %f: M = %f, D = (float) %f, (int) %d\n", candidate.vco, m, d,
                  whole_d);
    } else {
      trace.Print("DLL-- For VCO = %f: M = %f, D = (float) %f, (int) %d; remainder = %f\n",
                  candidate.vco, m, d, whole_d, remainder);
    }
    return true;
  }
  return false;
}

}  // namespace

bool CalculateMAndD(const PllRequest& request, const PllLimits& limits, bool integerStep,
                    PllState& state, Trace& trace) {
  trace.Print("DLL------- Calculating M and D\n");
  double pfd_max = limits.pfdMax;
  if (request.lowBandwidth) {
    pfd_max = limits.maxPfdLowB;
    trace.Print("DLL  --- Using _maxPfdLowB (%f) for PFD max\n", limits.maxPfdLowB);
  }
  bool any = false;
  for (std::optional<VcoCandidate>& slot : state.candidates) {
    if (!slot) continue;
    if (SearchMAndD(*slot, request.inFreq, limits.pfdMin, pfd_max, integerStep, state.prim,
                    trace)) {
      any = true;
    } else {
      slot.reset();
    }
  }
  if (!any) trace.Print("DLL------------ No valid M and D was found!\n");
  return any;
}

}  // namespace plain
