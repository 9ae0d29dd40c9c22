// The formulas of the certificate, by hand.
#include "planner/verify/Formulas.h"

#include <gtest/gtest.h>

namespace planner::verify {

namespace {

using hardware::Pin;

TEST(Formulas, ErrorsOfFrequencies) {
  // 148.5 MHz where 148 were wanted: 1/296 of it.
  EXPECT_EQ(Ppm(Rational(297, 2), 148), Rational(1'000'000, 296));
  EXPECT_EQ(Ppm(99, 100), Rational(-10'000));
  EXPECT_EQ(Ppm(100, 100), Rational(0));
}

TEST(Formulas, AnglesAreAboveMinus180AndUpTo180) {
  EXPECT_EQ(Turned(180), Rational(180));
  EXPECT_EQ(Turned(-180), Rational(180));
  EXPECT_EQ(Turned(Rational(361, 2)), Rational(-359, 2));
  EXPECT_EQ(Turned(-359), Rational(1));
  EXPECT_EQ(Turned(720), Rational(0));
}

TEST(Formulas, MarginsAreFractionsOfTheNearerEnd) {
  const Range range{400, 1000};
  EXPECT_EQ(MarginIn(range, 500), Rational(1, 4));
  EXPECT_EQ(MarginIn(range, 950), Rational(1, 20));
  EXPECT_EQ(MarginIn(range, 400), Rational(0));
  EXPECT_EQ(MarginIn(range, 300), Rational(-1, 4));
  EXPECT_EQ(MarginIn(range, 1100), Rational(-1, 10));
  // Without a lowest end only the highest counts.
  EXPECT_EQ(MarginIn({0, 1000}, 100), Rational(9, 10));
}

TEST(Formulas, ErrorsInUnitsOfTheirTolerances) {
  EXPECT_EQ(PpmInUnits(-30, 20), Rational(3, 2));
  EXPECT_EQ(PpmInUnits(30, 0), Rational(3, 10));
  EXPECT_EQ(DegreesInUnits(-1, 0), Rational(2));
  EXPECT_EQ(PointsInUnits(1, 4), Rational(1, 4));
  EXPECT_EQ(PsInUnits(120, 100), Rational(6, 5));
}

TEST(Formulas, ALoop) {
  // M 62.375 and D 3 of 27 MHz, and a divider of 4.125.
  EXPECT_EQ(VcoOf(27, 499, 3), Rational(4491, 8));
  EXPECT_EQ(PfdOf(27, 3), Rational(9));
  EXPECT_EQ(FrequencyOf(Rational(4491, 8), 33), Rational(4491, 33));
  // 3 eighths of a VCO period are 3/64 of 8 of them.
  EXPECT_EQ(PhaseOf(3, 64), Rational(135, 8));
  EXPECT_EQ(PhaseOf(-16, 64), Rational(-90));
  // High for 5 halves of the 8 periods.
  EXPECT_EQ(DutyOf(5, 64), Rational(125, 4));
}

TEST(Formulas, PinsOfAKru) {
  const hardware::KruRatios whole{.m = 5, .d = 3, .divide_halves = 5};
  const hardware::KruRatios half{.divide_by_2 = true, .m = 5, .d = 3, .divide_halves = 5};
  EXPECT_EQ(FrequencyOf(60, Pin::kClk0, whole), Rational(60));
  EXPECT_EQ(FrequencyOf(60, Pin::kClk270, half), Rational(30));
  EXPECT_EQ(FrequencyOf(60, Pin::kClk2x180, half), Rational(60));
  EXPECT_EQ(FrequencyOf(60, Pin::kClkdv, whole), Rational(24));
  EXPECT_EQ(FrequencyOf(60, Pin::kClkfx180, half), Rational(50));
  EXPECT_EQ(FrequencyOf(60, Pin::kClkfxdv, whole), Rational(40));
  EXPECT_EQ(PhaseOf(Pin::kClk90, 0), Rational(90));
  EXPECT_EQ(PhaseOf(Pin::kClk2x180, 51), Rational(252));
  EXPECT_EQ(PhaseOf(Pin::kClk270, 255), Rational(270));
  // A divide of 2.5 is high for 2 of 5 halves.
  EXPECT_EQ(DutyOf(Pin::kClkdv, 5), Rational(40));
  EXPECT_EQ(DutyOf(Pin::kClkdv, 6), Rational(50));
  EXPECT_EQ(DutyOf(Pin::kClkfxdv, 8), Rational(50));
}

// 50 ppm of 100 MHz are 0.005 MHz.
TEST(Formulas, WhatInputsCanBe) {
  EXPECT_EQ(CornersOf(Rational(100), 0), (std::vector<Rational>{100}));
  EXPECT_EQ(CornersOf(Rational(100), 50),
            (std::vector<Rational>{Rational(99995, 1000), Rational(100005, 1000)}));
  EXPECT_EQ(CornersOf(std::vector<Rational>{10, 20}, 100000),
            (std::vector<Rational>{9, 11, 18, 22}));
}

}  // namespace

}  // namespace planner::verify
