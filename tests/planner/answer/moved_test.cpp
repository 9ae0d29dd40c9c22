#include "planner/answer/Moved.h"

#include <gtest/gtest.h>

#include "tests/planner/answer/answer_support.h"

namespace planner::answer {

namespace {

using namespace answer_test;  // NOLINT: what all tests of this folder begin with

TEST(Moved, GoesByPlaces) {
  const Request request = Ask({100}, {10, 20, 30});
  const Request placed = Placed(request, PlaceOrder{2, 0, 1});
  EXPECT_EQ(placed.outputs[0].frequency, Rational(30));
  EXPECT_EQ(placed.outputs[1].frequency, Rational(10));
  EXPECT_EQ(placed.outputs[2].frequency, Rational(20));
  EXPECT_EQ(placed.inputs, request.inputs);

  Answer answer;
  answer.primitive = Primitive::kPll;
  NoteMoved({2, 0, 1}, &answer);
  ASSERT_EQ(answer.notes.size(), 1u);
  EXPECT_EQ(answer.notes[0].kind, FindingKind::kMoved);
  EXPECT_EQ(answer.notes[0].primitive, Primitive::kPll);
  EXPECT_EQ(answer.notes[0].outputs, (std::vector<int>{2, 0, 1}));
  EXPECT_EQ(OrderOf(request, answer), (PlaceOrder{2, 0, 1}));
  EXPECT_EQ(Placed(request, answer).outputs, placed.outputs);
}

TEST(Moved, NothingToTellOfOutputsAtTheirPlaces) {
  const Request request = Ask({100}, {10, 20});
  EXPECT_EQ(AsRequested(request), (PlaceOrder{0, 1}));
  Answer answer;
  NoteMoved(AsRequested(request), &answer);
  EXPECT_TRUE(answer.notes.empty());
  EXPECT_EQ(OrderOf(request, answer), AsRequested(request));
  EXPECT_EQ(Placed(request, answer).outputs, request.outputs);
}

}  // namespace

}  // namespace planner::answer
