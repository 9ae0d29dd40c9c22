// A quotient above 0 that is multiplied by whole numbers and compared with others: exactly, and in
// a few nanoseconds where it fits into two words.
#ifndef VORKEL_PLANNER_SEARCH_FACTOR_H_
#define VORKEL_PLANNER_SEARCH_FACTOR_H_

#include <compare>
#include <cstdint>

#include "hardware/Exact.h"

namespace planner::search {

using hardware::Rational;
using Wide = __int128;

class Factor {
 public:
  Factor() = default;
  // `value` is above 0.
  explicit Factor(const Rational& value);

  // The nearest double.
  double Approximate() const { return approximate_; }

  // The order of value x a and b, whole numbers from 0 to below 2^60.
  std::strong_ordering Compare(std::int64_t a, std::int64_t b) const {
    if (denominator_ == 0) return CompareSlowly(a, b);
    return static_cast<Wide>(numerator_) * a <=> static_cast<Wide>(denominator_) * b;
  }
  // The whole number that is next to value x a, below or above; `most`, which is
  // below 2^60, where that is smaller.
  std::int64_t Floor(std::int64_t a, std::int64_t most) const;
  std::int64_t Ceiling(std::int64_t a, std::int64_t most) const;

 private:
  std::strong_ordering CompareSlowly(std::int64_t a, std::int64_t b) const;

  std::int64_t numerator_ = 1;
  std::int64_t denominator_ = 1;  // 0 where the quotient does not fit into words
  double approximate_ = 1;
  Rational value_ = 1;
};

}  // namespace planner::search

#endif  // VORKEL_PLANNER_SEARCH_FACTOR_H_
