// Tests of what a TSYN output divider makes of a requested phase or duty cycle. The steps
// themselves are tested by output_steps_test.cpp and long_walks_test.cpp.

#include <gtest/gtest.h>

#include <cmath>

#include "engine/timing/OutputSteps.h"
#include "host/Tw_BmCMBCalculator.h"
#include "tests/engine/EngineTest.h"
#include "tests/support/FakeHost.h"

namespace {

using engine_test::kInfinity;
using engine_test::kNan;
using Ip::VorkelImp;

double Phase(double phase, double divider, bool flag = true) {
  return engine_test::NewImp().TSYNCalculateActualPhase(&phase, &divider, flag);
}

double Duty(double percent, double divider, double maxHighLowCount = 64.0) {
  VorkelImp& imp = engine_test::NewImp();
  imp.pllLimits.maxHighLowCount = maxHighLowCount;
  return imp.TSYNCalculateActualDutyCycle(&percent, &divider);
}

TEST(ActualPhase, IsAStepOfTheDivider) {
  EXPECT_EQ(Phase(100, 1), 90.0);
  EXPECT_EQ(Phase(112.5, 1), 135.0);
  EXPECT_EQ(Phase(-100, 1), -90.0);
  EXPECT_EQ(Phase(100, 4), 101.25);
  EXPECT_EQ(Phase(-100, 4), -90.0);
  EXPECT_EQ(Phase(90, 2.5), 90.0);  // steps of 18
  EXPECT_EQ(Phase(360, 1), 360.0);
  EXPECT_EQ(Phase(1000, 1), 360.0);
  EXPECT_EQ(Phase(-1000, 1), -360.0);
}

TEST(ActualPhase, IsZeroWithoutPhaseOrDivider) {
  for (const double divider : {1.0, 4.0, 0.0, -1.0, 1e300, kNan}) {
    EXPECT_EQ(Phase(0, divider), 0.0) << divider;
    EXPECT_EQ(Phase(-0.0, divider), 0.0) << divider;
  }
  for (const double phase : {90.0, -90.0, kInfinity}) {
    EXPECT_EQ(Phase(phase, 0), 0.0) << phase;
    EXPECT_EQ(Phase(phase, -0.0), 0.0) << phase;
  }
}

TEST(ActualPhase, TheFlagHasNoEffect) {
  for (const double phase : {100.0, -100.0, 112.5, 0.0, kNan}) {
    for (const double divider : {1.0, 4.0, 128.0, 0.0}) {
      EXPECT_EQ(Phase(phase, divider, false), Phase(phase, divider, true));
    }
  }
}

// Steps of 22.5: -112.5 lies below the request, -90 does not.
TEST(ActualPhase, ANegativeRequestGoesUp) {
  EXPECT_EQ(Phase(-91, 2), -90.0);
  EXPECT_EQ(Phase(-89, 2), -67.5);
}

TEST(ActualPhase, TheArgumentsStayAsTheyAre) {
  double phase = 100, divider = 4;
  engine_test::NewImp().TSYNCalculateActualPhase(&phase, &divider, true);
  EXPECT_EQ(phase, 100.0);
  EXPECT_EQ(divider, 4.0);
}

TEST(ActualDutyCycle, IsAFractionOnAStepOfTheDivider) {
  EXPECT_EQ(Duty(40, 4), 0.375);
  EXPECT_EQ(Duty(50, 4), 0.5);
  EXPECT_EQ(Duty(1, 4), 0.25);
  EXPECT_EQ(Duty(100, 4), 0.875);
  EXPECT_EQ(Duty(62.5, 2), 0.75);
}

TEST(ActualDutyCycle, IsOneHalfForADividerOfOne) {
  for (const double percent : {0.001, 20.0, 50.0, 100.0, -3.0, kInfinity, kNan}) {
    EXPECT_EQ(Duty(percent, 1), 0.5) << percent;
  }
}

TEST(ActualDutyCycle, IsZeroWithoutRequestOrDivider) {
  for (const double divider : {1.0, 4.0, 0.0, 1e300, kNan}) EXPECT_EQ(Duty(0, divider), 0.0);
  for (const double percent : {40.0, -40.0, kInfinity}) EXPECT_EQ(Duty(percent, 0), 0.0);
}

TEST(ActualDutyCycle, IsBoundByTheLargestCount) {
  EXPECT_EQ(Duty(20, 100), 0.36);
  // 0.36 and 57 steps of 0.005, added up; the last of them is 0.645 or just below.
  EXPECT_NEAR(Duty(99, 100), 0.645, 0.0051);
  EXPECT_LE(Duty(99, 100), 0.645);
  EXPECT_EQ(Duty(50, 128, 63), 0.0) << "no high time is long enough";
}

// A count of the object, which a load of limits sets.
TEST(ActualDutyCycle, UsesTheCountOfTheObject) {
  EXPECT_EQ(engine_test::NewImp().pllLimits.maxHighLowCount, 64.0);
  EXPECT_EQ(Duty(1, 8, 5), 0.375);
  EXPECT_EQ(Duty(1, 8, 8), 0.125);
}

TEST(ActualDutyCycle, AFractionalDividerHasItsOwnSteps) {
  EXPECT_EQ(Duty(1, 2.5), 0.4);  // 0.4, 0.6, 0.8
  EXPECT_EQ(Duty(99, 2.5), Ip::NearestDutyCycle(99, 2.5, 64));
}

TEST(ActualSteps, NeedNoDevice) {
  FakeHost::Instance().Reset();
  EXPECT_EQ(Phase(100, 1), 90.0);
  EXPECT_EQ(Duty(40, 4), 0.375);
  EXPECT_TRUE(FakeHost::Instance().messages.empty());
  EXPECT_EQ(FakeHost::Instance().calculatorRequests, 0);
}

}  // namespace
