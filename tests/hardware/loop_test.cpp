#include "hardware/Loop.h"

#include <gtest/gtest.h>

namespace hardware {
namespace {

constexpr Primitive kPll = Primitive::kPll;
constexpr Primitive kTsyn = Primitive::kTsyn;

TEST(Loop, OnlyATsynWithUpToFiveOutputsHasFractions) {
  EXPECT_TRUE(HasFractions(kTsyn, 5, false));
  EXPECT_FALSE(HasFractions(kTsyn, 6, false));
  EXPECT_FALSE(HasFractions(kTsyn, 1, true));
  EXPECT_FALSE(HasFractions(kPll, 1, false));
}

TEST(Loop, M) {
  EXPECT_FALSE(IsM(kPll, 0, false));
  EXPECT_TRUE(IsM(kPll, 8, false));
  EXPECT_TRUE(IsM(kPll, 16, false));
  EXPECT_FALSE(IsM(kPll, 17, false));
  EXPECT_TRUE(IsM(kPll, 512, false));
  EXPECT_FALSE(IsM(kPll, 520, false));
  EXPECT_TRUE(IsM(kTsyn, 8, true));
  EXPECT_FALSE(IsM(kTsyn, 9, true));
  EXPECT_FALSE(IsM(kTsyn, 39, true));  // 4.875
  EXPECT_TRUE(IsM(kTsyn, 40, true));
  EXPECT_TRUE(IsM(kTsyn, 41, true));
  EXPECT_FALSE(IsM(kTsyn, 41, false));
  EXPECT_FALSE(IsM(kTsyn, 513, true));
}

TEST(Loop, D) {
  EXPECT_FALSE(IsD(0));
  EXPECT_TRUE(IsD(1));
  EXPECT_TRUE(IsD(80));
  EXPECT_FALSE(IsD(81));
}

TEST(Loop, Dividers) {
  EXPECT_TRUE(IsDivider(8, 0, true, 128));
  EXPECT_FALSE(IsDivider(9, 0, true, 128));  // nothing between 1 and 2
  EXPECT_TRUE(IsDivider(17, 0, true, 128));
  EXPECT_FALSE(IsDivider(17, 1, true, 128));
  EXPECT_FALSE(IsDivider(17, 0, false, 128));
  EXPECT_TRUE(IsDivider(1024, 3, false, 128));
  EXPECT_FALSE(IsDivider(1032, 3, false, 128));
  EXPECT_FALSE(IsDivider(1024, 3, false, 100));
}

TEST(Loop, TheCountersEndTheDividers) {
  EXPECT_EQ(LargestDivider(64), 128);
  EXPECT_EQ(LargestDivider(63), 126);
  EXPECT_EQ(LargestDivider(1000000000), 128);
  EXPECT_EQ(LargestDivider(1), 2);
  EXPECT_EQ(LargestDivider(0), 1);  // which does not count
}

TEST(Loop, Ratios) {
  EXPECT_EQ(VcoRatio(499, 2), Rational(499, 16));        // 62.375 / 2
  EXPECT_EQ(OutputRatio(499, 2, 34), Rational(499, 68));  // 62.375 / 2 / 4.25
  EXPECT_EQ(OutputRatio(352, 1, 64), Rational(44, 8));
}

// Divider 4: steps of 360 / 32 = 11.25 degrees.
TEST(Loop, TheNearestPhaseStep) {
  constexpr int kFour = 4 * kEighths;
  EXPECT_EQ(PhaseOfStep(1, kFour), Rational(45, 4));
  EXPECT_EQ(NearestPhaseStep(100, kFour), 9);
  EXPECT_EQ(NearestPhaseStep(0, kFour), 0);
  EXPECT_EQ(NearestPhaseStep(360, kFour), 32);
  EXPECT_EQ(NearestPhaseStep(-100, kFour), -9);
  // Half-way between two steps: the later one.
  EXPECT_EQ(NearestPhaseStep(Rational(45, 8), kFour), 1);
  EXPECT_EQ(NearestPhaseStep(Rational(-45, 8), kFour), 0);
  EXPECT_EQ(NearestPhaseStep(Rational(-45, 8) - Rational::FromDecimal("1", -30), kFour), -1);
}

TEST(Loop, HighTimes) {
  const auto times = [](int divider, int count) {
    const HighTimes of = HighTimesOf(divider, count);
    return std::pair(of.shortest, of.longest);
  };
  EXPECT_EQ(times(1, 64), std::pair(1, 1));
  EXPECT_EQ(times(4, 64), std::pair(2, 7));      // 25 to 87.5 percent
  EXPECT_EQ(times(64, 64), std::pair(2, 127));
  EXPECT_EQ(times(65, 64), std::pair(2, 129));
  EXPECT_EQ(times(100, 64), std::pair(72, 129));  // 36 to 64.5 percent
  EXPECT_EQ(times(128, 64), std::pair(128, 129));
  EXPECT_EQ(times(2, 1), std::pair(2, 3));
}

TEST(Loop, TheNearestHighTime) {
  EXPECT_EQ(NearestHighTime(40, 4, 64), 3);   // 37.5 percent
  EXPECT_EQ(DutyOfHighTime(3, 4), Rational(75, 2));
  EXPECT_EQ(NearestHighTime(50, 3, 64), 3);
  EXPECT_EQ(NearestHighTime(Rational(125, 4), 4, 64), 3);  // half-way: the longer one
  EXPECT_EQ(NearestHighTime(1, 4, 64), 2);
  EXPECT_EQ(NearestHighTime(100, 4, 64), 7);
  EXPECT_EQ(NearestHighTime(20, 100, 64), 72);
  EXPECT_EQ(NearestHighTime(99, 1, 64), 1);
}

}  // namespace
}  // namespace hardware
