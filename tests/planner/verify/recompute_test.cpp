// What settings make, by hand.
#include "planner/verify/Recompute.h"

#include <gtest/gtest.h>

#include "tests/planner/answer/answer_support.h"

namespace planner::verify {

namespace {

using namespace answer_test;  // NOLINT: requests and devices

Answer Of(const Request& request, const Settings& settings) {
  return Recompute(request, HandMade(), settings, OwnPlaces(request), {});
}

// M 10 and D 1 of 100 MHz are a VCO of 1000 MHz; dividers 4 and 8 make 250 and 125 MHz.
TEST(Recompute, ALoop) {
  Request request = Ask({100}, {250, Rational(1251, 10)});
  request.outputs[0].phase = 30;
  request.outputs[1].duty = 40;
  LoopSettings set = Loop(Primitive::kPll, 10, 1, {4, 8});
  set.outputs[0].phase = 3;      // of 32: 33.75 degrees
  set.outputs[1].high_time = 6;  // of 16: 37.5 percent
  const Answer answer = Of(request, set);
  EXPECT_EQ(answer.vco, Rational(1000));
  EXPECT_EQ(answer.pfd, Rational(100));
  EXPECT_EQ(answer.outputs[0].frequency, Rational(250));
  EXPECT_EQ(answer.outputs[0].phase, Rational(135, 4));
  EXPECT_EQ(answer.outputs[0].phase_error, Rational(15, 4));
  EXPECT_EQ(answer.outputs[1].error_ppm, Rational(-1'000'000, 1251));
  EXPECT_EQ(answer.outputs[1].duty_error, Rational(-5, 2));
  // 3.75 degrees are 7.5 units, 799 ppm 8, and 2.5 points 5.
  EXPECT_EQ(answer.worst_error, Rational(10'000, 1251));
  EXPECT_EQ(answer.worst_ppm, Rational(1'000'000, 1251));
  // The VCO is 80 below 1080 MHz.
  EXPECT_EQ(answer.margin, Rational(80, 1080));
  EXPECT_FALSE(answer.within);
  EXPECT_TRUE(answer.violations.empty());
  ASSERT_EQ(answer.outputs[1].misses.size(), 2u);
  EXPECT_EQ(answer.outputs[1].misses[1].quantity, Quantity::kDuty);
  EXPECT_FALSE(answer.max_jitter);
}

TEST(Recompute, NothingMovesBesideAFraction) {
  Request request = Ask({100}, {125, 250});
  request.outputs[1].phase = 90;
  request.outputs[1].duty = 25;
  LoopSettings set = Loop(Primitive::kTsyn, 10, 1, {8, 4});
  set.m = 81;
  const Answer answer = Of(request, set);
  EXPECT_EQ(answer.outputs[1].phase, Rational(0));
  EXPECT_EQ(answer.outputs[1].phase_error, Rational(-90));
  EXPECT_EQ(answer.outputs[1].duty_error, Rational(25));
  EXPECT_EQ(answer.notes.front().kind, FindingKind::kNothingMoves);
}

// With the second input the VCO, 1100 MHz, is above 1080, and output 0 at 550 above 400.
TEST(Recompute, LimitsHoldWithEachInput) {
  const Request request = Ask({75, 110}, {375, 375});
  const Answer answer = Of(request, Loop(Primitive::kPll, 10, 1, {2, 2}));
  ASSERT_EQ(answer.violations.size(), 2u);
  EXPECT_EQ(answer.violations[0].quantity, Quantity::kVco);
  EXPECT_EQ(answer.violations[0].input, 1);
  EXPECT_EQ(answer.violations[0].value, Rational(1100));
  // Output 1 may go up to 1080.
  EXPECT_EQ(answer.violations[1].output, 0);
  EXPECT_EQ(answer.violations[1].value, Rational(550));
  EXPECT_EQ(answer.margin, Rational(-150, 400));
  EXPECT_EQ(answer.outputs[0].frequency_second, Rational(550));
}

TEST(Recompute, AKru) {
  Request request = Ask({60}, {120, 24, 60});
  request.outputs[2].phase = 100;
  KruSettings set{.feedback = true, .divide_halves = 5, .phase_shift = 7,
                  .pins = {Pin::kClk2x, Pin::kClkdv, Pin::kClk90}};
  const Answer answer = Of(request, set);
  EXPECT_EQ(answer.outputs[0].frequency, Rational(120));
  EXPECT_EQ(answer.outputs[1].frequency, Rational(24));
  EXPECT_EQ(answer.outputs[1].duty, Rational(40));
  // 90 degrees and 7 of 255 steps: 99.882.
  EXPECT_EQ(answer.outputs[2].phase, 90 + Rational(7 * 360, 255));
  EXPECT_EQ(answer.outputs[2].phase_error, Rational(7 * 360, 255) - 10);
  // With feedback from CLK2X: CLK90 at 60 of 5 to 120 MHz, CLKDV at 24 of 1/4 to 160.
  EXPECT_EQ(answer.margin, Rational(1, 2));
  EXPECT_TRUE(answer.violations.empty());
}

// High and low times up to 60 make dividers up to 120: 121 is too large, 120 is not.
TEST(Recompute, ADividerThatTheCountersCannotMake) {
  const Request request = Ask({100}, {Rational(1000, 120), Rational(1000, 121)});
  const Answer answer = Of(request, Loop(Primitive::kPll, 10, 1, {120, 121}));
  ASSERT_EQ(answer.violations.size(), 1u);
  const Finding& finding = answer.violations[0];
  EXPECT_EQ(finding.kind, FindingKind::kDividerTooLarge);
  EXPECT_EQ(finding.primitive, Primitive::kPll);
  EXPECT_EQ(finding.quantity, Quantity::kDivider);
  EXPECT_EQ(finding.output, 1);
  EXPECT_EQ(finding.value, Rational(121));
  EXPECT_EQ(finding.range, (Range{1, 60}));
  EXPECT_FALSE(answer.within);
}

// Output 0 of a KRU_CLKGEN is on CLKFX whatever its phase. None, and one of 0, is not told.
TEST(Recompute, PhaseOfOutput0OfAKruClkgen) {
  const KruSettings set{.primitive = Primitive::kKruClkgen, .m = 5, .d = 3, .pins = {Pin::kClkfx}};
  Request request = Ask({60}, {100});
  EXPECT_NE(Of(request, set).notes.front().kind, FindingKind::kOutput0Phase);
  request.outputs[0].phase = 0;
  EXPECT_NE(Of(request, set).notes.front().kind, FindingKind::kOutput0Phase);
  request.outputs[0].phase = -45;
  const Finding note = Of(request, set).notes.front();
  EXPECT_EQ(note.kind, FindingKind::kOutput0Phase);
  EXPECT_EQ(note.primitive, Primitive::kKruClkgen);
  EXPECT_EQ(note.quantity, Quantity::kPhase);
  EXPECT_EQ(note.output, 0);
  EXPECT_EQ(note.value, Rational(-45));
}

TEST(Recompute, OutputsThatHaveMoved) {
  const Request request = Ask({100}, {250, 125});
  const Answer answer = Recompute(request, HandMade(), Loop(Primitive::kPll, 10, 1, {8, 4}),
                                  {1, 0}, {});
  EXPECT_EQ(answer.worst_ppm, Rational(0));
  EXPECT_EQ(answer.notes.back().kind, FindingKind::kMoved);
  EXPECT_EQ(answer.notes.back().outputs, (std::vector<int>{1, 0}));
}

}  // namespace

}  // namespace planner::verify
