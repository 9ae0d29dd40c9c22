// Tested by margin_test.cpp.
#include "planner/answer/Margin.h"

#include <algorithm>

namespace planner::answer {

using hardware::Rational;

Rational MarginOf(const Rational& frequency, const hardware::Range& range) {
  // Where the range has no lowest end, that to the highest is all.
  const Rational above =
      range.highest == Rational(0) ? -frequency : (range.highest - frequency) / range.highest;
  if (range.lowest == Rational(0)) return above;
  return std::min((frequency - range.lowest) / range.lowest, above);
}

}  // namespace planner::answer
