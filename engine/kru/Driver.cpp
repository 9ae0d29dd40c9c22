// The entry of the KRU_SP solver.
//
// Tested by kru_driver_test.cpp.

#include "engine/kru/Stages.h"

namespace Ip {

namespace Kru {

bool ParseRequest(VorkelImp& imp, int numOut, const Port::StringBase& outFreqs,
                  const Port::StringBase& phases) {
  if (numOut > kKruOutputs) return false;
  const bool frequenciesParsed = imp.ParseOutFreqs(numOut, outFreqs);
  const bool phasesParsed = imp.ParsePhases(numOut, phases);
  return frequenciesParsed && phasesParsed;
}

namespace {

ResultCode Solve(VorkelImp& imp, const Port::StringBase& outFreqs,
                 const Port::StringBase& phases, const Run& run) {
  if (!ParseRequest(imp, run.numOut, outFreqs, phases)) return kNoConfiguration;
  if (run.inFreq == 0.0) return kNoConfiguration;
  run.trace.Write();
  if (!imp.LoadKruLimits()) return kNoSpeedData;
  TraceOutputRanges(imp.kruLimits, run.trace);
  if (!FindPhaseOffset(imp, run)) return kNoConfiguration;
  const ClkdvLists clkdv = AssignPins(imp, run);
  return ChooseList(imp, clkdv, run) ? kSolved : kNoConfiguration;
}

}  // namespace

}  // namespace Kru

int VorkelImp::KruCalculateActuals(const Port::StringBase& outFreqs,
                                   const Port::StringBase& phases, double inFreq, int numOut,
                                   bool feedbackUsed, bool verbose) {
  const Trace trace(verbose);
  TRACE(trace, "DLL- starting to calculate KRU actuals \n");
  const Kru::Run run = {inFreq, numOut, feedbackUsed, trace};
  const Kru::ResultCode result = Kru::Solve(*this, outFreqs, phases, run);
  if (result == Kru::kSolved) {
    Kru::TraceChosenValues(*this, run);
  } else {
    TRACE(trace, "DLL ---- KRU won't work!!\n");
  }
  return result;
}

}  // namespace Ip
