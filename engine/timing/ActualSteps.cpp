// What a TSYN output divider makes of a requested phase or duty cycle.
//
// Tested by actual_steps_test.cpp.

#include "engine/Ip_VorkelImp.h"
#include "engine/timing/LongWalks.h"
#include "engine/timing/OutputSteps.h"

namespace Ip {

double VorkelImp::TSYNCalculateActualPhase(const double* phase, const double* divider,
                                           bool) const {
  if (*phase == 0.0 || *divider == 0.0) return 0.0;
  return NearestPhaseStepOfAny(*phase, PhaseStep(*divider), *phase > 0.0);
}

double VorkelImp::TSYNCalculateActualDutyCycle(const double* dutyCycle,
                                               const double* divider) const {
  return NearestDutyCycleOfAny(*dutyCycle, *divider, pllLimits.maxHighLowCount);
}

}  // namespace Ip
