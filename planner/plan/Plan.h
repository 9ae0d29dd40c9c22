// A plan: all that the primitives of a device make of a request, the best first.
//
// It is a value, and making one leaves nothing behind: many can be made side by side.
//
// Tested by plan_test.cpp.
#ifndef VORKEL_PLANNER_PLAN_PLAN_H_
#define VORKEL_PLANNER_PLAN_PLAN_H_

#include <cstddef>
#include <cstdint>
#include <optional>
#include <vector>

#include "planner/Answer.h"
#include "planner/Device.h"
#include "planner/Request.h"
#include "planner/answer/Rank.h"

namespace planner::plan {

struct Options {
  // With any_order: how many orders of the outputs are tried for each primitive, at most. Seven
  // outputs have 5040.
  std::uint64_t most_orders = 5040;
};

// Why the answer at place `first` of the ranking is before that at place `second`.
struct Reason {
  std::size_t first = 0;
  std::size_t second = 0;
  answer::Criterion decided = answer::Criterion::kNone;
};

// A limit on work that has kept something from being looked at.
struct BoundWork {
  Primitive primitive = Primitive::kPll;
  std::uint64_t tried = 0;
  std::uint64_t all = 0;
};

struct Plan {
  Request request;
  // What is solved, the best first: the engine's answers, the first of the search for each
  // bandwidth, and the one with the smallest error. The same settings are there once, with both
  // flags of their source. Number N of a table of candidates is at place N - 1.
  std::vector<Answer> ranked;
  // The trade-offs among all settings of all primitives (answer/Front.h).
  Front front;
  // The primitives for which nothing is solved, each with its reasons, in their usual order.
  std::vector<Answer> refused;
  // Why the first is before the best of each other primitive that has one, in the order of these,
  // and before the second of its own primitive.
  std::vector<Reason> among_primitives;
  std::optional<Reason> among_own;
  // Where a limit on work has bound: empty when everything was looked at.
  std::vector<BoundWork> bound;

  bool IsSolved() const { return !ranked.empty(); }
  // Candidate `number`, from 1; null when there is none.
  const Answer* Pick(std::size_t number) const {
    return number >= 1 && number <= ranked.size() ? &ranked[number - 1] : nullptr;
  }
};

// Of all primitives of the device, or of request.primitive alone. With request.engine_only only
// what the engine answers is there.
Plan Make(const Request& request, const Device& device, const Options& options = {});

}  // namespace planner::plan

#endif  // VORKEL_PLANNER_PLAN_PLAN_H_
