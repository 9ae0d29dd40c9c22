// The output-0 dividers: each gives one VCO frequency, and those inside the working range
// become candidates.
//
// Tested by vco_enumeration_test.cpp.

#include "engine/Numbers.h"
#include "engine/pll/Stages.h"

namespace Ip::Pll {

namespace {

constexpr double kLargestDivider = 128.0;
constexpr double kIntegerStep = 1.0;
constexpr double kFractionalStep = 0.125;

}  // namespace

// Output 0 itself is not held against the output limits; only the VCO range bounds it.
int EnumerateVcoCandidates(VorkelImp& imp, double reqOutFreq0, double fudge, bool integerDiv0,
                           const Trace& trace) {
  PllState& pll = imp.pll;
  TRACE(trace, "DLL--- Using fudged oFreq = %3.3f (ofreq: %3.3f, fudge: %2.3f)\n",
        reqOutFreq0 + fudge, reqOutFreq0, fudge);
  int created = 0;
  double divider = 1.0;
  for (int slot = 0; slot < MAX_VCO_CANDIDATES; ++slot) {
    // Nothing lies between 1 and 2: the first step is a whole one in either mode.
    if (slot == 1) divider = 2.0;
    if (slot > 1) divider += integerDiv0 ? kIntegerStep : kFractionalStep;
    if (divider > kLargestDivider) break;
    const double vco = (fudge + reqOutFreq0) * divider;
    if (!(pll.minAdjVco <= vco && vco <= pll.maxAdjVco)) continue;
    const double div0 = integerDiv0 ? RoundToInt(divider) : divider;
    TRACE(trace, "DLL----- Found valid VCO = %4.3f and div0 = %3.3f (ofreq0_fudge = %1.3f)\n",
          vco, divider, fudge);
    pll._vcoCandidates.Put(slot, vco, div0);
    ++created;
  }
  if (created == 0) {
    TRACE(trace, "DLL----- NO VCO/Div0 pairs found for ofreq0_fudge = %1.3f!\n", fudge);
  }
  return created;
}

}  // namespace Ip::Pll
