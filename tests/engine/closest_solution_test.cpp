// Tests of the choice of the closest-solution mode, on candidates made by hand.

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstdio>
#include <string>
#include <vector>

#include "engine/pll/Stages.h"
#include "tests/engine/EngineTest.h"

namespace {

using engine_test::Above;
using engine_test::Below;
using engine_test::CountOf;
using engine_test::kNan;
using engine_test::Repeat;
using engine_test::SlotsOf;
using Ip::Trace;
using Ip::VorkelImp;
using Ip::Pll::VcoCandidate;
using Ip::Pll::VcoCandidateTable;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::Not;

constexpr int kTsyn = 0;
constexpr int kPll = 1;

// Slots from one candidate of a test to the next; 101 have room in the table.
constexpr int kApart = 9;

// Lines of the trace. Those of one test at least are written out whole below.
constexpr char kNoClk0[] = "DLL------- no matches for clk0, so try with higher threshold\n";
constexpr char kOneForClk0[] = "DLL------- only one exact solution for clk0, so use it\n";
constexpr char kPickBest[] = "DLL------ Multiple solutions found, so pick the best for clk0.\n";
constexpr char kBestClk0[] = "DLL-------- looking for best clk0 solution\n";
constexpr char kSmallest[] = "DLL------------ finding the smallest VCO\n";
constexpr char kLargest[] = "DLL----------- finding the largest VCO\n";
constexpr char kOneLeft[] = "DLL--------- only one exact solution left, so use it\n";

std::string Clk0(const std::string& threshold) {
  return "DLL---- looking for the clk0 phase solutions with threshold = " + threshold + "\n";
}
std::string CheckOthers(int count) {
  return "DLL------- " + std::to_string(count) + " solutions for clk0, so check other outclks\n";
}
std::string NoOthers(int count) {
  return "DLL------- " + std::to_string(count) + " solutions for clk0; no other oclks used\n";
}
std::string Clk(int n) {
  return "DLL-------- looking for clk" + std::to_string(n) +
         " phase solutions with threshold2 = 0.000000\n";
}
std::string NoClk(int n) {
  return "DLL--------- no matches for clk" + std::to_string(n) +
         ", so try with higher threshold\n";
}
std::string SeveralForClk(int count, int n) {
  return "DLL--------- " + std::to_string(count) + " solutions for clk" + std::to_string(n) +
         ", so test other oclks\n";
}
std::string Narrowing(int n) {
  return "DLL- narrowing down top choices for clk" + std::to_string(n) + "\n";
}
std::string AfterDivN(int count, int n) {
  return "DLL--------- have " + std::to_string(count) + " solutions after clk" +
         std::to_string(n) + " divN check\n";
}
std::string AfterPhase(int count, int n) {
  return "DLL------ have " + std::to_string(count) + " solutions after clk" + std::to_string(n) +
         " phase check\n";
}
std::string AfterDuty(int count, int n) {
  return "DLL------ have " + std::to_string(count) + " solutions after clk" + std::to_string(n) +
         " duty cycle check\n";
}
std::string Unique(int n, const std::string& what) {
  return "DLL------ using the unique clk" + std::to_string(n) +
         " solution with the closest " + what + "\n";
}

class ClosestSolutionTest : public testing::Test {
 protected:
  // A new candidate, with nothing to tell it from the request on any output.
  VcoCandidate& Add(double vco) {
    const int slot = kApart * added_++;
    engine_test::PutBare(table_, slot, vco, 4);
    table_[slot].m = 8;
    table_[slot].d = 1;
    return table_[slot];
  }

  // Three of the same worth, so that what a test sets on one or two of them decides.
  void AddThree() {
    for (const double vco : {700.0, 800.0, 900.0}) Add(vco);
  }
  VcoCandidate& operator[](int index) { return table_[kApart * index]; }

  const VcoCandidate* Select(int count, int prim = kPll) {
    const VcoCandidate* selected = nullptr;
    trace_ = engine_test::TraceOf([&](const Trace& trace) {
      selected = Ip::Pll::SelectPhaseSolution(imp_, {100, count, prim, trace});
    });
    return selected;
  }

  // The selected VCO, or 0 for none.
  double SelectVco(int count, int prim = kPll) {
    const VcoCandidate* const selected = Select(count, prim);
    return selected == nullptr ? 0.0 : selected->vco;
  }

  static std::string Listed(int slot, const std::string& vco) {
    return "DLL  _solutions[" + std::to_string(slot) + "] VCO = " + vco +
           "; clk0 phase = 0.000, dc = 0.000\n";
  }

  VorkelImp& imp_ = engine_test::NewImp();
  VcoCandidateTable& table_ = imp_.pll._vcoCandidates;
  int added_ = 0;
  std::string trace_;
};

// --- Gathering on output 0 -----------------------------------------------------------------

TEST_F(ClosestSolutionTest, TheOnlyOneThatMeetsOutput0IsTaken) {
  Add(800).phaseDiff[0] = 5;
  const VcoCandidate& met = Add(700);
  Add(600).dutyDiff[0] = 0.1;
  EXPECT_EQ(Select(1), &met);
  EXPECT_EQ(trace_,
            "DLL---- looking for the clk0 phase solutions with threshold = 0.000000\n"
            "DLL------- only one exact solution for clk0, so use it\n");
}

TEST_F(ClosestSolutionTest, AToleranceOf0IsOneTenThousandth) {
  Add(700).phaseDiff[0] = Above(0.0001);
  Add(800).phaseDiff[0] = 0.0001;
  EXPECT_EQ(SelectVco(1), 800.0);
  EXPECT_EQ(trace_, Clk0("0.000000") + kOneForClk0);

  (*this)[0].phaseDiff[0] = 0;
  (*this)[1].phaseDiff[0] = 0;
  (*this)[0].dutyDiff[0] = 0.0001;
  (*this)[1].dutyDiff[0] = Above(0.0001);
  EXPECT_EQ(SelectVco(1), 700.0);
  EXPECT_EQ(trace_, Clk0("0.000000") + kOneForClk0);
}

// The other outputs are not looked at, whatever is there.
TEST_F(ClosestSolutionTest, TheOnlyOneWithinTheSecondToleranceIsTaken) {
  AddThree();
  (*this)[0].phaseDiff = {Above(0.001), 0, 0, 0, 0, 0, 0};
  (*this)[1].phaseDiff = {0.001, 90, 90, 90, 90, 90, 90};
  (*this)[2].dutyDiff = {0.0011, 0, 0, 0, 0, 0, 0};
  EXPECT_EQ(SelectVco(7), 800.0);
  EXPECT_EQ(trace_,
            "DLL---- looking for the clk0 phase solutions with threshold = 0.000000\n"
            "DLL------- no matches for clk0, so try with higher threshold\n"
            "DLL---- looking for the clk0 phase solutions with threshold = 0.001000\n"
            "DLL------- only one exact solution for clk0, so use it\n");
}

std::string AttemptsOnClk0(int count) {
  std::string lines;
  for (int a = 0; a < count; ++a) {
    static constexpr const char* kFirst[] = {"0.000000", "0.001000", "0.010000", "0.100000",
                                             "0.500000"};
    // From the sixth attempt on 1.0, 1.5, ...
    char threshold[20];
    std::snprintf(threshold, sizeof threshold, "%d.%c00000", (a - 3) / 2, a % 2 == 0 ? '5' : '0');
    lines += Clk0(a < 5 ? kFirst[a] : threshold) + kNoClk0;
  }
  return lines;
}

TEST_F(ClosestSolutionTest, TheLastOf60TolerancesIs28) {
  Add(700).phaseDiff[0] = 28.0;
  EXPECT_EQ(SelectVco(1), 700.0);
  EXPECT_EQ(trace_, AttemptsOnClk0(59) + Clk0("28.000000") + kOneForClk0);

  (*this)[0].phaseDiff[0] = Above(28.0);
  EXPECT_EQ(Select(1), nullptr);
  EXPECT_EQ(trace_, AttemptsOnClk0(60));
  EXPECT_EQ(CountOf(Clk0("28.000000"), trace_), 1);
  EXPECT_EQ(CountOf(Clk0("27.500000"), trace_), 1);
  EXPECT_EQ(CountOf(Clk0("1.000000"), trace_), 1);
}

TEST_F(ClosestSolutionTest, EveryToleranceOfTheScheduleIsInclusive) {
  Add(700);
  const std::vector<double> schedule = {0.0001, 0.001, 0.01, 0.1, 0.5, 1.0, 1.5, 2.0, 20.0, 27.5};
  const std::vector<int> misses = {0, 1, 2, 3, 4, 5, 6, 7, 43, 58};
  for (std::size_t i = 0; i < schedule.size(); ++i) {
    (*this)[0].phaseDiff[0] = schedule[i];
    EXPECT_EQ(SelectVco(1), 700.0);
    EXPECT_EQ(CountOf(kNoClk0, trace_), misses[i]) << schedule[i];
    (*this)[0].phaseDiff[0] = Above(schedule[i]);
    EXPECT_EQ(SelectVco(1), 700.0);
    EXPECT_EQ(CountOf(kNoClk0, trace_), misses[i] + 1) << schedule[i];
  }
}

// The same number serves phases and duty cycles, and both have to hold.
TEST_F(ClosestSolutionTest, PhaseAndDutyCycleHaveToLieWithinTheTolerance) {
  Add(700).phaseDiff[0] = 0.05;
  Add(800).dutyDiff[0] = 0.3;
  VcoCandidate& both = Add(900);
  both.phaseDiff[0] = 0.008;
  both.dutyDiff[0] = 0.4;
  EXPECT_EQ(SelectVco(1), 700.0);
  EXPECT_EQ(CountOf(kNoClk0, trace_), 3);
  (*this)[0].phaseDiff[0] = 3;
  (*this)[1].phaseDiff[0] = 2;
  EXPECT_EQ(SelectVco(1), 900.0);
  EXPECT_EQ(CountOf(kNoClk0, trace_), 4);
}

TEST_F(ClosestSolutionTest, DifferencesThatAreNoNumbersAreNeverWithin) {
  Add(700).phaseDiff[0] = kNan;
  Add(800).dutyDiff[0] = kNan;
  EXPECT_EQ(Select(1), nullptr);
  EXPECT_EQ(trace_, AttemptsOnClk0(60));
}

TEST_F(ClosestSolutionTest, AnEmptyTableHasNoSolution) {
  EXPECT_EQ(Select(1), nullptr);
  EXPECT_EQ(trace_, AttemptsOnClk0(60));
}

TEST_F(ClosestSolutionTest, TheFirst100InSlotOrderAreGathered) {
  imp_.pll._preferMaxVco = true;
  Add(500).phaseDiff[0] = 1;  // not one of them
  for (int i = 0; i < 100; ++i) Add(600 + i);
  Add(900);
  EXPECT_EQ(SelectVco(1), 699.0);
  EXPECT_THAT(trace_, HasSubstr(NoOthers(100)));
  EXPECT_EQ(CountOf("DLL  _solutions[", trace_), 100);
  EXPECT_THAT(trace_, HasSubstr(Listed(0, "600.000")));
  EXPECT_THAT(trace_, HasSubstr(Listed(99, "699.000")));
}

TEST_F(ClosestSolutionTest, AFullTableFillsTheSolutions) {
  for (int slot = 0; slot < 1010; ++slot) engine_test::PutBare(table_, slot, 2000 - slot, 1);
  EXPECT_EQ(SelectVco(1), 2000 - 99);
  EXPECT_THAT(trace_, HasSubstr(NoOthers(100)));
}

TEST_F(ClosestSolutionTest, SolutionsOfAnEarlierRunAreGone) {
  AddThree();
  ASSERT_EQ(SelectVco(1), 700.0);
  table_.Empty(0);
  (*this)[2].phaseDiff[0] = 1;
  EXPECT_EQ(SelectVco(1), 800.0);
  EXPECT_EQ(trace_, Clk0("0.000000") + kOneForClk0);
}

TEST_F(ClosestSolutionTest, FewerSolutionsLeaveNoneOfAnEarlierRunBehindThem) {
  Add(800);
  Add(900);
  Add(600);
  ASSERT_EQ(SelectVco(1), 600.0);
  (*this)[2].phaseDiff[0] = 1;
  EXPECT_EQ(SelectVco(1), 800.0);
  EXPECT_THAT(trace_, HasSubstr(kPickBest + Listed(0, "800.000") + Listed(1, "900.000") +
                                kBestClk0));
}

TEST_F(ClosestSolutionTest, LeavesTheCandidates) {
  AddThree();
  (*this)[1].phaseDiff[1] = 0.6;
  (*this)[2].phaseDiff[1] = 90;
  ASSERT_EQ(SelectVco(2), 700.0);
  EXPECT_THAT(SlotsOf(table_.Occupied()), ElementsAre(0, kApart, 2 * kApart));
}

// --- Final choice by VCO -------------------------------------------------------------------

TEST_F(ClosestSolutionTest, APllEndsWithTheSmallestVco) {
  VcoCandidate& first = Add(800);
  first.phase[0] = 45;
  first.dutyCycle[0] = 0.5;
  Add(700).phase[0] = -11.25;
  EXPECT_EQ(SelectVco(1), 700.0);
  EXPECT_EQ(trace_,
            "DLL---- looking for the clk0 phase solutions with threshold = 0.000000\n"
            "DLL------- 2 solutions for clk0; no other oclks used\n"
            "DLL------ Multiple solutions found, so pick the best for clk0.\n"
            "DLL  _solutions[0] VCO = 800.000; clk0 phase = 45.000, dc = 0.500\n"
            "DLL  _solutions[1] VCO = 700.000; clk0 phase = -11.250, dc = 0.000\n"
            "DLL-------- looking for best clk0 solution\n"
            "DLL- narrowing down top choices for clk0\n"
            "DLL------ have 2 solutions after clk0 phase check\n"
            "DLL  _solutions[0] VCO = 800.000; clk0 phase = 45.000, dc = 0.500\n"
            "DLL  _solutions[1] VCO = 700.000; clk0 phase = -11.250, dc = 0.000\n"
            "DLL------ have 2 solutions after clk0 duty cycle check\n"
            "DLL  _solutions[0] VCO = 800.000; clk0 phase = 45.000, dc = 0.500\n"
            "DLL  _solutions[1] VCO = 700.000; clk0 phase = -11.250, dc = 0.000\n"
            "DLL------------ finding the smallest VCO\n");
}

TEST_F(ClosestSolutionTest, TheFirstOfEquallySmallVcosIsTaken) {
  Add(800);
  const VcoCandidate& first = Add(700);
  Add(700);
  EXPECT_EQ(Select(1), &first);
}

TEST_F(ClosestSolutionTest, EveryPrimitiveButATsynEndsWithTheSmallestVco) {
  imp_.pllLimits.vcoTarget = 900;
  AddThree();
  for (const int prim : {kPll, 2, -1}) {
    EXPECT_EQ(SelectVco(1, prim), 700.0) << prim;
    EXPECT_TRUE(trace_.ends_with(kSmallest));
  }
}

TEST_F(ClosestSolutionTest, ATsynEndsWithTheVcoClosestToItsTarget) {
  imp_.pllLimits.vcoTarget = 810;
  AddThree();
  EXPECT_EQ(SelectVco(1, kTsyn), 800.0);
  EXPECT_TRUE(trace_.ends_with(
      "DLL------------ finding the target VCO (closest to 810.000)\n"));
  EXPECT_THAT(trace_, Not(HasSubstr(kSmallest)));
  imp_.pllLimits.vcoTarget = 2000;
  EXPECT_EQ(SelectVco(1, kTsyn), 900.0);
  imp_.pllLimits.vcoTarget = 0;
  EXPECT_EQ(SelectVco(1, kTsyn), 700.0);
}

TEST_F(ClosestSolutionTest, TheFirstOfEquallyCloseVcosIsTaken) {
  imp_.pllLimits.vcoTarget = 1000;
  Add(1200);
  Add(1100);
  Add(900);
  EXPECT_EQ(SelectVco(1, kTsyn), 1100.0);
  (*this)[0].vco = 900;
  (*this)[1].vco = 1100;
  EXPECT_EQ(SelectVco(1, kTsyn), 900.0);
}

TEST_F(ClosestSolutionTest, ATargetThatIsNoNumberTakesTheFirst) {
  imp_.pllLimits.vcoTarget = kNan;
  AddThree();
  EXPECT_EQ(SelectVco(1, kTsyn), 700.0);
}

TEST_F(ClosestSolutionTest, PreferMaxVcoTakesTheLargestWithoutNarrowing) {
  imp_.pll._preferMaxVco = true;
  Add(800);
  const VcoCandidate& largest = Add(900);
  Add(900);
  Add(700);
  // Better than the others by output 0, which narrowing would see.
  for (const int index : {0, 1, 2}) (*this)[index].phaseDiff[0] = 0.09;
  (*this)[3].phaseDiff[0] = 0.02;
  for (const int prim : {kPll, kTsyn}) {
    EXPECT_EQ(Select(1, prim), &largest);
    const std::string list = Listed(0, "800.000") + Listed(1, "900.000") +
                             Listed(2, "900.000") + Listed(3, "700.000");
    EXPECT_EQ(trace_, AttemptsOnClk0(3) + Clk0("0.100000") + NoOthers(4) + kPickBest + list +
                          kBestClk0 + kLargest);
  }
}

TEST_F(ClosestSolutionTest, PreferMaxVcoLooksOnlyAtWhatTheFilterLeft) {
  imp_.pll._preferMaxVco = true;
  AddThree();
  (*this)[2].dutyDiff[1] = 0.51;
  EXPECT_EQ(SelectVco(2), 800.0);
}

// --- Filter by the other outputs -----------------------------------------------------------

TEST_F(ClosestSolutionTest, TheFilterKeepsWhatLiesWithinHalfADegreeAtOnce) {
  AddThree();
  (*this)[0].phaseDiff[1] = 0.5;
  (*this)[1].phaseDiff[1] = Above(0.5);
  (*this)[2].dutyDiff[1] = 0.0;
  imp_.pll._preferMaxVco = true;
  EXPECT_EQ(SelectVco(2), 900.0);
  EXPECT_EQ(trace_, Clk0("0.000000") + CheckOthers(3) + Clk(1) + SeveralForClk(2, 1) +
                        kPickBest + Listed(0, "700.000") + Listed(2, "900.000") + kBestClk0 +
                        kLargest);
}

TEST_F(ClosestSolutionTest, TheFilterIsWrittenOutWhole) {
  AddThree();
  imp_.pll._preferMaxVco = true;
  (*this)[1].phaseDiff[1] = 0.6;
  (*this)[0].phaseDiff[2] = 20;
  (*this)[2].dutyDiff[2] = 0.75;
  EXPECT_EQ(SelectVco(3), 900.0);
  EXPECT_EQ(trace_,
            "DLL---- looking for the clk0 phase solutions with threshold = 0.000000\n"
            "DLL------- 3 solutions for clk0, so check other outclks\n"
            "DLL-------- looking for clk1 phase solutions with threshold2 = 0.000000\n"
            "DLL--------- 2 solutions for clk1, so test other oclks\n"
            "DLL-------- looking for clk2 phase solutions with threshold2 = 0.000000\n"
            "DLL--------- no matches for clk2, so try with higher threshold\n"
            "DLL--------- no matches for clk2, so try with higher threshold\n"
            "DLL--------- no matches for clk2, so try with higher threshold\n"
            "DLL--------- no matches for clk2, so try with higher threshold\n"
            "DLL--------- no matches for clk2, so try with higher threshold\n"
            "DLL--------- only one exact solution left, so use it\n"
            "DLL------ Multiple solutions found, so pick the best for clk0.\n"
            "DLL  _solutions[2] VCO = 900.000; clk0 phase = 0.000, dc = 0.000\n"
            "DLL-------- looking for best clk0 solution\n"
            "DLL----------- finding the largest VCO\n");
}

// 0.5, 0.001, 0.01, 0.1, 0.5, 1.0, 1.5, ... 28.0: after the first no tolerance below 0.5 can
// meet anything that it did not, and the sixth is the first larger one.
TEST_F(ClosestSolutionTest, TheToleranceOfTheFilterStartsOver) {
  imp_.pll._preferMaxVco = true;
  const std::vector<double> schedule = {0.5, 1.0, 1.5, 2.0, 14.5, 27.5};
  const std::vector<int> misses = {0, 5, 6, 7, 32, 58};
  AddThree();
  for (std::size_t i = 0; i < schedule.size(); ++i) {
    for (const int index : {0, 1, 2}) (*this)[index].phaseDiff[3] = schedule[i];
    EXPECT_EQ(SelectVco(4), 900.0);
    EXPECT_EQ(CountOf(NoClk(3), trace_), misses[i]) << schedule[i];
    (*this)[2].phaseDiff[3] = Above(schedule[i]);
    EXPECT_EQ(SelectVco(4), 800.0);
    EXPECT_EQ(CountOf(NoClk(3), trace_), misses[i]) << schedule[i];
    for (const int index : {0, 1}) (*this)[index].phaseDiff[3] = 90;
    EXPECT_EQ(SelectVco(4), 900.0);
    EXPECT_EQ(CountOf(NoClk(3), trace_), schedule[i] == 0.5 ? 5 : misses[i] + 1) << schedule[i];
    EXPECT_THAT(trace_, HasSubstr(kOneLeft));
  }
}

TEST_F(ClosestSolutionTest, TheLastToleranceOfTheFilterIs28) {
  AddThree();
  for (const int index : {0, 1, 2}) (*this)[index].phaseDiff[1] = 28.0;
  EXPECT_EQ(SelectVco(2), 700.0);
  EXPECT_EQ(CountOf(NoClk(1), trace_), 59);
}

TEST_F(ClosestSolutionTest, AFilterThatMeetsNothingEmptiesTheTable) {
  AddThree();
  for (const int index : {0, 1, 2}) (*this)[index].phaseDiff[1] = Above(28.0);
  EXPECT_EQ(Select(3), nullptr);
  const std::string filtered = Clk0("0.000000") + CheckOthers(3) + Clk(1) +
                               Repeat(NoClk(1), 60) + Clk(2) + Repeat(NoClk(2), 60) + kPickBest +
                               kBestClk0;
  EXPECT_EQ(trace_, filtered + Narrowing(0) + Narrowing(1) + Narrowing(2) + kSmallest);

  EXPECT_EQ(Select(3, kTsyn), nullptr);
  EXPECT_EQ(trace_, filtered + Narrowing(0) + Narrowing(1) + Narrowing(2) +
                        "DLL------------ finding the target VCO (closest to 0.000)\n");

  imp_.pll._preferMaxVco = true;
  EXPECT_EQ(Select(3), nullptr);
  EXPECT_EQ(trace_, filtered + kLargest);
}

TEST_F(ClosestSolutionTest, TheFilterGoesOnWithOneSolution) {
  AddThree();
  (*this)[0].phaseDiff[1] = 3;
  (*this)[1].dutyDiff[1] = 0.7;
  (*this)[2].phaseDiff[2] = 1;
  EXPECT_EQ(SelectVco(4), 900.0);
  EXPECT_EQ(trace_, Clk0("0.000000") + CheckOthers(3) + Clk(1) + kOneLeft + Clk(2) +
                        Repeat(NoClk(2), 5) + kOneLeft + Clk(3) + kOneLeft + kPickBest +
                        Listed(2, "900.000") + kBestClk0 + Narrowing(0) + Unique(0, "phase"));
}

// The last one left fails a later output altogether.
TEST_F(ClosestSolutionTest, TheFilterMayLoseItsLastSolution) {
  AddThree();
  (*this)[0].phaseDiff[1] = 3;
  (*this)[1].phaseDiff[1] = 3;
  (*this)[2].phaseDiff[2] = 40;
  EXPECT_EQ(Select(3), nullptr);
}

TEST_F(ClosestSolutionTest, TheFilterKeepsDifferencesThatAreNoNumbers) {
  AddThree();
  (*this)[0].phaseDiff[1] = kNan;
  (*this)[1].dutyDiff[1] = kNan;
  (*this)[2].phaseDiff[1] = 1;
  EXPECT_EQ(SelectVco(2), 800.0) << "whose phase is exact; narrowing has no use for NaN";
  EXPECT_THAT(trace_, HasSubstr(Clk(1) + SeveralForClk(2, 1)));
  (*this)[0].dutyDiff[1] = 0.6;
  (*this)[1].phaseDiff[1] = 0.6;
  EXPECT_EQ(SelectVco(2), 700.0) << "all three at 1.0, and no phase equals 0";
  EXPECT_THAT(trace_, HasSubstr(Repeat(NoClk(1), 5) + SeveralForClk(3, 1)));
}

// --- Narrowing on output 0 -----------------------------------------------------------------

TEST_F(ClosestSolutionTest, Output0IsNarrowedByPhase) {
  Add(700).phaseDiff[0] = 0.05;
  Add(800).phaseDiff[0] = 0.02;
  Add(900).phaseDiff[0] = 0.03;
  EXPECT_EQ(SelectVco(1), 800.0);
  EXPECT_EQ(trace_, AttemptsOnClk0(3) + Clk0("0.100000") + NoOthers(3) + kPickBest +
                        Listed(0, "700.000") + Listed(1, "800.000") + Listed(2, "900.000") +
                        kBestClk0 + Narrowing(0) +
                        "DLL------ using the unique clk0 solution with the closest phase\n");
}

TEST_F(ClosestSolutionTest, Output0IsNarrowedByDutyCycleAmongTheBestPhases) {
  Add(600).phaseDiff[0] = 0.06;  // the best duty cycle, but not among the best phases
  Add(700).dutyDiff[0] = 0.05;
  Add(800).dutyDiff[0] = 0.02;
  EXPECT_EQ(SelectVco(1), 800.0);
  const std::string list = Listed(1, "700.000") + Listed(2, "800.000");
  EXPECT_EQ(trace_, AttemptsOnClk0(3) + Clk0("0.100000") + NoOthers(3) + kPickBest +
                        Listed(0, "600.000") + list + kBestClk0 + Narrowing(0) +
                        AfterPhase(2, 0) + list +
                        "DLL------ using the unique clk0 solution with the closest phase and "
                        "closest duty cycle\n");
}

TEST_F(ClosestSolutionTest, Output0HasNoFrequencyPass) {
  AddThree();
  (*this)[2].freqDiff[0] = 0;
  (*this)[0].freqDiff[0] = 50;
  (*this)[1].freqDiff[0] = 60;
  EXPECT_EQ(SelectVco(1), 700.0);
  EXPECT_THAT(trace_, HasSubstr(Narrowing(0) + AfterPhase(3, 0)));
}

TEST_F(ClosestSolutionTest, TheVcoChoiceSeesOnlyWhatNarrowingLeft) {
  AddThree();
  (*this)[0].dutyDiff[0] = 0.05;
  for (const int index : {1, 2}) (*this)[index].dutyDiff[0] = 0.03;
  EXPECT_EQ(SelectVco(1), 800.0);
  const std::string left = Listed(1, "800.000") + Listed(2, "900.000");
  EXPECT_TRUE(trace_.ends_with(AfterDuty(2, 0) + left + kSmallest));
}

// --- Narrowing on the other outputs --------------------------------------------------------

TEST_F(ClosestSolutionTest, AnotherOutputIsNarrowedByFrequency) {
  AddThree();
  (*this)[0].freqDiff[1] = 1.0;
  (*this)[1].freqDiff[1] = 0.5;
  (*this)[2].freqDiff[1] = 0.6;
  EXPECT_EQ(SelectVco(2), 800.0);
  const std::string all =
      Listed(0, "700.000") + Listed(1, "800.000") + Listed(2, "900.000");
  EXPECT_EQ(trace_, Clk0("0.000000") + CheckOthers(3) + Clk(1) + SeveralForClk(3, 1) + kPickBest +
                        all + kBestClk0 + Narrowing(0) + AfterPhase(3, 0) + all +
                        AfterDuty(3, 0) + all + Narrowing(1) +
                        "DLL------ using the unique clk1 solution with the closest outFreq\n");
}

TEST_F(ClosestSolutionTest, AnotherOutputIsNarrowedByPhase) {
  AddThree();
  (*this)[0].freqDiff[1] = 2;
  for (const int index : {1, 2}) (*this)[index].freqDiff[1] = 1;
  (*this)[1].phaseDiff[1] = 0.3;
  (*this)[2].phaseDiff[1] = 0.2;
  EXPECT_EQ(SelectVco(2), 900.0);
  const std::string left = Listed(1, "800.000") + Listed(2, "900.000");
  EXPECT_TRUE(trace_.ends_with(Narrowing(1) +
                               "DLL--------- have 2 solutions after clk1 divN check\n" + left +
                               "DLL------ using the unique clk1 solution with the closest phase\n"))
      << trace_;
}

TEST_F(ClosestSolutionTest, AnotherOutputIsNarrowedByDutyCycle) {
  AddThree();
  (*this)[0].dutyDiff[1] = 0.3;
  (*this)[1].dutyDiff[1] = 0.2;
  (*this)[2].dutyDiff[1] = 0.1;
  EXPECT_EQ(SelectVco(2), 900.0);
  const std::string all =
      Listed(0, "700.000") + Listed(1, "800.000") + Listed(2, "900.000");
  EXPECT_TRUE(trace_.ends_with(Narrowing(1) + AfterDivN(3, 1) + all + AfterPhase(3, 1) + all +
                               Unique(1, "phase and closest duty cycle")))
      << trace_;
}

TEST_F(ClosestSolutionTest, WithoutAUniqueSolutionTheNextOutputIsNarrowed) {
  AddThree();
  (*this)[0].freqDiff[1] = 2;
  (*this)[1].freqDiff[2] = 2;
  (*this)[0].freqDiff[2] = 0;
  EXPECT_EQ(SelectVco(3), 900.0);
  const std::string left = Listed(1, "800.000") + Listed(2, "900.000");
  EXPECT_TRUE(trace_.ends_with(Narrowing(1) + AfterDivN(2, 1) + left + AfterPhase(2, 1) + left +
                               AfterDuty(2, 1) + left + Narrowing(2) + Unique(2, "outFreq")))
      << trace_;
}

TEST_F(ClosestSolutionTest, NarrowingGoesOverAllOutputsBeforeTheVco) {
  AddThree();
  EXPECT_EQ(SelectVco(7), 700.0);
  const std::string all =
      Listed(0, "700.000") + Listed(1, "800.000") + Listed(2, "900.000");
  std::string expected = Clk0("0.000000") + CheckOthers(3);
  for (int n = 1; n < 7; ++n) expected += Clk(n) + SeveralForClk(3, n);
  expected += kPickBest + all + kBestClk0 + Narrowing(0) + AfterPhase(3, 0) + all +
              AfterDuty(3, 0) + all;
  for (int n = 1; n < 7; ++n) {
    expected += Narrowing(n) + AfterDivN(3, n) + all + AfterPhase(3, n) + all + AfterDuty(3, n) +
                all;
  }
  EXPECT_EQ(trace_, expected + kSmallest);
}

// --- The best value of the frequency pass goes on into the phase pass -----------------------

TEST_F(ClosestSolutionTest, PhasesAboveTheBestFrequencyDifferenceEndTheNarrowing) {
  AddThree();
  (*this)[0].phaseDiff[1] = 0.3;
  (*this)[1].phaseDiff[1] = 0.2;
  (*this)[2].phaseDiff[1] = 0.1;
  EXPECT_EQ(SelectVco(2), 700.0) << "phases of output 1 do not count, nor does its duty cycle";
  const std::string all =
      Listed(0, "700.000") + Listed(1, "800.000") + Listed(2, "900.000");
  EXPECT_TRUE(trace_.ends_with(Narrowing(1) + AfterDivN(3, 1) + all + kSmallest)) << trace_;
}

TEST_F(ClosestSolutionTest, AfterSuchAnEndTheNextOutputSeesWhatTheFrequencyPassLeft) {
  AddThree();
  (*this)[0].freqDiff[1] = 0.05;  // dropped by the frequency pass
  for (const int index : {0, 1, 2}) (*this)[index].phaseDiff[1] = 0.3;
  (*this)[1].freqDiff[2] = 0.5;
  (*this)[2].freqDiff[2] = 0.4;
  EXPECT_EQ(SelectVco(3), 900.0);
  EXPECT_TRUE(trace_.ends_with(Narrowing(1) + AfterDivN(2, 1) + Listed(1, "800.000") +
                               Listed(2, "900.000") + Narrowing(2) + Unique(2, "outFreq")))
      << trace_;
}

// The frequency pass ends with the best value 0.05, found at the first solution. In the phase
// pass only the last one is marked, because it equals that; so it is the one, not the first.
TEST_F(ClosestSolutionTest, AUniqueSolutionMayOnlyEqualTheBestFrequencyDifference) {
  AddThree();
  for (const int index : {0, 1, 2}) (*this)[index].freqDiff[1] = 0.05;
  (*this)[0].phaseDiff[1] = 0.2;
  (*this)[1].phaseDiff[1] = 0.3;
  (*this)[2].phaseDiff[1] = 0.05;
  EXPECT_EQ(SelectVco(2), 900.0);
  EXPECT_TRUE(trace_.ends_with(AfterDivN(3, 1) + Listed(0, "700.000") + Listed(1, "800.000") +
                               Listed(2, "900.000") + Unique(1, "phase")))
      << trace_;
}

// Near is b - 0.0001 <= x <= b + 0.0001 on doubles. 0.05 + 0.0001 is such a sum of which the
// distance from 0.05 is more than 0.0001.
TEST_F(ClosestSolutionTest, NearTheBestIsMeasuredByItsEnds) {
  volatile double best = 0.05;
  volatile double near = 0.0001;
  const double upper = best + near;
  ASSERT_GT(upper - best, near);
  AddThree();
  for (const int index : {0, 1, 2}) (*this)[index].freqDiff[1] = best;
  (*this)[0].phaseDiff[1] = 0.2;
  (*this)[1].phaseDiff[1] = upper;
  (*this)[2].phaseDiff[1] = Above(upper);
  EXPECT_EQ(SelectVco(2), 800.0);
  EXPECT_TRUE(trace_.ends_with(Unique(1, "phase")));
  (*this)[1].phaseDiff[1] = Above(upper);
  EXPECT_EQ(SelectVco(2), 700.0) << "none is near";
  EXPECT_TRUE(trace_.ends_with(kSmallest));
}

// The lower end: at it a value is as good as the best and leaves the best as it is; below it
// the value is the new best, alone.
TEST_F(ClosestSolutionTest, JustBelowTheBestIsAsGoodAndFartherBelowIsBetter) {
  volatile double best = 0.05;
  volatile double near = 0.0001;
  const double lower = best - near;
  AddThree();
  (*this)[0].freqDiff[1] = best;
  (*this)[1].freqDiff[1] = lower;
  (*this)[2].freqDiff[1] = 2;
  EXPECT_EQ(SelectVco(2), 700.0);
  EXPECT_THAT(trace_, HasSubstr(AfterDivN(2, 1)));
  (*this)[1].freqDiff[1] = Below(lower);
  EXPECT_EQ(SelectVco(2), 800.0);
  EXPECT_THAT(trace_, HasSubstr(Unique(1, "outFreq")));
}

// 0.5; 0.49995 is as good, and does not move the best; 0.49985 is better than 0.5 by more than
// 0.0001 and stands alone, although 0.49995 is as near to it.
TEST_F(ClosestSolutionTest, ValuesAreHeldAgainstTheBestAndNotAgainstEachOther) {
  AddThree();
  (*this)[0].freqDiff[1] = 0.5;
  (*this)[1].freqDiff[1] = 0.49995;
  (*this)[2].freqDiff[1] = 0.49985;
  EXPECT_EQ(SelectVco(2), 900.0);
  EXPECT_THAT(trace_, HasSubstr(Unique(1, "outFreq")));
  // The other way round 0.4999 is as good as the best before it, and 0.5 is not.
  (*this)[0].freqDiff[1] = 0.49985;
  (*this)[1].freqDiff[1] = 0.4999;
  (*this)[2].freqDiff[1] = 0.5;
  EXPECT_EQ(SelectVco(2), 700.0);
  EXPECT_THAT(trace_, HasSubstr(AfterDivN(2, 1)));
}

TEST_F(ClosestSolutionTest, APhaseBelowTheBestFrequencyDifferenceIsTheNewBest) {
  AddThree();
  for (const int index : {0, 1, 2}) (*this)[index].freqDiff[1] = 0.2;
  (*this)[0].phaseDiff[1] = 0.2;   // equals 0.2
  (*this)[1].phaseDiff[1] = 0.1;   // clears the mark of the first
  (*this)[2].phaseDiff[1] = 0.15;  // no longer good enough
  EXPECT_EQ(SelectVco(2), 800.0);
  EXPECT_TRUE(trace_.ends_with(Unique(1, "phase")));
}

// The duty pass does start over: it would find nothing with a best value of 0.
TEST_F(ClosestSolutionTest, TheDutyPassStartsOver) {
  AddThree();
  for (const int index : {0, 1, 2}) (*this)[index].dutyDiff[1] = 0.4;
  (*this)[1].dutyDiff[1] = 0.3;
  EXPECT_EQ(SelectVco(2), 800.0);
  EXPECT_TRUE(trace_.ends_with(Unique(1, "phase and closest duty cycle")));
}

// --- The starting value of 100 -------------------------------------------------------------

TEST_F(ClosestSolutionTest, FrequenciesFarOffEndTheNarrowingBeforeThePhasePass) {
  AddThree();
  for (const int index : {0, 1, 2}) (*this)[index].freqDiff[1] = Above(100.0 + 0.0001);
  (*this)[2].phaseDiff[1] = 0.0;
  (*this)[0].phaseDiff[1] = 0.1;
  (*this)[1].phaseDiff[1] = 0.1;
  EXPECT_EQ(SelectVco(2), 700.0);
  EXPECT_TRUE(trace_.ends_with(Narrowing(1) + kSmallest)) << trace_;
}

TEST_F(ClosestSolutionTest, AFrequencyDifferenceNear100EqualsTheStartingValue) {
  AddThree();
  (*this)[0].freqDiff[1] = 150;
  (*this)[1].freqDiff[1] = 100.0 + 0.0001;
  (*this)[2].freqDiff[1] = Above(100.0 + 0.0001);
  EXPECT_EQ(SelectVco(2), 800.0);
  EXPECT_TRUE(trace_.ends_with(Narrowing(1) + Unique(1, "outFreq"))) << trace_;
  (*this)[0].freqDiff[1] = 100;
  EXPECT_EQ(SelectVco(2), 700.0);
  EXPECT_THAT(trace_, HasSubstr(Narrowing(1) + AfterDivN(2, 1)));
  (*this)[2].freqDiff[1] = 99;
  EXPECT_EQ(SelectVco(2), 900.0);
}

TEST_F(ClosestSolutionTest, IsSilentWithTheTraceOff) {
  AddThree();
  (*this)[2].phaseDiff[1] = 0.6;
  const std::string text = engine_test::TraceOf(
      [&](const Trace& trace) {
        Ip::Pll::SelectPhaseSolution(imp_, {100, 3, kPll, trace});
        Ip::Pll::SelectPhaseSolution(imp_, {100, 1, kTsyn, trace});
        imp_.pll._preferMaxVco = true;
        Ip::Pll::SelectPhaseSolution(imp_, {100, 3, kPll, trace});
        table_.EmptyAll();
        Ip::Pll::SelectPhaseSolution(imp_, {100, 3, kPll, trace});
      },
      false);
  EXPECT_EQ(text, "");
}

}  // namespace
