// Tests of the inputs that make all frequencies exactly.
#include "planner/explain/Inputs.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>

#include "ExplainTest.h"
#include "tests/compare/Random.h"

namespace planner::explain {
namespace {

std::vector<InputThatServes> ServingOf(const Question& question,
                                       const std::vector<Rational>& inputs) {
  return InputsThatServe(question.request, question.device, {question.primitive}, inputs);
}

std::vector<Rational> FrequenciesOf(const std::vector<InputThatServes>& serving) {
  std::vector<Rational> frequencies;
  for (const InputThatServes& one : serving) frequencies.push_back(one.frequency);
  return frequencies;
}

// Whether some VCO and whole dividers make all outputs exactly.
bool Serves(Question question, const Rational& input) {
  question.request.inputs[0] = input;
  bool serves = false;
  ForEachVco(
      question,
      [&](const Rational& vco) {
        serves = serves || std::all_of(question.request.outputs.begin(),
                                       question.request.outputs.end(), [&](const Output& output) {
                                         const auto divider = (vco / output.frequency).Whole();
                                         return divider && *divider <= 128;
                                       });
      },
      question.device.pll->vco);
  return serves;
}

TEST(Inputs, ServeInTheirOrder) {
  // 600 MHz is the only VCO. From 33 it takes an M of 200 and a D of 11.
  const Question question = QuestionOf({33}, {100, 120});
  EXPECT_THAT(FrequenciesOf(ServingOf(question, {100, 50, 33, 60})),
              testing::ElementsAre(Rational(100), Rational(50), Rational(60)));
}

// A VCO of 495 MHz is 33 x 15.
TEST(Inputs, ThatMakeItOnlyNearlyDoNotServe) {
  Question question = QuestionOf({50}, {99, 33});
  EXPECT_EQ(ServingOf(question, {33}).size(), 1u);
  // 1 ppm off, which the tolerances would allow.
  question.request.tolerance = 1000;
  question.request.outputs[0].tolerance = 1000;
  question.request.outputs[0].frequency = Rational(99'000'099, 1'000'000);
  EXPECT_TRUE(ServingOf(question, {33}).empty());
}

// A step of 9 degrees is an eighth of a fifth of a turn, behind a VCO of 500 MHz. From 48 MHz, with
// a D of 1 or 2, there is only one of 600.
TEST(Inputs, AllOtherDemandsRemain) {
  Question question = QuestionOf({33}, {100});
  EXPECT_EQ(ServingOf(question, {48}).size(), 1u);
  question.request.outputs[0].phase = 9;
  question.request.phase_tolerance = 1;
  EXPECT_THAT(FrequenciesOf(ServingOf(question, {48, 80})), testing::ElementsAre(Rational(80)));
}

// With 100 MHz as the second input, its VCO has to be in range, too. So from 50 MHz there is none:
// 400 would be 800. From 120 it is 600 and 500.
TEST(Inputs, OfTwoTheFirstIsReplaced) {
  Question question = QuestionOf({33}, {100});
  EXPECT_EQ(ServingOf(question, {50, 100, 120}).size(), 3u);
  question.request.inputs.push_back(100);
  EXPECT_THAT(FrequenciesOf(ServingOf(question, {50, 100, 120})),
              testing::ElementsAre(Rational(100), Rational(120)));
}

TEST(Inputs, HaveThePrimitivesThatMakeAll) {
  const auto primitives_of = [](Question question, const Rational& input) {
    Device& device = question.device;
    device.tsyn = device.pll;
    device.tsyn->vco = {810, 890};
    device.primitives = {Primitive::kPll, Primitive::kTsyn};
    const std::vector<InputThatServes> serving =
        InputsThatServe(question.request, device, device.primitives, {input});
    return serving.empty() ? std::vector<Primitive>() : serving[0].primitives;
  };
  // 500 / 5, and 812.5 / 8.125.
  EXPECT_THAT(primitives_of(QuestionOf({33}, {100}), 100),
              testing::ElementsAre(Primitive::kPll, Primitive::kTsyn));
  // The divider of output 1 is whole, and no multiple of 100 is from 810 to 890.
  EXPECT_THAT(primitives_of(QuestionOf({33}, {100, 100}), 100),
              testing::ElementsAre(Primitive::kPll));
  // 290 x 5.625 / 2 is 815.625, which is 75 x 10.875. 450, 525 and 600 take a D of 29 or 58.
  EXPECT_THAT(primitives_of(QuestionOf({33}, {75}), 290), testing::ElementsAre(Primitive::kTsyn));
  EXPECT_TRUE(primitives_of(QuestionOf({33}, {75, 75}), 290).empty());
}

TEST(Inputs, AreThoseThatTryingAllFinds) {
  compare::Random random(1);
  const std::vector<Rational> frequencies = {25, Rational(98304, 1000), 40, 48, Rational(100, 3),
                                             27, Rational(12288, 1000), 60, 125};
  const std::vector<Rational> stock = StockOscillators();
  std::size_t count = 0;
  for (int i = 0; i < 20; ++i) {
    std::vector<Rational> outputs = {random.Pick(frequencies)};
    if (random.OneIn(2)) outputs.push_back(random.Pick(frequencies));
    const Question question = QuestionOf({33}, outputs);
    std::vector<Rational> plain;
    for (const Rational& input : stock) {
      if (Serves(question, input)) plain.push_back(input);
    }
    ASSERT_EQ(FrequenciesOf(ServingOf(question, stock)), plain) << i;
    count += plain.size();
  }
  EXPECT_GT(count, 50u);
}

TEST(StockOscillators, AreExactAndNoneIsThereTwice) {
  const std::vector<Rational> stock = StockOscillators();
  EXPECT_EQ(std::adjacent_find(stock.begin(), stock.end(),
                               [](const Rational& a, const Rational& b) { return a >= b; }),
            stock.end());
  EXPECT_THAT(stock, testing::IsSupersetOf({Rational(24576, 1000), Rational(3125, 20),
                                            Rational::FromDecimal("1611328125", -7)}));
}

}  // namespace
}  // namespace planner::explain
