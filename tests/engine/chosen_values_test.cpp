// Tests of reading the chosen configuration, and of its trace.

#include <gtest/gtest.h>

#include <climits>
#include <string>

#include "engine/pll/Stages.h"
#include "tests/engine/EngineTest.h"

namespace {

using Ip::Trace;
using Ip::VorkelImp;
using Ip::Pll::VcoCandidate;

class ChosenValuesTest : public testing::Test {
 protected:
  // Chooses a candidate; the test fills it.
  VcoCandidate& Choose(double vco, double div0) {
    engine_test::PutBare(imp_.pll._vcoCandidates, 5, vco, div0);
    imp_.pll.chosen = &imp_.pll._vcoCandidates[5];
    return imp_.pll._vcoCandidates[5];
  }

  std::string TraceChosen(int count) {
    return engine_test::TraceOf([&](const Trace& trace) {
      Ip::Pll::TraceChosenValues(imp_, {100, count, 1, trace});
    });
  }

  VorkelImp& imp_ = engine_test::NewImp();
};

TEST_F(ChosenValuesTest, AllAreZeroWhenNoneIsChosen) {
  // A candidate in the table is not a chosen one.
  VcoCandidate& candidate = Choose(400, 2);
  candidate.m = 4;
  candidate.divN.fill(2);
  imp_.pll.chosen = nullptr;
  EXPECT_EQ(imp_.GetChosenVCO(), 0.0);
  EXPECT_EQ(imp_.GetChosenM(), 0.0);
  EXPECT_EQ(imp_.GetChosenD(), 0);
  EXPECT_EQ(imp_.GetChosenDiv0(), 0.0);
  for (const int n : {INT_MIN, -1, 0, 1, 6, 7, INT_MAX}) {
    EXPECT_EQ(imp_.GetChosenDivN(n), 0) << n;
    EXPECT_EQ(imp_.GetChosenOutFreqN(n), 0.0) << n;
    EXPECT_EQ(imp_.GetChosenPhaseN(n), 0.0) << n;
    EXPECT_EQ(imp_.GetChosenDutyCycleN(n), 0.0) << n;
  }
}

TEST_F(ChosenValuesTest, AreThoseOfTheChosenCandidate) {
  VcoCandidate& chosen = Choose(850, 2.125);
  chosen.m = 17;
  chosen.d = 2;
  chosen.divN = {77, 1, 2, 4, 5, 10, 128};
  chosen.phase = {0.5, 1.5, 2.5, 3.5, 4.5, 5.5, -6.5};
  chosen.dutyCycle = {0.5, 0.25, 0.125, 0.5, 0.5, 0.5, 0.75};
  EXPECT_EQ(imp_.GetChosenVCO(), 850.0);
  EXPECT_EQ(imp_.GetChosenM(), 17.0);
  EXPECT_EQ(imp_.GetChosenD(), 2);
  EXPECT_EQ(imp_.GetChosenDiv0(), 2.125);
  EXPECT_EQ(imp_.GetChosenDivN(1), 1);
  EXPECT_EQ(imp_.GetChosenDivN(6), 128);
  EXPECT_EQ(imp_.GetChosenOutFreqN(0), 400.0);
  EXPECT_EQ(imp_.GetChosenOutFreqN(1), 850.0);
  EXPECT_EQ(imp_.GetChosenOutFreqN(5), 85.0);
  EXPECT_EQ(imp_.GetChosenOutFreqN(6), 6.640625);
  EXPECT_EQ(imp_.GetChosenPhaseN(0), 0.5);
  EXPECT_EQ(imp_.GetChosenPhaseN(6), -6.5);
  EXPECT_EQ(imp_.GetChosenDutyCycleN(1), 0.25);
  EXPECT_EQ(imp_.GetChosenDutyCycleN(6), 0.75);
}

TEST_F(ChosenValuesTest, OutputsThatThereAreNotAreZero) {
  VcoCandidate& chosen = Choose(800, 2);
  chosen.divN.fill(4);
  chosen.phase.fill(45);
  chosen.dutyCycle.fill(0.5);
  EXPECT_EQ(imp_.GetChosenDivN(0), 0) << "the divider of output 0 is Div0";
  for (const int n : {INT_MIN, -7, -1, 7, 8, 1000000, INT_MAX}) {
    EXPECT_EQ(imp_.GetChosenDivN(n), 0) << n;
    EXPECT_EQ(imp_.GetChosenOutFreqN(n), 0.0) << n;
    EXPECT_EQ(imp_.GetChosenPhaseN(n), 0.0) << n;
    EXPECT_EQ(imp_.GetChosenDutyCycleN(n), 0.0) << n;
  }
}

TEST_F(ChosenValuesTest, AFrequencyWithoutDividerOrVcoIsZero) {
  VcoCandidate& chosen = Choose(800, 0);
  EXPECT_EQ(imp_.GetChosenOutFreqN(0), 0.0);
  EXPECT_EQ(imp_.GetChosenOutFreqN(1), 0.0);
  chosen.divN[1] = 8;
  EXPECT_EQ(imp_.GetChosenOutFreqN(1), 100.0);
  chosen.vco = 0;
  EXPECT_EQ(imp_.GetChosenOutFreqN(1), 0.0);
}

TEST_F(ChosenValuesTest, TraceOfTheMinPowerMode) {
  imp_.pll._minPowerMode = true;
  VcoCandidate& chosen = Choose(850, 2.125);
  chosen.m = 17;
  chosen.d = 2;
  chosen.divN[1] = 10;
  chosen.divN[2] = 3;
  imp_.requests.reqOutFreq = {400, 85, 283.3339};
  EXPECT_EQ(TraceChosen(3),
            "DLL - chosen VCO = 850.000000\n"
            "DLL - chosen M = 17.000000\n"
            "DLL - chosen D = 2\n"
            "DLL - chosen CLKOUT0_DIVIDE_F = 2.125000\n"
            "DLL - chosen CLKOUT1_DIVIDE = 10\n"
            "DLL - chosen CLKOUT2_DIVIDE = 3\n"
            "DLL-- chosen clkout0 output freq = 400.000000 (req = 400.000)\n"
            "DLL-- chosen clkout1 output freq = 85.000000 (req = 85.000)\n"
            "DLL-- chosen clkout2 output freq = 283.333333 (req = 283.334)\n");
}

TEST_F(ChosenValuesTest, TraceOfTheClosestSolutionMode) {
  imp_.pll._minPowerMode = false;
  VcoCandidate& chosen = Choose(800, 4);
  chosen.m = 8;
  chosen.d = 1;
  chosen.divN[1] = 8;
  chosen.phase = {101.25, -90};
  chosen.dutyCycle = {0.5, 0.4375};
  imp_.requests.reqOutFreq = {200, 100};
  imp_.requests.reqPhase = {100, -90.5};
  imp_.requests.reqDutyCycle = {50, 45};
  EXPECT_EQ(TraceChosen(2),
            "DLL - chosen VCO = 800.000000\n"
            "DLL - chosen M = 8.000000\n"
            "DLL - chosen D = 1\n"
            "DLL - chosen CLKOUT0_DIVIDE_F = 4.000000\n"
            "DLL - chosen CLKOUT1_DIVIDE = 8\n"
            "DLL-- chosen clkout0 output freq = 200.000000 (req = 200.000)\n"
            "DLL -   chosen clkout0 phase = 101.250000 (req = 100.000)\n"
            "DLL -   chosen clkout0 duty cycle = 0.500000 (req = 50.000)\n"
            "DLL-- chosen clkout1 output freq = 100.000000 (req = 100.000)\n"
            "DLL -   chosen clkout1 phase = -90.000000 (req = -90.500)\n"
            "DLL -   chosen clkout1 duty cycle = 0.437500 (req = 45.000)\n");
}

TEST_F(ChosenValuesTest, TraceOfAllSevenOutputs) {
  imp_.pll._minPowerMode = true;
  VcoCandidate& chosen = Choose(960, 1);
  chosen.m = 48;
  chosen.d = 5;
  chosen.divN = {0, 2, 3, 4, 5, 6, 128};
  EXPECT_EQ(TraceChosen(7),
            "DLL - chosen VCO = 960.000000\n"
            "DLL - chosen M = 48.000000\n"
            "DLL - chosen D = 5\n"
            "DLL - chosen CLKOUT0_DIVIDE_F = 1.000000\n"
            "DLL - chosen CLKOUT1_DIVIDE = 2\n"
            "DLL - chosen CLKOUT2_DIVIDE = 3\n"
            "DLL - chosen CLKOUT3_DIVIDE = 4\n"
            "DLL - chosen CLKOUT4_DIVIDE = 5\n"
            "DLL - chosen CLKOUT5_DIVIDE = 6\n"
            "DLL - chosen CLKOUT6_DIVIDE = 128\n"
            "DLL-- chosen clkout0 output freq = 960.000000 (req = 0.000)\n"
            "DLL-- chosen clkout1 output freq = 480.000000 (req = 0.000)\n"
            "DLL-- chosen clkout2 output freq = 320.000000 (req = 0.000)\n"
            "DLL-- chosen clkout3 output freq = 240.000000 (req = 0.000)\n"
            "DLL-- chosen clkout4 output freq = 192.000000 (req = 0.000)\n"
            "DLL-- chosen clkout5 output freq = 160.000000 (req = 0.000)\n"
            "DLL-- chosen clkout6 output freq = 7.500000 (req = 0.000)\n");
}

TEST_F(ChosenValuesTest, IsSilentWithTheTraceOff) {
  Choose(800, 4);
  const std::string text = engine_test::TraceOf(
      [&](const Trace& trace) { Ip::Pll::TraceChosenValues(imp_, {100, 7, 1, trace}); }, false);
  EXPECT_EQ(text, "");
}

}  // namespace
