// Tests of what is demanded of the jitter of all outputs together.
#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <vector>

#include "exactly.h"
#include "planner/search/JitterDemand.h"
#include "tests/compare/Random.h"

namespace planner::search {
namespace {

using exactly::Holds;
using hardware::Rational;

constexpr double kUnknown = std::numeric_limits<double>::infinity();

JitterDemand DemandOf(const std::vector<Rational>& allowed) {
  JitterDemand demand;
  for (const Rational& one : allowed) demand.Add(one);
  return demand;
}

TEST(JitterDemand, ThatIsNoneIsMetByAll) {
  const JitterDemand demand;
  EXPECT_FALSE(demand.IsAsked());
  EXPECT_TRUE(demand.IsMet(1e9));
  EXPECT_TRUE(demand.IsMet(kUnknown));
  EXPECT_EQ(demand.Error(1e9).value, 0);
  EXPECT_EQ(demand.ExactError(1e9), Rational(0));
}

TEST(JitterDemand, IsMetUpToWhatIsAllowed) {
  const JitterDemand demand = DemandOf({120});
  EXPECT_TRUE(demand.IsAsked());
  EXPECT_TRUE(demand.IsMet(0));
  EXPECT_TRUE(demand.IsMet(120));
  EXPECT_FALSE(demand.IsMet(std::nextafter(120, 121)));
  EXPECT_EQ(demand.ExactError(90), Rational(3, 4));
}

TEST(JitterDemand, AnUnknownJitterMeetsNoneAndHasNoError) {
  const JitterDemand demand = DemandOf({Rational::FromDecimal("1", 400)});
  EXPECT_FALSE(demand.IsMet(kUnknown));
  EXPECT_TRUE(demand.IsMet(std::numeric_limits<double>::max()));
  EXPECT_EQ(demand.Error(kUnknown).value, 0);
  EXPECT_EQ(demand.ExactError(kUnknown), Rational(0));
}

// Neither is a double: the nearest one is above 0.1, and below 0.3.
TEST(JitterDemand, ComparesTheDoubleWithWhatWasAskedExactly) {
  ASSERT_GT(Rational::FromDouble(0.1), Rational(1, 10));
  EXPECT_FALSE(DemandOf({Rational(1, 10)}).IsMet(0.1));
  EXPECT_TRUE(DemandOf({Rational(1, 10)}).IsMet(std::nextafter(0.1, 0)));
  ASSERT_LT(Rational::FromDouble(0.3), Rational(3, 10));
  EXPECT_TRUE(DemandOf({Rational(3, 10)}).IsMet(0.3));
  EXPECT_FALSE(DemandOf({Rational(3, 10)}).IsMet(std::nextafter(0.3, 1)));
  EXPECT_FALSE(DemandOf({exactly::JustBelow(1)}).IsMet(1));
  EXPECT_TRUE(DemandOf({exactly::JustAbove(1)}).IsMet(1));
}

// The unit of 0 is 1 ps.
TEST(JitterDemand, OfSeveralTheSmallestCounts) {
  for (const std::vector<Rational>& allowed :
       std::vector<std::vector<Rational>>{{0, 200, Rational(1, 2)}, {Rational(1, 2), 200, 0}}) {
    const JitterDemand demand = DemandOf(allowed);
    EXPECT_TRUE(demand.IsMet(0));
    EXPECT_FALSE(demand.IsMet(0.25));
    EXPECT_EQ(demand.ExactError(3), Rational(6));
  }
  EXPECT_EQ(DemandOf({0, 200}).ExactError(3), Rational(3));
  EXPECT_EQ(DemandOf({200, 100}).ExactError(50), Rational(1, 2));
  EXPECT_TRUE(DemandOf({100, 200}).IsMet(100));
  EXPECT_FALSE(DemandOf({100, 200}).IsMet(101));
}

TEST(JitterDemand, IsWhatExactNumbersSay) {
  compare::Random random(1);
  for (int i = 0; i < 2000; ++i) {
    const double jitter = random.Real(0, 300);
    std::vector<Rational> allowed;
    for (int n = random.Int(1, 3); n > 0; --n) {
      Rational one(random.Int(0, 300'000), 1000);
      if (random.OneIn(3)) one = exactly::Nudged(random, Rational::FromDouble(jitter));
      allowed.push_back(one);
    }
    bool is_met = true;
    Rational error = 0;
    for (const Rational& one : allowed) {
      is_met = is_met && Rational::FromDouble(jitter) <= one;
      error =
          std::max(error, Rational::FromDouble(jitter) / (one == Rational(0) ? Rational(1) : one));
    }
    const JitterDemand demand = DemandOf(allowed);
    ASSERT_EQ(demand.IsMet(jitter), is_met) << i;
    ASSERT_EQ(demand.ExactError(jitter), error) << i;
    ASSERT_TRUE(Holds(demand.Error(jitter), error)) << i;
  }
}

}  // namespace
}  // namespace planner::search
