// The corners of a request: the ends of what its inputs can be over temperature and age.
//
// Every frequency behind an input goes with it. So a limit is kept with all that the input can be
// when it is kept at the two ends, f x (1 - t) and f x (1 + t) for a tolerance of t: lowest <= f x
// (1 - t) and f x (1 + t) <= highest. That is to say of the nominal frequency that it is in a
// narrower range, from lowest / (1 - t) to highest / (1 + t), and all of this is exact. The
// distance to an end of the narrower range, as a fraction of that end, is the one to the true limit
// in the corner that is nearest to it.
//
// Tested by corners_test.cpp.
#ifndef VORKEL_PLANNER_ANSWER_CORNERS_H_
#define VORKEL_PLANNER_ANSWER_CORNERS_H_

#include "planner/Device.h"
#include "planner/Request.h"

namespace planner::answer {

// What an input that is so many ppm off is to its frequency: 1 + ppm / 1e6.
Rational CornerFactor(const Rational& ppm);

// Where a frequency has to be nominally to be in a range at both corners. A lowest of 0 stays.
// `tolerance` is that of the input, ppm, below 1e6.
Range Narrowed(const Range& range, const Rational& tolerance);

// The device with such ranges in place of its own. What only the engine or the model of the jitter
// has of it is the same.
Device Narrowed(Device device, const Rational& tolerance);

}  // namespace planner::answer

#endif  // VORKEL_PLANNER_ANSWER_CORNERS_H_
