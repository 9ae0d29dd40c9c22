// Why a request cannot be had as it stands, and what could be had instead.
//
// For each primitive all smallest sets of demands that cannot be met together (conflicts), all
// smallest sets that must go (corrections), and the smallest changes of single demands with which
// everything else is met. All of it is data; report/ makes sentences of it.
//
// Tested by explain_test.cpp.
#ifndef VORKEL_PLANNER_EXPLAIN_EXPLAIN_H_
#define VORKEL_PLANNER_EXPLAIN_EXPLAIN_H_

#include <cstdint>
#include <vector>

#include "planner/Device.h"
#include "planner/Finding.h"
#include "planner/Request.h"
#include "planner/explain/Changes.h"
#include "planner/explain/Demand.h"
#include "planner/explain/Inputs.h"

namespace planner::explain {

struct Conflict {
  std::vector<Demand> demands;
  // The smallest changes of one of its demands with which the whole request goes; where there are
  // none, because other conflicts remain, those with which the demands of this conflict go.
  std::vector<Change> changes;
  bool lifts_all = true;  // which of the two
};

// Two outputs that should change places.
struct Swap {
  int first = 0;
  int second = 0;
  Settings settings;
};

struct OfPrimitive {
  Primitive primitive = Primitive::kPll;
  std::vector<Finding> refusals;  // it cannot be asked at all; nothing else is then known
  bool is_met = false;            // the request goes as it stands; nothing is in the way
  std::vector<Conflict> conflicts;
  std::vector<std::vector<Demand>> corrections;
  // The smallest tolerance for all (CommonTolerance), and the smallest jitter (CommonJitter).
  std::vector<Change> together;
  std::vector<Swap> swaps;
  std::int64_t questions = 0;
  bool is_complete = true;  // false: the questions came to their end (Conflicts.h)
};

struct Explanation {
  Request request;
  std::vector<OfPrimitive> primitives;  // request.primitive alone when it names one
  std::vector<InputThatServes> inputs;
  bool IsMet() const {
    for (const OfPrimitive& one : primitives) {
      if (one.is_met) return true;
    }
    return false;
  }
};

// `oscillators` are input frequencies to try, MHz.
Explanation Explain(const Request& request, const Device& device,
                    const std::vector<Rational>& oscillators);

}  // namespace planner::explain

#endif  // VORKEL_PLANNER_EXPLAIN_EXPLAIN_H_
