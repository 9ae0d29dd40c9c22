// Jitter, period, phase and duty cycle of a KRU output.
//
// A KRU puts the input clock through a line of delay taps whose length its loop keeps at one
// period. The noise of the taps adds up along the line, but only for that period: unlike in an
// oscillator, the next edge begins anew with the input. Its synthesiser closes the line to a
// ring and lets it run for D input periods, after which M output periods are over and the ring
// is put in step with the input again; until then its noise goes on adding up. Taps are the
// smallest step in which a length can be set, which shows as deterministic jitter and, in the
// synthesiser, as a rounding error of each output period.
//
// doc/calculator.md derives the formulas. The arguments are legal.
//
// Tested by calculator_kru_figures_test.cpp.
#ifndef VORKEL_HOST_BUNDLED_CALCULATOR_KRUFIGURES_H_
#define VORKEL_HOST_BUNDLED_CALCULATOR_KRUFIGURES_H_

#include "host/bundled/calculator/Coefficients.h"
#include "host/bundled/calculator/KruPin.h"

namespace Calculator {

struct KruSettings {
  double input;  // MHz
  bool divide_by_2 = false;
  bool feedback = false;
  bool phase_shift = false;
  double m = 0.0;  // of CLKFX and CLKFX180
  double d = 0.0;
  double clkdv = 0.0;  // the divide of CLKDV
};

// The frequency in MHz at which the delay line works: that of the input, or half of it.
double LineFrequency(const KruSettings& settings);

// The frequency of a pin, MHz.
double PinFrequency(const KruPin& pin, const KruSettings& settings);

// The random jitter, ps rms, that the KRU adds to that of its input, which passes through.
double KruRmsJitter(const KruCoefficients& coefficients, const KruPin& pin,
                    const KruSettings& settings);

// The jitter, ps peak to peak, that it adds: that of the random part, and the taps.
double KruPkToPkJitter(const KruCoefficients& coefficients, const KruPin& pin,
                       const KruSettings& settings);

// The duty cycle of a pin, percent.
double KruDutyCycle(const KruPin& pin, const KruSettings& settings);

}  // namespace Calculator

#endif  // VORKEL_HOST_BUNDLED_CALCULATOR_KRUFIGURES_H_
