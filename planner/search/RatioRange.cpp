// Tested by ratio_range_test.cpp.
#include "planner/search/RatioRange.h"

#include <algorithm>

#include "planner/answer/Margin.h"

namespace planner::search {

RatioRange::RatioRange(const Inputs& inputs, const Range& range)
    : inputs_(inputs), range_(range), has_lowest_(range.lowest > 0), is_empty_(range.highest <= 0) {
  if (has_lowest_) lowest_ = Factor(inputs.lowest / range.lowest);
  if (!is_empty_) highest_ = Factor(inputs.highest / range.highest);
}

Near RatioRange::Margin(double ratio) const {
  const double above = has_lowest_ ? ratio * lowest_.Approximate() - 1 : HUGE_VAL;
  const double below = 1 - ratio * highest_.Approximate();
  const double margin = std::min(above, below);
  return {margin, kRounding * (2 + std::abs(margin))};
}

double RatioRange::Middle() const {
  // Where ratio / lowest - 1 and 1 - ratio / highest are the same.
  const double per_lowest = has_lowest_ ? lowest_.Approximate() : HUGE_VAL;
  return 2 / (per_lowest + highest_.Approximate());
}

Rational RatioRange::ExactMargin(std::int64_t a, std::int64_t b) const {
  const Rational ratio(a, b);
  return std::min(answer::MarginOf(inputs_.lowest * ratio, range_),
                  answer::MarginOf(inputs_.highest * ratio, range_));
}

}  // namespace planner::search
