#include "planner/answer/Margin.h"

#include <gtest/gtest.h>

namespace {

using hardware::Range;
using hardware::Rational;
using planner::answer::MarginOf;

// (150 - 100) / 100 = 1/2 from below, (400 - 150) / 400 = 5/8 from above.
TEST(MarginOf, IsTheSmallerOfBothEnds) {
  EXPECT_EQ(MarginOf(150, {100, 400}), Rational(1, 2));
  EXPECT_EQ(MarginOf(300, {100, 400}), Rational(1, 4));
}

TEST(MarginOf, IsZeroAtTheEndsAndNegativeBeyond) {
  const Range range = {100, 400};
  EXPECT_EQ(MarginOf(100, range), Rational(0));
  EXPECT_EQ(MarginOf(400, range), Rational(0));
  EXPECT_EQ(MarginOf(99, range), Rational(-1, 100));
  EXPECT_EQ(MarginOf(500, range), Rational(-1, 4));
}

TEST(MarginOf, AnEndOfZeroIsNone) { EXPECT_EQ(MarginOf(3, {0, 4}), Rational(1, 4)); }

// Nothing is in a range whose ends are the wrong way round.
TEST(MarginOf, OfAnEmptyRangeIsNegative) { EXPECT_LT(MarginOf(250, {400, 100}), Rational(0)); }

}  // namespace
