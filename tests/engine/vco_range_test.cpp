// Tests of the preparation of a run: requests, limits and the working range.

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <climits>
#include <cmath>
#include <string>

#include "engine/pll/Stages.h"
#include "tests/engine/EngineTest.h"
#include "tests/support/FakeHost.h"

namespace {

using engine_test::Above;
using engine_test::Below;
using engine_test::kInfinity;
using engine_test::kNan;
using Ip::Trace;
using Ip::VorkelImp;
using testing::ElementsAre;
using testing::IsEmpty;

constexpr char kPart[] = "ranger";

class VcoRangeTest : public testing::Test {
 protected:
  VcoRangeTest() {
    host_.Reset();
    SetPll(kPart, {.vcoMin = 400, .vcoMax = 1080});
    SetTsyn(kPart, {.vcoMin = 600, .vcoMax = 1440});
    imp_.SetDevice(kPart);
  }

  int Prepare(const char* outFreqs, int count, double inFreq, double inFreq2, int prim = 1) {
    int code = 0;
    trace_ = engine_test::TraceOf([&](const Trace& trace) {
      code = Ip::Pll::PrepareVcoRange(imp_, outFreqs, inFreq2, {inFreq, count, prim, trace});
    });
    return code;
  }

  FakeHost& host_ = FakeHost::Instance();
  VorkelImp& imp_ = engine_test::NewImp();
  std::string trace_;
};

TEST_F(VcoRangeTest, OneInputClockOfAPllHasTheWholeRange) {
  EXPECT_EQ(Prepare("200 50", 2, 100, 0), 1);
  EXPECT_EQ(imp_.pll.minAdjVco, 400.0);
  EXPECT_EQ(imp_.pll.maxAdjVco, 1080.0);
  EXPECT_EQ(imp_.pll.minM, 4.0);
  EXPECT_EQ(imp_.pll.maxM, 10.8);
  EXPECT_THAT(imp_.requests.reqOutFreq, ElementsAre(200, 50, 0, 0, 0, 0, 0));
  EXPECT_EQ(trace_,
            "DLL---- minAdjVco = 400.000000\n"
            "DLL---- maxAdjVco = 1080.000000\n"
            "DLL---- minM = 4.000000\n"
            "DLL---- maxM = 10.800000\n");
}

TEST_F(VcoRangeTest, ATsynHasItsOwnLimits) {
  EXPECT_EQ(Prepare("200", 1, 100, 0, 0), 1);
  EXPECT_EQ(imp_.pllLimits.vcoTarget, 1000.0);
  EXPECT_EQ(trace_,
            "DLL---- minAdjVco = 600.000000\n"
            "DLL---- maxAdjVco = 1440.000000\n"
            "DLL---- minM = 6.000000\n"
            "DLL---- maxM = 14.400000\n");
}

TEST_F(VcoRangeTest, IsSilentWithTheTraceOff) {
  const std::string text = engine_test::TraceOf(
      [&](const Trace& trace) {
        EXPECT_EQ(Ip::Pll::PrepareVcoRange(imp_, "200", 20, {100, 1, 1, trace}), 3);
      },
      false);
  EXPECT_EQ(text, "");
}

// --- Two input clocks ------------------------------------------------------------------------

TEST_F(VcoRangeTest, EqualInputClocksLeaveTheRange) {
  EXPECT_EQ(Prepare("200", 1, 70, 70), 1);
  EXPECT_EQ(imp_.pll.minAdjVco, 400.0);
  EXPECT_EQ(imp_.pll.maxAdjVco, 1080.0);
}

TEST_F(VcoRangeTest, AFasterSecondClockLowersTheMaximum) {
  SetPll(kPart, {.vcoMin = 400, .vcoMax = 1000});
  EXPECT_EQ(Prepare("200", 1, 100, 200), 1);
  EXPECT_EQ(trace_,
            "DLL---- minAdjVco = 400.000000\n"
            "DLL---- maxAdjVco = 500.000000\n"
            "DLL---- minM = 4.000000\n"
            "DLL---- maxM = 5.000000\n");
}

TEST_F(VcoRangeTest, ASlowerSecondClockRaisesTheMinimum) {
  EXPECT_EQ(Prepare("200", 1, 100, 50), 1);
  EXPECT_EQ(trace_,
            "DLL---- minAdjVco = 800.000000\n"
            "DLL---- maxAdjVco = 1080.000000\n"
            "DLL---- minM = 8.000000\n"
            "DLL---- maxM = 10.800000\n");
}

// The quotient of the clocks is formed first. For these clocks another grouping gives another
// double.
TEST_F(VcoRangeTest, FormsTheQuotientOfTheClocksFirst) {
  volatile double fast = 110;
  volatile double slow = 30;
  ASSERT_NE(400.0 * (fast / slow), 400.0 * fast / slow);
  SetPll(kPart, {.vcoMin = 400, .vcoMax = 3000});
  EXPECT_EQ(Prepare("200", 1, fast, slow), 1);
  EXPECT_EQ(imp_.pll.minAdjVco, 400.0 * (fast / slow));
  EXPECT_EQ(imp_.pll.minM, 400.0 * (fast / slow) / fast);

  fast = 90;
  slow = 70;
  ASSERT_NE(1080.0 / (fast / slow), 1080.0 * slow / fast);
  SetPll(kPart, {.vcoMin = 400, .vcoMax = 1080});
  EXPECT_EQ(Prepare("200", 1, slow, fast), 1);
  EXPECT_EQ(imp_.pll.maxAdjVco, 1080.0 / (fast / slow));
  EXPECT_EQ(imp_.pll.maxM, 1080.0 / (fast / slow) / slow);
}

TEST_F(VcoRangeTest, ClocksTooFarApartLeaveNoRange) {
  // 400 * (100 / 20) = 2000 and 1080 / (500 / 100) = 216.
  EXPECT_EQ(Prepare("200", 1, 100, 20), 3);
  EXPECT_EQ(trace_,
            "DLL---- minAdjVco = 2000.000000\n"
            "DLL---- maxAdjVco = 1080.000000\n"
            "DLL---- minM = 20.000000\n"
            "DLL---- maxM = 10.800000\n"
            "DLL---- There is no valid working range for either VCO or M!\n");
  EXPECT_EQ(Prepare("200", 1, 100, 500), 3);
  EXPECT_EQ(trace_,
            "DLL---- minAdjVco = 400.000000\n"
            "DLL---- maxAdjVco = 216.000000\n"
            "DLL---- minM = 4.000000\n"
            "DLL---- maxM = 2.160000\n"
            "DLL---- There is no valid working range for either VCO or M!\n");
}

TEST_F(VcoRangeTest, ARangeOfOneFrequencyIsARange) {
  SetPll(kPart, {.vcoMin = 400, .vcoMax = 800});
  EXPECT_EQ(Prepare("200", 1, 200, 100), 1);
  EXPECT_EQ(imp_.pll.minAdjVco, imp_.pll.maxAdjVco);
  // The next slower clock makes the quotient, and with it the minimum, one step larger.
  EXPECT_EQ(Prepare("200", 1, 200, Below(100)), 3);
  EXPECT_EQ(Prepare("200", 1, 100, 200), 1);
  EXPECT_EQ(imp_.pll.maxAdjVco, 400.0);
  EXPECT_EQ(Prepare("200", 1, 100, Above(200)), 3);
}

TEST_F(VcoRangeTest, ADeviceWithAnEmptyRangeHasNone) {
  SetPll(kPart, {.vcoMin = 1000, .vcoMax = 999});
  EXPECT_EQ(Prepare("200", 1, 100, 0), 3);
}

// --- Requests --------------------------------------------------------------------------------

TEST_F(VcoRangeTest, AnEmptyOrShortListIsABadRequest) {
  EXPECT_EQ(Prepare("", 1, 100, 0), 4);
  EXPECT_EQ(Prepare("   ", 1, 100, 0), 4);
  EXPECT_EQ(Prepare("200 100", 3, 100, 0), 4);
  EXPECT_EQ(trace_, "");
  EXPECT_THAT(imp_.requests.reqOutFreq, ElementsAre(200, 100, 0, 0, 0, 0, 0));
  EXPECT_THAT(host_.reads, IsEmpty()) << "the limits come after the list";
}

TEST_F(VcoRangeTest, ACountOutsideTheOutputsIsABadRequest) {
  for (const int count : {0, -1, INT_MIN, 8, INT_MAX}) {
    EXPECT_EQ(Prepare("1 2 3 4 5 6 7 8 9", count, 100, 0), 4) << count;
  }
  EXPECT_THAT(imp_.requests.reqOutFreq, ElementsAre(0, 0, 0, 0, 0, 0, 0));
}

TEST_F(VcoRangeTest, SevenOutputsAreNot) {
  EXPECT_EQ(Prepare("1 2 3 4 5 6 7 8", 7, 100, 0), 1);
  EXPECT_THAT(imp_.requests.reqOutFreq, ElementsAre(1, 2, 3, 4, 5, 6, 7));
}

TEST_F(VcoRangeTest, AnItemThatIsNoNumberReadsAsZero) {
  EXPECT_EQ(Prepare("fast 50", 2, 100, 0), 1);
  EXPECT_THAT(imp_.requests.reqOutFreq, ElementsAre(0, 50, 0, 0, 0, 0, 0));
}

TEST_F(VcoRangeTest, AnInputFrequencyOfZeroIsABadRequest) {
  EXPECT_EQ(Prepare("200", 1, 0.0, 0), 4);
  EXPECT_EQ(Prepare("200", 1, -0.0, 0), 4);
  EXPECT_EQ(Prepare("200", 1, 0.0, 100), 4);
  EXPECT_EQ(imp_.requests.reqOutFreq[0], 200.0) << "the list comes first";
  EXPECT_THAT(host_.reads, IsEmpty());
}

// --- Limits ----------------------------------------------------------------------------------

TEST_F(VcoRangeTest, WithoutSpeedDataThereIsNoRun) {
  host_.devices[kPart].erase("CLKPFD_FREQ_MAX");
  imp_.pll.minAdjVco = 1.0;
  imp_.pll.maxAdjVco = 2.0;
  EXPECT_EQ(Prepare("200", 1, 100, 0), 2);
  EXPECT_EQ(trace_, "");
  EXPECT_EQ(imp_.pll.minAdjVco, 1.0);
  EXPECT_EQ(imp_.pll.maxAdjVco, 2.0);
  EXPECT_EQ(imp_.pllLimits.vcoMax, 1080.0) << "read before the missing keyword";
}

TEST_F(VcoRangeTest, BadRequestsAreFoundBeforeMissingSpeedData) {
  host_.devices[kPart].clear();
  EXPECT_EQ(Prepare("", 1, 100, 0), 4);
  EXPECT_EQ(Prepare("200", 1, 0, 0), 4);
  EXPECT_THAT(host_.messages, IsEmpty());
  EXPECT_EQ(Prepare("200", 1, 100, 0), 2);
}

TEST_F(VcoRangeTest, AnUnknownPrimitiveHasNoLimits) {
  for (const int prim : {2, -1, INT_MAX}) EXPECT_EQ(Prepare("200", 1, 100, 0, prim), 2) << prim;
  EXPECT_THAT(host_.messages, IsEmpty());
}

TEST_F(VcoRangeTest, EveryRunReadsTheLimitsAnew) {
  ASSERT_EQ(Prepare("200", 1, 100, 50), 1);
  ASSERT_EQ(Prepare("200", 1, 100, 0), 1);
  EXPECT_EQ(imp_.pll.minAdjVco, 400.0);
  SetPll(kPart, {.vcoMin = 300, .vcoMax = 1080});
  ASSERT_EQ(Prepare("200", 1, 100, 0), 1);
  EXPECT_EQ(imp_.pll.minAdjVco, 300.0);
}

// --- Frequencies that no clock has -----------------------------------------------------------

TEST_F(VcoRangeTest, NegativeInputTurnsTheRangeOfMAround) {
  EXPECT_EQ(Prepare("200", 1, -100, 0), 3);
  EXPECT_EQ(trace_,
            "DLL---- minAdjVco = 400.000000\n"
            "DLL---- maxAdjVco = 1080.000000\n"
            "DLL---- minM = -4.000000\n"
            "DLL---- maxM = -10.800000\n"
            "DLL---- There is no valid working range for either VCO or M!\n");
}

TEST_F(VcoRangeTest, NegativeSecondInputIsTakenAsTheFormulaTakesIt) {
  // 400 * (100 / -50).
  EXPECT_EQ(Prepare("200", 1, 100, -50), 1);
  EXPECT_EQ(imp_.pll.minAdjVco, -800.0);
  EXPECT_EQ(imp_.pll.maxAdjVco, 1080.0);
  EXPECT_EQ(imp_.pll.minM, -8.0);
}

TEST_F(VcoRangeTest, InfiniteInput) {
  EXPECT_EQ(Prepare("200", 1, kInfinity, 0), 1);
  EXPECT_EQ(imp_.pll.minM, 0.0);
  EXPECT_EQ(imp_.pll.maxM, 0.0);
  EXPECT_EQ(Prepare("200", 1, 100, kInfinity), 3);
  EXPECT_EQ(imp_.pll.maxAdjVco, 0.0);
  EXPECT_EQ(Prepare("200", 1, kInfinity, 100), 3);
  EXPECT_EQ(imp_.pll.minAdjVco, kInfinity);
}

// NaN is above nothing: the range tests hold, and no VCO will lie in the range.
TEST_F(VcoRangeTest, InputThatIsNoNumber) {
  EXPECT_EQ(Prepare("200", 1, kNan, 0), 1);
  EXPECT_TRUE(std::isnan(imp_.pll.minM));
  EXPECT_TRUE(std::isnan(imp_.pll.maxM));
  EXPECT_EQ(imp_.pll.maxAdjVco, 1080.0);
  EXPECT_EQ(Prepare("200", 1, 100, kNan), 1);
  EXPECT_EQ(imp_.pll.minAdjVco, 400.0);
  EXPECT_TRUE(std::isnan(imp_.pll.maxAdjVco)) << "not (100 >= NaN), so the maximum moves";
}

TEST_F(VcoRangeTest, ATinyInputMakesBothMInfinite) {
  EXPECT_EQ(Prepare("200", 1, 5e-324, 0), 1);
  EXPECT_EQ(imp_.pll.minM, kInfinity);
  EXPECT_EQ(imp_.pll.maxM, kInfinity);
}

}  // namespace
