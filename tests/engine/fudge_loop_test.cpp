// Tests of the loop over the fudges of the output-0 frequency.

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdio>
#include <string>

#include "engine/pll/Stages.h"
#include "tests/engine/EngineTest.h"

namespace {

using engine_test::CountOf;
using Ip::Trace;
using Ip::VorkelImp;
using testing::HasSubstr;
using testing::Not;

constexpr int kPll = 1;
constexpr char kUpping[] = "DLL- NO VALID VCOs found, so upping div0 fudge to ";

class FudgeLoopTest : public testing::Test {
 protected:
  FudgeLoopTest() {
    imp_.pllLimits.pfdMin = 19;
    imp_.pllLimits.pfdMax = 500;
    imp_.pll._minPowerMode = true;
  }

  // One output of a PLL from 100 MHz, with this working range.
  bool Loop(double freq, double least, double most) {
    imp_.requests.reqOutFreq[0] = freq;
    imp_.pll.minAdjVco = least;
    imp_.pll.maxAdjVco = most;
    bool solved = false;
    trace_ = engine_test::TraceOf([&](const Trace& trace) {
      solved = Ip::Pll::FudgeLoop(imp_, {inFreq_, 1, kPll, trace});
    });
    return solved;
  }

  VorkelImp& imp_ = engine_test::NewImp();
  double inFreq_ = 100;
  std::string trace_;
};

TEST_F(FudgeLoopTest, ARequestThatIsMetNeedsNoFudge) {
  EXPECT_TRUE(Loop(200, 400, 1080));
  EXPECT_THAT(trace_, HasSubstr("fudge: 0.000"));
  EXPECT_EQ(CountOf("Using fudged", trace_), 1);
  EXPECT_THAT(trace_, Not(HasSubstr("upping")));
}

// 199.998 + 0.002 = 200 exactly, and 2 * 200 is the only VCO in the range.
TEST_F(FudgeLoopTest, GoesUp) {
  EXPECT_TRUE(Loop(199.998, 399.9999, 400.0001));
  EXPECT_EQ(trace_,
            "DLL--- Using fudged oFreq = 199.998 (ofreq: 199.998, fudge: 0.000)\n"
            "DLL----- NO VCO/Div0 pairs found for ofreq0_fudge = 0.000!\n"
            "DLL---- number of valid VCOs: 0\n"
            "DLL---- number of valid VCOs: 0\n"
            "DLL- NO VALID VCOs found, so upping div0 fudge to 0.001!\n"
            "DLL--- Using fudged oFreq = 199.999 (ofreq: 199.998, fudge: 0.001)\n"
            "DLL----- NO VCO/Div0 pairs found for ofreq0_fudge = 0.001!\n"
            "DLL---- number of valid VCOs: 0\n"
            "DLL--- Using fudged oFreq = 199.997 (ofreq: 199.998, fudge: -0.001)\n"
            "DLL----- NO VCO/Div0 pairs found for ofreq0_fudge = -0.001!\n"
            "DLL---- number of valid VCOs: 0\n"
            "DLL- NO VALID VCOs found, so upping div0 fudge to 0.002!\n"
            "DLL--- Using fudged oFreq = 200.000 (ofreq: 199.998, fudge: 0.002)\n"
            "DLL----- Found valid VCO = 400.000 and div0 = 2.000 (ofreq0_fudge = 0.002)\n"
            "DLL------- Calculating M and D\n"
            "DLL - RK --> _prim = 1 \n"
            "DLL-- For VCO = 400.000000: M = 4.000000, D = (float) 1.000000, (int) 1\n"
            "DLL---- number of valid VCOs: 1\n"
            "DLL ------ getting phases and duty cycles\n"
            "DLL - chosen VCO = 400.000000\n"
            "DLL - chosen M = 4.000000\n"
            "DLL - chosen D = 1\n"
            "DLL - chosen CLKOUT0_DIVIDE_F = 2.000000\n"
            "DLL-- chosen clkout0 output freq = 200.000000 (req = 199.998)\n");
}

TEST_F(FudgeLoopTest, GoesDown) {
  EXPECT_TRUE(Loop(200.003, 399.9999, 400.0001));
  EXPECT_EQ(CountOf(kUpping, trace_), 3);
  EXPECT_EQ(CountOf("Using fudged", trace_), 7);
  EXPECT_THAT(trace_, HasSubstr("DLL--- Using fudged oFreq = 200.006 (ofreq: 200.003, fudge: "
                                "0.003)\n"
                                "DLL----- NO VCO/Div0 pairs found for ofreq0_fudge = 0.003!\n"
                                "DLL---- number of valid VCOs: 0\n"
                                "DLL--- Using fudged oFreq = 200.000 (ofreq: 200.003, fudge: "
                                "-0.003)\n"
                                "DLL----- Found valid VCO = 400.000 and div0 = 2.000 "
                                "(ofreq0_fudge = -0.003)\n"));
  EXPECT_EQ(imp_.GetChosenVCO(), 400.0);
}

// The last fudge is 10.999: 100 + 10.999 lies in the range, with divider 1 only.
TEST_F(FudgeLoopTest, TheLastFudgeIsTried) {
  inFreq_ = 110.999;
  EXPECT_TRUE(Loop(100, 110.9985, 110.9995));
  EXPECT_EQ(CountOf(kUpping, trace_), 10999);
  EXPECT_THAT(trace_, HasSubstr("fudge: 10.999)\nDLL----- Found valid VCO = 110.999 and div0 = "
                                "1.000 (ofreq0_fudge = 10.999)\n"));
  EXPECT_THAT(trace_, Not(HasSubstr("for all possible div0 fudges")));
}

TEST_F(FudgeLoopTest, TheLastFudgeIsTriedDownwardToo) {
  inFreq_ = 89.001;
  EXPECT_TRUE(Loop(100, 89.0005, 89.0015));
  EXPECT_EQ(CountOf(kUpping, trace_), 10999);
  EXPECT_THAT(trace_, HasSubstr("fudge: -10.999)\nDLL----- Found valid VCO = 89.001"));
}

TEST_F(FudgeLoopTest, NoLargerFudgeIsTried) {
  inFreq_ = 111;
  EXPECT_FALSE(Loop(100, 110.9999, 111.0001));
  EXPECT_FALSE(Loop(100, 88.9999, 89.0001));
}

// 11000 fudges, added up step by step. Nothing lies in an empty range, so every pass prints
// the same few lines.
TEST_F(FudgeLoopTest, EndsAfterAllFudges) {
  EXPECT_FALSE(Loop(100, 2, 1));
  EXPECT_EQ(imp_.pll.chosen, nullptr);

  std::string expected;
  double fudge = 0.0;
  for (int pass = 0; pass < 11000; ++pass) {
    char line[200];
    for (const bool upward : {true, false}) {
      // Downward there is nothing to enumerate for a fudge of 0.
      if (upward || pass > 0) {
        const double shift = upward ? fudge : -fudge;
        std::snprintf(line, sizeof line,
                      "DLL--- Using fudged oFreq = %3.3f (ofreq: 100.000, fudge: %2.3f)\n",
                      100.0 + shift, shift);
        expected += line;
        std::snprintf(line, sizeof line,
                      "DLL----- NO VCO/Div0 pairs found for ofreq0_fudge = %1.3f!\n", shift);
        expected += line;
      }
      expected += "DLL---- number of valid VCOs: 0\n";
    }
    fudge += 0.001;
    std::snprintf(line, sizeof line, "%s%1.3f!\n", kUpping, fudge);
    expected += line;
  }
  expected += "DLL- NO VALID VCOs found for all possible div0 fudges!\n";

  // A difference of texts of this size would take too long to print.
  const auto differ = std::mismatch(expected.begin(), expected.end(), trace_.begin(),
                                    trace_.end());
  EXPECT_TRUE(expected == trace_)
      << "after " << differ.first - expected.begin() << " characters";
  EXPECT_TRUE(trace_.ends_with("DLL- NO VALID VCOs found, so upping div0 fudge to 11.000!\n"
                               "DLL- NO VALID VCOs found for all possible div0 fudges!\n"));
}

TEST_F(FudgeLoopTest, AFailedLoopLeavesNothingChosen) {
  ASSERT_TRUE(Loop(200, 400, 1080));
  ASSERT_NE(imp_.pll.chosen, nullptr);
  EXPECT_FALSE(Loop(100, 2, 1));
  EXPECT_EQ(imp_.pll.chosen, nullptr);
  EXPECT_EQ(imp_.GetChosenVCO(), 0.0);
}

// Without a trace the loop leaves out passes that cannot succeed. What it answers is the same,
// at both ends of the fudges and beyond them.
TEST_F(FudgeLoopTest, AnswersTheSameWithTheTraceOff) {
  struct Case {
    double inFreq, freq, least, most;
  };
  for (const Case& c : {Case{100, 200, 400, 1080}, Case{100, 199.998, 399.9999, 400.0001},
                        Case{100, 200.003, 399.9999, 400.0001},
                        Case{110.999, 100, 110.9985, 110.9995},
                        Case{89.001, 100, 89.0005, 89.0015}, Case{111, 100, 110.9999, 111.0001},
                        Case{89, 100, 88.9999, 89.0001}, Case{100, 0, 400, 1080},
                        Case{100, -5, 400, 1080}, Case{33, 7.3, 1079.99, 1080}}) {
    inFreq_ = c.inFreq;
    const bool solved = Loop(c.freq, c.least, c.most);
    const double vco = imp_.GetChosenVCO();
    const double div0 = imp_.GetChosenDiv0();
    const double m = imp_.GetChosenM();
    const int d = imp_.GetChosenD();
    imp_.pll.chosen = nullptr;
    const Trace silent(false);
    EXPECT_EQ(Ip::Pll::FudgeLoop(imp_, {inFreq_, 1, kPll, silent}), solved) << c.freq;
    EXPECT_EQ(imp_.GetChosenVCO(), vco) << c.freq;
    EXPECT_EQ(imp_.GetChosenDiv0(), div0) << c.freq;
    EXPECT_EQ(imp_.GetChosenM(), m) << c.freq;
    EXPECT_EQ(imp_.GetChosenD(), d) << c.freq;
  }
}

TEST_F(FudgeLoopTest, IsSilentWithTheTraceOff) {
  imp_.pll.minAdjVco = 2;
  imp_.pll.maxAdjVco = 1;
  const std::string text = engine_test::TraceOf(
      [&](const Trace& trace) {
        EXPECT_FALSE(Ip::Pll::FudgeLoop(imp_, {100, 1, kPll, trace}));
      },
      false);
  EXPECT_EQ(text, "");
}

}  // namespace
