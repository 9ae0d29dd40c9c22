// Tests of the staircase of errors, against a list of all that was added.
#include "planner/search/Staircase.h"

#include <gtest/gtest.h>

#include <cmath>
#include <compare>
#include <limits>
#include <optional>
#include <vector>

#include "tests/compare/Random.h"

namespace planner::search {
namespace {

std::strong_ordering Compare(int a, int b) { return a <=> b; }

struct Added {
  double key;
  int error;
};

// The smallest error of those whose keys are larger by the factor, or as large.
std::optional<int> PlainBound(const std::vector<Added>& all, double key, double factor) {
  std::optional<int> bound;
  for (const Added& one : all) {
    if (one.key < key * factor) continue;
    if (!bound || one.error < *bound) bound = one.error;
  }
  return bound;
}

std::optional<int> BoundOf(const Staircase<int>& staircase, double key) {
  const int* bound = staircase.BoundOf(key);
  return bound ? std::optional<int>(*bound) : std::nullopt;
}

TEST(Staircase, HasNoBoundWithoutAStep) {
  EXPECT_EQ(Staircase<int>(0).BoundOf(1), nullptr);
  EXPECT_EQ(Staircase<int>(1).BoundOf(1), nullptr);
}

TEST(Staircase, AStepBoundsWhatHasNoLargerKey) {
  Staircase<int> staircase(1);
  staircase.Add(10, 5, Compare);
  staircase.Add(4, 2, Compare);
  EXPECT_EQ(BoundOf(staircase, 11), std::nullopt);
  EXPECT_EQ(BoundOf(staircase, 10), 5);
  EXPECT_EQ(BoundOf(staircase, 5), 5);
  EXPECT_EQ(BoundOf(staircase, 4), 2);
  EXPECT_EQ(BoundOf(staircase, 0.5), 2);
}

TEST(Staircase, WhatIsBeneathAStepChangesNothing) {
  Staircase<int> staircase(1);
  staircase.Add(10, 5, Compare);
  staircase.Add(9, 6, Compare);
  staircase.Add(9, 5, Compare);
  staircase.Add(10, 5, Compare);
  EXPECT_EQ(BoundOf(staircase, 9), 5);
  EXPECT_EQ(BoundOf(staircase, 10), 5);
}

TEST(Staircase, AStepTakesThePlaceOfAllBeneathIt) {
  Staircase<int> staircase(1);
  for (const Added& one : {Added{10, 9}, Added{8, 7}, Added{6, 5}, Added{4, 1}}) {
    staircase.Add(one.key, one.error, Compare);
  }
  staircase.Add(9, 5, Compare);
  EXPECT_EQ(BoundOf(staircase, 10), 9);
  EXPECT_EQ(BoundOf(staircase, 9), 5);
  EXPECT_EQ(BoundOf(staircase, 5), 5);
  EXPECT_EQ(BoundOf(staircase, 4), 1);
}

TEST(Staircase, AKeyCountsAsLargerByTheFactor) {
  Staircase<int> staircase(1.5);
  staircase.Add(9, 5, Compare);
  EXPECT_EQ(BoundOf(staircase, 6), 5);
  EXPECT_EQ(BoundOf(staircase, 6.001), std::nullopt);
}

TEST(Staircase, WithAFactorOfZeroTheSmallestErrorIsTheBound) {
  Staircase<int> staircase(0);
  staircase.Add(10, 5, Compare);
  staircase.Add(1, 3, Compare);
  EXPECT_EQ(BoundOf(staircase, 1e300), 3);
}

TEST(Staircase, WithAnUnlimitedFactorThereIsNoBound) {
  Staircase<int> staircase(HUGE_VAL);
  staircase.Add(1e300, 0, Compare);
  EXPECT_EQ(BoundOf(staircase, std::numeric_limits<double>::min()), std::nullopt);
}

// Few keys and errors, so that many are the same.
TEST(Staircase, IsWhatAListOfAllTells) {
  compare::Random random(1);
  const std::vector<double> factors = {0, 0.5, 1, 1.25, HUGE_VAL};
  for (int i = 0; i < 400; ++i) {
    const double factor = random.Pick(factors);
    Staircase<int> staircase(factor);
    std::vector<Added> all;
    for (int n = random.Int(1, 25); n > 0; --n) {
      const Added one = {random.Int(1, 12) / 4.0, random.Int(0, 12)};
      staircase.Add(one.key, one.error, Compare);
      all.push_back(one);
      for (int key = 1; key <= 13; ++key) {
        ASSERT_EQ(BoundOf(staircase, key / 4.0), PlainBound(all, key / 4.0, factor)) << i;
      }
    }
  }
}

}  // namespace
}  // namespace planner::search
