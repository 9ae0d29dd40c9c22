// The coefficients of the models, as the device file gives them for a speed grade. Their names
// there are those of devices/README.md.
#ifndef VORKEL_HOST_BUNDLED_CALCULATOR_COEFFICIENTS_H_
#define VORKEL_HOST_BUNDLED_CALCULATOR_COEFFICIENTS_H_

#include "host/bundled/device/DeviceFile.h"

namespace Calculator {

// The ring oscillator of PLL and TSYN and the loop around it.
struct LoopCoefficients {
  // `grade` has the coefficients of the loop.
  static LoopCoefficients Of(const Device::Grade& grade);

  double kappa;          // LOOP_KAPPA, ps per square root of a microsecond
  double kappa_vco;      // LOOP_KAPPA_VCO, the VCO frequency of that kappa, MHz
  double bandwidth_low;  // LOOP_BANDWIDTH_..., fractions of the PFD frequency
  double bandwidth_optimized;
  double bandwidth_high;
  double buffer_jitter;         // LOOP_BUFFER_JITTER, ps rms
  double deterministic_jitter;  // LOOP_DETERMINISTIC_JITTER, ps peak to peak
  double static_offset;         // LOOP_STATIC_OFFSET, ps
  double leakage;               // LOOP_LEAKAGE, millionths
};

// The delay line of KRU_SP and KRU_CLKGEN.
struct KruCoefficients {
  // `grade` has the coefficients of the KRU.
  static KruCoefficients Of(const Device::Grade& grade);

  double kappa;          // KRU_KAPPA, ps per square root of a microsecond
  double tap_step;       // KRU_TAP_STEP, ps
  double buffer_jitter;  // KRU_BUFFER_JITTER, ps rms
  double phase_error;    // KRU_PHASE_ERROR, ps
};

}  // namespace Calculator

#endif  // VORKEL_HOST_BUNDLED_CALCULATOR_COEFFICIENTS_H_
