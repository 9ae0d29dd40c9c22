// The order of settings, and trade-offs, by hand.
#include "planner/verify/Ranking.h"

#include <gtest/gtest.h>

namespace planner::verify {

namespace {

Ranked Of(int rank_class, Rational error, double jitter, int d = 1) {
  LoopSettings set;
  set.d = d;
  return {set, {.rank_class = rank_class, .worst_error = error, .jitter = jitter, .margin = 1,
                .vco = 1000}};
}

Request By(Rank rank) {
  Request request;
  request.rank = rank;
  return request;
}

TEST(Ranking, ClassesComeFirst) {
  EXPECT_TRUE(IsBefore(By(Rank::kJitter), Of(0, 1, 200), Of(1, 0, 100)));
  EXPECT_TRUE(IsBefore(By(Rank::kJitter), Of(1, 9, 200), Of(2, 0, 100)));
}

TEST(Ranking, TheRequestSaysWhatCountsInTheFirstClass) {
  const Ranked calm = Of(0, 1, 100);
  const Ranked exact = Of(0, 0, 200);
  EXPECT_TRUE(IsBefore(By(Rank::kJitter), calm, exact));
  EXPECT_TRUE(IsBefore(By(Rank::kError), exact, calm));
  // In the others it is always the error.
  EXPECT_TRUE(IsBefore(By(Rank::kJitter), Of(1, 0, 200), Of(1, 1, 100)));
  Ranked far = calm;
  far.figures.jitter = 300;
  far.figures.margin = 2;
  EXPECT_TRUE(IsBefore(By(Rank::kMargin), far, calm));
  EXPECT_FALSE(IsBefore(By(Rank::kJitter), far, calm));
  Ranked fast = far;
  fast.figures.vco = 1001;
  EXPECT_TRUE(IsBefore(By(Rank::kVco), far, fast));
  Request fastest = By(Rank::kVco);
  fastest.prefer_max_vco = true;
  EXPECT_TRUE(IsBefore(fastest, fast, far));
}

TEST(Ranking, AnUnknownJitterIsBehindAllOthers) {
  EXPECT_TRUE(IsBefore(By(Rank::kJitter), Of(0, 1, 1e9), Of(0, 0, kNoJitter)));
}

TEST(Ranking, WhatIsEqualGoesByTheSettings) {
  EXPECT_TRUE(IsBefore(By(Rank::kJitter), Of(0, 0, 1, 1), Of(0, 0, 1, 2)));
  EXPECT_FALSE(IsBefore(By(Rank::kJitter), Of(0, 0, 1, 2), Of(0, 0, 1, 2)));
  LoopSettings low{.bandwidth = Bandwidth::kLow, .m = 8, .d = 1, .outputs = {}};
  LoopSettings usual{.bandwidth = Bandwidth::kOptimized, .m = 16, .d = 2, .outputs = {}};
  EXPECT_LT(Numbers(usual), Numbers(low));
  KruSettings connected{.feedback = true, .pins = {}};
  KruSettings halved{.divide_by_2 = true, .m = 5, .d = 9, .pins = {}};
  EXPECT_LT(Numbers(halved), Numbers(connected));
  EXPECT_LT(Numbers(low), Numbers(halved));
}

TEST(Ranking, TradeoffsHaveLessJitterForALargerError) {
  const Request request = By(Rank::kJitter);
  Tradeoffs tradeoffs(request);
  tradeoffs.Add(Of(1, 0, 1));
  tradeoffs.Add(Of(0, 2, 100, 2));   // the first class alone counts
  tradeoffs.Add(Of(0, 1, 200));
  tradeoffs.Add(Of(0, 2, 100, 1));   // the same, and before it
  tradeoffs.Add(Of(0, 2, 100, 3));   // the same, and behind it
  tradeoffs.Add(Of(0, 3, 100));      // with a larger error only
  tradeoffs.Add(Of(0, Rational(3, 2), 250));  // worse in both
  tradeoffs.Add(Of(0, 4, 50));
  ASSERT_EQ(tradeoffs.All().size(), 3u);
  EXPECT_EQ(tradeoffs.All()[0].figures.worst_error, Rational(1));
  EXPECT_EQ(tradeoffs.All()[1].figures.worst_error, Rational(2));
  EXPECT_EQ(Numbers(tradeoffs.All()[1].settings)[2], 1);
  EXPECT_EQ(tradeoffs.All()[2].figures.worst_error, Rational(4));
  // Better than all of them in both.
  tradeoffs.Add(Of(0, 0, 10));
  EXPECT_EQ(tradeoffs.All().size(), 1u);
}

TEST(Ranking, BehindIsOnlyWhatIsWorseForCertain) {
  const Request request = By(Rank::kJitter);
  Tradeoffs tradeoffs(request);
  EXPECT_FALSE(tradeoffs.IsBehind(1, 5, 5, 1e-9));
  tradeoffs.Add(Of(0, 1, 100));
  EXPECT_TRUE(tradeoffs.IsBehind(1, 0, 0, 1e-9));
  EXPECT_TRUE(tradeoffs.IsBehind(0, 2, 100, 1e-9));
  EXPECT_FALSE(tradeoffs.IsBehind(0, 1 + 1e-10, 100, 1e-9));
  EXPECT_FALSE(tradeoffs.IsBehind(0, 2, 99, 1e-9));
}

}  // namespace

}  // namespace planner::verify
