// Tested by factor_test.cpp.
#include "planner/search/Factor.h"

#include <algorithm>
#include <cmath>

#include "planner/search/Near.h"

namespace planner::search {

Factor::Factor(const Rational& value) : approximate_(value.ToDouble()), value_(value) {
  const auto words = value.InWords();
  numerator_ = words ? words->numerator : 1;
  denominator_ = words ? words->denominator : 0;
}

std::strong_ordering Factor::CompareSlowly(std::int64_t a, std::int64_t b) const {
  return value_ * a <=> Rational(b);
}

// The double is near enough to begin with, on the side that it does not come from; the comparison
// decides.
std::int64_t Factor::Floor(std::int64_t a, std::int64_t most) const {
  const double product = approximate_ * static_cast<double>(a);
  if (product > static_cast<double>(most) * (1 + 1e-9) + 1) return most;
  std::int64_t whole = static_cast<std::int64_t>(product * (1 + kRounding)) + 1;
  while (Compare(a, whole) < 0) --whole;
  return std::min(whole, most);
}

std::int64_t Factor::Ceiling(std::int64_t a, std::int64_t most) const {
  const double product = approximate_ * static_cast<double>(a);
  if (product > static_cast<double>(most) * (1 + 1e-9) + 1) return most;
  std::int64_t whole =
      std::max<std::int64_t>(static_cast<std::int64_t>(product * (1 - kRounding)) - 1, 0);
  while (Compare(a, whole) > 0) ++whole;
  return std::min(whole, most);
}

}  // namespace planner::search
