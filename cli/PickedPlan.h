// The plan of a call, and which of its candidates the call is about.
//
// Tested by plan.test and wrong.test.
#ifndef VORKEL_CLI_PICKEDPLAN_H_
#define VORKEL_CLI_PICKEDPLAN_H_

#include <cstddef>

#include "cli/Call.h"
#include "cli/Setting.h"
#include "planner/plan/Plan.h"

namespace cli {

struct Picked {
  planner::plan::Plan plan;  // solved
  std::size_t number = 1;    // of --pick, which the plan has
  const planner::Answer& answer() const { return *plan.Pick(number); }
};

// Throws Failure when there is no plan, or no such candidate.
Picked PickedPlan(const Call& call, const Setting& setting);

}  // namespace cli

#endif  // VORKEL_CLI_PICKEDPLAN_H_
