// What is demanded of an output, and in what unit the error of each demand is counted.
//
// The unit of a demand is its tolerance, so that demands of different kinds are weighed alike: an
// error of 1 unit is just what is allowed. A tolerance of 0 has the unit that is the default of
// its kind.
//
// Tested by demands_test.cpp.
#ifndef VORKEL_PLANNER_ANSWER_DEMANDS_H_
#define VORKEL_PLANNER_ANSWER_DEMANDS_H_

#include <optional>

#include "planner/Answer.h"
#include "planner/Request.h"

namespace planner::answer {

// The units of tolerances of 0: 100 ppm, 0.5 degrees, 0.5 percent points, 1 ps.
Rational FrequencyUnit(const Rational& tolerance);
Rational PhaseUnit(const Rational& tolerance);
Rational DutyUnit(const Rational& tolerance);
Rational JitterUnit(const Rational& max_jitter);

// The errors of an output: all as the actual value less the requested one. Phases are turned to
// above -180 and up to 180 degrees; those of what is not asked for are none.
struct Errors {
  Rational ppm;
  std::optional<Rational> phase;
  std::optional<Rational> duty;
};

// (actual - requested) / requested x 1e6.
Rational ErrorPpm(const Rational& actual, const Rational& requested);
// From the actual phase and duty cycle.
Errors ErrorsOf(const Output& output, const Rational& frequency, const Rational& phase,
                const Rational& duty);

// The largest |error| / unit over the demands of a used output that do not concern jitter.
Rational WorstError(const Request& request, const Output& output, const Errors& errors);
// jitter / unit of the largest jitter that is allowed; 0 where none is given or, as nothing can be
// said, the jitter is not known (kUnknownJitter of Jitter.h).
Rational JitterError(const Request& request, const Output& output, double jitter);

// Whether all demands of a used output but that for the jitter are met; and that one. An unknown
// jitter does not meet it.
bool AreMet(const Request& request, const Output& output, const Errors& errors);
bool IsJitterMet(const Request& request, const Output& output, double jitter);

}  // namespace planner::answer

#endif  // VORKEL_PLANNER_ANSWER_DEMANDS_H_
