// The frequencies that an output can have, a second time in the plainest way: everything that can be
// set is tried in exact arithmetic. It shares no code with planner/reach.
#ifndef VORKEL_TESTS_PLANNER_REACH_PLAIN_REACH_H_
#define VORKEL_TESTS_PLANNER_REACH_PLAIN_REACH_H_

#include <vector>

#include "planner/Device.h"
#include "planner/Request.h"

namespace plain {

// All frequencies, MHz, rising, each once. The request is as for planner::reach::Reach.
std::vector<planner::Rational> Frequencies(const planner::Request& request,
                                           const planner::Device& device,
                                           planner::Primitive primitive, int output);

// Those of them that are in a range.
std::vector<planner::Rational> Within(const std::vector<planner::Rational>& all,
                                      const planner::Range& range);

}  // namespace plain

#endif  // VORKEL_TESTS_PLANNER_REACH_PLAIN_REACH_H_
