// Tests of the two entries of the PLL/TSYN solver, from the request to the chosen values.

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <climits>
#include <cstdio>
#include <cstdlib>
#include <string>
#include <thread>

#include "engine/pll/Stages.h"
#include "tests/engine/EngineTest.h"
#include "tests/support/FakeHost.h"

namespace {

using engine_test::CountOf;
using Ip::VorkelImp;
using testing::Each;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

constexpr int kTsyn = 0;
constexpr int kPll = 1;

constexpr char kPart[] = "driven";

constexpr char kStartMinPower[] =
    "DLL- starting to calculate min power output frequencies\n";
constexpr char kStartClosest[] = "DLL- starting to get closest solution\n";

// A request; what a test leaves out is that of 200 MHz from a PLL at 100 MHz, with no options.
struct Request {
  const char* freqs = "200";
  const char* phases = "0 0 0 0 0 0 0";
  const char* dutyCycles = "50 50 50 50 50 50 50";
  double inFreq = 100;
  double inFreq2 = 0;
  int count = 1;
  bool preferMaxVco = false;
  bool intDiv0Only = false;
  int prim = kPll;
};

class PllDriverTest : public testing::Test {
 protected:
  PllDriverTest() {
    host_.Reset();
    SetPll(kPart, {});    // VCO 400 to 1080, PFD 19 to 500
    SetTsyn(kPart, {});   // VCO 600 to 1440 with target 1000, PFD 10 to 500, low bandwidth 300
    imp_.SetDevice(kPart);
  }

  int MinPower(const Request& r) {
    CaptureTrace capture;
    const int code =
        imp_.CalculateMinPowerOutFreqs(r.freqs, r.inFreq, r.inFreq2, r.count, r.preferMaxVco,
                                       r.intDiv0Only, r.prim, true);
    trace_ = capture.Text();
    return code;
  }

  int Closest(const Request& r) {
    CaptureTrace capture;
    const int code =
        imp_.GetClosestSolution(r.freqs, r.phases, r.dutyCycles, r.inFreq, r.inFreq2, r.count,
                                r.preferMaxVco, r.intDiv0Only, r.prim, true);
    trace_ = capture.Text();
    return code;
  }

  void ExpectNothingChosen() {
    EXPECT_EQ(imp_.pll.chosen, nullptr);
    EXPECT_EQ(imp_.GetChosenVCO(), 0.0);
    EXPECT_EQ(imp_.GetChosenM(), 0.0);
    EXPECT_EQ(imp_.GetChosenD(), 0);
    EXPECT_EQ(imp_.GetChosenDiv0(), 0.0);
    for (int n = 0; n < 7; ++n) {
      EXPECT_EQ(imp_.GetChosenDivN(n), 0);
      EXPECT_EQ(imp_.GetChosenOutFreqN(n), 0.0);
      EXPECT_EQ(imp_.GetChosenPhaseN(n), 0.0);
      EXPECT_EQ(imp_.GetChosenDutyCycleN(n), 0.0);
    }
  }

  FakeHost& host_ = FakeHost::Instance();
  VorkelImp& imp_ = engine_test::NewImp();
  std::string trace_;
};

// --- Whole runs ----------------------------------------------------------------------------

TEST_F(PllDriverTest, AMinPowerRunOfAPll) {
  EXPECT_EQ(MinPower({.freqs = "500 250 31.25", .count = 3}), 1);
  // 1000 / 4 and 1000 / 32 as well, but 500 is the smaller VCO.
  EXPECT_EQ(trace_,
            "DLL- starting to calculate min power output frequencies\n"
            "DLL---- minAdjVco = 400.000000\n"
            "DLL---- maxAdjVco = 1080.000000\n"
            "DLL---- minM = 4.000000\n"
            "DLL---- maxM = 10.800000\n"
            "DLL--- Using fudged oFreq = 500.000 (ofreq: 500.000, fudge: 0.000)\n"
            "DLL----- Found valid VCO = 500.000 and div0 = 1.000 (ofreq0_fudge = 0.000)\n"
            "DLL----- Found valid VCO = 1000.000 and div0 = 2.000 (ofreq0_fudge = 0.000)\n"
            "DLL----- Looking for valid div1 from remaining VCOs\n"
            "DLL ---------- for VCO = 500.000000: div1 = 2\n"
            "DLL ---------- for VCO = 1000.000000: div1 = 4\n"
            "DLL----- Looking for valid div2 from remaining VCOs\n"
            "DLL ---------- for VCO = 500.000000: div2 = 16\n"
            "DLL ---------- for VCO = 1000.000000: div2 = 32\n"
            "DLL------- Calculating M and D\n"
            "DLL - RK --> _prim = 1 \n"
            "DLL-- For VCO = 500.000000: M = 5.000000, D = (float) 1.000000, (int) 1\n"
            "DLL - RK --> _prim = 1 \n"
            "DLL-- For VCO = 1000.000000: M = 10.000000, D = (float) 1.000000, (int) 1\n"
            "DLL---- number of valid VCOs: 2\n"
            "DLL------------ finding the smallest VCO\n"
            "DLL - chosen VCO = 500.000000\n"
            "DLL - chosen M = 5.000000\n"
            "DLL - chosen D = 1\n"
            "DLL - chosen CLKOUT0_DIVIDE_F = 1.000000\n"
            "DLL - chosen CLKOUT1_DIVIDE = 2\n"
            "DLL - chosen CLKOUT2_DIVIDE = 16\n"
            "DLL-- chosen clkout0 output freq = 500.000000 (req = 500.000)\n"
            "DLL-- chosen clkout1 output freq = 250.000000 (req = 250.000)\n"
            "DLL-- chosen clkout2 output freq = 31.250000 (req = 31.250)\n");
  EXPECT_EQ(imp_.GetChosenVCO(), 500.0);
  EXPECT_EQ(imp_.GetChosenDivN(2), 16);
  EXPECT_EQ(imp_.GetChosenOutFreqN(2), 31.25);
  EXPECT_EQ(imp_.GetChosenOutFreqN(3), 0.0);
}

TEST_F(PllDriverTest, AClosestSolutionRunOfAPll) {
  EXPECT_EQ(Closest({.freqs = "500", .phases = "40", .dutyCycles = "60"}), 1);
  // Divider 1: phase 45 and duty cycle 0.5, off by 5 and 0.1; divider 2: 45 and 0.5. Both are
  // gathered at 5.0, the 14th tolerance, and no pass tells them apart.
  std::string attempts;
  for (const char* threshold : {"0.000000", "0.001000", "0.010000", "0.100000", "0.500000",
                                "1.000000", "1.500000", "2.000000", "2.500000", "3.000000",
                                "3.500000", "4.000000", "4.500000"}) {
    attempts += "DLL---- looking for the clk0 phase solutions with threshold = " +
                std::string(threshold) +
                "\nDLL------- no matches for clk0, so try with higher threshold\n";
  }
  const std::string list =
      "DLL  _solutions[0] VCO = 500.000; clk0 phase = 45.000, dc = 0.500\n"
      "DLL  _solutions[1] VCO = 1000.000; clk0 phase = 45.000, dc = 0.500\n";
  EXPECT_EQ(trace_,
            "DLL- starting to get closest solution\n"
            "DLL---- minAdjVco = 400.000000\n"
            "DLL---- maxAdjVco = 1080.000000\n"
            "DLL---- minM = 4.000000\n"
            "DLL---- maxM = 10.800000\n"
            "DLL--- Using fudged oFreq = 500.000 (ofreq: 500.000, fudge: 0.000)\n"
            "DLL----- Found valid VCO = 500.000 and div0 = 1.000 (ofreq0_fudge = 0.000)\n"
            "DLL----- Found valid VCO = 1000.000 and div0 = 2.000 (ofreq0_fudge = 0.000)\n"
            "DLL------- Calculating M and D\n"
            "DLL - RK --> _prim = 1 \n"
            "DLL-- For VCO = 500.000000: M = 5.000000, D = (float) 1.000000, (int) 1\n"
            "DLL - RK --> _prim = 1 \n"
            "DLL-- For VCO = 1000.000000: M = 10.000000, D = (float) 1.000000, (int) 1\n"
            "DLL---- number of valid VCOs: 2\n"
            "DLL ------ getting phases and duty cycles\n" +
                attempts +
                "DLL---- looking for the clk0 phase solutions with threshold = 5.000000\n"
                "DLL------- 2 solutions for clk0; no other oclks used\n"
                "DLL------ Multiple solutions found, so pick the best for clk0.\n" +
                list +
                "DLL-------- looking for best clk0 solution\n"
                "DLL- narrowing down top choices for clk0\n"
                "DLL------ have 2 solutions after clk0 phase check\n" +
                list + "DLL------ have 2 solutions after clk0 duty cycle check\n" + list +
                "DLL------------ finding the smallest VCO\n"
                "DLL - chosen VCO = 500.000000\n"
                "DLL - chosen M = 5.000000\n"
                "DLL - chosen D = 1\n"
                "DLL - chosen CLKOUT0_DIVIDE_F = 1.000000\n"
                "DLL-- chosen clkout0 output freq = 500.000000 (req = 500.000)\n"
                "DLL -   chosen clkout0 phase = 45.000000 (req = 40.000)\n"
                "DLL -   chosen clkout0 duty cycle = 0.500000 (req = 60.000)\n");
}

TEST_F(PllDriverTest, AClosestSolutionOfATsynIsNearItsTarget) {
  // 200 MHz: dividers 3 to 7 and eighths between; 5 makes the target of 1000 MHz.
  EXPECT_EQ(Closest({.prim = kTsyn}), 1);
  EXPECT_EQ(imp_.GetChosenVCO(), 1000.0);
  EXPECT_EQ(imp_.GetChosenDiv0(), 5.0);
  EXPECT_EQ(imp_.GetChosenDutyCycleN(0), 0.5);
  EXPECT_THAT(trace_, HasSubstr("finding the target VCO (closest to 1000.000)\n"));
}

TEST_F(PllDriverTest, AMinPowerRunOfATsynHasTheSmallestVco) {
  EXPECT_EQ(MinPower({.prim = kTsyn}), 1);
  EXPECT_EQ(imp_.GetChosenVCO(), 600.0);
  EXPECT_EQ(imp_.GetChosenDiv0(), 3.0);
  EXPECT_EQ(imp_.GetChosenM(), 6.0);
}

// 850 MHz serves all outputs but with a divider of 2.125 for output 0. With six outputs, or
// when asked, the divider is whole, and 800 MHz has to do.
TEST_F(PllDriverTest, ATsynHasAFractionalDividerWithUpToFiveOutputs) {
  SetTsyn(kPart, {.vcoMin = 800, .vcoMax = 850});
  const Request five = {.freqs = "400 85 170 425 42.5 17 17", .count = 5, .prim = kTsyn};
  EXPECT_EQ(MinPower(five), 1);
  EXPECT_EQ(imp_.GetChosenDiv0(), 2.125);
  EXPECT_EQ(imp_.GetChosenVCO(), 850.0);
  for (const int count : {6, 7}) {
    Request more = five;
    more.count = count;
    EXPECT_EQ(MinPower(more), 1);
    EXPECT_EQ(imp_.GetChosenDiv0(), 2.0);
    EXPECT_EQ(imp_.GetChosenVCO(), 800.0);
  }
  Request whole = five;
  whole.intDiv0Only = true;
  EXPECT_EQ(MinPower(whole), 1);
  EXPECT_EQ(imp_.GetChosenDiv0(), 2.0);
}

TEST_F(PllDriverTest, PreferMaxVcoIsForTheClosestSolution) {
  EXPECT_EQ(Closest({.preferMaxVco = true}), 1);
  EXPECT_EQ(imp_.GetChosenVCO(), 1000.0);
  EXPECT_EQ(MinPower({.preferMaxVco = true}), 1);
  EXPECT_EQ(imp_.GetChosenVCO(), 400.0);
}

TEST_F(PllDriverTest, LowBandwidthLimitsThePfd) {
  SetTsyn(kPart, {.maxPfdLowB = 60});
  imp_.SetLowBandwidth(true);
  EXPECT_EQ(MinPower({.prim = kTsyn}), 1);
  EXPECT_EQ(imp_.GetChosenM(), 12.0);
  EXPECT_EQ(imp_.GetChosenD(), 2);
  EXPECT_THAT(trace_, HasSubstr("DLL  --- Using _maxPfdLowB (60.000000) for PFD max\n"));
  // The limit of the last TSYN load serves a PLL run, too.
  EXPECT_EQ(MinPower({}), 1);
  EXPECT_EQ(imp_.GetChosenM(), 8.0);
  EXPECT_EQ(imp_.GetChosenD(), 2);
}

TEST_F(PllDriverTest, TwoInputClocks) {
  EXPECT_EQ(MinPower({.inFreq2 = 50}), 1);
  EXPECT_EQ(imp_.GetChosenVCO(), 800.0) << "400 at the second clock";
  EXPECT_EQ(Closest({.inFreq2 = 200, .preferMaxVco = true}), 1);
  EXPECT_EQ(imp_.GetChosenVCO(), 400.0) << "from 400 to 540";
}

TEST_F(PllDriverTest, TheFudgeHelpsWhereTheRequestIsMissed) {
  SetPll(kPart, {.vcoMin = 399.9999, .vcoMax = 400.0001});
  EXPECT_EQ(MinPower({.freqs = "199.998"}), 1);
  EXPECT_EQ(CountOf("upping div0 fudge", trace_), 2);
  EXPECT_EQ(imp_.GetChosenOutFreqN(0), 200.0);
}

// --- Results -------------------------------------------------------------------------------

TEST_F(PllDriverTest, Code2WithoutDevice) {
  VorkelImp& imp = engine_test::NewImp();
  EXPECT_EQ(imp.CalculateMinPowerOutFreqs("200", 100, 0, 1, false, false, kPll, false), 2);
  EXPECT_EQ(imp.GetClosestSolution("200", "0", "50", 100, 0, 1, false, false, kTsyn, false), 2);
  EXPECT_THAT(host_.MessageTexts(),
              Each("Internal GetSpdKeyValue() error -- no device was specified yet\n"));
  EXPECT_EQ(host_.messages.size(), 2u);
}

TEST_F(PllDriverTest, Code2WithoutALimit) {
  ASSERT_EQ(MinPower({}), 1);
  host_.devices[kPart].erase("CLKOUT_FREQ_MAX_IOCLK");
  EXPECT_EQ(MinPower({}), 2);
  EXPECT_EQ(trace_, kStartMinPower);
  ExpectNothingChosen();
  EXPECT_EQ(Closest({}), 2);
  EXPECT_EQ(trace_, kStartClosest);
  ExpectNothingChosen();
  EXPECT_EQ(MinPower({.prim = kTsyn}), 1) << "the TSYN has all of its own";
}

TEST_F(PllDriverTest, Code2ForAnUnknownPrimitive) {
  ASSERT_EQ(MinPower({}), 1);
  for (const int prim : {2, -1, INT_MAX, INT_MIN}) {
    EXPECT_EQ(MinPower({.prim = prim}), 2) << prim;
    EXPECT_EQ(Closest({.prim = prim}), 2) << prim;
  }
  ExpectNothingChosen();
  EXPECT_THAT(host_.messages, IsEmpty());
}

TEST_F(PllDriverTest, Code3ForClocksTooFarApart) {
  ASSERT_EQ(MinPower({}), 1);
  EXPECT_EQ(MinPower({.inFreq2 = 20}), 3);
  EXPECT_TRUE(trace_.ends_with(
      "DLL---- There is no valid working range for either VCO or M!\n"));
  ExpectNothingChosen();
  ASSERT_EQ(Closest({}), 1);
  EXPECT_EQ(Closest({.inFreq2 = 1000}), 3);
  ExpectNothingChosen();
  EXPECT_EQ(MinPower({.inFreq = -100}), 3);
}

TEST_F(PllDriverTest, Code4ForAnEmptyOrShortFrequencyList) {
  for (const char* freqs : {"", " ", "200"}) {
    ASSERT_EQ(MinPower({}), 1);
    EXPECT_EQ(MinPower({.freqs = freqs, .count = 2}), 4) << freqs;
    EXPECT_EQ(trace_, kStartMinPower);
    ExpectNothingChosen();
    ASSERT_EQ(MinPower({}), 1);
    EXPECT_EQ(Closest({.freqs = freqs, .count = 2}), 4) << freqs;
    EXPECT_EQ(trace_, kStartClosest);
    ExpectNothingChosen();
  }
}

TEST_F(PllDriverTest, Code4ForAnInputOfZero) {
  ASSERT_EQ(MinPower({}), 1);
  EXPECT_EQ(MinPower({.inFreq = 0, .inFreq2 = 100}), 4);
  ExpectNothingChosen();
  ASSERT_EQ(MinPower({}), 1);
  EXPECT_EQ(Closest({.inFreq = 0}), 4);
  ExpectNothingChosen();
}

TEST_F(PllDriverTest, Code4ForACountThatIsNone) {
  const char* const nine = "200 100 50 200 100 50 200 100 50";
  for (const int count : {0, -1, INT_MIN, 8, 9, INT_MAX}) {
    ASSERT_EQ(MinPower({}), 1);
    EXPECT_EQ(MinPower({.freqs = nine, .count = count}), 4) << count;
    ExpectNothingChosen();
    ASSERT_EQ(MinPower({}), 1);
    EXPECT_EQ(Closest({.freqs = nine, .phases = nine, .dutyCycles = nine, .count = count}), 4)
        << count;
    ExpectNothingChosen();
  }
}

TEST_F(PllDriverTest, Code4ForAnEmptyOrShortPhaseOrDutyCycleList) {
  for (const char* list : {"", "  ", "45"}) {
    ASSERT_EQ(MinPower({}), 1);
    EXPECT_EQ(Closest({.freqs = "200 100", .phases = list, .count = 2}), 4) << list;
    EXPECT_EQ(trace_, kStartClosest);
    ExpectNothingChosen();
    ASSERT_EQ(MinPower({}), 1);
    EXPECT_EQ(Closest({.freqs = "200 100", .dutyCycles = list, .count = 2}), 4) << list;
    EXPECT_EQ(trace_, kStartClosest);
    ExpectNothingChosen();
  }
}

// A frequency of 0 at output 0 has no VCO, but the fudge reaches 3.126, and 128 times that is
// one. (3.125, added up in steps, is a little less than 400 / 128.)
TEST_F(PllDriverTest, ATextThatIsNoNumberIsARequestOf0) {
  EXPECT_EQ(MinPower({.freqs = "fast"}), 1);
  EXPECT_EQ(CountOf("upping div0 fudge", trace_), 3126);
  EXPECT_EQ(imp_.GetChosenDiv0(), 128.0);
  EXPECT_EQ(imp_.GetChosenM(), 4.0);
  EXPECT_NEAR(imp_.GetChosenOutFreqN(0), 3.126, 1e-9);
}

TEST_F(PllDriverTest, Code5ForRequestsThatNothingServes) {
  for (const char* freqs : {"nan", "inf", "-inf", "-200", "1e300", "2000", "0x1p20"}) {
    ASSERT_EQ(MinPower({}), 1);
    EXPECT_EQ(MinPower({.freqs = freqs}), 5) << freqs;
    EXPECT_TRUE(trace_.ends_with("upping div0 fudge to 11.000!\n"
                                 "DLL- NO VALID VCOs found for all possible div0 fudges!\n"));
    ExpectNothingChosen();
    ASSERT_EQ(MinPower({}), 1);
    EXPECT_EQ(Closest({.freqs = freqs}), 5) << freqs;
    ExpectNothingChosen();
  }
}

TEST_F(PllDriverTest, Code5ForInputsThatNothingServes) {
  for (const double inFreq : {engine_test::kNan, engine_test::kInfinity, 1e-300, 1e300}) {
    ASSERT_EQ(MinPower({}), 1);
    EXPECT_EQ(MinPower({.inFreq = inFreq}), 5) << inFreq;
    ExpectNothingChosen();
  }
  EXPECT_EQ(MinPower({.inFreq2 = engine_test::kNan}), 5);
}

TEST_F(PllDriverTest, HexadecimalRequests) {
  EXPECT_EQ(MinPower({.freqs = "0xC8 0x1.9p5", .count = 2}), 1);
  EXPECT_THAT(imp_.requests.reqOutFreq, ElementsAre(200, 50, 0, 0, 0, 0, 0));
  EXPECT_EQ(imp_.GetChosenDivN(1), 8);
}

TEST_F(PllDriverTest, ANegativeRequestOfAnotherOutputIsTakenAsTheFormulaTakesIt) {
  EXPECT_EQ(MinPower({.freqs = "200 -50", .count = 2}), 1);
  EXPECT_EQ(imp_.GetChosenDivN(1), 1);
}

// --- Lists ---------------------------------------------------------------------------------

TEST_F(PllDriverTest, PhasesAndDutyCyclesAreBothParsedBeforeEitherIsTested) {
  imp_.requests.reqOutFreq.fill(9);
  EXPECT_EQ(Closest({.freqs = "200 100", .phases = "", .dutyCycles = "40 60", .count = 2}), 4);
  EXPECT_THAT(imp_.requests.reqDutyCycle, ElementsAre(40, 60, 0, 0, 0, 0, 0));
  EXPECT_EQ(Closest({.freqs = "200 100", .phases = "45", .dutyCycles = "30", .count = 2}), 4);
  EXPECT_THAT(imp_.requests.reqPhase, ElementsAre(45, 0, 0, 0, 0, 0, 0));
  EXPECT_THAT(imp_.requests.reqDutyCycle, ElementsAre(30, 60, 0, 0, 0, 0, 0));
  EXPECT_THAT(imp_.requests.reqOutFreq, Each(9)) << "the frequencies come after them";
  EXPECT_THAT(host_.reads, IsEmpty());
}

TEST_F(PllDriverTest, FrequenciesThatFailComeAfterPhasesAndDutyCycles) {
  EXPECT_EQ(Closest({.freqs = "200", .phases = "45 90", .dutyCycles = "30 40", .count = 2}), 4);
  EXPECT_THAT(imp_.requests.reqOutFreq, ElementsAre(200, 0, 0, 0, 0, 0, 0));
  EXPECT_THAT(imp_.requests.reqPhase, ElementsAre(45, 90, 0, 0, 0, 0, 0));
  EXPECT_THAT(imp_.requests.reqDutyCycle, ElementsAre(30, 40, 0, 0, 0, 0, 0));
}

// 1080 MHz leaves one VCO. Its phases and duty cycles come from the lists of the object, whoever
// filled them.
TEST_F(PllDriverTest, AMinPowerRunReadsThePhasesOfEarlierCalls) {
  const Request one = {.freqs = "1080 540", .inFreq = 90, .count = 2};
  ASSERT_EQ(MinPower(one), 1);
  EXPECT_EQ(imp_.GetChosenPhaseN(0), 0.0);
  EXPECT_EQ(imp_.GetChosenDutyCycleN(0), 0.0) << "nothing was requested yet";

  ASSERT_EQ(Closest({.phases = "45 90", .dutyCycles = "50 75", .count = 1}), 1);
  ASSERT_EQ(MinPower(one), 1);
  EXPECT_EQ(imp_.GetChosenPhaseN(0), 45.0);
  EXPECT_EQ(imp_.GetChosenDutyCycleN(0), 0.5);
  EXPECT_EQ(imp_.GetChosenPhaseN(1), 0.0) << "only one phase was read";

  // Lists of a call that failed count, too.
  ASSERT_EQ(Closest({.phases = "45 90 3", .dutyCycles = "50 75", .count = 3}), 4);
  ASSERT_EQ(MinPower(one), 1);
  EXPECT_EQ(imp_.GetChosenPhaseN(1), 90.0);
  EXPECT_EQ(imp_.GetChosenDutyCycleN(1), 0.75);
  EXPECT_EQ(CountOf("phase =", trace_), 0) << "but are not traced";
}

// --- State ---------------------------------------------------------------------------------

TEST_F(PllDriverTest, ACallStoresItsFlagsAndMode) {
  MinPower({.preferMaxVco = true, .intDiv0Only = false});
  EXPECT_TRUE(imp_.pll._preferMaxVco);
  EXPECT_FALSE(imp_.pll._intDiv0Only);
  EXPECT_TRUE(imp_.pll._minPowerMode);
  Closest({.preferMaxVco = false, .intDiv0Only = true});
  EXPECT_FALSE(imp_.pll._preferMaxVco);
  EXPECT_TRUE(imp_.pll._intDiv0Only);
  EXPECT_FALSE(imp_.pll._minPowerMode);
  // A call that fails does so, too.
  EXPECT_EQ(MinPower({.freqs = "", .preferMaxVco = true}), 4);
  EXPECT_TRUE(imp_.pll._preferMaxVco);
  EXPECT_FALSE(imp_.pll._intDiv0Only);
  EXPECT_TRUE(imp_.pll._minPowerMode);
  EXPECT_EQ(Closest({.phases = "", .intDiv0Only = true}), 4);
  EXPECT_FALSE(imp_.pll._preferMaxVco);
  EXPECT_TRUE(imp_.pll._intDiv0Only);
  EXPECT_FALSE(imp_.pll._minPowerMode);
}

TEST_F(PllDriverTest, ThePrimitiveIsSetByThePassesOnly) {
  ASSERT_EQ(MinPower({.prim = kTsyn}), 1);
  EXPECT_EQ(VorkelImp::_prim, kTsyn);
  EXPECT_EQ(MinPower({.freqs = ""}), 4);
  EXPECT_EQ(MinPower({.inFreq2 = 20}), 3);
  EXPECT_EQ(VorkelImp::_prim, kTsyn);
  EXPECT_EQ(MinPower({.freqs = "2000"}), 5);
  EXPECT_EQ(VorkelImp::_prim, kPll);
}

TEST_F(PllDriverTest, TheAnswersOfTwoObjectsAreTheirOwn) {
  VorkelImp& other = engine_test::NewImp();
  other.SetDevice(kPart);
  ASSERT_EQ(MinPower({}), 1);
  ASSERT_EQ(other.CalculateMinPowerOutFreqs("300", 100, 0, 1, false, false, kTsyn, false), 1);
  EXPECT_EQ(imp_.GetChosenVCO(), 400.0);
  EXPECT_EQ(other.GetChosenVCO(), 600.0);
  EXPECT_EQ(other.CalculateMinPowerOutFreqs("", 100, 0, 1, false, false, kTsyn, false), 4);
  EXPECT_EQ(imp_.GetChosenVCO(), 400.0);
}

TEST_F(PllDriverTest, ALaterRunReplacesTheAnswer) {
  ASSERT_EQ(MinPower({.freqs = "200 50 25", .count = 3}), 1);
  ASSERT_EQ(imp_.GetChosenDivN(2), 16);
  ASSERT_EQ(MinPower({.freqs = "300"}), 1);
  EXPECT_EQ(imp_.GetChosenVCO(), 600.0);
  EXPECT_EQ(imp_.GetChosenDivN(1), 0);
  EXPECT_EQ(imp_.GetChosenDivN(2), 0);
}

TEST_F(PllDriverTest, TheSpeedDataStayThoseOfTheFirstDevice) {
  ASSERT_EQ(MinPower({}), 1);
  SetPll("other", {.vcoMin = 500});
  imp_.SetDevice("other");
  ASSERT_EQ(MinPower({}), 1);
  EXPECT_EQ(imp_.GetChosenVCO(), 400.0);
}

// Passes that are left out without a trace are such as fail. The requests below are solved by a
// fudge, or by none.
TEST_F(PllDriverTest, TheAnswerDoesNotDependOnTheTraceFlag) {
  SetPll(kPart, {.vcoMin = 399.9999, .vcoMax = 400.0001});
  for (const char* freqs :
       {"199.998 50", "200.003 31", "199.998 0", "199.998 -100", "199.998 nan", "199.998 inf",
        "199.998 -inf", "199.998 1e-320", "-1 50", "nan 50", "inf 50", "1e300 50", "0 50"}) {
    const int code = MinPower({.freqs = freqs, .count = 2});
    const double vco = imp_.GetChosenVCO();
    const int div1 = imp_.GetChosenDivN(1);
    EXPECT_EQ(imp_.CalculateMinPowerOutFreqs(freqs, 100, 0, 2, false, false, kPll, false), code)
        << freqs;
    EXPECT_EQ(imp_.GetChosenVCO(), vco) << freqs;
    EXPECT_EQ(imp_.GetChosenDivN(1), div1) << freqs;
  }
}

// A quotient by -0 is negative and so within any tolerance: output 1 has a divider.
TEST_F(PllDriverTest, TheAnswerToARequestOfMinusZeroDoesNotDependOnTheTraceFlag) {
  SetPll(kPart, {.vcoMin = 399.9999, .vcoMax = 400.0001});
  ASSERT_EQ(MinPower({.freqs = "199.998 -0", .count = 2}), 1);
  EXPECT_EQ(imp_.GetChosenDivN(1), 1);
  EXPECT_EQ(
      imp_.CalculateMinPowerOutFreqs("199.998 -0", 100, 0, 2, false, false, kPll, false), 1);
  EXPECT_EQ(imp_.GetChosenDivN(1), 1);
}

// --- Trace ---------------------------------------------------------------------------------

TEST_F(PllDriverTest, WithoutTheTraceFlagNothingIsPrinted) {
  CaptureTrace capture;
  const auto run = [&](const char* freqs, const char* phases, double inFreq2) {
    imp_.CalculateMinPowerOutFreqs(freqs, 100, inFreq2, 1, false, false, kPll, false);
    imp_.GetClosestSolution(freqs, phases, "50", 100, inFreq2, 1, false, false, kPll, false);
  };
  run("200", "0", 0);
  run("", "0", 0);
  run("200", "", 0);
  run("200", "0", 20);
  run("2000", "0", 0);
  const std::string text = capture.Text();
  EXPECT_EQ(text, "");
}

// --- Several objects -----------------------------------------------------------------------

// Both answers are those of slot 1, a divider of 2: 250 x 2, and 300 x 2 from 100 x 6.
TEST_F(PllDriverTest, TheAnswerStaysWhenAnotherObjectRuns) {
  VorkelImp& other = engine_test::NewImp();
  other.SetDevice(kPart);
  ASSERT_EQ(imp_.CalculateMinPowerOutFreqs("250 125", 100, 0, 2, false, false, kPll, false), 1);
  ASSERT_EQ(other.CalculateMinPowerOutFreqs("300 100", 100, 0, 2, false, false, kPll, false), 1);
  EXPECT_EQ(imp_.GetChosenVCO(), 500.0);
  EXPECT_EQ(imp_.GetChosenDivN(1), 4);
  EXPECT_EQ(other.GetChosenVCO(), 600.0);
  EXPECT_EQ(other.GetChosenDivN(1), 6);
}

// 250 MHz from 100: the VCO of 500 is 100 x 5, that of 1000 is larger.
TEST_F(PllDriverTest, TheAnswerStaysWhenItsThreadEnds) {
  int code = 0;
  std::thread([&] {
    code = imp_.CalculateMinPowerOutFreqs("250", 100, 0, 1, false, false, kPll, false);
  }).join();
  ASSERT_EQ(code, 1);
  EXPECT_EQ(imp_.GetChosenVCO(), 500.0);
  EXPECT_EQ(imp_.GetChosenM(), 5.0);
  EXPECT_EQ(imp_.CalculateMinPowerOutFreqs("300", 100, 0, 1, false, false, kPll, false), 1);
  EXPECT_EQ(imp_.GetChosenVCO(), 600.0);
}

// The object lives until the process ends, longer than what its thread has.
TEST_F(PllDriverTest, RunsAtTheVeryEndOfTheProcess) {
  static VorkelImp& imp = imp_;
  static const auto runs = [](const char* outFreq, double vco) {
    return imp.CalculateMinPowerOutFreqs(outFreq, 100, 0, 1, false, false, kPll, false) == 1 &&
           imp.GetChosenVCO() == vco;
  };
  EXPECT_EXIT(
      {
        std::atexit([] { std::_Exit(runs("250", 500.0) ? 0 : 1); });
        std::exit(runs("300", 600.0) ? 2 : 3);
      },
      testing::ExitedWithCode(0), "");
}

// What a script prints after a run must come after the trace of the run, so the trace is out
// of the buffer of standard output when the call returns.
TEST_F(PllDriverTest, TheTraceIsFlushedWhenTheCallReturns) {
  for (const char* freqs : {"200", ""}) {
    char* text = nullptr;
    std::size_t size = 0;
    std::FILE* const saved = stdout;
    stdout = open_memstream(&text, &size);
    imp_.CalculateMinPowerOutFreqs(freqs, 100, 0, 1, false, false, kPll, true);
    const std::size_t flushed = size;
    std::fflush(stdout);
    const std::size_t whole = size;
    std::fclose(stdout);
    stdout = saved;
    std::free(text);
    EXPECT_GT(flushed, 0u) << freqs;
    EXPECT_EQ(flushed, whole) << freqs;
  }
}

}  // namespace
