// What settings make of a request, judged exactly.
#ifndef VORKEL_PLANNER_ANSWER_H_
#define VORKEL_PLANNER_ANSWER_H_

#include <optional>
#include <string>
#include <vector>

#include "planner/Finding.h"
#include "planner/Settings.h"

namespace planner {

// What an answer's settings make of one output. Frequencies in MHz, phases in degrees, duty
// cycles in percent, jitter in ps peak to peak at a bit error rate of 1e-12.
struct OutputAnswer {
  bool used = true;
  Rational ratio;      // to the input
  Rational frequency;  // with the first input
  std::optional<Rational> frequency_second;
  Rational error_ppm;                   // (frequency - requested) / requested * 1e6
  Rational phase;                       // as the step says it: negative for a negative request
  std::optional<Rational> phase_error;  // above -180 and up to 180, when one was asked for
  Rational duty;
  std::optional<Rational> duty_error;  // percent points
  std::optional<double> jitter;        // with that of the input
  std::optional<double> jitter_rms;    // of the random part alone
  std::optional<double> searched;      // MHz: what the engine counted with
  Rational margin = 0;                 // to the limits of its range: see Answer
  // What is not as asked for (kOffTarget), and what is outside of the device's limits.
  std::vector<Finding> misses;
  std::vector<Finding> violations;
  bool IsWithin() const { return misses.empty() && violations.empty(); }
};

// Where settings come from. Those of the user's own come from neither of both.
struct Source {
  bool engine = false;       // the design flow's own search answers them
  bool search = false;       // the search over all settings has found them
  std::string variant = {};  // of the engine: "smallest VCO", "largest VCO", ...; empty else
};

struct Answer {
  Primitive primitive = Primitive::kPll;
  Source source;
  bool solved = false;
  std::vector<Finding> refusals;  // why it is not solved

  // Of a solved one:
  Settings settings;
  std::vector<OutputAnswer> outputs;  // as many as the request has
  Rational vco = 0;                   // MHz, with the first input; 0 of a KRU
  Rational pfd = 0;
  std::optional<double> searched_vco;  // MHz: what the engine counted with
  std::optional<double> phase_error;   // between input and outputs, ps
  std::vector<Finding> violations;     // VCO and PFD, and then those of all outputs
  std::vector<Finding> notes;
  // The largest |error_ppm| and the largest jitter, unknown when that of an output is.
  Rational worst_ppm = 0;
  std::optional<double> max_jitter;
  // The worst error of all demands, each in units of its tolerance (see answer/Rank.h).
  Rational worst_error = 0;
  // The smallest distance of a frequency from a limit of the device, as a fraction of that limit,
  // with each input at the worst of what it can be (answer/Corners.h): of VCO and PFD, 0 of a KRU,
  // and of these and all outputs.
  Rational vco_margin = 0;
  Rational pfd_margin = 0;
  Rational margin = 0;
  bool within = false;  // all is as asked for and inside of the device's limits
};

// Settings of which each has less jitter than all with a smaller error, the best first.
using Front = std::vector<Answer>;

}  // namespace planner

#endif  // VORKEL_PLANNER_ANSWER_H_
