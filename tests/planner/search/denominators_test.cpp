// Tests of the denominators in a span, against each number.
#include "planner/search/Denominators.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cmath>
#include <vector>

#include "exactly.h"
#include "tests/compare/Random.h"

namespace planner::search {
namespace {

using exactly::Rational;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

std::vector<int> All(const Span& span, int most) {
  std::vector<int> all;
  const Denominators denominators(span, most);
  for (int d = denominators.First(); d <= most; d = denominators.Next(d)) all.push_back(d);
  return all;
}

bool HasQuotient(const Span& span, int denominator) {
  const Rational numerator = -(-Rational::FromDouble(span.lowest) * denominator).Floor();
  return numerator <= Rational::FromDouble(span.highest) * denominator;
}

// 5/2 and nothing else: with denominators up to 11 the next are 1/22 apart.
TEST(Denominators, OfOneQuotientAreItsMultiples) {
  EXPECT_THAT(All({2.5, 2.5}, 11), ElementsAre(2, 4, 6, 8, 10));
  EXPECT_THAT(All({2.4999, 2.5001}, 11), ElementsAre(2, 4, 6, 8, 10));
}

// Beside 2/5 nothing from 0.38 to 0.42 has a denominator below 1 / (5 x 0.04): all from 5 on count.
TEST(Denominators, OfAWideSpanAreAllFromSomeNumberOn) {
  EXPECT_THAT(All({3, 4}, 5), ElementsAre(1, 2, 3, 4, 5));
  EXPECT_THAT(All({0, 0.1}, 3), ElementsAre(1, 2, 3));
  EXPECT_THAT(All({0.38, 0.42}, 8), ElementsAre(5, 6, 7, 8));
  EXPECT_THAT(All({0.396, 0.404}, 29), ElementsAre(5, 10, 15, 20, 24, 25, 26, 27, 28, 29));
  EXPECT_THAT(All({1, HUGE_VAL}, 3), ElementsAre(1, 2, 3));
}

TEST(Denominators, NoneWithoutAQuotient) { EXPECT_THAT(All({2.51, 2.512}, 40), IsEmpty()); }

TEST(Denominators, EachWithAQuotientIsAmongThem) {
  compare::Random random(9);
  int fewer = 0;
  for (int i = 0; i < 3'000; ++i) {
    const int most = random.Int(1, 300);
    const double width = std::pow(10, random.Real(-14, 0));
    // About a quotient, or about nothing.
    const double middle = random.Int(0, 1) == 0
                              ? random.Real(0.01, 300)
                              : static_cast<double>(random.Int(1, 300)) / random.Int(1, 300);
    const double at = random.Real(0, 1);
    const Span span = {middle * (1 - width * at), middle * (1 + width * (1 - at))};
    const std::vector<int> all = All(span, most);
    std::size_t place = 0;
    for (int d = 1; d <= most; ++d) {
      const bool is_among = place < all.size() && all[place] == d;
      if (is_among) ++place;
      if (HasQuotient(span, d)) {
        EXPECT_TRUE(is_among) << d << " in " << span.lowest << " to " << span.highest;
      }
    }
    EXPECT_EQ(place, all.size());
    if (static_cast<int>(all.size()) < most / 2) ++fewer;
  }
  EXPECT_GT(fewer, 700);
}

}  // namespace
}  // namespace planner::search
