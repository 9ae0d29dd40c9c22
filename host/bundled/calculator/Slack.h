// The slack of the solvers.
#ifndef VORKEL_HOST_BUNDLED_CALCULATOR_SLACK_H_
#define VORKEL_HOST_BUNDLED_CALCULATOR_SLACK_H_

namespace Calculator {

// The solvers take an M and a D for which input frequency x M / frequency is within 0.0005 of
// D, and compare the frequency that was asked for with the limits. The frequency that results
// can so lie beyond a limit by this fraction of it.
inline constexpr double kSolverSlack = 0.0005;

// Whether a frequency is within limits, as far as the solvers care.
constexpr bool IsWithinLimits(double frequency, double lowest, double highest) {
  return frequency >= lowest * (1.0 - kSolverSlack) && frequency <= highest * (1.0 + kSolverSlack);
}

}  // namespace Calculator

#endif  // VORKEL_HOST_BUNDLED_CALCULATOR_SLACK_H_
