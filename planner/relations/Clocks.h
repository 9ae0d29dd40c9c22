// The clocks that a design has of an answer, as their edges: the inputs and what comes out of the
// primitive with each of them.
//
// All of them rise together at time 0, but for their phases.
//
// Tested by clocks_test.cpp.
#ifndef VORKEL_PLANNER_RELATIONS_CLOCKS_H_
#define VORKEL_PLANNER_RELATIONS_CLOCKS_H_

#include <optional>
#include <vector>

#include "planner/Answer.h"
#include "planner/Request.h"

namespace planner::relations {

// A clock rises at rise, rise + period, rise + 2 * period ... and falls `high` after each of these.
// Times in ns.
struct Clock {
  int input = 0;          // the input that it is, or that the primitive follows when it is there
  int output = -1;        // the place of the output; -1: it is the input itself
  std::vector<int> also;  // further outputs on the same pin of a KRU: they are this clock
  Rational period;        // above 0
  Rational rise;          // from 0 to below a period
  Rational high;          // above 0 and below a period
  std::optional<double> jitter;  // ps, peak to peak; unknown with the second input

  bool IsInput() const { return output < 0; }
  Rational Fall() const { return rise + high; }
};

// Those of an answer that is solved: the first input, the outputs that follow it by their places,
// and then the same of the second input, where there is one.
std::vector<Clock> ClocksOf(const Request& request, const Answer& answer);

// The same request with inputs as fast as their tolerance lets them be: then all periods and all
// gaps are at their shortest, each by the same part.
Request Fastest(const Request& request);

}  // namespace planner::relations

#endif  // VORKEL_PLANNER_RELATIONS_CLOCKS_H_
