// Tests of the search for the M, D and DV of a KRU_CLKGEN.
//
// 127 MHz out of 64 MHz have just two pairs of M and D, 127 / 64 and 254 / 128, which keeps the
// traces short.

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "engine/kru_clkgen/Search.h"
#include "tests/engine/KruTest.h"

namespace {

using engine_test::Above;
using engine_test::Below;
using engine_test::CountOf;
using engine_test::kInfinity;
using engine_test::kNan;
using engine_test::KruOutput;
using engine_test::Names;
using engine_test::Refused;
using Ip::KruPin;
using Ip::Trace;
using Ip::VorkelImp;

constexpr char kStart[] = "DLL ---- Calculating KRU_CLKGEN actuals \n";
constexpr char kNone[] = "DLL -- couldn't find an M and D\n";

// What the search prints for an output 0 of 127 MHz with two pairs, when others follow.
constexpr char kOutput0[] =
    "DLL ---- Calculating KRU_CLKGEN actuals \n"
    "DLL ------ Clk_Out0 ofreq = 127.000\n"
    "DLL -- Found 2 possible M/D pairs for CLK_OUT1\n";

class ClkgenSearchTest : public testing::Test {
 protected:
  bool Search(double inFreq, const std::vector<KruOutput>& outputs) {
    engine_test::Request(imp_, outputs);
    bool found = false;
    trace_ = engine_test::TraceOf([&](const Trace& trace) {
      found = Ip::KruClkgen::FindMDAndDv(imp_,
                                         {inFreq, static_cast<int>(outputs.size()), trace});
    });
    return found;
  }

  void ExpectChosen(const std::string& pins, int m, int d, double dv) const {
    EXPECT_EQ(Names(imp_.kru._kruChosenPin), pins);
    EXPECT_EQ(imp_.kru._kruChosenM, m);
    EXPECT_EQ(imp_.kru._kruChosenD, d);
    EXPECT_EQ(imp_.kru._kruChosenClkdv, dv);
  }

  VorkelImp& imp_ = engine_test::NewImp();
  Ip::KruLimits& limits_ = imp_.kruLimits;
  std::string trace_;
};

// --- Output 0 ----------------------------------------------------------------------------------

// M = 3, 6 and so on up to 255.
TEST_F(ClkgenSearchTest, OneOutput) {
  EXPECT_TRUE(Search(100, {{150}}));
  ExpectChosen("CLKFX", 3, 2, 0);
  EXPECT_EQ(trace_,
            "DLL ---- Calculating KRU_CLKGEN actuals \n"
            "DLL ------ Clk_Out0 ofreq = 150.000\n"
            "DLL ----- found 85 possible M and Ds\n"
            "DLL -- found M = 3, D = 2, DV = 0\n");
}

TEST_F(ClkgenSearchTest, ThePhaseOfOutput0DoesNotMatter) {
  for (const double phase : {90.0, 180.0, 45.0, -1.0, kNan, kInfinity}) {
    EXPECT_TRUE(Search(64, {{127, phase}})) << phase;
    ExpectChosen("CLKFX", 127, 64, 0);
    EXPECT_EQ(trace_,
              "DLL ---- Calculating KRU_CLKGEN actuals \n"
              "DLL ------ Clk_Out0 ofreq = 127.000\n"
              "DLL ----- found 2 possible M and Ds\n"
              "DLL -- found M = 127, D = 64, DV = 0\n");
  }
}

TEST_F(ClkgenSearchTest, TheEndsOfTheRangesOfMAndD) {
  limits_._kruClkfxMin = 0;
  limits_._kruClkfxMax = 1e6;
  EXPECT_TRUE(Search(1, {{2}}));
  ExpectChosen("CLKFX", 2, 1, 0);
  EXPECT_TRUE(Search(1, {{256}}));
  ExpectChosen("CLKFX", 256, 1, 0);
  EXPECT_FALSE(Search(1, {{257}}));
  EXPECT_TRUE(Search(128, {{1}}));
  ExpectChosen("CLKFX", 2, 256, 0);
  EXPECT_FALSE(Search(129, {{1}}));
  EXPECT_TRUE(Search(256, {{255}}));
  ExpectChosen("CLKFX", 255, 256, 0);
  EXPECT_TRUE(Search(255, {{256}}));
  ExpectChosen("CLKFX", 256, 255, 0);
  // M = D for every M from 2 on: 255 pairs.
  EXPECT_TRUE(Search(100, {{100}}));
  ExpectChosen("CLKFX", 2, 2, 0);
  EXPECT_EQ(CountOf("DLL ----- found 255 possible M and Ds\n", trace_), 1);
}

TEST_F(ClkgenSearchTest, Output0HasTheRangeOfClkfx) {
  limits_._kruClkfxMin = 127;
  EXPECT_TRUE(Search(64, {{127}}));
  limits_._kruClkfxMin = Above(127);
  EXPECT_FALSE(Search(64, {{127}}));
  EXPECT_EQ(trace_,
            "DLL ---- Calculating KRU_CLKGEN actuals \n"
            "DLL ------ Clk_Out0 ofreq = 127.000\n"
            "DLL -!!!!!! Can't use CLKFX because requested freq 127.000 is out of range\n"
            "DLL -- couldn't find an M and D\n");
  ExpectChosen("", 0, 0, 0);
  limits_._kruClkfxMin = 0;
  limits_._kruClkfxMax = 127;
  EXPECT_TRUE(Search(64, {{127}}));
  limits_._kruClkfxMax = Below(127);
  EXPECT_FALSE(Search(64, {{127}, {127}}));
  EXPECT_EQ(trace_, std::string(kStart) + "DLL ------ Clk_Out0 ofreq = 127.000\n" +
                        Refused("CLKFX", 127) + kNone);
}

TEST_F(ClkgenSearchTest, NoPairForOutput0) {
  EXPECT_FALSE(Search(100, {{100.3}, {100.3}}));
  EXPECT_EQ(trace_,
            "DLL ---- Calculating KRU_CLKGEN actuals \n"
            "DLL ------ Clk_Out0 ofreq = 100.300\n"
            "DLL -- couldn't find an M and D\n");
  ExpectChosen("", 0, 0, 0);
}

// f0 = 2 makes x = inFreq for M = 2, and no other M comes near.
TEST_F(ClkgenSearchTest, TheSeedTakesLessThan0p0001) {
  limits_._kruClkfxMin = 0;
  double above = 1.0001;
  while (!(above - 1.0 < 0.0001)) above = Below(above);
  while (Above(above) - 1.0 < 0.0001) above = Above(above);
  EXPECT_TRUE(Search(above, {{2}}));
  ExpectChosen("CLKFX", 2, 1, 0);
  EXPECT_EQ(CountOf("DLL ----- found 1 possible M and Ds\n", trace_), 1);
  EXPECT_FALSE(Search(Above(above), {{2}}));
  double below = 0.9999;
  while (!(1.0 - below < 0.0001)) below = Above(below);
  while (1.0 - Below(below) < 0.0001) below = Below(below);
  EXPECT_TRUE(Search(below, {{2}})) << "D is at least 1, x need not be";
  ExpectChosen("CLKFX", 2, 1, 0);
  EXPECT_FALSE(Search(Below(below), {{2}}));
}

// --- CLKFX and CLKFX180 --------------------------------------------------------------------------

TEST_F(ClkgenSearchTest, TheSameFrequencyAtTheOtherPhase) {
  EXPECT_TRUE(Search(64, {{127}, {127, 180}}));
  ExpectChosen("CLKFX CLKFX180", 127, 64, 0);
  EXPECT_EQ(trace_, std::string(kOutput0) +
                        "DLL ------ Clk_Out1 ofreq = 127.000; phase = 180.000\n"
                        "DLL ----- for clk1, found match: CLKFX180\n"
                        "DLL ----- for clk1, found 2 possible M/D pairs that work for CLKFX\n"
                        "DLL ----- found 2 possible M and Ds\n"
                        "DLL -- found M = 127, D = 64, DV = 0\n");
  EXPECT_TRUE(Search(64, {{127}, {127, -0.0}}));
  ExpectChosen("CLKFX CLKFX", 127, 64, 0);
}

// 127 x 64 / 126.99984 = 64.00008, and twice that is 0.00016 off.
TEST_F(ClkgenSearchTest, PairsThatDoNotServeAreRemoved) {
  EXPECT_TRUE(Search(64, {{127}, {126.99984}}));
  ExpectChosen("CLKFX CLKFX", 127, 64, 0);
  EXPECT_EQ(trace_, std::string(kOutput0) +
                        "DLL ------ Clk_Out1 ofreq = 127.000; phase = 0.000\n"
                        "DLL ----- for clk1, found match: CLKFX\n"
                        "DLL ----- removed possible M = 254, D = 128\n"
                        "DLL ----- for clk1, found 1 possible M/D pairs that work for CLKFX\n"
                        "DLL ----- found 1 possible M and Ds\n"
                        "DLL -- found M = 127, D = 64, DV = 0\n");
}

// With inFreq = c and f0 = 2 x c every even M has a pair; f1 = 2 makes x = c for M = 2 and takes
// the others farther away.
TEST_F(ClkgenSearchTest, ClkfxTakesUpTo0p0001OnEitherSide) {
  limits_._kruClkfxMin = 0;
  for (const double c : {1 + 0.0001, 1 - 0.0001}) {
    EXPECT_TRUE(Search(c, {{2 * c}, {2}}));
    ExpectChosen("CLKFX CLKFX", 2, 1, 0);
    EXPECT_EQ(CountOf("found 1 possible M/D pairs that work for CLKFX\n", trace_), 1);
    const double beyond = c > 1 ? Above(c) : Below(c);
    EXPECT_FALSE(Search(beyond, {{2 * beyond}, {2}}));
    EXPECT_EQ(CountOf("DLL ----- for clk1, CLKFX doesn't work, so trying CLKFXDV\n", trace_), 1);
  }
}

TEST_F(ClkgenSearchTest, ClkfxHasTwoPhases) {
  for (const double phase : {90.0, 270.0, 360.0, -180.0, Above(180), Below(180), kNan, kInfinity}) {
    EXPECT_FALSE(Search(64, {{127}, {127, phase}})) << phase;
    EXPECT_EQ(CountOf("DLL ----- for clk1, CLKFX doesn't work, so trying CLKFXDV\n", trace_), 1);
    EXPECT_EQ(CountOf("DLL -!!!!!! Can't use CLKFXDV because phase is set to ", trace_), 1);
  }
}

TEST_F(ClkgenSearchTest, APhaseOf90) {
  EXPECT_FALSE(Search(64, {{127}, {127, 90}}));
  EXPECT_EQ(trace_, std::string(kOutput0) +
                        "DLL ------ Clk_Out1 ofreq = 127.000; phase = 90.000\n"
                        "DLL ----- for clk1, CLKFX doesn't work, so trying CLKFXDV\n"
                        "DLL -!!!!!! Can't use CLKFXDV because phase is set to 90.000, not 0\n"
                        "DLL --- couldn't find any M and Ds for clknum 1\n"
                        "DLL -- couldn't find an M and D\n");
  ExpectChosen("CLKFX", 0, 0, 0);
}

// --- CLKFXDV -------------------------------------------------------------------------------------

TEST_F(ClkgenSearchTest, HalfTheFrequency) {
  EXPECT_TRUE(Search(64, {{127}, {63.5}}));
  ExpectChosen("CLKFX CLKFXDV", 127, 64, 2);
  EXPECT_EQ(trace_, std::string(kOutput0) +
                        "DLL ------ Clk_Out1 ofreq = 63.500; phase = 0.000\n"
                        "DLL ----- for clk1, CLKFX doesn't work, so trying CLKFXDV\n"
                        "DLL ----- found 2 possible M and Ds\n"
                        "DLL -- found M = 127, D = 64, DV = 2\n");
  EXPECT_TRUE(Search(100, {{150}, {75}}));
  ExpectChosen("CLKFX CLKFXDV", 3, 2, 2);
}

TEST_F(ClkgenSearchTest, EveryDv) {
  EXPECT_TRUE(Search(64, {{127}, {31.75}}));
  ExpectChosen("CLKFX CLKFXDV", 127, 64, 4);
  EXPECT_TRUE(Search(64, {{127}, {15.875}}));
  ExpectChosen("CLKFX CLKFXDV", 127, 64, 8);
  EXPECT_TRUE(Search(64, {{127}, {7.9375}}));
  ExpectChosen("CLKFX CLKFXDV", 127, 64, 16);
  EXPECT_TRUE(Search(64, {{127}, {3.96875}}));
  ExpectChosen("CLKFX CLKFXDV", 127, 64, 32);
  EXPECT_FALSE(Search(64, {{127}, {1.984375}}));
  EXPECT_FALSE(Search(64, {{127}, {127.0 / 3}}));
  EXPECT_FALSE(Search(64, {{127}, {254}})) << "there is no DV of 1/2";
}

TEST_F(ClkgenSearchTest, NoDvFits) {
  EXPECT_FALSE(Search(64, {{127}, {80}}));
  EXPECT_EQ(trace_, std::string(kOutput0) +
                        "DLL ------ Clk_Out1 ofreq = 80.000; phase = 0.000\n"
                        "DLL ----- for clk1, CLKFX doesn't work, so trying CLKFXDV\n"
                        "DLL ----- for clk 1, not a CLKFXDV solution, so remove M = 127, D = 64\n"
                        "DLL ----- for clk 1, not a CLKFXDV solution, so remove M = 254, D = 128\n"
                        "DLL --- couldn't find any M and Ds for clknum 1\n"
                        "DLL -- couldn't find an M and D\n");
  ExpectChosen("CLKFX", 0, 0, 0);
}

TEST_F(ClkgenSearchTest, OneDvForAllOutputs) {
  EXPECT_TRUE(Search(64, {{127}, {63.5}, {63.5}}));
  ExpectChosen("CLKFX CLKFXDV CLKFXDV", 127, 64, 2);
  EXPECT_FALSE(Search(64, {{127}, {63.5}, {31.75}, {127}}));
  EXPECT_EQ(trace_,
            std::string(kOutput0) +
                "DLL ------ Clk_Out1 ofreq = 63.500; phase = 0.000\n"
                "DLL ----- for clk1, CLKFX doesn't work, so trying CLKFXDV\n"
                "DLL ------ Clk_Out2 ofreq = 31.750; phase = 0.000\n"
                "DLL ----- for clk2, CLKFX doesn't work, so trying CLKFXDV\n"
                "DLL ----- for clk 2, existing DV = 2 didn't work, so remove M = 127, D = 64\n"
                "DLL ----- for clk 2, existing DV = 2 didn't work, so remove M = 254, D = 128\n"
                "DLL --- couldn't find any M and Ds for clknum 2\n"
                "DLL -- couldn't find an M and D\n");
  // Pins stay as far as they were found.
  ExpectChosen("CLKFX CLKFXDV", 0, 0, 0);
}

// A smaller DV is as little at hand as a larger one.
TEST_F(ClkgenSearchTest, ADvOnceTakenStays) {
  EXPECT_FALSE(Search(64, {{127}, {31.75}, {63.5}}));
  EXPECT_EQ(CountOf("DLL ----- for clk 2, existing DV = 4 didn't work, so remove M = ", trace_), 2);
}

// 50 MHz is 100 / 2 for every pair, so only the request moves.
TEST_F(ClkgenSearchTest, ClkfxdvTakesUpTo0p0001OnEitherSide) {
  double above = 50.0001;
  while (!(above - 0.0001 <= 50.0)) above = Below(above);
  while (Above(above) - 0.0001 <= 50.0) above = Above(above);
  double below = 49.9999;
  while (!(below + 0.0001 >= 50.0)) below = Above(below);
  while (Below(below) + 0.0001 >= 50.0) below = Below(below);
  for (const double f : {above, below}) {
    const double beyond = f > 50 ? Above(f) : Below(f);
    EXPECT_TRUE(Search(100, {{100}, {f}})) << f;
    ExpectChosen("CLKFX CLKFXDV", 2, 2, 2);
    EXPECT_FALSE(Search(100, {{100}, {beyond}})) << f;
    // The same for a DV that is taken already.
    EXPECT_TRUE(Search(100, {{100}, {50}, {f}})) << f;
    ExpectChosen("CLKFX CLKFXDV CLKFXDV", 2, 2, 2);
    EXPECT_FALSE(Search(100, {{100}, {50}, {beyond}})) << f;
    EXPECT_EQ(CountOf("existing DV = 2 didn't work", trace_), 255);
  }
}

TEST_F(ClkgenSearchTest, ClkfxdvHasPhase0) {
  EXPECT_TRUE(Search(64, {{127}, {63.5, -0.0}}));
  for (const double phase : {90.0, 180.0, 360.0, -1.0, kNan, kInfinity}) {
    EXPECT_FALSE(Search(64, {{127}, {63.5, phase}})) << phase;
  }
  EXPECT_FALSE(Search(64, {{127}, {63.5, 180}}));
  EXPECT_EQ(trace_, std::string(kOutput0) +
                        "DLL ------ Clk_Out1 ofreq = 63.500; phase = 180.000\n"
                        "DLL ----- for clk1, CLKFX doesn't work, so trying CLKFXDV\n"
                        "DLL -!!!!!! Can't use CLKFXDV because phase is set to 180.000, not 0\n"
                        "DLL --- couldn't find any M and Ds for clknum 1\n"
                        "DLL -- couldn't find an M and D\n");
}

// --- Ranges of the further outputs ---------------------------------------------------------------

TEST_F(ClkgenSearchTest, AFurtherOutputHasTheRangeOfClkfx) {
  // 127 as output 0 is in range when the limits are 63.5 and 127; both ends serve output 1.
  limits_._kruClkfxMin = 63.5;
  limits_._kruClkfxMax = 127;
  EXPECT_TRUE(Search(64, {{127}, {127}}));
  EXPECT_TRUE(Search(64, {{63.5}, {63.5}}));
  EXPECT_EQ(CountOf("Can't use", trace_), 0);
  // Above the range of CLKFX only CLKFXDV is left.
  EXPECT_FALSE(Search(64, {{127}, {Above(127)}}));
  EXPECT_EQ(trace_, std::string(kOutput0) +
                        "DLL ------ Clk_Out1 ofreq = 127.000; phase = 0.000\n" +
                        Refused("CLKFX", 127) +
                        "DLL ----- for clk1, CLKFX doesn't work, so trying CLKFXDV\n"
                        "DLL ----- for clk 1, not a CLKFXDV solution, so remove M = 127, D = 64\n"
                        "DLL ----- for clk 1, not a CLKFXDV solution, so remove M = 254, D = 128\n"
                        "DLL --- couldn't find any M and Ds for clknum 1\n"
                        "DLL -- couldn't find an M and D\n");
  // Below it CLKFXDV serves.
  limits_._kruClkfxMin = Above(63.5);
  EXPECT_TRUE(Search(64, {{127}, {63.5}}));
  EXPECT_EQ(trace_, std::string(kOutput0) +
                        "DLL ------ Clk_Out1 ofreq = 63.500; phase = 0.000\n" +
                        Refused("CLKFX", 63.5) +
                        "DLL ----- for clk1, CLKFX doesn't work, so trying CLKFXDV\n"
                        "DLL ----- found 2 possible M and Ds\n"
                        "DLL -- found M = 127, D = 64, DV = 2\n");
}

TEST_F(ClkgenSearchTest, AFurtherOutputHasTheRangeOfClkfxdv) {
  limits_._kruClkfxdvMin = 63.5;
  EXPECT_TRUE(Search(64, {{127}, {63.5}}));
  limits_._kruClkfxdvMin = Above(63.5);
  EXPECT_FALSE(Search(64, {{127}, {63.5}}));
  EXPECT_EQ(trace_, std::string(kOutput0) +
                        "DLL ------ Clk_Out1 ofreq = 63.500; phase = 0.000\n"
                        "DLL ----- for clk1, CLKFX doesn't work, so trying CLKFXDV\n" +
                        Refused("CLKFXDV", 63.5) +
                        "DLL --- couldn't find any M and Ds for clknum 1\n"
                        "DLL -- couldn't find an M and D\n");
  limits_._kruClkfxdvMin = 0;
  limits_._kruClkfxdvMax = 63.5;
  EXPECT_TRUE(Search(64, {{127}, {63.5}}));
  limits_._kruClkfxdvMax = Below(63.5);
  EXPECT_FALSE(Search(64, {{127}, {63.5}}));
  EXPECT_EQ(CountOf(Refused("CLKFXDV", 63.5), trace_), 1);
}

// CLKFX serves, so the range of CLKFXDV is not asked.
TEST_F(ClkgenSearchTest, ClkfxComesFirst) {
  limits_._kruClkfxdvMax = 1;
  EXPECT_TRUE(Search(64, {{127}, {127, 180}, {127}}));
  ExpectChosen("CLKFX CLKFX180 CLKFX", 127, 64, 0);
  EXPECT_EQ(CountOf("Can't use", trace_), 0);
}

// Phase and range are told independently.
TEST_F(ClkgenSearchTest, BothReasonsAreTold) {
  EXPECT_FALSE(Search(64, {{127}, {1000, 90}}));
  EXPECT_EQ(trace_, std::string(kOutput0) +
                        "DLL ------ Clk_Out1 ofreq = 1000.000; phase = 90.000\n" +
                        Refused("CLKFX", 1000) +
                        "DLL ----- for clk1, CLKFX doesn't work, so trying CLKFXDV\n"
                        "DLL -!!!!!! Can't use CLKFXDV because phase is set to 90.000, not 0\n" +
                        Refused("CLKFXDV", 1000) +
                        "DLL --- couldn't find any M and Ds for clknum 1\n"
                        "DLL -- couldn't find an M and D\n");
}

// --- Whole runs ----------------------------------------------------------------------------------

TEST_F(ClkgenSearchTest, SixOutputs) {
  EXPECT_TRUE(Search(64, {{127, 90}, {127, 180}, {31.75}, {127}, {31.75}, {126.99984, 180}}));
  ExpectChosen("CLKFX CLKFX180 CLKFXDV CLKFX CLKFXDV CLKFX180", 127, 64, 4);
  EXPECT_EQ(trace_, std::string(kOutput0) +
                        "DLL ------ Clk_Out1 ofreq = 127.000; phase = 180.000\n"
                        "DLL ----- for clk1, found match: CLKFX180\n"
                        "DLL ----- for clk1, found 2 possible M/D pairs that work for CLKFX\n"
                        "DLL ------ Clk_Out2 ofreq = 31.750; phase = 0.000\n"
                        "DLL ----- for clk2, CLKFX doesn't work, so trying CLKFXDV\n"
                        "DLL ------ Clk_Out3 ofreq = 127.000; phase = 0.000\n"
                        "DLL ----- for clk3, found match: CLKFX\n"
                        "DLL ----- for clk3, found 2 possible M/D pairs that work for CLKFX\n"
                        "DLL ------ Clk_Out4 ofreq = 31.750; phase = 0.000\n"
                        "DLL ----- for clk4, CLKFX doesn't work, so trying CLKFXDV\n"
                        "DLL ------ Clk_Out5 ofreq = 127.000; phase = 180.000\n"
                        "DLL ----- for clk5, found match: CLKFX180\n"
                        "DLL ----- removed possible M = 254, D = 128\n"
                        "DLL ----- for clk5, found 1 possible M/D pairs that work for CLKFX\n"
                        "DLL ----- found 1 possible M and Ds\n"
                        "DLL -- found M = 127, D = 64, DV = 4\n");
}

// What was removed before does not come back, and its removal is told once.
TEST_F(ClkgenSearchTest, ARemovedPairStaysRemoved) {
  EXPECT_FALSE(Search(64, {{127}, {126.99984}, {80}}));
  EXPECT_EQ(CountOf("M = 254, D = 128\n", trace_), 1);
  EXPECT_EQ(CountOf("for clk 2, not a CLKFXDV solution, so remove M = 127, D = 64\n", trace_), 1);
}

TEST_F(ClkgenSearchTest, TheFirstOutputThatFailsEndsTheSearch) {
  EXPECT_FALSE(Search(64, {{127}, {80}, {127}, {63.5}}));
  EXPECT_EQ(CountOf("Clk_Out", trace_), 2);
  EXPECT_EQ(CountOf("couldn't find any M and Ds for clknum", trace_), 1);
}

// --- State ---------------------------------------------------------------------------------------

TEST_F(ClkgenSearchTest, ClearsWhatAnEarlierRunLeft) {
  Ip::KruState& kru = imp_.kru;
  const auto fill = [&] {
    kru._kruChosenPin.fill(KruPin::CLK0);
    kru._kruPinsDivBy2F.fill(KruPin::CLK0);
    kru._kruPinsDivBy2T.fill(KruPin::CLK0);
    kru._kruChosenM = 99;
    kru._kruChosenD = 98;
    kru._kruChosenClkdv = 7.5;
  };
  fill();
  EXPECT_FALSE(Search(64, {{1000}}));
  ExpectChosen("", 0, 0, 0);
  EXPECT_EQ(Names(kru._kruPinsDivBy2F), "");
  EXPECT_EQ(Names(kru._kruPinsDivBy2T), "");
  fill();
  EXPECT_TRUE(Search(64, {{127}}));
  ExpectChosen("CLKFX", 127, 64, 0);
  EXPECT_EQ(Names(kru._kruPinsDivBy2F), "");
  EXPECT_EQ(Names(kru._kruPinsDivBy2T), "");
}

TEST_F(ClkgenSearchTest, LeavesWhatIsTheKruSpsAlone) {
  imp_.kru._kruChosenDivBy2 = true;
  imp_.kru._kruPhaseOffset = 45;
  EXPECT_TRUE(Search(64, {{127}, {63.5}}));
  EXPECT_FALSE(Search(64, {{127}, {80}}));
  EXPECT_TRUE(imp_.kru._kruChosenDivBy2);
  EXPECT_EQ(imp_.kru._kruPhaseOffset, 45.0);
}

TEST_F(ClkgenSearchTest, OutputsBeyondTheCountDoNotMatter) {
  imp_.requests.reqOutFreq.fill(1000);
  imp_.requests.reqPhase.fill(90);
  EXPECT_TRUE(Search(64, {{127}, {63.5}}));
  ExpectChosen("CLKFX CLKFXDV", 127, 64, 2);
}

TEST_F(ClkgenSearchTest, IsSilentWithTheTraceOff) {
  engine_test::Request(imp_, {{127}, {126.99984, 180}, {63.5}, {63.5}, {31.75}, {1000, 90}});
  EXPECT_EQ(engine_test::TraceOf(
                [&](const Trace& trace) {
                  for (int numOut = 1; numOut <= 6; ++numOut) {
                    Ip::KruClkgen::FindMDAndDv(imp_, {64, numOut, trace});
                  }
                },
                false),
            "");
}

// --- Bad numbers ---------------------------------------------------------------------------------

TEST_F(ClkgenSearchTest, NumbersThatAreNone) {
  for (const double f : {0.0, -0.0, -127.0, kNan, kInfinity, -kInfinity, 1e-300, 1e300}) {
    EXPECT_FALSE(Search(64, {{f}})) << f;
    EXPECT_EQ(CountOf("Can't use CLKFX because", trace_), 1) << f;
    EXPECT_FALSE(Search(64, {{127}, {f}})) << f;
    EXPECT_EQ(CountOf("Can't use CLKFX because", trace_), 1) << f;
    EXPECT_EQ(CountOf("Can't use CLKFXDV because", trace_), 1) << f;
  }
  for (const double inFreq : {kNan, kInfinity, -kInfinity, -64.0, 1e-300, 1e308}) {
    EXPECT_FALSE(Search(inFreq, {{127}, {63.5}})) << inFreq;
    EXPECT_EQ(trace_, std::string(kStart) + "DLL ------ Clk_Out0 ofreq = 127.000\n" + kNone)
        << inFreq;
  }
}

// With limits that hold everything the quotients are the ones that fail.
TEST_F(ClkgenSearchTest, NumbersWithoutAQuotient) {
  limits_._kruClkfxMin = limits_._kruClkfxdvMin = -kInfinity;
  limits_._kruClkfxMax = limits_._kruClkfxdvMax = kInfinity;
  for (const double f : {0.0, -0.0, -127.0, kInfinity, -kInfinity, 1e-300, 1e300}) {
    EXPECT_FALSE(Search(64, {{f}})) << f;
    EXPECT_FALSE(Search(64, {{127}, {f}})) << f;
  }
  EXPECT_TRUE(Search(-64, {{-127}, {-63.5}}));
  ExpectChosen("CLKFX CLKFXDV", 127, 64, 2);
}

}  // namespace
