// The trade-offs of a plan between error and jitter, as text.
#ifndef VORKEL_PLANNER_REPORT_FRONTTEXT_H_
#define VORKEL_PLANNER_REPORT_FRONTTEXT_H_

#include <cstddef>
#include <string>
#include <vector>

#include "planner/plan/Plan.h"
#include "planner/report/Style.h"

namespace planner::report {

// The trade-offs that matter: those that can be told from each other by what is shown of them, and
// that are near what was asked for (kFarPpm of Why.h), but for the first. They begin with the one
// that the ranking of the request puts first: with a ranking by jitter the one with the least
// jitter, else the one with the smallest error.
std::vector<const Answer*> Tradeoffs(const plan::Plan& plan);

// At most `most` of them, in that order. Empty when `most` is 0.
std::string FrontText(const plan::Plan& plan, std::size_t most, const Style& style);

}  // namespace planner::report

#endif  // VORKEL_PLANNER_REPORT_FRONTTEXT_H_
