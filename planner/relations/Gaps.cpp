// Tested by gaps_test.cpp.
#include "planner/relations/Gaps.h"

namespace planner::relations {

namespace {

// Of one / other in lowest terms.
Rational Numerator(const Rational& quotient) {
  if (const auto words = quotient.InWords()) return words->numerator;
  return Rational::FromDecimal(quotient.NumeratorText(), 0);
}

// From an edge to the next one that is `offset` + k * step later.
Rational Later(const Rational& offset, const Rational& step) {
  const Rational gap = Modulo(offset, step);
  return gap == Rational(0) ? step : gap;
}

}  // namespace

// With one / other = p / q in lowest terms, one is p times and other q times the same.
Rational CommonStep(const Rational& one, const Rational& other) {
  return one / Numerator(one / other);
}

Rational Hyperperiod(const Rational& one, const Rational& other) {
  return other * Numerator(one / other);
}

Rational Modulo(const Rational& value, const Rational& step) {
  return value - step * (value / step).Floor();
}

Gaps GapsBetween(const Clock& launching, const Clock& capturing) {
  const Rational step = CommonStep(launching.period, capturing.period);
  return {Later(capturing.rise - launching.rise, step),
          Later(capturing.Fall() - launching.rise, step),
          Later(capturing.rise - launching.Fall(), step),
          Later(capturing.Fall() - launching.Fall(), step)};
}

Rational HoldGap(const Clock& launching, const Clock& capturing) {
  return Modulo(launching.rise - capturing.rise, CommonStep(launching.period, capturing.period));
}

}  // namespace planner::relations
