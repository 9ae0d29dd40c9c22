// Phases and duty cycles that the output dividers of the plain PLL/TSYN solver can make.

#include <cmath>

#include "plain_numbers.h"
#include "plain_pll.h"
#include "plain_pll_stages.h"

namespace plain {
namespace {

constexpr double kMaxDivider = 128.0;
constexpr double kFractionTolerance = 0.0001;
constexpr double kNoDifference = 0.0001;
constexpr double kFullTurn = 360.0;

bool IsDivider(double divider) { return 1.0 <= divider && divider <= kMaxDivider; }

bool IsFractional(double value) {
  return std::fabs(WholeNumber(value + 0.5) - value) >= kFractionTolerance;
}

// |request - actual|, with what is too small to matter taken as no difference.
double Difference(double request, double actual) {
  const double difference = std::fabs(request - actual);
  return difference <= kNoDifference ? 0.0 : difference;
}

double NearestPositivePhase(double request, double step) {
  double best = 0.0;
  for (int k = 0;; ++k) {
    const double p = k * step;
    if (!(p <= kFullTurn)) break;
    if (p == request) return p;
    if (k == 0) best = p;
    if (std::fabs(best - request) >= std::fabs(p - request)) best = p;
  }
  return best;
}

// Walks from -360 upward. A phase replaces the best one when it is at least as far from it as from
// the request: not the rule of the positive direction.
double NearestNegativePhase(double request, double step) {
  double best = 0.0;
  for (int k = 0;; ++k) {
    const double p = k * step;
    if (!(p <= kFullTurn)) break;
    const double q = p - kFullTurn;
    if (!(q >= -kFullTurn)) continue;
    if (q == request) return q;
    if (k == 0) best = q;
    if (std::fabs(q - best) >= std::fabs(q - request)) best = q;
  }
  return best;
}

void SetPhaseAndDutyCycle(int n, const PllLimits& limits, const RequestLists& lists,
                          VcoCandidate& candidate) {
  const double divider = n == 0 ? candidate.div0 : candidate.divN[n];
  candidate.phase[n] = PhaseForRequest(lists.phase[n], divider);
  candidate.phaseDiff[n] = Difference(lists.phase[n], candidate.phase[n]);
  candidate.dutyCycle[n] =
      DutyCycleForRequest(lists.dutyCycle[n], divider, limits.maxHighLowCount);
  candidate.dutyDiff[n] = Difference(lists.dutyCycle[n] / 100.0, candidate.dutyCycle[n]);
}

}  // namespace

double PhaseForRequest(double request, double divider) {
  if (!IsDivider(divider)) return 0.0;
  const double step = 1.0 / (divider * 8.0) * kFullTurn;
  if (request > 0.0) return NearestPositivePhase(request, step);
  if (request < 0.0) return NearestNegativePhase(request, step);
  return 0.0;
}

double DutyCycleForRequest(double requestPercent, double divider, double maxHighLowCount) {
  if (requestPercent == 0.0 || !IsDivider(divider)) return 0.0;
  if (divider == 1.0) return 0.5;
  const double request = requestPercent / 100.0;
  double lowest = 1.0 / divider;
  double highest = (divider - 0.5) / divider;
  if (divider > maxHighLowCount) {
    lowest = (divider - maxHighLowCount) / divider;
    highest = (maxHighLowCount + 0.5) / divider;
  }
  if (highest > 1.0) highest = 1.0;
  const double step = 0.5 / divider;

  double best = 0.0;
  bool first = true;
  for (double x = lowest; x <= highest; x += step) {
    if (x == request) return x;
    if (first) best = x;
    first = false;
    if (std::fabs(best - request) >= std::fabs(x - request)) best = x;
  }
  return best;
}

void GetPhasesAndDutyCycles(const PllRequest& request, const PllLimits& limits,
                            const RequestLists& lists, PllState& state, Trace& trace) {
  trace.Print("DLL ------ getting phases and duty cycles\n");
  for (int n = 0; n < request.count; ++n) {
    for (std::optional<VcoCandidate>& slot : state.candidates) {
      if (!slot) continue;
      const bool fractional = IsFractional(slot->m) || IsFractional(slot->div0);
      if (request.prim == kPrimTsyn && !request.intDiv0Only && fractional) {
        // A fractional setting anywhere leaves a TSYN no choice of phase and duty cycle.
        slot->phase[n] = 0.0;
        slot->phaseDiff[n] = 0.0;
        slot->dutyDiff[n] = 0.0;
        slot->dutyCycle[n] = 0.5;
        continue;
      }
      SetPhaseAndDutyCycle(n, limits, lists, *slot);
    }
  }
}

}  // namespace plain
