// Tests of the errors of frequencies that are quotients of the input.
#include <gtest/gtest.h>

#include <algorithm>

#include "exactly.h"
#include "planner/search/FrequencyDemand.h"
#include "tests/compare/Random.h"

namespace planner::search {
namespace {

using exactly::Holds;

Request RequestOf(const Rational& input, const Rational& asked, const Rational& tolerance) {
  Request request;
  request.inputs = {input};
  request.tolerance = tolerance;
  Output output;
  output.frequency = asked;
  request.outputs.push_back(output);
  return request;
}

FrequencyDemand DemandOf(const Request& request) {
  return FrequencyDemand(request, request.outputs[0]);
}

// |input x a / b - asked| / asked, in ppm.
Rational PlainPpm(const Request& request, std::int64_t a, std::int64_t b) {
  const Rational& asked = request.outputs[0].frequency;
  return (request.inputs[0] * a / b - asked).Absolute() / asked * 1'000'000;
}

Rational UnitOf(const Request& request) {
  return request.tolerance > 0 ? request.tolerance : Rational(100);
}

// 100 MHz x 3 / 10 is 30: of 29.997 MHz 0.003 / 29.997, which is 100.01 ppm.
TEST(FrequencyDemand, IsMetUpToTheTolerance) {
  const Rational ppm = Rational(1'000'000) * 3 / 29997;
  for (const Rational& asked : {Rational(29997, 1000), Rational(29997, 1000) * 2}) {
    const Rational input = asked > 30 ? 200 : 100;
    EXPECT_TRUE(DemandOf(RequestOf(input, asked, ppm)).IsMet(3, 10));
    EXPECT_FALSE(DemandOf(RequestOf(input, asked, exactly::JustBelow(ppm))).IsMet(3, 10));
    EXPECT_TRUE(DemandOf(RequestOf(input, asked, exactly::JustAbove(ppm))).IsMet(3, 10));
    EXPECT_EQ(DemandOf(RequestOf(input, asked, ppm)).Ppm(3, 10), ppm);
  }
}

TEST(FrequencyDemand, WithoutToleranceOnlyTheFrequencyItselfDoes) {
  const FrequencyDemand demand = DemandOf(RequestOf(100, 30, 0));
  EXPECT_TRUE(demand.IsMet(3, 10));
  EXPECT_EQ(demand.Error(3, 10).value, 0);
  EXPECT_FALSE(demand.IsMet(kLargestRatioPart * 3 / 10, kLargestRatioPart));
  const FrequencyDemand wide = DemandOf(RequestOf(100, exactly::JustAbove(30), 0));
  EXPECT_FALSE(wide.IsMet(3, 10));
  const FrequencyDemand exact =
      DemandOf(RequestOf(exactly::JustAbove(30), exactly::JustAbove(30), 0));
  EXPECT_TRUE(exact.IsMet(7, 7));
}

// The unit of a tolerance of 0 is 100 ppm, and 60 MHz in place of 30 are a million.
TEST(FrequencyDemand, IsCountedInUnits) {
  EXPECT_TRUE(Holds(DemandOf(RequestOf(100, 30, 0)).Error(6, 10), 10'000));
  EXPECT_TRUE(Holds(DemandOf(RequestOf(100, 30, 50)).Error(6, 10), 20'000));
  EXPECT_TRUE(Holds(DemandOf(RequestOf(100, 30, 50)).Error(3, 20), 10'000));
}

TEST(FrequencyDemand, AnOutputsOwnToleranceCounts) {
  Request request = RequestOf(100, 30, 50);
  request.outputs[0].tolerance = 2'000'000;
  EXPECT_TRUE(DemandOf(request).IsMet(6, 10));
  EXPECT_TRUE(Holds(DemandOf(request).Error(6, 10), Rational(1, 2)));
}

TEST(FrequencyDemand, IsNotComparedInOtherUnitsOrBeyondWords) {
  const FrequencyDemand one = DemandOf(RequestOf(100, 30, 50));
  EXPECT_EQ(FrequencyDemand::Compare(one, 3, 10, one, 6, 20), std::strong_ordering::equal);
  EXPECT_EQ(FrequencyDemand::Compare(one, 3, 10, one, 3, 11), std::strong_ordering::less);
  const FrequencyDemand other = DemandOf(RequestOf(100, 30, 51));
  EXPECT_EQ(FrequencyDemand::Compare(one, 3, 10, other, 3, 10), std::nullopt);
  const FrequencyDemand wide = DemandOf(RequestOf(100, exactly::JustAbove(30), 50));
  EXPECT_EQ(FrequencyDemand::Compare(one, 3, 10, wide, 3, 10), std::nullopt);
  EXPECT_EQ(FrequencyDemand::Compare(wide, 3, 10, one, 3, 10), std::nullopt);
}

TEST(FrequencyDemand, IsWhatExactNumbersSay) {
  compare::Random random(1);
  const auto part = [&random] {
    return std::int64_t{random.Int(1, random.OneIn(2) ? 1000 : 1 << 24)};
  };
  const std::vector<Rational> tolerances = {0, Rational(1, 1000), 50, 100, 100'000};
  int met = 0;
  int compared = 0;
  for (int i = 0; i < 2000; ++i) {
    const std::int64_t a = part();
    const std::int64_t b = part();
    const Rational input(random.Int(1, random.OneIn(2) ? 1000 : 1 << 30), part());
    // What the ratio makes, something near to it, or anything.
    const int kind = random.Int(0, 2);
    Rational asked = input * a / b;
    if (kind == 1) asked = asked * (1'000'000 + random.Int(-200, 200)) / 1'000'000;
    if (kind == 2) asked = Rational(random.Int(1, 1 << 30), part());
    asked = exactly::Nudged(random, asked);
    Request request = RequestOf(input, asked, random.Pick(tolerances));
    if (random.OneIn(3)) request.tolerance = exactly::Nudged(random, PlainPpm(request, a, b));
    request.tolerance = std::max(request.tolerance, Rational(0));
    const FrequencyDemand demand = DemandOf(request);
    const Rational ppm = PlainPpm(request, a, b);
    ASSERT_EQ(demand.Ppm(a, b), ppm);
    ASSERT_EQ(demand.IsMet(a, b), ppm <= request.tolerance) << i;
    ASSERT_TRUE(Holds(demand.Error(a, b), ppm / UnitOf(request))) << i;
    const double quotient =
        static_cast<double>(a) / static_cast<double>(b) * demand.InputPerAsked();
    ASSERT_TRUE(Holds({demand.QuickError(quotient), demand.Slack() * (1 + quotient)},
                      ppm / UnitOf(request)))
        << i;
    met += ppm <= request.tolerance ? 1 : 0;
    // Of a ratio beside it.
    const std::int64_t other_a = std::max<std::int64_t>(a - random.Int(0, 1), 1);
    const auto order = FrequencyDemand::Compare(demand, a, b, demand, other_a, b);
    if (!order) continue;
    ++compared;
    ASSERT_EQ(*order, ppm <=> PlainPpm(request, other_a, b)) << i;
  }
  EXPECT_GT(met, 500);
  EXPECT_GT(compared, 500);
}

}  // namespace
}  // namespace planner::search
