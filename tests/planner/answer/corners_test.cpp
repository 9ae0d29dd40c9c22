#include "planner/answer/Corners.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <vector>

#include "answer_support.h"
#include "planner/answer/Evaluate.h"
#include "planner/answer/Margin.h"

namespace planner::answer {
namespace {

using answer_test::Ask;
using answer_test::HandMade;
using answer_test::Loop;
using answer_test::Sliver;

// 800 / (1 - 1/5) is 1000, and 1200 / (1 + 1/5) is 1000.
TEST(Corners, ARangeIsNarrowedAtBothEnds) {
  EXPECT_EQ(Narrowed({800, 1800}, 200000), (Range{1000, 1500}));
  EXPECT_EQ(Narrowed({800, 1800}, 0), (Range{800, 1800}));
  EXPECT_EQ(Narrowed({0, 1200}, 200000), (Range{0, 1000}));
  EXPECT_EQ(CornerFactor(50), Rational(1000050, 1000000));
}

TEST(Corners, AllRangesOfADeviceAreNarrowed) {
  const Device device = Narrowed(HandMade(), 200000);
  EXPECT_EQ(device.pll->vco, (Range{500, 900}));
  EXPECT_EQ(device.pll->pfd_low, (Range{Rational(95, 4), 250}));
  EXPECT_EQ(device.tsyn->output, (Range{5, Rational(2000, 3)}));
  EXPECT_EQ(device.tsyn->max_count, 60);
  EXPECT_EQ(device.tsyn->vco_target, 1000);
  EXPECT_EQ(device.kru_sp->Of(hardware::Pin::kClk0, true), (Range{Rational(25, 4), 125}));
  EXPECT_EQ(device.kru_clkgen->Of(hardware::Pin::kClkfx, false),
            (Range{Rational(25, 4), Rational(1000, 3)}));
}

// The VCO is at 1440 MHz, its maximum: 1440 x 1.00005 is 1440.072. The output of 720 MHz is at
// most at 720.036.
TEST(Corners, AViolationTellsTheCornerTheLimitAndWhatIsThere) {
  Request request = Ask({90}, {720});
  const LoopSettings settings = Loop(Primitive::kTsyn, 16, 1, {2});
  EXPECT_TRUE(Evaluate(request, HandMade(), settings, {}).within);
  request.input_tolerance = 50;
  const Answer answer = Evaluate(request, HandMade(), settings, {});
  EXPECT_FALSE(answer.within);
  ASSERT_EQ(answer.violations.size(), 1U);
  const Finding& broken = answer.violations[0];
  EXPECT_EQ(broken.kind, FindingKind::kOutsideLimit);
  EXPECT_EQ(broken.quantity, Quantity::kVco);
  EXPECT_EQ(broken.corner, 50);
  EXPECT_EQ(broken.value, Rational(1440072, 1000));
  EXPECT_EQ(broken.range, (Range{600, 1440}));
  EXPECT_EQ(answer.vco, 1440);
  EXPECT_EQ(answer.vco_margin, Rational(-50, 1000000));
  EXPECT_EQ(answer.margin, Rational(-50, 1000000));
  // (800 - 720.036) / 800.
  EXPECT_EQ(answer.outputs[0].margin, Rational(79964, 800000));
  // (90 x 0.99995 - 10) / 10 is 7.99955, and (500 - 90.0045) / 500 is 0.819991.
  EXPECT_EQ(answer.pfd_margin, Rational(819991, 1000000));
  EXPECT_EQ(answer.outputs[0].error_ppm, 0);
}

// The lowest input is 10 x (1 - t): with a PFD of at least 10 it is too low for any t.
TEST(Corners, ALimitThatIsJustKeptAndJustBroken) {
  Request request = Ask({Rational(100, 9)}, {100});
  request.input_tolerance = 100000;
  const LoopSettings settings = Loop(Primitive::kTsyn, 63, 1, {7});
  EXPECT_TRUE(Evaluate(request, HandMade(), settings, {}).violations.empty());
  request.input_tolerance = 100000 + Sliver(100000);
  const Answer answer = Evaluate(request, HandMade(), settings, {});
  ASSERT_EQ(answer.violations.size(), 1U);
  EXPECT_EQ(answer.violations[0].quantity, Quantity::kPfd);
  EXPECT_EQ(answer.violations[0].corner, -request.input_tolerance);
  EXPECT_LT(answer.violations[0].value, Rational(10));
}

// Settings with a tolerance against the same settings at each corner of each input, where the
// input is what it is.
TEST(Corners, TheJudgeSaysWhatEachCornerDoes) {
  const Device device = HandMade();
  int broken = 0;
  int kept = 0;
  for (const Rational& tolerance : {Rational(100), Rational(20000), Rational(99999)}) {
    for (int m = 8; m <= 60; m += 4) {
      for (int d = 1; d <= 5; ++d) {
        for (const int divider : {1, 3, 60}) {
          const LoopSettings settings = Loop(Primitive::kTsyn, m, d, {divider, 2});
          Request request = Ask({40, 41}, {100, 200});
          request.input_tolerance = tolerance;
          const Answer answer = Evaluate(request, device, settings, {});
          bool all = true;
          std::optional<Rational> margin;
          std::size_t findings = 0;
          for (const Rational& input : request.inputs) {
            for (const int sign : {-1, 1}) {
              Request corner = Ask({input * (1 + tolerance * sign / 1000000)}, {100, 200});
              const Answer there = Evaluate(corner, device, settings, {});
              all = all && there.violations.empty();
              if (!margin || there.margin < *margin) margin = there.margin;
              // Each corner has its own end of a range.
              for (const Finding& one : there.violations) {
                const bool is_own = sign < 0 ? one.value < one.range.lowest
                                             : one.range.highest < one.value;
                if (!is_own) continue;
                ++findings;
                EXPECT_TRUE(std::any_of(
                    answer.violations.begin(), answer.violations.end(), [&](const Finding& told) {
                      return told.quantity == one.quantity && told.output == one.output &&
                             told.value == one.value && told.range == one.range &&
                             told.corner == tolerance * sign;
                    }));
              }
            }
          }
          EXPECT_EQ(answer.violations.empty(), all);
          EXPECT_EQ(answer.violations.size(), findings);
          EXPECT_EQ(answer.margin, *margin);
          ++(all ? kept : broken);
        }
      }
    }
  }
  EXPECT_GT(kept, 20);
  EXPECT_GT(broken, 20);
}

// CLK2X of 200 MHz is at 400, its maximum.
TEST(Corners, PinsOfAKru) {
  KruSettings settings;
  settings.feedback = true;
  settings.pins = {hardware::Pin::kClk0, hardware::Pin::kClk2x};
  Request request = Ask({200}, {200, 400});
  EXPECT_TRUE(Evaluate(request, HandMade(), settings, {}).violations.empty());
  request.input_tolerance = 1000;
  const Answer answer = Evaluate(request, HandMade(), settings, {});
  ASSERT_EQ(answer.violations.size(), 1U);
  EXPECT_EQ(answer.violations[0].output, 1);
  EXPECT_EQ(answer.violations[0].pin, "CLK2X");
  EXPECT_EQ(answer.violations[0].corner, 1000);
  EXPECT_EQ(answer.violations[0].value, Rational(4004, 10));
  EXPECT_EQ(answer.outputs[1].margin, Rational(-1, 1000));
  // (300 - 200.2) / 300.
  EXPECT_EQ(answer.outputs[0].margin, Rational(998, 3000));
}

}  // namespace
}  // namespace planner::answer
