// Doubles that know how far they can be from what they stand for.
//
// Nearly all comparisons of a search are between values that lie far apart, and take a double each.
// What is closer than the doubles can tell is decided exactly, by who asks.
#ifndef VORKEL_PLANNER_SEARCH_NEAR_H_
#define VORKEL_PLANNER_SEARCH_NEAR_H_

#include <algorithm>

namespace planner::search {

// A value, and the largest distance of the true one from it.
struct Near {
  double value = 0;
  double slack = 0;
};

// What a few roundings change of a value, as a fraction of it.
inline constexpr double kRounding = 4e-15;

// A value that is worked out without cancellation.
inline Near Rounded(double value) { return {value, value * kRounding}; }

inline bool IsSurelyBelow(const Near& a, const Near& b) {
  return a.value + a.slack < b.value - b.slack;
}

// The larger of two, whichever it is.
inline Near LargerOf(const Near& a, const Near& b) {
  return {std::max(a.value, b.value), std::max(a.slack, b.slack)};
}

}  // namespace planner::search

#endif  // VORKEL_PLANNER_SEARCH_NEAR_H_
