// What there is to ask of the frequencies that an output can have. Memory is that of the answer,
// however many frequencies there are.
//
// Tested by find_test.cpp.
#ifndef VORKEL_PLANNER_REACH_FIND_H_
#define VORKEL_PLANNER_REACH_FIND_H_

#include <cstddef>
#include <cstdint>
#include <optional>
#include <vector>

#include "planner/reach/Reach.h"

namespace planner::reach {

struct Counted {
  std::int64_t count = 0;
  std::optional<Point> lowest;  // where there is any
  std::optional<Point> highest;
};
Counted Count(const Reach& reach, const Range& frequencies);

// Two frequencies with none between them.
struct Gap {
  Point below;
  Point above;
  bool operator==(const Gap&) const = default;
};
// The widest gaps between frequencies in a range, in MHz, at most `most`; the widest first, and of
// equal ones the lower.
std::vector<Gap> LargestGaps(const Reach& reach, const Range& frequencies, std::size_t most);

// The frequencies in a range that are nearest to one, at most `most`; the nearest first, and of two
// that are equally near the lower.
std::vector<Point> Nearest(const Reach& reach, const Rational& frequency, const Range& frequencies,
                           std::size_t most);

}  // namespace planner::reach

#endif  // VORKEL_PLANNER_REACH_FIND_H_
