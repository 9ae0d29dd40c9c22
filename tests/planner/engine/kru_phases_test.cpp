// PHASE_SHIFT moves all pins in steps of 360 / 255 = 24 / 17 degrees.
#include "planner/engine/KruPhases.h"

#include <gtest/gtest.h>

#include "tests/planner/engine/devices.h"

namespace {

using engine_test::Ask;
using engine_test::Out;
using hardware::Primitive;
using hardware::Rational;
using planner::Request;
using planner::engine::KruPhases;
using Lists = std::vector<std::vector<double>>;

Request Phases(const std::vector<std::optional<Rational>>& phases) {
  Request request = Ask({100}, {});
  for (const auto& phase : phases) request.outputs.push_back(Out(100, phase));
  return request;
}

// The largest binary fraction of 1024 parts that is not above 89.999, and above 9.882: 7 steps.
constexpr double kJustBelow90 = 92158.0 / 1024;
constexpr double kSevenSteps = 10119.0 / 1024;

TEST(KruPhases, AreNoneWhereNoneAreAskedFor) {
  EXPECT_EQ(KruPhases(Phases({{}, {}}), Primitive::kKruSp, true), (Lists{{0, 0}}));
  EXPECT_EQ(KruPhases(Phases({{}}), Primitive::kKruClkgen, false), (Lists{{0}}));
}

// 90 degrees are a pin, or the pin at 0 with 64 steps, 90.353. Less than that is asked for.
TEST(KruPhases, AreThoseOfAPinAndOfAStep) {
  EXPECT_EQ(KruPhases(Phases({90}), Primitive::kKruSp, true), (Lists{{90}, {kJustBelow90}}));
}

TEST(KruPhases, AreTurnedToTheFirstTurn) {
  EXPECT_EQ(KruPhases(Phases({-90}), Primitive::kKruSp, true),
            (Lists{{-90}, {270}, {180 + kJustBelow90}}));
  EXPECT_EQ(KruPhases(Phases({360}), Primitive::kKruClkgen, false), (Lists{{360}, {0}}));
}

// Without feedback the pins are 180 degrees apart: 90 is 64 steps.
TEST(KruPhases, HaveOtherPinsWithoutFeedback) {
  const double steps = 92521.0 / 1024;  // 64 steps are 90.3529
  EXPECT_EQ(KruPhases(Phases({90}), Primitive::kKruSp, false), (Lists{{90}, {steps}}));
  EXPECT_EQ(KruPhases(Phases({90}), Primitive::kKruClkgen, false), (Lists{{90}}));
}

// 10.1 and 100.1 less 90 differ as doubles. 7 steps are 9.882.
TEST(KruPhases, HaveTheSameRest) {
  EXPECT_EQ(KruPhases(Phases({Rational(101, 10), Rational(1001, 10)}), Primitive::kKruSp, true),
            (Lists{{10.1, 100.1}, {kSevenSteps, 90 + kSevenSteps}}));
}

TEST(KruPhases, KeepToTheToleranceOfEachOutput) {
  Request request = Phases({Rational(101, 10), Rational(1003, 10)});  // 0.218 and 0.418 off
  EXPECT_EQ(KruPhases(request, Primitive::kKruSp, true).size(), 2u);
  request.outputs[1].phase_tolerance = Rational(4, 10);
  EXPECT_EQ(KruPhases(request, Primitive::kKruSp, true), (Lists{{10.1, 100.3}}));
  request.outputs[1].phase_tolerance = Rational(1003, 10) - Rational(90) - Rational(7 * 24, 17);
  EXPECT_EQ(KruPhases(request, Primitive::kKruSp, true).size(), 2u);
}

// The step is that with the smallest largest error, in units of the tolerances: 28 degrees are
// 19.83 steps, and 29 are 20.54. With 20 steps, 28.235, the errors are 0.235 and 0.765; with 21,
// 29.647, they are 1.647 and 0.647.
TEST(KruPhases, TakeTheStepThatComesNearestToAll) {
  Request request = Phases({28, 119});
  request.phase_tolerance = 2;
  const double twenty = 28912.0 / 1024;
  const double twenty_one = 30358.0 / 1024;
  EXPECT_EQ(KruPhases(request, Primitive::kKruSp, true),
            (Lists{{28, 119}, {twenty, 90 + twenty}}));
  request.outputs[0].phase_tolerance = 20;
  EXPECT_EQ(KruPhases(request, Primitive::kKruSp, true),
            (Lists{{28, 119}, {twenty_one, 90 + twenty_one}}));
}

TEST(KruPhases, FillInWhatIsNotAskedFor) {
  EXPECT_EQ(KruPhases(Phases({10, {}}), Primitive::kKruSp, true),
            (Lists{{10, 0}, {10, 10}, {10, 100}, {10, 190}, {10, 280},
                   {kSevenSteps, 0}, {kSevenSteps, kSevenSteps}, {kSevenSteps, 90 + kSevenSteps},
                   {kSevenSteps, 180 + kSevenSteps}, {kSevenSteps, 270 + kSevenSteps}}));
  EXPECT_EQ(KruPhases(Phases({0, {}}), Primitive::kKruClkgen, false),
            (Lists{{0, 0}, {0, 90}, {0, 180}, {0, 270}}));
}

TEST(KruPhases, LeaveUnusedOutputsAlone) {
  Request request = Phases({90, 45});
  request.outputs[1].used = false;
  const Lists lists = KruPhases(request, Primitive::kKruSp, true);
  ASSERT_FALSE(lists.empty());
  for (const auto& list : lists) EXPECT_EQ(list[1], 0);
  EXPECT_EQ(lists.front(), (std::vector<double>{90, 0}));
}

}  // namespace
