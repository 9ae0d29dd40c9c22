// The rule by which gaps are too small, as a user writes it.
//
// Tested by rule_test.cpp.
#ifndef VORKEL_PLANNER_RELATIONS_RULE_H_
#define VORKEL_PLANNER_RELATIONS_RULE_H_

#include <optional>
#include <string_view>

#include "planner/read/Mistake.h"
#include "planner/relations/Relations.h"

namespace planner::relations {

// "0.5" and "0.5ns" are a gap, "20%" is a share of the shorter period. What is wrong is added to
// `mistakes` with the place, and there is no rule then.
std::optional<Rule> ReadRule(std::string_view text, const read::Place& place,
                             read::Mistakes* mistakes);

}  // namespace planner::relations

#endif  // VORKEL_PLANNER_RELATIONS_RULE_H_
