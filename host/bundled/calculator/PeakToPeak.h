// Rms and peak-to-peak jitter.
#ifndef VORKEL_HOST_BUNDLED_CALCULATOR_PEAKTOPEAK_H_
#define VORKEL_HOST_BUNDLED_CALCULATOR_PEAKTOPEAK_H_

namespace Calculator {

// The peak-to-peak value of Gaussian jitter in rms values: a bound that it exceeds with a
// probability of 1e-12, twice 7.0345.
inline constexpr double kPeakToPeakPerRms = 14.069;

constexpr double Square(double x) { return x * x; }

}  // namespace Calculator

#endif  // VORKEL_HOST_BUNDLED_CALCULATOR_PEAKTOPEAK_H_
