// The phases and duty cycles that an output divider can make.
//
// A divider of value O counts VCO cycles, and the VCO has eight phases: the output can start
// at any eighth of a VCO cycle, and be high for any whole or half number of VCO cycles that
// its counters hold. Requests are snapped to these steps by walking over them one by one.
//
// A walk takes as many steps as the divider has; the walks here are for dividers of which that
// is no matter. LongWalks.h has the others.
//
// Tested by output_steps_test.cpp.
#ifndef VORKEL_ENGINE_TIMING_OUTPUTSTEPS_H_
#define VORKEL_ENGINE_TIMING_OUTPUTSTEPS_H_

namespace Ip {

// The phase step of a divider: an eighth of a VCO cycle in degrees of the output.
double PhaseStep(double divider);

// The multiple of `step` that a requested phase is snapped to, in degrees; 0 when either is 0.
// Upward (`positive`) that is the nearest from 0 to 360, and the later of two equally near.
// Downward it is the first from -360 to 0 that is not below the request, or the last where all
// are: each multiple is weighed against the best so far and not against the request. A request
// below -360 stays there.
// `step` is positive and at least 360 / INT_MAX, or 0.
double NearestPhaseStep(double phase, double step, bool positive);

// What a divider with high and low counts up to `maxHighLowCount` can make, as fractions: from
// `lowest` to `highest` in steps. Nothing when `highest` is below `lowest`.
struct DutyRange {
  double lowest;
  double highest;
  double step;
};
DutyRange DutyRangeOf(double divider, double maxHighLowCount);

// The step of the range that is nearest to a requested fraction, the larger of two equally
// near; 0 when the range is empty. The steps add up from `lowest` one by one.
double NearestDutyStep(double requested, const DutyRange& range);

// The duty cycle, a fraction, nearest to `percent` that a divider can make. 0 when percent or
// divider is 0 or the range is empty; one half for a divider of 1, which passes the VCO clock
// on as it is.
double NearestDutyCycle(double percent, double divider, double maxHighLowCount);

}  // namespace Ip

#endif  // VORKEL_ENGINE_TIMING_OUTPUTSTEPS_H_
