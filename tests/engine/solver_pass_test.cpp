// Tests of one pass of the search: the stages in their order, the two attempts, the choice.

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>

#include "engine/pll/Stages.h"
#include "tests/engine/EngineTest.h"

namespace {

using engine_test::CountOf;
using engine_test::SlotsOf;
using Ip::Trace;
using Ip::VorkelImp;
using Ip::Pll::VcoCandidateTable;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;

constexpr int kTsyn = 0;
constexpr int kPll = 1;

constexpr char kCalculating[] = "DLL------- Calculating M and D\n";
constexpr char kSearching[] = "DLL - RK --> _prim = 1 \n";
constexpr char kNoMAndD[] = "DLL------------ No valid M and D was found!\n";
constexpr char kGettingPhases[] = "DLL ------ getting phases and duty cycles\n";

std::string Valid(int count) {
  return "DLL---- number of valid VCOs: " + std::to_string(count) + "\n";
}

// The search for a divider of output 1 that finds none.
std::string NoDiv1() {
  std::string lines = "DLL----- Looking for valid div1 from remaining VCOs\n";
  for (int i = 1; i <= 27; ++i) {
    lines += "DLL------ Can't find a clkout1_divide, so upping threshold to 0." +
             std::string(i < 10 ? "0" : "") + std::to_string(i) + "0!\n";
  }
  return lines + "DLL-- Can't find a clkout1_divide for all possible thresholds!\n";
}

class SolverPassTest : public testing::Test {
 protected:
  SolverPassTest() {
    imp_.pllLimits.clkoutMin = 3.125;
    imp_.pllLimits.clkoutMax = 400;
    imp_.pllLimits.clkoutMaxIo = 1080;
    imp_.pllLimits.pfdMin = 19;
    imp_.pllLimits.pfdMax = 500;
    imp_.pll._minPowerMode = true;
    SetRange(400, 1080);
  }

  void SetRange(double least, double most) {
    imp_.pll.minAdjVco = least;
    imp_.pll.maxAdjVco = most;
  }

  // An input clock of 100 MHz unless the test says otherwise.
  bool Pass(double fudge, int count, int prim = kPll) {
    bool chosen = false;
    trace_ = engine_test::TraceOf([&](const Trace& trace) {
      chosen = Ip::Pll::SolverPass(imp_, fudge, {inFreq_, count, prim, trace});
    });
    return chosen;
  }

  VorkelImp& imp_ = engine_test::NewImp();
  VcoCandidateTable& table_ = imp_.pll._vcoCandidates;
  double inFreq_ = 100;
  std::string trace_;
};

// --- One candidate, several, none ----------------------------------------------------------

TEST_F(SolverPassTest, MinPowerTakesTheSmallestVco) {
  imp_.requests.reqOutFreq = {200, 50};
  EXPECT_TRUE(Pass(0, 2));
  EXPECT_EQ(trace_,
            "DLL--- Using fudged oFreq = 200.000 (ofreq: 200.000, fudge: 0.000)\n"
            "DLL----- Found valid VCO = 400.000 and div0 = 2.000 (ofreq0_fudge = 0.000)\n"
            "DLL----- Found valid VCO = 600.000 and div0 = 3.000 (ofreq0_fudge = 0.000)\n"
            "DLL----- Found valid VCO = 800.000 and div0 = 4.000 (ofreq0_fudge = 0.000)\n"
            "DLL----- Found valid VCO = 1000.000 and div0 = 5.000 (ofreq0_fudge = 0.000)\n"
            "DLL----- Looking for valid div1 from remaining VCOs\n"
            "DLL ---------- for VCO = 400.000000: div1 = 8\n"
            "DLL ---------- for VCO = 600.000000: div1 = 12\n"
            "DLL ---------- for VCO = 800.000000: div1 = 16\n"
            "DLL ---------- for VCO = 1000.000000: div1 = 20\n"
            "DLL------- Calculating M and D\n"
            "DLL - RK --> _prim = 1 \n"
            "DLL-- For VCO = 400.000000: M = 4.000000, D = (float) 1.000000, (int) 1\n"
            "DLL - RK --> _prim = 1 \n"
            "DLL-- For VCO = 600.000000: M = 6.000000, D = (float) 1.000000, (int) 1\n"
            "DLL - RK --> _prim = 1 \n"
            "DLL-- For VCO = 800.000000: M = 8.000000, D = (float) 1.000000, (int) 1\n"
            "DLL - RK --> _prim = 1 \n"
            "DLL-- For VCO = 1000.000000: M = 10.000000, D = (float) 1.000000, (int) 1\n"
            "DLL---- number of valid VCOs: 4\n"
            "DLL------------ finding the smallest VCO\n"
            "DLL - chosen VCO = 400.000000\n"
            "DLL - chosen M = 4.000000\n"
            "DLL - chosen D = 1\n"
            "DLL - chosen CLKOUT0_DIVIDE_F = 2.000000\n"
            "DLL - chosen CLKOUT1_DIVIDE = 8\n"
            "DLL-- chosen clkout0 output freq = 200.000000 (req = 200.000)\n"
            "DLL-- chosen clkout1 output freq = 50.000000 (req = 50.000)\n");
  EXPECT_EQ(imp_.pll.chosen, &table_[1]);
}

// 400, 600, 800 and 1000 MHz are valid. The first is chosen, and with the second it is certain that
// it is not the only one. What would have lines in a trace is left out without one.
TEST_F(SolverPassTest, WithoutATraceOneOutputStopsAtTheSecondValidVco) {
  imp_.requests.reqOutFreq = {200};
  EXPECT_TRUE(Pass(0, 1));
  EXPECT_THAT(SlotsOf(table_.Occupied()), ElementsAre(1, 2, 3, 4));
  EXPECT_EQ(imp_.GetChosenVCO(), 400.0);
  EXPECT_TRUE(Ip::Pll::SolverPass(imp_, 0, {inFreq_, 1, kPll, Trace(false)}));
  EXPECT_THAT(SlotsOf(table_.Occupied()), ElementsAre(1, 2));
  EXPECT_EQ(imp_.GetChosenVCO(), 400.0);
}

// A PFD of 300 MHz and more at an input of 300 allows 600 MHz, M = 2 and D = 1, alone: that is the
// only one, with and without a trace, and gets its phase.
TEST_F(SolverPassTest, WithoutATraceTheOnlyVcoOfOneOutputHasItsPhase) {
  imp_.requests.reqOutFreq = {200};
  imp_.requests.reqPhase = {90};
  imp_.requests.reqDutyCycle = {50};
  imp_.pllLimits.pfdMin = 300;
  inFreq_ = 300;
  SetRange(400, 800);
  EXPECT_TRUE(Ip::Pll::SolverPass(imp_, 0, {inFreq_, 1, kPll, Trace(false)}));
  EXPECT_THAT(SlotsOf(table_.Occupied()), ElementsAre(2));
  EXPECT_EQ(imp_.GetChosenPhaseN(0), 90.0);
}

TEST_F(SolverPassTest, MinPowerAmongSeveralWorksOutNoPhases) {
  imp_.requests.reqOutFreq = {200};
  imp_.requests.reqPhase = {90};
  imp_.requests.reqDutyCycle = {50};
  EXPECT_TRUE(Pass(0, 1));
  EXPECT_EQ(imp_.GetChosenVCO(), 400.0);
  EXPECT_EQ(imp_.GetChosenPhaseN(0), 0.0);
  EXPECT_EQ(imp_.GetChosenDutyCycleN(0), 0.0);
  EXPECT_THAT(trace_, Not(HasSubstr(kGettingPhases)));
}

// The only candidate is taken without a choice, and its phases and duty cycles are worked out
// from the lists as they are, in either mode.
TEST_F(SolverPassTest, TheOnlyCandidateIsTaken) {
  SetRange(400, 500);
  imp_.requests.reqOutFreq = {200};
  imp_.requests.reqPhase = {100};
  imp_.requests.reqDutyCycle = {74};
  const std::string upToChosen =
      "DLL--- Using fudged oFreq = 200.000 (ofreq: 200.000, fudge: 0.000)\n"
      "DLL----- Found valid VCO = 400.000 and div0 = 2.000 (ofreq0_fudge = 0.000)\n"
      "DLL------- Calculating M and D\n"
      "DLL - RK --> _prim = 1 \n"
      "DLL-- For VCO = 400.000000: M = 4.000000, D = (float) 1.000000, (int) 1\n"
      "DLL---- number of valid VCOs: 1\n"
      "DLL ------ getting phases and duty cycles\n"
      "DLL - chosen VCO = 400.000000\n"
      "DLL - chosen M = 4.000000\n"
      "DLL - chosen D = 1\n"
      "DLL - chosen CLKOUT0_DIVIDE_F = 2.000000\n"
      "DLL-- chosen clkout0 output freq = 200.000000 (req = 200.000)\n";
  EXPECT_TRUE(Pass(0, 1));
  EXPECT_EQ(trace_, upToChosen);
  // Steps of 22.5: 90 is 10 away and 112.5 is 12.5. Duty cycles 0.5 and 0.75.
  EXPECT_EQ(imp_.GetChosenPhaseN(0), 90.0);
  EXPECT_EQ(imp_.GetChosenDutyCycleN(0), 0.75);

  imp_.pll._minPowerMode = false;
  EXPECT_TRUE(Pass(0, 1));
  EXPECT_EQ(trace_, upToChosen +
                        "DLL -   chosen clkout0 phase = 90.000000 (req = 100.000)\n"
                        "DLL -   chosen clkout0 duty cycle = 0.750000 (req = 74.000)\n");
}

TEST_F(SolverPassTest, ClosestSolutionIsSelectedAmongSeveral) {
  imp_.pll._minPowerMode = false;
  imp_.requests.reqOutFreq = {200, 50};
  imp_.requests.reqPhase = {0, 90};
  imp_.requests.reqDutyCycle = {50, 50};
  EXPECT_TRUE(Pass(0, 2));
  const std::string list =
      "DLL  _solutions[0] VCO = 400.000; clk0 phase = 0.000, dc = 0.500\n"
      "DLL  _solutions[1] VCO = 600.000; clk0 phase = 0.000, dc = 0.500\n"
      "DLL  _solutions[2] VCO = 800.000; clk0 phase = 0.000, dc = 0.500\n"
      "DLL  _solutions[3] VCO = 1000.000; clk0 phase = 0.000, dc = 0.500\n";
  const std::string expected =
      Valid(4) + kGettingPhases +
      "DLL---- looking for the clk0 phase solutions with threshold = 0.000000\n"
      "DLL------- 4 solutions for clk0, so check other outclks\n"
      "DLL-------- looking for clk1 phase solutions with threshold2 = 0.000000\n"
      "DLL--------- 4 solutions for clk1, so test other oclks\n"
      "DLL------ Multiple solutions found, so pick the best for clk0.\n" + list +
      "DLL-------- looking for best clk0 solution\n"
      "DLL- narrowing down top choices for clk0\n"
      "DLL------ have 4 solutions after clk0 phase check\n" + list +
      "DLL------ have 4 solutions after clk0 duty cycle check\n" + list +
      "DLL- narrowing down top choices for clk1\n"
      "DLL--------- have 4 solutions after clk1 divN check\n" + list +
      "DLL------ have 4 solutions after clk1 phase check\n" + list +
      "DLL------ have 4 solutions after clk1 duty cycle check\n" + list +
      "DLL------------ finding the smallest VCO\n"
      "DLL - chosen VCO = 400.000000\n"
      "DLL - chosen M = 4.000000\n"
      "DLL - chosen D = 1\n"
      "DLL - chosen CLKOUT0_DIVIDE_F = 2.000000\n"
      "DLL - chosen CLKOUT1_DIVIDE = 8\n"
      "DLL-- chosen clkout0 output freq = 200.000000 (req = 200.000)\n"
      "DLL -   chosen clkout0 phase = 0.000000 (req = 0.000)\n"
      "DLL -   chosen clkout0 duty cycle = 0.500000 (req = 50.000)\n"
      "DLL-- chosen clkout1 output freq = 50.000000 (req = 50.000)\n"
      "DLL -   chosen clkout1 phase = 90.000000 (req = 90.000)\n"
      "DLL -   chosen clkout1 duty cycle = 0.500000 (req = 50.000)\n";
  EXPECT_TRUE(trace_.ends_with(expected)) << trace_;
  EXPECT_EQ(CountOf("number of valid VCOs", trace_), 1);
}

TEST_F(SolverPassTest, PreferMaxVcoIsForTheClosestSolutionOnly) {
  imp_.requests.reqOutFreq = {200};
  imp_.pll._preferMaxVco = true;
  EXPECT_TRUE(Pass(0, 1));
  EXPECT_EQ(imp_.GetChosenVCO(), 400.0);
  imp_.pll._minPowerMode = false;
  EXPECT_TRUE(Pass(0, 1));
  EXPECT_EQ(imp_.GetChosenVCO(), 1000.0);
}

// --- The second attempt with a fudge of 0 --------------------------------------------------

TEST_F(SolverPassTest, WithoutCandidatesBothAttemptsCountNone) {
  SetRange(7000, 7001);
  imp_.requests.reqOutFreq = {3};
  for (const bool minPower : {true, false}) {
    imp_.pll._minPowerMode = minPower;
    EXPECT_FALSE(Pass(0, 3));
    EXPECT_EQ(trace_, "DLL--- Using fudged oFreq = 3.000 (ofreq: 3.000, fudge: 0.000)\n"
                      "DLL----- NO VCO/Div0 pairs found for ofreq0_fudge = 0.000!\n" +
                          Valid(0) + Valid(0));
    EXPECT_EQ(imp_.pll.chosen, nullptr);
  }
}

TEST_F(SolverPassTest, WithoutMAndDTheSecondAttemptSearchesTheEmptyTable) {
  SetRange(7000, 7000);
  imp_.requests.reqOutFreq = {7000};
  EXPECT_FALSE(Pass(0, 1));
  EXPECT_EQ(trace_, "DLL--- Using fudged oFreq = 7000.000 (ofreq: 7000.000, fudge: 0.000)\n"
                    "DLL----- Found valid VCO = 7000.000 and div0 = 1.000 (ofreq0_fudge = "
                    "0.000)\n" +
                        std::string(kCalculating) + kSearching + kNoMAndD + kCalculating +
                        kNoMAndD);
  EXPECT_THAT(SlotsOf(table_.Occupied()), IsEmpty());
}

TEST_F(SolverPassTest, WithoutMAndDTheSecondAttemptFindsNoDividersInTheEmptyTable) {
  SetRange(7000, 7000);
  imp_.requests.reqOutFreq = {7000, 350};
  EXPECT_FALSE(Pass(0, 2));
  EXPECT_EQ(trace_, "DLL--- Using fudged oFreq = 7000.000 (ofreq: 7000.000, fudge: 0.000)\n"
                    "DLL----- Found valid VCO = 7000.000 and div0 = 1.000 (ofreq0_fudge = "
                    "0.000)\n"
                    "DLL----- Looking for valid div1 from remaining VCOs\n"
                    "DLL ---------- for VCO = 7000.000000: div1 = 20\n" +
                        std::string(kCalculating) + kSearching + kNoMAndD + NoDiv1());
}

TEST_F(SolverPassTest, WithoutDividersTheSecondAttemptLooksForThemAgain) {
  SetRange(600, 600);
  imp_.requests.reqOutFreq = {200, 2000};
  EXPECT_FALSE(Pass(0, 2));
  EXPECT_EQ(trace_, "DLL--- Using fudged oFreq = 200.000 (ofreq: 200.000, fudge: 0.000)\n"
                    "DLL----- Found valid VCO = 600.000 and div0 = 3.000 (ofreq0_fudge = "
                    "0.000)\n" +
                        NoDiv1() + NoDiv1());
  EXPECT_THAT(SlotsOf(table_.Occupied()), ElementsAre(2));
  EXPECT_EQ(imp_.pll.chosen, nullptr);
}

std::string Attempts60() {
  std::string lines;
  for (int a = 0; a < 60; ++a) {
    static constexpr const char* kFirst[] = {"0.000000", "0.001000", "0.010000", "0.100000",
                                             "0.500000"};
    const std::string later =
        std::to_string((a - 3) / 2) + "." + (a % 2 == 0 ? "5" : "0") + "00000";
    lines += "DLL---- looking for the clk0 phase solutions with threshold = " +
             (a < 5 ? kFirst[a] : later) +
             "\nDLL------- no matches for clk0, so try with higher threshold\n";
  }
  return lines;
}

// 400 degrees are 40 away from the last step of any divider, and 28 is the largest tolerance.
TEST_F(SolverPassTest, WithoutASelectionTheSecondAttemptGoesOverTheSameCandidates) {
  imp_.pll._minPowerMode = false;
  SetRange(400, 700);
  imp_.requests.reqOutFreq = {200};
  imp_.requests.reqPhase = {400};
  EXPECT_FALSE(Pass(0, 1));
  const std::string attempt =
      std::string(kCalculating) + kSearching +
      "DLL-- For VCO = 400.000000: M = 4.000000, D = (float) 1.000000, (int) 1\n" + kSearching +
      "DLL-- For VCO = 600.000000: M = 6.000000, D = (float) 1.000000, (int) 1\n" + Valid(2) +
      kGettingPhases + Attempts60();
  EXPECT_EQ(trace_, "DLL--- Using fudged oFreq = 200.000 (ofreq: 200.000, fudge: 0.000)\n"
                    "DLL----- Found valid VCO = 400.000 and div0 = 2.000 (ofreq0_fudge = "
                    "0.000)\n"
                    "DLL----- Found valid VCO = 600.000 and div0 = 3.000 (ofreq0_fudge = "
                    "0.000)\n" +
                        attempt + attempt);
  EXPECT_EQ(imp_.pll.chosen, nullptr);
}

// --- The second attempt with a fudge -------------------------------------------------------

TEST_F(SolverPassTest, TheFudgeIsTriedUpwardFirst) {
  // 195 + 5 and 205 - 5 both make 200.
  SetRange(600, 600);
  imp_.requests.reqOutFreq = {195};
  EXPECT_TRUE(Pass(5, 1));
  EXPECT_THAT(trace_, HasSubstr("DLL--- Using fudged oFreq = 200.000 (ofreq: 195.000, fudge: "
                                "5.000)\n"));
  EXPECT_EQ(CountOf("Using fudged", trace_), 1);
  EXPECT_EQ(imp_.GetChosenVCO(), 600.0);
}

TEST_F(SolverPassTest, ThenDownward) {
  SetRange(600, 600);
  imp_.requests.reqOutFreq = {205};
  EXPECT_TRUE(Pass(5, 1));
  EXPECT_EQ(trace_, "DLL--- Using fudged oFreq = 210.000 (ofreq: 205.000, fudge: 5.000)\n"
                    "DLL----- NO VCO/Div0 pairs found for ofreq0_fudge = 5.000!\n" +
                        Valid(0) +
                        "DLL--- Using fudged oFreq = 200.000 (ofreq: 205.000, fudge: -5.000)\n"
                        "DLL----- Found valid VCO = 600.000 and div0 = 3.000 (ofreq0_fudge = "
                        "-5.000)\n" +
                        kCalculating + kSearching +
                        "DLL-- For VCO = 600.000000: M = 6.000000, D = (float) 1.000000, (int) "
                        "1\n" +
                        Valid(1) + kGettingPhases +
                        "DLL - chosen VCO = 600.000000\n"
                        "DLL - chosen M = 6.000000\n"
                        "DLL - chosen D = 1\n"
                        "DLL - chosen CLKOUT0_DIVIDE_F = 3.000000\n"
                        "DLL-- chosen clkout0 output freq = 200.000000 (req = 205.000)\n");
}

// Upward 210 * 3 has no divider for output 1 and stays in the table; downward nothing lies in
// the range. What is left has no M and D: it does not count and is not chosen.
TEST_F(SolverPassTest, CandidatesWithoutMAndDDoNotCount) {
  SetRange(630, 640);
  imp_.requests.reqOutFreq = {200, 2000};
  for (const bool minPower : {true, false}) {
    imp_.pll._minPowerMode = minPower;
    EXPECT_FALSE(Pass(10, 2));
    EXPECT_EQ(trace_, "DLL--- Using fudged oFreq = 210.000 (ofreq: 200.000, fudge: 10.000)\n"
                      "DLL----- Found valid VCO = 630.000 and div0 = 3.000 (ofreq0_fudge = "
                      "10.000)\n" +
                          NoDiv1() +
                          "DLL--- Using fudged oFreq = 190.000 (ofreq: 200.000, fudge: "
                          "-10.000)\n"
                          "DLL----- NO VCO/Div0 pairs found for ofreq0_fudge = -10.000!\n" +
                          Valid(0));
    EXPECT_EQ(imp_.pll.chosen, nullptr);
    EXPECT_EQ(imp_.GetChosenVCO(), 0.0);
    EXPECT_THAT(SlotsOf(table_.Occupied()), ElementsAre(2));
  }
}

// The same with two left.
TEST_F(SolverPassTest, SeveralCandidatesWithoutMAndDDoNotCount) {
  SetRange(400, 1080);
  imp_.requests.reqOutFreq = {200, 2000};
  EXPECT_FALSE(Pass(300, 2));  // 500 and 1000 upward, -100 downward
  EXPECT_TRUE(trace_.ends_with(
      "DLL--- Using fudged oFreq = -100.000 (ofreq: 200.000, fudge: -300.000)\n"
      "DLL----- NO VCO/Div0 pairs found for ofreq0_fudge = -300.000!\n" + Valid(0)));
  EXPECT_THAT(SlotsOf(table_.Occupied()), ElementsAre(0, 1));
}

// Upward: 500 and 1000, both valid and none close enough. Downward nothing is new, and the two
// are gone over again, without dividers, M and D.
TEST_F(SolverPassTest, WithoutNewCandidatesTheValidOnesAreChosenFromAgain) {
  imp_.pll._minPowerMode = false;
  imp_.requests.reqOutFreq = {200};
  imp_.requests.reqPhase = {400};
  EXPECT_FALSE(Pass(300, 1));
  EXPECT_TRUE(trace_.ends_with(
      Valid(2) + kGettingPhases + Attempts60() +
      "DLL--- Using fudged oFreq = -100.000 (ofreq: 200.000, fudge: -300.000)\n"
      "DLL----- NO VCO/Div0 pairs found for ofreq0_fudge = -300.000!\n" +
      Valid(2) + kGettingPhases + Attempts60()));
  EXPECT_EQ(CountOf(kCalculating, trace_), 1);
}

// Upward 420, 630 and 840 MHz; downward 570 and 760 take over the slots of dividers 3 and 4,
// 950 comes new and has no M and D for 20 MHz. 420 stays.
TEST_F(SolverPassTest, TheTableIsNotEmptiedBetweenTheAttempts) {
  imp_.pll._minPowerMode = false;
  imp_.pllLimits.pfdMin = 5;
  inFreq_ = 20;
  SetRange(400, 1000);
  imp_.requests.reqOutFreq = {200};
  imp_.requests.reqPhase = {400};
  EXPECT_FALSE(Pass(10, 1));
  EXPECT_THAT(SlotsOf(table_.Occupied()), ElementsAre(1, 2, 3));
  EXPECT_EQ(table_[1].vco, 420.0);
  EXPECT_EQ(table_[2].vco, 570.0);
  EXPECT_EQ(table_[3].vco, 760.0);
  EXPECT_EQ(table_[2].m, 57.0);
  EXPECT_EQ(table_[2].d, 2u);
  EXPECT_THAT(trace_, HasSubstr("DLL - RK --> _prim = 1 \n"
                                "DLL-- For VCO = 420.000000: M = 21.000000, D = (float) "
                                "1.000000, (int) 1\n"
                                "DLL - RK --> _prim = 1 \n"
                                "DLL-- For VCO = 570.000000: M = 57.000000, D = (float) "
                                "2.000000, (int) 2\n"
                                "DLL - RK --> _prim = 1 \n"
                                "DLL-- For VCO = 760.000000: M = 38.000000, D = (float) "
                                "1.000000, (int) 1\n"
                                "DLL - RK --> _prim = 1 \n" +
                                Valid(3)));
}

// Upward 420 and 630, none close enough. Downward 570 takes the place of 630 and has no M and D
// with the detector above 100 MHz: 420 is the only one left, and the only one is taken.
TEST_F(SolverPassTest, ACandidateOfTheFirstAttemptMayBeChosenInTheSecond) {
  imp_.pll._minPowerMode = false;
  imp_.pllLimits.pfdMin = 100;
  inFreq_ = 210;
  SetRange(400, 700);
  imp_.requests.reqOutFreq = {200};
  imp_.requests.reqPhase = {400};
  imp_.requests.reqDutyCycle = {50};
  EXPECT_TRUE(Pass(10, 1));
  EXPECT_EQ(trace_,
            "DLL--- Using fudged oFreq = 210.000 (ofreq: 200.000, fudge: 10.000)\n"
            "DLL----- Found valid VCO = 420.000 and div0 = 2.000 (ofreq0_fudge = 10.000)\n"
            "DLL----- Found valid VCO = 630.000 and div0 = 3.000 (ofreq0_fudge = 10.000)\n" +
                std::string(kCalculating) + kSearching +
                "DLL-- For VCO = 420.000000: M = 2.000000, D = (float) 1.000000, (int) 1\n" +
                kSearching +
                "DLL-- For VCO = 630.000000: M = 3.000000, D = (float) 1.000000, (int) 1\n" +
                Valid(2) + kGettingPhases + Attempts60() +
                "DLL--- Using fudged oFreq = 190.000 (ofreq: 200.000, fudge: -10.000)\n"
                "DLL----- Found valid VCO = 570.000 and div0 = 3.000 (ofreq0_fudge = "
                "-10.000)\n" +
                kCalculating + kSearching +
                "DLL-- For VCO = 420.000000: M = 2.000000, D = (float) 1.000000, (int) 1\n" +
                kSearching + Valid(1) + kGettingPhases +
                "DLL - chosen VCO = 420.000000\n"
                "DLL - chosen M = 2.000000\n"
                "DLL - chosen D = 1\n"
                "DLL - chosen CLKOUT0_DIVIDE_F = 2.000000\n"
                "DLL-- chosen clkout0 output freq = 210.000000 (req = 200.000)\n"
                "DLL -   chosen clkout0 phase = 360.000000 (req = 400.000)\n"
                "DLL -   chosen clkout0 duty cycle = 0.500000 (req = 50.000)\n");
}

// --- What a pass begins with ---------------------------------------------------------------

TEST_F(SolverPassTest, APassBeginsWithAnEmptyTableAndNothingChosen) {
  table_.Put(0, 400, 1);
  table_.Put(900, 400, 1);
  table_[0].m = 4;
  table_[0].d = 1;
  imp_.pll.chosen = &table_[0];
  imp_.requests.reqOutFreq = {3};
  SetRange(7000, 7001);
  EXPECT_FALSE(Pass(0, 1));
  EXPECT_EQ(imp_.pll.chosen, nullptr);
  EXPECT_THAT(SlotsOf(table_.Occupied()), IsEmpty());
}

TEST_F(SolverPassTest, WhatWasChosenIsGoneHoweverThePassFails) {
  imp_.requests.reqOutFreq = {200};
  ASSERT_TRUE(Pass(0, 1));
  imp_.requests.reqOutFreq = {7000};
  SetRange(7000, 7000);
  EXPECT_FALSE(Pass(0, 1)) << "no M and D";
  EXPECT_EQ(imp_.pll.chosen, nullptr);

  SetRange(400, 1080);
  imp_.requests.reqOutFreq = {200, 2000};
  ASSERT_TRUE(Pass(0, 1));
  EXPECT_FALSE(Pass(0, 2)) << "no divider of output 1";
  EXPECT_EQ(imp_.pll.chosen, nullptr);
}

TEST_F(SolverPassTest, APassSetsThePrimitiveOfTheProcess) {
  imp_.requests.reqOutFreq = {3};
  SetRange(7000, 7001);
  for (const int prim : {kTsyn, kPll, 7}) {
    EXPECT_FALSE(Pass(0, 1, prim));
    EXPECT_EQ(VorkelImp::_prim, prim);
  }
}

// Output 1 of a PLL may go up to the maximum of I/O clocks; that is decided by the primitive
// of the pass at hand.
TEST_F(SolverPassTest, TheStagesWorkWithThePrimitiveOfThePass) {
  VorkelImp::_prim = kTsyn;
  SetRange(600, 600);
  imp_.requests.reqOutFreq = {200, 600};
  EXPECT_TRUE(Pass(0, 2, kPll));
  EXPECT_FALSE(Pass(0, 2, kTsyn));
}

// --- Whole or fractional divider of output 0 -----------------------------------------------

class IntegerDiv0Test : public SolverPassTest {
 protected:
  IntegerDiv0Test() {
    SetRange(200, 300);
    imp_.requests.reqOutFreq.fill(100);
  }

  // Whether a pass walks whole dividers: 2 and 3, or 2, 2.125, ... 3.
  bool IsWhole(int count, int prim) {
    Pass(0, count, prim);
    const int found = CountOf("Found valid VCO", trace_);
    EXPECT_TRUE(found == 2 || found == 9) << found;
    return found == 2;
  }
};

TEST_F(IntegerDiv0Test, APllHasWholeDividers) {
  for (int count = 1; count <= 7; ++count) EXPECT_TRUE(IsWhole(count, kPll)) << count;
  imp_.pll._intDiv0Only = true;
  EXPECT_TRUE(IsWhole(1, kPll));
}

TEST_F(IntegerDiv0Test, ATsynHasWholeDividersFromSixOutputs) {
  for (int count = 1; count <= 5; ++count) EXPECT_FALSE(IsWhole(count, kTsyn)) << count;
  EXPECT_TRUE(IsWhole(6, kTsyn));
  EXPECT_TRUE(IsWhole(7, kTsyn));
}

TEST_F(IntegerDiv0Test, ATsynHasWholeDividersWhenAsked) {
  imp_.pll._intDiv0Only = true;
  for (int count = 1; count <= 7; ++count) EXPECT_TRUE(IsWhole(count, kTsyn)) << count;
}

TEST_F(IntegerDiv0Test, OtherPrimitivesHaveFractionalOnes) {
  imp_.pll._intDiv0Only = true;
  for (const int prim : {2, -1}) {
    EXPECT_FALSE(IsWhole(1, prim)) << prim;
    EXPECT_FALSE(IsWhole(7, prim)) << prim;
  }
}

// 850 = 400 * 2.125 and 100 * 17 / 2.
TEST_F(SolverPassTest, AFractionalTsynSolution) {
  SetRange(850, 850);
  imp_.requests.reqOutFreq = {400, 85};
  imp_.requests.reqPhase = {90, 90};
  imp_.requests.reqDutyCycle = {25, 25};
  EXPECT_TRUE(Pass(0, 2, kTsyn));
  EXPECT_EQ(imp_.GetChosenDiv0(), 2.125);
  EXPECT_EQ(imp_.GetChosenM(), 17.0);
  EXPECT_EQ(imp_.GetChosenD(), 2);
  EXPECT_EQ(imp_.GetChosenDivN(1), 10);
  for (const int n : {0, 1}) {
    EXPECT_EQ(imp_.GetChosenPhaseN(n), 0.0);
    EXPECT_EQ(imp_.GetChosenDutyCycleN(n), 0.5);
  }
}

TEST_F(SolverPassTest, IsSilentWithTheTraceOff) {
  imp_.requests.reqOutFreq = {200, 50};
  const std::string text = engine_test::TraceOf(
      [&](const Trace& trace) {
        for (const bool minPower : {true, false}) {
          imp_.pll._minPowerMode = minPower;
          Ip::Pll::SolverPass(imp_, 0, {100, 2, kPll, trace});
          Ip::Pll::SolverPass(imp_, 3, {100, 1, kTsyn, trace});
          SetRange(400, 500);
          Ip::Pll::SolverPass(imp_, 0, {100, 2, kPll, trace});
          SetRange(400, 1080);
        }
      },
      false);
  EXPECT_EQ(text, "");
  EXPECT_EQ(imp_.GetChosenVCO(), 400.0);
}

}  // namespace
