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

}  // namespace

void GetPhasesAndDutyCycles(VorkelImp& imp, const Run& run) {
  TRACE(run.trace, "DLL ------ getting phases and duty cycles\n");
  const bool fractionFixesAll = run.prim == kTsyn && !imp.pll._intDiv0Only;
  VcoCandidateTable& candidates = imp.pll._vcoCandidates;
  for (int n = 0; n < run.count; ++n) {
    const auto output = static_cast<std::size_t>(n);
    const double reqPhase = imp.requests.reqPhase[output];
    const double reqDutyCycle = imp.requests.reqDutyCycle[output];
    for (const int slot : candidates.Occupied()) {
      VcoCandidate& candidate = candidates[slot];
      // One fractional divider fixes the phases and duty cycles of all outputs of a TSYN,
      // those with whole dividers included.
      if (fractionFixesAll && (IsFractional(candidate.m) || IsFractional(candidate.div0))) {
        candidate.phase[output] = 0.0;
        candidate.phaseDiff[output] = 0.0;
        candidate.dutyCycle[output] = 0.5;
        candidate.dutyDiff[output] = 0.0;
        continue;
      }
      const double divider = candidate.Divider(n);
      candidate.phase[output] = AchievablePhase(reqPhase, divider);
      candidate.phaseDiff[output] = Difference(reqPhase, candidate.phase[output]);
      candidate.dutyCycle[output] =
          NearestDutyCycleOfAny(reqDutyCycle, divider, imp.pllLimits.maxHighLowCount);
      candidate.dutyDiff[output] = Difference(reqDutyCycle / 100.0, candidate.dutyCycle[output]);
    }
  }
}

}  // namespace Ip::Pll
