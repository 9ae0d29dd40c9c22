// The working range of a run: the VCO frequencies that the device allows, narrowed so that
// they serve both input clocks.
//
// Tested by vco_range_test.cpp.

#include "engine/pll/Stages.h"

namespace Ip::Pll {

ResultCode PrepareVcoRange(VorkelImp& imp, const Port::StringBase& outFreqs, double inFreq2,
                           const Run& run) {
  if (!imp.ParseOutFreqs(run.count, outFreqs)) return kBadRequest;
  if (run.inFreq == 0.0) return kBadRequest;
  run.trace.Write();
  if (!imp.LoadPllLimits(run.prim)) return kNoSpeedData;

  PllState& pll = imp.pll;
  pll.minAdjVco = imp.pllLimits.vcoMin;
  pll.maxAdjVco = imp.pllLimits.vcoMax;
  if (inFreq2 != 0.0) {
    // M and D are found for the first clock. The VCO runs at the same multiple of the second,
    // so one end moves: the lower one when the second clock is slower, else the upper one.
    if (run.inFreq >= inFreq2) {
      pll.minAdjVco = pll.minAdjVco * (run.inFreq / inFreq2);
    } else {
      pll.maxAdjVco = pll.maxAdjVco / (inFreq2 / run.inFreq);
    }
  }
  pll.minM = pll.minAdjVco / run.inFreq;
  pll.maxM = pll.maxAdjVco / run.inFreq;
  TRACE(run.trace, "DLL---- minAdjVco = %f\n", pll.minAdjVco);
  TRACE(run.trace, "DLL---- maxAdjVco = %f\n", pll.maxAdjVco);
  TRACE(run.trace, "DLL---- minM = %f\n", pll.minM);
  TRACE(run.trace, "DLL---- maxM = %f\n", pll.maxM);
  if (pll.minM > pll.maxM || pll.minAdjVco > pll.maxAdjVco) {
    TRACE(run.trace, "DLL---- There is no valid working range for either VCO or M!\n");
    return kEmptyRange;
  }
  return kSolved;
}

}  // namespace Ip::Pll
