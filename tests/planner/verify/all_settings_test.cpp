// All settings, tried one by one, against the search: two programs that share nothing but the
// formulas of the hardware have to find the same.
#include "planner/verify/AllSettings.h"

#include <gtest/gtest.h>

#include "../search/drawn.h"
#include "planner/search/Search.h"
#include "tests/planner/primitive_names.h"

namespace planner::verify {

namespace {

using compare::Random;

void ExpectSame(const Request& request, const planner::Device& device, Primitive primitive) {
  const search::Found found = search::Search(request, device, primitive);
  const BestSettings best = BestOf(request, device, primitive);
  std::vector<Settings> own;
  for (const auto& one : best.OfKinds()) {
    if (one) own.push_back(one->settings);
  }
  ASSERT_EQ(own.size(), found.best.size()) << drawn::TextOf(request);
  for (std::size_t i = 0; i < own.size(); ++i) {
    EXPECT_EQ(own[i], found.best[i].settings) << drawn::TextOf(request) << " best " << i;
  }
  ASSERT_EQ(best.AllTradeoffs().size(), found.front.size()) << drawn::TextOf(request);
  for (std::size_t i = 0; i < found.front.size(); ++i) {
    EXPECT_EQ(best.AllTradeoffs()[i].settings, found.front[i].settings)
        << drawn::TextOf(request) << " trade-off " << i;
    EXPECT_EQ(best.AllTradeoffs()[i].figures.worst_error, found.front[i].worst_error);
  }
}

class AllSettings : public testing::TestWithParam<Primitive> {};

TEST_P(AllSettings, OfDrawnDevices) {
  Random random(hardware::IsLoop(GetParam()) ? 71 : 72);
  const int count = hardware::IsLoop(GetParam()) ? 40 : 6;
  for (int i = 0; i < count; ++i) {
    const auto input = drawn::Input(random);
    const planner::Device device = drawn::SmallDevice(random, GetParam(), input);
    ExpectSame(drawn::RequestFor(random, device, GetParam(), input, 4), device, GetParam());
  }
}

// --- What is left out early -------------------------------------------------------------------

Ranked RankedWith(int rank_class, const Rational& error, double jitter, const Rational& margin) {
  KruSettings set{.pins = {hardware::Pin::kClk0}};
  return {set, {.rank_class = rank_class, .worst_error = error, .jitter = jitter,
                .margin = margin, .vco = 0}};
}

// Both have a larger error than the one that is there and no less jitter; but it is the jitter
// that is ranked by, and another kind has made the trade-off with 80 ps.
TEST(BestSettings, BehindByJitter) {
  for (const Rank rank : {Rank::kJitter, Rank::kVco}) {
    Request request;
    request.rank = rank;
    BestSettings best(request);
    best.Add(0, RankedWith(0, 2, 100, 0));
    EXPECT_TRUE(best.IsBehind(0, 0, 3, 101, 0));
    EXPECT_TRUE(best.IsBehind(0, 0, 3, 100, 0));
    EXPECT_FALSE(best.IsBehind(0, 0, 2, 100, 0));
    EXPECT_FALSE(best.IsBehind(0, 0, 3, 99, 0));
    EXPECT_FALSE(best.IsBehind(1, 0, 3, 101, 0));
    best.Add(1, RankedWith(0, 1, 80, 0));
    EXPECT_FALSE(best.IsBehind(0, 0, 3, 99, 0));
    // Behind the trade-off; of the kind it is the best jitter's equal, and no larger error.
    EXPECT_FALSE(best.IsBehind(0, 0, 2, 100, 0));
    EXPECT_TRUE(best.IsBehind(0, 0, 2, 101, 0));
  }
}

TEST(BestSettings, BehindByMargin) {
  Request request;
  request.rank = Rank::kMargin;
  BestSettings best(request);
  best.Add(0, RankedWith(0, 2, 100, Rational(1, 2)));
  EXPECT_TRUE(best.IsBehind(0, 0, 3, 100, 0.4));
  EXPECT_FALSE(best.IsBehind(0, 0, 3, 100, 0.5));
  EXPECT_FALSE(best.IsBehind(0, 0, 3, 100, 0.6));
  // With no larger error, or less jitter, it could be a trade-off.
  EXPECT_FALSE(best.IsBehind(0, 0, 2, 100, 0.4));
  EXPECT_FALSE(best.IsBehind(0, 0, 3, 99, 0.4));
}

TEST(BestSettings, BehindByClassExactly) {
  const Request request;
  BestSettings best(request);
  best.Add(0, RankedWith(1, 2, 100, 0));
  // One that meets all could be the best; one that does not is compared.
  EXPECT_FALSE(best.IsBehind(0, RankedWith(0, 3, 200, 0)));
  EXPECT_FALSE(best.IsBehind(0, RankedWith(1, 1, 200, 0)));
  EXPECT_TRUE(best.IsBehind(0, RankedWith(1, 3, 200, 0)));
  best.Add(0, RankedWith(0, 5, 300, 0));
  // Behind in the class, with whatever error and jitter.
  EXPECT_TRUE(best.IsBehind(0, RankedWith(1, 1, 10, 9)));
  EXPECT_FALSE(best.IsBehind(1, RankedWith(1, 1, 10, 9)));
}

INSTANTIATE_TEST_SUITE_P(Of, AllSettings, testing::ValuesIn(hardware::kPrimitives),
                         [](const auto& one) { return std::string(Name(one.param)); });

}  // namespace

}  // namespace planner::verify
