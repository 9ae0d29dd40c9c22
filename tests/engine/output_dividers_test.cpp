// Tests of the search for the dividers of outputs 1 and later.

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <climits>
#include <cstdio>
#include <string>

#include "engine/pll/OutputDividers.h"
#include "engine/pll/Stages.h"
#include "tests/engine/EngineTest.h"

namespace {

using engine_test::Above;
using engine_test::Below;
using engine_test::CountOf;
using engine_test::kInfinity;
using engine_test::kNan;
using engine_test::PutBare;
using engine_test::SlotsOf;
using Ip::Trace;
using Ip::VorkelImp;
using Ip::Pll::VcoCandidateTable;
using testing::ElementsAre;
using testing::IsEmpty;

// The lines of the first `count` tolerances at which output n has no divider.
std::string Retries(int n, int count) {
  std::string lines;
  for (int i = 1; i <= count; ++i) {
    char line[100];
    std::snprintf(line, sizeof line,
                  "DLL------ Can't find a clkout%d_divide, so upping threshold to 0.%02d0!\n", n,
                  i);
    lines += line;
  }
  return lines;
}

std::string Looking(int n) {
  return "DLL----- Looking for valid div" + std::to_string(n) + " from remaining VCOs\n";
}

std::string GivenUp(int n) {
  return Looking(n) + Retries(n, 27) + "DLL-- Can't find a clkout" + std::to_string(n) +
         "_divide for all possible thresholds!\n";
}

class OutputDividersTest : public testing::Test {
 protected:
  OutputDividersTest() {
    imp_.pllLimits.clkoutMin = 3.125;
    imp_.pllLimits.clkoutMax = 400;
    imp_.pllLimits.clkoutMaxIo = 1080;
  }

  // Requests from output 1 on.
  void Request(double first, double second = 0.0, double third = 0.0) {
    imp_.requests.reqOutFreq = {0, first, second, third, 0, 0, 0};
  }

  bool Find(int count) {
    bool found = false;
    trace_ = engine_test::TraceOf([&](const Trace& trace) {
      found = Ip::Pll::FindOutputDividers(imp_, {100, count, prim_, trace});
    });
    return found;
  }

  // Whether one candidate of this VCO serves output 1 at this frequency; 2 outputs.
  bool Serves(double vco, double requested) {
    table_.EmptyAll();
    PutBare(table_, 0, vco, 1);
    Request(requested);
    return Find(2);
  }

  int prim_ = Ip::Pll::kPll;
  VorkelImp& imp_ = engine_test::NewImp();
  VcoCandidateTable& table_ = imp_.pll._vcoCandidates;
  std::string trace_;
};

TEST_F(OutputDividersTest, ASingleOutputNeedsNoWork) {
  PutBare(table_, 4, 400, 4);
  for (const int count : {1, 0, -1, INT_MIN}) {
    EXPECT_TRUE(Find(count)) << count;
    EXPECT_EQ(trace_, "");
  }
  table_.EmptyAll();
  EXPECT_TRUE(Find(1)) << "even with no candidate";
}

TEST_F(OutputDividersTest, ExactDividers) {
  for (const int div0 : {2, 3, 4, 5}) PutBare(table_, div0 - 1, 200 * div0, div0);
  Request(50);
  EXPECT_TRUE(Find(2));
  EXPECT_THAT(SlotsOf(table_.Occupied()), ElementsAre(1, 2, 3, 4));
  EXPECT_EQ(table_[1].divN[1], 8u);
  EXPECT_EQ(table_[4].divN[1], 20u);
  EXPECT_EQ(table_[4].freqDiff[1], 0.0);
  EXPECT_EQ(trace_,
            "DLL----- Looking for valid div1 from remaining VCOs\n"
            "DLL ---------- for VCO = 400.000000: div1 = 8\n"
            "DLL ---------- for VCO = 600.000000: div1 = 12\n"
            "DLL ---------- for VCO = 800.000000: div1 = 16\n"
            "DLL ---------- for VCO = 1000.000000: div1 = 20\n");
}

TEST_F(OutputDividersTest, AnExactOneDropsTheInexactOnes) {
  PutBare(table_, 3, 400, 4);
  PutBare(table_, 4, 450, 4.5);
  Request(100);
  EXPECT_TRUE(Find(2));
  EXPECT_THAT(SlotsOf(table_.Occupied()), ElementsAre(3));
}

// 450 / 100 = 4.5 rounds to 5: 90 MHz is off by 0.1 of the request. Ten steps of 0.01 add up
// to one unit in the last place less than 0.1, so it takes the eleventh.
TEST_F(OutputDividersTest, TheToleranceAddsUpStepByStep) {
  EXPECT_TRUE(Serves(450, 100));
  EXPECT_EQ(trace_, Looking(1) + Retries(1, 11) +
                        "DLL ---------- for VCO = 450.000000: div1 = 5 (diff = 10.000)\n");
  EXPECT_EQ(table_[0].divN[1], 5u);
  EXPECT_EQ(table_[0].freqDiff[1], 10.0);
}

// 104, 101 and 102.5 MHz for 100: at 0.01 only 101 serves, and the others are not asked again.
TEST_F(OutputDividersTest, TheFirstToleranceThatServesAnyDecides) {
  PutBare(table_, 0, 104, 1);
  PutBare(table_, 1, 101, 1);
  PutBare(table_, 2, 102.5, 1);
  Request(100);
  EXPECT_TRUE(Find(2));
  EXPECT_THAT(SlotsOf(table_.Occupied()), ElementsAre(1));
  EXPECT_EQ(trace_, Looking(1) + Retries(1, 1) +
                        "DLL ---------- for VCO = 101.000000: div1 = 1 (diff = 1.000)\n");
}

TEST_F(OutputDividersTest, AllThatServeAtThatToleranceStay) {
  PutBare(table_, 0, 104.5, 1);
  PutBare(table_, 1, 95.25, 1);
  PutBare(table_, 2, 94, 1);
  PutBare(table_, 3, 104.125, 1);
  Request(100);
  EXPECT_TRUE(Find(2));
  EXPECT_THAT(SlotsOf(table_.Occupied()), ElementsAre(0, 1, 3));
  EXPECT_EQ(trace_, Looking(1) + Retries(1, 5) +
                        "DLL ---------- for VCO = 104.500000: div1 = 1 (diff = 4.500)\n"
                        "DLL ---------- for VCO = 95.250000: div1 = 1 (diff = 4.750)\n"
                        "DLL ---------- for VCO = 104.125000: div1 = 1 (diff = 4.125)\n");
}

TEST_F(OutputDividersTest, TheDividerIsTheNearestWholeNumberHalvesUp) {
  // 7.5 gives 8: 750 / 8 = 93.75; just below 7.5 gives 7.
  ASSERT_TRUE(Serves(750, 100));
  EXPECT_EQ(table_[0].divN[1], 8u);
  ASSERT_TRUE(Serves(Below(750), 100));
  EXPECT_EQ(table_[0].divN[1], 7u);
}

TEST_F(OutputDividersTest, TheDifferenceIsToTheRequestAndOfTheRequest) {
  // 98 for 100 is off by 0.02 of 100 and more than that of 98.
  EXPECT_TRUE(Serves(98, 100));
  EXPECT_EQ(CountOf("upping", trace_), 2);
}

// --- The end of the tolerances ---------------------------------------------------------------

TEST_F(OutputDividersTest, TheLastOf27TolerancesIs26Hundredths) {
  imp_.pllLimits.clkoutMin = 0;
  EXPECT_TRUE(Serves(74, 100));
  EXPECT_EQ(trace_, Looking(1) + Retries(1, 26) +
                        "DLL ---------- for VCO = 74.000000: div1 = 1 (diff = 26.000)\n");
  EXPECT_FALSE(Serves(73.5, 100));
  EXPECT_EQ(trace_, GivenUp(1));
}

TEST_F(OutputDividersTest, TheLastToleranceIsInclusive) {
  imp_.pllLimits.clkoutMin = 0;
  volatile double tolerance = 0.0;
  for (int i = 0; i < 26; ++i) tolerance = tolerance + 0.01;
  // The smallest VCO that is still within it for 1 MHz; 1 - vco is exact.
  double vco = 1.0 - tolerance;
  if (1.0 - vco > tolerance) vco = Above(vco);
  ASSERT_LE(1.0 - vco, tolerance);
  ASSERT_GT(1.0 - Below(vco), tolerance);
  EXPECT_TRUE(Serves(vco, 1));
  EXPECT_FALSE(Serves(Below(vco), 1));
}

TEST_F(OutputDividersTest, GivingUpLeavesTheTable) {
  PutBare(table_, 0, 400, 1);
  PutBare(table_, 9, 900, 2);
  Request(2000);
  EXPECT_FALSE(Find(2));
  EXPECT_EQ(trace_, GivenUp(1));
  EXPECT_THAT(SlotsOf(table_.Occupied()), ElementsAre(0, 9));
  EXPECT_EQ(table_[0].divN[1], 0u);
  EXPECT_EQ(table_[0].freqDiff[1], 0.0);
}

TEST_F(OutputDividersTest, AnEmptyTableServesNoOutput) {
  Request(50);
  EXPECT_FALSE(Find(2));
  EXPECT_EQ(trace_, GivenUp(1));
}

TEST_F(OutputDividersTest, EveryToleranceIsInclusive) {
  volatile double tolerance = 0.0;
  for (int number = 0; number < 27; ++number) {
    EXPECT_EQ(Ip::Pll::Tolerance(number), tolerance);
    EXPECT_EQ(Ip::Pll::FirstTolerance(tolerance), number);
    EXPECT_EQ(Ip::Pll::FirstTolerance(Above(tolerance)), number + 1);
    tolerance = tolerance + 0.01;
  }
  EXPECT_EQ(Ip::Pll::kTolerances, 27);
}

TEST_F(OutputDividersTest, ErrorsThatAreNoFractionsHaveTheFirstToleranceOrNone) {
  EXPECT_EQ(Ip::Pll::FirstTolerance(-5), 0);
  EXPECT_EQ(Ip::Pll::FirstTolerance(-1e300), 0);
  EXPECT_EQ(Ip::Pll::FirstTolerance(-kInfinity), 0);
  EXPECT_EQ(Ip::Pll::FirstTolerance(-0.0), 0);
  EXPECT_EQ(Ip::Pll::FirstTolerance(5e-324), 1);
  EXPECT_EQ(Ip::Pll::FirstTolerance(1), 27);
  EXPECT_EQ(Ip::Pll::FirstTolerance(1e300), 27);
  EXPECT_EQ(Ip::Pll::FirstTolerance(kInfinity), 27);
  EXPECT_EQ(Ip::Pll::FirstTolerance(kNan), 27);
}

// Against the walk from tolerance to tolerance, on a grid that meets none of them exactly.
TEST_F(OutputDividersTest, TheFirstToleranceIsThatOfTheWalk) {
  for (int i = 0; i < 3000; ++i) {
    const double error = i * 1.0001e-4;
    int number = 0;
    double tolerance = 0.0;
    while (number < 27 && !(error <= tolerance)) {
      tolerance += 0.01;
      ++number;
    }
    EXPECT_EQ(Ip::Pll::FirstTolerance(error), number) << error;
  }
}

// --- Several outputs -------------------------------------------------------------------------

TEST_F(OutputDividersTest, EachOutputWorksOnWhatTheLastOneLeft) {
  // 50: all but 630. 75 (tolerance 0): 600 and 900. 40 (0): 400, 600, 800 would do; 600 is left.
  PutBare(table_, 0, 400, 1);
  PutBare(table_, 1, 600, 1);
  PutBare(table_, 2, 630, 1);
  PutBare(table_, 3, 800, 1);
  PutBare(table_, 4, 900, 1);
  Request(50, 75, 40);
  EXPECT_TRUE(Find(4));
  EXPECT_THAT(SlotsOf(table_.Occupied()), ElementsAre(1));
  EXPECT_THAT(table_[1].divN, ElementsAre(0, 12, 8, 15, 0, 0, 0));
  EXPECT_EQ(trace_, Looking(1) +
                        "DLL ---------- for VCO = 400.000000: div1 = 8\n"
                        "DLL ---------- for VCO = 600.000000: div1 = 12\n"
                        "DLL ---------- for VCO = 800.000000: div1 = 16\n"
                        "DLL ---------- for VCO = 900.000000: div1 = 18\n" +
                        Looking(2) +
                        "DLL ---------- for VCO = 600.000000: div2 = 8\n"
                        "DLL ---------- for VCO = 900.000000: div2 = 12\n" +
                        Looking(3) + "DLL ---------- for VCO = 600.000000: div3 = 15\n");
}

TEST_F(OutputDividersTest, TheToleranceStartsAgainForEachOutput) {
  PutBare(table_, 0, 450, 1);
  Request(100, 45);
  EXPECT_TRUE(Find(3));
  EXPECT_EQ(trace_, Looking(1) + Retries(1, 11) +
                        "DLL ---------- for VCO = 450.000000: div1 = 5 (diff = 10.000)\n" +
                        Looking(2) + "DLL ---------- for VCO = 450.000000: div2 = 10\n");
}

TEST_F(OutputDividersTest, ALaterOutputThatFailsLeavesWhatTheEarlierOnesDid) {
  PutBare(table_, 0, 400, 1);
  PutBare(table_, 1, 425, 1);
  PutBare(table_, 2, 800, 1);
  Request(200, 1900);
  EXPECT_FALSE(Find(3));
  EXPECT_THAT(SlotsOf(table_.Occupied()), ElementsAre(0, 2));
  EXPECT_EQ(table_[2].divN[1], 4u);
  EXPECT_EQ(table_[2].divN[2], 0u);
  EXPECT_EQ(trace_, Looking(1) +
                        "DLL ---------- for VCO = 400.000000: div1 = 2\n"
                        "DLL ---------- for VCO = 800.000000: div1 = 4\n" +
                        GivenUp(2));
}

TEST_F(OutputDividersTest, AllSixFurtherOutputs) {
  PutBare(table_, 0, 960, 1);
  imp_.requests.reqOutFreq = {0, 480, 320, 240, 192, 160, 7.5};
  EXPECT_TRUE(Find(7));
  EXPECT_THAT(table_[0].divN, ElementsAre(0, 2, 3, 4, 5, 6, 128));
}

TEST_F(OutputDividersTest, ANewSearchOverwritesTheDividersOfAnEarlierOne) {
  PutBare(table_, 0, 400, 1);
  table_[0].divN[1] = 99;
  table_[0].freqDiff[1] = 9.9;
  Request(50);
  EXPECT_TRUE(Find(2));
  EXPECT_EQ(table_[0].divN[1], 8u);
  EXPECT_EQ(table_[0].freqDiff[1], 0.0);
}

// --- Limits ----------------------------------------------------------------------------------

TEST_F(OutputDividersTest, TheOutputMinimumIsInclusive) {
  imp_.pllLimits.clkoutMin = 50;
  EXPECT_TRUE(Serves(400, 50));
  imp_.pllLimits.clkoutMin = Above(50);
  EXPECT_FALSE(Serves(400, 50));
}

TEST_F(OutputDividersTest, TheIoMaximumIsThatOfOutput1OfAPll) {
  imp_.pllLimits.clkoutMax = 100;
  imp_.pllLimits.clkoutMaxIo = 200;
  EXPECT_TRUE(Serves(400, 200));
  imp_.pllLimits.clkoutMaxIo = Below(200);
  EXPECT_FALSE(Serves(400, 200));
}

TEST_F(OutputDividersTest, TheIoMaximumMayAlsoBeTheLowerOne) {
  imp_.pllLimits.clkoutMax = 300;
  imp_.pllLimits.clkoutMaxIo = 100;
  EXPECT_FALSE(Serves(400, 200));
}

TEST_F(OutputDividersTest, TheOutputMaximumIsThatOfTheFurtherOutputsOfAPll) {
  imp_.pllLimits.clkoutMax = 200;
  imp_.pllLimits.clkoutMaxIo = 1080;
  for (int n = 2; n < 7; ++n) {
    for (const double maximum : {200.0, Below(200)}) {
      imp_.pllLimits.clkoutMax = maximum;
      table_.EmptyAll();
      PutBare(table_, 0, 400, 1);
      imp_.requests.reqOutFreq.fill(100);
      imp_.requests.reqOutFreq[static_cast<std::size_t>(n)] = 200;
      EXPECT_EQ(Find(n + 1), maximum == 200.0) << n;
    }
  }
}

TEST_F(OutputDividersTest, TheOutputMaximumIsThatOfOutput1OfAnyOtherPrimitive) {
  imp_.pllLimits.clkoutMaxIo = 1080;
  for (const int prim : {0, -1, 2}) {
    prim_ = prim;
    imp_.pllLimits.clkoutMax = 200;
    EXPECT_TRUE(Serves(400, 200)) << prim;
    imp_.pllLimits.clkoutMax = Below(200);
    EXPECT_FALSE(Serves(400, 200)) << prim;
  }
}

// A primitive that another object's run has left in the process decides nothing.
TEST_F(OutputDividersTest, ThePrimitiveIsThatOfTheRun) {
  imp_.pllLimits.clkoutMax = 100;
  imp_.pllLimits.clkoutMaxIo = 200;
  VorkelImp::_prim = Ip::Pll::kTsyn;
  EXPECT_TRUE(Serves(400, 200));
  VorkelImp::_prim = Ip::Pll::kPll;
  prim_ = Ip::Pll::kTsyn;
  EXPECT_FALSE(Serves(400, 200));
}

// 390 does not serve 200 exactly, but within the limits; 400 would, but 200 is above them.
TEST_F(OutputDividersTest, ACandidateOutsideTheLimitsGivesWayToAnInexactOne) {
  imp_.pllLimits.clkoutMaxIo = 198;
  PutBare(table_, 0, 400, 1);
  PutBare(table_, 1, 390, 1);
  Request(200);
  EXPECT_TRUE(Find(2));
  EXPECT_THAT(SlotsOf(table_.Occupied()), ElementsAre(1));
  EXPECT_EQ(CountOf("upping", trace_), 3) << "195 is off by 0.025";
}

// --- Ends of the divider range, odd requests -------------------------------------------------

TEST_F(OutputDividersTest, ARequestAboveTheVcoHasDivider1) {
  // 400 for 450: off by 50 / 450 = 0.11..., so twelve retries.
  EXPECT_TRUE(Serves(400, 450));
  EXPECT_EQ(table_[0].divN[1], 1u);
  EXPECT_EQ(CountOf("upping", trace_), 12);
  EXPECT_FALSE(Serves(400, 600));
}

TEST_F(OutputDividersTest, ARequestBelowA128thOfTheVcoHasDivider128) {
  // 1000 / 128 = 7.8125 for 7: off by 0.116..., so twelve retries. For 5 it is 0.5625.
  EXPECT_TRUE(Serves(1000, 7));
  EXPECT_EQ(table_[0].divN[1], 128u);
  EXPECT_EQ(table_[0].freqDiff[1], 0.8125);
  EXPECT_EQ(CountOf("upping", trace_), 12);
  EXPECT_FALSE(Serves(1000, 5));
}

TEST_F(OutputDividersTest, RequestsOfZeroInfinityOrNanAreServedByNothing) {
  for (const double request : {0.0, kNan, kInfinity, -kInfinity, 1e-320, 1e300}) {
    EXPECT_FALSE(Serves(400, request)) << request;
    EXPECT_EQ(trace_, GivenUp(1)) << request;
  }
}

// 400 for -100: divider 1 and a difference of 500, which is -5 of the request, so below any
// tolerance.
TEST_F(OutputDividersTest, ANegativeRequestIsTakenAsTheFormulaTakesIt) {
  EXPECT_TRUE(Serves(400, -100));
  EXPECT_EQ(trace_, Looking(1) +
                        "DLL ---------- for VCO = 400.000000: div1 = 1 (diff = 500.000)\n");
  EXPECT_EQ(table_[0].freqDiff[1], 500.0);
  // A quotient by -0 is negative, too.
  EXPECT_TRUE(Serves(400, -0.0));
  EXPECT_EQ(table_[0].freqDiff[1], 400.0);
}

TEST_F(OutputDividersTest, IsSilentWithTheTraceOff) {
  PutBare(table_, 0, 450, 1);
  Request(100, 2000);
  const std::string text = engine_test::TraceOf(
      [&](const Trace& trace) {
        Ip::Pll::FindOutputDividers(imp_, {100, 3, prim_, trace});
      },
      false);
  EXPECT_EQ(text, "");
  EXPECT_EQ(table_[0].divN[1], 5u);
}

}  // namespace
