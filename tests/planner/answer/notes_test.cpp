#include <gtest/gtest.h>

#include <stdexcept>

#include "planner/answer/Evaluate.h"
#include "tests/planner/answer/answer_support.h"

namespace planner::answer {

namespace {

using namespace answer_test;  // NOLINT: what all tests of this folder begin with

bool Has(const Answer& answer, FindingKind kind) {
  for (const Finding& note : answer.notes) {
    if (note.kind == kind) return true;
  }
  return false;
}

const Finding& The(const Answer& answer, FindingKind kind) {
  for (const Finding& note : answer.notes) {
    if (note.kind == kind) return note;
  }
  throw std::logic_error("no such note");
}

const Source kEngine = {.engine = true};

TEST(Notes, FrequenciesThatTheEngineCountedWith) {
  const Request request = Ask({100}, {100, 50});
  const LoopSettings settings = Loop(Primitive::kPll, 10, 1, {10, 20});
  const auto evaluate = [&](double first, double second) {
    return Evaluate(request, HandMade(), settings, kEngine, {1000.0, {first, second}});
  };
  EXPECT_FALSE(Has(evaluate(100, 50), FindingKind::kSearchedFrequencies));
  EXPECT_FALSE(Has(evaluate(100.0004, 49.9996), FindingKind::kSearchedFrequencies));
  const Answer answer = evaluate(100, 50.0625);
  EXPECT_EQ(The(answer, FindingKind::kSearchedFrequencies).numbers,
            (std::vector<Rational>{100, Rational(801, 16)}));
  EXPECT_EQ(answer.outputs[1].searched, 50.0625);
  EXPECT_EQ(answer.searched_vco, 1000.0);
  // Where the engine does not say what it counted with there is nothing to tell.
  EXPECT_FALSE(Has(Evaluate(request, HandMade(), settings, kEngine, {1000.0, {{}, 50.0625}}),
                   FindingKind::kSearchedFrequencies));
}

// With one input the report shows both VCOs side by side.
TEST(Notes, TheVcoThatTheEngineCountedWith) {
  const LoopSettings settings = Loop(Primitive::kPll, 10, 1, {10});
  EXPECT_FALSE(Has(Evaluate(Ask({100}, {100}), HandMade(), settings, kEngine, {1001.5, {}}),
                   FindingKind::kSearchedVco));
  const Request two = Ask({100, 99}, {100});
  const Answer answer = Evaluate(two, HandMade(), settings, kEngine, {1001.5, {}});
  EXPECT_EQ(The(answer, FindingKind::kSearchedVco).value, Rational(2003, 2));
  EXPECT_FALSE(Has(Evaluate(two, HandMade(), settings, kEngine, {1000.0003, {}}),
                   FindingKind::kSearchedVco));
}

TEST(Notes, NothingMovesBesideAFraction) {
  Request request = Ask({100}, {100});
  LoopSettings settings = Loop(Primitive::kTsyn, 10, 1, {10});
  settings.m += 1;
  EXPECT_FALSE(Has(Evaluate(request, HandMade(), settings, {}), FindingKind::kNothingMoves));
  request.outputs[0].duty = 50;
  EXPECT_TRUE(Has(Evaluate(request, HandMade(), settings, {}), FindingKind::kNothingMoves));
  settings.m -= 1;
  EXPECT_FALSE(Has(Evaluate(request, HandMade(), settings, {}), FindingKind::kNothingMoves));
}

TEST(Notes, SwitchesWithoutAUse) {
  Request request = Ask({100}, {100});
  request.prefer_max_vco = true;
  request.whole_divider_0 = true;
  request.bandwidth = Bandwidth::kLow;
  const LoopSettings pll = Loop(Primitive::kPll, 10, 1, {10});
  const Answer answer = Evaluate(request, HandMade(), pll, kEngine);
  EXPECT_TRUE(Has(answer, FindingKind::kPreferMaxVcoUnused));
  EXPECT_TRUE(Has(answer, FindingKind::kWholeDividerUnused));
  EXPECT_FALSE(Has(answer, FindingKind::kBandwidthUnused));
  // A variant of the engine, and the search, take the VCO into account.
  const Source variant = {.engine = true, .variant = "largest VCO"};
  EXPECT_FALSE(Has(Evaluate(request, HandMade(), pll, variant), FindingKind::kPreferMaxVcoUnused));
  EXPECT_FALSE(Has(Evaluate(request, HandMade(), pll, {.search = true}),
                   FindingKind::kPreferMaxVcoUnused));
  // So does the engine where phases are asked for.
  request.outputs[0].phase = 0;
  EXPECT_FALSE(Has(Evaluate(request, HandMade(), pll, kEngine), FindingKind::kPreferMaxVcoUnused));
  EXPECT_FALSE(Has(Evaluate(request, HandMade(), Loop(Primitive::kTsyn, 10, 1, {10}), kEngine),
                   FindingKind::kWholeDividerUnused));
  KruSettings kru;
  kru.pins = {Pin::kClk0};
  const Answer of_kru = Evaluate(request, HandMade(), kru, kEngine);
  EXPECT_TRUE(Has(of_kru, FindingKind::kBandwidthUnused));
  EXPECT_FALSE(Has(of_kru, FindingKind::kWholeDividerUnused));
  EXPECT_FALSE(Has(of_kru, FindingKind::kOutput0Phase));
}

TEST(Notes, Output0OfAClkgenHasItsPhase) {
  Request request = Ask({100}, {150});
  KruSettings settings;
  settings.primitive = Primitive::kKruClkgen;
  settings.m = 3;
  settings.d = 2;
  settings.pins = {Pin::kClkfx};
  EXPECT_FALSE(Has(Evaluate(request, HandMade(), settings, {}), FindingKind::kOutput0Phase));
  request.outputs[0].phase = 0;
  EXPECT_FALSE(Has(Evaluate(request, HandMade(), settings, {}), FindingKind::kOutput0Phase));
  request.outputs[0].phase = 90;
  EXPECT_TRUE(Has(Evaluate(request, HandMade(), settings, {}), FindingKind::kOutput0Phase));
}

// Of what is not known nothing passes.
TEST(Notes, JitterOfTheInput) {
  Request request = Ask({100}, {100});
  request.input_jitter = 20;
  KruSettings kru;
  kru.pins = {Pin::kClk0};
  EXPECT_FALSE(Has(Evaluate(request, HandMade(), kru, {}), FindingKind::kInputJitterPasses));
}

}  // namespace

}  // namespace planner::answer
