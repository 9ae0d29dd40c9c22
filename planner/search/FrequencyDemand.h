// How far a frequency is off that is a quotient of the input, and whether that is allowed.
//
// A frequency is told by its ratio a / b to the first input, two whole numbers above 0.
//
// Tested by frequency_demand_test.cpp.
#ifndef VORKEL_PLANNER_SEARCH_FREQUENCYDEMAND_H_
#define VORKEL_PLANNER_SEARCH_FREQUENCYDEMAND_H_

#include <cmath>
#include <compare>
#include <cstdint>
#include <cstdlib>
#include <optional>

#include "planner/Request.h"
#include "planner/search/Factor.h"
#include "planner/search/Near.h"

namespace planner::search {

// No part of a ratio is larger.
inline constexpr std::int64_t kLargestRatioPart = std::int64_t{1} << 24;

class FrequencyDemand {
 public:
  FrequencyDemand(const Request& request, const Output& asked);

  // |error| / unit.
  Near Error(std::int64_t a, std::int64_t b) const {
    if (q_ == 0) return WideError(a, b);
    const std::int64_t whole = q_ * b;
    const std::int64_t rest = std::abs(p_ * a - whole);
    return Rounded(static_cast<double>(rest) / static_cast<double>(whole) * per_unit_);
  }
  // The order of the errors in units of two outputs; nothing where it takes more than words.
  static std::optional<std::strong_ordering> Compare(const FrequencyDemand& one, std::int64_t a,
                                                     std::int64_t b, const FrequencyDemand& other,
                                                     std::int64_t other_a, std::int64_t other_b) {
    if (one.q_ == 0 || other.q_ == 0 || one.unit_ != other.unit_) return std::nullopt;
    const std::int64_t whole = one.q_ * b;
    const std::int64_t other_whole = other.q_ * other_b;
    return Wide{std::abs(one.p_ * a - whole)} * other_whole <=>
           Wide{std::abs(other.p_ * other_a - other_whole)} * whole;
  }
  bool IsMet(std::int64_t a, std::int64_t b) const;
  // |error| in ppm, exactly.
  Rational Ppm(std::int64_t a, std::int64_t b) const;

  // The ratio to the input that makes the frequency exactly is 1 / this.
  double InputPerAsked() const { return input_per_asked_; }
  // |error| / unit of a ratio, told by ratio x InputPerAsked(). To within Slack() x (1 + ratio).
  double QuickError(double quotient) const { return std::abs(quotient - 1) * per_unit_; }
  double Slack() const { return slack_; }
  double PerUnit() const { return per_unit_; }
  // How far the frequency may be off, as a fraction of it and in units, to within rounding.
  double Allowed() const { return allowed_; }
  double AllowedUnits() const { return allowed_ * per_unit_; }

 private:
  Near WideError(std::int64_t a, std::int64_t b) const;

  Rational exact_;      // input / asked
  Rational tolerance_;  // as a fraction
  Rational unit_;       // ppm
  std::int64_t p_ = 0;  // input / asked is p_ / q_,
  std::int64_t q_ = 0;  // or this is 0 where they are too large
  double input_per_asked_;
  double allowed_;
  double per_unit_;
  double slack_;
};

}  // namespace planner::search

#endif  // VORKEL_PLANNER_SEARCH_FREQUENCYDEMAND_H_
