// Tests of the simplest quotient of an interval.
#include "planner/search/Fractions.h"

#include <gtest/gtest.h>

#include <cmath>
#include <numeric>

#include "exactly.h"
#include "tests/compare/Random.h"

namespace planner::search {

bool operator==(const Fraction& a, const Fraction& b) {
  return a.numerator == b.numerator && a.denominator == b.denominator;
}

void PrintTo(const Fraction& fraction, std::ostream* out) {
  *out << fraction.numerator << "/" << fraction.denominator;
}

namespace {

using exactly::Rational;

constexpr std::int64_t kMost = 300;

// By asking each denominator; one that is too large where none has a numerator.
Fraction Plain(double lowest, double highest, std::int64_t most) {
  const Rational from = Rational::FromDouble(lowest);
  const Rational to = Rational::FromDouble(highest);
  for (std::int64_t denominator = 1; denominator <= most; ++denominator) {
    const Rational numerator = -(-from * denominator).Floor();
    if (numerator <= to * denominator) return {*numerator.Whole(), denominator};
  }
  return {0, most + 1};
}

TEST(SimplestIn, HasTheSmallestDenominatorAndThenTheSmallestNumerator) {
  EXPECT_EQ(SimplestIn(2.1, 4.9, kMost), (Fraction{3, 1}));
  EXPECT_EQ(SimplestIn(0.3, 0.9, kMost), (Fraction{1, 2}));
  EXPECT_EQ(SimplestIn(0.25, 0.4, kMost), (Fraction{1, 3}));
  EXPECT_EQ(SimplestIn(3.1, 3.15, kMost), (Fraction{22, 7}));
  EXPECT_EQ(SimplestIn(3.141592, 3.141593, kMost), (Fraction{355, 113}));
}

TEST(SimplestIn, EndsBelongToIt) {
  EXPECT_EQ(SimplestIn(4, 4.5, kMost), (Fraction{4, 1}));
  EXPECT_EQ(SimplestIn(3.5, 4, kMost), (Fraction{4, 1}));
  EXPECT_EQ(SimplestIn(2.5, 2.5, kMost), (Fraction{5, 2}));
  EXPECT_EQ(SimplestIn(0.125, 0.125, kMost), (Fraction{1, 8}));
}

// (t + 1) / (3t + 2) is 0.3345 with a t of 94.6, and falls from there to 0.334: so 96 / 287.
TEST(SimplestIn, MostBelongsToIt) {
  EXPECT_EQ(SimplestIn(0.334, 0.3345, 287), (Fraction{96, 287}));
  EXPECT_GT(SimplestIn(0.334, 0.3345, 286).denominator, 286);
}

TEST(SimplestIn, IsNoneWhereOnlyLargeOnesAre) {
  EXPECT_GT(SimplestIn(1e-20, 2e-20, kMost).denominator, kMost);
  EXPECT_GT(SimplestIn(1.0 / 302, 1.0 / 301, kMost).denominator, kMost);
  EXPECT_GT(SimplestIn(1 + 1e-14, 1 + 2e-14, kMost).denominator, kMost);
}

// Two quotients with denominators up to 80 are 1 / 6400 apart.
TEST(SimplestIn, FindsEveryQuotientThroughRounding) {
  for (std::int64_t denominator = 1; denominator <= 80; ++denominator) {
    for (std::int64_t numerator = 1; numerator <= 512; ++numerator) {
      if (std::gcd(numerator, denominator) != 1) continue;
      const double value = static_cast<double>(numerator) / static_cast<double>(denominator);
      ASSERT_EQ(SimplestIn(value * (1 - 1e-12), value * (1 + 1e-12), 80),
                (Fraction{numerator, denominator}));
    }
  }
}

TEST(SimplestIn, IsWhatAWalkOverDenominatorsFinds) {
  compare::Random random(1);
  int none = 0;
  for (int i = 0; i < 1500; ++i) {
    const double lowest = std::exp2(random.Real(-9, 11));
    const double highest = lowest * (1 + std::exp2(random.Real(-30, 1)));
    const std::int64_t most = random.Int(1, 80);
    const Fraction plain = Plain(lowest, highest, most);
    const Fraction found = SimplestIn(lowest, highest, most);
    if (plain.denominator > most) {
      ++none;
      ASSERT_GT(found.denominator, most) << lowest << " to " << highest;
    } else {
      ASSERT_EQ(found, plain) << lowest << " to " << highest;
    }
  }
  EXPECT_GT(none, 200);
  EXPECT_LT(none, 1300);
}

}  // namespace
}  // namespace planner::search
