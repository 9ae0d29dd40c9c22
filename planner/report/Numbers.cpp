// Tested by numbers_test.cpp.
#include "planner/report/Numbers.h"

#include <cstddef>

namespace planner::report {

namespace {

// So many decimals tell apart whatever a person has written.
constexpr int kMostDecimals = 60;

Rational PowerOfTen(int exponent) { return Rational::FromDecimal("1", exponent); }

std::string WithoutZeros(std::string text) {
  if (text.find('.') == std::string::npos) return text;
  text.erase(text.find_last_not_of('0') + 1);
  if (text.back() == '.') text.pop_back();
  return text;
}

// The exponent of the leading digit of a value above 0.
int LeadingDigit(const Rational& value) {
  const auto whole = static_cast<int>(value.NumeratorText().size());
  int exponent = whole - static_cast<int>(value.DenominatorText().size());
  while (value < PowerOfTen(exponent)) --exponent;
  while (value >= PowerOfTen(exponent + 1)) ++exponent;
  return exponent;
}

}  // namespace

std::string Fixed(const Rational& value, int decimals) { return value.Fixed(decimals); }

std::string Fixed(double value, int decimals) {
  return Rational::FromDouble(value).Fixed(decimals);
}

std::string Short(const Rational& value, int decimals) {
  return WithoutZeros(Fixed(value, decimals));
}

std::string Short(double value, int decimals) {
  return Short(Rational::FromDouble(value), decimals);
}

std::string General(const Rational& value, int digits) {
  if (value == Rational(0)) return "0";
  const Rational size = value.Absolute();
  int exponent = LeadingDigit(size);
  const auto rounded = [&] {
    return (size * PowerOfTen(digits - 1 - exponent) + Rational(1, 2)).Floor();
  };
  // Rounding can make one digit more.
  if (rounded() >= PowerOfTen(digits)) ++exponent;
  const std::string sign = value < Rational(0) ? "-" : "";
  if (exponent >= -4 && exponent < digits) return sign + Short(size, digits - 1 - exponent);
  const std::string mantissa = Short(rounded() * PowerOfTen(-(digits - 1)), digits - 1);
  std::string power = std::to_string(exponent < 0 ? -exponent : exponent);
  if (power.size() < 2) power.insert(0, "0");
  return sign + mantissa + (exponent < 0 ? "e-" : "e+") + power;
}

std::string Distinct(const Rational& value, const Rational& other, int decimals) {
  std::string text = Short(value, decimals);
  while (value != other && text == Short(other, decimals) && decimals < kMostDecimals) {
    text = Short(value, ++decimals);
  }
  return text;
}

std::string Ps(double value) { return Fixed(value, 3); }

std::string Eighths(int count) { return Short(Rational(count, 8), 3); }

std::string Quotient(const Rational& value) {
  std::string text = value.NumeratorText();
  if (!value.IsWhole()) text += "/" + value.DenominatorText();
  return text;
}

std::string Decimal(const Rational& value) {
  // Decimals end where the denominator divides a power of ten: of its factors 2 and 5 none is there
  // more often than it has digits to the base of 2.
  Rational scaled = value;
  int decimals = 0;
  const auto most = static_cast<int>(value.DenominatorText().size()) * 4;
  while (!scaled.IsWhole() && decimals < most) {
    scaled *= 10;
    ++decimals;
  }
  return scaled.IsWhole() ? value.Fixed(decimals) : Quotient(value);
}

}  // namespace planner::report
