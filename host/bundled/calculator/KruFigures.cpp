#include "host/bundled/calculator/KruFigures.h"

#include <cmath>

#include "host/bundled/calculator/PeakToPeak.h"

namespace Calculator {
namespace {

constexpr double kHalf = 50.0;  // percent

// The variance of a rounding error that is anything up to half a step either way, in steps.
constexpr double kRoundingVariance = 1.0 / 12.0;

// What the noise of the taps adds up to, ps squared.
double LineVariance(const KruCoefficients& coefficients, const KruPin& pin,
                    const KruSettings& settings) {
  const double period = 1.0 / LineFrequency(settings);  // microseconds
  if (pin.source != KruSource::kSynthesiser) return Square(coefficients.kappa) * period;
  return Square(coefficients.kappa) * settings.d * period +
         settings.m * kRoundingVariance * Square(coefficients.tap_step);
}

// The buffers that a clock edge passes: that of the output, the divider in front of the line,
// and that of the feedback.
double Buffers(const KruSettings& settings) {
  return 1.0 + (settings.divide_by_2 ? 1.0 : 0.0) + (settings.feedback ? 1.0 : 0.0);
}

// The lengths that are set in taps, each of which moves to and fro by a tap: that of the line;
// for the doubler the place of its second tap, for the synthesiser the length of its ring; and
// that of the phase shifter.
double TapSettings(const KruPin& pin, const KruSettings& settings) {
  const bool second = pin.source == KruSource::kDoubler || pin.source == KruSource::kSynthesiser;
  return 1.0 + (second ? 1.0 : 0.0) + (settings.phase_shift ? 1.0 : 0.0);
}

}  // namespace

double LineFrequency(const KruSettings& settings) {
  return settings.divide_by_2 ? settings.input * 0.5 : settings.input;
}

double PinFrequency(const KruPin& pin, const KruSettings& settings) {
  const double line = LineFrequency(settings);
  switch (pin.source) {
    case KruSource::kDoubler:
      return line * 2.0;
    case KruSource::kSynthesiser:
      return line * settings.m / settings.d;
    case KruSource::kDivider:
      return line / settings.clkdv;
    case KruSource::kTap:
      break;
  }
  return line;
}

double KruRmsJitter(const KruCoefficients& coefficients, const KruPin& pin,
                    const KruSettings& settings) {
  const double variance = LineVariance(coefficients, pin, settings) +
                          Buffers(settings) * Square(coefficients.buffer_jitter);
  return std::sqrt(variance);
}

double KruPkToPkJitter(const KruCoefficients& coefficients, const KruPin& pin,
                       const KruSettings& settings) {
  return kPeakToPeakPerRms * KruRmsJitter(coefficients, pin, settings) +
         TapSettings(pin, settings) * coefficients.tap_step;
}

// The divider counts half cycles. An odd number of them, from a divide between whole numbers,
// has one more low than high.
double KruDutyCycle(const KruPin& pin, const KruSettings& settings) {
  if (pin.source != KruSource::kDivider) return kHalf;
  return std::floor(settings.clkdv) / settings.clkdv * kHalf;
}

}  // namespace Calculator
