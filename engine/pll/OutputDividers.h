// The divider that serves one output from one VCO frequency, and how well.
//
// Tested by output_dividers_test.cpp.
#ifndef VORKEL_ENGINE_PLL_OUTPUTDIVIDERS_H_
#define VORKEL_ENGINE_PLL_OUTPUTDIVIDERS_H_

#include "engine/DeviceLimits.h"

namespace Ip::Pll {

// The largest divider of an output.
inline constexpr double kLargestDivider = 128.0;

// Relative tolerances of an output frequency: 0.00, 0.01, ... 0.26, by repeated addition.
inline constexpr int kTolerances = 27;

// A tolerance by its number, 0 to kTolerances - 1.
double Tolerance(int number);

// The number of the first tolerance that `error` is not above. kTolerances when there is none,
// and for a NaN, which a request can bring about.
int FirstTolerance(double error);

// What one VCO frequency does for one output.
struct OutputFit {
  int divider;
  double diff;    // |actual - requested| frequency, MHz
  int tolerance;  // number of the narrowest tolerance that it keeps; kTolerances: none, or out
                  // of the output range
};

// The range of frequencies of output n of a primitive (MHz).
struct OutputRange {
  double min;
  double max;
};
OutputRange RangeOfOutput(const PllLimits& limits, int prim, int n);

// The divider, a whole number from 1 to 128, nearest to the ratio of `vco` and `requested`
// (both MHz), and what comes of it. A NaN has the divider 0, and no tolerance.
OutputFit FitOutput(double vco, double requested, const OutputRange& range);

}  // namespace Ip::Pll

#endif  // VORKEL_ENGINE_PLL_OUTPUTDIVIDERS_H_
