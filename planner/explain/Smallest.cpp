// Tested by smallest_test.cpp.
#include "planner/explain/Smallest.h"

#include <algorithm>
#include <utility>

namespace planner::explain {

namespace {

// Each turn halves the interval at least.
constexpr int kMostTurns = 100;

// Below a value by less than can be told.
Rational JustBelow(const Rational& value) { return value - value / (std::int64_t{1} << 50); }

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
  // What settings take is never more than what they were allowed.
  const auto ask = [&](const Rational& allowed) -> std::optional<Allowance> {
    std::optional<Settings> found = find(allowed);
    if (!found) return std::nullopt;
    return Allowance{std::min(needs(*found), allowed), std::move(*found)};
  };
  std::optional<Allowance> smallest = ask(most);
  Rational low = 0;
  for (int turn = 0; smallest && smallest->value > low && turn < kMostTurns; ++turn) {
    const Rational below = JustBelow(smallest->value);
    if (below <= low) break;
    std::optional<Allowance> found = ask(below);
    if (!found) break;
    smallest = std::move(found);
    if (smallest->value <= low) break;
    // Nearer steps would take too many turns.
    const Rational middle = Between(low, smallest->value);
    found = ask(middle);
    if (found) {
      smallest = std::move(found);
    } else {
      low = middle;
    }
  }
  return smallest;
}

}  // namespace planner::explain
