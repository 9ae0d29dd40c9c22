// The smallest allowance with which a question goes: how far a frequency, a phase or a limit has to
// be moved. Allowing more never makes it fail, so that halving the interval finds it; and as each
// answer says how much it takes itself, the end is met exactly.
//
// Tested by smallest_test.cpp.
#ifndef VORKEL_PLANNER_EXPLAIN_SMALLEST_H_
#define VORKEL_PLANNER_EXPLAIN_SMALLEST_H_

#include <functional>
#include <optional>

#include "planner/Request.h"
#include "planner/Settings.h"

namespace planner::explain {

struct Allowance {
  Rational value;
  Settings settings;  // that do with it
};

// `find` answers settings that do with an allowance from 0 to `most`, and `needs` how much of it
// settings take, which is no more than they were allowed. Two allowances of which one is larger by
// less than one part in 2^50 count as the same. None when not even `most` does.
std::optional<Allowance> FindSmallest(
    const std::function<std::optional<Settings>(const Rational&)>& find,
    const std::function<Rational(const Settings&)>& needs, const Rational& most);

}  // namespace planner::explain

#endif  // VORKEL_PLANNER_EXPLAIN_SMALLEST_H_
