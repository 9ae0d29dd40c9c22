// The fudges by which the search shifts output 0: 0.000, 0.001, ... 10.999 MHz, each the one before
// plus 0.001 as doubles add up. Pass p of the fudge loop has fudge p.
//
// Tested by fudges_test.cpp.
#ifndef VORKEL_ENGINE_PLL_FUDGES_H_
#define VORKEL_ENGINE_PLL_FUDGES_H_

namespace Ip::Pll {

inline constexpr int kPasses = 11000;
inline constexpr double kFudgeStep = 0.001;     // MHz
inline constexpr double kLargestFudge = 10.999;  // MHz

// The fudge of a pass from 0 to kPasses, MHz. That of kPasses is the first above kLargestFudge.
double FudgeOf(int pass);

}  // namespace Ip::Pll

#endif  // VORKEL_ENGINE_PLL_FUDGES_H_
