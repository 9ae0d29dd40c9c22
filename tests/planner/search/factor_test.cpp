// Tests of quotients that are multiplied by whole numbers.
#include "planner/search/Factor.h"

#include <gtest/gtest.h>

#include <algorithm>

#include "exactly.h"
#include "tests/compare/Random.h"

namespace planner::search {
namespace {

using exactly::JustAbove;
using exactly::JustBelow;

constexpr std::int64_t kLarge = (std::int64_t{1} << 60) - 1;  // the largest that is compared

std::int64_t PlainFloor(const Rational& value, std::int64_t a, std::int64_t most) {
  return *std::min((value * a).Floor(), Rational(most)).Whole();
}
std::int64_t PlainCeiling(const Rational& value, std::int64_t a, std::int64_t most) {
  return *std::min(-(-value * a).Floor(), Rational(most)).Whole();
}

TEST(Factor, IsOneByItself) {
  EXPECT_EQ(Factor().Compare(7, 7), std::strong_ordering::equal);
  EXPECT_EQ(Factor().Floor(7, 100), 7);
  EXPECT_EQ(Factor().Approximate(), 1);
}

TEST(Factor, ComparesExactly) {
  const Factor third(Rational(1, 3));
  EXPECT_EQ(third.Compare(6, 2), std::strong_ordering::equal);
  EXPECT_EQ(third.Compare(0, 0), std::strong_ordering::equal);
  EXPECT_EQ(third.Compare(0, 1), std::strong_ordering::less);
  EXPECT_EQ(third.Compare(1, 0), std::strong_ordering::greater);
  EXPECT_EQ(third.Compare(kLarge, kLarge / 3), std::strong_ordering::equal);  // 4^30 - 1
  EXPECT_EQ(third.Compare(kLarge - 1, kLarge / 3), std::strong_ordering::less);
}

TEST(Factor, ComparesWhatTakesNearlyAllOfTheBits) {
  constexpr std::int64_t kMost = INT64_MAX;
  const Factor large(Rational(kMost, 2));
  EXPECT_EQ(large.Compare(kLarge, kLarge), std::strong_ordering::greater);
  const Factor small(Rational(2, kMost));
  EXPECT_EQ(small.Compare(kLarge, kLarge), std::strong_ordering::less);
  const Factor nearly(Rational(kMost - 1, kMost));
  EXPECT_EQ(nearly.Compare(kLarge, kLarge), std::strong_ordering::less);
  EXPECT_EQ(nearly.Compare(kLarge, kLarge - 1), std::strong_ordering::greater);
}

TEST(Factor, ComparesWhatDoesNotFitIntoWords) {
  const Factor above(JustAbove(Rational(2, 3)));
  EXPECT_EQ(above.Compare(3, 2), std::strong_ordering::greater);
  EXPECT_EQ(above.Compare(0, 0), std::strong_ordering::equal);
  EXPECT_EQ(above.Floor(3, 100), 2);
  EXPECT_EQ(above.Ceiling(3, 100), 3);
  const Factor below(JustBelow(Rational(2, 3)));
  EXPECT_EQ(below.Compare(3, 2), std::strong_ordering::less);
  EXPECT_EQ(below.Floor(3, 100), 1);
  EXPECT_EQ(below.Ceiling(3, 100), 2);
}

TEST(Factor, HasAWholeNumberOnEitherSide) {
  const Factor factor(Rational(5, 2));
  EXPECT_EQ(factor.Floor(0, 9), 0);
  EXPECT_EQ(factor.Ceiling(0, 9), 0);
  EXPECT_EQ(factor.Floor(3, 9), 7);
  EXPECT_EQ(factor.Ceiling(3, 9), 8);
  EXPECT_EQ(factor.Floor(2, 9), 5);
  EXPECT_EQ(factor.Ceiling(2, 9), 5);
}

TEST(Factor, WholeNumbersEndAtTheMost) {
  const Factor factor(Rational(5, 2));
  EXPECT_EQ(factor.Floor(3, 7), 7);
  EXPECT_EQ(factor.Ceiling(3, 7), 7);
  EXPECT_EQ(factor.Floor(4, 9), 9);
  EXPECT_EQ(factor.Floor(kLarge, 9), 9);
  EXPECT_EQ(factor.Ceiling(kLarge, 0), 0);
  // A quotient beyond all doubles.
  const Factor huge(Rational::FromDecimal("1", 400));
  EXPECT_EQ(huge.Floor(1, 9), 9);
  EXPECT_EQ(huge.Ceiling(1, 9), 9);
  EXPECT_EQ(huge.Floor(0, 9), 0);
  const Factor tiny(Rational::FromDecimal("1", -400));
  EXPECT_EQ(tiny.Floor(kLarge, 9), 0);
  EXPECT_EQ(tiny.Ceiling(kLarge, 9), 1);
}

// Doubles of this size are 128 apart.
TEST(Factor, WholeNumbersThatNoDoubleIs) {
  constexpr std::int64_t kBase = std::int64_t{1} << 59;
  for (const std::int64_t part : {1, 63, 64, 65, 127}) {
    const Factor factor(Rational(kBase + part));
    EXPECT_EQ(factor.Floor(1, kLarge), kBase + part);
    EXPECT_EQ(factor.Ceiling(1, kLarge), kBase + part);
  }
}

TEST(Factor, IsWhatExactNumbersSay) {
  compare::Random random(1);
  const auto number = [&random](int bits) {
    return std::int64_t{random.Int(0, INT32_MAX)} * random.Int(1, 1 << 28) >> (59 - bits);
  };
  for (int i = 0; i < 3000; ++i) {
    const Rational value = exactly::Nudged(
        random, Rational(number(random.Int(5, 59)) + 1, number(random.Int(5, 59)) + 1));
    const Factor factor(value);
    const std::int64_t a = number(random.Int(5, 40));
    const std::int64_t most = number(random.Int(5, 59));
    ASSERT_EQ(factor.Floor(a, most), PlainFloor(value, a, most))
        << exactly::TextOf(value) << " " << a;
    ASSERT_EQ(factor.Ceiling(a, most), PlainCeiling(value, a, most))
        << exactly::TextOf(value) << " " << a;
    // The whole numbers next to the product, as far as they may be told.
    const std::int64_t middle = PlainFloor(value, a, kLarge - 2);
    for (const std::int64_t b : {std::max<std::int64_t>(middle - 1, 0), middle, middle + 1}) {
      ASSERT_EQ(factor.Compare(a, b), value * a <=> Rational(b))
          << exactly::TextOf(value) << " " << a;
    }
  }
}

}  // namespace
}  // namespace planner::search
