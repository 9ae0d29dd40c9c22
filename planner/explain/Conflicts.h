// All smallest sets of demands that cannot be met together, and all smallest sets whose loss lets
// the rest be met.
//
// Tested by conflicts_test.cpp.
#ifndef VORKEL_PLANNER_EXPLAIN_CONFLICTS_H_
#define VORKEL_PLANNER_EXPLAIN_CONFLICTS_H_

#include <cstdint>
#include <functional>
#include <vector>

#include "planner/explain/Demand.h"

namespace planner::explain {

// The questions that are asked at most for one primitive.
inline constexpr std::int64_t kMostQuestions = 20000;

struct Conflicts {
  // Each cannot be met, and can be without any one of its demands. The smaller ones first.
  std::vector<Set> conflicts;
  // Each is what must go, and nothing of it can stay. The smaller ones first.
  std::vector<Set> corrections;
  std::int64_t questions = 0;
  bool complete = true;  // false: the questions came to their end, and there may be more
};

// `goes` says whether the demands of a set go together: a subset of what does must, too. Where
// all go together, both lists are empty.
Conflicts FindConflicts(std::size_t demands, const std::function<bool(Set)>& goes,
                        std::int64_t most_questions = kMostQuestions);

}  // namespace planner::explain

#endif  // VORKEL_PLANNER_EXPLAIN_CONFLICTS_H_
