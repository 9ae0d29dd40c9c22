// The version of plans in JSON, which doc/planner-json.md describes.
#ifndef VORKEL_PLANNER_PLANVERSION_H_
#define VORKEL_PLANNER_PLANVERSION_H_

namespace planner {

// Counts up when an entry goes, is added, or changes its meaning or type.
inline constexpr int kPlanVersion = 4;

}  // namespace planner

#endif  // VORKEL_PLANNER_PLANVERSION_H_
