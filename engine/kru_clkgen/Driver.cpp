// The entry of the KRU_CLKGEN solver.
//
// It does not load its limits: it works with the CLKFX and CLKFXDV fields as they stand, the
// defaults or what a KRU_SP run has loaded for CLKFX. That is meant so.
//
// Tested by kru_clkgen_driver_test.cpp.

#include "engine/kru/Stages.h"
#include "engine/kru_clkgen/Search.h"

namespace Ip {

namespace KruClkgen {

namespace {

bool Solve(VorkelImp& imp, const Port::StringBase& outFreqs, const Port::StringBase& phases,
           const Run& run) {
  if (!Kru::ParseRequest(imp, run.numOut, outFreqs, phases)) return false;
  if (run.inFreq == 0.0) return false;
  TRACE(run.trace, "DLL --- KRU_CLKGEN output clock valid freq ranges:\n");
  TRACE(run.trace, "DLL ------> CLKFX min = %3.3f; max = %3.3f\n", imp.kruLimits._kruClkfxMin,
        imp.kruLimits._kruClkfxMax);
  TRACE(run.trace, "DLL ------> CLKFXDV min = %3.3f; max = %3.3f\n",
        imp.kruLimits._kruClkfxdvMin, imp.kruLimits._kruClkfxdvMax);
  return FindMDAndDv(imp, run);
}

void TraceChosenValues(const VorkelImp& imp, const Run& run) {
  const Trace& trace = run.trace;
  if (!trace.On()) return;
  for (int n = 0; n < run.numOut; ++n) {
    trace.Print("DLL - for CLK_OUT%d, chosen KRU_CLKGEN pin = %s\n", n,
                imp.GetKruChosenPinname(n).CStr());
  }
  trace.Print("DLL - chosen M = %d\n", imp.GetKruChosenM());
  trace.Print("DLL - chosen D = %d\n", imp.GetKruChosenD());
  if (imp.GetKruChosenClkfxdv() != 0.0) {
    trace.Print("DLL - chosen DV = %f\n", imp.GetKruChosenClkfxdv());
  }
}

}  // namespace

}  // namespace KruClkgen

int VorkelImp::KruClkgenCalculateActuals(const Port::StringBase& outFreqs,
                                         const Port::StringBase& phases, double inFreq,
                                         int numOut, bool verbose) {
  const Trace trace(verbose);
  kru._kruChosenClkdv = 0.0;
  TRACE(trace, "DLL- starting to calculate KRU_CLKGEN actuals \n");
  const KruClkgen::Run run = {inFreq, numOut, trace};
  if (!KruClkgen::Solve(*this, outFreqs, phases, run)) {
    TRACE(trace, "DLL ---- KRU_CLKGEN won't work!!\n");
    return Kru::kNoConfiguration;
  }
  KruClkgen::TraceChosenValues(*this, run);
  return Kru::kSolved;
}

}  // namespace Ip
