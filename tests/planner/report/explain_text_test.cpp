// The sentences of an explanation, about conflicts and changes that are made by hand.
#include "planner/report/ExplainText.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <utility>

#include "made.h"
#include "planner/report/ExplainWords.h"

namespace planner::report {

namespace {

using explain::Change;
using explain::ChangeKind;
using explain::Conflict;
using explain::Demand;
using explain::DemandKind;
using explain::Explanation;
using explain::OfPrimitive;
using testing::HasSubstr;
using testing::Not;
using testing::StartsWith;

Change To(ChangeKind kind, Demand demand, Rational value, Rational before = 0) {
  Change change;
  change.kind = kind;
  change.demand = demand;
  change.value = std::move(value);
  change.before = std::move(before);
  return change;
}

Change Frequency(int output, Rational value, Rational before) {
  return To(ChangeKind::kFrequency, {DemandKind::kFrequency, output}, std::move(value),
            std::move(before));
}

Conflict Between(std::vector<Demand> demands, std::vector<Change> changes, bool lifts_all) {
  Conflict conflict;
  conflict.demands = std::move(demands);
  conflict.changes = std::move(changes);
  conflict.lifts_all = lifts_all;
  return conflict;
}

// 200 and 70 MHz from 100 MHz.
class ExplainTextTest : public testing::Test {
 protected:
  ExplainTextTest() {
    explanation_.request = MadeRequest({100}, {200, 70});
    OfPrimitive tsyn;
    tsyn.primitive = Primitive::kTsyn;
    explanation_.primitives = {tsyn};
  }
  OfPrimitive& Tsyn() { return explanation_.primitives[0]; }
  std::string Text(bool own_inputs = false) const {
    Calls calls;
    calls.best = "vorkel best";
    return ExplainText(explanation_, MadeDevice(), Style{false, 200}, calls, own_inputs);
  }
  Explanation explanation_;
};

TEST_F(ExplainTextTest, WhatIsPossibleHasTheCallForItsSettings) {
  Tsyn().is_met = true;
  EXPECT_EQ(Text(),
            "Possible as it stands with TSYN.\n"
            "hint: the settings: vorkel best\n");
}

TEST_F(ExplainTextTest, WithTheEngineAloneTheSettingsStillCount) {
  Tsyn().is_met = true;
  EXPECT_THAT(Text(), Not(HasSubstr("note:")));
  explanation_.request.engine_only = true;
  EXPECT_THAT(Text(), HasSubstr("\nnote: all settings count here, those that the design flow's own "
                                "search does not find, too\n"));
}

TEST_F(ExplainTextTest, AConflictWithWhatLiftsIt) {
  Tsyn().conflicts = {Between({{DemandKind::kFrequency, 0}, {DemandKind::kVco}},
                              {Frequency(0, Rational(400, 3), 200), Frequency(0, 201, 200)}, true)};
  EXPECT_EQ(Text(),
            "Not possible as it stands with any primitive of vk40b484-2.\n"
            "\n"
            "TSYN\n"
            "  in the way  output 0 at 200 MHz and the VCO from 600 to 1440 MHz\n"
            "  works with  output 0 at 201 MHz; 1 more; --format json has all\n"
            "\n"
            "None of the stock oscillators makes every frequency exact.\n");
}

// 133.333 MHz is more than a tenth below 200; a tolerance of 20000 ppm is the largest told.
TEST_F(ExplainTextTest, WhatIsFarAwayIsNoAdvice) {
  const Demand demand = {DemandKind::kFrequency, 0};
  Tsyn().conflicts = {Between({demand}, {Frequency(0, 180, 200), Frequency(0, 221, 200),
                                         To(ChangeKind::kTolerance, demand, 20000),
                                         To(ChangeKind::kTolerance, demand, 20001),
                                         To(ChangeKind::kWithout, demand, 0)},
                              true)};
  EXPECT_THAT(Text(), HasSubstr("\n  works with  output 0 at 180 MHz; output 0 with a tolerance of "
                                "20000 ppm; 3 more; --format json has all\n"));
  Tsyn().conflicts[0].changes.erase(Tsyn().conflicts[0].changes.begin());
  Tsyn().conflicts[0].changes.erase(Tsyn().conflicts[0].changes.begin() + 1);
  EXPECT_THAT(Text(), Not(HasSubstr("works with")));
}

TEST_F(ExplainTextTest, SixChangesAreToldAndNoneTwice) {
  const Demand first = {DemandKind::kFrequency, 0};
  const Demand second = {DemandKind::kFrequency, 1};
  const Change same = Frequency(0, 201, 200);
  Tsyn().conflicts = {
      Between({first}, {same, Frequency(0, 199, 200), Frequency(0, 202, 200)}, false),
      Between({first, second},
              {same, Frequency(0, 198, 200), Frequency(1, 71, 70), Frequency(1, 69, 70),
               Frequency(1, 72, 70)},
              false)};
  EXPECT_THAT(Text(), HasSubstr("\n  helps       output 0 at 201 MHz; output 0 at 199 MHz; output "
                                "0 at 202 MHz; output 0 at 198 MHz; output 1 at 71 MHz; output 1 "
                                "at 69 MHz; 1 more; --format json"));
}

TEST_F(ExplainTextTest, FourConflictsAreTold) {
  for (const DemandKind kind : {DemandKind::kVco, DemandKind::kPfd, DemandKind::kM, DemandKind::kD,
                                DemandKind::kDividers, DemandKind::kWhole}) {
    Tsyn().conflicts.push_back(Between({{kind}}, {}, true));
  }
  EXPECT_THAT(Text(), HasSubstr("\n  in the way  the VCO from 600 to 1440 MHz\n"
                                "  and         the PFD from 10 to 500 MHz\n"
                                "  and         M up to 64\n"
                                "  and         D up to 80\n"
                                "              2 more; --format json has all\n"));
}

// M 6, D 1: a VCO of 600 MHz; dividers 3 and 9 make 200 and 66.667 MHz, 5 percent off.
TEST_F(ExplainTextTest, AllOutputsMovedTogetherAndTheNearestOfAll) {
  Change together = To(ChangeKind::kTolerance, {DemandKind::kFrequency, -1}, Rational(100001, 1000));
  LoopSettings settings;
  settings.primitive = Primitive::kTsyn;
  settings.m = 48;
  settings.d = 1;
  settings.outputs = {{24, 0, 3}, {72, 0, 9}};
  together.settings = settings;
  Tsyn().together = {together};
  OfPrimitive pll = Tsyn();
  pll.primitive = Primitive::kPll;
  pll.together[0].value = 200;
  explanation_.primitives.insert(explanation_.primitives.begin(), pll);
  EXPECT_THAT(Text(), StartsWith("Not possible as it stands with any primitive of vk40b484-2.\n"
                                 "nearest: 200, 66.666667 MHz, with a tolerance of 100.01 ppm "
                                 "(TSYN)\n"));
  EXPECT_THAT(Text(), HasSubstr("\n  all moved   200, 66.666667 MHz, with a tolerance of 200 ppm"));
}

// The nearest is that of the smaller distance: 300 ps for 200 is 1.5 of a limit, and 5 percent
// off is 500 tolerances.
TEST_F(ExplainTextTest, AllLimitsOfTheJitterTogether) {
  explanation_.request.max_jitter = 200;
  Change jitter = To(ChangeKind::kJitter, {DemandKind::kJitter, -1}, Rational(3001234, 10000), 200);
  LoopSettings settings;
  settings.primitive = Primitive::kTsyn;
  settings.m = 48;
  settings.d = 1;
  settings.outputs = {{24, 0, 3}, {72, 0, 9}};
  jitter.settings = settings;
  Tsyn().together = {jitter};
  Tsyn().conflicts = {
      Between({{DemandKind::kJitter, 0}}, {To(ChangeKind::kJitter, {DemandKind::kJitter, 0}, 290)},
              false)};
  const std::string text = Text();
  EXPECT_THAT(text, HasSubstr("\nnearest: all jitter limits at 300.124 ps (TSYN)\n"));
  EXPECT_THAT(text, HasSubstr("\n  works with  all jitter limits at 300.124 ps\n"));
  EXPECT_THAT(text, Not(HasSubstr("all moved")));
}

TEST_F(ExplainTextTest, WithoutOutputsAndInAnotherOrder) {
  Tsyn().corrections = {{{DemandKind::kFrequency, 0}}, {{DemandKind::kFrequency, 1}},
                        {{DemandKind::kFrequency, 0}, {DemandKind::kVco}}};
  Tsyn().swaps = {{0, 1, {}}};
  EXPECT_THAT(Text(), HasSubstr("\n  without     output 0 or output 1\n"
                                "              works when outputs 0 and 1 change places: "
                                "--any-order\n"));
}

// Where a primitive cannot be asked, nothing else of it is told.
TEST_F(ExplainTextTest, APrimitiveThatCannotBeAsked) {
  Tsyn().primitive = Primitive::kKruSp;
  Tsyn().refusals = {{.kind = FindingKind::kTooManyInputs,
                      .primitive = Primitive::kKruSp,
                      .value = 2,
                      .range = {0, 1}},
                     {.kind = FindingKind::kTooManyOutputs,
                      .primitive = Primitive::kKruSp,
                      .value = 7,
                      .range = {0, 6}}};
  Tsyn().conflicts = {Between({{DemandKind::kFrequency, 0}}, {Frequency(0, 201, 200)}, true)};
  EXPECT_EQ(Text(),
            "Not possible as it stands with any primitive of vk40b484-2.\n"
            "\n"
            "KRU_SP\n"
            "              A KRU_SP has 1 input clock, not 2.\n"
            "              A KRU_SP has at most 6 outputs, not 7.\n"
            "\n"
            "None of the stock oscillators makes every frequency exact.\n");
}

TEST_F(ExplainTextTest, QuestionsThatCameToTheirEnd) {
  Tsyn().is_complete = false;
  Tsyn().questions = 4096;
  EXPECT_THAT(Text(), HasSubstr("there may be more: 4096 sets of demands were looked at\n"));
}

TEST_F(ExplainTextTest, OscillatorsThatServe) {
  explanation_.inputs = {{27, {Primitive::kPll, Primitive::kTsyn}}, {Rational(100, 3), {}}};
  explanation_.inputs[1].primitives = {Primitive::kKruSp};
  EXPECT_THAT(Text(), HasSubstr("\nexact from stock oscillators: 27 MHz (PLL, TSYN) or 33.333333 "
                                "MHz (100/3) (KRU_SP)\n"));
  explanation_.request.inputs.emplace_back(50);
  EXPECT_THAT(Text(true), HasSubstr("\nexact from oscillators of your list in place of the first "
                                    "input: 27 MHz"));
}

TEST(ChangeWordsTest, ANumberThatHasToBeAllowedIsRoundedUp) {
  const Demand output = {DemandKind::kJitter, 2};
  EXPECT_EQ(ChangeWords(To(ChangeKind::kTolerance, output, Rational(84001, 1000)),
                        Primitive::kPll),
            "output 2 with a tolerance of 84.01 ppm");
  EXPECT_EQ(ChangeWords(To(ChangeKind::kTolerance, {DemandKind::kFrequency, -1}, 84),
                        Primitive::kPll),
            "all outputs with a tolerance of 84 ppm");
  EXPECT_EQ(ChangeWords(To(ChangeKind::kJitter, output, Rational(1234561, 10000)),
                        Primitive::kPll),
            "output 2 with a jitter of up to 123.457 ps");
  EXPECT_EQ(ChangeWords(To(ChangeKind::kJitter, {DemandKind::kJitter, -1}, Rational(1234561, 10000)),
                        Primitive::kPll),
            "all jitter limits at 123.457 ps");
}

// Two decimals, and where these would be 0, so many that there is one digit.
TEST(ChangeWordsTest, AToleranceOfTheInputIsRoundedDown) {
  const auto words = [](const Rational& value) {
    return ChangeWords(To(ChangeKind::kInputTolerance, {DemandKind::kInputTolerance}, value),
                       Primitive::kPll);
  };
  EXPECT_EQ(words(Rational(12349, 1000)), "an input that is off by at most 12.34 ppm");
  EXPECT_EQ(words(Rational(1, 100)), "an input that is off by at most 0.01 ppm");
  EXPECT_EQ(words(Rational(99, 10000)), "an input that is off by at most 0.009 ppm");
  EXPECT_EQ(words(Rational(129, 1000000)), "an input that is off by at most 0.0001 ppm");
  EXPECT_EQ(words(0), "an input without a tolerance");
}

TEST(ChangeWordsTest, BeyondTheRangesOfTheDevice) {
  EXPECT_EQ(ChangeWords(To(ChangeKind::kHighest, {DemandKind::kVco}, 1452, 1440), Primitive::kTsyn),
            "a VCO of 1452 MHz, 12 above the range");
  EXPECT_EQ(ChangeWords(To(ChangeKind::kLowest, {DemandKind::kPfd}, 9, 10), Primitive::kTsyn),
            "a PFD of 9 MHz, 1 below the range");
  EXPECT_EQ(ChangeWords(To(ChangeKind::kHighest, {DemandKind::kOutputRange, 1}, 810, 800),
                        Primitive::kTsyn),
            "output 1 at 810 MHz, 10 above the range");
}

TEST(ChangeWordsTest, PhasesDutyCyclesAndBandwidths) {
  EXPECT_EQ(ChangeWords(To(ChangeKind::kPhase, {DemandKind::kPhase, 1}, Rational(225, 2)),
                        Primitive::kTsyn),
            "output 1 at 112.5 degrees");
  EXPECT_EQ(ChangeWords(To(ChangeKind::kDuty, {DemandKind::kDuty, 1}, Rational(100, 3)),
                        Primitive::kTsyn),
            "output 1 with a duty cycle of 33.333333 percent (100/3)");
  Change change = To(ChangeKind::kBandwidth, {DemandKind::kBandwidth}, 0);
  LoopSettings settings;
  settings.bandwidth = Bandwidth::kLow;
  change.settings = settings;
  EXPECT_EQ(ChangeWords(change, Primitive::kTsyn), "bandwidth LOW");
}

TEST(ChangeWordsTest, ADemandThatGoes) {
  const auto without = [](DemandKind kind, Primitive primitive) {
    return ChangeWords(To(ChangeKind::kWithout, {kind, 1}, 0), primitive);
  };
  EXPECT_EQ(without(DemandKind::kFrequency, Primitive::kPll), "without output 1");
  EXPECT_EQ(without(DemandKind::kPhase, Primitive::kPll), "output 1 at any phase");
  EXPECT_EQ(without(DemandKind::kDuty, Primitive::kPll), "output 1 with any duty cycle");
  EXPECT_EQ(without(DemandKind::kJitter, Primitive::kPll), "output 1 with any jitter");
  EXPECT_EQ(without(DemandKind::kFeedback, Primitive::kKruSp), "without feedback");
  EXPECT_EQ(without(DemandKind::kSecondInput, Primitive::kPll), "without the second input");
  EXPECT_EQ(without(DemandKind::kD, Primitive::kPll), "a D above 80");
  EXPECT_EQ(without(DemandKind::kM, Primitive::kKruSp), "an M that the KRU_SP does not have");
}

}  // namespace

}  // namespace planner::report
