// Tests of reading the chosen KRU configuration, and of its trace.

#include <gtest/gtest.h>

#include <climits>
#include <cmath>
#include <ostream>
#include <string>

#include "tests/engine/KruTest.h"

namespace {

using engine_test::kInfinity;
using engine_test::kNan;
using Ip::KruPin;
using Ip::Trace;
using Ip::VorkelImp;
using enum Ip::KruPin;

class KruChosenValuesTest : public testing::Test {
 protected:
  std::string NameAt(int n) const { return imp_.GetKruChosenPinname(n).CStr(); }

  std::string TraceChosen(int numOut) {
    return engine_test::TraceOf([&](const Trace& trace) {
      Ip::Kru::TraceChosenValues(imp_, {100, numOut, true, trace});
    });
  }

  VorkelImp& imp_ = engine_test::NewImp();
  Ip::KruState& kru_ = imp_.kru;
};

TEST_F(KruChosenValuesTest, AFreshObjectHasNone) {
  EXPECT_EQ(imp_.GetKruChosenM(), 0);
  EXPECT_EQ(imp_.GetKruChosenD(), 0);
  EXPECT_FALSE(imp_.GetKruChosenDivBy2());
  EXPECT_EQ(imp_.GetKruChosenPhaseOffset(), 0.0);
  EXPECT_EQ(imp_.GetKruChosenPhaseShift(), 0);
  EXPECT_EQ(imp_.GetKruChosenClkdv(), 0.0);
  EXPECT_EQ(imp_.GetKruChosenClkfxdv(), 0.0);
  for (int n = -1; n <= 7; ++n) {
    EXPECT_EQ(NameAt(n), "NONE") << n;
    EXPECT_EQ(imp_.GetKruChosenOutFreqN(100, n), 0.0) << n;
  }
}

TEST_F(KruChosenValuesTest, AreThoseOfTheState) {
  kru_._kruChosenM = 7;
  kru_._kruChosenD = 2;
  kru_._kruChosenDivBy2 = true;
  kru_._kruPhaseOffset = 45;
  kru_._kruChosenClkdv = 2.5;
  EXPECT_EQ(imp_.GetKruChosenM(), 7);
  EXPECT_EQ(imp_.GetKruChosenD(), 2);
  EXPECT_TRUE(imp_.GetKruChosenDivBy2());
  EXPECT_EQ(imp_.GetKruChosenPhaseOffset(), 45.0);
  EXPECT_EQ(imp_.GetKruChosenPhaseShift(), 32);
  EXPECT_EQ(imp_.GetKruChosenClkdv(), 2.5);
  EXPECT_EQ(imp_.GetKruChosenClkfxdv(), 2.5) << "the same value";
}

TEST_F(KruChosenValuesTest, PhaseShiftOfANegativeOffset) {
  kru_._kruPhaseOffset = -1;
  EXPECT_EQ(imp_.GetKruChosenPhaseOffset(), -1.0);
  EXPECT_EQ(imp_.GetKruChosenPhaseShift(), 0);
}

// --- Pins --------------------------------------------------------------------------------------

TEST_F(KruChosenValuesTest, PinsOfTheOutputs) {
  kru_._kruChosenPin = {CLK0, CLK90, CLKDV, CLK2X180, CLKFX180, CLKFXDV};
  EXPECT_EQ(NameAt(0), "CLK0");
  EXPECT_EQ(NameAt(1), "CLK90");
  EXPECT_EQ(NameAt(2), "CLKDV");
  EXPECT_EQ(NameAt(3), "CLK2X180");
  EXPECT_EQ(NameAt(4), "CLKFX180");
  EXPECT_EQ(NameAt(5), "CLKFXDV");
}

// Scripts rely on what index 6 has always read: the list for CLKIN_DIVIDE_BY_2 = TRUE.
TEST_F(KruChosenValuesTest, Index6IsTheFirstPinOfListT) {
  kru_._kruChosenPin.fill(CLK0);
  kru_._kruPinsDivBy2F.fill(CLK90);
  kru_._kruPinsDivBy2T = {CLK2X, CLK180, CLK180, CLK180, CLK180, CLK180};
  EXPECT_EQ(NameAt(6), "CLK2X");
  EXPECT_EQ(imp_.GetKruChosenOutFreqN(100, 6), 200.0);
  kru_._kruPinsDivBy2T[0] = NONE;
  EXPECT_EQ(NameAt(6), "NONE");
  EXPECT_EQ(imp_.GetKruChosenOutFreqN(100, 6), 0.0);
}

TEST_F(KruChosenValuesTest, OutputsThatThereAreNot) {
  kru_._kruChosenPin.fill(CLK0);
  kru_._kruPinsDivBy2F.fill(CLK0);
  kru_._kruPinsDivBy2T.fill(CLK0);
  for (const int n : {INT_MIN, -6, -1, 7, 8, 12, 1000000, INT_MAX}) {
    EXPECT_EQ(NameAt(n), "NONE") << n;
    EXPECT_EQ(imp_.GetKruChosenOutFreqN(100, n), 0.0) << n;
  }
}

// --- Frequencies -------------------------------------------------------------------------------

struct FrequencyCase {
  KruPin pin;
  double frequency;        // from 100 MHz with M = 7, D = 2 and CLKDV = 2.5
  double halvedFrequency;  // with CLKIN_DIVIDE_BY_2
};

std::ostream& operator<<(std::ostream& out, const FrequencyCase& frequency) {
  return out << Ip::KruPinName(frequency.pin).CStr();
}

class FrequencyTest : public KruChosenValuesTest,
                      public testing::WithParamInterface<FrequencyCase> {
 protected:
  FrequencyTest() {
    kru_._kruChosenM = 7;
    kru_._kruChosenD = 2;
    kru_._kruChosenClkdv = 2.5;
  }
};

TEST_P(FrequencyTest, IsThatOfThePin) {
  for (int n = 0; n < 6; ++n) {
    kru_._kruChosenPin = {};
    kru_._kruChosenPin[static_cast<std::size_t>(n)] = GetParam().pin;
    kru_._kruChosenDivBy2 = false;
    EXPECT_EQ(imp_.GetKruChosenOutFreqN(100, n), GetParam().frequency);
    kru_._kruChosenDivBy2 = true;
    EXPECT_EQ(imp_.GetKruChosenOutFreqN(100, n), GetParam().halvedFrequency);
  }
}

TEST_P(FrequencyTest, IsThatOfTheFirstPinOfListTForIndex6) {
  kru_._kruPinsDivBy2T[0] = GetParam().pin;
  EXPECT_EQ(imp_.GetKruChosenOutFreqN(100, 6), GetParam().frequency);
  kru_._kruChosenDivBy2 = true;
  EXPECT_EQ(imp_.GetKruChosenOutFreqN(100, 6), GetParam().halvedFrequency);
}

TEST_P(FrequencyTest, IsZeroWithoutAnInput) {
  kru_._kruChosenPin.fill(GetParam().pin);
  kru_._kruPinsDivBy2T.fill(GetParam().pin);
  for (int n = -1; n <= 7; ++n) {
    EXPECT_EQ(imp_.GetKruChosenOutFreqN(0.0, n), 0.0);
    EXPECT_EQ(imp_.GetKruChosenOutFreqN(-0.0, n), 0.0);
  }
}

INSTANTIATE_TEST_SUITE_P(
    Pins, FrequencyTest,
    testing::Values(FrequencyCase{NONE, 0, 0}, FrequencyCase{CLK0, 100, 50},
                    FrequencyCase{CLK90, 100, 50}, FrequencyCase{CLK180, 100, 50},
                    FrequencyCase{CLK270, 100, 50}, FrequencyCase{CLKDV, 40, 20},
                    FrequencyCase{CLK2X, 200, 100}, FrequencyCase{CLK2X180, 200, 100},
                    FrequencyCase{CLKFX, 350, 175}, FrequencyCase{CLKFX180, 350, 175},
                    FrequencyCase{CLKFXDV, 0, 0}),
    [](const auto& parameter) {
      return std::string(Ip::KruPinName(parameter.param.pin).CStr());
    });

// Index 6 can meet a pin of list T when list F was taken, and then nothing that it divides by.
TEST_F(KruChosenValuesTest, ADividerOf0MakesNoFrequency) {
  kru_._kruPinsDivBy2T[0] = CLKDV;
  EXPECT_EQ(imp_.GetKruChosenOutFreqN(100, 6), 0.0);
  for (const KruPin pin : {CLKFX, CLKFX180}) {
    kru_._kruPinsDivBy2T[0] = pin;
    EXPECT_EQ(imp_.GetKruChosenOutFreqN(100, 6), 0.0);
    kru_._kruChosenM = 7;
    EXPECT_EQ(imp_.GetKruChosenOutFreqN(100, 6), 0.0);
    kru_._kruChosenM = 0;
  }
  kru_._kruChosenPin[0] = CLKFX;
  EXPECT_EQ(imp_.GetKruChosenOutFreqN(-100, 0), 0.0);
  EXPECT_FALSE(std::signbit(imp_.GetKruChosenOutFreqN(-100, 0)));
}

// (0.1 x 3) / 3 is the double behind 0.1, and 0.1 x (3 / 3) is 0.1.
TEST_F(KruChosenValuesTest, MultipliesBeforeItDivides) {
  ASSERT_NE(0.1 * 3 / 3, 0.1);
  kru_._kruChosenPin[0] = CLKFX;
  kru_._kruChosenM = 3;
  kru_._kruChosenD = 3;
  EXPECT_EQ(imp_.GetKruChosenOutFreqN(0.1, 0), 0.1 * 3 / 3);
}

TEST_F(KruChosenValuesTest, OddInputFrequencies) {
  kru_._kruChosenPin = {CLK0, CLK2X, CLKDV, CLKFX};
  kru_._kruChosenM = 7;
  kru_._kruChosenD = 2;
  kru_._kruChosenClkdv = 4;
  EXPECT_EQ(imp_.GetKruChosenOutFreqN(-100, 0), -100.0);
  EXPECT_EQ(imp_.GetKruChosenOutFreqN(-100, 1), -200.0);
  EXPECT_EQ(imp_.GetKruChosenOutFreqN(-100, 2), -25.0);
  EXPECT_EQ(imp_.GetKruChosenOutFreqN(-100, 3), -350.0);
  EXPECT_EQ(imp_.GetKruChosenOutFreqN(kInfinity, 2), kInfinity);
  EXPECT_EQ(imp_.GetKruChosenOutFreqN(1e308, 1), kInfinity);
  for (int n = 0; n < 4; ++n) EXPECT_TRUE(std::isnan(imp_.GetKruChosenOutFreqN(kNan, n))) << n;
  EXPECT_EQ(imp_.GetKruChosenOutFreqN(kNan, 4), 0.0) << "no pin";
}

// The frequencies come from the argument, not from the input of the run.
TEST_F(KruChosenValuesTest, TheRequestsDoNotMatter) {
  kru_._kruChosenPin[0] = CLK2X;
  imp_.requests.reqOutFreq.fill(33);
  EXPECT_EQ(imp_.GetKruChosenOutFreqN(60, 0), 120.0);
}

// --- Trace -------------------------------------------------------------------------------------

TEST_F(KruChosenValuesTest, TraceWithoutClkdv) {
  kru_._kruChosenPin = {CLK0, CLKFX};
  kru_._kruChosenM = 7;
  kru_._kruChosenD = 2;
  EXPECT_EQ(TraceChosen(2),
            "DLL - for CLK_OUT0, chosen KRU pin = CLK0\n"
            "DLL - for CLK_OUT1, chosen KRU pin = CLKFX\n"
            "DLL - chosen CLKIN_DIVIDE_BY_2 = 0\n"
            "DLL - chosen M = 7\n"
            "DLL - chosen D = 2\n"
            "DLL - chosen phase offset = 0.000000\n"
            "DLL - chosen PHASE_SHIFT = 0\n");
}

TEST_F(KruChosenValuesTest, TraceOfSixOutputs) {
  kru_._kruChosenPin = {CLKDV, CLK90, CLK180, CLK270, CLK2X, CLK2X180};
  kru_._kruChosenDivBy2 = true;
  kru_._kruChosenClkdv = 7.5;
  kru_._kruPhaseOffset = 22.5;
  EXPECT_EQ(TraceChosen(6),
            "DLL - for CLK_OUT0, chosen KRU pin = CLKDV\n"
            "DLL - for CLK_OUT1, chosen KRU pin = CLK90\n"
            "DLL - for CLK_OUT2, chosen KRU pin = CLK180\n"
            "DLL - for CLK_OUT3, chosen KRU pin = CLK270\n"
            "DLL - for CLK_OUT4, chosen KRU pin = CLK2X\n"
            "DLL - for CLK_OUT5, chosen KRU pin = CLK2X180\n"
            "DLL - chosen CLKIN_DIVIDE_BY_2 = 1\n"
            "DLL - chosen M = 0\n"
            "DLL - chosen D = 0\n"
            "DLL - chosen phase offset = 22.500000\n"
            "DLL - chosen PHASE_SHIFT = 16\n"
            "DLL - chosen CLKDV = 7.500000\n");
}

TEST_F(KruChosenValuesTest, IsSilentWithTheTraceOff) {
  kru_._kruChosenClkdv = 2;
  EXPECT_EQ(engine_test::TraceOf(
                [&](const Trace& trace) {
                  Ip::Kru::TraceChosenValues(imp_, {100, 6, true, trace});
                },
                false),
            "");
}

}  // namespace
