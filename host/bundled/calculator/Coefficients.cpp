#include "host/bundled/calculator/Coefficients.h"

namespace Calculator {

LoopCoefficients LoopCoefficients::Of(const Device::Grade& grade) {
  return {
      .kappa = *grade.CoefficientOf("LOOP_KAPPA"),
      .kappa_vco = *grade.CoefficientOf("LOOP_KAPPA_VCO"),
      .bandwidth_low = *grade.CoefficientOf("LOOP_BANDWIDTH_LOW"),
      .bandwidth_optimized = *grade.CoefficientOf("LOOP_BANDWIDTH_OPTIMIZED"),
      .bandwidth_high = *grade.CoefficientOf("LOOP_BANDWIDTH_HIGH"),
      .buffer_jitter = *grade.CoefficientOf("LOOP_BUFFER_JITTER"),
      .deterministic_jitter = *grade.CoefficientOf("LOOP_DETERMINISTIC_JITTER"),
      .static_offset = *grade.CoefficientOf("LOOP_STATIC_OFFSET"),
      .leakage = *grade.CoefficientOf("LOOP_LEAKAGE"),
  };
}

KruCoefficients KruCoefficients::Of(const Device::Grade& grade) {
  return {
      .kappa = *grade.CoefficientOf("KRU_KAPPA"),
      .tap_step = *grade.CoefficientOf("KRU_TAP_STEP"),
      .buffer_jitter = *grade.CoefficientOf("KRU_BUFFER_JITTER"),
      .phase_error = *grade.CoefficientOf("KRU_PHASE_ERROR"),
  };
}

}  // namespace Calculator
