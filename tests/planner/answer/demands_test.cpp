// Expected values are worked out by hand.
#include "planner/answer/Demands.h"

#include <gtest/gtest.h>

#include "planner/answer/Jitter.h"
#include "tests/planner/answer/answer_support.h"

namespace planner::answer {

namespace {

using namespace answer_test;  // NOLINT: what all tests of this folder begin with

TEST(Units, AreTheTolerances) {
  EXPECT_EQ(FrequencyUnit(20), Rational(20));
  EXPECT_EQ(PhaseUnit(3), Rational(3));
  EXPECT_EQ(DutyUnit(Rational(1, 4)), Rational(1, 4));
  EXPECT_EQ(JitterUnit(150), Rational(150));
}

TEST(Units, OfNoToleranceAreTheDefaults) {
  EXPECT_EQ(FrequencyUnit(0), Rational(100));
  EXPECT_EQ(PhaseUnit(0), Rational(1, 2));
  EXPECT_EQ(DutyUnit(0), Rational(1, 2));
  EXPECT_EQ(JitterUnit(0), Rational(1));
}

// 100.01 instead of 100 is 10^-4 of it, 100 ppm; a third of 100 MHz for 33.333 MHz is
// (100/3 - 33333/1000) / (33333/1000) = (1/3000) / (33333/1000) = 1/99999, 10^6/99999 ppm.
TEST(ErrorPpm, IsActualLessRequested) {
  EXPECT_EQ(ErrorPpm(Rational(10001, 100), 100), Rational(100));
  EXPECT_EQ(ErrorPpm(Rational(9999, 100), 100), Rational(-100));
  EXPECT_EQ(ErrorPpm(Rational(100, 3), Rational(33333, 1000)), Rational(1'000'000, 99'999));
}

TEST(ErrorsOf, OnlyOfWhatIsAskedFor) {
  const Errors errors = ErrorsOf(Frequency(100), 100, 90, 40);
  EXPECT_EQ(errors.ppm, Rational(0));
  EXPECT_FALSE(errors.phase);
  EXPECT_FALSE(errors.duty);
}

TEST(ErrorsOf, PhasesAreTurned) {
  Output output = Frequency(100);
  const auto error = [&](const Rational& asked, const Rational& actual) {
    output.phase = asked;
    return *ErrorsOf(output, 100, actual, 50).phase;
  };
  EXPECT_EQ(error(-90, 270), Rational(0));
  EXPECT_EQ(error(180, -180), Rational(0));
  EXPECT_EQ(error(350, 10), Rational(20));
  EXPECT_EQ(error(10, 350), Rational(-20));
  EXPECT_EQ(error(0, 180), Rational(180));
  EXPECT_EQ(error(180, 0), Rational(180));  // -180 is the same angle
  EXPECT_EQ(error(0, -540), Rational(180));
}

TEST(ErrorsOf, OfADutyCycle) {
  Output output = Frequency(100);
  output.duty = Rational(50);
  EXPECT_EQ(*ErrorsOf(output, 100, 0, Rational(100, 3)).duty, Rational(-50, 3));
}

// 50 ppm of 100 are 1/2, 0.2 degrees of 0.5 are 2/5, 0.3 points of 0.5 are 3/5.
TEST(WorstError, IsTheLargestInItsUnit) {
  Request request = Ask({100}, {100});
  Output& output = request.outputs[0];
  const Errors errors = {-50, Rational(-1, 5), Rational(3, 10)};
  EXPECT_EQ(WorstError(request, output, errors), Rational(3, 5));
  output.duty_tolerance = 3;  // 1/10 now
  EXPECT_EQ(WorstError(request, output, errors), Rational(1, 2));
  output.tolerance = 1000;  // 1/20
  EXPECT_EQ(WorstError(request, output, errors), Rational(2, 5));
  request.phase_tolerance = 0;  // the default again
  EXPECT_EQ(WorstError(request, output, errors), Rational(2, 5));
  output.phase_tolerance = Rational(1, 10);
  EXPECT_EQ(WorstError(request, output, errors), Rational(2));
}

TEST(WorstError, IsZeroWithoutErrors) {
  const Request request = Ask({100}, {100});
  EXPECT_EQ(WorstError(request, request.outputs[0], {}), Rational(0));
}

TEST(JitterError, IsAFractionOfWhatIsAllowed) {
  Request request = Ask({100}, {100});
  const Output& output = request.outputs[0];
  EXPECT_EQ(JitterError(request, output, 1e6), Rational(0));  // nothing is asked
  request.max_jitter = 200;
  EXPECT_EQ(JitterError(request, output, 150.5), Rational(301, 400));
  EXPECT_EQ(JitterError(request, output, kUnknownJitter), Rational(0));
  request.outputs[0].max_jitter = 100;
  EXPECT_EQ(JitterError(request, output, 150.5), Rational(301, 200));
}

TEST(AreMet, BothEndsOfToleranceCount) {
  Request request = Ask({100}, {100});
  Output& output = request.outputs[0];
  const auto met = [&](const Errors& errors) { return AreMet(request, output, errors); };
  EXPECT_TRUE(met({100, {}, {}}));
  EXPECT_TRUE(met({-100, {}, {}}));
  EXPECT_FALSE(met({100 + Sliver(100), {}, {}}));
  EXPECT_FALSE(met({-100 - Sliver(100), {}, {}}));
  output.phase = 0;
  EXPECT_TRUE(met({0, Rational(-1, 2), {}}));
  EXPECT_FALSE(met({0, Rational(1, 2) + Sliver(1), {}}));
  output.duty = 50;
  EXPECT_TRUE(met({0, Rational(0), Rational(1, 2)}));
  EXPECT_FALSE(met({0, Rational(0), Rational(-1, 2) - Sliver(1)}));
  request.tolerance = 0;
  EXPECT_TRUE(met({0, Rational(0), Rational(0)}));
  EXPECT_FALSE(met({Sliver(1), Rational(0), Rational(0)}));
}

// 128.5 is a double; a third of 100 is not, and the double below it is less than it.
TEST(IsJitterMet, ExactAndNeverWhenUnknown) {
  Request request = Ask({100}, {100});
  const Output& output = request.outputs[0];
  EXPECT_TRUE(IsJitterMet(request, output, kUnknownJitter));
  request.max_jitter = Rational(257, 2);
  EXPECT_TRUE(IsJitterMet(request, output, 128.5));
  EXPECT_FALSE(IsJitterMet(request, output, 128.5000000001));
  EXPECT_FALSE(IsJitterMet(request, output, kUnknownJitter));
  request.max_jitter = Rational(257, 2) - Sliver(1);
  EXPECT_FALSE(IsJitterMet(request, output, 128.5));
}

}  // namespace

}  // namespace planner::answer
