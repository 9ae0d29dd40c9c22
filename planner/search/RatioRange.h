// The ratios to the input with which a frequency keeps a range of the device, with each input.
//
// A ratio is a / b, two whole numbers above 0 and up to kLargestRatioPart.
//
// Tested by ratio_range_test.cpp.
#ifndef VORKEL_PLANNER_SEARCH_RATIORANGE_H_
#define VORKEL_PLANNER_SEARCH_RATIORANGE_H_

#include <cmath>
#include <cstdint>

#include "planner/search/Factor.h"
#include "planner/search/LoopGrid.h"
#include "planner/search/Near.h"

namespace planner::search {

class RatioRange {
 public:
  // The inputs are above 0.
  RatioRange(const Inputs& inputs, const Range& range);

  bool IsNotAbove(std::int64_t a, std::int64_t b) const {
    return !is_empty_ && highest_.Compare(a, b) <= 0;
  }
  bool IsNotBelow(std::int64_t a, std::int64_t b) const {
    return !has_lowest_ || lowest_.Compare(a, b) >= 0;
  }
  bool Contains(std::int64_t a, std::int64_t b) const {
    return IsNotAbove(a, b) && IsNotBelow(a, b);
  }

  // The ends, rounded. No ratio is in a range whose highest is below its lowest.
  double Lowest() const { return has_lowest_ ? 1 / lowest_.Approximate() : 0; }
  double Highest() const { return is_empty_ ? 0 : 1 / highest_.Approximate(); }

  // The ratio with the largest margin, rounded; margins fall both ways from it.
  double Middle() const;
  // The smallest distance of the frequency from an end of the range, as a fraction of that end.
  Near Margin(double ratio) const;
  Rational ExactMargin(std::int64_t a, std::int64_t b) const;

 private:
  Inputs inputs_;
  Range range_;
  bool has_lowest_;
  bool is_empty_;
  Factor lowest_;   // lowest input / lowest end
  Factor highest_;  // highest input / highest end
};

}  // namespace planner::search

#endif  // VORKEL_PLANNER_SEARCH_RATIORANGE_H_
