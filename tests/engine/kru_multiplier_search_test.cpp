// Tests of the search for the M and D that serve all synthesised outputs of a KRU_SP.
//
// For each M the search looks at x = M * c / f, with c the input frequency of the synthesiser.

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "tests/engine/KruTest.h"

namespace {

using engine_test::Above;
using engine_test::Below;
using engine_test::CountOf;
using engine_test::kInfinity;
using engine_test::kNan;
using Ip::KruPin;
using Ip::KruPinList;
using Ip::Trace;
using Ip::VorkelImp;
using enum Ip::KruPin;

constexpr char kNone[] = "DLL -- couldn't find an M and D\n";

class KruMultiplierSearchTest : public testing::Test {
 protected:
  bool Search(double inFreq, const std::vector<double>& frequencies, const KruPinList& pins,
              bool divBy2 = false) {
    return SearchFirst(static_cast<int>(frequencies.size()), inFreq, frequencies, pins, divBy2);
  }

  bool SearchFirst(int numOut, double inFreq, const std::vector<double>& frequencies,
                   const KruPinList& pins, bool divBy2 = false) {
    for (std::size_t n = 0; n < frequencies.size(); ++n) {
      imp_.requests.reqOutFreq[n] = frequencies[n];
    }
    imp_.kru._kruChosenM = 99;
    imp_.kru._kruChosenD = 98;
    bool found = false;
    trace_ = engine_test::TraceOf([&](const Trace& trace) {
      found = Ip::Kru::FindMAndD(imp_, pins, divBy2, {inFreq, numOut, true, trace});
    });
    return found;
  }

  void ExpectMAndD(int m, int d) const {
    EXPECT_EQ(imp_.kru._kruChosenM, m);
    EXPECT_EQ(imp_.kru._kruChosenD, d);
  }
  void ExpectUntouched() const { ExpectMAndD(99, 98); }

  VorkelImp& imp_ = engine_test::NewImp();
  std::string trace_;
};

// --- One output --------------------------------------------------------------------------------

TEST_F(KruMultiplierSearchTest, FindsTheSmallestD) {
  EXPECT_TRUE(Search(100, {150}, {CLKFX}));
  ExpectMAndD(3, 2);
  EXPECT_EQ(trace_,
            "DLL ----- looking for M/D for requested ofreq = 150.000000\n"
            "DLL ----- a possible M = 3, D = 2\n"
            "DLL ----- a possible M = 6, D = 4\n"
            "DLL ----- a possible M = 9, D = 6\n"
            "DLL ----- a possible M = 12, D = 8\n"
            "DLL ----- a possible M = 15, D = 10\n"
            "DLL ----- a possible M = 18, D = 12\n"
            "DLL ----- a possible M = 21, D = 14\n"
            "DLL ----- a possible M = 24, D = 16\n"
            "DLL ----- a possible M = 27, D = 18\n"
            "DLL ----- a possible M = 30, D = 20\n"
            "DLL ----- found 10 possible M and Ds\n"
            "DLL -- found M = 3, D = 2\n");
}

TEST_F(KruMultiplierSearchTest, DivideBy2HalvesTheInput) {
  EXPECT_TRUE(Search(100, {350}, {CLKFX}, true));
  ExpectMAndD(7, 1);
  EXPECT_EQ(trace_,
            "DLL ----- looking for M/D for requested ofreq = 350.000000\n"
            "DLL ----- a possible M = 7, D = 1\n"
            "DLL ----- a possible M = 14, D = 2\n"
            "DLL ----- a possible M = 21, D = 3\n"
            "DLL ----- a possible M = 28, D = 4\n"
            "DLL ----- found 4 possible M and Ds\n"
            "DLL -- found M = 7, D = 1\n");
}

TEST_F(KruMultiplierSearchTest, Clkfx180HasTheSameMAndD) {
  EXPECT_TRUE(Search(100, {350}, {CLKFX180}));
  ExpectMAndD(7, 2);
}

// M is 2 to 32: 31 / 32 and 32 / 31 have one pair each, a factor of 32 needs the largest M, and
// 1 / 17 the D of 34 already for M = 2.
TEST_F(KruMultiplierSearchTest, TheEndsOfTheRanges) {
  EXPECT_TRUE(Search(100, {3200}, {CLKFX}));
  ExpectMAndD(32, 1);
  EXPECT_EQ(trace_,
            "DLL ----- looking for M/D for requested ofreq = 3200.000000\n"
            "DLL ----- a possible M = 32, D = 1\n"
            "DLL ----- found 1 possible M and Ds\n"
            "DLL -- found M = 32, D = 1\n");
  EXPECT_TRUE(Search(100, {6.25}, {CLKFX}));
  ExpectMAndD(2, 32);
  EXPECT_EQ(trace_,
            "DLL ----- looking for M/D for requested ofreq = 6.250000\n"
            "DLL ----- a possible M = 2, D = 32\n"
            "DLL ----- found 1 possible M and Ds\n"
            "DLL -- found M = 2, D = 32\n");
  EXPECT_TRUE(Search(320, {310}, {CLKFX}));
  ExpectMAndD(31, 32);
  EXPECT_FALSE(Search(100, {3300}, {CLKFX}));
  EXPECT_FALSE(Search(170, {10}, {CLKFX}));
  ExpectUntouched();
  EXPECT_EQ(trace_,
            "DLL ----- looking for M/D for requested ofreq = 10.000000\n"
            "DLL ----- couldn't find and M and Ds for clknum 0\n"
            "DLL -- couldn't find an M and D\n");
}

// x = M exactly, for every M from 2 to 32.
TEST_F(KruMultiplierSearchTest, EveryMIsTried) {
  EXPECT_TRUE(Search(100, {100}, {CLKFX}));
  std::string expected = "DLL ----- looking for M/D for requested ofreq = 100.000000\n";
  for (int m = 2; m <= 32; ++m) {
    const std::string number = std::to_string(m);
    expected += "DLL ----- a possible M = " + number + ", D = " + number + "\n";
  }
  EXPECT_EQ(trace_, expected +
                        "DLL ----- found 31 possible M and Ds\n"
                        "DLL -- found M = 2, D = 2\n");
}

// x comes close enough to 32 and to 1, but lies beyond them.
TEST_F(KruMultiplierSearchTest, XLiesFrom1To32) {
  EXPECT_TRUE(Search(100.001, {100}, {CLKFX}));
  EXPECT_EQ(CountOf("DLL ----- a possible M = 31, D = 31\n", trace_), 1);
  EXPECT_EQ(CountOf("D = 32", trace_), 0);
  EXPECT_TRUE(Search(0.99985, {2}, {CLKFX}));
  ExpectMAndD(4, 2);
  // Down to the last bit: M = 2 and c = 1 make x = 1, M = 32 and c = 1 make x = 32.
  EXPECT_TRUE(Search(1, {2}, {CLKFX}));
  ExpectMAndD(2, 1);
  EXPECT_TRUE(Search(Below(1), {2}, {CLKFX}));
  ExpectMAndD(4, 2);
  EXPECT_TRUE(Search(1, {1}, {CLKFX}));
  EXPECT_EQ(CountOf("a possible M = 32, D = 32\n", trace_), 1);
  EXPECT_TRUE(Search(Above(1), {1}, {CLKFX}));
  EXPECT_EQ(CountOf("a possible M = 32, D = 32\n", trace_), 0);
}

// --- The tolerance of the seed: f = 2 makes x = c for M = 2 --------------------------------------

TEST_F(KruMultiplierSearchTest, TheSeedTakesLessThan0p0005AboveD) {
  ASSERT_LT(1.0005 - 1.0, 0.0005);
  ASSERT_GT(Above(1.0005) - 1.0, 0.0005);
  EXPECT_TRUE(Search(1.0005, {2}, {CLKFX}));
  ExpectMAndD(2, 1);
  EXPECT_FALSE(Search(Above(1.0005), {2}, {CLKFX}));
  ExpectUntouched();
}

TEST_F(KruMultiplierSearchTest, TheSeedTakesLessThan0p0005BelowD) {
  double c = 1.9995;
  while (2.0 - c < 0.0005) c = Below(c);
  while (!(2.0 - c < 0.0005)) c = Above(c);
  EXPECT_TRUE(Search(c, {2}, {CLKFX}));
  ExpectMAndD(2, 2);
  EXPECT_FALSE(Search(Below(c), {2}, {CLKFX}));
  ExpectUntouched();
}

// --- Several outputs ---------------------------------------------------------------------------

// Against 150.003 MHz, x is short of D by 0.00004, 0.00008, 0.00012 and so on.
TEST_F(KruMultiplierSearchTest, ALaterOutputFiltersThePairs) {
  EXPECT_TRUE(Search(100, {150, 150.003}, {CLKFX, CLKFX180}));
  ExpectMAndD(3, 2);
  EXPECT_EQ(trace_,
            "DLL ----- looking for M/D for requested ofreq = 150.000000\n"
            "DLL ----- a possible M = 3, D = 2\n"
            "DLL ----- a possible M = 6, D = 4\n"
            "DLL ----- a possible M = 9, D = 6\n"
            "DLL ----- a possible M = 12, D = 8\n"
            "DLL ----- a possible M = 15, D = 10\n"
            "DLL ----- a possible M = 18, D = 12\n"
            "DLL ----- a possible M = 21, D = 14\n"
            "DLL ----- a possible M = 24, D = 16\n"
            "DLL ----- a possible M = 27, D = 18\n"
            "DLL ----- a possible M = 30, D = 20\n"
            "DLL ----- looking for M/D for requested ofreq = 150.003000\n"
            "DLL ----- testing M = 3, D = 2\n"
            "DLL ----- testing M = 6, D = 4\n"
            "DLL ----- testing M = 9, D = 6\n"
            "DLL ----- removed possible M = 9, D = 6\n"
            "DLL ----- testing M = 12, D = 8\n"
            "DLL ----- removed possible M = 12, D = 8\n"
            "DLL ----- testing M = 15, D = 10\n"
            "DLL ----- removed possible M = 15, D = 10\n"
            "DLL ----- testing M = 18, D = 12\n"
            "DLL ----- removed possible M = 18, D = 12\n"
            "DLL ----- testing M = 21, D = 14\n"
            "DLL ----- removed possible M = 21, D = 14\n"
            "DLL ----- testing M = 24, D = 16\n"
            "DLL ----- removed possible M = 24, D = 16\n"
            "DLL ----- testing M = 27, D = 18\n"
            "DLL ----- removed possible M = 27, D = 18\n"
            "DLL ----- testing M = 30, D = 20\n"
            "DLL ----- removed possible M = 30, D = 20\n"
            "DLL ----- found 2 possible M and Ds\n"
            "DLL -- found M = 3, D = 2\n");
}

TEST_F(KruMultiplierSearchTest, AFilteredPairIsNotTestedAgain) {
  EXPECT_TRUE(Search(100, {150, 150.003, 150}, {CLKFX, CLKFX, CLKFX}));
  EXPECT_EQ(CountOf("DLL ----- testing M = 9, D = 6\n", trace_), 1);
  EXPECT_EQ(CountOf("DLL ----- testing M = 6, D = 4\n", trace_), 2);
  EXPECT_EQ(CountOf("DLL ----- found 2 possible M and Ds\n", trace_), 1);
}

TEST_F(KruMultiplierSearchTest, TheWalkEndsWithTheLastPair) {
  EXPECT_FALSE(Search(100, {3200, 100, 3200}, {CLKFX, CLKFX, CLKFX}));
  ExpectUntouched();
  EXPECT_EQ(trace_,
            "DLL ----- looking for M/D for requested ofreq = 3200.000000\n"
            "DLL ----- a possible M = 32, D = 1\n"
            "DLL ----- looking for M/D for requested ofreq = 100.000000\n"
            "DLL ----- testing M = 32, D = 1\n"
            "DLL ----- removed possible M = 32, D = 1\n"
            "DLL ----- couldn't find and M and Ds for clknum 1\n"
            "DLL -- couldn't find an M and D\n");
}

TEST_F(KruMultiplierSearchTest, TheWalkEndsWithoutASeed) {
  EXPECT_FALSE(Search(100, {3300, 100}, {CLKFX, CLKFX}));
  EXPECT_EQ(trace_,
            "DLL ----- looking for M/D for requested ofreq = 3300.000000\n"
            "DLL ----- couldn't find and M and Ds for clknum 0\n"
            "DLL -- couldn't find an M and D\n");
}

// A D that a seed takes as near enough is too far off for a second output at the same frequency.
TEST_F(KruMultiplierSearchTest, TheFilterIsTighterThanTheSeed) {
  EXPECT_TRUE(Search(1.0003, {2}, {CLKFX}));
  ExpectMAndD(2, 1);
  EXPECT_FALSE(Search(1.0003, {2, 2}, {CLKFX, CLKFX}));
  ExpectUntouched();
  EXPECT_EQ(trace_,
            "DLL ----- looking for M/D for requested ofreq = 2.000000\n"
            "DLL ----- a possible M = 2, D = 1\n"
            "DLL ----- looking for M/D for requested ofreq = 2.000000\n"
            "DLL ----- testing M = 2, D = 1\n"
            "DLL ----- removed possible M = 2, D = 1\n"
            "DLL ----- couldn't find and M and Ds for clknum 1\n"
            "DLL -- couldn't find an M and D\n");
}

TEST_F(KruMultiplierSearchTest, TheFilterTakesUpTo0p0001OnEitherSide) {
  const double above = 1 + 0.0001;
  EXPECT_TRUE(Search(above, {2, 2}, {CLKFX, CLKFX}));
  ExpectMAndD(2, 1);
  EXPECT_FALSE(Search(Above(above), {2, 2}, {CLKFX, CLKFX}));
  const double below = 2 - 0.0001;
  EXPECT_TRUE(Search(below, {2, 2}, {CLKFX, CLKFX}));
  ExpectMAndD(2, 2);
  EXPECT_FALSE(Search(Below(below), {2, 2}, {CLKFX, CLKFX}));
}

// --- Which outputs take part -------------------------------------------------------------------

TEST_F(KruMultiplierSearchTest, OnlySynthesisedOutputsTakePart) {
  EXPECT_TRUE(Search(100, {100, 50, 400, 33, 350, 350},
                     {CLK0, CLKDV, CLK2X180, NONE, CLKFX180, CLKFX}));
  ExpectMAndD(7, 2);
  EXPECT_EQ(trace_,
            "DLL ----- looking for M/D for requested ofreq = 350.000000\n"
            "DLL ----- a possible M = 7, D = 2\n"
            "DLL ----- a possible M = 14, D = 4\n"
            "DLL ----- a possible M = 21, D = 6\n"
            "DLL ----- a possible M = 28, D = 8\n"
            "DLL ----- looking for M/D for requested ofreq = 350.000000\n"
            "DLL ----- testing M = 7, D = 2\n"
            "DLL ----- testing M = 14, D = 4\n"
            "DLL ----- testing M = 21, D = 6\n"
            "DLL ----- testing M = 28, D = 8\n"
            "DLL ----- found 4 possible M and Ds\n"
            "DLL -- found M = 7, D = 2\n");
  // No other pin counts, and the number of the output is told, not that of the search.
  EXPECT_FALSE(Search(100, {1, 1, 1, 1, 1, 3300}, {CLK90, CLK180, CLK270, CLK2X, CLKFXDV, CLKFX}));
  EXPECT_EQ(trace_,
            "DLL ----- looking for M/D for requested ofreq = 3300.000000\n"
            "DLL ----- couldn't find and M and Ds for clknum 5\n"
            "DLL -- couldn't find an M and D\n");
}

TEST_F(KruMultiplierSearchTest, NoOutputTakesPart) {
  EXPECT_FALSE(Search(100, {100, 50}, {CLK0, CLKDV}));
  EXPECT_EQ(trace_, kNone);
  ExpectUntouched();
}

TEST_F(KruMultiplierSearchTest, OutputsBeyondTheCountDoNot) {
  EXPECT_TRUE(SearchFirst(1, 100, {150, 3300}, {CLKFX, CLKFX}));
  ExpectMAndD(3, 2);
}

TEST_F(KruMultiplierSearchTest, CountsBelow1) {
  for (const int numOut : {0, -1, -2147483647 - 1}) {
    EXPECT_FALSE(SearchFirst(numOut, 100, {150}, {CLKFX}));
    EXPECT_EQ(trace_, kNone);
    ExpectUntouched();
  }
}

TEST_F(KruMultiplierSearchTest, IsSilentWithTheTraceOff) {
  imp_.requests.reqOutFreq = {150, 150.003, 3300};
  const KruPinList pins = {CLKFX, CLKFX, CLKFX};
  EXPECT_EQ(engine_test::TraceOf(
                [&](const Trace& trace) {
                  EXPECT_TRUE(Ip::Kru::FindMAndD(imp_, pins, false, {100, 2, true, trace}));
                  EXPECT_FALSE(Ip::Kru::FindMAndD(imp_, pins, false, {100, 3, true, trace}));
                },
                false),
            "");
}

// --- Bad numbers -------------------------------------------------------------------------------

TEST_F(KruMultiplierSearchTest, NumbersWithoutAQuotient) {
  for (const double f : {0.0, -0.0, -100.0, kNan, kInfinity, -kInfinity, 1e-300, 1e300}) {
    EXPECT_FALSE(Search(100, {f}, {CLKFX})) << f;
    EXPECT_FALSE(Search(100, {150, f}, {CLKFX, CLKFX})) << f;
    ExpectUntouched();
  }
  for (const double inFreq : {0.0, -100.0, kNan, kInfinity, -kInfinity, 1e-300, 1e308}) {
    EXPECT_FALSE(Search(inFreq, {100}, {CLKFX})) << inFreq;
    ExpectUntouched();
  }
  EXPECT_FALSE(Search(kInfinity, {kInfinity}, {CLKFX}));
}

// Two signs make none.
TEST_F(KruMultiplierSearchTest, NegativeFrequenciesAreTakenAsTheyStand) {
  EXPECT_TRUE(Search(-100, {-150}, {CLKFX}));
  ExpectMAndD(3, 2);
}

}  // namespace
