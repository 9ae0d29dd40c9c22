#include <gtest/gtest.h>

#include "made.h"
#include "planner/report/FrontText.h"

namespace planner::report {
namespace {

// 148.502994 MHz from 100 MHz: M and dividers in eighths, with errors of 13.40 and 30.09 ppm.
plan::Plan Made() {
  plan::Plan plan;
  plan.request = MadeRequest({100}, {Rational(148502994, 1000000)});
  plan.front = {MadeLoop(plan.request, Primitive::kTsyn, Bandwidth::kHigh, 447, 7, {43}, 198.526),
                MadeLoop(plan.request, Primitive::kTsyn, Bandwidth::kHigh, 199, 2, {67}, 100.565)};
  plan.ranked = {plan.front[1], plan.front[0]};
  return plan;
}

TEST(FrontText, ByJitterTheBestIsFirstAndSmallerErrorsFollow) {
  EXPECT_EQ(FrontText(Made(), 6, {}),
            "trade-offs, a smaller error for more jitter:\n"
            "primitive  loop       M  D  worst ppm  jitter ps  dividers  mark\n"
            "TSYN       HIGH  24.875  2      30.09    100.565  8.375     best\n"
            "TSYN       HIGH  55.875  7      13.40    198.526  5.375\n");
}

TEST(FrontText, ByErrorLessJitterFollows) {
  plan::Plan plan = Made();
  plan.request.rank = Rank::kError;
  plan.ranked = {plan.front[0]};
  EXPECT_EQ(FrontText(plan, 6, {}),
            "trade-offs, less jitter for a larger error:\n"
            "primitive  loop       M  D  worst ppm  jitter ps  dividers  mark\n"
            "TSYN       HIGH  55.875  7      13.40    198.526  5.375     best\n"
            "TSYN       HIGH  24.875  2      30.09    100.565  8.375\n");
}

TEST(FrontText, SomeOfThem) {
  EXPECT_EQ(FrontText(Made(), 1, {}),
            "trade-offs, a smaller error for more jitter:\n"
            "primitive  loop       M  D  worst ppm  jitter ps  dividers  mark\n"
            "TSYN       HIGH  24.875  2      30.09    100.565  8.375     best\n"
            "and 1 more; --front 2 shows all\n");
  EXPECT_EQ(FrontText(Made(), 0, {}), "");
}

TEST(FrontText, WhatLooksTheSameIsNotThereTwice) {
  plan::Plan plan = Made();
  // Less by what three decimals do not show.
  Answer twin = plan.front[1];
  twin.max_jitter = 100.5649999;
  twin.worst_ppm += Rational(1, 1000000);
  plan.front.push_back(twin);
  EXPECT_EQ(Tradeoffs(plan).size(), 2U);
  plan.front.back().max_jitter = 100.563;
  EXPECT_EQ(Tradeoffs(plan).size(), 3U);
}

TEST(FrontText, WhatIsNowhereNearIsNoTrade) {
  plan::Plan plan = Made();
  for (Answer& answer : plan.front) answer.within = false;
  plan.front[1].worst_ppm = 100001;
  EXPECT_EQ(Tradeoffs(plan).size(), 1U);
  plan.front[1].worst_ppm = 100000;
  EXPECT_EQ(Tradeoffs(plan).size(), 2U);
  // The first is shown whatever it is.
  plan.front[0].worst_ppm = 900000;
  plan.front[1].worst_ppm = 900001;
  ASSERT_EQ(Tradeoffs(plan).size(), 1U);
  EXPECT_EQ(Tradeoffs(plan)[0], &plan.front[0]);
}

TEST(FrontText, NoTradeoffs) {
  plan::Plan plan = Made();
  plan.front.resize(1);
  EXPECT_EQ(FrontText(plan, 6, {}), "trade-offs: none, no other setting has a smaller error\n");
  plan.request.rank = Rank::kVco;
  EXPECT_EQ(FrontText(plan, 6, {}), "trade-offs: none, no other setting has less jitter\n");
  plan.front[0].max_jitter.reset();
  EXPECT_EQ(FrontText(plan, 6, {}), "trade-offs: none, as the jitter is not known\n");
}

TEST(FrontText, ErrorsOfPhasesAreCountedInTolerances) {
  plan::Plan plan = Made();
  plan.request.outputs[0].phase = 10;
  plan.front[0].worst_error = Rational(1, 5);
  plan.front[1].worst_error = Rational(3, 4);
  EXPECT_EQ(FrontText(plan, 6, {}),
            "trade-offs, a smaller error for more jitter:\n"
            "primitive  loop       M  D  worst ppm  of tolerance  jitter ps  dividers  mark\n"
            "TSYN       HIGH  24.875  2      30.09          0.75    100.565  8.375     best\n"
            "TSYN       HIGH  55.875  7      13.40          0.20    198.526  5.375\n");
}

TEST(FrontText, PinsOfAKru) {
  plan::Plan plan = Made();
  plan.request = MadeRequest({100}, {100});
  plan.front = {MadeKru(plan.request, {.pins = {Pin::kClk0}}, {1}, 180),
                MadeLoop(plan.request, Primitive::kPll, Bandwidth::kLow, 80, 1, {80}, 170)};
  plan.ranked = {plan.front[1]};
  EXPECT_EQ(FrontText(plan, 6, {}),
            "trade-offs, a smaller error for more jitter:\n"
            "primitive  loop   M  D  worst ppm  jitter ps  dividers or pins  mark\n"
            "PLL        LOW   10  1       0.00    170.000  10                best\n"
            "KRU_SP     -      -  -       0.00    180.000  CLK0\n");
}

TEST(FrontText, ManyDividersLeaveNoRoomForTheMark) {
  const std::string text = FrontText(Made(), 6, {.width = 60});
  EXPECT_EQ(text.find("mark"), std::string::npos);
  EXPECT_NE(text.find("8.375\n"), std::string::npos);
}

}  // namespace
}  // namespace planner::report
