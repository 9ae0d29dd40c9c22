#include <gtest/gtest.h>

#include "made.h"
#include "planner/report/PlanText.h"
#include "planner/report/ReportText.h"

namespace planner::report {
namespace {

using answer::Criterion;

const Calls kCalls = {"./vorkel explain", "./vorkel best", "./vorkel plan --pick N"};

// A TSYN that engine and search have, a PLL of the engine alone, and no KRU.
plan::Plan Made() {
  plan::Plan plan;
  plan.request = VideoRequest();
  Answer tsyn = VideoAnswer(plan.request);
  tsyn.source = {.engine = true, .search = true, .variant = "largest VCO"};
  Answer pll =
      MadeLoop(plan.request, Primitive::kPll, Bandwidth::kHigh, 264, 1, {48, 96, 264}, 144.594);
  pll.source = {.engine = true, .search = false, .variant = "largest VCO"};
  plan.ranked = {tsyn, pll};
  plan.front = {tsyn};
  plan.refused = {Refused(Primitive::kKruSp, "The KRU_SP cannot support this.")};
  plan.among_primitives = {{0, 1, Criterion::kJitter}};
  return plan;
}

TEST(PlanText, TheWholeOfIt) {
  const plan::Plan plan = Made();
  EXPECT_EQ(PlanText(plan, MadeDevice(), 1, {}, kCalls),
            ReportText(plan.request, MadeDevice(), plan.ranked[0], {}) +
                "\n"
                "primitive  source  loop  worst ppm  jitter ps  result\n"
                "TSYN       both    HIGH       0.00    128.815  best\n"
                "PLL        engine  HIGH       0.00    144.594  15.779 ps more\n"
                "KRU_SP     -       -             -          -  no configuration\n"
                "\n"
                "why: of TSYN and PLL, whose outputs are all within 100 ppm, TSYN has the least\n"
                "  jitter, 128.815 ps; the PLL has 144.594 ps.\n"
                "engine: the design flow's own search takes these settings: largest VCO,\n"
                "  bandwidth HIGH.\n"
                "jitter: peak to peak, at a bit error rate of 1e-12.\n"
                "KRU_SP: The KRU_SP cannot support this.\n"
                "hint: more on KRU_SP: ./vorkel explain\n"
                "hint: this is for an input clock without jitter; --input-jitter PS tells that\n"
                "  of yours, which can make another bandwidth the best\n");
}

// Of a plan that is made without the engine nothing is known of why.
TEST(PlanText, NothingOfTheEngine) {
  plan::Plan plan = Made();
  plan.ranked.resize(1);
  plan.among_primitives.clear();
  plan.ranked[0].source = {.engine = false, .search = true};
  const std::string text = PlanText(plan, MadeDevice(), 1, {}, kCalls);
  EXPECT_NE(text.find("\nengine: the design flow's own search has no answer to this.\n"),
            std::string::npos)
      << text;
  plan.engine_refused = {Refused(Primitive::kTsyn, "No VCO.")};
  const std::string why = PlanText(plan, MadeDevice(), 1, {}, kCalls);
  EXPECT_NE(why.find("has no answer to this; of the TSYN"), std::string::npos) << why;
  EXPECT_NE(why.find("No VCO.\n"), std::string::npos) << why;
}

TEST(BestText, SaysWhichTradeOffsAreLeftOut) {
  plan::Plan plan = Made();
  plan.front_cut = {Primitive::kTsyn};
  const std::string text = BestText(plan, MadeDevice(), 1, 10, {}, kCalls);
  EXPECT_NE(text.find("\nnote: the TSYN has more trade-offs than are kept; those with the larger "
                      "errors\n  are not there\n"),
            std::string::npos)
      << text;
}

TEST(PlanText, WhatTheEngineTakesInstead) {
  plan::Plan plan = Made();
  plan.ranked[0].source = {.engine = false, .search = true};
  const std::string text = PlanText(plan, MadeDevice(), 1, {}, kCalls);
  EXPECT_NE(text.find("engine: the design flow's own search does not take these settings; its "
                      "best\n"
                      "  answer, number 2 of compare, is a PLL with M 33, D 1 and dividers 6, 12 "
                      "and\n"
                      "  33, with 15.779 ps more jitter, 144.594 ps.\n"),
            std::string::npos)
      << text;
}

TEST(PlanText, TheEngineHasNothing) {
  plan::Plan plan = Made();
  plan.ranked[0].source = plan.ranked[1].source = {.engine = false, .search = true};
  plan.engine_refused = {Refused(Primitive::kTsyn, "Could not obtain a VCO.")};
  const std::string text = PlanText(plan, MadeDevice(), 1, {}, kCalls);
  EXPECT_NE(text.find("engine: the design flow's own search has no answer to this; of the TSYN it\n"
                      "  says: Could not obtain a VCO.\n"),
            std::string::npos)
      << text;
}

TEST(PlanText, OnlyTheEngineWasAsked) {
  plan::Plan plan = Made();
  plan.request.engine_only = true;
  EXPECT_EQ(PlanText(plan, MadeDevice(), 1, {}, kCalls).find("engine: "), std::string::npos);
}

TEST(PlanText, AnotherCandidate) {
  const plan::Plan plan = Made();
  const std::string text = PlanText(plan, MadeDevice(), 2, {}, kCalls);
  EXPECT_EQ(text.find("device        vk40b484-2 PLL\n"), 0U);
  EXPECT_NE(
      text.find("why: this is number 2 of 2; the best is a TSYN with M 44, D 1 and dividers "
                "8,\n"
                "  16 and 44, and this is behind it, with 15.779 ps more jitter, 144.594 ps.\n"),
      std::string::npos)
      << text;
}

TEST(PlanText, WhatIsOffHasItsHints) {
  plan::Plan plan = Made();
  Miss(&plan.ranked[0], 0, Quantity::kPhase, 9, 1);
  Miss(&plan.ranked[1], 0, Quantity::kFrequency, 900, 100);
  Break(&plan.ranked[1], Outside(Quantity::kVco, -1, 0, 1400, {400, 1080}));
  plan.among_primitives[0].decided = Criterion::kClass;
  const std::string text = PlanText(plan, MadeDevice(), 1, {}, kCalls);
  EXPECT_NE(text.find("128.815  best, but phase OFF\n"), std::string::npos) << text;
  EXPECT_NE(text.find("144.594  frequency and range OFF\n"), std::string::npos) << text;
  EXPECT_NE(text.find("hint: what stands in the way: ./vorkel explain\n"), std::string::npos);
  EXPECT_EQ(text.find("hint: more on"), std::string::npos);
}

TEST(PlanText, TradeoffsAreHintedAt) {
  plan::Plan plan = Made();
  Answer other = plan.ranked[0];
  other.max_jitter = 100;
  other.worst_ppm = 3;
  plan.front.push_back(other);
  EXPECT_NE(PlanText(plan, MadeDevice(), 1, {}, kCalls)
                .find("hint: trade-offs between error and jitter: ./vorkel best\n"),
            std::string::npos);
  // `best` has them.
  const std::string best = BestText(plan, MadeDevice(), 1, 6, {}, kCalls);
  EXPECT_EQ(best.find("hint: trade-offs"), std::string::npos);
  EXPECT_NE(best.find("1e-12.\n\ntrade-offs, a smaller error for more jitter:\n"),
            std::string::npos)
      << best;
}

TEST(PlanText, ASinglePrimitiveHasNoTableOfPrimitives) {
  plan::Plan plan = Made();
  plan.refused.clear();
  plan.among_primitives.clear();
  plan.ranked.resize(1);
  EXPECT_EQ(PlanText(plan, MadeDevice(), 1, {}, kCalls).find("result"), std::string::npos);
}

TEST(CompareText, AllCandidatesWithTheirNumbers) {
  plan::Plan plan = Made();
  plan.refused.clear();
  Miss(&plan.ranked[1], 0, Quantity::kPhase, 9, 1);
  EXPECT_EQ(CompareText(plan, MadeDevice(), {}, kCalls),
            "#  primitive  source  loop  VCO MHz  worst ppm  jitter ps  off\n"
            "1  TSYN       both    HIGH     1188       0.00    128.815\n"
            "2  PLL        engine  HIGH      891       0.00    144.594  phase OFF\n"
            "\n"
            "order: least jitter, then smallest error, then lowest VCO.\n"
            "Rows that are off are ranked by their worst error, counted in tolerances of\n"
            "  what was asked for.\n"
            "source: engine is what the design flow's own search answers; search is the\n"
            "  best of all settings that the device allows; both is the one as well as the\n"
            "  other.\n"
            "jitter: peak to peak, at a bit error rate of 1e-12.\n"
            "hint: the report on a row: ./vorkel plan --pick N\n"
            "hint: this is for an input clock without jitter; --input-jitter PS tells that\n"
            "  of yours, which can make another bandwidth the best\n");
}

TEST(CompareText, MarginsAreThereWhenTheyCount) {
  plan::Plan plan = Made();
  plan.request.rank = Rank::kMargin;
  plan.ranked[0].margin = Rational(1, 8);
  plan.ranked[1].margin = Rational(-1, 300);
  const std::string text = CompareText(plan, MadeDevice(), {}, kCalls);
  EXPECT_EQ(text.find("#  primitive  source  loop  VCO MHz  worst ppm  jitter ps  margin %  off\n"
                      "1  TSYN       both    HIGH     1188       0.00    128.815     12.50\n"
                      "2  PLL        engine  HIGH      891       0.00    144.594     -0.33\n"),
            0U)
      << text;
}

TEST(CompareText, RowsOutOfRangeAreTold) {
  plan::Plan plan = Made();
  Break(&plan.ranked[1], Outside(Quantity::kVco, -1, 0, 1400, {400, 1080}));
  const std::string text = CompareText(plan, MadeDevice(), {}, kCalls);
  EXPECT_NE(text.find("range OFF\n\n"
                      "order: least jitter, then smallest error, then lowest VCO.\n"
                      "Rows with something out of the device's range come after all "
                      "others.\nsource: "),
            std::string::npos)
      << text;
  EXPECT_NE(text.find("KRU_SP: The KRU_SP cannot support this.\n"), std::string::npos);
}

// The widest row there is.
TEST(CompareText, LinesFitATerminal) {
  plan::Plan plan = Made();
  plan.ranked.resize(12, plan.ranked[1]);
  Answer& wide = plan.ranked[11];
  std::get<LoopSettings>(wide.settings).bandwidth = Bandwidth::kOptimized;
  wide.vco = Rational(124375, 100);
  wide.worst_ppm = 999999;
  for (const Quantity quantity : {Quantity::kFrequency, Quantity::kPhase, Quantity::kDuty}) {
    Miss(&wide, 0, quantity, 999999, 1);
  }
  Answer kru =
      MadeKru(plan.request,
              {.primitive = Primitive::kKruClkgen, .pins = {Pin::kClkfx, Pin::kClkfx, Pin::kClkfx}},
              {1, 1, 1}, 9999.999);
  plan.ranked[10] = kru;
  const std::string text = CompareText(plan, MadeDevice(), {}, {});
  std::size_t begin = 0;
  while (begin < text.size()) {
    const std::size_t end = text.find('\n', begin);
    EXPECT_LE(end - begin, 80U) << text.substr(begin, end - begin);
    begin = end + 1;
  }
  EXPECT_NE(text.find("OFF: frequency, phase and duty of 12\n"), std::string::npos) << text;
}

TEST(UnsolvedText, NoPrimitiveHasSettings) {
  plan::Plan plan;
  plan.request = VideoRequest();
  plan.refused = {Refused(Primitive::kPll, "Could not."), Refused(Primitive::kKruSp, "Cannot.")};
  EXPECT_EQ(UnsolvedText(plan, MadeDevice(), {}, kCalls),
            "no primitive of vk40b484-2 has a configuration for this\n"
            "PLL: Could not.\n"
            "KRU_SP: Cannot.\n"
            "hint: ./vorkel explain\n");
}

TEST(UnsolvedText, OnePrimitive) {
  const Answer answer = Refused(Primitive::kPll, "Could not.");
  EXPECT_EQ(UnsolvedText(answer, MadeDevice(), "", {}, kCalls),
            "Could not.\nhint: what stands in the way: ./vorkel explain\n");
  EXPECT_EQ(UnsolvedText(answer, MadeDevice(), "The reason: limits.", {}, {}),
            "Could not.\nThe reason: limits.\n");
}

}  // namespace
}  // namespace planner::report
