// Exact numbers: quotients of whole numbers of any size.
//
// What a person writes and what a clock primitive makes of it are quotients of whole numbers:
// 33.333 MHz is 33333/1000, and an output is input x M / (D x divider). They are kept as such, so
// that "equal" and "in range" mean just that; a number is rounded once, when it is shown.
//
// Nearly all of them fit into two words of 64 bits, and sums and products of those into 128. What
// does not fit goes through Boost.Multiprecision, slower and with the same answers.
//
// Tested by exact_test.cpp.
#ifndef VORKEL_HARDWARE_EXACT_H_
#define VORKEL_HARDWARE_EXACT_H_

#include <compare>
#include <concepts>
#include <cstdint>
#include <limits>
#include <memory>
#include <optional>
#include <string>
#include <string_view>

namespace hardware {

// A value that does not change but by assignment. Always in lowest terms, with a denominator
// above 0.
class Rational {
 public:
  Rational() = default;
  template <std::signed_integral T>
  Rational(T whole) : numerator_(whole) {  // NOLINT: it is a quotient
    if (numerator_ == std::numeric_limits<std::int64_t>::min()) *this = Rational(numerator_, 1);
  }
  // Throws std::domain_error when the denominator is 0.
  Rational(std::int64_t numerator, std::int64_t denominator);

  // digits x 10^exponent. `digits` are decimal digits, one at least; the exponent is from -5000
  // to 5000.
  static Rational FromDecimal(std::string_view digits, int exponent);
  // The double, which must be finite, exactly.
  static Rational FromDouble(double value);

  friend Rational operator+(const Rational& a, const Rational& b);
  friend Rational operator-(const Rational& a, const Rational& b);
  friend Rational operator*(const Rational& a, const Rational& b);
  // Throws std::domain_error when b is 0.
  friend Rational operator/(const Rational& a, const Rational& b);
  Rational operator-() const;
  Rational& operator+=(const Rational& other) { return *this = *this + other; }
  Rational& operator-=(const Rational& other) { return *this = *this - other; }
  Rational& operator*=(const Rational& other) { return *this = *this * other; }
  Rational& operator/=(const Rational& other) { return *this = *this / other; }

  friend bool operator==(const Rational& a, const Rational& b);
  friend std::strong_ordering operator<=>(const Rational& a, const Rational& b);

  bool IsWhole() const;
  // The value when it is whole and fits.
  std::optional<std::int64_t> Whole() const;
  // Numerator and denominator, when both fit: for who has to be quick.
  struct Words {
    std::int64_t numerator;
    std::int64_t denominator;
  };
  std::optional<Words> InWords() const;
  // Numerator and denominator as decimal digits, the first with its sign.
  std::string NumeratorText() const;
  std::string DenominatorText() const;

  // The largest whole number that is not above the value.
  Rational Floor() const;
  // The whole number that is nearest; of two that are equally near the larger one.
  Rational Round() const;
  Rational Absolute() const { return *this < Rational(0) ? -*this : *this; }

  // The nearest double; of two that are equally near the even one. The largest finite one of its
  // sign for what is beyond it.
  double ToDouble() const;
  // With so many decimals, rounded to the nearest; half of the last one away from 0. Never "-0".
  std::string Fixed(int decimals) const;

 private:
  struct Large;
  // Reduces, and keeps it small where it fits. Its denominator is not 0.
  explicit Rational(Large large);
  Large Widened() const;
  std::optional<std::uint64_t> InUnits(int decimals) const;

  std::int64_t numerator_ = 0;
  std::int64_t denominator_ = 1;
  std::shared_ptr<const Large> large_;  // the value, where it does not fit into the two above
};

// The same angle above -180 and up to 180 degrees, and from 0 to below 360 degrees.
Rational TurnedToHalf(const Rational& degrees);
Rational TurnedToFull(const Rational& degrees);

// A closed interval. Nothing is in one whose lowest is above its highest.
struct Range {
  Rational lowest;
  Rational highest;
  bool Contains(const Rational& value) const { return lowest <= value && value <= highest; }
  bool operator==(const Range&) const = default;
};

}  // namespace hardware

#endif  // VORKEL_HARDWARE_EXACT_H_
