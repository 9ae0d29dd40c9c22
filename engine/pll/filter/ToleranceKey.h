// What the divider search makes of a VCO frequency, in one number.
//
// The divider search goes through outputs 1, 2, ... and keeps, of the candidates that are left,
// those with the narrowest tolerance on that output. So what it keeps are the candidates with the
// smallest key, when the numbers of the tolerances that a candidate keeps on outputs 1, 2, ... are
// read as the digits of one number, the key.
//
// Tested by tolerance_key_test.cpp.
#ifndef VORKEL_ENGINE_PLL_FILTER_TOLERANCEKEY_H_
#define VORKEL_ENGINE_PLL_FILTER_TOLERANCEKEY_H_

#include <cstdint>

#include "engine/pll/OutputDividers.h"
#include "engine/pll/Stages.h"

namespace Ip::Pll {

// Five bits for each output, output 1 highest. Behind a digit of kTolerances, which is that of an
// output without a divider, the digits are 0: the divider search does not get to them.
using ToleranceKey = std::uint32_t;

inline constexpr int kKeyBits = 5;  // for tolerance numbers 0 to kTolerances
static_assert(kTolerances < (1 << kKeyBits) && kKeyBits * (MAX_OUTPUTS - 1) < 32);

// A key, digit by digit.
struct KeyDigits {
  ToleranceKey key = 0;
  bool isServed = true;  // no digit so far is kTolerances

  void Append(int digit) {
    key = key << kKeyBits | static_cast<ToleranceKey>(isServed ? digit : 0);
    isServed = isServed && digit < kTolerances;
  }
  friend bool operator==(const KeyDigits&, const KeyDigits&) = default;
};

// The key of a candidate with this VCO (MHz), by the very doubles of the divider search.
inline KeyDigits KeyOf(const VorkelImp& imp, const Run& run, double vco) {
  KeyDigits digits;
  for (int n = 1; n < run.count; ++n) {
    const OutputRange range = RangeOfOutput(imp.pllLimits, run.prim, n);
    const double requested = imp.requests.reqOutFreq[static_cast<std::size_t>(n)];
    digits.Append(digits.isServed ? FitOutput(vco, requested, range).tolerance : 0);
  }
  return digits;
}

}  // namespace Ip::Pll

#endif  // VORKEL_ENGINE_PLL_FILTER_TOLERANCEKEY_H_
