// Tested by frequency_demand_test.cpp.
#include "planner/search/FrequencyDemand.h"

#include "planner/answer/Demands.h"

namespace planner::search {

namespace {

constexpr std::int64_t kMillion = 1'000'000;

// With parts below this, products with those of a ratio stay below 2^62.
constexpr std::int64_t kLargestWord = (std::int64_t{1} << 62) / kLargestRatioPart;

}  // namespace

FrequencyDemand::FrequencyDemand(const Request& request, const Output& asked)
    : exact_(request.inputs.front() / asked.frequency),
      tolerance_(request.ToleranceOf(asked) / kMillion),
      unit_(answer::FrequencyUnit(request.ToleranceOf(asked))),
      input_per_asked_(exact_.ToDouble()),
      allowed_(tolerance_.ToDouble()),
      per_unit_((Rational(kMillion) / unit_).ToDouble()),
      slack_(kRounding * per_unit_) {
  const auto words = exact_.InWords();
  if (words && words->numerator < kLargestWord && words->denominator < kLargestWord) {
    p_ = words->numerator;
    q_ = words->denominator;
  }
}

Near FrequencyDemand::WideError(std::int64_t a, std::int64_t b) const {
  const double quotient = input_per_asked_ * static_cast<double>(a) / static_cast<double>(b);
  return {QuickError(quotient), slack_ * (1 + quotient)};
}

bool FrequencyDemand::IsMet(std::int64_t a, std::int64_t b) const {
  const Near error = Error(a, b);
  const Near allowed = Rounded(AllowedUnits());
  if (IsSurelyBelow(error, allowed)) return true;
  if (IsSurelyBelow(allowed, error)) return false;
  if (error.value + error.slack == 0) return true;
  return (exact_ * Rational(a, b) - 1).Absolute() <= tolerance_;
}

Rational FrequencyDemand::Ppm(std::int64_t a, std::int64_t b) const {
  return (exact_ * Rational(a, b) - 1).Absolute() * kMillion;
}

}  // namespace planner::search
