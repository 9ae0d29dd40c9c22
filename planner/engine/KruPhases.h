// The phases that the engine is asked for on a KRU.
//
// It takes them as numbers: the pins have 0, 90, 180 and 270 degrees, or 0 and 180, one PHASE_SHIFT
// moves them all, and what is left of each phase above that of a pin must be the same to the last
// bit. So it has nothing for -90 degrees, which are 270, nor for 10.1 beside 100.1, of which the
// arithmetic leaves two different rests. And an output whose phase does not matter must have one
// that goes with the others. It is asked, in this order, until it has what is wanted:
//   for the phases as they are written
//   for those between 0 and 360 degrees that are the same
//   for those that the pins make with one step of PHASE_SHIFT, the one that comes nearest to all,
//   where all are then within their tolerance
//   for those with the nearest step that is not 0: the pins that make a frequency need not have the
//   phase of a pin, such as 90 degrees, but they have all steps below it
// each time with these phases of the outputs that ask for none: 0, each one that is asked for, and
// those 90, 180 and 270 degrees from it.
//
// Tested by kru_phases_test.cpp.
#ifndef VORKEL_PLANNER_ENGINE_KRUPHASES_H_
#define VORKEL_PLANNER_ENGINE_KRUPHASES_H_

#include <vector>

#include "planner/Request.h"

namespace planner::engine {

// The lists of phases to ask for, each a phase for each output of the request (that of an unused
// one is 0), degrees. `feedback` is whether a KRU_SP has its feedback connected.
std::vector<std::vector<double>> KruPhases(const Request& request, Primitive primitive,
                                           bool feedback);

}  // namespace planner::engine

#endif  // VORKEL_PLANNER_ENGINE_KRUPHASES_H_
