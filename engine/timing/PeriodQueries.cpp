// The queries of period, phase and duty cycle, which keep phase and duty cycle.
//
// Tested by calculator_queries_test.cpp.

#include "engine/Ip_VorkelImp.h"
#include "engine/Numbers.h"
#include "engine/timing/PinCode.h"
#include "host/Tw_BmCMBCalculator.h"

namespace Ip {

bool VorkelImp::GetKRUPeriodPhaseDutyCycle(double a1, const Port::StringBase& pin, bool f1,
                                           double a2, double a3, double a4,
                                           Port::StringBase* error, double* period,
                                           double* phase, double* dutyCycle) {
  if (!ObtainCalculator()) return false;
  if (!cmbCalculator->KruPeriodPhaseDutyCycle(a1, CalculatorPinCode(pin), f1, a2, a3, a4, error,
                                              period, phase, dutyCycle)) {
    return false;
  }
  *phase = *phase * 360.0;
  latestPhase = TruncateToInt(*phase);
  latestDutyCycle = *dutyCycle;
  return true;
}

// Nothing is scaled or truncated here, unlike above; that is meant so.
bool VorkelImp::GetPLLPeriodPhaseDutyCycle(double a1, double a2, double a3, double a4, double a5,
                                           double a6, double a7, Port::StringBase* error,
                                           double* period, double* phase, double* dutyCycle) {
  if (!ObtainCalculator()) return false;
  if (!cmbCalculator->PllPeriodPhaseDutyCycle(a1, a2, a3, a4, a5, a6, a7, error, period, phase,
                                              dutyCycle)) {
    return false;
  }
  latestPhase = *phase;
  latestDutyCycle = *dutyCycle;
  return true;
}

}  // namespace Ip
