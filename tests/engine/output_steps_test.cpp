// Tests of the phases and duty cycles that an output divider can make.

#include "engine/timing/OutputSteps.h"

#include <gtest/gtest.h>

#include <cmath>

#include "tests/engine/EngineTest.h"

namespace {

using engine_test::Above;
using engine_test::Below;
using engine_test::kInfinity;
using engine_test::kNan;
using Ip::NearestDutyCycle;
using Ip::NearestPhaseStep;
using Ip::PhaseStep;

// --- Phase step ------------------------------------------------------------------------------

TEST(PhaseStep, IsAnEighthOfAVcoCycle) {
  EXPECT_EQ(PhaseStep(1), 45.0);
  EXPECT_EQ(PhaseStep(2), 22.5);
  EXPECT_EQ(PhaseStep(4), 11.25);
  EXPECT_EQ(PhaseStep(128), 0.3515625);
}

// 1 / 56 * 360 is one unit in the last place below 45 / 7.
TEST(PhaseStep, RoundsTheQuotientFirst) {
  volatile double eighths = 56;
  ASSERT_LT(1.0 / eighths * 360.0, 45.0 / 7.0);
  EXPECT_EQ(PhaseStep(7), 1.0 / eighths * 360.0);
}

// --- Positive phases -------------------------------------------------------------------------

TEST(NearestPhaseStepUp, IsTheNearestMultiple) {
  EXPECT_EQ(NearestPhaseStep(100, 11.25, true), 101.25);
  EXPECT_EQ(NearestPhaseStep(94, 11.25, true), 90.0);
  EXPECT_EQ(NearestPhaseStep(5, 11.25, true), 0.0);
  EXPECT_EQ(NearestPhaseStep(350, 45, true), 360.0);
}

TEST(NearestPhaseStepUp, IsTheLargerOfTwoEquallyNear) {
  EXPECT_EQ(NearestPhaseStep(22.5, 45, true), 45.0);
  EXPECT_EQ(NearestPhaseStep(Below(22.5), 45, true), 0.0);
  EXPECT_EQ(NearestPhaseStep(337.5, 45, true), 360.0);
}

TEST(NearestPhaseStepUp, TakesAMultipleThatIsMet) {
  for (int k = 0; k <= 32; ++k) EXPECT_EQ(NearestPhaseStep(k * 11.25, 11.25, true), k * 11.25);
}

TEST(NearestPhaseStepUp, EndsAt360) {
  EXPECT_EQ(NearestPhaseStep(360, 45, true), 360.0);
  EXPECT_EQ(NearestPhaseStep(500, 45, true), 360.0);
  EXPECT_EQ(NearestPhaseStep(1e300, 45, true), 360.0);
  EXPECT_EQ(NearestPhaseStep(kInfinity, 45, true), 360.0);
  EXPECT_EQ(NearestPhaseStep(360, 100, true), 300.0);
}

// The multiples are products. For a divider of 33 the 264th lies just above 360 and is none;
// for a divider of 7 the 56th lies just below.
TEST(NearestPhaseStepUp, TheLastMultipleDependsOnItsRounding) {
  ASSERT_GT(264 * PhaseStep(33), 360.0);
  EXPECT_EQ(NearestPhaseStep(360, PhaseStep(33), true), 263 * PhaseStep(33));
  ASSERT_LT(56 * PhaseStep(7), 360.0);
  EXPECT_EQ(NearestPhaseStep(360, PhaseStep(7), true), 56 * PhaseStep(7));
}

TEST(NearestPhaseStepUp, AStepAbove360LeavesOnly0) {
  EXPECT_EQ(NearestPhaseStep(300, 361, true), 0.0);
  EXPECT_EQ(NearestPhaseStep(300, kInfinity, true), 0.0);
}

// --- Negative phases -------------------------------------------------------------------------
// Downward a step replaces the best when its distance from the best is at least its distance
// from the request, which is not the nearest.

TEST(NearestPhaseStepDown, TakesAMultipleThatIsMet) {
  EXPECT_EQ(NearestPhaseStep(-90, 45, false), -90.0);
  EXPECT_EQ(NearestPhaseStep(-90, 11.25, false), -90.0);
  EXPECT_EQ(NearestPhaseStep(-360, 45, false), -360.0);
  EXPECT_EQ(NearestPhaseStep(-45, 45, false), -45.0);
}

// -360; -225 (135 from it, 125 from -100); -157.5 (67.5, 57.5); -123.75 (33.75, 23.75);
// -101.25 (22.5, 1.25); -90 (11.25, 10). After that a step is farther from -100 than from -90.
TEST(NearestPhaseStepDown, GoesPastTheNearest) {
  EXPECT_EQ(NearestPhaseStep(-100, 11.25, false), -90.0);
}

// -360; -180 (180 from it, 160 from -20); -90 (90, 70); -45 (45, 25); 0 (45, 20).
TEST(NearestPhaseStepDown, MayEndAtZero) {
  EXPECT_EQ(NearestPhaseStep(-20, 45, false), 0.0);
  // ...; -45 (45, 15); 0 (45, 30), although -45 is nearer.
  EXPECT_EQ(NearestPhaseStep(-30, 45, false), 0.0);
}

// -360; -315 (45 from it, 35 from -350). -270 is 45 from that and 80 from the request.
TEST(NearestPhaseStepDown, MayLeaveTheNearestAtTheStart) {
  EXPECT_EQ(NearestPhaseStep(-350, 45, false), -315.0);
}

// -360; -270 (90, 70); -225 (45, 25); -180 (45, 20); -135 is 45 from that, 65 from -200.
TEST(NearestPhaseStepDown, GoesFromBestToBest) {
  EXPECT_EQ(NearestPhaseStep(-200, 45, false), -180.0);
}

// -360; -270 (90 from it, 45 from -315). -180 is 90 from that and 135 from the request.
TEST(NearestPhaseStepDown, CoarseSteps) {
  EXPECT_EQ(NearestPhaseStep(-315, 90, false), -270.0);
  // -360; -160 (200 from it, 100 from -60).
  EXPECT_EQ(NearestPhaseStep(-60, 200, false), -160.0);
  EXPECT_EQ(NearestPhaseStep(-60, 361, false), -360.0);
}

TEST(NearestPhaseStepDown, RequestsBelow360StayThere) {
  EXPECT_EQ(NearestPhaseStep(-405, 45, false), -360.0);
  EXPECT_EQ(NearestPhaseStep(-1e300, 45, false), -360.0);
  EXPECT_EQ(NearestPhaseStep(-kInfinity, 45, false), -360.0);
}

// Divider 33: 264 steps lie above 360, so the walk ends at 263, a step short of 0.
TEST(NearestPhaseStepDown, TheLastMultipleDependsOnItsRounding) {
  EXPECT_EQ(NearestPhaseStep(-0.5, PhaseStep(33), false), 263 * PhaseStep(33) - 360.0);
  EXPECT_EQ(NearestPhaseStep(-0.5, PhaseStep(7), false), 56 * PhaseStep(7) - 360.0);
}

TEST(NearestPhaseStep, IsZeroWithoutPhaseOrStep) {
  for (const bool positive : {true, false}) {
    EXPECT_EQ(NearestPhaseStep(0, 45, positive), 0.0);
    EXPECT_EQ(NearestPhaseStep(-0.0, 45, positive), 0.0);
    EXPECT_EQ(NearestPhaseStep(90, 0, positive), 0.0);
    EXPECT_EQ(NearestPhaseStep(-90, 0, positive), 0.0);
  }
}

// --- Duty cycles -----------------------------------------------------------------------------

// The x-th duty cycle of a walk from `lowest`, added up step by step.
double Walked(double lowest, double step, int x) {
  volatile double duty = lowest;
  for (int i = 0; i < x; ++i) duty = duty + step;
  return duty;
}

TEST(NearestDutyCycle, IsZeroWithoutRequestOrDivider) {
  EXPECT_EQ(NearestDutyCycle(0, 4, 64), 0.0);
  EXPECT_EQ(NearestDutyCycle(-0.0, 4, 64), 0.0);
  EXPECT_EQ(NearestDutyCycle(0, 1, 64), 0.0) << "before the rule for a divider of 1";
  EXPECT_EQ(NearestDutyCycle(50, 0, 64), 0.0);
}

TEST(NearestDutyCycle, IsOneHalfForDivider1) {
  for (const double percent : {1.0, 50.0, 99.0, -5.0, 1e300, kInfinity}) {
    EXPECT_EQ(NearestDutyCycle(percent, 1, 64), 0.5) << percent;
  }
  EXPECT_EQ(NearestDutyCycle(kNan, 1, 64), 0.5);
}

TEST(NearestDutyCycle, GoesInHalfVcoCycles) {
  // Divider 4: 1/4, 3/8, ... 7/8.
  EXPECT_EQ(NearestDutyCycle(50, 4, 64), 0.5);
  EXPECT_EQ(NearestDutyCycle(40, 4, 64), 0.375);
  EXPECT_EQ(NearestDutyCycle(60, 4, 64), 0.625);
  EXPECT_EQ(NearestDutyCycle(62.5, 4, 64), 0.625);
  // Divider 3: 1/3, 1/2, ...
  EXPECT_EQ(NearestDutyCycle(50, 3, 64), 0.5);
}

TEST(NearestDutyCycle, IsTheLargerOfTwoEquallyNear) {
  // Divider 2: 0.5 and 0.75.
  EXPECT_EQ(NearestDutyCycle(62.5, 2, 64), 0.75);
  EXPECT_EQ(NearestDutyCycle(62, 2, 64), 0.5);
}

TEST(NearestDutyCycle, EndsAtOneCycleHighAndHalfACycleLow) {
  EXPECT_EQ(NearestDutyCycle(1, 4, 64), 0.25);
  EXPECT_EQ(NearestDutyCycle(-50, 4, 64), 0.25);
  EXPECT_EQ(NearestDutyCycle(-kInfinity, 4, 64), 0.25 + 5 * 0.125)
      << "all are equally far, so each replaces the one before";
  EXPECT_EQ(NearestDutyCycle(100, 4, 64), 0.875);
  EXPECT_EQ(NearestDutyCycle(kInfinity, 4, 64), 0.875);
}

TEST(NearestDutyCycle, NanKeepsTheLowest) {
  EXPECT_EQ(NearestDutyCycle(kNan, 4, 64), 0.25);
}

// 1/6 + 9 * 1/12 = 11/12 is the upper end, but the steps add up to a little more than that.
TEST(NearestDutyCycle, AddsItsStepsUp) {
  const double lowest = 1.0 / 6.0;
  const double step = 0.5 / 6.0;
  ASSERT_GT(Walked(lowest, step, 9), 5.5 / 6.0);
  EXPECT_EQ(NearestDutyCycle(92, 6, 64), Walked(lowest, step, 8));
  EXPECT_EQ(NearestDutyCycle(50, 7, 64), Walked(1.0 / 7.0, 0.5 / 7.0, 5));
}

// --- Largest high and low count --------------------------------------------------------------

// Divider 128 with 64: 64/128 high at least, and 64.5/128 at most.
TEST(NearestDutyCycle, ALargeDividerHasFewDutyCycles) {
  EXPECT_EQ(NearestDutyCycle(1, 128, 64), 0.5);
  EXPECT_EQ(NearestDutyCycle(99, 128, 64), 0.50390625);
  EXPECT_EQ(NearestDutyCycle(50, 128, 64), 0.5);
}

TEST(NearestDutyCycle, ADividerUpToTheCountIsNotLimited) {
  EXPECT_EQ(NearestDutyCycle(1, 64, 64), 0.015625);
  EXPECT_EQ(NearestDutyCycle(100, 64, 64), 0.9921875);
  // Divider 16 with 15.75: 0.25/16 instead of 1/16, and 1 instead of 16.25/16.
  EXPECT_EQ(NearestDutyCycle(1, 16, 16), 0.0625);
  EXPECT_EQ(NearestDutyCycle(1, 16, Below(16)), (16 - Below(16)) / 16);
}

TEST(NearestDutyCycle, ADividerAboveTheCountHasThatOfTheCount) {
  // Divider 8 with 5: 3/8 to 5.5/8.
  EXPECT_EQ(NearestDutyCycle(1, 8, 5), 0.375);
  EXPECT_EQ(NearestDutyCycle(99, 8, 5), 0.6875);
}

// Divider 4 with 3.75: from 0.0625 in eighths, and up to 1 instead of 4.25/4. Without the end
// at 1, 1.0625 would be as near to 100 percent as 0.9375, and later.
TEST(NearestDutyCycle, TheUpperEndIsAtMost1) {
  EXPECT_EQ(NearestDutyCycle(100, 4, 3.75), 0.9375);
  EXPECT_EQ(NearestDutyCycle(1, 4, 3.75), 0.0625);
}

// Divider 128 with 63: at least 65/128 and at most 63.5/128.
TEST(NearestDutyCycle, CountersThatAreTooSmallLeaveNothing) {
  EXPECT_EQ(NearestDutyCycle(50, 128, 63), 0.0);
  EXPECT_EQ(NearestDutyCycle(50, 2, 0), 0.0);
}

TEST(NearestDutyCycle, FractionalDividers) {
  // Divider 2.5: 0.4 to 0.8 in steps of 0.2.
  EXPECT_EQ(NearestDutyCycle(1, 2.5, 64), 0.4);
  EXPECT_EQ(NearestDutyCycle(59, 2.5, 64), Walked(0.4, 0.2, 1));
}

}  // namespace
