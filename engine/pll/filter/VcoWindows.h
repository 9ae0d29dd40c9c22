// The VCO frequencies that have an M and a D. They form narrow windows, which depend on the input
// clock and the limits but not on the fudge.
//
// Example: 100 MHz in, VCO 600 to 1440 MHz, PFD 10 to 500 MHz. M = 6 and D = 1 give the window
// 599.70 to 600.30 MHz, M = 61 and D = 10 the window 609.97 to 610.03 MHz; between windows no
// candidate is ever accepted.
//
// The windows are an outer bound: each is a little wider than the stages accept, so a VCO
// outside all of them is refused for certain, and one inside is refused only at the very ends.
// The ends are moved outward by kMargin (Rounding.h), millions of times what they can be off.
//
// Tested by vco_windows_test.cpp.
#ifndef VORKEL_ENGINE_PLL_FILTER_VCOWINDOWS_H_
#define VORKEL_ENGINE_PLL_FILTER_VCOWINDOWS_H_

#include <vector>

#include "engine/pll/Stages.h"

namespace Ip::Pll {

// A range of VCO frequencies, MHz, both ends included.
struct VcoWindow {
  double low;
  double high;
};

// In rising order, without overlaps.
using VcoWindows = std::vector<VcoWindow>;

// The windows of a run whose VCO range is prepared and whose primitive is that of the process.
VcoWindows FindVcoWindows(const VorkelImp& imp, const Run& run);

// Whether there is any.
bool HasVcoWindow(const VorkelImp& imp, const Run& run);

}  // namespace Ip::Pll

#endif  // VORKEL_ENGINE_PLL_FILTER_VCOWINDOWS_H_
