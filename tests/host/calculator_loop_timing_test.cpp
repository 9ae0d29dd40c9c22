// Phases and duty cycles of PLL and TSYN outputs, against the steps worked out by hand and
// against those of the solver.
#include <gtest/gtest.h>

#include <cmath>

#include "engine/timing/OutputSteps.h"
#include "hardware/Loop.h"
#include "host/bundled/calculator/LoopTiming.h"

namespace {

using Calculator::DutyOnStep;
using Calculator::PhaseOnStep;

// --- Phase -----------------------------------------------------------------------------------

TEST(PhaseOnStep, GoesInEighthsOfAVcoCycle) {
  EXPECT_EQ(PhaseOnStep(100, 1), 90.0);     // steps of 45
  EXPECT_EQ(PhaseOnStep(100, 4), 101.25);   // steps of 11.25
  EXPECT_EQ(PhaseOnStep(33.75, 4), 33.75);  // the third step
  EXPECT_EQ(PhaseOnStep(1, 8), 0.0);        // steps of 5.625
  EXPECT_EQ(PhaseOnStep(359, 4), 360.0);
  EXPECT_EQ(PhaseOnStep(360, 7), 360.0);
  EXPECT_EQ(PhaseOnStep(360, 33), 360.0);
}

TEST(PhaseOnStep, TakesTheLaterOfTwoEquallyNear) {
  EXPECT_EQ(PhaseOnStep(112.5, 1), 135.0);
  EXPECT_EQ(PhaseOnStep(22.5, 1), 45.0);
  EXPECT_EQ(PhaseOnStep(7.5, 3), 15.0);
  EXPECT_EQ(PhaseOnStep(22.499, 1), 0.0);
}

TEST(PhaseOnStep, NegativeRequestsGoToTheNearestStepToo) {
  EXPECT_EQ(PhaseOnStep(-100, 1), -90.0);     // steps of 45
  EXPECT_EQ(PhaseOnStep(-100, 4), -101.25);   // steps of 11.25
  EXPECT_EQ(PhaseOnStep(-90, 1), -90.0);
  EXPECT_EQ(PhaseOnStep(-350, 1), -360.0);
  EXPECT_EQ(PhaseOnStep(-360, 1), -360.0);
  EXPECT_EQ(PhaseOnStep(-20, 1), 0.0);
  EXPECT_EQ(PhaseOnStep(-22.5, 1), 0.0);      // the later of two
  EXPECT_EQ(PhaseOnStep(-22.501, 1), -45.0);
  EXPECT_EQ(PhaseOnStep(-1e-300, 1), 0.0);
  EXPECT_FALSE(std::signbit(PhaseOnStep(-20, 1)));
}

// The model of the hardware has the same steps, exactly.
TEST(PhaseOnStep, AgreesWithTheHardware) {
  for (int divider = 1; divider <= 128; ++divider) {
    for (int request = -360; request <= 360; ++request) {
      const int eighths = divider * hardware::kEighths;
      const int step = hardware::NearestPhaseStep(request, eighths);
      ASSERT_NEAR(PhaseOnStep(request, divider), hardware::PhaseOfStep(step, eighths).ToDouble(),
                  1e-9)
          << request << " / " << divider;
    }
  }
}

TEST(PhaseOnStep, IsZeroForNoRequest) {
  for (int divider = 1; divider <= 128; ++divider) EXPECT_EQ(PhaseOnStep(0, divider), 0.0);
  EXPECT_EQ(PhaseOnStep(-0.0, 4), 0.0);
}

double Printed(double value) { return std::round(value * 1000.0) / 1000.0; }

// A script hands on what the solver printed, with three decimals. It must come back as the step
// that was meant, whichever way the print was rounded.
TEST(PhaseOnStep, KeepsEveryStepThatWasPrinted) {
  for (int divider = 1; divider <= 128; ++divider) {
    const int steps = 8 * divider;
    for (int k = 0; k <= steps; ++k) {
      const double phase = 360.0 * k / steps;
      ASSERT_NEAR(PhaseOnStep(Printed(phase), divider), phase, 1e-9) << divider;
      if (k == 0) continue;
      ASSERT_NEAR(PhaseOnStep(-Printed(phase), divider), -phase, 1e-9) << divider;
    }
  }
}

// The solver goes with a negative request to the first step that is not below it; a positive one
// agrees everywhere but within a step of a full cycle, where the solver's own rounding of a step
// makes it leave out 360 degrees for some dividers.
TEST(PhaseOnStep, AgreesWithTheSolver) {
  int compared = 0;
  for (int divider = 1; divider <= 128; ++divider) {
    const double step = Ip::PhaseStep(divider);
    for (double request = 0.037; request < 360.0 - step; request += 0.368) {
      const double solver = Ip::NearestPhaseStep(request, step, true);
      ASSERT_NEAR(PhaseOnStep(request, divider), solver, 1e-9) << request << " / " << divider;
      ++compared;
    }
  }
  EXPECT_GT(compared, 100000);
}

// --- Duty cycle ------------------------------------------------------------------------------

TEST(DutyOnStep, GoesInHalfVcoCycles) {
  // Divider 4: 25, 37.5, 50, 62.5, 75 and 87.5.
  EXPECT_EQ(DutyOnStep(40, 4, 64), 37.5);
  EXPECT_EQ(DutyOnStep(50, 4, 64), 50.0);
  EXPECT_EQ(DutyOnStep(70, 4, 64), 75.0);
  EXPECT_EQ(DutyOnStep(75, 4, 64), 75.0);
  EXPECT_NEAR(DutyOnStep(30, 3, 64), 100.0 / 3.0, 1e-12);
  EXPECT_EQ(DutyOnStep(50, 3, 64), 50.0);
}

TEST(DutyOnStep, EndsAtOneCycleHighAndHalfACycleLow) {
  EXPECT_EQ(DutyOnStep(0.001, 4, 64), 25.0);
  EXPECT_EQ(DutyOnStep(1, 4, 64), 25.0);
  EXPECT_EQ(DutyOnStep(100, 4, 64), 87.5);
  EXPECT_EQ(DutyOnStep(1, 2, 64), 50.0);
  EXPECT_EQ(DutyOnStep(100, 2, 64), 75.0);
  EXPECT_EQ(DutyOnStep(100, 16, 64), 96.875);
}

TEST(DutyOnStep, TakesTheLargerOfTwoEquallyNear) {
  EXPECT_EQ(DutyOnStep(62.5, 2, 64), 75.0);   // 50 and 75
  EXPECT_EQ(DutyOnStep(43.75, 4, 64), 50.0);  // 37.5 and 50
  EXPECT_EQ(DutyOnStep(43.7, 4, 64), 37.5);
}

TEST(DutyOnStep, IsOneHalfForADividerOfOne) {
  for (const double request : {0.0, 1.0, 50.0, 100.0}) EXPECT_EQ(DutyOnStep(request, 1, 64), 50.0);
}

TEST(DutyOnStep, TakesNoRequestForOneHalf) {
  EXPECT_EQ(DutyOnStep(0, 4, 64), 50.0);
  EXPECT_EQ(DutyOnStep(0, 3, 64), 50.0);
  EXPECT_EQ(DutyOnStep(0, 128, 64), 50.0);
}

// Divider 100 with counts up to 64: 36 to 64.5.
TEST(DutyOnStep, IsBoundByTheCounts) {
  EXPECT_EQ(DutyOnStep(20, 100, 64), 36.0);
  EXPECT_EQ(DutyOnStep(99, 100, 64), 64.5);
  EXPECT_EQ(DutyOnStep(50.2, 100, 64), 50.0);
  EXPECT_EQ(DutyOnStep(1, 128, 64), 50.0);
  EXPECT_EQ(DutyOnStep(99, 128, 64), 50.390625);
  // Up to the count there is no bound: 1 / 64 and 63.5 / 64.
  EXPECT_EQ(DutyOnStep(1, 64, 64), 1.5625);
  EXPECT_EQ(DutyOnStep(100, 64, 64), 99.21875);
  // Divider 8 with counts up to 5: 3/8 to 5.5/8; with 4: 4/8 and 4.5/8.
  EXPECT_EQ(DutyOnStep(1, 8, 5), 37.5);
  EXPECT_EQ(DutyOnStep(99, 8, 5), 68.75);
  EXPECT_EQ(DutyOnStep(99, 8, 4), 56.25);
}

// The counts of divider 4 with 3.75: 0.25 cycles high, then half a cycle more each time, up to
// the whole cycle at most.
TEST(DutyOnStep, EndsAtTheWholeCycle) {
  EXPECT_EQ(DutyOnStep(1, 4, 3.75), 6.25);
  EXPECT_EQ(DutyOnStep(100, 4, 3.75), 93.75);
}

// The solver adds its steps up, and the sum of the rounding errors makes it miss the last step
// of some dividers; this is the step above the one that it ends at.
TEST(DutyOnStep, AgreesWithTheSolver) {
  int missed = 0;
  int compared = 0;
  for (int divider = 2; divider <= 128; ++divider) {
    for (const double count : {64.0, 100.0}) {
      for (double request = 0.137; request < 100.0; request += 0.613) {
        const double solver = 100.0 * Ip::NearestDutyCycle(request, divider, count);
        const double step = DutyOnStep(request, divider, count);
        ++compared;
        if (std::fabs(step - solver) < 1e-9) continue;
        ++missed;
        ASSERT_NEAR(step, solver + 50.0 / divider, 1e-9) << request << " / " << divider;
        ASSERT_GT(request, solver) << divider;
        const double last = 100.0 * Ip::NearestDutyCycle(100, divider, count);
        ASSERT_NEAR(solver, last, 1e-9) << divider;
      }
    }
  }
  EXPECT_GT(compared, 40000);
  EXPECT_LT(missed, compared / 10);
}

}  // namespace
