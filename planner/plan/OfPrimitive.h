// What one primitive makes of a request.
#ifndef VORKEL_PLANNER_PLAN_OFPRIMITIVE_H_
#define VORKEL_PLANNER_PLAN_OFPRIMITIVE_H_

#include <vector>

#include "planner/Answer.h"
#include "planner/Device.h"
#include "planner/Request.h"
#include "planner/answer/Moved.h"
#include "planner/plan/Plan.h"
#include "planner/search/Search.h"

namespace planner::plan {

// What there is for the outputs in one order.
struct Attempt {
  answer::PlaceOrder order;
  Request placed;              // the request in that order
  std::vector<Answer> engine;  // what is solved
  std::vector<Answer> search;  // the first of each bandwidth, and that with the smallest error
  search::Found found;
};

struct OfPrimitive {
  Primitive primitive = Primitive::kPll;
  // Of the order of the request, and of all others with any_order.
  std::vector<Attempt> attempts;
  // Why it cannot be asked, or why the engine finds nothing with the outputs in the order of the
  // request; and that no settings keep the device's limits.
  std::vector<Finding> refusals;

  // The answers to show: those with the outputs as in the request, and, from the engine as from
  // the search, those of the order whose best ranks before all that come earlier. The same
  // settings are there once.
  std::vector<Answer> Shown() const;
  // Whether the engine solves it with some order.
  bool IsEngineSolved() const;
};

// `options` are those of the plan, without the search where the request has none. `found`, if not
// null, is what the search has found already, with the outputs in the order of the request.
OfPrimitive MakeOf(Primitive primitive, const Request& request, const Device& device,
                   const Options& options, const search::Found* found = nullptr);

// One candidate of a search, as an answer to the request in the order of the attempt.
Answer AnswerOf(const Attempt& attempt, const Settings& settings, const Device& device);

}  // namespace planner::plan

#endif  // VORKEL_PLANNER_PLAN_OFPRIMITIVE_H_
