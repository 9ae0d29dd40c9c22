#include "host/bundled/calculator/LoopModel.h"

#include <cmath>
#include <numbers>

namespace Calculator {

using std::numbers::pi;

double BandwidthFraction(const LoopCoefficients& coefficients, Bandwidth bandwidth) {
  switch (bandwidth) {
    case Bandwidth::kLow:
      return coefficients.bandwidth_low;
    case Bandwidth::kHigh:
      return coefficients.bandwidth_high;
    case Bandwidth::kOptimized:
      break;
  }
  return coefficients.bandwidth_optimized;
}

// The square of kappa goes with the inverse of the current of a stage, and the frequency of a
// ring with the current, which charges the same load to the same swing in less time.
double KappaAt(const LoopCoefficients& coefficients, double vco) {
  return coefficients.kappa * std::sqrt(coefficients.kappa_vco / vco);
}

double OscillatorJitter(double kappa, double loop_bandwidth) {
  return kappa * std::sqrt(1.0 / (4.0 * pi * loop_bandwidth));
}

// The detector samples the input once in a PFD period, so that white jitter fills the band up to
// half the PFD frequency; the noise bandwidth of a first-order low-pass is pi / 2 times its
// bandwidth. The quotient stays below 1, as the loop is no wider than a tenth of the PFD
// frequency.
double FilteredInputJitter(double input, double bandwidth_fraction) {
  return input * std::sqrt(pi * bandwidth_fraction);
}

}  // namespace Calculator
