// Tests of the entry of the KRU_CLKGEN solver, alone and after runs of the KRU_SP.

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <climits>
#include <string>

#include "tests/engine/KruTest.h"

namespace {

using engine_test::Names;
using Ip::VorkelImp;
using testing::Each;
using testing::ElementsAre;
using testing::IsEmpty;

constexpr char kPart[] = "clkgen";
constexpr char kStart[] = "DLL- starting to calculate KRU_CLKGEN actuals \n";
constexpr char kFailed[] = "DLL ---- KRU_CLKGEN won't work!!\n";
constexpr char kDefaultRanges[] =
    "DLL --- KRU_CLKGEN output clock valid freq ranges:\n"
    "DLL ------> CLKFX min = 5.000; max = 374.532\n"
    "DLL ------> CLKFXDV min = 0.156; max = 187.266\n";
constexpr char kLoadedRanges[] =
    "DLL --- KRU_CLKGEN output clock valid freq ranges:\n"
    "DLL ------> CLKFX min = 8.000; max = 500.000\n"
    "DLL ------> CLKFXDV min = 0.156; max = 187.266\n";

class ClkgenDriverTest : public testing::Test {
 protected:
  ClkgenDriverTest() {
    host_.Reset();
    engine_test::SetKru(kPart);
    auto& keys = host_.devices[kPart];
    keys["D_KRU_CLKFXDV_CLKIN_DIVIDE_BY_2_FALSE_MAXPERIOD"] = FigureFor(4000);
    keys["D_KRU_CLKFXDV_CLKIN_DIVIDE_BY_2_FALSE_MINPERIOD"] = FigureFor(4);
    imp_.SetDevice(kPart);
  }

  int Run(const char* freqs, const char* phases, double inFreq, int numOut) {
    CaptureTrace capture;
    const int code = imp_.KruClkgenCalculateActuals(freqs, phases, inFreq, numOut, true);
    trace_ = capture.Text();
    return code;
  }

  int RunKruSp(const char* freqs, const char* phases, double inFreq, int numOut) {
    return imp_.KruCalculateActuals(freqs, phases, inFreq, numOut, true, false);
  }

  void ExpectChosen(const std::string& pins, int m, int d, double dv) const {
    EXPECT_EQ(Names(imp_.kru._kruChosenPin), pins);
    EXPECT_EQ(imp_.GetKruChosenM(), m);
    EXPECT_EQ(imp_.GetKruChosenD(), d);
    EXPECT_EQ(imp_.GetKruChosenClkfxdv(), dv);
    EXPECT_EQ(imp_.GetKruChosenClkdv(), dv) << "one value";
  }

  void ExpectRefused(const char* freqs, const char* phases, double inFreq, int numOut) {
    EXPECT_EQ(Run(freqs, phases, inFreq, numOut), 3);
    EXPECT_EQ(trace_, std::string(kStart) + kFailed);
  }

  FakeHost& host_ = FakeHost::Instance();
  VorkelImp& imp_ = engine_test::NewImp();
  std::string trace_;
};

// --- Whole runs ----------------------------------------------------------------------------------

TEST_F(ClkgenDriverTest, OneOutput) {
  EXPECT_EQ(Run("150", "0", 100, 1), 1);
  EXPECT_EQ(trace_, std::string(kStart) + kDefaultRanges +
                        "DLL ---- Calculating KRU_CLKGEN actuals \n"
                        "DLL ------ Clk_Out0 ofreq = 150.000\n"
                        "DLL ----- found 85 possible M and Ds\n"
                        "DLL -- found M = 3, D = 2, DV = 0\n"
                        "DLL - for CLK_OUT0, chosen KRU_CLKGEN pin = CLKFX\n"
                        "DLL - chosen M = 3\n"
                        "DLL - chosen D = 2\n");
  ExpectChosen("CLKFX", 3, 2, 0);
  EXPECT_EQ(imp_.GetKruChosenOutFreqN(100, 0), 150.0);
  EXPECT_EQ(imp_.GetKruChosenPinname(1), Port::StringBase("NONE"));
  EXPECT_EQ(imp_.GetKruChosenPinname(6), Port::StringBase("NONE"));
}

TEST_F(ClkgenDriverTest, EveryPin) {
  EXPECT_EQ(Run("127 127 63.5", "90 180 0", 64, 3), 1);
  EXPECT_EQ(trace_, std::string(kStart) + kDefaultRanges +
                        "DLL ---- Calculating KRU_CLKGEN actuals \n"
                        "DLL ------ Clk_Out0 ofreq = 127.000\n"
                        "DLL -- Found 2 possible M/D pairs for CLK_OUT1\n"
                        "DLL ------ Clk_Out1 ofreq = 127.000; phase = 180.000\n"
                        "DLL ----- for clk1, found match: CLKFX180\n"
                        "DLL ----- for clk1, found 2 possible M/D pairs that work for CLKFX\n"
                        "DLL ------ Clk_Out2 ofreq = 63.500; phase = 0.000\n"
                        "DLL ----- for clk2, CLKFX doesn't work, so trying CLKFXDV\n"
                        "DLL ----- found 2 possible M and Ds\n"
                        "DLL -- found M = 127, D = 64, DV = 2\n"
                        "DLL - for CLK_OUT0, chosen KRU_CLKGEN pin = CLKFX\n"
                        "DLL - for CLK_OUT1, chosen KRU_CLKGEN pin = CLKFX180\n"
                        "DLL - for CLK_OUT2, chosen KRU_CLKGEN pin = CLKFXDV\n"
                        "DLL - chosen M = 127\n"
                        "DLL - chosen D = 64\n"
                        "DLL - chosen DV = 2.000000\n");
  ExpectChosen("CLKFX CLKFX180 CLKFXDV", 127, 64, 2);
  EXPECT_EQ(imp_.GetKruChosenOutFreqN(64, 1), 127.0);
  EXPECT_EQ(imp_.GetKruChosenOutFreqN(64, 2), 0.0) << "CLKFXDV has no frequency there";
}

TEST_F(ClkgenDriverTest, NoConfiguration) {
  EXPECT_EQ(Run("127 80", "0 0", 64, 2), 3);
  EXPECT_EQ(trace_,
            std::string(kStart) + kDefaultRanges +
                "DLL ---- Calculating KRU_CLKGEN actuals \n"
                "DLL ------ Clk_Out0 ofreq = 127.000\n"
                "DLL -- Found 2 possible M/D pairs for CLK_OUT1\n"
                "DLL ------ Clk_Out1 ofreq = 80.000; phase = 0.000\n"
                "DLL ----- for clk1, CLKFX doesn't work, so trying CLKFXDV\n"
                "DLL ----- for clk 1, not a CLKFXDV solution, so remove M = 127, D = 64\n"
                "DLL ----- for clk 1, not a CLKFXDV solution, so remove M = 254, D = 128\n"
                "DLL --- couldn't find any M and Ds for clknum 1\n"
                "DLL -- couldn't find an M and D\n"
                "DLL ---- KRU_CLKGEN won't work!!\n");
}

TEST_F(ClkgenDriverTest, IsSilentWithTheTraceOff) {
  CaptureTrace capture;
  EXPECT_EQ(imp_.KruClkgenCalculateActuals("127 63.5", "0 0", 64, 2, false), 1);
  EXPECT_EQ(imp_.KruClkgenCalculateActuals("127 80", "0 0", 64, 2, false), 3);
  EXPECT_EQ(imp_.KruClkgenCalculateActuals("", "", 64, 2, false), 3);
  EXPECT_EQ(capture.Text(), "");
}

// --- Bad requests --------------------------------------------------------------------------------

TEST_F(ClkgenDriverTest, EmptyAndShortLists) {
  ExpectRefused("", "0", 100, 1);
  ExpectRefused("150", "", 100, 1);
  ExpectRefused("  ", "0", 100, 1);
  ExpectRefused("150", "0 0", 100, 2);
  ExpectRefused("150 75", "0", 100, 2);
  ExpectRefused("150 75 75 75 75", "0 0 0 0 0 0", 100, 6);
}

TEST_F(ClkgenDriverTest, CountsThatThereAreNot) {
  for (const int numOut : {0, -1, INT_MIN, 7, 8, 1000000, INT_MAX}) {
    ExpectRefused("1 2 3 4 5 6 7 8", "1 2 3 4 5 6 7 8", 100, numOut);
    EXPECT_THAT(imp_.requests.reqOutFreq, Each(0.0)) << numOut;
    EXPECT_THAT(imp_.requests.reqPhase, Each(0.0)) << numOut;
  }
}

TEST_F(ClkgenDriverTest, NoInputFrequency) {
  ExpectRefused("150", "0", 0.0, 1);
  ExpectRefused("150", "0", -0.0, 1);
}

TEST_F(ClkgenDriverTest, ABadListLeavesWhatWasRead) {
  ExpectRefused("", "7 8", 100, 2);
  EXPECT_THAT(imp_.requests.reqPhase, ElementsAre(7, 8, 0, 0, 0, 0, 0));
  ExpectRefused("150", "9", 100, 2);
  EXPECT_THAT(imp_.requests.reqOutFreq, ElementsAre(150, 0, 0, 0, 0, 0, 0));
  EXPECT_THAT(imp_.requests.reqPhase, ElementsAre(9, 8, 0, 0, 0, 0, 0));
}

// DV alone is cleared before the lists are looked at.
TEST_F(ClkgenDriverTest, ABadRequestClearsDvOnly) {
  const auto solve = [&] { ASSERT_EQ(Run("127 63.5", "0 0", 64, 2), 1); };
  solve();
  ExpectChosen("CLKFX CLKFXDV", 127, 64, 2);
  ExpectRefused("", "0", 100, 1);
  ExpectChosen("CLKFX CLKFXDV", 127, 64, 0);
  solve();
  ExpectRefused("150", "0", 0, 1);
  ExpectChosen("CLKFX CLKFXDV", 127, 64, 0);
  solve();
  ExpectRefused("150", "0", 100, 7);
  ExpectChosen("CLKFX CLKFXDV", 127, 64, 0);
}

TEST_F(ClkgenDriverTest, AFailedSearchLeavesThePinsThatItFound) {
  ASSERT_EQ(Run("127 63.5", "0 0", 64, 2), 1);
  EXPECT_EQ(Run("127 127 80", "0 180 0", 64, 3), 3);
  ExpectChosen("CLKFX CLKFX180", 0, 0, 0);
  EXPECT_EQ(imp_.GetKruChosenOutFreqN(64, 0), 0.0) << "D is 0";
  EXPECT_EQ(Run("1000", "0", 64, 1), 3);
  ExpectChosen("", 0, 0, 0);
}

TEST_F(ClkgenDriverTest, NumbersThatAreNone) {
  for (const char* freqs : {"abc", "0", "-100", "inf", "-inf", "nan", "1e999", "1e300", "1e-300"}) {
    EXPECT_EQ(Run(freqs, "0", 100, 1), 3) << freqs;
    EXPECT_EQ(Run((std::string("100 ") + freqs).c_str(), "0 0", 100, 2), 3) << freqs;
  }
  for (const double inFreq :
       {engine_test::kNan, engine_test::kInfinity, -engine_test::kInfinity, 1e300, -100.0}) {
    EXPECT_EQ(Run("100", "0", inFreq, 1), 3) << inFreq;
  }
  for (const char* phase : {"inf", "-inf", "nan", "1e300"}) {
    EXPECT_EQ(Run("100", phase, 100, 1), 1) << "the phase of output 0 does not matter";
    EXPECT_EQ(Run("100 100", (std::string("0 ") + phase).c_str(), 100, 2), 3) << phase;
  }
}

TEST_F(ClkgenDriverTest, ListsAreReadGenerously) {
  EXPECT_EQ(Run("  127   0x3f.8p0\t 1e9", "abc \n0 7", 64, 2), 1);
  ExpectChosen("CLKFX CLKFXDV", 127, 64, 2);
}

// --- Limits --------------------------------------------------------------------------------------

// It reads no speed data, so neither a device nor what its file lacks matters.
TEST_F(ClkgenDriverTest, TheDeviceIsNotAsked) {
  EXPECT_EQ(Run("150", "0", 100, 1), 1);
  EXPECT_EQ(Run("400", "0", 100, 1), 3);
  VorkelImp& fresh = engine_test::NewImp();
  EXPECT_EQ(fresh.KruClkgenCalculateActuals("150", "0", 100, 1, false), 1);
  fresh.SetDevice("no such part");
  EXPECT_EQ(fresh.KruClkgenCalculateActuals("150", "0", 100, 1, false), 1);
  EXPECT_THAT(host_.reads, IsEmpty());
  EXPECT_THAT(host_.messages, IsEmpty());
  EXPECT_EQ(imp_.speedController, nullptr);
}

// 400 MHz lies between the default maximum and that of the device, 6 MHz between the minima.
TEST_F(ClkgenDriverTest, TheClkfxLimitsThatAKruSpRunHasLoaded) {
  EXPECT_EQ(Run("400", "0", 100, 1), 3);
  EXPECT_EQ(Run("6", "0", 100, 1), 1);
  ASSERT_EQ(RunKruSp("100", "0", 100, 1), 1);
  EXPECT_EQ(Run("400", "0", 100, 1), 1);
  ExpectChosen("CLKFX", 4, 1, 0);
  EXPECT_EQ(trace_, std::string(kStart) + kLoadedRanges +
                        "DLL ---- Calculating KRU_CLKGEN actuals \n"
                        "DLL ------ Clk_Out0 ofreq = 400.000\n"
                        "DLL ----- found 64 possible M and Ds\n"
                        "DLL -- found M = 4, D = 1, DV = 0\n"
                        "DLL - for CLK_OUT0, chosen KRU_CLKGEN pin = CLKFX\n"
                        "DLL - chosen M = 4\n"
                        "DLL - chosen D = 1\n");
  EXPECT_EQ(Run("6", "0", 100, 1), 3);
  EXPECT_EQ(Run("500", "0", 100, 1), 1);
  EXPECT_EQ(Run("8", "0", 100, 1), 1);
  // Not those of CLKFXDV: 200 MHz is in the range of the device only.
  EXPECT_EQ(Run("400 200", "0 0", 100, 2), 3);
  EXPECT_EQ(imp_.kruLimits._kruClkfxdvMin, 0.156);
  EXPECT_EQ(imp_.kruLimits._kruClkfxdvMax, 187.266);
}

TEST_F(ClkgenDriverTest, AKruSpRunThatFailsLaterHasLoadedThemToo) {
  ASSERT_EQ(RunKruSp("100 100", "0 45", 100, 2), 3);
  EXPECT_EQ(Run("400", "0", 100, 1), 1);
}

TEST_F(ClkgenDriverTest, AKruSpRunThatFailsBeforeHasNot) {
  ASSERT_EQ(RunKruSp("", "0", 100, 1), 3);
  ASSERT_EQ(RunKruSp("100", "0", 0, 1), 3);
  EXPECT_EQ(Run("400", "0", 100, 1), 3);
}

// The maximum of CLKFX is read before its minimum, as the last but one.
TEST_F(ClkgenDriverTest, AKruSpLoadThatEndsEarlyHasLoadedAPart) {
  host_.devices[kPart].erase("D_KRU_CLKFX_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MAXPERIOD");
  ASSERT_EQ(RunKruSp("100", "0", 100, 1), 2);
  EXPECT_EQ(Run("400", "0", 100, 1), 1);
  EXPECT_EQ(Run("6", "0", 100, 1), 1);
  EXPECT_EQ(imp_.kruLimits._kruClkfxMin, 5.0);
  EXPECT_EQ(imp_.kruLimits._kruClkfxMax, 500.0);
}

TEST_F(ClkgenDriverTest, TheLimitsOfOneObjectAreNotThoseOfAnother) {
  ASSERT_EQ(RunKruSp("100", "0", 100, 1), 1);
  VorkelImp& other = engine_test::NewImp();
  other.SetDevice(kPart);
  EXPECT_EQ(other.KruClkgenCalculateActuals("400", "0", 100, 1, false), 3);
  EXPECT_EQ(Run("400", "0", 100, 1), 1);
}

// --- In turn with the KRU_SP ---------------------------------------------------------------------

TEST_F(ClkgenDriverTest, ReplacesWhatAKruSpHasChosen) {
  ASSERT_EQ(RunKruSp("25 50 350", "45 135 45", 100, 3), 1);
  ASSERT_EQ(imp_.GetKruChosenPinname(6), Port::StringBase("CLKDV"));
  EXPECT_EQ(Run("150", "0", 100, 1), 1);
  ExpectChosen("CLKFX", 3, 2, 0);
  EXPECT_EQ(imp_.GetKruChosenPinname(6), Port::StringBase("NONE"));
  // What a KRU_CLKGEN does not have stays, and the halved input goes into the frequencies.
  EXPECT_TRUE(imp_.GetKruChosenDivBy2());
  EXPECT_EQ(imp_.GetKruChosenPhaseOffset(), 45.0);
  EXPECT_EQ(imp_.GetKruChosenPhaseShift(), 32);
  EXPECT_EQ(imp_.GetKruChosenOutFreqN(100, 0), 75.0);
  ASSERT_EQ(RunKruSp("100", "0", 100, 1), 1);
  EXPECT_EQ(Run("150", "0", 100, 1), 1);
  EXPECT_EQ(imp_.GetKruChosenOutFreqN(100, 0), 150.0);
}

TEST_F(ClkgenDriverTest, AKruSpReplacesWhatItHasChosen) {
  ASSERT_EQ(Run("127 63.5", "0 0", 64, 2), 1);
  ASSERT_EQ(RunKruSp("100", "0", 100, 1), 1);
  ExpectChosen("CLK0", 0, 0, 0);
  // One that fails at its pins clears pins, M and D, and keeps DV.
  ASSERT_EQ(Run("127 63.5", "0 0", 64, 2), 1);
  ASSERT_EQ(RunKruSp("100", "-30", 100, 1), 3);
  ExpectChosen("", 0, 0, 2);
}

TEST_F(ClkgenDriverTest, ABadRequestClearsTheClkdvOfAKruSp) {
  ASSERT_EQ(RunKruSp("50", "0", 100, 1), 1);
  ExpectChosen("CLKDV", 0, 0, 2);
  ExpectRefused("", "", 100, 1);
  ExpectChosen("CLKDV", 0, 0, 0);
  EXPECT_EQ(imp_.GetKruChosenOutFreqN(100, 0), 0.0);
}

// A KRU_CLKGEN request writes both lists; a KRU_SP run reads its own.
TEST_F(ClkgenDriverTest, TheRequestsAreShared) {
  ASSERT_EQ(Run("150 75", "90 0", 100, 2), 1);
  EXPECT_THAT(imp_.requests.reqOutFreq, ElementsAre(150, 75, 0, 0, 0, 0, 0));
  EXPECT_THAT(imp_.requests.reqPhase, ElementsAre(90, 0, 0, 0, 0, 0, 0));
  ASSERT_EQ(RunKruSp("100", "180", 100, 1), 1);
  EXPECT_THAT(imp_.requests.reqOutFreq, ElementsAre(100, 75, 0, 0, 0, 0, 0));
  EXPECT_THAT(imp_.requests.reqPhase, ElementsAre(180, 0, 0, 0, 0, 0, 0));
}

}  // namespace
