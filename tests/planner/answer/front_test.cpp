#include "planner/answer/Front.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <random>

#include "tests/planner/answer/answer_support.h"

namespace planner::answer {

namespace {

using namespace answer_test;  // NOLINT: what all tests of this folder begin with

using Places = std::vector<std::size_t>;

RankKey Key(Rational error, double jitter, Class rank_class = Class::kMet) {
  return {.rank_class = rank_class, .worst_error = std::move(error), .jitter = jitter};
}
Places PlacesOf(const std::vector<RankKey>& keys) {
  return FrontOf(keys, [](std::size_t a, std::size_t b) { return a < b; });
}

TEST(FrontOf, LessJitterForALargerError) {
  EXPECT_EQ(PlacesOf({Key(Rational(1, 2), 90), Key(0, 100), Key(Rational(1, 3), 95),
                     Key(Rational(1, 4), 105), Key(1, 90)}),
            (Places{1, 2, 0}));
}

TEST(FrontOf, OfEqualOnesThatWhichRanksFirst) {
  EXPECT_EQ(PlacesOf({Key(0, 100), Key(0, 90), Key(0, 90), Key(0, 100)}), (Places{1}));
  const std::vector<RankKey> keys = {Key(0, 90), Key(0, 90)};
  EXPECT_EQ(FrontOf(keys, [](std::size_t a, std::size_t b) { return a > b; }),
            (Places{1}));
}

// Less jitter does not make up for a demand that is missed while others meet it.
TEST(FrontOf, OnlyTheClassOfTheBest) {
  EXPECT_EQ(PlacesOf({Key(2, 50, Class::kMissed), Key(1, 100), Key(0, 60, Class::kBroken),
                     Key(0, 0, Class::kUnsolved)}),
            (Places{1}));
  EXPECT_EQ(PlacesOf({Key(3, 50, Class::kMissed), Key(2, 60, Class::kMissed),
                     Key(0, 10, Class::kBroken)}),
            (Places{1, 0}));
}

TEST(FrontOf, NothingOfNothing) {
  EXPECT_TRUE(PlacesOf({}).empty());
  EXPECT_TRUE(PlacesOf({Key(0, 1, Class::kUnsolved)}).empty());
}

TEST(FrontOf, WithoutAJitterOnlyTheFirst) {
  EXPECT_EQ(PlacesOf({Key(1, kUnknownJitter), Key(0, kUnknownJitter)}), (Places{1}));
  EXPECT_EQ(PlacesOf({Key(0, kUnknownJitter), Key(1, 100)}), (Places{0, 1}));
}

// By the definition: nothing of the same class is at least as good in both and better in one.
TEST(FrontOf, IsWhatNothingDominates) {
  std::mt19937 random(7);
  for (int round = 0; round < 500; ++round) {
    std::vector<RankKey> keys;
    const auto count = static_cast<int>(random() % 12);
    for (int i = 0; i < count; ++i) {
      keys.push_back(Key(static_cast<int>(random() % 5), static_cast<double>(random() % 5),
                         random() % 4 == 0 ? Class::kMissed : Class::kMet));
    }
    bool met = false;
    for (const RankKey& key : keys) met = met || key.rank_class == Class::kMet;
    Places expected;
    for (std::size_t i = 0; i < keys.size(); ++i) {
      if (met && keys[i].rank_class != Class::kMet) continue;
      bool is_dominated = false;
      for (std::size_t j = 0; j < keys.size(); ++j) {
        if (keys[j].rank_class != keys[i].rank_class) continue;
        const bool no_worse = keys[j].worst_error <= keys[i].worst_error &&
                              keys[j].jitter <= keys[i].jitter;
        const bool is_better =
            keys[j].worst_error < keys[i].worst_error || keys[j].jitter < keys[i].jitter;
        is_dominated = is_dominated || (no_worse && (is_better || j < i));
      }
      if (!is_dominated) expected.push_back(i);
    }
    std::sort(expected.begin(), expected.end(), [&](std::size_t a, std::size_t b) {
      return keys[a].worst_error < keys[b].worst_error;
    });
    EXPECT_EQ(PlacesOf(keys), expected);
  }
}

TEST(FrontOf, OfAnswers) {
  const auto answer = [](Primitive primitive, double jitter, int error) {
    Answer made;
    made.primitive = primitive;
    made.solved = true;
    made.within = true;
    made.settings = Loop(primitive, 10, 1, {4});
    made.max_jitter = jitter;
    made.worst_error = Rational(error, 10);
    return made;
  };
  const Front front = FrontOf(
      Ask({100}, {100}),
      {answer(Primitive::kTsyn, 90, 5), answer(Primitive::kPll, 90, 5),
       answer(Primitive::kTsyn, 100, 0), answer(Primitive::kPll, 95, 7)});
  ASSERT_EQ(front.size(), 2u);
  EXPECT_EQ(front[0].max_jitter, 100);
  EXPECT_EQ(front[1].primitive, Primitive::kPll);
  EXPECT_EQ(front[1].max_jitter, 90);
}

}  // namespace

}  // namespace planner::answer
