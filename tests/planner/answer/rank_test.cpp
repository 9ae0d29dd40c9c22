// The order of hand-made answers for each class and preference, and that it is one for all.
#include "planner/answer/Rank.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <random>
#include <string>

#include "tests/planner/answer/answer_support.h"

namespace planner::answer {

namespace {

using namespace answer_test;  // NOLINT: what all tests of this folder begin with
using Preference = planner::Rank;

constexpr std::array kPreferences = {Preference::kJitter, Preference::kError, Preference::kMargin,
                                     Preference::kVco};

RankKey Key(Class rank_class, Rational error, double jitter, Rational margin, Rational vco) {
  return {.rank_class = rank_class,
          .worst_error = std::move(error),
          .jitter = jitter,
          .margin = std::move(margin),
          .vco = std::move(vco)};
}
RankKey Met(Rational error, double jitter, Rational margin, Rational vco) {
  return Key(Class::kMet, std::move(error), jitter, std::move(margin), std::move(vco));
}

Order By(Preference rank, bool prefer_max_vco = false) {
  Order order;
  order.rank = rank;
  order.prefer_max_vco = prefer_max_vco;
  return order;
}

// That `a` is before `b` for that reason, and `b` behind `a`.
void ExpectBefore(const Order& order, const RankKey& a, const RankKey& b, Criterion criterion) {
  EXPECT_TRUE(Compare(order, a, b).order < 0);
  EXPECT_EQ(Compare(order, a, b).decided, criterion);
  EXPECT_TRUE(Compare(order, b, a).order > 0);
  EXPECT_EQ(Compare(order, b, a).decided, criterion);
}

TEST(Compare, AClassBeforeAllElse) {
  const RankKey keys[] = {Key(Class::kMet, 9, 900, 0, 900), Key(Class::kMissed, 8, 800, 1, 800),
                          Key(Class::kBroken, 7, 700, -1, 700),
                          Key(Class::kUnsolved, 0, 0, 0, 0)};
  for (const Preference rank : kPreferences) {
    for (int i = 0; i < 4; ++i) {
      for (int j = i + 1; j < 4; ++j) ExpectBefore(By(rank), keys[i], keys[j], Criterion::kClass);
    }
  }
}

TEST(Compare, ByJitterThenErrorThenVco) {
  const Order order = By(Preference::kJitter);
  ExpectBefore(order, Met(1, 100, 0, 900), Met(0, 101, 1, 800), Criterion::kJitter);
  ExpectBefore(order, Met(Rational(1, 3), 100, 0, 900), Met(Rational(1, 2), 100, 1, 800),
               Criterion::kWorstError);
  ExpectBefore(order, Met(0, 100, 0, 800), Met(0, 100, 1, 900), Criterion::kVco);
  EXPECT_EQ(Compare(order, Met(0, 100, 0, 800), Met(0, 100, 1, 800)).decided, Criterion::kNone);
}

TEST(Compare, ByErrorThenJitterThenVco) {
  const Order order = By(Preference::kError);
  ExpectBefore(order, Met(0, 101, 0, 900), Met(1, 100, 1, 800), Criterion::kWorstError);
  ExpectBefore(order, Met(0, 100, 0, 900), Met(0, 101, 1, 800), Criterion::kJitter);
  ExpectBefore(order, Met(0, 100, 0, 800), Met(0, 100, 1, 900), Criterion::kVco);
}

TEST(Compare, ByMarginThenJitterThenErrorThenVco) {
  const Order order = By(Preference::kMargin);
  ExpectBefore(order, Met(1, 101, Rational(1, 2), 900), Met(0, 100, Rational(1, 3), 800),
               Criterion::kMargin);
  ExpectBefore(order, Met(1, 100, 1, 900), Met(0, 101, 1, 800), Criterion::kJitter);
  ExpectBefore(order, Met(0, 100, 1, 900), Met(1, 100, 1, 800), Criterion::kWorstError);
  ExpectBefore(order, Met(0, 100, 1, 800), Met(0, 100, 1, 900), Criterion::kVco);
}

TEST(Compare, ByVcoThenJitterThenError) {
  const Order order = By(Preference::kVco);
  ExpectBefore(order, Met(1, 101, 0, 800), Met(0, 100, 1, 900), Criterion::kVco);
  ExpectBefore(order, Met(1, 100, 0, 800), Met(0, 101, 1, 800), Criterion::kJitter);
  ExpectBefore(order, Met(0, 100, 0, 800), Met(1, 100, 1, 800), Criterion::kWorstError);
}

TEST(Compare, WithPreferMaxVcoTheHighestFirst) {
  for (const Preference rank : kPreferences) {
    ExpectBefore(By(rank, true), Met(0, 100, 0, 900), Met(0, 100, 0, 800), Criterion::kVco);
    for (const Class of : {Class::kMissed, Class::kBroken}) {
      ExpectBefore(By(rank, true), Key(of, 2, 100, 0, 900), Key(of, 2, 100, 0, 800),
                   Criterion::kVco);
    }
  }
  ExpectBefore(By(Preference::kVco, true), Met(1, 200, 0, 900), Met(0, 100, 0, 800),
               Criterion::kVco);
}

TEST(Compare, AnUnknownJitterBehindAllKnown) {
  for (const Preference rank : kPreferences) {
    ExpectBefore(By(rank), Met(0, 1e300, 0, 800), Met(0, kUnknownJitter, 0, 800),
                 Criterion::kKnownJitter);
    EXPECT_EQ(Compare(By(rank), Met(0, kUnknownJitter, 0, 800), Met(0, kUnknownJitter, 0, 800))
                  .decided,
              Criterion::kNone);
  }
}

// What misses a demand or breaks a limit is ordered alike, whatever is preferred.
TEST(Compare, TheRestByItsWorstError) {
  for (const Preference rank : kPreferences) {
    for (const Class of : {Class::kMissed, Class::kBroken}) {
      ExpectBefore(By(rank), Key(of, 2, 200, 0, 900), Key(of, 3, 100, 1, 800),
                   Criterion::kWorstError);
      ExpectBefore(By(rank), Key(of, 2, 100, 0, 900), Key(of, 2, 101, 1, 800),
                   Criterion::kJitter);
      ExpectBefore(By(rank), Key(of, 2, 100, 0, 800), Key(of, 2, 100, 1, 900), Criterion::kVco);
      EXPECT_EQ(Compare(By(rank), Key(of, 2, 1, 0, 8), Key(of, 2, 1, 1, 8)).decided,
                Criterion::kNone);
    }
  }
}

TEST(CompareSettings, OfLoopsInTheirOrder) {
  LoopSettings first = Loop(Primitive::kPll, 10, 2, {5, 6});
  first.outputs[0].phase = 1;
  const auto expect = [&](const LoopSettings& second, Criterion criterion) {
    EXPECT_TRUE(CompareSettings(first, second).order < 0);
    EXPECT_EQ(CompareSettings(first, second).decided, criterion);
    EXPECT_TRUE(CompareSettings(second, first).order > 0);
  };
  LoopSettings second = Loop(Primitive::kTsyn, 8, 1, {4, 5});
  expect(second, Criterion::kPrimitive);
  second = Loop(Primitive::kPll, 8, 1, {4, 5}, Bandwidth::kLow);
  expect(second, Criterion::kBandwidth);
  second = Loop(Primitive::kPll, 9, 3, {4, 5});
  expect(second, Criterion::kSettings);
  second = Loop(Primitive::kPll, 11, 2, {4, 5});
  expect(second, Criterion::kSettings);
  second = Loop(Primitive::kPll, 10, 2, {5, 7});
  expect(second, Criterion::kSettings);
  second = first;
  second.outputs[0].phase = 2;
  expect(second, Criterion::kSettings);
  second = first;
  second.outputs[1].high_time = 1;
  expect(second, Criterion::kSettings);
  EXPECT_EQ(CompareSettings(first, first).decided, Criterion::kNone);
  // LOW before HIGH, OPTIMIZED before both.
  EXPECT_TRUE(CompareSettings(Loop(Primitive::kPll, 1, 1, {}, Bandwidth::kLow),
                              Loop(Primitive::kPll, 1, 1, {}, Bandwidth::kHigh))
                  .order < 0);
}

// All phases count after all dividers, and all high times after all phases.
TEST(CompareSettings, DividersOfAllOutputsBeforePhases) {
  LoopSettings a = Loop(Primitive::kPll, 10, 2, {5, 6});
  LoopSettings b = Loop(Primitive::kPll, 10, 2, {5, 7});
  a.outputs[0].phase = 9;
  EXPECT_TRUE(CompareSettings(a, b).order < 0);
  b = a;
  a.outputs[0].high_time = 9;
  b.outputs[1].phase = 1;
  EXPECT_TRUE(CompareSettings(a, b).order < 0);
}

TEST(CompareSettings, OfKrusInTheirOrder) {
  KruSettings first;
  first.m = 3;
  first.d = 2;
  first.divide_halves = 4;
  first.pins = {Pin::kClk0, Pin::kClkfx};
  const auto expect = [&](const KruSettings& second, Criterion criterion) {
    EXPECT_TRUE(CompareSettings(first, second).order < 0);
    EXPECT_EQ(CompareSettings(first, second).decided, criterion);
    EXPECT_TRUE(CompareSettings(second, first).order > 0);
  };
  KruSettings second = first;
  second.d = 3;
  second.m = 2;
  expect(second, Criterion::kSettings);
  second.divide_by_2 = true;
  second.d = 1;
  expect(second, Criterion::kBandwidth);
  second = {.feedback = true, .pins = {}};
  expect(second, Criterion::kBandwidth);
  second = {.primitive = Primitive::kKruClkgen, .pins = {}};
  expect(second, Criterion::kPrimitive);
  second = first;
  second.divide_halves = 5;
  second.pins[0] = Pin::kNone;
  expect(second, Criterion::kSettings);
  second = first;
  second.pins[1] = Pin::kClkfx180;
  expect(second, Criterion::kSettings);
  second = first;
  second.phase_shift = 1;
  expect(second, Criterion::kSettings);
  EXPECT_EQ(CompareSettings(Settings(first), Settings(Loop(Primitive::kTsyn, 1, 1, {}))).decided,
            Criterion::kPrimitive);
  EXPECT_TRUE(CompareSettings(Settings(Loop(Primitive::kTsyn, 1, 1, {})), Settings(first)).order <
              0);
}

Answer Solved(Settings settings, double jitter, bool within = true) {
  Answer answer;
  answer.primitive = PrimitiveOf(settings);
  answer.solved = true;
  answer.settings = std::move(settings);
  answer.max_jitter = jitter;
  answer.within = within;
  return answer;
}
Answer None(Primitive primitive) {
  Answer answer;
  answer.primitive = primitive;
  return answer;
}

TEST(KeyOf, HasTheClass) {
  Answer answer = Solved(Loop(Primitive::kPll, 10, 1, {4}), 5);
  EXPECT_EQ(KeyOf(answer).rank_class, Class::kMet);
  answer.within = false;
  EXPECT_EQ(KeyOf(answer).rank_class, Class::kMissed);
  answer.violations.push_back({.kind = FindingKind::kOutsideLimit});
  EXPECT_EQ(KeyOf(answer).rank_class, Class::kBroken);
  EXPECT_EQ(KeyOf(None(Primitive::kPll)).rank_class, Class::kUnsolved);
  EXPECT_EQ(KeyOf(answer).jitter, 5);
  answer.max_jitter.reset();
  EXPECT_EQ(KeyOf(answer).jitter, kUnknownJitter);
}

TEST(Rank, TheBestFirst) {
  const Request request = Ask({100}, {100});
  std::vector<Answer> answers = {
      None(Primitive::kKruClkgen), None(Primitive::kKruSp),
      Solved(Loop(Primitive::kPll, 9, 1, {4}), 5, false),
      Solved(Loop(Primitive::kTsyn, 9, 1, {4}), 20), Solved(Loop(Primitive::kPll, 8, 1, {4}), 20),
      Solved(Loop(Primitive::kPll, 10, 1, {4}), 10)};
  const std::vector<Answer> given = answers;
  answer::Rank(request, &answers);
  const std::size_t expected[] = {5, 4, 3, 2, 1, 0};
  for (std::size_t i = 0; i < 6; ++i) {
    EXPECT_EQ(answers[i].primitive, given[expected[i]].primitive) << i;
    EXPECT_EQ(answers[i].max_jitter, given[expected[i]].max_jitter) << i;
    EXPECT_TRUE(SameSettings(answers[i], given[expected[i]])) << i;
  }
  EXPECT_EQ(Decided(request, answers[0], answers[1]), Criterion::kJitter);
  EXPECT_EQ(Decided(request, answers[1], answers[2]), Criterion::kPrimitive);
  EXPECT_EQ(Decided(request, answers[2], answers[3]), Criterion::kClass);
  EXPECT_EQ(Decided(request, answers[4], answers[5]), Criterion::kPrimitive);
  EXPECT_FALSE(Before(request, answers[0], answers[0]));
}

// Where settings come from does not count; those that are the same keep their order.
TEST(Rank, IsStable) {
  const Request request = Ask({100}, {100});
  Answer engine = Solved(Loop(Primitive::kPll, 8, 1, {4}), 20);
  engine.source.engine = true;
  Answer search = engine;
  search.source = {.search = true};
  std::vector<Answer> answers = {engine, search};
  answer::Rank(request, &answers);
  EXPECT_TRUE(answers[0].source.engine);
  answers = {search, engine};
  answer::Rank(request, &answers);
  EXPECT_TRUE(answers[0].source.search);
}

// --- One order for all --------------------------------------------------------------------

// An answer out of few values for each criterion, so that many are equal in some.
Answer Drawn(std::mt19937* random) {
  const auto draw = [&](int count) {
    return static_cast<int>((*random)() % static_cast<unsigned>(count));
  };
  if (draw(12) == 0) return None(hardware::kPrimitives[static_cast<std::size_t>(draw(4))]);
  Answer answer;
  if (draw(3) > 0) {
    LoopSettings settings = Loop(draw(2) == 0 ? Primitive::kPll : Primitive::kTsyn, 5 + draw(2),
                                 1 + draw(2), {4 + draw(2), 4},
                                 hardware::kBandwidths[static_cast<std::size_t>(draw(3))]);
    settings.outputs[1].phase = draw(2);
    answer = Solved(settings, 100 + draw(2), draw(2) == 0);
    answer.vco = 800 + draw(2);
  } else {
    KruSettings settings;
    settings.feedback = draw(2) == 0;
    settings.m = 2 + draw(2);
    settings.d = 1;
    settings.pins = {draw(2) == 0 ? Pin::kClkfx : Pin::kClkfx180};
    answer = Solved(settings, 100 + draw(2), draw(2) == 0);
  }
  answer.worst_error = Rational(draw(2), 3);
  answer.margin = Rational(draw(2), 3);
  if (draw(6) == 0) answer.max_jitter.reset();
  if (!answer.within && draw(2) == 0) {
    answer.violations.push_back({.kind = FindingKind::kOutsideLimit});
  }
  return answer;
}

TEST(Rank, IsATotalOrder) {
  std::mt19937 random(20261121);
  std::vector<Answer> answers;
  for (int i = 0; i < 90; ++i) answers.push_back(Drawn(&random));
  for (const Preference rank : kPreferences) {
    for (const bool prefer_max_vco : {false, true}) {
      Request request = Ask({100}, {100});
      request.rank = rank;
      request.prefer_max_vco = prefer_max_vco;
      std::vector<std::vector<int>> sign(answers.size(), std::vector<int>(answers.size()));
      for (std::size_t i = 0; i < answers.size(); ++i) {
        for (std::size_t j = 0; j < answers.size(); ++j) {
          const auto order = Compare(request, answers[i], answers[j]).order;
          sign[i][j] = order < 0 ? -1 : order > 0 ? 1 : 0;
        }
      }
      for (std::size_t i = 0; i < answers.size(); ++i) {
        EXPECT_EQ(sign[i][i], 0);
        for (std::size_t j = 0; j < answers.size(); ++j) {
          ASSERT_EQ(sign[i][j], -sign[j][i]);
          // Equal ones are the same settings, or both none of the same primitive.
          if (sign[i][j] == 0) {
            ASSERT_EQ(answers[i].solved, answers[j].solved);
            ASSERT_EQ(answers[i].primitive, answers[j].primitive);
            ASSERT_TRUE(!answers[i].solved || SameSettings(answers[i], answers[j]));
          }
          for (std::size_t k = 0; k < answers.size(); ++k) {
            ASSERT_TRUE(sign[i][j] > 0 || sign[j][k] > 0 || sign[i][k] <= 0);
          }
        }
      }
    }
  }
}

}  // namespace

}  // namespace planner::answer
