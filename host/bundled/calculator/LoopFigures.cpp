#include "host/bundled/calculator/LoopFigures.h"

#include <cmath>

#include "host/bundled/calculator/LoopModel.h"
#include "host/bundled/calculator/PeakToPeak.h"

namespace Calculator {

double LoopRmsJitter(const LoopCoefficients& coefficients, const Loop& loop,
                     double input_jitter) {
  const double fraction = BandwidthFraction(coefficients, loop.bandwidth);
  const double oscillator = OscillatorJitter(KappaAt(coefficients, loop.vco), fraction * loop.pfd);
  const double input = FilteredInputJitter(input_jitter / kPeakToPeakPerRms, fraction);
  const double variance = Square(oscillator) + Square(input) + Square(coefficients.buffer_jitter);
  return std::sqrt(variance);
}

double LoopPkToPkJitter(const LoopCoefficients& coefficients, const Loop& loop,
                        double input_jitter) {
  return kPeakToPeakPerRms * LoopRmsJitter(coefficients, loop, input_jitter) +
         coefficients.deterministic_jitter;
}

// The current of the pump sets the bandwidth of the loop and so is in proportion to it. Millionths
// over MHz are picoseconds.
double LoopPhaseError(const LoopCoefficients& coefficients, double pfd, Bandwidth bandwidth) {
  const double loop_bandwidth = BandwidthFraction(coefficients, bandwidth) * pfd;
  return coefficients.static_offset + coefficients.leakage / loop_bandwidth;
}

}  // namespace Calculator
