#include "planner/device/Decimal.h"

#include <algorithm>
#include <string>

namespace planner::device {
namespace {

using hardware::Rational;

// What Rational::FromDecimal takes as an exponent.
constexpr long kLargestExponent = 5000;

// An exponent as it can stand beside a finite double that is not 0. A device file has no more
// digits than it has bytes, so that larger ones are none.
constexpr long kMostExponent = 10'000'000;

long ExponentOf(std::string_view text) {
  const bool negative = text.starts_with('-');
  long exponent = 0;
  for (const char c : text) {
    if (c < '0' || c > '9') continue;
    exponent = std::min(10 * exponent + (c - '0'), kMostExponent);
  }
  return negative ? -exponent : exponent;
}

}  // namespace

Rational ExactDecimal(std::string_view decimal) {
  const std::size_t mark = std::min(decimal.find('e'), decimal.size());
  long exponent = mark < decimal.size() ? ExponentOf(decimal.substr(mark + 1)) : 0;
  std::string digits(decimal.substr(0, mark));
  const std::size_t point = digits.find('.');
  if (point != std::string::npos) {
    exponent -= static_cast<long>(digits.size() - point - 1);
    digits.erase(point, 1);
  }
  // Zeros at the end are better told by the exponent: "1000...0e-4000" is a small number.
  const std::size_t last = digits.find_last_not_of('0');
  if (last == std::string::npos) return 0;
  exponent += static_cast<long>(digits.size() - last - 1);
  digits.resize(last + 1);
  Rational value = Rational::FromDecimal(digits, 0);
  while (exponent != 0) {
    const long step = std::clamp(exponent, -kLargestExponent, kLargestExponent);
    value *= Rational::FromDecimal("1", static_cast<int>(step));
    exponent -= step;
  }
  return value;
}

std::optional<Rational> ExactFigure(const ::Device::Grade& grade, std::size_t index) {
  if (!grade.figures[index]) return std::nullopt;
  const bool has_source =
      index < grade.figure_sources.size() && !grade.figure_sources[index].decimal.empty();
  return has_source ? ExactDecimal(grade.figure_sources[index].decimal)
                    : Rational::FromDouble(*grade.figures[index]);
}

::Device::Primitive HostPrimitive(hardware::Primitive primitive) {
  switch (primitive) {
    case hardware::Primitive::kPll:
      return ::Device::kPll;
    case hardware::Primitive::kTsyn:
      return ::Device::kTsyn;
    case hardware::Primitive::kKruSp:
      return ::Device::kKruSp;
    case hardware::Primitive::kKruClkgen:
      break;
  }
  return ::Device::kKruClkgen;
}

}  // namespace planner::device
