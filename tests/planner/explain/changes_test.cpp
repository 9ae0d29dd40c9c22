#include "planner/explain/Changes.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <optional>
#include <random>
#include <string>
#include <vector>

#include "tests/planner/answer/bundled_device.h"
#include "tests/planner/explain/ExplainTest.h"

namespace planner::explain {
namespace {

using Kind = DemandKind;
using testing::IsEmpty;

std::optional<Rational> ValueOf(const std::vector<Change>& changes, ChangeKind kind,
                                const std::function<bool(const Rational&)>& is_meant) {
  for (const Change& change : changes) {
    if (change.kind == kind && is_meant(change.value)) return change.value;
  }
  return std::nullopt;
}

// What lies next to a value on either side, and the distance of the nearer one.
struct Neighbours {
  explicit Neighbours(const Rational& of) : value(of) {}
  void Add(const Rational& made) {
    if (made <= value && (!below || made > *below)) below = made;
    if (made >= value && (!above || made < *above)) above = made;
  }
  Rational value;
  std::optional<Rational> below;
  std::optional<Rational> above;
};

// A single output: the next frequencies are those of all M, D and dividers.
TEST(Changes, OfAFrequencyAreTheNextOnesThatThereAre) {
  std::mt19937 random(1);
  for (int turn = 0; turn < 25; ++turn) {
    const Rational input = 20 + static_cast<int>(random() % 200);
    const Rational asked(static_cast<int>(60000 + random() % 200000), 1000);
    Question question = QuestionOf({input}, {asked});
    question.request.tolerance = 1;
    Neighbours next(asked);
    ForEachVco(
        question,
        [&](const Rational& vco) {
          for (int divider = 1; divider <= 128; ++divider) {
            const Rational made = vco / divider;
            if (question.device.pll->output.Contains(made)) next.Add(made);
          }
        },
        question.device.pll->vco);
    const std::vector<Change> changes = ChangesOf(question, {Kind::kFrequency, 0});
    const auto is_below = [&](const Rational& made) { return made <= asked; };
    const auto is_above = [&](const Rational& made) { return made >= asked; };
    // No further than to a thousandth, or to four times itself.
    if (next.below) {
      ASSERT_EQ(ValueOf(changes, ChangeKind::kFrequency, is_below), next.below) << turn;
    }
    if (next.above) {
      ASSERT_EQ(ValueOf(changes, ChangeKind::kFrequency, is_above), next.above) << turn;
    }
    Rational nearest = 1000000000;
    for (const auto& made : {next.below, next.above}) {
      if (made) nearest = std::min(nearest, ((*made - asked) / asked * 1000000).Absolute());
    }
    ASSERT_EQ(ValueOf(changes, ChangeKind::kTolerance, [](const Rational&) { return true; }),
              nearest)
        << turn;
  }
}

// 100 MHz from 100 MHz has dividers 4, 5 and 6, with steps of 90, 72 and 60 eighths of a degree.
TEST(Changes, OfAPhaseAreTheNextSteps) {
  Question question = QuestionOf({100}, {100});
  question.request.tolerance = 0;
  for (int degrees = -350; degrees <= 350; degrees += 50) {
    const Rational asked = degrees;
    question.request.outputs[0].phase = asked;
    question.request.phase_tolerance = 0;
    std::optional<Rational> below;
    std::optional<Rational> above;
    for (const int divider : {4, 5, 6}) {
      for (int step = -8 * divider; step <= 8 * divider; ++step) {
        const Rational made(45 * step, divider);
        const Rational down = hardware::TurnedToFull(asked - made);
        const Rational up = hardware::TurnedToFull(made - asked);
        if (!below || down < *below) below = down;
        if (!above || up < *above) above = up;
      }
    }
    const std::vector<Change> changes = ChangesOf(question, {Kind::kPhase, 0});
    const auto is_any = [](const Rational&) { return true; };
    ASSERT_EQ(changes.size(), 2u) << degrees;
    EXPECT_EQ(ValueOf({changes[0]}, ChangeKind::kPhase, is_any), asked - *below) << degrees;
    EXPECT_EQ(ValueOf({changes[1]}, ChangeKind::kPhase, is_any), asked + *above) << degrees;
  }
}

// 220 and 330 MHz need a VCO of 660 MHz, which is 60 above the range: 220 x 3.
TEST(Changes, OfARangeEndWhereTheNextVcoIs) {
  Question question = QuestionOf({220}, {220, 330});
  question.request.tolerance = 0;
  const std::vector<Change> changes = ChangesOf(question, {Kind::kVco});
  const auto is_any = [](const Rational&) { return true; };
  EXPECT_EQ(ValueOf(changes, ChangeKind::kHighest, is_any), Rational(660));
  EXPECT_EQ(ValueOf(changes, ChangeKind::kLowest, is_any), std::nullopt);
}

// Each change is what it says: the request goes with it, and its settings are right.
TEST(Changes, AreProvedByTheirSettings) {
  Question question = QuestionOf({100}, {133, 77});
  for (const Demand& demand : DemandsOf(question.request, Primitive::kPll)) {
    for (const Change& change : ChangesOf(question, demand)) {
      if (change.kind != ChangeKind::kFrequency) continue;
      Question changed = question;
      changed.request.outputs[static_cast<std::size_t>(demand.output)].frequency = change.value;
      EXPECT_TRUE(changed.Judge(change.settings).within);
      EXPECT_TRUE(changed.Ask().has_value());
    }
  }
}

TEST(Changes, ThereAreNoneWhereNothingHelps) {
  // The other output is beyond its range, whatever this one is.
  Question question = QuestionOf({100}, {100, 1000});
  EXPECT_THAT(ChangesOf(question, {Kind::kFrequency, 0}), IsEmpty());
}

// A KRU_SP from 100 MHz. Nothing can be on CLKFX or CLK90. CLK2X has a range only with feedback
// from it, and no room there for 100 MHz, twice half of the input: these are on CLK0.
Question KruQuestion(const std::vector<Rational>& outputs) {
  Question question = QuestionOf({100}, outputs);
  PinLimits pins;
  for (const hardware::PinFacts& facts : hardware::kPins) {
    pins.usual[std::string(facts.limits)] = {1, 2};
    pins.doubled[std::string(facts.limits)] = {1, 2};
  }
  pins.usual["CLK0"] = {5, 105};
  pins.doubled["CLK0"] = {99, 400};
  pins.doubled["CLK2X"] = {190, 204};
  question.device.primitives = {Primitive::kKruSp};
  question.device.kru_sp = pins;
  question.primitive = Primitive::kKruSp;
  question.request.input_tolerance = 80000;
  return question;
}

// 100 MHz are 5 percent below 105. 200 MHz on output 0 need feedback from CLK2X, with which they
// are 2 percent below 204; 100 MHz beside them are 1 percent above 99.
TEST(Changes, TheToleranceOfTheInputKeepsTheRangesOfThePins) {
  const auto tolerance = [](const std::vector<Rational>& outputs) {
    const std::vector<Change> changes = ChangesOf(KruQuestion(outputs), {Kind::kInputTolerance});
    EXPECT_EQ(changes.size(), 1u);
    if (changes.empty()) return Rational(-1);
    EXPECT_EQ(changes[0].kind, ChangeKind::kInputTolerance);
    EXPECT_EQ(changes[0].before, Rational(80000));
    return changes[0].value;
  };
  EXPECT_EQ(tolerance({100}), Rational(50000));
  EXPECT_EQ(tolerance({200}), Rational(20000));
  EXPECT_EQ(tolerance({200, 100}), Rational(10000));
}

// The smallest common tolerance, by trying every M, D and the two dividers around each output.
TEST(Changes, TheCommonToleranceIsTheSmallest) {
  std::mt19937 random(2);
  for (int turn = 0; turn < 20; ++turn) {
    const Rational input = 20 + static_cast<int>(random() % 200);
    const std::vector<Rational> asked = {
        Rational(static_cast<int>(20000 + random() % 250000), 1000),
        Rational(static_cast<int>(20000 + random() % 250000), 1000)};
    Question question = QuestionOf({input}, asked);
    std::optional<Rational> smallest;
    ForEachVco(
        question,
        [&](const Rational& vco) {
          Rational worst = 0;
          for (std::size_t n = 0; n < asked.size(); ++n) {
            std::optional<Rational> nearest;
            for (int divider = 1; divider <= 128; ++divider) {
              const Rational made = vco / divider;
              if (!question.device.pll->OutputOf(static_cast<int>(n)).Contains(made)) continue;
              const Rational error = ((made - asked[n]) / asked[n] * 1000000).Absolute();
              if (!nearest || error < *nearest) nearest = error;
            }
            worst = std::max(worst, nearest.value_or(Rational(1000000000)));
          }
          if (!smallest || worst < *smallest) smallest = worst;
        },
        question.device.pll->vco);
    const std::vector<Change> changes = CommonTolerance(question);
    if (!smallest || *smallest > Rational(1000000)) {
      EXPECT_THAT(changes, IsEmpty());
      continue;
    }
    ASSERT_EQ(changes.size(), 1u);
    ASSERT_EQ(changes[0].value, *smallest) << turn;
  }
}

// Of three video clocks a PLL has 144.594 ps at least (plan_test.cpp works it out): the smallest
// variance, 78.4271 ps^2, is that of 33 x 27 MHz with bandwidth HIGH.
TEST(Changes, TheCommonJitterOfALoop) {
  Question question = QuestionOf({27}, {Rational(297, 2), Rational(297, 4), 27});
  question.device = answer_test::Bundled("vk40", "2");
  question.request.max_jitter = 100;
  const std::vector<Change> changes = CommonJitter(question);
  ASSERT_EQ(changes.size(), 1u);
  EXPECT_EQ(changes[0].kind, ChangeKind::kJitter);
  EXPECT_EQ(changes[0].demand, (Demand{Kind::kJitter, -1}));
  EXPECT_NEAR(changes[0].value.ToDouble(), 14.069 * std::sqrt(78.4271) + 20, 0.001);
  EXPECT_EQ(changes[0].before, Rational(100));
  // What is above the others may stay, and what has no limit needs none.
  question.request.max_jitter.reset();
  question.request.outputs[0].max_jitter = 130;
  question.request.outputs[2].max_jitter = 1000;
  const std::vector<Change> others = CommonJitter(question);
  ASSERT_EQ(others.size(), 1u);
  EXPECT_EQ(others[0].value, changes[0].value);
  EXPECT_EQ(others[0].before, Rational(130));
  question.request.outputs[2].max_jitter.reset();
  EXPECT_THAT(CommonJitter(question), IsEmpty());  // the change of the one output says all
}

// With the limits there, the request goes; a little below, it does not.
TEST(Changes, TheCommonJitterIsTheSmallest) {
  std::mt19937 random(3);
  Question question = QuestionOf({100}, {});
  question.device = answer_test::Bundled("vk40", "2");
  int found = 0;
  for (int turn = 0; turn < 12; ++turn) {
    question.primitive = hardware::kPrimitives[static_cast<std::size_t>(turn % 4)];
    const Rational vco = 600;
    question.request.outputs.assign(2, {});
    question.request.outputs[0].frequency = 100;
    question.request.outputs[1].frequency = vco / static_cast<int>(6 * (1 + random() % 3));
    question.request.tolerance = 100000;
    question.request.max_jitter = 1;
    const std::vector<Change> changes = CommonJitter(question);
    if (changes.empty()) continue;
    ++found;
    const auto goes_with = [&](const Rational& jitter) {
      Question changed = question;
      changed.request.max_jitter = jitter;
      return changed.Ask().has_value();
    };
    EXPECT_TRUE(goes_with(changes[0].value)) << turn;
    EXPECT_FALSE(goes_with(changes[0].value * Rational(999999, 1000000))) << turn;
    Rational worst = 0;
    for (const OutputAnswer& output : question.Judge(changes[0].settings).outputs) {
      worst = std::max(worst, Rational::FromDouble(output.jitter.value()));
    }
    EXPECT_EQ(changes[0].value, worst) << turn;
  }
  EXPECT_GE(found, 6);
}

}  // namespace
}  // namespace planner::explain
