// The two entries of the PLL/TSYN solver.
//
// Tested by pll_driver_test.cpp.

#include "engine/pll/Stages.h"

namespace Ip {

namespace {

// Takes over the options of a call. Whatever becomes of it, the last answer is gone.
void Begin(Pll::PllState& pll, bool preferMaxVco, bool intDiv0Only, bool minPowerMode) {
  pll._preferMaxVco = preferMaxVco;
  pll._intDiv0Only = intDiv0Only;
  pll._minPowerMode = minPowerMode;
  pll.chosen = nullptr;
}

int Solve(VorkelImp& imp, const Port::StringBase& outFreqs, double inFreq2, const Pll::Run& run) {
  const Pll::ResultCode prepared = PrepareVcoRange(imp, outFreqs, inFreq2, run);
  if (prepared != Pll::kSolved) return prepared;
  const bool solved = FudgeLoop(imp, run);
  imp.pll.KeepChosen();
  return solved ? Pll::kSolved : Pll::kNoSolution;
}

}  // namespace

int VorkelImp::CalculateMinPowerOutFreqs(const Port::StringBase& outFreqs, double inFreq,
                                         double inFreq2, int count, bool preferMaxVco,
                                         bool intDiv0Only, int prim, bool verbose) {
  const Trace trace(verbose);
  TRACE(trace, "DLL- starting to calculate min power output frequencies\n");
  Begin(pll, preferMaxVco, intDiv0Only, true);
  return Solve(*this, outFreqs, inFreq2, {inFreq, count, prim, trace});
}

int VorkelImp::GetClosestSolution(const Port::StringBase& outFreqs,
                                  const Port::StringBase& phases,
                                  const Port::StringBase& dutyCycles, double inFreq,
                                  double inFreq2, int count, bool preferMaxVco,
                                  bool intDiv0Only, int prim, bool verbose) {
  const Trace trace(verbose);
  TRACE(trace, "DLL- starting to get closest solution\n");
  Begin(pll, preferMaxVco, intDiv0Only, false);
  const bool phasesParsed = ParsePhases(count, phases);
  const bool dutyCyclesParsed = ParseDutyCycles(count, dutyCycles);
  if (!phasesParsed || !dutyCyclesParsed) return Pll::kBadRequest;
  return Solve(*this, outFreqs, inFreq2, {inFreq, count, prim, trace});
}

}  // namespace Ip
