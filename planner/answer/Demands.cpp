// Tested by demands_test.cpp.
#include "planner/answer/Demands.h"

#include <algorithm>

#include "planner/answer/Jitter.h"

namespace planner::answer {

namespace {

Rational UnitOf(const Rational& tolerance, const Rational& default_unit) {
  return tolerance == Rational(0) ? default_unit : tolerance;
}

}  // namespace

Rational FrequencyUnit(const Rational& tolerance) { return UnitOf(tolerance, 100); }
Rational PhaseUnit(const Rational& tolerance) { return UnitOf(tolerance, Rational(1, 2)); }
Rational DutyUnit(const Rational& tolerance) { return UnitOf(tolerance, Rational(1, 2)); }
Rational JitterUnit(const Rational& max_jitter) { return UnitOf(max_jitter, 1); }

Rational ErrorPpm(const Rational& actual, const Rational& requested) {
  return (actual - requested) / requested * 1'000'000;
}

Errors ErrorsOf(const Output& output, const Rational& frequency, const Rational& phase,
                const Rational& duty) {
  Errors errors;
  errors.ppm = ErrorPpm(frequency, output.frequency);
  if (output.phase) errors.phase = hardware::TurnedToHalf(phase - *output.phase);
  if (output.duty) errors.duty = duty - *output.duty;
  return errors;
}

Rational WorstError(const Request& request, const Output& output, const Errors& errors) {
  Rational worst = errors.ppm.Absolute() / FrequencyUnit(request.ToleranceOf(output));
  if (errors.phase) {
    worst = std::max(worst, errors.phase->Absolute() / PhaseUnit(request.PhaseToleranceOf(output)));
  }
  if (errors.duty) {
    worst = std::max(worst, errors.duty->Absolute() / DutyUnit(request.DutyToleranceOf(output)));
  }
  return worst;
}

Rational JitterError(const Request& request, const Output& output, double jitter) {
  const std::optional<Rational>& allowed = request.MaxJitterOf(output);
  if (!allowed || jitter == kUnknownJitter) return 0;
  return Rational::FromDouble(jitter) / JitterUnit(*allowed);
}

bool AreMet(const Request& request, const Output& output, const Errors& errors) {
  return errors.ppm.Absolute() <= request.ToleranceOf(output) &&
         (!errors.phase || errors.phase->Absolute() <= request.PhaseToleranceOf(output)) &&
         (!errors.duty || errors.duty->Absolute() <= request.DutyToleranceOf(output));
}

bool IsJitterMet(const Request& request, const Output& output, double jitter) {
  const std::optional<Rational>& allowed = request.MaxJitterOf(output);
  return !allowed || (jitter != kUnknownJitter && Rational::FromDouble(jitter) <= *allowed);
}

}  // namespace planner::answer
