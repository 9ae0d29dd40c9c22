// The rules by which a pair of M and D is accepted, for those who work out in advance where
// the search can succeed.
#ifndef VORKEL_ENGINE_PLL_MULTIPLIERSEARCH_H_
#define VORKEL_ENGINE_PLL_MULTIPLIERSEARCH_H_

#include "engine/Ip_VorkelImp.h"

namespace Ip::Pll {

inline constexpr double kLargestM = 64.0;

// A TSYN multiplies by 1 or by 5 and more: M lies outside of [kTsynGapBegin, kTsynGapEnd).
inline constexpr double kTsynGapBegin = 2.0;
inline constexpr double kTsynGapEnd = 5.0;

// D before rounding lies strictly between these; D is at most 80.
inline constexpr double kDAbove = 0.5;
inline constexpr double kDBelow = 80.5;
inline constexpr double kLargestRemainder = 0.0005;  // of D; exclusive

// The highest frequency at the phase-frequency detector, MHz, in the mode that is set.
inline double PfdMaximum(const VorkelImp& imp) {
  return imp.lowBandwidth ? imp.pllLimits._maxPfdLowB : imp.pllLimits.pfdMax;
}

}  // namespace Ip::Pll

#endif  // VORKEL_ENGINE_PLL_MULTIPLIERSEARCH_H_
