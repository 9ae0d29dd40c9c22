// The host's calculator of clock-management blocks: VCO frequency, jitter, phase error,
// period, phase and duty cycle of a configured block.
//
// The engine forwards the arguments of every operation unread; what they mean is the
// calculator's affair. Every operation returns true and writes its figures, or returns false
// and writes a sentence into `error`.
#ifndef VORKEL_HOST_TW_BMCMBCALCULATOR_H_
#define VORKEL_HOST_TW_BMCMBCALCULATOR_H_

#include "host/Port_StringBase.h"

class Dly_SpeedController;

// The operations stand in the order of the interface's slots; the order is part of it.
class Tw_BmCMBCalculator {
 public:
  virtual ~Tw_BmCMBCalculator();

  // VCO frequency.
  virtual bool VcoFrequency(double a1, double a2, double a3, double a4, Port::StringBase* error,
                            double* frequency) = 0;

  // Peak-to-peak jitter of a PLL or TSYN output.
  virtual bool PllPkToPkJitter(double a1, double a2, double a3, Port::StringBase t4, double a5,
                               double a6, Port::StringBase* error, double* jitter) = 0;

  // Holds the place of an operation that this system does not use.
  virtual bool Unused(Port::StringBase* error);

  // Peak-to-peak jitter of a KRU output; `pin` is the calculator's pin code.
  virtual bool KruPkToPkJitter(double a1, int pin, bool isKruClkgen, bool f1, bool f2, bool f3,
                               const double& a2, const double& a3, Port::StringBase* error,
                               double* jitter) = 0;

  // Phase error of a PLL or TSYN.
  virtual bool PllPhaseError(double a1, double a2, Port::StringBase t3, Port::StringBase* error,
                             double* phaseError) = 0;

  // Phase error of a KRU.
  virtual bool KruPhaseError(Port::StringBase* error, double* phaseError) = 0;

  // Period, phase (a fraction of a cycle) and duty cycle of a KRU output.
  virtual bool KruPeriodPhaseDutyCycle(double a1, int pin, bool f1, double a2, double a3,
                                       double a4, Port::StringBase* error, double* period,
                                       double* phase, double* dutyCycle) = 0;

  // Period, phase and duty cycle of a PLL or TSYN output.
  virtual bool PllPeriodPhaseDutyCycle(double a1, double a2, double a3, double a4, double a5,
                                       double a6, double a7, Port::StringBase* error,
                                       double* period, double* phase, double* dutyCycle) = 0;

 protected:
  Tw_BmCMBCalculator() = default;
  Tw_BmCMBCalculator(const Tw_BmCMBCalculator&) = delete;
  Tw_BmCMBCalculator& operator=(const Tw_BmCMBCalculator&) = delete;
};

class Tw_BmPhysicalBlockModeler {
 public:
  // The calculator of the device behind `controller`, or null when the device has none.
  // The caller owns it; asking again for the same controller gives the same calculator.
  static Tw_BmCMBCalculator* GetCMBCalculator(Dly_SpeedController* controller);
};

#endif  // VORKEL_HOST_TW_BMCMBCALCULATOR_H_
