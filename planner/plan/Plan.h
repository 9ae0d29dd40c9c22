// A plan: all that the primitives of a device make of a request, the best first.
//
// It is a value, and making one leaves nothing behind: many can be made side by side.
//
// Tested by plan_test.cpp.
#ifndef VORKEL_PLANNER_PLAN_PLAN_H_
#define VORKEL_PLANNER_PLAN_PLAN_H_

#include <cstddef>
#include <optional>
#include <vector>

#include "planner/Answer.h"
#include "planner/Device.h"
#include "planner/Request.h"
#include "planner/answer/Rank.h"

namespace planner::plan {

// Where a plan takes its answers from. request.engine_only is as if `search` were not set.
struct Options {
  bool engine = true;
  bool search = true;
  // For who shows nothing but what ranks first: that is the same, with all that is known of it, and
  // is a trade-off when it is one in a whole plan. What ranks behind it, the front and front_cut
  // may be those of its primitive alone.
  bool first_only = false;
};

// Why the answer at place `first` of the ranking is before that at place `second`.
struct Reason {
  std::size_t first = 0;
  std::size_t second = 0;
  answer::Criterion decided = answer::Criterion::kNone;
};

struct Plan {
  Request request;

  // What is solved, the best first: the engine's answers; of the search over all settings, for each
  // primitive the first of each bandwidth and the one with the smallest error. The same settings
  // are there once, with both flags of their source. Number N of a table of candidates is at place
  // N - 1. With any_order an answer can have the outputs at other places than the request; it then
  // goes by places (answer/Moved.h).
  std::vector<Answer> ranked;
  // The trade-offs among all settings of all primitives (answer/Front.h); with engine_only among
  // the engine's answers.
  Front front;

  // The primitives for which nothing is solved, each with its reasons, in their usual order.
  std::vector<Answer> refused;
  // Those for which the engine finds nothing, although the search does.
  std::vector<Answer> engine_refused;

  // Why the first is before the best of each other primitive that has one, in the order of these,
  // and before the next of its own primitive.
  std::vector<Reason> among_primitives;
  std::optional<Reason> among_own;

  // Primitives some of whose trade-offs are left out, because there are more than the search keeps
  // (search::kMostOfFront). All else is complete.
  std::vector<Primitive> front_cut;

  bool IsSolved() const { return !ranked.empty(); }
  // Candidate `number`, from 1; null when there is none.
  const Answer* Pick(std::size_t number) const {
    return number >= 1 && number <= ranked.size() ? &ranked[number - 1] : nullptr;
  }
  // The first of those that the engine answers; null when it answers none.
  const Answer* FirstOfEngine() const {
    for (const Answer& answer : ranked) {
      if (answer.source.engine) return &answer;
    }
    return nullptr;
  }
};

// Of all primitives of the device, or of request.primitive alone. Throws std::invalid_argument when
// the device does not have that one.
Plan Make(const Request& request, const Device& device, const Options& options = {});

}  // namespace planner::plan

#endif  // VORKEL_PLANNER_PLAN_PLAN_H_
