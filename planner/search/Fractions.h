// Quotients of whole numbers in an interval.
//
// Tested by fractions_test.cpp.
#ifndef VORKEL_PLANNER_SEARCH_FRACTIONS_H_
#define VORKEL_PLANNER_SEARCH_FRACTIONS_H_

#include <cmath>
#include <cstdint>

namespace planner::search {

struct Fraction {
  std::int64_t numerator;
  std::int64_t denominator;
};

// The quotient from `lowest` to `highest`, which are above 0 and up to 10^15, with the smallest
// denominator, and of those with the smallest numerator. No other quotient in the interval has a
// smaller numerator, either. Where the denominator is above `most` it is some number above `most`.
//
// The way there is that of Euclid: with the same whole part, the simplest is that of what is left,
// upside down. What rounding does is as if the ends were off by a few units in the last place.
inline Fraction SimplestIn(double lowest, double highest, std::int64_t most) {
  // The last two of the convergents: {0 / 1, 1 / 0}.
  Fraction before = {0, 1};
  Fraction last = {1, 0};
  while (true) {
    const double whole = std::floor(lowest);
    // Nothing so large is asked for.
    if (whole > 1e15) return {1, most + 1};
    const bool is_inside = std::ceil(lowest) <= highest;
    const auto digit = static_cast<std::int64_t>(is_inside ? std::ceil(lowest) : whole);
    const Fraction next = {before.numerator + digit * last.numerator,
                           before.denominator + digit * last.denominator};
    if (is_inside || next.denominator > most) return next;
    before = last;
    last = next;
    const double below = lowest - whole;
    lowest = 1 / (highest - whole);
    highest = 1 / below;
  }
}

}  // namespace planner::search

#endif  // VORKEL_PLANNER_SEARCH_FRACTIONS_H_
