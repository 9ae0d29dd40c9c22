// Tested by jitter_demand_test.cpp.
#include "planner/search/JitterDemand.h"

#include <algorithm>
#include <cmath>

#include "planner/answer/Demands.h"

namespace planner::search {

using hardware::Rational;

void JitterDemand::Add(const Rational& allowed) {
  double most = allowed.ToDouble();
  if (Rational::FromDouble(most) > allowed) {
    most = std::nextafter(most, -std::numeric_limits<double>::infinity());
  }
  most_ = std::min(most_, most);
  const Rational unit = answer::JitterUnit(allowed);
  unit_ = is_asked_ ? std::min(unit_, unit) : unit;
  per_unit_ = 1 / unit_.ToDouble();
  is_asked_ = true;
}

Rational JitterDemand::ExactError(double jitter) const {
  if (!is_asked_ || jitter == std::numeric_limits<double>::infinity()) return 0;
  return Rational::FromDouble(jitter) / unit_;
}

}  // namespace planner::search
