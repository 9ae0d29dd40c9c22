// Tests of the conversions of doubles to whole numbers.

#include "engine/Numbers.h"

#include <gtest/gtest.h>

#include <climits>
#include <limits>

#include "tests/engine/EngineTest.h"

namespace {

using engine_test::Above;
using engine_test::Below;
using engine_test::kInfinity;
using engine_test::kNan;
using Ip::RoundToInt;
using Ip::TruncateToInt;

TEST(TruncateToInt, CutsTowardZero) {
  EXPECT_EQ(TruncateToInt(0.0), 0);
  EXPECT_EQ(TruncateToInt(-0.0), 0);
  EXPECT_EQ(TruncateToInt(2.0), 2);
  EXPECT_EQ(TruncateToInt(Below(3.0)), 2);
  EXPECT_EQ(TruncateToInt(2.999), 2);
  EXPECT_EQ(TruncateToInt(-2.999), -2);
  EXPECT_EQ(TruncateToInt(-0.999), 0);
  EXPECT_EQ(TruncateToInt(std::numeric_limits<double>::denorm_min()), 0);
}

TEST(TruncateToInt, HoldsAtBothEndsOfTheRangeOfInt) {
  EXPECT_EQ(TruncateToInt(2147483647.0), INT_MAX);
  EXPECT_EQ(TruncateToInt(Below(2147483648.0)), INT_MAX);
  EXPECT_EQ(TruncateToInt(-2147483648.0), INT_MIN);
  EXPECT_EQ(TruncateToInt(Above(-2147483649.0)), INT_MIN);
}

TEST(TruncateToInt, IsZeroForWhatNoIntHolds) {
  EXPECT_EQ(TruncateToInt(2147483648.0), 0);
  EXPECT_EQ(TruncateToInt(-2147483649.0), 0);
  EXPECT_EQ(TruncateToInt(1e300), 0);
  EXPECT_EQ(TruncateToInt(-1e300), 0);
  EXPECT_EQ(TruncateToInt(kInfinity), 0);
  EXPECT_EQ(TruncateToInt(-kInfinity), 0);
  EXPECT_EQ(TruncateToInt(kNan), 0);
}

TEST(RoundToInt, RoundsHalvesUp) {
  EXPECT_EQ(RoundToInt(0.0), 0);
  EXPECT_EQ(RoundToInt(4.4), 4);
  EXPECT_EQ(RoundToInt(4.5), 5);
  EXPECT_EQ(RoundToInt(Below(4.5)), 4);
  EXPECT_EQ(RoundToInt(128.0), 128);
}

// It is x + 0.5 that is truncated: the sum below rounds to 1, and negative numbers go up.
TEST(RoundToInt, TruncatesTheSum) {
  EXPECT_EQ(RoundToInt(Below(0.5)), 1);
  EXPECT_EQ(RoundToInt(-0.7), 0);
  EXPECT_EQ(RoundToInt(-1.7), -1);
}

TEST(RoundToInt, IsZeroForWhatNoIntHolds) {
  EXPECT_EQ(RoundToInt(2147483647.25), INT_MAX);
  EXPECT_EQ(RoundToInt(2147483647.5), 0);
  EXPECT_EQ(RoundToInt(kInfinity), 0);
  EXPECT_EQ(RoundToInt(-kInfinity), 0);
  EXPECT_EQ(RoundToInt(kNan), 0);
}

}  // namespace
