#include "planner/report/Why.h"

#include <gtest/gtest.h>

#include "made.h"

namespace planner::report {
namespace {

using answer::Criterion;

// A TSYN with 128.815 ps and a PLL with 144.594 ps, both exact.
plan::Plan Met() {
  plan::Plan plan;
  plan.request = VideoRequest();
  Answer tsyn = VideoAnswer(plan.request);
  Answer pll =
      MadeLoop(plan.request, Primitive::kPll, Bandwidth::kHigh, 264, 1, {48, 96, 264}, 144.594);
  Answer low = VideoAnswer(plan.request);
  std::get<LoopSettings>(low.settings).bandwidth = Bandwidth::kLow;
  low.max_jitter = 160.5;
  plan.ranked = {tsyn, pll, low};
  plan.among_primitives = {{0, 1, Criterion::kJitter}};
  plan.among_own = plan::Reason{0, 2, Criterion::kJitter};
  return plan;
}

std::string Why(const plan::Plan& plan) { return WhyText(plan, MadeDevice()); }

TEST(Why, TheLeastJitterOfTwoPrimitives) {
  EXPECT_EQ(Why(Met()),
            "of TSYN and PLL, whose outputs are all within 100 ppm, TSYN has the least jitter, "
            "128.815 ps; the PLL has 144.594 ps. Of the settings of the TSYN, these have the least "
            "jitter, 128.815 ps; the next has 160.500 ps.");
}

TEST(Why, ExactFrequenciesAndTolerancesOfOutputs) {
  plan::Plan plan = Met();
  plan.among_own.reset();
  plan.request.tolerance = 0;
  EXPECT_EQ(Why(plan),
            "of TSYN and PLL, whose outputs all have exact frequencies, TSYN has the least jitter, "
            "128.815 ps; the PLL has 144.594 ps.");
  plan.request.outputs[1].tolerance = 3;
  EXPECT_EQ(Why(plan),
            "of TSYN and PLL, whose outputs are all within their tolerances, TSYN has the least "
            "jitter, 128.815 ps; the PLL has 144.594 ps.");
}

TEST(Why, WhatDecidesIsNamed) {
  plan::Plan plan = Met();
  plan.among_own.reset();
  const auto why = [&](Rank rank, Criterion decided) {
    plan.request.rank = rank;
    plan.among_primitives[0].decided = decided;
    const std::string text = Why(plan);
    return text.substr(text.find(", TSYN ") + 2);
  };
  plan.ranked[0].worst_ppm = 1;
  plan.ranked[1].worst_ppm = Rational(5, 2);
  plan.ranked[0].margin = Rational(1, 8);
  plan.ranked[1].margin = Rational(1, 40);
  EXPECT_EQ(why(Rank::kError, Criterion::kWorstError),
            "TSYN has the smallest error, 1.00 ppm; the PLL has 2.50 ppm.");
  EXPECT_EQ(why(Rank::kJitter, Criterion::kWorstError),
            "TSYN with the same jitter has the smallest error, 1.00 ppm; the PLL has 2.50 ppm.");
  EXPECT_EQ(why(Rank::kMargin, Criterion::kMargin),
            "TSYN has the largest margin to the device's limits, 12.50 %; the PLL has 2.50 %.");
  EXPECT_EQ(why(Rank::kVco, Criterion::kVco), "TSYN has the lowest VCO, 1188 MHz.");
  EXPECT_EQ(why(Rank::kError, Criterion::kJitter),
            "TSYN with the same error has the least jitter, 128.815 ps; the PLL has 144.594 ps.");
  EXPECT_EQ(why(Rank::kJitter, Criterion::kKnownJitter),
            "TSYN has a jitter that is known, 128.815 ps.");
  EXPECT_EQ(why(Rank::kJitter, Criterion::kPrimitive),
            "TSYN comes first, with all that counts the same.");
  EXPECT_EQ(why(Rank::kVco, Criterion::kJitter),
            "TSYN with the same VCO has the least jitter, 128.815 ps; the PLL has 144.594 ps.");
  plan.request.prefer_max_vco = true;
  EXPECT_EQ(why(Rank::kMargin, Criterion::kVco),
            "TSYN with the same margin has the highest VCO, 1188 MHz.");
}

TEST(Why, ErrorsOfDifferentKindsAreCountedInTolerances) {
  plan::Plan plan = Met();
  plan.among_own.reset();
  plan.request.rank = Rank::kError;
  plan.request.outputs[0].phase = 90;
  plan.ranked[0].worst_error = Rational(1, 4);
  plan.ranked[1].worst_error = Rational(4, 5);
  plan.among_primitives[0].decided = Criterion::kWorstError;
  EXPECT_EQ(Why(plan),
            "of TSYN and PLL, whose outputs are all within 100 ppm, TSYN has the smallest error, "
            "0.25 times its tolerance; the PLL has 0.80 times its tolerance.");
}

TEST(Why, TheOnlyPrimitive) {
  plan::Plan plan = Met();
  plan.among_own.reset();
  plan.ranked.resize(1);
  plan.among_primitives.clear();
  EXPECT_EQ(Why(plan), "all outputs of the TSYN are within 100 ppm.");
  plan.refused = {Refused(Primitive::kPll, "No.")};
  EXPECT_EQ(Why(plan), "TSYN is the only primitive whose outputs are all within 100 ppm.");
}

TEST(Why, OthersAreAsNearButNotAsAskedFor) {
  plan::Plan plan = Met();
  plan.among_own.reset();
  plan.among_primitives[0].decided = Criterion::kClass;
  Miss(&plan.ranked[1], 0, Quantity::kFrequency, 900, 100);
  EXPECT_EQ(Why(plan), "TSYN is the only primitive whose outputs are all within 100 ppm.");
  plan.ranked[1].outputs[0].misses.clear();
  Break(&plan.ranked[1], Outside(Quantity::kFrequency, 0, 0, 700, {3, 400}));
  EXPECT_EQ(Why(plan),
            "TSYN is the only primitive with everything as asked for and in the device's range.");
  // It need not be the best of the other primitive.
  Answer worse = plan.ranked[1];
  plan.ranked[1].violations.clear();
  Miss(&plan.ranked[1], 0, Quantity::kFrequency, 900, 100);
  EXPECT_EQ(Why(plan), "TSYN is the only primitive whose outputs are all within 100 ppm.");
  plan.ranked.push_back(worse);
  EXPECT_EQ(Why(plan),
            "TSYN is the only primitive with everything as asked for and in the device's range.");
}

TEST(Why, SettingsThatOnlyTheEngineWasAskedFor) {
  plan::Plan plan = Met();
  for (Answer& answer : plan.ranked) answer.source = {.engine = true, .search = false};
  EXPECT_NE(
      Why(plan).find(". Of the settings of the TSYN that the engine answers, these have the "),
      std::string::npos);
}

// 333.333333 is 1001.00 ppm more than 333.
plan::Plan Missed() {
  plan::Plan plan;
  plan.request = MadeRequest({100}, {333});
  plan.ranked = {MadeLoop(plan.request, Primitive::kPll, Bandwidth::kHigh, 80, 1, {24}, 100),
                 MadeLoop(plan.request, Primitive::kTsyn, Bandwidth::kHigh, 80, 1, {24}, 110)};
  for (Answer& answer : plan.ranked) {
    Miss(&answer, 0, Quantity::kFrequency, answer.outputs[0].error_ppm, 100);
  }
  plan.among_primitives = {{0, 1, Criterion::kWorstError}};
  return plan;
}

TEST(Why, NothingIsAsAskedFor) {
  plan::Plan plan = Missed();
  EXPECT_EQ(Why(plan),
            "nothing is as asked for; of all settings in the device's range those of the PLL come "
            "nearest: output 0: the frequency is off by 1001.00 ppm, with 100 allowed.");
  plan.among_primitives[0].decided = Criterion::kJitter;
  EXPECT_EQ(Why(plan),
            "nothing is as asked for; of all settings in the device's range those of PLL and TSYN "
            "come equally near, and the PLL with the same error has the least jitter, 100.000 ps; "
            "the TSYN has 110.000 ps.");
  plan.ranked[0].source = {.engine = true, .search = false};
  plan.among_primitives[0].decided = Criterion::kPrimitive;
  EXPECT_EQ(Why(plan),
            "nothing is as asked for; of all that the engine answers those of PLL and TSYN come "
            "equally near, and the PLL comes first, with all that counts the same.");
}

TEST(Why, NothingIsNear) {
  plan::Plan plan = Missed();
  plan.ranked[0].worst_ppm = 100001;
  EXPECT_NE(
      Why(plan).find("with 100 allowed. No setting comes near what is asked for; explain tells "
                     "why."),
      std::string::npos);
}

TEST(Why, NothingIsInTheDevicesRange) {
  plan::Plan plan = Missed();
  Break(&plan.ranked[0], Outside(Quantity::kFrequency, 0, 0, 700, {3, 400}));
  EXPECT_EQ(
      Why(plan),
      "nothing is as asked for and in the device's range: with the PLL, output 0 is at 700 "
      "MHz, outside the device's range of 3 to 400 MHz. What is out of range ranks behind all "
      "that is only off.");
  Break(&plan.ranked[0], Outside(Quantity::kVco, -1, 0, 1400, {400, 1080}));
  EXPECT_NE(Why(plan).find("of 3 to 400 MHz (1 more such note is above). What"), std::string::npos);
}

TEST(Why, TheOrderInWords) {
  Request request;
  EXPECT_EQ(OrderWords(request), "least jitter, then smallest error, then lowest VCO");
  request.rank = Rank::kError;
  EXPECT_EQ(OrderWords(request), "smallest error, then least jitter, then lowest VCO");
  request.rank = Rank::kMargin;
  EXPECT_EQ(OrderWords(request),
            "largest margin to the device's limits, then least jitter, then smallest error, then "
            "lowest VCO");
  request.rank = Rank::kVco;
  request.prefer_max_vco = true;
  EXPECT_EQ(OrderWords(request), "highest VCO, then least jitter, then smallest error");
}

TEST(Why, WhatAnAnswerLacks) {
  const plan::Plan plan = Met();
  const Answer& first = plan.ranked[0];
  Answer other = plan.ranked[1];
  const auto loss = [&](Criterion decided) {
    return LossText(plan.request, MadeDevice(), first, other, decided);
  };
  EXPECT_EQ(loss(Criterion::kJitter), "with 15.779 ps more jitter, 144.594 ps");
  EXPECT_EQ(loss(Criterion::kVco), "with a VCO of 891 MHz instead of 1188 MHz");
  EXPECT_EQ(loss(Criterion::kSettings), "as good in all that counts");
  EXPECT_EQ(loss(Criterion::kKnownJitter), "with a jitter that is not known");
  other.worst_ppm = 8000;
  EXPECT_EQ(loss(Criterion::kWorstError), "with an error of 8000.00 ppm instead of 0.00 ppm");
  other.margin = Rational(1, 10);
  EXPECT_EQ(loss(Criterion::kMargin), "with a margin of 10.00 % instead of 0.00 %");
  Miss(&other, 1, Quantity::kPhase, 7, Rational(1, 2));
  EXPECT_EQ(loss(Criterion::kClass),
            "but output 1: the phase is off by 7.00 degrees, with 0.5 allowed");
  Break(&other, Outside(Quantity::kVco, -1, 0, 1400, {400, 1080}));
  EXPECT_EQ(loss(Criterion::kClass),
            "but the VCO is at 1400 MHz, outside the device's range of 400 to 1080 MHz");
}

TEST(Why, TheSameInAFewWords) {
  const plan::Plan plan = Met();
  Answer other = plan.ranked[1];
  const auto cell = [&](Criterion decided) { return LossCell(plan.ranked[0], other, decided); };
  EXPECT_EQ(cell(Criterion::kJitter), "15.779 ps more");
  EXPECT_EQ(cell(Criterion::kVco), "lower VCO");
  EXPECT_EQ(cell(Criterion::kWorstError), "larger error");
  EXPECT_EQ(cell(Criterion::kMargin), "smaller margin");
  EXPECT_EQ(cell(Criterion::kKnownJitter), "jitter not known");
  EXPECT_EQ(cell(Criterion::kSettings), "as good");
  other.max_jitter = 128.8150001;
  EXPECT_EQ(cell(Criterion::kJitter), "the same jitter");
}

}  // namespace
}  // namespace planner::report
