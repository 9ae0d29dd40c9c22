#include "planner/explain/Explain.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <random>

#include "planner/search/Within.h"
#include "tests/planner/explain/ExplainTest.h"

namespace planner::explain {
namespace {

using Kind = DemandKind;
using testing::IsEmpty;
using testing::UnorderedElementsAreArray;

TEST(Explain, NothingIsInTheWayOfWhatGoes) {
  const Question question = QuestionOf({100}, {100, 50});
  const Explanation explanation = Explain(question.request, question.device, {});
  ASSERT_EQ(explanation.primitives.size(), 1u);
  EXPECT_TRUE(explanation.primitives[0].is_met);
  EXPECT_THAT(explanation.primitives[0].conflicts, IsEmpty());
  EXPECT_TRUE(explanation.IsMet());
}

TEST(Explain, APrimitiveWithTooFewOutputsIsRefused) {
  Question question = QuestionOf({100}, {});
  question.request.outputs.resize(7);
  for (Output& output : question.request.outputs) output.frequency = 50;
  question.request.inputs = {100, 100, 100};
  const Explanation explanation = Explain(question.request, question.device, {});
  ASSERT_EQ(explanation.primitives[0].refusals.size(), 1u);
  EXPECT_EQ(explanation.primitives[0].refusals[0].kind, FindingKind::kTooManyInputs);
}

// An output above its range: nothing else is in the way of it.
TEST(Explain, AnOutputAboveItsRange) {
  const Question question = QuestionOf({100}, {350});
  const OfPrimitive one = Explain(question.request, question.device, {}).primitives[0];
  EXPECT_FALSE(one.is_met);
  const std::vector<Demand> expected = {{Kind::kFrequency, 0}, {Kind::kOutputRange, 0}};
  EXPECT_TRUE(std::any_of(one.conflicts.begin(), one.conflicts.end(), [&](const Conflict& found) {
    return found.demands == expected;
  }));
}

// The conflicts and corrections of drawn requests are those of all subsets of their demands.
TEST(Explain, ConflictsAreThoseOfAllSubsets) {
  std::mt19937 random(3);
  int explained = 0;
  for (int turn = 0; turn < 12; ++turn) {
    Question question = QuestionOf({20 + static_cast<int>(random() % 200)},
                                   {Rational(static_cast<int>(20 + random() % 320))});
    question.request.tolerance = 10;
    if (random() % 2 == 0) question.request.outputs[0].phase = static_cast<int>(random() % 360);
    const std::vector<Demand> demands = DemandsOf(question.request, Primitive::kPll);
    ASSERT_LE(demands.size(), 12u);
    const search::Within within(question.request, question.device, Primitive::kPll);
    const Set end = Set{1} << demands.size();
    std::vector<bool> goes(static_cast<std::size_t>(end));
    for (Set set = 0; set < end; ++set) goes[set] = within.Exists(OnlyWith(demands, set));
    std::vector<std::vector<Demand>> conflicts;
    for (Set set = 0; set < end; ++set) {
      bool is_conflict = !goes[set];
      for (std::size_t i = 0; i < demands.size(); ++i) {
        if (Has(set, i)) is_conflict = is_conflict && goes[set & ~(Set{1} << i)];
      }
      if (is_conflict) conflicts.push_back(In(demands, set));
    }
    const OfPrimitive one = Explain(question.request, question.device, {}).primitives[0];
    ASSERT_EQ(one.is_met, goes[end - 1]);
    std::vector<std::vector<Demand>> found;
    for (const Conflict& conflict : one.conflicts) found.push_back(conflict.demands);
    ASSERT_THAT(found, UnorderedElementsAreArray(conflicts)) << turn;
    explained += one.is_met ? 0 : 1;
  }
  EXPECT_GT(explained, 3);
}

// 98.304 MHz from 24.576: a VCO of 491.52 and M 20. From 25 MHz nothing makes it exactly.
TEST(Explain, InputsThatMakeAllExactly) {
  const Question question = QuestionOf({25}, {Rational(98304, 1000)});
  const std::vector<InputThatServes> serving =
      InputsThatServe(question.request, question.device, {Primitive::kPll},
                      {25, Rational(24576, 1000), Rational(98304, 1000)});
  ASSERT_EQ(serving.size(), 2u);
  EXPECT_EQ(serving[0].frequency, Rational(24576, 1000));
  EXPECT_EQ(serving[1].frequency, Rational(98304, 1000));
}

TEST(Explain, StockOscillatorsRise) {
  const std::vector<Rational> stock = StockOscillators();
  EXPECT_TRUE(std::is_sorted(stock.begin(), stock.end()));
  EXPECT_EQ(stock.front(), Rational(8));
  EXPECT_EQ(stock.back(), Rational(250));
}

// Only output 1 reaches 400 MHz.
TEST(Explain, OutputsThatShouldChangePlaces) {
  const Question question = QuestionOf({100}, {400, 100});
  const OfPrimitive one = Explain(question.request, question.device, {}).primitives[0];
  EXPECT_FALSE(one.is_met);
  ASSERT_EQ(one.swaps.size(), 1u);
  EXPECT_EQ(one.swaps[0].first, 0);
  EXPECT_EQ(one.swaps[0].second, 1);
}

}  // namespace
}  // namespace planner::explain
