// Jitter and phase error of a PLL or TSYN output.
//
// Tested by calculator_loop_figures_test.cpp.
#ifndef VORKEL_HOST_BUNDLED_CALCULATOR_LOOPFIGURES_H_
#define VORKEL_HOST_BUNDLED_CALCULATOR_LOOPFIGURES_H_

#include "host/bundled/calculator/Coefficients.h"
#include "host/bundled/calculator/LoopArguments.h"

namespace Calculator {

// A loop at work: frequencies in MHz.
struct Loop {
  double pfd;
  double vco;
  Bandwidth bandwidth;
};

// The random jitter, ps rms, with an input jitter in ps peak to peak: the noise of the oscillator,
// of the input and of the buffers, which are independent and add as variances. An output divider
// passes on edges of the VCO and leaves their jitter as it is, so it is no argument.
double LoopRmsJitter(const LoopCoefficients& coefficients, const Loop& loop, double input_jitter);

// Peak-to-peak jitter, ps: that of the random part, and the deterministic part.
double LoopPkToPkJitter(const LoopCoefficients& coefficients, const Loop& loop,
                        double input_jitter);

// The largest distance between the edges of input and feedback, ps, without jitter: the unlike
// delays of the two paths, and the time for which the charge pump must run in each PFD period
// to make up for the leakage.
double LoopPhaseError(const LoopCoefficients& coefficients, double pfd, Bandwidth bandwidth);

}  // namespace Calculator

#endif  // VORKEL_HOST_BUNDLED_CALCULATOR_LOOPFIGURES_H_
