// Tested by exact_test.cpp.
#include "hardware/Exact.h"

#include <algorithm>
#include <bit>
#include <boost/multiprecision/cpp_int.hpp>
#include <cassert>
#include <cmath>
#include <limits>
#include <stdexcept>
#include <utility>

namespace hardware {

namespace {

namespace mp = boost::multiprecision;
using Integer = mp::number<mp::cpp_int_backend<>, mp::et_off>;
using Wide = __int128;

constexpr std::int64_t kLeast = std::numeric_limits<std::int64_t>::min();
constexpr std::int64_t kMost = std::numeric_limits<std::int64_t>::max();

// The least value of a word has no opposite in it, and is not kept in one.
bool Fits(Wide value) { return value > kLeast && value <= kMost; }
bool Fits(const Integer& value) { return value > kLeast && value <= kMost; }

std::uint64_t Magnitude(std::int64_t value) {
  return value < 0 ? 0 - static_cast<std::uint64_t>(value) : static_cast<std::uint64_t>(value);
}

// By halving and subtracting, which takes less time than to divide (Stein's algorithm). `b` is not 0.
std::uint64_t Gcd(std::uint64_t a, std::uint64_t b) {
  assert(b != 0);
  if (a == 0) return b;
  if (a == 1 || b == 1) return 1;
  const int halvings = std::countr_zero(a | b);
  a >>= std::countr_zero(a);
  while (b != 0) {
    b >>= std::countr_zero(b);
    if (a > b) std::swap(a, b);
    b -= a;
  }
  return a << halvings;
}

// Of a word that is not the least, and one above 0.
std::int64_t CommonOf(std::int64_t a, std::int64_t b) {
  return static_cast<std::int64_t>(Gcd(Magnitude(a), static_cast<std::uint64_t>(b)));
}

// Keeps a quotient in lowest terms when it fits into two words.
bool Keep(Wide numerator, Wide denominator, std::int64_t* small_numerator,
          std::int64_t* small_denominator) {
  if (!Fits(numerator) || !Fits(denominator)) return false;
  *small_numerator = static_cast<std::int64_t>(numerator);
  *small_denominator = static_cast<std::int64_t>(denominator);
  return true;
}

std::int64_t Divided(std::int64_t value, std::int64_t divisor) {
  return divisor == 1 ? value : value / divisor;
}

// The exponent of the leading bit of a quotient above 0: 2^e <= value < 2^(e + 1).
int LeadingExponent(const Integer& numerator, const Integer& denominator) {
  const int guess = static_cast<int>(mp::msb(numerator)) - static_cast<int>(mp::msb(denominator));
  const bool is_below = guess >= 0 ? numerator < Integer(denominator << guess)
                                   : Integer(numerator << -guess) < denominator;
  return is_below ? guess - 1 : guess;
}

Integer Power(int exponent) { return mp::pow(Integer(10), static_cast<unsigned>(exponent)); }

}  // namespace

struct Rational::Large {
  Integer numerator;
  Integer denominator;
};

Rational::Rational(Large large) {
  assert(large.denominator != 0);
  if (large.denominator < 0) {
    large.numerator = -large.numerator;
    large.denominator = -large.denominator;
  }
  const Integer common = mp::gcd(large.numerator, large.denominator);
  large.numerator /= common;
  large.denominator /= common;
  if (Fits(large.numerator) && Fits(large.denominator)) {
    numerator_ = large.numerator.convert_to<std::int64_t>();
    denominator_ = large.denominator.convert_to<std::int64_t>();
  } else {
    large_ = std::make_shared<const Large>(std::move(large));
  }
}

Rational::Rational(std::int64_t numerator, std::int64_t denominator) {
  if (denominator == 0) throw std::domain_error("division by 0");
  if (numerator == kLeast || denominator == kLeast) {
    *this = Rational(Large{Integer(numerator), Integer(denominator)});
    return;
  }
  if (denominator < 0) {
    numerator = -numerator;
    denominator = -denominator;
  }
  const std::int64_t common = CommonOf(numerator, denominator);
  numerator_ = Divided(numerator, common);
  denominator_ = Divided(denominator, common);
}

Rational::Large Rational::Widened() const {
  return large_ ? *large_ : Large{Integer(numerator_), Integer(denominator_)};
}

Rational Rational::FromDecimal(std::string_view digits, int exponent) {
  const std::size_t first = std::min(digits.find_first_not_of('0'), digits.size() - 1);
  Large value{Integer(std::string(digits.substr(first))), 1};
  (exponent < 0 ? value.denominator : value.numerator) *= Power(std::abs(exponent));
  return Rational(std::move(value));
}

Rational Rational::FromDouble(double value) {
  constexpr int kDigits = std::numeric_limits<double>::digits;
  int exponent = 0;
  const double fraction = std::frexp(value, &exponent);
  Large exact{Integer(static_cast<std::int64_t>(std::ldexp(fraction, kDigits))), 1};
  exponent -= kDigits;
  (exponent < 0 ? exact.denominator : exact.numerator) <<= std::abs(exponent);
  return Rational(std::move(exact));
}

Rational operator+(const Rational& a, const Rational& b) {
  if (!a.large_ && !b.large_) {
    // What the denominators have in common is all that the sum can have with theirs.
    const std::int64_t common = CommonOf(a.denominator_, b.denominator_);
    const std::int64_t a_rest = Divided(a.denominator_, common);
    const std::int64_t b_rest = Divided(b.denominator_, common);
    // Two products below 2^126 each.
    Wide numerator =
        static_cast<Wide>(a.numerator_) * b_rest + static_cast<Wide>(b.numerator_) * a_rest;
    std::int64_t shared = 1;
    if (common != 1) {
      shared = CommonOf(static_cast<std::int64_t>(numerator % common), common);
      if (shared != 1) numerator /= shared;
    }
    const Wide denominator = static_cast<Wide>(Divided(common, shared)) * a_rest * b_rest;
    Rational sum;
    if (Keep(numerator, denominator, &sum.numerator_, &sum.denominator_)) return sum;
  }
  const Rational::Large x = a.Widened();
  const Rational::Large y = b.Widened();
  return Rational(Rational::Large{x.numerator * y.denominator + y.numerator * x.denominator,
                                  x.denominator * y.denominator});
}

Rational operator-(const Rational& a, const Rational& b) { return a + -b; }

Rational operator*(const Rational& a, const Rational& b) {
  if (!a.large_ && !b.large_) {
    // Each is in lowest terms: only the numerator of one and the denominator of the other can have
    // something in common.
    const std::int64_t first = CommonOf(a.numerator_, b.denominator_);
    const std::int64_t second = CommonOf(b.numerator_, a.denominator_);
    Rational product;
    if (Keep(static_cast<Wide>(Divided(a.numerator_, first)) * Divided(b.numerator_, second),
             static_cast<Wide>(Divided(a.denominator_, second)) * Divided(b.denominator_, first),
             &product.numerator_, &product.denominator_)) {
      return product;
    }
  }
  const Rational::Large x = a.Widened();
  const Rational::Large y = b.Widened();
  return Rational(Rational::Large{x.numerator * y.numerator, x.denominator * y.denominator});
}

Rational operator/(const Rational& a, const Rational& b) {
  if (b == Rational(0)) throw std::domain_error("division by 0");
  if (!b.large_) {
    Rational inverse;
    inverse.numerator_ = b.numerator_ < 0 ? -b.denominator_ : b.denominator_;
    inverse.denominator_ = b.numerator_ < 0 ? -b.numerator_ : b.numerator_;
    return a * inverse;
  }
  return a * Rational(Rational::Large{b.large_->denominator, b.large_->numerator});
}

Rational Rational::operator-() const {
  if (large_) return Rational(Large{-large_->numerator, large_->denominator});
  Rational opposite = *this;
  opposite.numerator_ = -numerator_;
  return opposite;
}

bool operator==(const Rational& a, const Rational& b) {
  if (a.large_ || b.large_) return (a <=> b) == 0;
  return a.numerator_ == b.numerator_ && a.denominator_ == b.denominator_;
}

std::strong_ordering operator<=>(const Rational& a, const Rational& b) {
  if (!a.large_ && !b.large_) {
    if (a.denominator_ == b.denominator_) return a.numerator_ <=> b.numerator_;
    return static_cast<Wide>(a.numerator_) * b.denominator_ <=>
           static_cast<Wide>(b.numerator_) * a.denominator_;
  }
  const Rational::Large x = a.Widened();
  const Rational::Large y = b.Widened();
  return Integer(x.numerator * y.denominator).compare(y.numerator * x.denominator) <=> 0;
}

bool Rational::IsWhole() const { return large_ ? large_->denominator == 1 : denominator_ == 1; }

std::optional<std::int64_t> Rational::Whole() const {
  if (large_ || denominator_ != 1) return std::nullopt;
  return numerator_;
}

std::optional<Rational::Words> Rational::InWords() const {
  if (large_) return std::nullopt;
  return Words{numerator_, denominator_};
}

std::string Rational::NumeratorText() const {
  return large_ ? large_->numerator.str() : std::to_string(numerator_);
}
std::string Rational::DenominatorText() const {
  return large_ ? large_->denominator.str() : std::to_string(denominator_);
}

Rational Rational::Floor() const {
  if (!large_) {
    const std::int64_t quotient = numerator_ / denominator_;  // towards 0
    return numerator_ % denominator_ < 0 ? quotient - 1 : quotient;
  }
  Integer quotient = large_->numerator / large_->denominator;
  if (large_->numerator < 0 && quotient * large_->denominator != large_->numerator) --quotient;
  return Rational(Large{std::move(quotient), 1});
}

Rational Rational::Round() const { return (*this + Rational(1, 2)).Floor(); }

// The quotient is scaled so that its whole part has the 53 bits of a double; what is left decides
// the rounding. Below the smallest normal double there are fewer bits.
double Rational::ToDouble() const {
  constexpr int kDigits = std::numeric_limits<double>::digits;
  constexpr std::int64_t kExact = std::int64_t{1} << kDigits;
  if (!large_ && numerator_ <= kExact && numerator_ >= -kExact && denominator_ <= kExact) {
    return static_cast<double>(numerator_) / static_cast<double>(denominator_);
  }
  Large value = Widened();
  const bool is_negative = value.numerator < 0;
  if (is_negative) value.numerator = -value.numerator;
  constexpr int kLowest = std::numeric_limits<double>::min_exponent - kDigits;
  const int leading = LeadingExponent(value.numerator, value.denominator);
  double result = std::numeric_limits<double>::max();
  if (leading < std::numeric_limits<double>::max_exponent) {
    const int unit = std::max(leading - (kDigits - 1), kLowest);
    (unit >= 0 ? value.denominator : value.numerator) <<= std::abs(unit);
    Integer quotient = value.numerator / value.denominator;
    const Integer rest = (value.numerator - quotient * value.denominator) * 2;
    if (rest > value.denominator || (rest == value.denominator && mp::bit_test(quotient, 0))) {
      ++quotient;
    }
    const double scaled = std::ldexp(quotient.convert_to<double>(), unit);  // both exact
    if (std::isfinite(scaled)) result = scaled;
  }
  return is_negative ? -result : result;
}

// The absolute value in units of the last of some decimals, rounded; nothing when it does not fit.
std::optional<std::uint64_t> Rational::InUnits(int decimals) const {
  constexpr int kMostDecimals = 18;  // so that 2 x 2^63 x 10^18 fits into Wide
  if (decimals > kMostDecimals) return std::nullopt;
  Wide scaled = numerator_ < 0 ? -Wide{numerator_} : Wide{numerator_};
  for (int i = 0; i < decimals; ++i) scaled *= 10;
  const Wide units = (scaled * 2 + denominator_) / (Wide{denominator_} * 2);
  if (units > std::numeric_limits<std::uint64_t>::max()) return std::nullopt;
  return static_cast<std::uint64_t>(units);
}

std::string Rational::Fixed(int decimals) const {
  bool is_negative = numerator_ < 0;
  std::string digits;
  if (const std::optional<std::uint64_t> short_one = large_ ? std::nullopt : InUnits(decimals)) {
    digits = std::to_string(*short_one);
  } else {
    const Large value = Widened();
    is_negative = value.numerator < 0;
    const Integer scaled = mp::abs(value.numerator) * Power(decimals) * 2 + value.denominator;
    digits = Integer(scaled / (value.denominator * 2)).str();
  }
  const auto places = static_cast<std::size_t>(decimals);
  if (digits.size() <= places) digits.insert(0, places + 1 - digits.size(), '0');
  const bool is_zero = digits.find_first_not_of('0') == std::string::npos;
  if (places > 0) digits.insert(digits.size() - places, 1, '.');
  if (is_negative && !is_zero) digits.insert(0, 1, '-');
  return digits;
}

Rational TurnedToFull(const Rational& degrees) {
  return degrees - Rational(360) * (degrees / 360).Floor();
}

Rational TurnedToHalf(const Rational& degrees) {
  const Rational full = TurnedToFull(degrees);
  return full > 180 ? full - 360 : full;
}

}  // namespace hardware
