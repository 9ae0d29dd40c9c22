// The output-0 dividers: each gives one VCO frequency, and those inside the working range
// become candidates.
//
// Tested by vco_enumeration_test.cpp.

#include "engine/pll/Div0Steps.h"
#include "engine/pll/Stages.h"

namespace Ip::Pll {

int EnumerateVcoCandidates(VorkelImp& imp, double reqOutFreq0, double fudge,
                           const Div0Steps& steps, const Trace& trace) {
  TRACE(trace, "DLL--- Using fudged oFreq = %3.3f (ofreq: %3.3f, fudge: %2.3f)\n",
        reqOutFreq0 + fudge, reqOutFreq0, fudge);
  int created = 0;
  VisitVcos(imp.pll, steps, fudge + reqOutFreq0, [&](int slot, double vco) {
    const double step = steps[slot];
    TRACE(trace, "DLL----- Found valid VCO = %4.3f and div0 = %3.3f (ofreq0_fudge = %1.3f)\n",
          vco, step, fudge);
    imp.pll._vcoCandidates.Put(slot, vco, step);
    ++created;
    return true;
  });
  if (created == 0) {
    TRACE(trace, "DLL----- NO VCO/Div0 pairs found for ofreq0_fudge = %1.3f!\n", fudge);
  }
  return created;
}

}  // namespace Ip::Pll
