// The phases and duty cycles that an output divider can make.
//
// A divider of value O counts VCO cycles, and the VCO has eight phases: the output can start
// at any eighth of a VCO cycle, and be high for any whole or half number of VCO cycles that
// its counters hold.
//
// Tested by output_steps_test.cpp.
#ifndef VORKEL_ENGINE_TIMING_OUTPUTSTEPS_H_
#define VORKEL_ENGINE_TIMING_OUTPUTSTEPS_H_

namespace Ip {

// The phase step of a divider: an eighth of a VCO cycle in degrees of the output.
double PhaseStep(double divider);

// The multiple of `step` from 0 to 360 degrees, or from -360 to 0 when not `positive`, that is
// nearest to `phase`; of two equally near the later, larger one. 0 when either is 0.
// `step` is positive and at least 360 / INT_MAX.
double NearestPhaseStep(double phase, double step, bool positive);

// The duty cycle, a fraction, nearest to `percent` that a divider of value `divider` makes
// with high and low counts up to `maxHighLowCount`; of two equally near the larger one. 0 when
// percent or divider is 0, or when the counters leave nothing to choose from.
// `divider` is at least 1, and small enough that a walk in steps of 0.5 / divider ends.
double NearestDutyCycle(double percent, double divider, double maxHighLowCount);

}  // namespace Ip

#endif  // VORKEL_ENGINE_TIMING_OUTPUTSTEPS_H_
