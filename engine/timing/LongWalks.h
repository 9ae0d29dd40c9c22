// The walks of OutputSteps.h for any divider at all, in a time that does not depend on it.
//
// A search asks for the steps of hundreds of dividers, and scripts may ask about dividers that no
// device has. Where the plain walk has more than some dozen steps, the answer is worked out from
// the few steps around the request, and is the one that the plain walk would arrive at; where it
// would never end, or would find no step, the answer is 0.
//
// Tested by long_walks_test.cpp.
#ifndef VORKEL_ENGINE_TIMING_LONGWALKS_H_
#define VORKEL_ENGINE_TIMING_LONGWALKS_H_

namespace Ip {

// As NearestPhaseStep, for the step of any divider.
double NearestPhaseStepOfAny(double phase, double step, bool positive);

// As NearestDutyCycle, for any divider.
double NearestDutyCycleOfAny(double percent, double divider, double maxHighLowCount);

}  // namespace Ip

#endif  // VORKEL_ENGINE_TIMING_LONGWALKS_H_
