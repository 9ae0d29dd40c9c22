#include "planner/relations/Clocks.h"

#include <gtest/gtest.h>

#include "planner/report/made.h"

namespace planner::relations {
namespace {

using report::MadeKru;
using report::MadeLoop;
using report::MadeRequest;

// 100 MHz times 8 is 800; by 8 and 16.
TEST(Clocks, OfALoop) {
  Request request = MadeRequest({100}, {100, 77, 50});
  request.outputs[1].used = false;
  request.input_jitter = 30;
  Answer answer = MadeLoop(request, Primitive::kPll, Bandwidth::kHigh, 64, 1, {64, 64, 128}, 120);
  answer.outputs[1].used = false;
  answer.outputs[0].phase = -90;
  answer.outputs[2].duty = 25;
  const std::vector<Clock> clocks = ClocksOf(request, answer);
  ASSERT_EQ(clocks.size(), 3);
  EXPECT_TRUE(clocks[0].IsInput());
  EXPECT_EQ(clocks[0].period, Rational(10));
  EXPECT_EQ(clocks[0].rise, Rational(0));
  EXPECT_EQ(clocks[0].high, Rational(5));
  EXPECT_EQ(clocks[0].jitter, 30);
  EXPECT_FALSE(clocks[1].IsInput());
  EXPECT_EQ(clocks[1].output, 0);
  EXPECT_EQ(clocks[1].rise, Rational(15, 2));  // -90 degrees are 270
  EXPECT_EQ(clocks[1].high, Rational(5));
  EXPECT_EQ(clocks[1].Fall(), Rational(25, 2));
  EXPECT_EQ(clocks[1].jitter, 120);
  EXPECT_EQ(clocks[2].output, 2);
  EXPECT_EQ(clocks[2].period, Rational(20));
  EXPECT_EQ(clocks[2].high, Rational(5));
}

TEST(Clocks, OfTwoInputs) {
  const Request request = MadeRequest({100, 80}, {200});
  const std::vector<Clock> clocks =
      ClocksOf(request, MadeLoop(request, Primitive::kPll, Bandwidth::kHigh, 64, 1, {32}, 120));
  ASSERT_EQ(clocks.size(), 4);
  EXPECT_EQ(clocks[1].period, Rational(5));
  EXPECT_TRUE(clocks[2].IsInput());
  EXPECT_EQ(clocks[2].input, 1);
  EXPECT_EQ(clocks[2].period, Rational(25, 2));
  EXPECT_EQ(clocks[3].input, 1);
  EXPECT_EQ(clocks[3].output, 0);
  EXPECT_EQ(clocks[3].period, Rational(25, 4));
  EXPECT_EQ(clocks[1].jitter, 120);
  EXPECT_FALSE(clocks[3].jitter);
}

TEST(Clocks, OutputsOnTheSamePinAreOne) {
  const Request request = MadeRequest({100}, {150, 100, 150});
  KruSettings settings;
  settings.m = 3;
  settings.d = 2;
  settings.pins = {hardware::Pin::kClkfx, hardware::Pin::kClk0, hardware::Pin::kClkfx};
  const std::vector<Clock> clocks =
      ClocksOf(request, MadeKru(request, settings, {Rational(3, 2), 1, Rational(3, 2)}, 200));
  ASSERT_EQ(clocks.size(), 3);
  EXPECT_EQ(clocks[1].output, 0);
  EXPECT_EQ(clocks[1].also, std::vector<int>{2});
  EXPECT_EQ(clocks[2].output, 1);
  EXPECT_TRUE(clocks[2].also.empty());
}

// 10 percent more of 100 and of 75 MHz.
TEST(Clocks, AreFastestWithTheTolerance) {
  Request request = MadeRequest({100, 75}, {200});
  EXPECT_EQ(Fastest(request).inputs, request.inputs);
  request.input_tolerance = 100000;
  EXPECT_EQ(Fastest(request).inputs, (std::vector<Rational>{110, Rational(165, 2)}));
}

}  // namespace
}  // namespace planner::relations
