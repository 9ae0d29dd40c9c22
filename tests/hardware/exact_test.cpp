#include "hardware/Exact.h"

#include <gtest/gtest.h>

#include <cmath>
#include <cstdint>
#include <limits>
#include <optional>
#include <random>
#include <stdexcept>

namespace hardware {
namespace {

constexpr std::int64_t kMost = std::numeric_limits<std::int64_t>::max();
constexpr std::int64_t kLeast = std::numeric_limits<std::int64_t>::min();

TEST(Rational, IsKeptInLowestTerms) {
  const Rational value(-6, -4);
  EXPECT_EQ(value.NumeratorText(), "3");
  EXPECT_EQ(value.DenominatorText(), "2");
  EXPECT_EQ(Rational(6, -4).NumeratorText(), "-3");
  EXPECT_EQ(Rational(0, -5).DenominatorText(), "1");
}

TEST(Rational, RefusesToDivideByZero) {
  EXPECT_THROW(Rational(1, 0), std::domain_error);
  EXPECT_THROW(Rational(1) / Rational(0), std::domain_error);
  const Rational large = Rational(kMost) * kMost;
  EXPECT_THROW(large / Rational(0), std::domain_error);
}

TEST(Rational, CountsBeyondTwoWords) {
  const Rational square = Rational(kMost) * kMost;
  EXPECT_EQ(square.NumeratorText(), "85070591730234615847396907784232501249");
  EXPECT_EQ(square / kMost, Rational(kMost));
  EXPECT_EQ((square + 1) - square, Rational(1));
  EXPECT_EQ(-(-square), square);
  EXPECT_EQ((Rational(1) / square).DenominatorText(), "85070591730234615847396907784232501249");
  EXPECT_EQ(Rational(1) / square * square, Rational(1));
}

TEST(Rational, DividesByWhatIsBelowZero) {
  EXPECT_EQ(Rational(3) / Rational(-2), Rational(-3, 2));
  EXPECT_EQ(Rational(-3, 5) / Rational(-2, 7), Rational(21, 10));
  const Rational large = Rational(kMost) * kMost;
  EXPECT_EQ(Rational(2) / -large, Rational(-2) / large);
  EXPECT_LT(Rational(2) / -large, Rational(0));
}

// Equal numbers are in the same form; so no large one equals a small one.
TEST(Rational, IsEqualByValueInBothForms) {
  const Rational large = Rational(kMost) * kMost;
  EXPECT_TRUE(large == Rational(kMost) * kMost);
  EXPECT_FALSE(large == large + 1);
  EXPECT_FALSE(large == Rational(kMost));
  EXPECT_FALSE(Rational(kMost) == large);
  EXPECT_FALSE(Rational(2, 3) == Rational(2, 5));
  EXPECT_FALSE(Rational(2, 3) == Rational(1, 3));
}

TEST(Rational, HasTheLeastWordToo) {
  const Rational least = kLeast;
  EXPECT_EQ(least.NumeratorText(), "-9223372036854775808");
  EXPECT_EQ((-least).NumeratorText(), "9223372036854775808");
  EXPECT_EQ(-(-least), least);
  EXPECT_EQ((Rational(1) / least).DenominatorText(), "9223372036854775808");
  EXPECT_EQ(Rational(kLeast, kLeast), Rational(1));
  EXPECT_EQ(Rational(1, kLeast), Rational(1) / least);
  EXPECT_EQ(least.Absolute() - 1, Rational(kMost));
}

TEST(Rational, IsOrderedByValue) {
  EXPECT_LT(Rational(1, 3), Rational(34, 100));
  EXPECT_GT(Rational(-1, 3), Rational(-34, 100));
  const Rational square = Rational(kMost) * kMost;
  EXPECT_LT(square, square + Rational(1, 7));
  EXPECT_LT(-square, Rational(0));
  EXPECT_LT(Rational(kMost - 1, kMost), Rational(kMost, kMost - 1));
}

TEST(Rational, ReadsDecimals) {
  EXPECT_EQ(Rational::FromDecimal("187617", -3), Rational(187617, 1000));
  EXPECT_EQ(Rational::FromDecimal("0005", 2), Rational(500));
  EXPECT_EQ(Rational::FromDecimal("0", -30), Rational(0));
  const Rational tiny = Rational::FromDecimal("1", -30);
  EXPECT_GT(tiny, Rational(0));
  EXPECT_EQ(tiny * Rational::FromDecimal("1", 30), Rational(1));
}

TEST(Rational, FloorAndRound) {
  EXPECT_EQ(Rational(7, 2).Floor(), Rational(3));
  EXPECT_EQ(Rational(-7, 2).Floor(), Rational(-4));
  EXPECT_EQ(Rational(-4).Floor(), Rational(-4));
  EXPECT_EQ(Rational(7, 2).Round(), Rational(4));
  EXPECT_EQ(Rational(-7, 2).Round(), Rational(-3));  // the larger of two
  const Rational large = Rational(kMost) * kMost;
  EXPECT_EQ((large + Rational(1, 2)).Floor(), large);
  EXPECT_EQ((-large - Rational(1, 2)).Floor(), -large - 1);
  EXPECT_EQ((-large).Floor(), -large);
  EXPECT_EQ(Rational(7).Whole(), 7);
  EXPECT_EQ(Rational(7, 2).Whole(), std::nullopt);
  EXPECT_EQ(large.Whole(), std::nullopt);
  EXPECT_TRUE(large.IsWhole());
  EXPECT_FALSE((large + Rational(1, 2)).IsWhole());
  EXPECT_TRUE(Rational(7).IsWhole());
  EXPECT_FALSE(Rational(7, 2).IsWhole());
}

TEST(Rational, TellsItsWordsWhereItFits) {
  const std::optional<Rational::Words> words = Rational(6, -4).InWords();
  ASSERT_TRUE(words.has_value());
  EXPECT_EQ(words->numerator, -3);
  EXPECT_EQ(words->denominator, 2);
  const Rational most = std::numeric_limits<std::int64_t>::max();
  EXPECT_FALSE((most + 1).InWords().has_value());
}

TEST(Rational, RoundsOnceWhenShown) {
  EXPECT_EQ(Rational(2, 3).Fixed(3), "0.667");
  EXPECT_EQ(Rational(-1, 2).Fixed(0), "-1");
  EXPECT_EQ(Rational(-1, 3000).Fixed(3), "0.000");
  EXPECT_EQ(Rational(12345, 10).Fixed(0), "1235");
  EXPECT_EQ(Rational(-5, 1000).Fixed(2), "-0.01");
  EXPECT_EQ(Rational(27).Fixed(6), "27.000000");
}

// A double is its own value exactly.
TEST(Rational, TakesDoublesAsTheyAre) {
  std::mt19937_64 random(1);
  for (int i = 0; i < 20000; ++i) {
    const double value =
        std::ldexp(static_cast<double>(random()), static_cast<int>(random() % 2000) - 1060);
    if (!std::isfinite(value)) continue;
    ASSERT_EQ(Rational::FromDouble(value).ToDouble(), value);
    ASSERT_EQ(Rational::FromDouble(-value).ToDouble(), -value);
  }
  EXPECT_EQ(Rational::FromDouble(0.1).DenominatorText(), "36028797018963968");  // 2^55
  EXPECT_EQ(Rational::FromDouble(std::numeric_limits<double>::denorm_min()).ToDouble(),
            std::numeric_limits<double>::denorm_min());
}

TEST(Rational, GoesToTheNearestDouble) {
  EXPECT_EQ(Rational(1, 3).ToDouble(), 1.0 / 3.0);
  // Half-way between two doubles goes to the even one, and a little more to the other.
  const Rational half = Rational(1) + Rational(1, std::int64_t{1} << 53);
  EXPECT_EQ(half.ToDouble(), 1.0);
  EXPECT_EQ((half + Rational::FromDecimal("1", -60)).ToDouble(), std::nextafter(1.0, 2.0));
  EXPECT_EQ((half + Rational(1, std::int64_t{1} << 52)).ToDouble(), 1.0 + std::ldexp(1.0, -51));
  const Rational huge = Rational::FromDecimal("1", 400);
  EXPECT_EQ(huge.ToDouble(), std::numeric_limits<double>::max());
  EXPECT_EQ((-huge).ToDouble(), -std::numeric_limits<double>::max());
  // The largest double is 2^1024 - 2^971. Half-way to 2^1024 the even one would be that.
  const Rational largest = Rational::FromDouble(std::numeric_limits<double>::max());
  const Rational over = largest + Rational::FromDouble(std::ldexp(1.0, 970));
  EXPECT_EQ(over.ToDouble(), std::numeric_limits<double>::max());
  EXPECT_EQ((-over).ToDouble(), -std::numeric_limits<double>::max());
  EXPECT_EQ((Rational(1) / huge).ToDouble(), 0.0);
}

// Decimal texts of up to 25 digits read as strtod reads them.
TEST(Rational, RoundsDecimalsAsTheLibraryDoes) {
  std::mt19937_64 random(2);
  for (int i = 0; i < 20000; ++i) {
    std::string digits;
    const auto count = 1 + random() % 25;
    for (std::uint64_t n = 0; n < count; ++n) {
      digits += static_cast<char>('0' + random() % 10);
    }
    const int exponent = static_cast<int>(random() % 60) - 40;
    const std::string text = digits + "e" + std::to_string(exponent);
    ASSERT_EQ(Rational::FromDecimal(digits, exponent).ToDouble(),
              std::strtod(text.c_str(), nullptr))
        << text;
  }
}

// Sums and products against those of wider words.
TEST(Rational, CountsAlikeInBothForms) {
  std::mt19937_64 random(3);
  const Rational shift = Rational(kMost) * kMost;
  for (int i = 0; i < 5000; ++i) {
    const auto number = [&] {
      return static_cast<std::int64_t>(random() >> (random() % 60 + 2)) - 1000;
    };
    const Rational a(number(), std::abs(number()) + 1);
    const Rational b(number(), std::abs(number()) + 1);
    // The same by way of numbers that do not fit into words.
    ASSERT_EQ(a + b, ((a + shift) + (b + shift)) - shift - shift);
    ASSERT_EQ(a * b, (a * shift) * (b * shift) / shift / shift);
    ASSERT_EQ(a < b, a + shift < b + shift);
  }
}

// Numerator and denominator of sums, products and quotients against cross multiplication and
// Euclid's algorithm; with words up to the largest.
TEST(Rational, KeepsSumsAndProductsInLowestTerms) {
  using Wide = __int128;
  std::mt19937_64 random(4);
  const auto expect = [](const Rational& value, Wide numerator, Wide denominator) {
    Wide a = numerator < 0 ? -numerator : numerator;
    for (Wide b = denominator; b != 0;) {
      const Wide rest = a % b;
      a = b;
      b = rest;
    }
    numerator /= a;
    denominator /= a;
    const std::optional<Rational::Words> words = value.InWords();
    const bool fits = numerator <= kMost && numerator > kLeast && denominator <= kMost;
    ASSERT_EQ(words.has_value(), fits);
    if (!fits) return;
    ASSERT_EQ(words->numerator, static_cast<std::int64_t>(numerator));
    ASSERT_EQ(words->denominator, static_cast<std::int64_t>(denominator));
  };
  for (int i = 0; i < 20000; ++i) {
    // Few or many bits, and often with factors in common.
    const auto number = [&] {
      const auto bits = static_cast<std::int64_t>(random() >> (random() % 62 + 2));
      return random() % 3 == 0 ? bits / 720720 * 720720 : bits;
    };
    const std::int64_t a = random() % 2 == 0 ? number() : -number();
    const std::int64_t c = random() % 2 == 0 ? number() : -number();
    const std::int64_t b = number() + (random() % 50 == 0 ? kMost / 2 : 1);
    const std::int64_t d = random() % 3 == 0 ? b : number() + 1;
    expect(Rational(a, b), a, b);
    expect(Rational(a, b) * Rational(c, d), Wide{a} * c, Wide{b} * d);
    expect(Rational(a, b) + Rational(c, d), Wide{a} * d + Wide{c} * b, Wide{b} * d);
    if (c > 0) expect(Rational(a, b) / Rational(c, d), Wide{a} * d, Wide{b} * c);
  }
}

TEST(Angles, Turn) {
  EXPECT_EQ(TurnedToHalf(-180), Rational(180));
  EXPECT_EQ(TurnedToHalf(180), Rational(180));
  EXPECT_EQ(TurnedToHalf(Rational(3601, 10)), Rational(1, 10));
  EXPECT_EQ(TurnedToHalf(270), Rational(-90));
  EXPECT_EQ(TurnedToFull(-30), Rational(330));
  EXPECT_EQ(TurnedToFull(720), Rational(0));
}

TEST(Range, HasItsEnds) {
  const Range range{400, 1080};
  EXPECT_TRUE(range.Contains(400));
  EXPECT_TRUE(range.Contains(1080));
  const Rational little = Rational::FromDecimal("1", -30);
  EXPECT_FALSE(range.Contains(Rational(400) - little));
  EXPECT_FALSE(range.Contains(Rational(1080) + little));
  EXPECT_FALSE((Range{2, 1}.Contains(Rational(3, 2))));
}

}  // namespace
}  // namespace hardware
