// The output-0 dividers: each gives one VCO frequency, and those inside the working range
// become candidates.
//
// Tested by vco_enumeration_test.cpp.

#include "engine/Numbers.h"
#include "engine/pll/Div0Steps.h"
#include "engine/pll/Stages.h"

namespace Ip::Pll {

// Output 0 itself is not held against the output limits; only the VCO range bounds it.
int EnumerateVcoCandidates(VorkelImp& imp, double reqOutFreq0, double fudge, bool integerDiv0,
                           const Trace& trace) {
  PllState& pll = imp.pll;
  TRACE(trace, "DLL--- Using fudged oFreq = %3.3f (ofreq: %3.3f, fudge: %2.3f)\n",
        reqOutFreq0 + fudge, reqOutFreq0, fudge);
  int created = 0;
  const double outFreq0 = fudge + reqOutFreq0;
  const Div0Steps steps(integerDiv0);
  for (int slot = steps.FirstWorthTrying(outFreq0, pll.minAdjVco); slot < steps.Count(); ++slot) {
    const double step = steps[slot];
    const double vco = outFreq0 * step;
    if (!(pll.minAdjVco <= vco && vco <= pll.maxAdjVco)) {
      if (vco > pll.maxAdjVco && outFreq0 > 0.0) break;  // and so are all that follow
      continue;
    }
    const double div0 = integerDiv0 ? RoundToInt(step) : step;
    TRACE(trace, "DLL----- Found valid VCO = %4.3f and div0 = %3.3f (ofreq0_fudge = %1.3f)\n",
          vco, step, fudge);
    pll._vcoCandidates.Put(slot, vco, div0);
    ++created;
  }
  if (created == 0) {
    TRACE(trace, "DLL----- NO VCO/Div0 pairs found for ofreq0_fudge = %1.3f!\n", fudge);
  }
  return created;
}

}  // namespace Ip::Pll
