// What the dividers of each candidate can do for the requested phases and duty cycles.
//
// Tested by phase_and_duty_test.cpp.

#include <cmath>

#include "engine/Numbers.h"
#include "engine/pll/Stages.h"
#include "engine/timing/LongWalks.h"
#include "engine/timing/OutputSteps.h"

namespace Ip::Pll {

namespace {

constexpr double kEqual = 0.0001;  // differences up to this count as none

bool IsFractional(double x) { return std::fabs(RoundToInt(x) - x) >= kEqual; }

double Difference(double requested, double achievable) {
  const double difference = std::fabs(requested - achievable);
  return difference <= kEqual ? 0.0 : difference;
}

// A request that is neither positive nor negative, NaN among them, keeps 0.
double AchievablePhase(double requested, double divider) {
  if (divider == 0.0) return 0.0;
  if (requested > 0.0) return NearestPhaseStepOfAny(requested, PhaseStep(divider), true);
  if (requested < 0.0) return NearestPhaseStepOfAny(requested, PhaseStep(divider), false);
  return 0.0;
}

// One fractional divider fixes the phases and duty cycles of all outputs of a TSYN, those with
// whole dividers included.
bool IsFixed(const VorkelImp& imp, const Run& run, const VcoCandidate& candidate) {
  return run.prim == kTsyn && !imp.pll._intDiv0Only &&
         (IsFractional(candidate.m) || IsFractional(candidate.div0));
}

void TakeFixed(VcoCandidate& candidate, std::size_t output) {
  candidate.phase[output] = 0.0;
  candidate.phaseDiff[output] = 0.0;
  candidate.dutyCycle[output] = 0.5;
  candidate.dutyDiff[output] = 0.0;
}

void TakePhase(const VorkelImp& imp, VcoCandidate& candidate, int n) {
  const auto output = static_cast<std::size_t>(n);
  const double requested = imp.requests.reqPhase[output];
  candidate.phase[output] = AchievablePhase(requested, candidate.Divider(n));
  candidate.phaseDiff[output] = Difference(requested, candidate.phase[output]);
}

void TakeDutyCycle(const VorkelImp& imp, VcoCandidate& candidate, int n) {
  const auto output = static_cast<std::size_t>(n);
  const double requested = imp.requests.reqDutyCycle[output];
  candidate.dutyCycle[output] =
      NearestDutyCycleOfAny(requested, candidate.Divider(n), imp.pllLimits.maxHighLowCount);
  candidate.dutyDiff[output] = Difference(requested / 100.0, candidate.dutyCycle[output]);
}

}  // namespace

void GetPhasesAndDutyCycles(VorkelImp& imp, const Run& run) {
  TRACE(run.trace, "DLL ------ getting phases and duty cycles\n");
  VcoCandidateTable& candidates = imp.pll._vcoCandidates;
  const bool isOnly = candidates.Occupied().Count() == 1;
  for (const int slot : candidates.Occupied()) {
    VcoCandidate& candidate = candidates[slot];
    const bool isFixed = IsFixed(imp, run, candidate);
    for (int n = 0; n < run.count; ++n) {
      if (isFixed) {
        TakeFixed(candidate, static_cast<std::size_t>(n));
        continue;
      }
      TakePhase(imp, candidate, n);
      // One that is too far off on output 0 is not chosen, whatever else it can do.
      if (!isOnly && candidate.phaseDiff[0] > kWidestTolerance) break;
      TakeDutyCycle(imp, candidate, n);
      if (!isOnly && candidate.dutyDiff[0] > kWidestTolerance) break;
    }
  }
}

}  // namespace Ip::Pll
