// Tested by output_shape_test.cpp.
#include "planner/search/OutputShape.h"

#include <algorithm>
#include <cmath>

#include "hardware/Loop.h"
#include "planner/answer/Demands.h"
#include "planner/search/Factor.h"

namespace planner::search {

namespace {

using hardware::kEighths;

// With all parts of a demand below this, products with dividers and a few constants fit into 128
// bits.
constexpr std::int64_t kLargest = std::int64_t{1} << 44;

// Percent of a half of a VCO period behind a divider of an eighth.
constexpr int kPercentPerHalf = 50 * kEighths;

}  // namespace

OutputShape::Demand OutputShape::DemandOf(const Rational& asked, const Rational& tolerance,
                                          const Rational& unit) {
  Demand demand{.is_asked = true, .exact = asked, .tolerance = tolerance};
  demand.per_unit = (1 / unit).ToDouble();
  demand.value = asked.ToDouble();
  demand.tolerated = tolerance.ToDouble();
  const auto words = asked.InWords();
  const auto allowed = tolerance.InWords();
  if (words && allowed && std::abs(words->numerator) < kLargest && words->denominator < kLargest &&
      allowed->numerator < kLargest && allowed->denominator < kLargest) {
    demand.asked = words->numerator;
    demand.per = words->denominator;
    demand.allowed = allowed->numerator;
    demand.allowed_per = allowed->denominator;
  }
  return demand;
}

ShapeError OutputShape::Judge(const Demand& demand, const Rational& error) {
  return {Rounded(error.ToDouble() * demand.per_unit), error <= demand.tolerance};
}

// How far part / whole is from what is asked for.
ShapeError OutputShape::Compare(const Demand& demand, std::int64_t part, int whole) {
  const double quotient = static_cast<double>(part) / whole;
  const Near error = {std::abs(quotient - demand.value),
                      kRounding * (std::abs(quotient) + std::abs(demand.value))};
  const Near tolerated = Rounded(demand.tolerated);
  const bool is_below = IsSurelyBelow(error, tolerated);
  if (!is_below && !IsSurelyBelow(tolerated, error)) {
    return Judge(demand, (Rational(part, whole) - demand.exact).Absolute());
  }
  const Near in_units = Rounded(error.value * demand.per_unit);
  return {{in_units.value, in_units.slack + error.slack * demand.per_unit}, is_below};
}

// The whole number that is nearest to what is asked for x factor / per, of two the larger.
std::int64_t OutputShape::NearestOf(const Demand& demand, int factor, int per) {
  const double value = demand.value * factor / per;
  const double nearest = std::floor(value + 0.5);
  // How far it is from the middle between two.
  const double distance = 0.5 - std::abs(value - nearest);
  if (distance > kRounding * (1 + std::abs(value))) return static_cast<std::int64_t>(nearest);
  return *(demand.exact * Rational(factor, per)).Round().Whole();
}

OutputShape::OutputShape(const Request& request, const Output& asked, int count) : count_(count) {
  if (asked.phase) {
    const Rational& tolerance = request.PhaseToleranceOf(asked);
    const Rational degrees = 360;
    phase_ = DemandOf(*asked.phase / degrees, tolerance / degrees,
                      answer::PhaseUnit(tolerance) / degrees);
    still_phase_ = Judge(phase_, hardware::TurnedToHalf(-*asked.phase).Absolute() / degrees);
  }
  if (asked.duty) {
    const Rational& tolerance = request.DutyToleranceOf(asked);
    duty_ = DemandOf(*asked.duty, tolerance, answer::DutyUnit(tolerance));
    still_duty_ = Judge(duty_, (Rational(50) - *asked.duty).Absolute());
  }
}

// A step is 1 / divider of a turn, so that the error is |rest| / (per x divider), with the rest of
// asked x divider that is nearest to a multiple of `per`.
ShapeError OutputShape::Phase(int divider) const {
  if (!phase_.is_asked) return {};
  if (phase_.per == 0) return Compare(phase_, Step(divider), divider);
  const std::int64_t above = std::abs(phase_.asked) * divider % phase_.per;
  const std::int64_t rest = std::min(above, phase_.per - above);
  const std::int64_t whole = phase_.per * divider;
  return {Rounded(static_cast<double>(rest) / static_cast<double>(whole) * phase_.per_unit),
          Wide{rest} * phase_.allowed_per <= Wide{phase_.allowed} * whole};
}

int OutputShape::Step(int divider) const {
  if (!phase_.is_asked) return 0;
  return static_cast<int>(NearestOf(phase_, divider, 1));
}

ShapeError OutputShape::Duty(int divider) const {
  if (!duty_.is_asked) return {};
  const int halves = HighTime(divider);
  if (duty_.per == 0) return Compare(duty_, std::int64_t{kPercentPerHalf} * halves, divider);
  const Wide difference = Wide{kPercentPerHalf} * halves * duty_.per - Wide{duty_.asked} * divider;
  const Wide rest = difference < 0 ? -difference : difference;
  const Wide whole = Wide{duty_.per} * divider;
  return {Rounded(static_cast<double>(rest) / static_cast<double>(whole) * duty_.per_unit),
          rest * duty_.allowed_per <= whole * duty_.allowed};
}

int OutputShape::HighTime(int divider) const {
  if (!duty_.is_asked) return 0;
  const hardware::HighTimes times = hardware::HighTimesOf(divider / kEighths, count_);
  const std::int64_t nearest = NearestOf(duty_, divider, kPercentPerHalf);
  // Of a longest that is below the shortest, as with a divider beyond the counters, the longest.
  return static_cast<int>(
      std::min<std::int64_t>(std::max<std::int64_t>(nearest, times.shortest), times.longest));
}

}  // namespace planner::search
