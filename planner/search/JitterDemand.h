// The largest jitter that outputs may have, ps, for outputs that all have the same.
//
// Tested by jitter_demand_test.cpp.
#ifndef VORKEL_PLANNER_SEARCH_JITTERDEMAND_H_
#define VORKEL_PLANNER_SEARCH_JITTERDEMAND_H_

#include <limits>

#include "hardware/Exact.h"
#include "planner/search/Near.h"

namespace planner::search {

class JitterDemand {
 public:
  // None.
  JitterDemand() = default;

  // Adds that of one more output.
  void Add(const hardware::Rational& allowed);

  bool IsAsked() const { return is_asked_; }
  // An unknown jitter meets no demand.
  bool IsMet(double jitter) const { return !is_asked_ || jitter <= most_; }
  // jitter / unit; 0 of an unknown one.
  Near Error(double jitter) const {
    return is_asked_ && jitter < std::numeric_limits<double>::infinity()
               ? Rounded(jitter * per_unit_)
               : Near{};
  }
  hardware::Rational ExactError(double jitter) const;

 private:
  bool is_asked_ = false;
  double most_ = std::numeric_limits<double>::infinity();  // the largest double that is allowed
  double per_unit_ = 0;
  hardware::Rational unit_;  // the smallest of the outputs
};

}  // namespace planner::search

#endif  // VORKEL_PLANNER_SEARCH_JITTERDEMAND_H_
