// One pass of the search: the stages one after the other for one fudge of the output-0
// frequency, upward and then downward, and the choice among the candidates that get through.
//
// Tested by solver_pass_test.cpp.

#include "engine/pll/Stages.h"

namespace Ip::Pll {

namespace {

// Outputs from which a TSYN has only whole dividers on output 0.
constexpr int kOutputsWithIntegerDiv0 = 6;

// The valid VCOs: the candidates that have an M and a D. An upward attempt that ended before
// the M and D search leaves candidates without them in the table; they do not count.
int CountValidVcos(const VcoCandidateTable& candidates) {
  int count = 0;
  for (const int slot : candidates.Occupied()) {
    if (candidates[slot].HasMAndD()) ++count;
  }
  return count;
}

// In the smallest-VCO mode two valid candidates tell what is chosen: the first one, when VCOs rise
// with the slots; and whether it is the only one decides about its phases.
constexpr int kEnoughRisingVcos = 2;

// Whether the first valid candidate will be chosen. With a trace, all others have lines, too.
bool FirstIsChosen(const VorkelImp& imp, double outFreq0, const Run& run) {
  return imp.pll._minPowerMode && !run.trace.On() && outFreq0 > 0.0 &&
         imp.pll._vcoCandidates.Occupied().IsEmpty();
}

// Finds all that the candidates still lack. False when an output or M and D leave none.
bool ServeCandidates(VorkelImp& imp, int enough, const Run& run) {
  return FindOutputDividers(imp, run) && CalculateMAndD(imp, true, run, enough);
}

// The valid candidate with the smallest VCO, the first of several.
const VcoCandidate* SmallestVco(const VcoCandidateTable& candidates) {
  const VcoCandidate* smallest = nullptr;
  for (const int slot : candidates.Occupied()) {
    const VcoCandidate& candidate = candidates[slot];
    if (!candidate.HasMAndD()) continue;
    if (smallest == nullptr || candidate.vco < smallest->vco) smallest = &candidate;
  }
  return smallest;
}

// Chooses among the valid candidates; null when there is none or none comes close enough.
// Either every candidate in the table is valid or none is: the M and D search works on the
// whole table, and what it has accepted is only ever dropped.
const VcoCandidate* Choose(VorkelImp& imp, const Run& run) {
  const int count = CountValidVcos(imp.pll._vcoCandidates);
  TRACE(run.trace, "DLL---- number of valid VCOs: %d\n", count);
  if (count == 0) return nullptr;
  if (count == 1) {
    GetPhasesAndDutyCycles(imp, run);
    return SmallestVco(imp.pll._vcoCandidates);
  }
  if (imp.pll._minPowerMode) {
    TRACE(run.trace, "DLL------------ finding the smallest VCO\n");
    return SmallestVco(imp.pll._vcoCandidates);
  }
  GetPhasesAndDutyCycles(imp, run);
  return SelectPhaseSolution(imp, run);
}

}  // namespace

bool HasIntegerDiv0(const VorkelImp& imp, const Run& run) {
  if (run.prim == kPll) return true;
  return run.prim == kTsyn && (run.count >= kOutputsWithIntegerDiv0 || imp.pll._intDiv0Only);
}

bool SolverPass(VorkelImp& imp, double fudge, const Run& run) {
  PllState& pll = imp.pll;
  pll._vcoCandidates.EmptyAll();
  pll.chosen = nullptr;
  VorkelImp::_prim = run.prim;
  const Div0Steps steps(HasIntegerDiv0(imp, run));

  // The table is not emptied between the attempts: what the upward one has left takes part in
  // the downward one. With a fudge of 0 there is nothing to enumerate downward, and the second
  // attempt goes over what the first has left once more, with the first one's count.
  int created = 0;
  for (const bool upward : {true, false}) {
    const double outFreq0 = imp.requests.reqOutFreq[0];
    const double shift = upward ? fudge : 0.0 - fudge;
    const bool enumerates = upward || fudge != 0.0;
    const bool firstIsChosen = FirstIsChosen(imp, outFreq0 + shift, run);
    if (firstIsChosen && run.count == 1) {
      if (enumerates) FindFirstValidVcos(imp, outFreq0 + shift, steps, run, kEnoughRisingVcos);
    } else {
      if (enumerates) created = EnumerateVcoCandidates(imp, outFreq0, shift, steps, run.trace);
      const int enough = firstIsChosen ? kEnoughRisingVcos : MAX_VCO_CANDIDATES;
      if (created > 0 && !ServeCandidates(imp, enough, run)) continue;
    }
    pll.chosen = Choose(imp, run);
    if (pll.chosen != nullptr) {
      TraceChosenValues(imp, run);
      return true;
    }
  }
  return false;
}

}  // namespace Ip::Pll
