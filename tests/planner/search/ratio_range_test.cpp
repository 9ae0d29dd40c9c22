// Tests of the ratios that keep a range.
#include <gtest/gtest.h>

#include <algorithm>

#include "exactly.h"
#include "planner/search/RatioRange.h"
#include "tests/compare/Random.h"

namespace planner::search {
namespace {

using exactly::Holds;

// The smallest distance from an end, as a fraction of it; a lowest end of 0 is none.
Rational PlainMargin(const Inputs& inputs, const Range& range, const Rational& ratio) {
  const Rational below = (range.highest - inputs.highest * ratio) / range.highest;
  if (range.lowest == Rational(0)) return below;
  return std::min(below, (inputs.lowest * ratio - range.lowest) / range.lowest);
}

// 100 MHz: 30 to 60 are ratios of 3 / 10 to 6 / 10.
TEST(RatioRange, EndsBelongToIt) {
  const RatioRange range({100, 100}, {30, 60});
  EXPECT_TRUE(range.Contains(3, 10));
  EXPECT_TRUE(range.Contains(6, 10));
  EXPECT_TRUE(range.Contains(9, 20));
  EXPECT_FALSE(range.IsNotBelow(299'999, 1'000'000));
  EXPECT_TRUE(range.IsNotAbove(299'999, 1'000'000));
  EXPECT_FALSE(range.IsNotAbove(600'001, 1'000'000));
  EXPECT_TRUE(range.IsNotBelow(600'001, 1'000'000));
  EXPECT_DOUBLE_EQ(range.Lowest(), 0.3);
  EXPECT_DOUBLE_EQ(range.Highest(), 0.6);
}

// The lower input has to stay above the lowest, the higher one below the highest.
TEST(RatioRange, HoldsForBothInputs) {
  const RatioRange range({90, 110}, {27, 66});
  EXPECT_TRUE(range.Contains(3, 10));
  EXPECT_TRUE(range.Contains(6, 10));
  EXPECT_FALSE(range.Contains(29, 100));
  EXPECT_FALSE(range.Contains(61, 100));
  // 50 to 52 from 90 and 110 together: none.
  const RatioRange narrow({90, 110}, {50, 52});
  EXPECT_LT(narrow.Highest(), narrow.Lowest());
  EXPECT_FALSE(narrow.Contains(5, 9));
  EXPECT_FALSE(narrow.Contains(52, 110));
}

TEST(RatioRange, EndsThatDoNotFitIntoWords) {
  const RatioRange narrow({100, 100}, {exactly::JustAbove(30), exactly::JustBelow(60)});
  EXPECT_FALSE(narrow.Contains(3, 10));
  EXPECT_FALSE(narrow.Contains(6, 10));
  EXPECT_TRUE(narrow.Contains(4, 10));
  const RatioRange wide({100, 100}, {exactly::JustBelow(30), exactly::JustAbove(60)});
  EXPECT_TRUE(wide.Contains(3, 10));
  EXPECT_TRUE(wide.Contains(6, 10));
}

TEST(RatioRange, ALowestOfZeroHoldsNothingBelow) {
  const RatioRange range({100, 100}, {0, 60});
  EXPECT_TRUE(range.Contains(1, 1 << 24));
  EXPECT_TRUE(range.Contains(6, 10));
  EXPECT_FALSE(range.Contains(7, 10));
  EXPECT_EQ(range.Lowest(), 0);
  EXPECT_EQ(range.Middle(), 0);
  EXPECT_EQ(range.ExactMargin(3, 10), Rational(1, 2));
  EXPECT_TRUE(Holds(range.Margin(0.3), Rational(1, 2)));
}

TEST(RatioRange, AHighestOfZeroLeavesNothing) {
  const RatioRange range({100, 100}, {0, 0});
  EXPECT_FALSE(range.Contains(1, 1 << 24));
  EXPECT_FALSE(range.IsNotAbove(1, 1 << 24));
  EXPECT_EQ(range.Highest(), 0);
}

// 30 to 60 from 100: 40 is a third above the lowest and a third below the highest.
TEST(RatioRange, TheMiddleHasTheLargestMargin) {
  const RatioRange range({100, 100}, {30, 60});
  EXPECT_DOUBLE_EQ(range.Middle(), 0.4);
  EXPECT_EQ(range.ExactMargin(4, 10), Rational(1, 3));
  EXPECT_EQ(range.ExactMargin(3, 10), Rational(0));
  EXPECT_EQ(range.ExactMargin(9, 10), Rational(-1, 2));
  EXPECT_EQ(range.ExactMargin(15, 100), Rational(-1, 2));
  EXPECT_TRUE(Holds(range.Margin(0.5), Rational(1, 6)));
}

TEST(RatioRange, IsWhatExactNumbersSay) {
  compare::Random random(1);
  int kept = 0;
  for (int i = 0; i < 1200; ++i) {
    Inputs inputs;
    inputs.lowest = Rational(random.Int(1, 2000), random.Int(1, 1001));
    inputs.highest = random.OneIn(2) ? inputs.lowest : inputs.lowest * random.Int(100, 120) / 100;
    const std::int64_t a = random.Int(1, random.OneIn(2) ? 40 : 1 << 24);
    const std::int64_t b = random.Int(1, random.OneIn(2) ? 40 : 1 << 24);
    // Ends that are just met, and others.
    const Rational ratio(a, b);
    Range range;
    range.lowest = inputs.lowest * ratio * random.Int(50, 110) / 100;
    if (random.OneIn(4)) range.lowest = inputs.lowest * ratio;
    range.highest = inputs.highest * ratio * random.Int(90, 150) / 100;
    if (random.OneIn(4)) range.highest = inputs.highest * ratio;
    range.lowest = exactly::Nudged(random, range.lowest);
    range.highest = exactly::Nudged(random, range.highest);
    if (random.OneIn(10)) range.lowest = 0;
    const RatioRange ratios(inputs, range);
    const bool is_kept =
        range.Contains(inputs.lowest * ratio) && range.Contains(inputs.highest * ratio);
    ASSERT_EQ(ratios.Contains(a, b), is_kept) << i;
    kept += is_kept ? 1 : 0;
    const Rational margin = PlainMargin(inputs, range, ratio);
    ASSERT_EQ(ratios.ExactMargin(a, b), margin) << i;
    ASSERT_TRUE(Holds(ratios.Margin(static_cast<double>(a) / static_cast<double>(b)), margin)) << i;
    if (range.lowest == Rational(0)) continue;
    const Rational middle = Rational::FromDouble(ratios.Middle());
    const Rational largest = PlainMargin(inputs, range, middle);
    for (const Rational& factor : {Rational(999'999, 1'000'000), Rational(1'000'001, 1'000'000)}) {
      ASSERT_LT(PlainMargin(inputs, range, middle * factor), largest) << i;
    }
  }
  EXPECT_GT(kept, 400);
  EXPECT_LT(kept, 1000);
}

}  // namespace
}  // namespace planner::search
