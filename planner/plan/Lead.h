// Which primitive has what ranks first, found without making answers of all candidates.
//
// Tested by lead_test.cpp.
#ifndef VORKEL_PLANNER_PLAN_LEAD_H_
#define VORKEL_PLANNER_PLAN_LEAD_H_

#include <optional>
#include <vector>

#include "planner/Device.h"
#include "planner/Request.h"
#include "planner/search/Search.h"

namespace planner::plan {

struct Lead {
  Primitive primitive = Primitive::kPll;
  // What the search has found of it. Where something meets all demands, that alone; else what is
  // no further off than what ranks first of the primitives before it.
  search::Found found;
};

// Nothing where no primitive has settings, and where only a whole plan can tell: with any_order,
// with engine_only, and with a rank by which what is first need not be a trade-off.
std::optional<Lead> LeadOf(const Request& request, const Device& device,
                           const std::vector<Primitive>& primitives);

}  // namespace planner::plan

#endif  // VORKEL_PLANNER_PLAN_LEAD_H_
