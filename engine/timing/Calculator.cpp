// The host's calculator: how it is obtained, and the queries of VCO frequency, jitter and
// phase error.
//
// Tested by calculator_queries_test.cpp.

#include "engine/Ip_VorkelImp.h"
#include "engine/Messages.h"
#include "engine/timing/PinCode.h"
#include "host/Tw_BmCMBCalculator.h"

namespace Ip {

namespace {

// The calculator of a controller; null when the host has none or throws while it makes one.
Tw_BmCMBCalculator* CalculatorOf(Dly_SpeedController* controller) {
  try {
    return Tw_BmPhysicalBlockModeler::GetCMBCalculator(controller);
  } catch (...) {
    return nullptr;
  }
}

}  // namespace

// The earlier calculator is replaced, possibly by none, and not deleted: the host answers with
// the same one for the same controller.
bool VorkelImp::ObtainCalculator() {
  if (EnsureSpeedController()) cmbCalculator = CalculatorOf(speedController);
  if (cmbCalculator != nullptr) return true;
  Message()->issueError(
      "Internal getCMBCalculator() error -- could not obtain CMBCalculator\n");
  return false;
}

bool VorkelImp::GetVcoFreq(double a1, double a2, double a3, double a4, Port::StringBase* error,
                           double* frequency) {
  return ObtainCalculator() && cmbCalculator->VcoFrequency(a1, a2, a3, a4, error, frequency);
}

bool VorkelImp::GetPLLPkToPkJitter(double a1, double a2, double a3, const Port::StringBase& t4,
                                   double a5, double a6, Port::StringBase* error,
                                   double* jitter) {
  return ObtainCalculator() &&
         cmbCalculator->PllPkToPkJitter(a1, a2, a3, t4, a5, a6, error, jitter);
}

bool VorkelImp::GetKruPkToPkJitter(double a1, const Port::StringBase& pin, bool isKruClkgen,
                                   bool f1, bool f2, bool f3, double a2, double a3,
                                   Port::StringBase* error, double* jitter) {
  return ObtainCalculator() &&
         cmbCalculator->KruPkToPkJitter(a1, CalculatorPinCode(pin), isKruClkgen, f1, f2, f3, a2,
                                        a3, error, jitter);
}

bool VorkelImp::GetKRUPhaseError(Port::StringBase* error, double* phaseError) {
  return ObtainCalculator() && cmbCalculator->KruPhaseError(error, phaseError);
}

bool VorkelImp::GetPLLPhaseError(double a1, double a2, const Port::StringBase& t3,
                                 Port::StringBase* error, double* phaseError) {
  return ObtainCalculator() && cmbCalculator->PllPhaseError(a1, a2, t3, error, phaseError);
}

}  // namespace Ip
