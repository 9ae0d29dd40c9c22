// Tests of the entry of the KRU_SP solver, from the request to the chosen values.

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <climits>
#include <string>
#include <vector>

#include "tests/engine/KruTest.h"

namespace {

using engine_test::kKruRanges;
using engine_test::Names;
using Ip::KruLimits;
using Ip::VorkelImp;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::StartsWith;

constexpr char kPart[] = "kru";
constexpr char kStart[] = "DLL- starting to calculate KRU actuals \n";
constexpr char kFailed[] = "DLL ---- KRU won't work!!\n";

// A request; what a test leaves out is that of 100 MHz out of 100 MHz, with feedback.
struct Request {
  const char* freqs = "100";
  const char* phases = "0";
  double inFreq = 100;
  int numOut = 1;
  bool feedbackUsed = true;
};

class KruDriverTest : public testing::Test {
 protected:
  KruDriverTest() {
    host_.Reset();
    engine_test::SetKru(kPart);
    imp_.SetDevice(kPart);
  }

  int Run(const Request& r) {
    CaptureTrace capture;
    const int code = imp_.KruCalculateActuals(r.freqs, r.phases, r.inFreq, r.numOut,
                                              r.feedbackUsed, true);
    trace_ = capture.Text();
    return code;
  }

  void ExpectChosen(const std::string& pins, int m, int d, bool divBy2, double clkdv,
                    double phaseOffset) const {
    EXPECT_EQ(Names(imp_.kru._kruChosenPin), pins);
    EXPECT_EQ(imp_.GetKruChosenM(), m);
    EXPECT_EQ(imp_.GetKruChosenD(), d);
    EXPECT_EQ(imp_.GetKruChosenDivBy2(), divBy2);
    EXPECT_EQ(imp_.GetKruChosenClkdv(), clkdv);
    EXPECT_EQ(imp_.GetKruChosenPhaseOffset(), phaseOffset);
  }

  FakeHost& host_ = FakeHost::Instance();
  VorkelImp& imp_ = engine_test::NewImp();
  std::string trace_;
};

// --- Whole runs --------------------------------------------------------------------------------

TEST_F(KruDriverTest, AllPinFamiliesOfListF) {
  EXPECT_EQ(Run({"100 100 100 100 50 350", "0 90 180 270 0 0", 100, 6}), 1);
  EXPECT_EQ(trace_,
            std::string(kStart) + kKruRanges +
                "DLL -- determining if a phase offset is used for KRU\n"
                "DLL ---- all phases have 0 offset\n"
                "DLL ---- Checking if KRU will work\n"
                "DLL ------ Clk_Out0 ofreq = 100.000; phase = 0.000\n"
                "DLL ------ Clk_Out1 ofreq = 100.000; phase = 90.000\n"
                "DLL ------ Clk_Out2 ofreq = 100.000; phase = 180.000\n"
                "DLL ------ Clk_Out3 ofreq = 100.000; phase = 270.000\n"
                "DLL ------ Clk_Out4 ofreq = 50.000; phase = 0.000\n"
                "DLL ------ Clk_Out5 ofreq = 350.000; phase = 0.000\n"
                "DLL --------- _kruPinsDivBy2False[0] = CLK0\n"
                "DLL --------- _kruPinsDivBy2False[1] = CLK90\n"
                "DLL --------- _kruPinsDivBy2False[2] = CLK180\n"
                "DLL --------- _kruPinsDivBy2False[3] = CLK270\n"
                "DLL --------- _kruPinsDivBy2False[4] = CLKDV\n"
                "DLL --------- _kruPinsDivBy2False[5] = CLKFX\n"
                "DLL --------- _kruPinsDivBy2True[0] = CLK2X\n"
                "DLL --------- _kruPinsDivBy2True[1] = NONE\n"
                "DLL --------- _kruPinsDivBy2True[2] = CLK2X180\n"
                "DLL --------- _kruPinsDivBy2True[3] = NONE\n"
                "DLL --------- _kruPinsDivBy2True[4] = CLK0\n"
                "DLL --------- _kruPinsDivBy2True[5] = CLKFX\n"
                "DLL ----- looking for M/D for requested ofreq = 350.000000\n"
                "DLL ----- a possible M = 7, D = 2\n"
                "DLL ----- a possible M = 14, D = 4\n"
                "DLL ----- a possible M = 21, D = 6\n"
                "DLL ----- a possible M = 28, D = 8\n"
                "DLL ----- found 4 possible M and Ds\n"
                "DLL -- found M = 7, D = 2\n"
                "DLL --    _kruPinsDivBy2F list works!\n"
                "DLL - for CLK_OUT0, chosen KRU pin = CLK0\n"
                "DLL - for CLK_OUT1, chosen KRU pin = CLK90\n"
                "DLL - for CLK_OUT2, chosen KRU pin = CLK180\n"
                "DLL - for CLK_OUT3, chosen KRU pin = CLK270\n"
                "DLL - for CLK_OUT4, chosen KRU pin = CLKDV\n"
                "DLL - for CLK_OUT5, chosen KRU pin = CLKFX\n"
                "DLL - chosen CLKIN_DIVIDE_BY_2 = 0\n"
                "DLL - chosen M = 7\n"
                "DLL - chosen D = 2\n"
                "DLL - chosen phase offset = 0.000000\n"
                "DLL - chosen PHASE_SHIFT = 0\n"
                "DLL - chosen CLKDV = 2.000000\n");
  ExpectChosen("CLK0 CLK90 CLK180 CLK270 CLKDV CLKFX", 7, 2, false, 2, 0);
  EXPECT_EQ(imp_.GetKruChosenOutFreqN(100, 0), 100.0);
  EXPECT_EQ(imp_.GetKruChosenOutFreqN(100, 4), 50.0);
  EXPECT_EQ(imp_.GetKruChosenOutFreqN(100, 5), 350.0);
  EXPECT_EQ(imp_.GetKruChosenPinname(6), Port::StringBase("CLK2X"));
  EXPECT_THAT(host_.messages, IsEmpty());
}

// Half the input at 90 degrees is there only with the halved input.
TEST_F(KruDriverTest, ListTWithAPhaseOffset) {
  EXPECT_EQ(Run({"100 50 25", "45 135 45", 100, 3}), 1);
  EXPECT_EQ(trace_,
            std::string(kStart) + kKruRanges +
                "DLL -- determining if a phase offset is used for KRU\n"
                "DLL ---- 45.000 offset was used for all outclks\n"
                "DLL ---- Checking if KRU will work\n"
                "DLL ------ Clk_Out0 ofreq = 100.000; phase = 45.000\n"
                "DLL ------ Clk_Out1 ofreq = 50.000; phase = 135.000\n"
                "DLL ------ Clk_Out2 ofreq = 25.000; phase = 45.000\n"
                "DLL --------- _kruPinsDivBy2False[0] = CLK0\n"
                "DLL --------- _kruPinsDivBy2False[1] = NONE\n"
                "DLL --------- _kruPinsDivBy2False[2] = CLKDV\n"
                "DLL --------- _kruPinsDivBy2True[0] = CLK2X\n"
                "DLL --------- _kruPinsDivBy2True[1] = CLK90\n"
                "DLL --------- _kruPinsDivBy2True[2] = CLKDV\n"
                "DLL -------- _kruPinsDivby2F[1] isn't filled, so KRU won't work for DivBy2 = F\n"
                "DLL ---------- checking 2nd list: _kruPinsDivBy2T \n"
                "DLL ---------- _kruPinsDivBy2T list works!\n"
                "DLL - for CLK_OUT0, chosen KRU pin = CLK2X\n"
                "DLL - for CLK_OUT1, chosen KRU pin = CLK90\n"
                "DLL - for CLK_OUT2, chosen KRU pin = CLKDV\n"
                "DLL - chosen CLKIN_DIVIDE_BY_2 = 1\n"
                "DLL - chosen M = 0\n"
                "DLL - chosen D = 0\n"
                "DLL - chosen phase offset = 45.000000\n"
                "DLL - chosen PHASE_SHIFT = 32\n"
                "DLL - chosen CLKDV = 2.000000\n");
  ExpectChosen("CLK2X CLK90 CLKDV", 0, 0, true, 2, 45);
  EXPECT_EQ(imp_.GetKruChosenOutFreqN(100, 0), 100.0);
  EXPECT_EQ(imp_.GetKruChosenOutFreqN(100, 1), 50.0);
  EXPECT_EQ(imp_.GetKruChosenOutFreqN(100, 2), 25.0);
}

TEST_F(KruDriverTest, WithoutFeedback) {
  EXPECT_EQ(Run({"100 100", "0 180", 100, 2, false}), 1);
  ExpectChosen("CLKFX CLKFX180", 2, 2, false, 0, 0);
  EXPECT_THAT(trace_, testing::EndsWith("DLL - for CLK_OUT0, chosen KRU pin = CLKFX\n"
                                        "DLL - for CLK_OUT1, chosen KRU pin = CLKFX180\n"
                                        "DLL - chosen CLKIN_DIVIDE_BY_2 = 0\n"
                                        "DLL - chosen M = 2\n"
                                        "DLL - chosen D = 2\n"
                                        "DLL - chosen phase offset = 0.000000\n"
                                        "DLL - chosen PHASE_SHIFT = 0\n"));
}

// Without feedback CLKFX180 of an unrelated frequency is in list T alone: 350 = 50 x 7.
TEST_F(KruDriverTest, WithoutFeedbackAndAnUnrelatedFrequencyAt180) {
  EXPECT_EQ(Run({"350", "180", 100, 1, false}), 1);
  ExpectChosen("CLKFX180", 7, 1, true, 0, 0);
  EXPECT_EQ(Run({"350", "180", 100, 1, true}), 1);
  ExpectChosen("CLKFX180", 7, 2, false, 0, 0);
}

// -1 and 89 degrees: nothing but -1 is common to both.
TEST_F(KruDriverTest, ANegativePhaseOffset) {
  EXPECT_EQ(Run({"100 100", "-1 89", 100, 2}), 1);
  ExpectChosen("CLK0 CLK90", 0, 0, false, 0, -1);
  EXPECT_THAT(trace_, testing::EndsWith("DLL - chosen phase offset = -1.000000\n"
                                        "DLL - chosen PHASE_SHIFT = 0\n"));
}

// 50 and 25 MHz need two CLKDV values; the second goes to CLKFX, with D = 4 x M.
TEST_F(KruDriverTest, TwoClkdvValues) {
  EXPECT_EQ(Run({"50 25", "0 0", 100, 2}), 1);
  ExpectChosen("CLKDV CLKFX", 2, 8, false, 2, 0);
  EXPECT_EQ(imp_.GetKruChosenOutFreqN(100, 1), 25.0);
  EXPECT_EQ(imp_.GetKruChosenPinname(6), Port::StringBase("CLK0"));
}

// Output 0 on CLK2X takes the feedback along: CLKDV ends at 100 MHz then, and not at 160.
TEST_F(KruDriverTest, TheMaximaWith2xFeedback) {
  EXPECT_EQ(Run({"400 80", "0 0", 200, 2}), 1);
  ExpectChosen("CLK2X CLKDV", 0, 0, false, 2.5, 0);
  host_.devices[kPart]["D_KRU_CLK2X_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MINPERIOD"] =
      FigureFor(1.25);
  EXPECT_EQ(Run({"104", "0", 260, 1}), 1);
  ExpectChosen("CLKDV", 0, 0, false, 2.5, 0);
  EXPECT_EQ(Run({"520 104", "0 0", 260, 2}), 1);
  ExpectChosen("CLK2X CLKFX", 2, 5, false, 0, 0);
}

TEST_F(KruDriverTest, IsSilentWithTheTraceOff) {
  CaptureTrace capture;
  EXPECT_EQ(imp_.KruCalculateActuals("50 25", "0 0", 100, 2, true, false), 1);
  EXPECT_EQ(imp_.KruCalculateActuals("", "", 100, 2, true, false), 3);
  EXPECT_EQ(capture.Text(), "");
}

// --- Result 3 before the device is asked ---------------------------------------------------------

class KruBadRequestTest : public KruDriverTest {
 protected:
  void ExpectRefused(const Request& r) {
    EXPECT_EQ(Run(r), 3);
    EXPECT_EQ(trace_, std::string(kStart) + kFailed);
    EXPECT_THAT(host_.reads, IsEmpty());
    EXPECT_THAT(host_.messages, IsEmpty());
  }
};

TEST_F(KruBadRequestTest, EmptyAndShortLists) {
  ExpectRefused({.freqs = ""});
  ExpectRefused({.phases = ""});
  ExpectRefused({.freqs = "   "});
  ExpectRefused({.phases = " "});
  ExpectRefused({"100", "0 0", 100, 2});
  ExpectRefused({"100 50", "0", 100, 2});
  ExpectRefused({"100 50 25 20 10", "0 0 0 0 0 0", 100, 6});
}

TEST_F(KruBadRequestTest, CountsThatThereAreNot) {
  for (const int numOut : {0, -1, INT_MIN, 7, 8, 1000000, INT_MAX}) {
    ExpectRefused({"100 1 2 3 4 5 6 7", "1 2 3 4 5 6 7 8", 100, numOut});
    EXPECT_THAT(imp_.requests.reqOutFreq, testing::Each(0.0)) << numOut;
    EXPECT_THAT(imp_.requests.reqPhase, testing::Each(0.0)) << numOut;
  }
}

TEST_F(KruBadRequestTest, NoInputFrequency) {
  ExpectRefused({.inFreq = 0.0});
  ExpectRefused({.inFreq = -0.0});
}

// Both lists are read before either is judged.
TEST_F(KruBadRequestTest, ABadListLeavesWhatWasRead) {
  ExpectRefused({"", "7 8", 100, 2});
  EXPECT_THAT(imp_.requests.reqPhase, ElementsAre(7, 8, 0, 0, 0, 0, 0));
  ExpectRefused({"100", "9 10", 100, 2});
  EXPECT_THAT(imp_.requests.reqOutFreq, ElementsAre(100, 0, 0, 0, 0, 0, 0));
  EXPECT_THAT(imp_.requests.reqPhase, ElementsAre(9, 10, 0, 0, 0, 0, 0));
  ExpectRefused({"50 60", "11", 100, 2});
  EXPECT_THAT(imp_.requests.reqOutFreq, ElementsAre(50, 60, 0, 0, 0, 0, 0));
  EXPECT_THAT(imp_.requests.reqPhase, ElementsAre(11, 10, 0, 0, 0, 0, 0));
  ExpectRefused({"1 2", "3 4", 0, 2});
  EXPECT_THAT(imp_.requests.reqOutFreq, ElementsAre(1, 2, 0, 0, 0, 0, 0));
  EXPECT_THAT(imp_.requests.reqPhase, ElementsAre(3, 4, 0, 0, 0, 0, 0));
}

TEST_F(KruBadRequestTest, KeepsTheChosenValues) {
  ASSERT_EQ(Run({"100 50 350", "45 135 45", 100, 3}), 1);
  host_.reads.clear();
  for (const Request& r : {Request{.freqs = ""}, Request{.phases = ""}, Request{.inFreq = 0},
                           Request{.numOut = 0}, Request{.numOut = 7}}) {
    ExpectRefused(r);
    ExpectChosen("CLK2X CLK90 CLKFX", 7, 1, true, 0, 45);
  }
}

// Numbers beyond the count and blanks around the others do not matter.
TEST_F(KruDriverTest, ListsAreReadGenerously) {
  EXPECT_EQ(Run({"  100   50 1e9", " 0 \t0 abc 7", 100, 2}), 1);
  ExpectChosen("CLK0 CLKDV", 0, 0, false, 2, 0);
  EXPECT_THAT(imp_.requests.reqOutFreq, ElementsAre(100, 50, 0, 0, 0, 0, 0));
}

// --- Result 2 ----------------------------------------------------------------------------------

TEST_F(KruDriverTest, TheLimitsAreReadInTheirOrder) {
  EXPECT_EQ(Run({}), 1);
  std::vector<std::string> keywords;
  for (const auto& [keyword, period] : engine_test::KruPeriods()) keywords.push_back(keyword);
  EXPECT_EQ(host_.reads, keywords);
  EXPECT_EQ(Run({}), 1);
  EXPECT_EQ(host_.reads.size(), 26u) << "every run reads them anew";
}

TEST_F(KruDriverTest, AMissingKeywordEndsTheRun) {
  for (std::size_t i = 0; i < engine_test::KruPeriods().size(); ++i) {
    const std::string& keyword = engine_test::KruPeriods()[i].first;
    engine_test::SetKru(kPart);
    host_.devices[kPart].erase(keyword);
    host_.reads.clear();
    host_.messages.clear();
    EXPECT_EQ(Run({}), 2) << keyword;
    EXPECT_EQ(trace_, std::string(kStart) + kFailed) << keyword;
    EXPECT_EQ(host_.reads.size(), i + 1) << keyword;
    EXPECT_THAT(host_.MessageTexts(),
                ElementsAre("Internal GetSpdKeyValue() error -- could not get speedsfile data "
                            "for key " +
                            keyword + "\n"));
  }
}

TEST_F(KruDriverTest, AMissingKeywordKeepsTheChosenValuesAndTheLimitsReadBeforeIt) {
  ASSERT_EQ(Run({"100 50 350", "45 135 45", 100, 3}), 1);
  imp_.kruLimits = KruLimits{};
  host_.devices[kPart].erase("D_KRU_CLK0_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_2X_MINPERIOD");
  EXPECT_EQ(Run({"100", "7", 100, 1}), 2);
  ExpectChosen("CLK2X CLK90 CLKFX", 7, 1, true, 0, 45);
  EXPECT_EQ(imp_.requests.reqPhase[0], 7.0);
  EXPECT_EQ(imp_.kruLimits._kruClk0Max, 250.0);
  EXPECT_EQ(imp_.kruLimits._kruClk0Min, 5.0);
  EXPECT_EQ(imp_.kruLimits._kruClk0Max2x, 187.617);
  EXPECT_EQ(imp_.kruLimits._kruClkfxMax, 374.532);
}

TEST_F(KruDriverTest, WithoutADevice) {
  VorkelImp& fresh = engine_test::NewImp();
  EXPECT_EQ(fresh.KruCalculateActuals("100", "0", 100, 1, true, false), 2);
  EXPECT_THAT(host_.MessageTexts(),
              ElementsAre("Internal GetSpdKeyValue() error -- no device was specified yet\n"));
}

// --- Result 3 from the stages ------------------------------------------------------------------

TEST_F(KruDriverTest, NoCommonPhaseOffset) {
  ASSERT_EQ(Run({"100 50 350", "45 135 45", 100, 3}), 1);
  EXPECT_EQ(Run({"100 100", "0 45", 100, 2}), 3);
  EXPECT_EQ(trace_, std::string(kStart) + kKruRanges +
                        "DLL -- determining if a phase offset is used for KRU\n"
                        "DLL ---- found non-zero offset for clkunm 1 = 45.000000\n" +
                        kFailed);
  // The run did not come to the pins.
  ExpectChosen("CLK2X CLK90 CLKFX", 7, 1, true, 0, 45);
}

TEST_F(KruDriverTest, APhaseThatNoPinHas) {
  ASSERT_EQ(Run({"25 50 350", "45 135 45", 100, 3}), 1);
  ExpectChosen("CLKDV CLK90 CLKFX", 7, 1, true, 2, 45);
  EXPECT_EQ(Run({"100", "-30", 100, 1}), 3);
  EXPECT_EQ(trace_,
            std::string(kStart) + kKruRanges +
                "DLL -- determining if a phase offset is used for KRU\n"
                "DLL ---- 30.000 offset was used for all outclks\n"
                "DLL ---- Checking if KRU will work\n"
                "DLL ------ Clk_Out0 ofreq = 100.000; phase = -30.000\n"
                "DLL --------- _kruPinsDivBy2False[0] = NONE\n"
                "DLL --------- _kruPinsDivBy2True[0] = NONE\n"
                "DLL -------- _kruPinsDivby2F[0] isn't filled, so KRU won't work for DivBy2 = F\n"
                "DLL ---------- checking 2nd list: _kruPinsDivBy2T \n"
                "DLL -------- _kruPinsDivby2T[0] isn't filled, so KRU won't work for DivyBy2 = "
                "T\n" +
                kFailed);
  // Pins, M and D are gone, the offset is new, and the rest is what the run before has left.
  ExpectChosen("", 0, 0, true, 2, 30);
  EXPECT_EQ(imp_.GetKruChosenPinname(6), Port::StringBase("NONE"));
}

TEST_F(KruDriverTest, NoCommonMAndD) {
  ASSERT_EQ(Run({"25 50 350", "45 135 45", 100, 3}), 1);
  EXPECT_EQ(Run({"350 330", "0 0", 100, 2}), 3);
  // Both lists had their search: 350 = 100 x 7 / 2 = 50 x 7, but 330 is neither.
  EXPECT_THAT(trace_, testing::EndsWith("DLL ----- couldn't find and M and Ds for clknum 1\n"
                                        "DLL -- couldn't find an M and D\n"
                                        "DLL ---- KRU won't work!!\n"));
  EXPECT_EQ(engine_test::CountOf("DLL -- couldn't find an M and D\n", trace_), 2);
  ExpectChosen("", 0, 0, true, 2, 0);
  EXPECT_EQ(imp_.GetKruChosenPinname(6), Port::StringBase("CLKFX"));
  EXPECT_EQ(imp_.GetKruChosenOutFreqN(100, 6), 0.0) << "D is 0";
}

TEST_F(KruDriverTest, OutOfEveryRange) {
  EXPECT_EQ(Run({"600", "0", 300, 1}), 3);
  EXPECT_EQ(trace_,
            std::string(kStart) + kKruRanges +
                "DLL -- determining if a phase offset is used for KRU\n"
                "DLL ---- all phases have 0 offset\n"
                "DLL ---- Checking if KRU will work\n"
                "DLL ------ Clk_Out0 ofreq = 600.000; phase = 0.000\n"
                "DLL -!!!!!! Can't use CLK2X because requested freq 600.000 is out of range\n"
                "DLL -!!!!!! Can't potentially use CLKFX because requested freq 600.000 is out "
                "of range\n"
                "DLL --------- _kruPinsDivBy2False[0] = NONE\n"
                "DLL --------- _kruPinsDivBy2True[0] = NONE\n"
                "DLL -------- _kruPinsDivby2F[0] isn't filled, so KRU won't work for DivBy2 = F\n"
                "DLL ---------- checking 2nd list: _kruPinsDivBy2T \n"
                "DLL -------- _kruPinsDivby2T[0] isn't filled, so KRU won't work for DivyBy2 = "
                "T\n" +
                kFailed);
}

// --- Bad numbers -------------------------------------------------------------------------------

TEST_F(KruDriverTest, NumbersThatAreNone) {
  for (const char* freqs : {"abc", "0", "-100", "inf", "-inf", "nan", "1e999", "1e300", "1e-300"}) {
    for (const bool feedback : {false, true}) {
      EXPECT_EQ(Run({.freqs = freqs, .feedbackUsed = feedback}), 3) << freqs;
      EXPECT_EQ(Run({.freqs = freqs, .phases = "180", .feedbackUsed = feedback}), 3) << freqs;
    }
  }
  for (const double inFreq : {engine_test::kNan, engine_test::kInfinity, -engine_test::kInfinity,
                              1e300, -100.0}) {
    EXPECT_EQ(Run({.inFreq = inFreq}), 3) << inFreq;
  }
  for (const char* phases : {"inf", "-inf", "1e300", "nan", "-nan", "-1e300"}) {
    EXPECT_EQ(Run({.phases = phases, .feedbackUsed = false}), 3) << phases;
  }
  EXPECT_EQ(Run({.phases = "abc"}), 1) << "text reads as 0";
}

// An infinite offset meets itself: no int holds its PHASE_SHIFT, which is 0 then.
TEST_F(KruDriverTest, AnInfinitePhase) {
  EXPECT_EQ(Run({.phases = "inf"}), 1);
  ExpectChosen("CLK0", 0, 0, false, 0, engine_test::kInfinity);
  EXPECT_EQ(imp_.GetKruChosenPhaseShift(), 0);
  EXPECT_EQ(Run({.phases = "-inf"}), 3);
}

TEST_F(KruDriverTest, HexadecimalAndExponents) {
  EXPECT_EQ(Run({"0x64 5e1", "0x0 0e9", 100, 2}), 1);
  ExpectChosen("CLK0 CLKDV", 0, 0, false, 2, 0);
}

// Limits of periods that make no sense hold nothing, or everything; no run fails on them.
TEST_F(KruDriverTest, PeriodsOf0AndBelow) {
  for (const double period : {0.0, -4.0}) {
    for (const auto& [keyword, usual] : engine_test::KruPeriods()) {
      host_.devices[kPart][keyword] = period;
    }
    EXPECT_EQ(Run({"100 50 25 350 200 1e9", "0 0 0 0 0 0", 100, 6}), 3) << period;
    EXPECT_THAT(trace_, StartsWith(kStart));
  }
}

// --- In turn with the PLL ------------------------------------------------------------------------

class KruAndPllTest : public KruDriverTest {
 protected:
  KruAndPllTest() { SetPll(kPart, {}); }  // VCO 400 to 1080

  // 600 MHz has one VCO, so that its phases are worked out from what was last asked for.
  void RunPll(const char* freqs = "600", int count = 1) {
    ASSERT_EQ(imp_.CalculateMinPowerOutFreqs(freqs, 50, 0, count, false, false, 1, false), 1);
    ASSERT_EQ(imp_.GetChosenVCO(), 600.0);
  }
};

TEST_F(KruAndPllTest, TheRequestedPhasesAreShared) {
  RunPll();
  EXPECT_EQ(imp_.GetChosenPhaseN(0), 0.0);
  ASSERT_EQ(Run({.phases = "90"}), 1);
  RunPll();
  EXPECT_EQ(imp_.GetChosenPhaseN(0), 90.0);
  // A bad KRU request writes what it read, too.
  ASSERT_EQ(Run({"", "135 45", 100, 2}), 3);
  RunPll("600 600", 2);
  EXPECT_EQ(imp_.GetChosenPhaseN(0), 135.0);
  EXPECT_EQ(imp_.GetChosenPhaseN(1), 45.0);
  // And so does a KRU_CLKGEN.
  ASSERT_EQ(imp_.KruClkgenCalculateActuals("150", "180", 100, 1, false), 1);
  RunPll("600 600", 2);
  EXPECT_EQ(imp_.GetChosenPhaseN(0), 180.0);
  EXPECT_EQ(imp_.GetChosenPhaseN(1), 45.0);
}

TEST_F(KruAndPllTest, NeitherTouchesWhatTheOtherHasChosen) {
  ASSERT_EQ(Run({"25 50 350", "45 135 45", 100, 3}), 1);
  RunPll("600 300", 2);
  ExpectChosen("CLKDV CLK90 CLKFX", 7, 1, true, 2, 45);
  ASSERT_EQ(Run({"100 100", "0 90", 100, 2}), 1);
  ASSERT_EQ(Run({.freqs = ""}), 3);
  EXPECT_EQ(imp_.GetChosenVCO(), 600.0);
  EXPECT_EQ(imp_.GetChosenM(), 12.0);
  EXPECT_EQ(imp_.GetChosenDivN(1), 2);
  EXPECT_EQ(imp_.GetChosenOutFreqN(1), 300.0);
  EXPECT_EQ(imp_.GetChosenPhaseN(0), 45.0);
  // A PLL run that fails leaves the KRU as it is.
  EXPECT_EQ(imp_.CalculateMinPowerOutFreqs("", 50, 0, 1, false, false, 1, false), 4);
  ExpectChosen("CLK0 CLK90", 0, 0, false, 0, 0);
}

TEST_F(KruAndPllTest, AClosestSolutionWritesThePhasesThatAKruReadsAnew) {
  ASSERT_EQ(imp_.GetClosestSolution("600 600", "90 270", "50 50", 50, 0, 2, false, false, 1, false),
            1);
  ASSERT_EQ(Run({.phases = "0"}), 1);
  EXPECT_THAT(imp_.requests.reqPhase, ElementsAre(0, 270, 0, 0, 0, 0, 0));
  ExpectChosen("CLK0", 0, 0, false, 0, 0);
}

TEST_F(KruAndPllTest, TheLimitsAreApart) {
  ASSERT_EQ(Run({}), 1);
  const double pllMax = imp_.pllLimits.clkoutMax;
  EXPECT_EQ(pllMax, 375.0) << "the default";
  RunPll();
  EXPECT_EQ(imp_.kruLimits._kruClkfxMax, 500.0);
  EXPECT_EQ(imp_.pllLimits.clkoutMax, 400.0);
}

}  // namespace
