// Tests of the enumeration of output-0 dividers.

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>

#include "engine/pll/Div0Steps.h"
#include "engine/pll/Stages.h"
#include "tests/engine/EngineTest.h"

namespace {

using engine_test::Above;
using engine_test::Below;
using engine_test::kInfinity;
using engine_test::kNan;
using engine_test::SlotsOf;
using Ip::Trace;
using Ip::VorkelImp;
using Ip::Pll::VcoCandidate;
using Ip::Pll::VcoCandidateTable;
using testing::ElementsAre;
using testing::IsEmpty;

class VcoEnumerationTest : public testing::Test {
 protected:
  void SetRange(double least, double most) {
    imp_.pll.minAdjVco = least;
    imp_.pll.maxAdjVco = most;
  }

  int Enumerate(double freq, double fudge, bool integerDiv0) {
    int created = -1;
    trace_ = engine_test::TraceOf([&](const Trace& trace) {
      created = Ip::Pll::EnumerateVcoCandidates(imp_, freq, fudge, Ip::Pll::Div0Steps(integerDiv0), trace);
    });
    return created;
  }

  VorkelImp& imp_ = engine_test::NewImp();
  VcoCandidateTable& table_ = imp_.pll._vcoCandidates;
  std::string trace_;
};

TEST_F(VcoEnumerationTest, WholeDividers) {
  SetRange(400, 1080);
  EXPECT_EQ(Enumerate(200, 0, true), 4);
  EXPECT_THAT(SlotsOf(table_.Occupied()), ElementsAre(1, 2, 3, 4));
  EXPECT_EQ(trace_,
            "DLL--- Using fudged oFreq = 200.000 (ofreq: 200.000, fudge: 0.000)\n"
            "DLL----- Found valid VCO = 400.000 and div0 = 2.000 (ofreq0_fudge = 0.000)\n"
            "DLL----- Found valid VCO = 600.000 and div0 = 3.000 (ofreq0_fudge = 0.000)\n"
            "DLL----- Found valid VCO = 800.000 and div0 = 4.000 (ofreq0_fudge = 0.000)\n"
            "DLL----- Found valid VCO = 1000.000 and div0 = 5.000 (ofreq0_fudge = 0.000)\n");
}

TEST_F(VcoEnumerationTest, FractionalDividersBeginWith1AndGoOnInEighthsFrom2) {
  SetRange(100, 250);
  EXPECT_EQ(Enumerate(100, 0, false), 6);
  EXPECT_THAT(SlotsOf(table_.Occupied()), ElementsAre(0, 1, 2, 3, 4, 5));
  EXPECT_EQ(trace_,
            "DLL--- Using fudged oFreq = 100.000 (ofreq: 100.000, fudge: 0.000)\n"
            "DLL----- Found valid VCO = 100.000 and div0 = 1.000 (ofreq0_fudge = 0.000)\n"
            "DLL----- Found valid VCO = 200.000 and div0 = 2.000 (ofreq0_fudge = 0.000)\n"
            "DLL----- Found valid VCO = 212.500 and div0 = 2.125 (ofreq0_fudge = 0.000)\n"
            "DLL----- Found valid VCO = 225.000 and div0 = 2.250 (ofreq0_fudge = 0.000)\n"
            "DLL----- Found valid VCO = 237.500 and div0 = 2.375 (ofreq0_fudge = 0.000)\n"
            "DLL----- Found valid VCO = 250.000 and div0 = 2.500 (ofreq0_fudge = 0.000)\n");
}

TEST_F(VcoEnumerationTest, FractionalModeFillsTheWholeTable) {
  SetRange(1, 128);
  EXPECT_EQ(Enumerate(1, 0, false), 1010);
  ASSERT_EQ(table_.Occupied().Count(), 1010);
  EXPECT_EQ(table_[0].div0, 1.0);
  for (int slot = 1; slot < 1010; ++slot) {
    EXPECT_EQ(table_[slot].div0, 2.0 + (slot - 1) * 0.125) << slot;
    EXPECT_EQ(table_[slot].vco, table_[slot].div0) << slot;
  }
  EXPECT_EQ(table_[1009].div0, 128.0);
}

TEST_F(VcoEnumerationTest, IntegerModeFillsTheFirst128Slots) {
  SetRange(0, 1e6);
  EXPECT_EQ(Enumerate(1, 0, true), 128);
  ASSERT_EQ(table_.Occupied().Count(), 128);
  for (int slot = 0; slot < 128; ++slot) {
    EXPECT_EQ(table_[slot].div0, slot + 1.0) << slot;
    EXPECT_EQ(table_[slot].vco, slot + 1.0) << slot;
  }
}

TEST_F(VcoEnumerationTest, BothEndsOfTheRangeBelongToIt) {
  SetRange(400, 600);
  EXPECT_EQ(Enumerate(200, 0, true), 2);
  SetRange(Above(400), 600);
  table_.EmptyAll();
  EXPECT_EQ(Enumerate(200, 0, true), 1);
  EXPECT_EQ(table_[2].vco, 600.0);
  SetRange(400, Below(600));
  table_.EmptyAll();
  EXPECT_EQ(Enumerate(200, 0, true), 1);
  EXPECT_EQ(table_[1].vco, 400.0);
}

TEST_F(VcoEnumerationTest, TheFudgeShiftsTheFrequency) {
  SetRange(400, 1080);
  EXPECT_EQ(Enumerate(395.5, 4.5, true), 2);
  EXPECT_EQ(trace_,
            "DLL--- Using fudged oFreq = 400.000 (ofreq: 395.500, fudge: 4.500)\n"
            "DLL----- Found valid VCO = 400.000 and div0 = 1.000 (ofreq0_fudge = 4.500)\n"
            "DLL----- Found valid VCO = 800.000 and div0 = 2.000 (ofreq0_fudge = 4.500)\n");
  table_.EmptyAll();
  EXPECT_EQ(Enumerate(1000.5, -0.5, true), 1);
  EXPECT_EQ(trace_,
            "DLL--- Using fudged oFreq = 1000.000 (ofreq: 1000.500, fudge: -0.500)\n"
            "DLL----- Found valid VCO = 1000.000 and div0 = 1.000 (ofreq0_fudge = -0.500)\n");
}

TEST_F(VcoEnumerationTest, MultipliesTheSum) {
  SetRange(400, 1080);
  volatile double fudge = 0.001;
  volatile double freq = 148.35;
  ASSERT_GT(Enumerate(freq, fudge, true), 0);
  for (const int slot : table_.Occupied()) {
    EXPECT_EQ(table_[slot].vco, (fudge + freq) * (slot + 1)) << slot;
  }
}

TEST_F(VcoEnumerationTest, ReportsThatThereIsNone) {
  SetRange(400, 1080);
  EXPECT_EQ(Enumerate(1100, 0, true), 0);
  EXPECT_EQ(trace_,
            "DLL--- Using fudged oFreq = 1100.000 (ofreq: 1100.000, fudge: 0.000)\n"
            "DLL----- NO VCO/Div0 pairs found for ofreq0_fudge = 0.000!\n");
  EXPECT_EQ(Enumerate(3, -0.005, false), 0);
  EXPECT_EQ(trace_,
            "DLL--- Using fudged oFreq = 2.995 (ofreq: 3.000, fudge: -0.005)\n"
            "DLL----- NO VCO/Div0 pairs found for ofreq0_fudge = -0.005!\n");
  EXPECT_THAT(SlotsOf(table_.Occupied()), IsEmpty());
}

TEST_F(VcoEnumerationTest, IsSilentWithTheTraceOff) {
  SetRange(400, 1080);
  const std::string text = engine_test::TraceOf(
      [&](const Trace& trace) {
        Ip::Pll::EnumerateVcoCandidates(imp_, 200, 0, Ip::Pll::Div0Steps(true), trace);
        Ip::Pll::EnumerateVcoCandidates(imp_, 0, 0, Ip::Pll::Div0Steps(true), trace);
      },
      false);
  EXPECT_EQ(text, "");
  EXPECT_EQ(table_.Occupied().Count(), 4);
}

TEST_F(VcoEnumerationTest, TakesOverSlotsOfValidVcosAndLeavesTheOthers) {
  SetRange(400, 1080);
  for (const int slot : {0, 1, 900}) {
    table_.Put(slot, 777.0, 7.0);
    VcoCandidate& old = table_[slot];
    old.m = 7.0;
    old.d = 1;
    old.divN.fill(1);
  }
  EXPECT_EQ(Enumerate(200, 0, true), 4) << "counts what it creates";
  EXPECT_THAT(SlotsOf(table_.Occupied()), ElementsAre(0, 1, 2, 3, 4, 900));
  for (const int slot : {0, 900}) {
    EXPECT_EQ(table_[slot].vco, 777.0) << slot;
    EXPECT_EQ(table_[slot].m, 7.0) << slot;
    EXPECT_EQ(table_[slot].divN[3], 1u) << slot;
  }
  const VcoCandidate& taken = table_[1];
  EXPECT_EQ(taken.vco, 400.0);
  EXPECT_EQ(taken.div0, 2.0);
  EXPECT_EQ(taken.m, 0.0);
  EXPECT_EQ(taken.d, 0u);
}

// 1000 MHz is far above what this device allows at an output; the VCO range alone counts.
TEST_F(VcoEnumerationTest, DoesNotLookAtTheOutputLimits) {
  SetRange(400, 1080);
  imp_.pllLimits.clkoutMin = 100;
  imp_.pllLimits.clkoutMax = 200;
  EXPECT_EQ(Enumerate(1000, 0, true), 1);
  table_.EmptyAll();
  EXPECT_EQ(Enumerate(10, 0, true), 69) << "dividers 40 to 108";
}

TEST_F(VcoEnumerationTest, OddFrequenciesGiveNoCandidates) {
  SetRange(400, 1080);
  for (const double freq : {0.0, -200.0, kNan, kInfinity, -kInfinity, 1e-300, 1e300}) {
    EXPECT_EQ(Enumerate(freq, 0, false), 0) << freq;
    EXPECT_EQ(Enumerate(freq, 0, true), 0) << freq;
  }
}

TEST_F(VcoEnumerationTest, ARangeThatIsNoNumberHoldsNothing) {
  SetRange(400, kNan);
  EXPECT_EQ(Enumerate(200, 0, true), 0);
  SetRange(kNan, 1080);
  EXPECT_EQ(Enumerate(200, 0, true), 0);
}

// Products of the smallest doubles are rounded to whole multiples of 5e-324: 2.625 times it is
// three of them, as many as 3 times, and lies in the range.
TEST_F(VcoEnumerationTest, TheSmallestFrequencies) {
  const double smallest = 5e-324;
  SetRange(3 * smallest, 3 * smallest);
  EXPECT_EQ(Enumerate(smallest, 0, false), 7) << "2.625, 2.75, ... 3.375";
  EXPECT_THAT(SlotsOf(table_.Occupied()), ElementsAre(6, 7, 8, 9, 10, 11, 12));
}

// --- Steps -----------------------------------------------------------------------------------

using Ip::Pll::Div0Steps;

TEST(Div0Steps, AreWholeOrEighthsFrom2On) {
  const Div0Steps whole(true);
  ASSERT_EQ(whole.Count(), 128);
  for (int step = 0; step < 128; ++step) EXPECT_EQ(whole[step], step + 1.0);
  const Div0Steps eighths(false);
  ASSERT_EQ(eighths.Count(), 1010);
  double divider = 2.0;
  EXPECT_EQ(eighths[0], 1.0);
  for (int step = 1; step < 1010; ++step) {
    EXPECT_EQ(eighths[step], divider);
    divider += 0.125;
  }
}

TEST(Div0Steps, BelowIsTheLastStepThatIsNotAbove) {
  for (const bool integer : {true, false}) {
    const Div0Steps steps(integer);
    for (int step = 0; step < steps.Count(); ++step) {
      EXPECT_EQ(steps.Below(steps[step]), step);
      EXPECT_EQ(steps.Below(Below(steps[step])), step == 0 ? 0 : step - 1);
    }
    EXPECT_EQ(steps.Below(1.9), 0);
    EXPECT_EQ(steps.Below(-3), 0);
    EXPECT_EQ(steps.Below(kNan), 0);
    EXPECT_EQ(steps.Below(200), steps.Count() - 1);
    EXPECT_EQ(steps.Below(kInfinity), steps.Count() - 1);
  }
}

// No step before it may bring the frequency up to the VCO minimum, however the numbers round.
TEST(Div0Steps, NoneBeforeTheFirstWorthTryingReachesTheMinimum) {
  for (const bool integer : {true, false}) {
    const Div0Steps steps(integer);
    for (const double freq : {0.1, 1.0 / 3.0, 3.14, 27.0, 66.6, 148.35, 399.9, 1e-300, 1e300}) {
      for (int meets = 0; meets < steps.Count(); meets += 7) {
        const double exact = freq * steps[meets];
        for (const double minimum : {exact, Above(exact), Below(exact)}) {
          const int first = steps.FirstWorthTrying(freq, minimum);
          ASSERT_GE(first, 0);
          ASSERT_LE(first, steps.Count());
          if (first > 0) {
            EXPECT_FALSE(freq * steps[first - 1] >= minimum) << freq << " " << minimum;
          }
        }
      }
    }
  }
}

TEST(Div0Steps, OddFrequencies) {
  const Div0Steps steps(false);
  EXPECT_EQ(steps.FirstWorthTrying(0.0, 400), 1010);
  EXPECT_EQ(steps.FirstWorthTrying(-1.0, 400), 1010);
  EXPECT_EQ(steps.FirstWorthTrying(kNan, 400), 1010);
  EXPECT_EQ(steps.FirstWorthTrying(-1.0, -400), 0);
  EXPECT_EQ(steps.FirstWorthTrying(0.0, 0.0), 0);
  EXPECT_EQ(steps.FirstWorthTrying(1.0, kNan), 0);
  EXPECT_EQ(steps.FirstWorthTrying(kInfinity, 400), 0);
}

TEST_F(VcoEnumerationTest, ANegativeRangeHoldsNegativeFrequencies) {
  SetRange(-800, 1080);
  EXPECT_EQ(Enumerate(-200, 0, true), 4) << "-200, -400, -600, -800";
  EXPECT_EQ(table_[3].vco, -800.0);
}

}  // namespace
