// The loop of PLL and TSYN: how wide it is, and what it does to the noise of the oscillator and
// of the input.
//
// A ring oscillator that runs freely adds an independent error to each of its cycles, so that
// the error of an edge grows with the square root of the time: its rms value after a time T is
// kappa * sqrt(T). A loop of bandwidth f_loop corrects the oscillator within a time of about
// 1 / f_loop, which ends that growth; what is left is kappa * sqrt(1 / (4 pi f_loop)), says
// J. McNeill, "Jitter in ring oscillators", IEEE Journal of Solid-State Circuits 32(6), 1997.
// The input goes through the same loop as through a low-pass: a wider loop lets less of the
// oscillator's noise pass, and more of the input's.
//
// doc/calculator.md derives the formulas.
//
// Frequencies are in MHz and jitter is in ps rms. The arguments are legal.
//
// Tested by calculator_loop_model_test.cpp.
#ifndef VORKEL_HOST_BUNDLED_CALCULATOR_LOOPMODEL_H_
#define VORKEL_HOST_BUNDLED_CALCULATOR_LOOPMODEL_H_

#include "host/bundled/calculator/Coefficients.h"
#include "host/bundled/calculator/LoopArguments.h"

namespace Calculator {

// The loop's bandwidth as a fraction of the PFD frequency.
double BandwidthFraction(const LoopCoefficients& coefficients, Bandwidth bandwidth);

// Kappa of a VCO, ps per square root of a microsecond.
double KappaAt(const LoopCoefficients& coefficients, double vco);

// What the loop leaves of the oscillator's noise.
double OscillatorJitter(double kappa, double loop_bandwidth);

// What the loop leaves of white input jitter, `input` ps rms.
double FilteredInputJitter(double input, double bandwidth_fraction);

}  // namespace Calculator

#endif  // VORKEL_HOST_BUNDLED_CALCULATOR_LOOPMODEL_H_
