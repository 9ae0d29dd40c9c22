// The Pareto front: the settings for which there is none with both a smaller error and less
// jitter.
//
// Only what is of the class of the best is there (Rank.h): less jitter does not make up for a
// demand that is missed while others meet it. Its members are in the order of their worst errors,
// the smallest first; each has less jitter than all before it. So the first has the smallest
// error, the last the least jitter. Of those that are equal in both, the one that ranks first is
// there. Without a known jitter only the first is left.
//
// Tested by front_test.cpp.
#ifndef VORKEL_PLANNER_ANSWER_FRONT_H_
#define VORKEL_PLANNER_ANSWER_FRONT_H_

#include <cstddef>
#include <functional>
#include <vector>

#include "planner/Answer.h"
#include "planner/answer/Rank.h"

namespace planner::answer {

// The places of the keys that are on the front. Keys of class kUnsolved never are. `before` tells
// whether the one at the first place ranks before that at the second; it is asked only for keys
// with equal error and jitter.
std::vector<std::size_t> FrontOf(const std::vector<RankKey>& keys,
                                 const std::function<bool(std::size_t, std::size_t)>& before);

// The front of answers to a request, in any order.
Front FrontOf(const Request& request, const std::vector<Answer>& answers);

}  // namespace planner::answer

#endif  // VORKEL_PLANNER_ANSWER_FRONT_H_
