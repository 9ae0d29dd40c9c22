// How far frequencies that should be the same may be apart, all in one place. Relative to the
// frequency:
//
//   2^-53        one operation on doubles
//   1e-15        an end of a stretch or a point, worked out in a handful of operations; and the VCO
//                of a candidate, of which the same holds
//   kRounding    what is taken for the same: a thousand times that
//   kSlack       how far a limit is moved for a VCO that is itself moved by kRounding
//   kMargin      how far the ends of windows are moved outward
//
// And relative to a fudge step, which is 0.001 MHz: a fudge, the sum of up to 11000 steps, is off
// by less than 1e-8 steps. MarginInSteps has room for that and, as what is worked out from them is
// off by less than 1e-14 of the frequency, for ends and candidates.
//
// Wherever the filter says "for certain", two such bounds lie between. Where it cannot say it, it
// looks at the candidate itself, with the doubles of the search.
#ifndef VORKEL_ENGINE_PLL_FILTER_ROUNDING_H_
#define VORKEL_ENGINE_PLL_FILTER_ROUNDING_H_

#include <cmath>

namespace Ip::Pll {

inline constexpr double kRounding = 1e-12;
inline constexpr double kSlack = 4.0 * kRounding;
inline constexpr double kMargin = 1e-9;

inline bool AreClose(double a, double b) { return std::fabs(a - b) <= kRounding * std::fabs(b); }

// In steps of a fudge of `step` MHz, for output-0 frequencies up to `fastest` MHz.
inline double MarginInSteps(double fastest, double step) {
  return 1e-6 + kRounding * fastest / step;
}

// Above this output-0 frequency, in MHz, rounding is no longer small against a fudge step.
inline constexpr double kLargestOutFreq0 = 1e9;

// Frequencies above this one, in MHz, are far enough from the smallest doubles for relative errors
// to be bounded. No candidate lies below it and above 0: output 0, shifted by a fudge, is 0 or as
// large as the rounding of the fudge at least.
inline constexpr double kSmallestFrequency = 1e-200;

}  // namespace Ip::Pll

#endif  // VORKEL_ENGINE_PLL_FILTER_ROUNDING_H_
