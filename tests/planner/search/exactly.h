// What tests that work everything out exactly have in common.
#ifndef VORKEL_TESTS_PLANNER_SEARCH_EXACTLY_H_
#define VORKEL_TESTS_PLANNER_SEARCH_EXACTLY_H_

#include <string>

#include "../../compare/Random.h"
#include "hardware/Exact.h"
#include "planner/search/Near.h"

namespace exactly {

using hardware::Rational;

// Whether a value is as near to the exact one as it says.
inline bool Holds(const planner::search::Near& near, const Rational& exact) {
  return (Rational::FromDouble(near.value) - exact).Absolute() <= Rational::FromDouble(near.slack);
}

// A value whose parts do not fit into words, just above another.
inline Rational JustAbove(const Rational& value) {
  return value + Rational::FromDecimal("123456789012345678901", -60);
}
inline Rational JustBelow(const Rational& value) {
  return value - Rational::FromDecimal("123456789012345678901", -60);
}

// A value, or once in a while one that is a little off it and does not fit into words.
inline Rational Nudged(compare::Random& random, const Rational& value) {
  if (!random.OneIn(3)) return value;
  return random.OneIn(2) ? JustAbove(value) : JustBelow(value);
}

inline std::string TextOf(const Rational& value) {
  return value.NumeratorText() + "/" + value.DenominatorText();
}

}  // namespace exactly

#endif  // VORKEL_TESTS_PLANNER_SEARCH_EXACTLY_H_
