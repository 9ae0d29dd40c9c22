// The denominators of the quotients in a span.
//
// Tested by denominators_test.cpp.
#ifndef VORKEL_PLANNER_SEARCH_DENOMINATORS_H_
#define VORKEL_PLANNER_SEARCH_DENOMINATORS_H_

#include <algorithm>
#include <cmath>
#include <cstdint>

#include "planner/search/Fractions.h"
#include "planner/search/VcoSpans.h"

namespace planner::search {

// Those up to `most` with which there can be a quotient in the span, in rising order. All that have
// one are among them, also where rounding has moved the ends of the span by less than kWider.
//
// Two quotients a / b and c / d that differ are 1 / (bd) apart at least. So beside the smallest
// denominator all that are below 1 / (smallest x width of the span) are its multiples: in a short
// span that are few.
class Denominators {
 public:
  Denominators(const Span& span, int most) : first_(1), others_from_(1) {
    if (!(span.lowest > 0)) return;
    const double lowest = span.lowest * (1 - kWider);
    const double highest = span.highest * (1 + kWider);
    first_ = std::min<std::int64_t>(SimplestIn(lowest, highest, most).denominator, most + 1);
    const double width = (highest - lowest) * (1 + kWider) + highest * kWider;
    const auto others = std::min(1 / (static_cast<double>(first_) * width), most + 1.0);
    others_from_ = static_cast<std::int64_t>(others);
  }

  // Above `most` where there is none.
  int First() const { return static_cast<int>(first_); }
  // The one after another.
  int Next(int denominator) const {
    const std::int64_t next = std::int64_t{denominator} + 1;
    if (next >= others_from_) return static_cast<int>(next);
    return static_cast<int>(std::min((denominator / first_ + 1) * first_, others_from_));
  }

 private:
  std::int64_t first_;
  std::int64_t others_from_;  // from there on any number can be one
};

}  // namespace planner::search

#endif  // VORKEL_PLANNER_SEARCH_DENOMINATORS_H_
