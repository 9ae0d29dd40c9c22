// Tested by smallest_test.cpp.
#include "planner/explain/Smallest.h"

#include <utility>

namespace planner::explain {

namespace {

// Below a value by less than can be told.
Rational JustBelow(const Rational& value) {
  return value - value / (std::int64_t{1} << 50);
}

// A number between two others with few digits.
Rational Between(const Rational& low, const Rational& high) {
  const Rational middle = (low + high) / 2;
  const Rational rounded = Rational::FromDouble(middle.ToDouble());
  return low < rounded && rounded < high ? rounded : middle;
}

}  // namespace

std::optional<Allowance> FindSmallest(
    const std::function<std::optional<Settings>(const Rational&)>& find,
    const std::function<Rational(const Settings&)>& needs, const Rational& most) {
  std::optional<Settings> found = find(most);
  if (!found) return std::nullopt;
  Allowance smallest{needs(*found), std::move(*found)};
  Rational low = 0;
  while (smallest.value > low) {
    const Rational below = JustBelow(smallest.value);
    if (below <= low) break;
    found = find(below);
    if (!found) break;
    smallest = {needs(*found), std::move(*found)};
    if (smallest.value <= low) break;
    // Nearer steps would take too many turns.
    const Rational middle = Between(low, smallest.value);
    found = find(middle);
    if (found) {
      smallest = {needs(*found), std::move(*found)};
    } else {
      low = middle;
    }
  }
  return smallest;
}

}  // namespace planner::explain
