// Plans as text: the report on one of the candidates and why it is the best, the numbered ranking
// of all of them, and the trade-offs.
#ifndef VORKEL_PLANNER_REPORT_PLANTEXT_H_
#define VORKEL_PLANNER_REPORT_PLANTEXT_H_

#include <cstddef>
#include <string>

#include "planner/Device.h"
#include "planner/plan/Plan.h"
#include "planner/report/Style.h"

namespace planner::report {

// The report on candidate `number` of a plan, from 1, which it has; a table of the best of each
// primitive; what the design flow's own search makes of the request; why the candidate is the best
// or what is before it; primitives without settings; and hints.
std::string PlanText(const plan::Plan& plan, const Device& device, std::size_t number,
                     const Style& style, const Calls& calls);

// The same with at most `most` trade-offs.
std::string BestText(const plan::Plan& plan, const Device& device, std::size_t number,
                     std::size_t most, const Style& style, const Calls& calls);

// The ranking of a solved plan.
std::string CompareText(const plan::Plan& plan, const Device& device, const Style& style,
                        const Calls& calls);

// Why a plan has nothing at all, for standard error.
std::string UnsolvedText(const plan::Plan& plan, const Device& device, const Style& style,
                         const Calls& calls);

// Why the engine has no settings of the one primitive that it was asked for. `cause` is what else
// is known of that, a sentence, or empty.
std::string UnsolvedText(const Answer& answer, const Device& device, const std::string& cause,
                         const Style& style, const Calls& calls);

}  // namespace planner::report

#endif  // VORKEL_PLANNER_REPORT_PLANTEXT_H_
