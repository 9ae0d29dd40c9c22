// Period, phase and duty cycle of a PLL or TSYN output.
//
// Tested by calculator_loop_timing_test.cpp.
#ifndef VORKEL_HOST_BUNDLED_CALCULATOR_LOOPTIMING_H_
#define VORKEL_HOST_BUNDLED_CALCULATOR_LOOPTIMING_H_

namespace Calculator {

// The phase, in degrees, that an output divider makes of a requested one from -360 to 360. It
// can start its output at any eighth of a VCO cycle. A request goes to the nearest step, the
// later of two equally near, whatever its sign.
double PhaseOnStep(double requested, double divider);

// The duty cycle, in percent, that an output divider makes of a requested one from 0 to 100:
// the nearest, the larger of two equally near. A request of 0 asks for nothing and is answered
// as 50. The output is high for a whole or half number of VCO cycles, one at least, and low
// for half a cycle at least; neither is longer than `largest_count`, for which the high time
// may be half a cycle more. A divider of 1 passes the VCO clock on, which has 50.
// `largest_count` is large enough for the divider.
double DutyOnStep(double requested, double divider, double largest_count);

}  // namespace Calculator

#endif  // VORKEL_HOST_BUNDLED_CALCULATOR_LOOPTIMING_H_
