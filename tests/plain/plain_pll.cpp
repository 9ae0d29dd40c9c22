// Passes, fudge loop, choice and answer of the plain PLL/TSYN solver.

#include "plain_pll.h"

#include "plain_pll_stages.h"

namespace plain {
namespace {

constexpr double kFudgeStep = 0.001;   // MHz
constexpr double kLastFudge = 10.999;  // MHz

int CountAccepted(const PllState& state) {
  int accepted = 0;
  for (const std::optional<VcoCandidate>& slot : state.candidates) {
    if (slot && slot->Accepted()) ++accepted;
  }
  return accepted;
}

// The accepted candidate with the smallest VCO; the first of several equal ones.
std::optional<std::size_t> SmallestAcceptedVco(const PllState& state) {
  std::optional<std::size_t> chosen;
  for (std::size_t k = 0; k < state.candidates.size(); ++k) {
    const std::optional<VcoCandidate>& slot = state.candidates[k];
    if (!slot || !slot->Accepted()) continue;
    if (!chosen || slot->vco < state.candidates[*chosen]->vco) chosen = k;
  }
  return chosen;
}

// The divider of output n; 0 when there is none.
double DividerOfOutput(const VcoCandidate& candidate, int n) {
  if (n == 0) return candidate.div0 - candidate.freqDiff[0];
  if (n >= 1 && n < kMaxOutputs) return candidate.divN[n];
  return 0.0;
}

double FrequencyOfOutput(const VcoCandidate& candidate, int n) {
  const double divider = DividerOfOutput(candidate, n);
  if (divider == 0.0 || candidate.vco == 0.0) return 0.0;
  return candidate.vco / divider;
}

void TraceChosen(const PllRequest& request, const RequestLists& lists, const PllState& state,
                 Trace& trace) {
  const VcoCandidate& chosen = *state.candidates[*state.chosen];
  trace.Print("DLL - chosen VCO = %f\n", chosen.vco);
  trace.Print("DLL - chosen M = %f\n", chosen.m);
  trace.Print("DLL - chosen D = %d\n", chosen.d);
  trace.Print("DLL - chosen CLKOUT0_DIVIDE_F = %f\n", chosen.div0);
  for (int n = 1; n < request.count; ++n) {
    trace.Print("DLL - chosen CLKOUT%d_DIVIDE = %d\n", n, chosen.divN[n]);
  }
  for (int n = 0; n < request.count; ++n) {
    trace.Print("DLL-- chosen clkout%d output freq = %f (req = %3.3f)\n", n,
                FrequencyOfOutput(chosen, n), lists.outFreq[n]);
    if (!request.closest) continue;
    trace.Print("DLL -   chosen clkout%d phase = %f (req = %3.3f)\n", n, chosen.phase[n],
                lists.phase[n]);
    trace.Print("DLL -   chosen clkout%d duty cycle = %f (req = %3.3f)\n", n, chosen.dutyCycle[n],
                lists.dutyCycle[n]);
  }
}

// Chooses among several accepted candidates.
std::optional<std::size_t> ChooseAmongSeveral(const PllRequest& request, const PllLimits& limits,
                                              const RequestLists& lists, PllState& state,
                                              Trace& trace) {
  if (!request.closest) {
    trace.Print("DLL------------ finding the smallest VCO\n");
    return SmallestAcceptedVco(state);
  }
  GetPhasesAndDutyCycles(request, limits, lists, state, trace);
  return SelectPhaseSolution(request, limits, state, trace);
}

bool UsesIntegerDiv0(const PllRequest& request) {
  if (request.prim == kPrimPll) return true;
  return request.prim == kPrimTsyn && (request.count >= 6 || request.intDiv0Only);
}

// Runs the searches on what an attempt has enumerated. False when they leave nothing to choose
// from.
bool SearchDividersAndM(const PllRequest& request, const PllLimits& limits,
                        const RequestLists& lists, PllState& state, Trace& trace) {
  if (request.count > 1 &&
      !FindOutputDividers(request.count, limits, lists, state, trace)) {
    return false;
  }
  return CalculateMAndD(request, limits, true, state, trace);
}

// Counts what is left and chooses. True when a candidate was chosen.
bool ChooseCandidate(const PllRequest& request, const PllLimits& limits,
                     const RequestLists& lists, PllState& state, Trace& trace) {
  const int accepted = CountAccepted(state);
  trace.Print("DLL---- number of valid VCOs: %d\n", accepted);
  if (accepted == 1) {
    state.chosen = SmallestAcceptedVco(state);
    GetPhasesAndDutyCycles(request, limits, lists, state, trace);
  } else if (accepted > 1) {
    state.chosen = ChooseAmongSeveral(request, limits, lists, state, trace);
  }
  if (!state.chosen) return false;
  TraceChosen(request, lists, state, trace);
  return true;
}

// Runs passes with a growing fudge. True when one has chosen; `fudge` then is its fudge.
bool RunFudgeLoop(const PllRequest& request, const PllLimits& limits, const RequestLists& lists,
                  PllState& state, double& fudge, Trace& trace) {
  fudge = 0.0;
  do {
    if (SolverPass(fudge, request, limits, lists, state, trace)) return true;
    fudge += kFudgeStep;
    trace.Print("DLL- NO VALID VCOs found, so upping div0 fudge to %1.3f!\n", fudge);
  } while (!(fudge > kLastFudge));
  trace.Print("DLL- NO VALID VCOs found for all possible div0 fudges!\n");
  return false;
}

int Run(const PllRequest& request, const PllLimits& limits, RequestLists& lists, PllState& state,
        double& fudge, Trace& trace) {
  if (request.closest) {
    trace.Print("DLL- starting to get closest solution\n");
    const bool phases_read = ParseList(request.phases, request.count, kMaxOutputs, lists.phase);
    const bool duty_cycles_read =
        ParseList(request.dutyCycles, request.count, kMaxOutputs, lists.dutyCycle);
    if (!phases_read || !duty_cycles_read) return kBadRequest;
  } else {
    trace.Print("DLL- starting to calculate min power output frequencies\n");
  }
  const int range = PrepareVcoRange(request, limits, lists, state, trace);
  if (range != kSolved) return range;
  return RunFudgeLoop(request, limits, lists, state, fudge, trace) ? kSolved : kNoConfiguration;
}

void CopyChosen(const VcoCandidate& chosen, PllAnswer& answer) {
  answer.chosen = true;
  answer.vco = chosen.vco;
  answer.m = chosen.m;
  answer.d = chosen.d;
  answer.div0 = chosen.div0 - chosen.freqDiff[0];
  for (int n = 0; n < kMaxOutputs; ++n) {
    answer.divN[n] = n == 0 ? 0 : chosen.divN[n];
    answer.outFreq[n] = FrequencyOfOutput(chosen, n);
    answer.phase[n] = chosen.phase[n];
    answer.dutyCycle[n] = chosen.dutyCycle[n];
  }
}

}  // namespace

bool SolverPass(double fudge, const PllRequest& request, const PllLimits& limits,
                const RequestLists& lists, PllState& state, Trace& trace) {
  for (std::optional<VcoCandidate>& slot : state.candidates) slot.reset();
  state.chosen.reset();
  state.prim = request.prim;
  const bool integer_mode = UsesIntegerDiv0(request);

  int enumerated = 0;
  for (int attempt = 1; attempt <= 2; ++attempt) {
    // The second attempt keeps what the first one left in the table. Without a fudge there is no
    // other direction, and it only goes over that once more.
    if (attempt == 1) {
      enumerated = EnumerateVcoCandidates(lists.outFreq[0], fudge, integer_mode, state, trace);
    } else if (fudge != 0.0) {
      enumerated =
          EnumerateVcoCandidates(lists.outFreq[0], 0.0 - fudge, integer_mode, state, trace);
    }
    if (enumerated > 0 && !SearchDividersAndM(request, limits, lists, state, trace)) continue;
    if (ChooseCandidate(request, limits, lists, state, trace)) return true;
  }
  return false;
}

PllAnswer SolvePll(const PllRequest& request, const PllLimits& limits, RequestLists& lists,
                   Trace& trace) {
  PllAnswer answer;
  PllState state;
  double fudge = 0.0;
  answer.code = Run(request, limits, lists, state, fudge, trace);
  answer.minAdjVco = state.minAdjVco;
  answer.maxAdjVco = state.maxAdjVco;
  answer.minM = state.minM;
  answer.maxM = state.maxM;
  if (answer.code == kSolved) {
    answer.fudge = fudge;
    CopyChosen(*state.candidates[*state.chosen], answer);
  }
  return answer;
}

bool GoesFar(const PllRequest& request, const PllLimits& limits, RequestLists lists,
             int passes) {
  PllState state;
  Trace trace(false);
  if (PrepareVcoRange(request, limits, lists, state, trace) != kSolved) return false;
  if (request.closest) {
    ParseList(request.phases, request.count, kMaxOutputs, lists.phase);
    ParseList(request.dutyCycles, request.count, kMaxOutputs, lists.dutyCycle);
  }
  double fudge = 0.0;
  for (int pass = 0; pass < passes; ++pass, fudge += kFudgeStep) {
    if (SolverPass(fudge, request, limits, lists, state, trace)) return false;
  }
  return true;
}

}  // namespace plain
