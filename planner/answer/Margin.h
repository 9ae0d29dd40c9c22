// How far frequencies stay from the limits of the device.
//
// Tested by margin_test.cpp.
#ifndef VORKEL_PLANNER_ANSWER_MARGIN_H_
#define VORKEL_PLANNER_ANSWER_MARGIN_H_

#include "hardware/Exact.h"

namespace planner::answer {

// The distance of a frequency from the nearer end of a range, as a fraction of that end:
// the smaller of (f - lowest) / lowest and (highest - f) / highest. Negative outside of the range.
// An end of 0 is none.
hardware::Rational MarginOf(const hardware::Rational& frequency, const hardware::Range& range);

}  // namespace planner::answer

#endif  // VORKEL_PLANNER_ANSWER_MARGIN_H_
