// Tests of phases and duty cycles behind a divider, against all steps and all high times.
#include <gtest/gtest.h>

#include <algorithm>

#include "exactly.h"
#include "hardware/Loop.h"
#include "planner/search/OutputShape.h"
#include "tests/compare/Random.h"

namespace planner::search {
namespace {

using exactly::Holds;
using hardware::kEighths;

constexpr int kCount = 64;

Request RequestOf(const std::optional<Rational>& phase, const std::optional<Rational>& duty) {
  Request request;
  request.inputs = {100};
  Output output;
  output.frequency = 50;
  output.phase = phase;
  output.duty = duty;
  request.outputs.push_back(output);
  return request;
}

OutputShape ShapeOf(const Request& request) {
  return OutputShape(request, request.outputs[0], kCount);
}

struct Nearest {
  int number;
  Rational error;
};

// Of all from `first` to `last` the one that is nearest to a value, of two the larger one.
template <typename ValueOf>
Nearest NearestOf(const Rational& value, int first, int last, const ValueOf& value_of) {
  Nearest nearest = {first, (value_of(first) - value).Absolute()};
  for (int number = first + 1; number <= last; ++number) {
    const Rational error = (value_of(number) - value).Absolute();
    if (error <= nearest.error) nearest = {number, error};
  }
  return nearest;
}

// A step is 360 / divider degrees: -1 to 1 turn.
Nearest PlainStep(const Rational& phase, int divider) {
  return NearestOf(phase, -divider, divider,
                   [divider](int step) { return Rational(360) * step / divider; });
}

// A half of a VCO period is 100 / (2 x divider) percent.
Nearest PlainHighTime(const Rational& duty, int divider) {
  const hardware::HighTimes times = hardware::HighTimesOf(divider / kEighths, kCount);
  return NearestOf(duty, times.shortest, times.longest, [divider](int halves) {
    return Rational(100) * halves / 2 / Rational(divider, kEighths);
  });
}

void ExpectNearest(const Request& request, int divider) {
  const Output& asked = request.outputs[0];
  const OutputShape shape = ShapeOf(request);
  const Nearest step = PlainStep(*asked.phase, divider);
  EXPECT_EQ(shape.Step(divider), step.number) << exactly::TextOf(*asked.phase) << " / " << divider;
  const ShapeError phase = shape.Phase(divider);
  const Rational unit = request.phase_tolerance > 0 ? request.phase_tolerance : Rational(1, 2);
  EXPECT_TRUE(Holds(phase.error, step.error / unit)) << exactly::TextOf(*asked.phase);
  EXPECT_EQ(phase.is_met, step.error <= request.phase_tolerance) << exactly::TextOf(*asked.phase);

  const Nearest high = PlainHighTime(*asked.duty, divider);
  EXPECT_EQ(shape.HighTime(divider), high.number)
      << exactly::TextOf(*asked.duty) << " / " << divider;
  const ShapeError duty = shape.Duty(divider);
  const Rational duty_unit = request.duty_tolerance > 0 ? request.duty_tolerance : Rational(1, 2);
  EXPECT_TRUE(Holds(duty.error, high.error / duty_unit)) << exactly::TextOf(*asked.duty);
  EXPECT_EQ(duty.is_met, high.error <= request.duty_tolerance) << exactly::TextOf(*asked.duty);
}

TEST(OutputShape, HasNoErrorOfWhatIsNotAskedFor) {
  const Request request = RequestOf({}, {});
  const OutputShape shape = ShapeOf(request);
  EXPECT_FALSE(shape.AsksForPhase());
  EXPECT_FALSE(shape.AsksForDuty());
  EXPECT_EQ(shape.Step(24), 0);
  EXPECT_EQ(shape.HighTime(24), 0);
  for (const ShapeError& error :
       {shape.Phase(24), shape.Duty(24), shape.StillPhase(), shape.StillDuty()}) {
    EXPECT_TRUE(error.is_met);
    EXPECT_EQ(error.error.value, 0);
  }
}

// A divider of 2 has steps of 22.5 degrees.
TEST(OutputShape, OfTwoStepsTheLaterIsTaken) {
  const Rational half_step(45, 4);
  EXPECT_EQ(ShapeOf(RequestOf(half_step, {})).Step(16), 1);
  EXPECT_EQ(ShapeOf(RequestOf(-half_step, {})).Step(16), 0);
  EXPECT_EQ(ShapeOf(RequestOf(exactly::JustBelow(half_step), {})).Step(16), 0);
  EXPECT_EQ(ShapeOf(RequestOf(exactly::JustBelow(-half_step), {})).Step(16), -1);
  EXPECT_EQ(ShapeOf(RequestOf(360, {})).Step(16), 16);
  EXPECT_EQ(ShapeOf(RequestOf(-360, {})).Step(16), -16);
}

// A divider of 4 has high times of 12.5 percent.
TEST(OutputShape, OfTwoHighTimesTheLongerIsTaken) {
  EXPECT_EQ(ShapeOf(RequestOf({}, Rational(225, 4))).HighTime(32), 5);
  EXPECT_EQ(ShapeOf(RequestOf({}, exactly::JustBelow(Rational(225, 4)))).HighTime(32), 4);
  EXPECT_EQ(ShapeOf(RequestOf({}, 1)).HighTime(32), 2);
  EXPECT_EQ(ShapeOf(RequestOf({}, 100)).HighTime(32), 7);
}

// 180 degrees are as far from 0 as a phase can be, and 350 are 10.
TEST(OutputShape, WhatStandsStillIsTurned) {
  EXPECT_TRUE(Holds(ShapeOf(RequestOf(180, {})).StillPhase().error, 360));
  EXPECT_TRUE(Holds(ShapeOf(RequestOf(350, {})).StillPhase().error, 20));
  EXPECT_TRUE(Holds(ShapeOf(RequestOf(-350, {})).StillPhase().error, 20));
  EXPECT_TRUE(ShapeOf(RequestOf(-360, {})).StillPhase().is_met);
  EXPECT_TRUE(Holds(ShapeOf(RequestOf({}, 49)).StillDuty().error, 2));
  EXPECT_FALSE(ShapeOf(RequestOf({}, 49)).StillDuty().is_met);
}

TEST(OutputShape, AToleranceThatIsJustKept) {
  // The nearest step of a divider of 2 is 22.5 degrees, the nearest high time of 2 is 50 percent.
  Request request = RequestOf(Rational(21), Rational(48));
  request.phase_tolerance = Rational(3, 2);
  request.duty_tolerance = 2;
  EXPECT_TRUE(ShapeOf(request).Phase(16).is_met);
  EXPECT_TRUE(ShapeOf(request).Duty(16).is_met);
  request.phase_tolerance = exactly::JustBelow(request.phase_tolerance);
  request.duty_tolerance = exactly::JustBelow(request.duty_tolerance);
  EXPECT_FALSE(ShapeOf(request).Phase(16).is_met);
  EXPECT_FALSE(ShapeOf(request).Duty(16).is_met);
}

TEST(OutputShape, IsTheNearestOfAll) {
  compare::Random random(1);
  const std::vector<Rational> tolerances = {0, Rational(1, 2), Rational(1, 1000), 3, 200};
  for (int i = 0; i < 100; ++i) {
    const int divider =
        random.OneIn(2) ? random.Int(1, 127) * kEighths : random.Int(kEighths, 127 * kEighths);
    // Half-way cases and whole steps, and anything else.
    Rational phase = random.OneIn(2)
                         ? Rational(180) * random.Int(-2 * divider, 2 * divider) / divider
                         : Rational(random.Int(-359999, 359999), 1000);
    phase = std::max(Rational(-359), std::min(Rational(359), exactly::Nudged(random, phase)));
    Rational duty = random.OneIn(2) ? Rational(25 * kEighths) * random.Int(1, divider / 2) / divider
                                    : Rational(random.Int(1, 99999), 1000);
    duty = exactly::Nudged(random, duty);
    Request request = RequestOf(phase, duty);
    request.phase_tolerance =
        random.OneIn(3) ? PlainStep(phase, divider).error : random.Pick(tolerances);
    request.duty_tolerance =
        random.OneIn(3) ? PlainHighTime(duty, divider).error : random.Pick(tolerances);
    ExpectNearest(request, divider);
  }
}

}  // namespace
}  // namespace planner::search
