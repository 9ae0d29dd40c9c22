// The order in which the answers of a document follow each other.
//
// Tested by verify_test.cpp.
#ifndef VORKEL_PLANNER_VERIFY_SEQUENCE_H_
#define VORKEL_PLANNER_VERIFY_SEQUENCE_H_

#include <vector>

#include "planner/verify/Claim.h"
#include "planner/verify/Difference.h"
#include "planner/verify/Standing.h"

namespace planner::verify {

// `compare` has all candidates, the best first, and then what is not solved. `best` has one that
// was picked, the best, the best of each other primitive, trade-offs and the first of the engine's.
// The answers have to follow each other in one of these ways.
void HoldSequence(const Standing& standing, const std::vector<Claim>& claims,
                  Discrepancies* discrepancies);

}  // namespace planner::verify

#endif  // VORKEL_PLANNER_VERIFY_SEQUENCE_H_
