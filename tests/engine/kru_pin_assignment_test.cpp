// Tests of which pin could serve each output of a KRU_SP.
//
// The input has 100 MHz where a test does not say otherwise, so that outputs of 100, 50 and
// 200 MHz have its frequency, half and double of it.

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstdio>
#include <limits>
#include <ostream>
#include <string>
#include <vector>

#include "tests/engine/KruTest.h"

namespace {

using engine_test::Above;
using engine_test::Below;
using engine_test::CountOf;
using engine_test::kInfinity;
using engine_test::kNan;
using engine_test::KruOutput;
using engine_test::Names;
using engine_test::PotentiallyRefused;
using engine_test::Refused;
using engine_test::Request;
using Ip::KruLimits;
using Ip::KruPin;
using Ip::Trace;
using Ip::VorkelImp;
using testing::Each;
using testing::ElementsAre;

// Limits that refuse nothing.
KruLimits Wide() {
  KruLimits limits;
  for (double KruLimits::*min : {&KruLimits::_kruClk0Min, &KruLimits::_kruClk90Min,
                                 &KruLimits::_kruClk2xMin, &KruLimits::_kruClkdvMin,
                                 &KruLimits::_kruClkfxMin}) {
    limits.*min = 0;
  }
  for (double KruLimits::*max :
       {&KruLimits::_kruClk0Max, &KruLimits::_kruClk0Max2x, &KruLimits::_kruClk90Max,
        &KruLimits::_kruClk90Max2x, &KruLimits::_kruClk2xMax, &KruLimits::_kruClkdvMax,
        &KruLimits::_kruClkdvMax2x, &KruLimits::_kruClkfxMax}) {
    limits.*max = 10000;
  }
  return limits;
}

class PinAssignmentTest : public testing::Test {
 protected:
  PinAssignmentTest() { limits_ = Wide(); }

  void Assign(const std::vector<KruOutput>& outputs, bool feedbackUsed = true,
              double inFreq = 100) {
    Request(imp_, outputs);
    trace_ = engine_test::TraceOf([&](const Trace& trace) {
      clkdv_ = Ip::Kru::AssignPins(
          imp_, {inFreq, static_cast<int>(outputs.size()), feedbackUsed, trace});
    });
  }

  std::string F() const { return Names(imp_.kru._kruPinsDivBy2F); }
  std::string T() const { return Names(imp_.kru._kruPinsDivBy2T); }

  // The trace of a run for one output with these refusals and these pins.
  static std::string TraceOfOne(const KruOutput& output, const std::string& refusals,
                                const std::string& f, const std::string& t) {
    char line[100];
    std::snprintf(line, sizeof line, "DLL ------ Clk_Out0 ofreq = %3.3f; phase = %3.3f\n",
                  output.frequency, output.phase);
    return "DLL ---- Checking if KRU will work\n" + std::string(line) + refusals +
           "DLL --------- _kruPinsDivBy2False[0] = " + (f.empty() ? "NONE" : f) +
           "\nDLL --------- _kruPinsDivBy2True[0] = " + (t.empty() ? "NONE" : t) + "\n";
  }

  // Assigns one output and expects these pins, with no refusal but these, and this CLKDV value
  // for list F.
  void ExpectOne(const KruOutput& output, bool feedbackUsed, const std::string& f,
                 const std::string& t, const std::string& refusals = "", double clkdvF = 0) {
    Assign({output}, feedbackUsed);
    EXPECT_EQ(F(), f);
    EXPECT_EQ(T(), t);
    EXPECT_EQ(trace_, TraceOfOne(output, refusals, f, t));
    EXPECT_THAT(clkdv_.f, ElementsAre(clkdvF, 0, 0, 0, 0, 0));
    EXPECT_THAT(clkdv_.t, Each(0.0));
  }

  VorkelImp& imp_ = engine_test::NewImp();
  KruLimits& limits_ = imp_.kruLimits;
  Ip::Kru::ClkdvLists clkdv_;
  std::string trace_;
};

// --- The rows of the tables --------------------------------------------------------------------

struct RowCase {
  const char* name;
  bool feedbackUsed;
  double frequency;
  double phase;  // above the offset
  const char* f;
  const char* t;
  double clkdvF = 0;
};

std::ostream& operator<<(std::ostream& out, const RowCase& row) { return out << row.name; }

class RowTest : public PinAssignmentTest, public testing::WithParamInterface<RowCase> {
 protected:
  void ExpectRow(double offset) {
    const RowCase& row = GetParam();
    imp_.kru._kruPhaseOffset = offset;
    ExpectOne({row.frequency, offset + row.phase}, row.feedbackUsed, row.f, row.t, "",
              row.clkdvF);
  }
};

TEST_P(RowTest, WithoutOffset) { ExpectRow(0); }
TEST_P(RowTest, WithAnOffset) { ExpectRow(45); }
TEST_P(RowTest, WithANegativeOffset) { ExpectRow(-1); }

INSTANTIATE_TEST_SUITE_P(
    InputFrequency, RowTest,
    testing::Values(RowCase{"NoFeedback0", false, 100, 0, "CLKFX", "CLKFX"},
                    RowCase{"NoFeedback90", false, 100, 90, "", ""},
                    RowCase{"NoFeedback180", false, 100, 180, "CLKFX180", "CLKFX180"},
                    RowCase{"NoFeedback270", false, 100, 270, "", ""},
                    RowCase{"NoFeedback22", false, 100, 22, "", ""},
                    RowCase{"Feedback0", true, 100, 0, "CLK0", "CLK2X"},
                    RowCase{"Feedback90", true, 100, 90, "CLK90", ""},
                    RowCase{"Feedback180", true, 100, 180, "CLK180", "CLK2X180"},
                    RowCase{"Feedback270", true, 100, 270, "CLK270", ""},
                    RowCase{"Feedback22", true, 100, 22, "", ""},
                    RowCase{"Feedback360", true, 100, 360, "", ""}),
    [](const auto& parameter) { return std::string(parameter.param.name); });

INSTANTIATE_TEST_SUITE_P(
    HalfFrequency, RowTest,
    testing::Values(RowCase{"NoFeedback0", false, 50, 0, "CLKFX", "CLKFX"},
                    RowCase{"NoFeedback90", false, 50, 90, "", ""},
                    RowCase{"NoFeedback180", false, 50, 180, "CLKFX180", "CLKFX180"},
                    RowCase{"NoFeedback270", false, 50, 270, "", ""},
                    RowCase{"NoFeedback22", false, 50, 22, "", ""},
                    RowCase{"Feedback0", true, 50, 0, "CLKDV", "CLK0", 2.0},
                    RowCase{"Feedback90", true, 50, 90, "", "CLK90"},
                    RowCase{"Feedback180", true, 50, 180, "", "CLK180"},
                    RowCase{"Feedback270", true, 50, 270, "", "CLK270"},
                    RowCase{"Feedback22", true, 50, 22, "", ""},
                    RowCase{"Feedback360", true, 50, 360, "", ""}),
    [](const auto& parameter) { return std::string(parameter.param.name); });

INSTANTIATE_TEST_SUITE_P(
    DoubleFrequency, RowTest,
    testing::Values(RowCase{"NoFeedback0", false, 200, 0, "CLKFX", "CLKFX"},
                    RowCase{"NoFeedback90", false, 200, 90, "", ""},
                    RowCase{"NoFeedback180", false, 200, 180, "CLKFX180", "CLKFX180"},
                    RowCase{"NoFeedback270", false, 200, 270, "", ""},
                    RowCase{"NoFeedback22", false, 200, 22, "", ""},
                    RowCase{"Feedback0", true, 200, 0, "CLK2X", "CLKFX"},
                    RowCase{"Feedback90", true, 200, 90, "", ""},
                    RowCase{"Feedback180", true, 200, 180, "CLK2X180", ""},
                    RowCase{"Feedback270", true, 200, 270, "", ""},
                    RowCase{"Feedback22", true, 200, 22, "", ""},
                    RowCase{"Feedback360", true, 200, 360, "", ""}),
    [](const auto& parameter) { return std::string(parameter.param.name); });

// Without feedback CLKFX180 goes into list T only; that is meant so.
INSTANTIATE_TEST_SUITE_P(
    OtherFrequency, RowTest,
    testing::Values(RowCase{"NoFeedback0", false, 300, 0, "CLKFX", "CLKFX"},
                    RowCase{"NoFeedback90", false, 300, 90, "", ""},
                    RowCase{"NoFeedback180", false, 300, 180, "", "CLKFX180"},
                    RowCase{"NoFeedback270", false, 300, 270, "", ""},
                    RowCase{"NoFeedback22", false, 300, 22, "", ""},
                    RowCase{"Feedback0", true, 300, 0, "CLKFX", "CLKFX"},
                    RowCase{"Feedback90", true, 300, 90, "", ""},
                    RowCase{"Feedback180", true, 300, 180, "CLKFX180", "CLKFX180"},
                    RowCase{"Feedback270", true, 300, 270, "", ""},
                    RowCase{"Feedback22", true, 300, 22, "", ""}),
    [](const auto& parameter) { return std::string(parameter.param.name); });

TEST_F(PinAssignmentTest, PhasesCompareExactly) {
  imp_.kru._kruPhaseOffset = 45;
  for (const double frequency : {100.0, 50.0, 200.0, 300.0}) {
    for (const double phase : {45.0, 135.0, 225.0, 315.0}) {
      for (const bool feedback : {false, true}) {
        ExpectOne({frequency, Above(phase)}, feedback, "", "");
        ExpectOne({frequency, Below(phase)}, feedback, "", "");
      }
    }
  }
}

// Then every row has the phase, and the first of them is taken.
TEST_F(PinAssignmentTest, AnOffsetThatSwallowsTheFixedPhases) {
  imp_.kru._kruPhaseOffset = kInfinity;
  ExpectOne({100, kInfinity}, true, "CLK0", "CLK2X");
  ExpectOne({50, kInfinity}, true, "CLKDV", "CLK0", "", 2.0);
  ExpectOne({200, kInfinity}, true, "CLK2X", "CLKFX");
  // Here the tests for 0 and 180 degrees are two, and the second has the last word.
  ExpectOne({300, kInfinity}, true, "CLKFX180", "CLKFX180");
  ExpectOne({300, kInfinity}, false, "CLKFX", "CLKFX180");
}

// --- Range tests -------------------------------------------------------------------------------

// A range whose failure leaves one list (or both) without the pin.
struct RangeCase {
  const char* name;
  bool feedbackUsed;
  KruOutput output;
  double KruLimits::*min;
  double KruLimits::*max;
  const char* f;         // the lists when the test holds
  const char* t;
  const char* failedF;   // and when it fails
  const char* failedT;
  const char* pin;       // of the message
  bool potentially = false;
  double clkdvF = 0;
};

std::ostream& operator<<(std::ostream& out, const RangeCase& range) { return out << range.name; }

class RangeTest : public PinAssignmentTest, public testing::WithParamInterface<RangeCase> {
 protected:
  void ExpectHolds() {
    const RangeCase& c = GetParam();
    ExpectOne(c.output, c.feedbackUsed, c.f, c.t, "", c.clkdvF);
  }
  void ExpectFails() {
    const RangeCase& c = GetParam();
    ExpectOne(c.output, c.feedbackUsed, c.failedF, c.failedT,
              c.potentially ? PotentiallyRefused(c.pin, c.output.frequency)
                            : Refused(c.pin, c.output.frequency),
              c.clkdvF);
  }
  double Frequency() const { return GetParam().output.frequency; }
};

TEST_P(RangeTest, HoldsAtTheMinimum) {
  limits_.*GetParam().min = Frequency();
  ExpectHolds();
}

TEST_P(RangeTest, FailsBelowTheMinimum) {
  limits_.*GetParam().min = Above(Frequency());
  ExpectFails();
}

TEST_P(RangeTest, HoldsAtTheMaximum) {
  limits_.*GetParam().max = Frequency();
  ExpectHolds();
}

TEST_P(RangeTest, FailsAboveTheMaximum) {
  limits_.*GetParam().max = Below(Frequency());
  ExpectFails();
}

using L = KruLimits;
INSTANTIATE_TEST_SUITE_P(
    InputFrequency, RangeTest,
    testing::Values(
        RangeCase{"Clk0", true, {100, 0}, &L::_kruClk0Min, &L::_kruClk0Max,
                  "CLK0", "CLK2X", "", "CLK2X", "CLK0"},
        RangeCase{"Clk2x", true, {100, 0}, &L::_kruClk2xMin, &L::_kruClk2xMax,
                  "CLK0", "CLK2X", "CLK0", "", "CLK2X"},
        RangeCase{"Clk90", true, {100, 90}, &L::_kruClk90Min, &L::_kruClk90Max,
                  "CLK90", "", "", "", "CLK90"},
        RangeCase{"Clk180", true, {100, 180}, &L::_kruClk0Min, &L::_kruClk0Max,
                  "CLK180", "CLK2X180", "", "CLK2X180", "CLK180"},
        RangeCase{"Clk2x180", true, {100, 180}, &L::_kruClk2xMin, &L::_kruClk2xMax,
                  "CLK180", "CLK2X180", "CLK180", "", "CLK2X180"},
        RangeCase{"Clk270", true, {100, 270}, &L::_kruClk90Min, &L::_kruClk90Max,
                  "CLK270", "", "", "", "CLK270"},
        RangeCase{"Clkfx", false, {100, 0}, &L::_kruClkfxMin, &L::_kruClkfxMax,
                  "CLKFX", "CLKFX", "", "", "CLKFX", true},
        RangeCase{"Clkfx180", false, {100, 180}, &L::_kruClkfxMin, &L::_kruClkfxMax,
                  "CLKFX180", "CLKFX180", "", "", "CLKFX180", true}),
    [](const auto& parameter) { return std::string(parameter.param.name); });

INSTANTIATE_TEST_SUITE_P(
    HalfFrequency, RangeTest,
    testing::Values(
        // The value 2 is needed whether or not CLKDV has the range for it; that is meant so.
        RangeCase{"Clkdv", true, {50, 0}, &L::_kruClkdvMin, &L::_kruClkdvMax,
                  "CLKDV", "CLK0", "", "CLK0", "CLKDV", false, 2.0},
        RangeCase{"Clk0", true, {50, 0}, &L::_kruClk0Min, &L::_kruClk0Max,
                  "CLKDV", "CLK0", "CLKDV", "", "CLK0", false, 2.0},
        RangeCase{"Clk90", true, {50, 90}, &L::_kruClk90Min, &L::_kruClk90Max,
                  "", "CLK90", "", "", "CLK90"},
        RangeCase{"Clk180", true, {50, 180}, &L::_kruClk0Min, &L::_kruClk0Max,
                  "", "CLK180", "", "", "CLK180"},
        RangeCase{"Clk270", true, {50, 270}, &L::_kruClk90Min, &L::_kruClk90Max,
                  "", "CLK270", "", "", "CLK270"},
        RangeCase{"Clkfx", false, {50, 0}, &L::_kruClkfxMin, &L::_kruClkfxMax,
                  "CLKFX", "CLKFX", "", "", "CLKFX", true},
        RangeCase{"Clkfx180", false, {50, 180}, &L::_kruClkfxMin, &L::_kruClkfxMax,
                  "CLKFX180", "CLKFX180", "", "", "CLKFX180", true}),
    [](const auto& parameter) { return std::string(parameter.param.name); });

INSTANTIATE_TEST_SUITE_P(
    DoubleFrequency, RangeTest,
    testing::Values(
        RangeCase{"Clk2x", true, {200, 0}, &L::_kruClk2xMin, &L::_kruClk2xMax,
                  "CLK2X", "CLKFX", "", "CLKFX", "CLK2X"},
        RangeCase{"ClkfxOfListT", true, {200, 0}, &L::_kruClkfxMin, &L::_kruClkfxMax,
                  "CLK2X", "CLKFX", "CLK2X", "", "CLKFX", true},
        RangeCase{"Clk2x180", true, {200, 180}, &L::_kruClk2xMin, &L::_kruClk2xMax,
                  "CLK2X180", "", "", "", "CLK2X180"},
        RangeCase{"Clkfx", false, {200, 0}, &L::_kruClkfxMin, &L::_kruClkfxMax,
                  "CLKFX", "CLKFX", "", "", "CLKFX", true},
        RangeCase{"Clkfx180", false, {200, 180}, &L::_kruClkfxMin, &L::_kruClkfxMax,
                  "CLKFX180", "CLKFX180", "", "", "CLKFX180", true}),
    [](const auto& parameter) { return std::string(parameter.param.name); });

INSTANTIATE_TEST_SUITE_P(
    OtherFrequency, RangeTest,
    testing::Values(
        RangeCase{"Clkfx", true, {300, 0}, &L::_kruClkfxMin, &L::_kruClkfxMax,
                  "CLKFX", "CLKFX", "", "", "CLKFX", true},
        RangeCase{"Clkfx180", true, {300, 180}, &L::_kruClkfxMin, &L::_kruClkfxMax,
                  "CLKFX180", "CLKFX180", "", "", "CLKFX180", true},
        RangeCase{"ClkfxWithoutFeedback", false, {300, 0}, &L::_kruClkfxMin, &L::_kruClkfxMax,
                  "CLKFX", "CLKFX", "", "", "CLKFX", true},
        RangeCase{"Clkfx180WithoutFeedback", false, {300, 180}, &L::_kruClkfxMin,
                  &L::_kruClkfxMax, "", "CLKFX180", "", "", "CLKFX180", true}),
    [](const auto& parameter) { return std::string(parameter.param.name); });

// At half the input frequency the CLK0 of list T is first, else list F is.
TEST_F(PinAssignmentTest, BothTestsOfARowFailInTheOrderOfTheRow) {
  limits_._kruClk0Min = limits_._kruClk2xMin = limits_._kruClkdvMin = limits_._kruClkfxMin = 900;
  ExpectOne({100, 0}, true, "", "", Refused("CLK0", 100) + Refused("CLK2X", 100));
  ExpectOne({100, 180}, true, "", "", Refused("CLK180", 100) + Refused("CLK2X180", 100));
  ExpectOne({50, 0}, true, "", "", Refused("CLK0", 50) + Refused("CLKDV", 50), 2.0);
  ExpectOne({200, 0}, true, "", "", Refused("CLK2X", 200) + PotentiallyRefused("CLKFX", 200));
}

TEST_F(PinAssignmentTest, AnUnlistedPhaseIsNotRefused) {
  limits_._kruClk0Min = limits_._kruClk90Min = limits_._kruClk2xMin = 900;
  limits_._kruClkdvMin = limits_._kruClkfxMin = 900;
  for (const bool feedback : {false, true}) {
    for (const double frequency : {100.0, 50.0, 200.0, 300.0}) {
      ExpectOne({frequency, 45}, feedback, "", "");
    }
  }
  ExpectOne({200, 90}, true, "", "");
  ExpectOne({300, 90}, true, "", "");
  ExpectOne({100, 90}, false, "", "");
}

// --- The maxima with 2X feedback ---------------------------------------------------------------

// Output 0 takes CLK2X in list F for twice the input frequency, in list T for the input
// frequency itself; and in neither for another one.
constexpr KruOutput kNoFlag = {300};
constexpr KruOutput kFlagF = {200};
constexpr KruOutput kFlagT = {100};

struct FlagCase {
  const char* name;
  KruOutput output;  // output 1
  double KruLimits::*max;
  double KruLimits::*max2x;
  char list;         // F or T
  const char* pin;
  char flag;         // F or T
  const char* refused = "NONE";
};

std::ostream& operator<<(std::ostream& out, const FlagCase& flag) { return out << flag.name; }

class FlagTest : public PinAssignmentTest, public testing::WithParamInterface<FlagCase> {
 protected:
  // The pin of output 1 in the list of the case.
  std::string PinBehind(const KruOutput& output0) {
    Assign({output0, GetParam().output});
    const auto& list =
        GetParam().list == 'F' ? imp_.kru._kruPinsDivBy2F : imp_.kru._kruPinsDivBy2T;
    return Ip::KruPinName(list[1]).CStr();
  }
};

TEST_P(FlagTest, The1xMaximumHoldsWithoutTheFlag) {
  const FlagCase& c = GetParam();
  limits_.*c.max = c.output.frequency;
  limits_.*c.max2x = Below(c.output.frequency);
  EXPECT_EQ(PinBehind(kNoFlag), c.pin);
  EXPECT_EQ(PinBehind(kFlagF), c.flag == 'F' ? c.refused : c.pin);
  EXPECT_EQ(PinBehind(kFlagT), c.flag == 'T' ? c.refused : c.pin);
}

TEST_P(FlagTest, The2xMaximumHoldsWithTheFlag) {
  const FlagCase& c = GetParam();
  limits_.*c.max = Below(c.output.frequency);
  limits_.*c.max2x = c.output.frequency;
  EXPECT_EQ(PinBehind(kNoFlag), c.refused);
  EXPECT_EQ(PinBehind(kFlagF), c.flag == 'F' ? c.pin : c.refused);
  EXPECT_EQ(PinBehind(kFlagT), c.flag == 'T' ? c.pin : c.refused);
}

// CLK90 of the input frequency goes by the flag of list T; that is meant so.
INSTANTIATE_TEST_SUITE_P(
    Rows, FlagTest,
    testing::Values(
        FlagCase{"Clk0", {100, 0}, &L::_kruClk0Max, &L::_kruClk0Max2x, 'F', "CLK0", 'F'},
        FlagCase{"Clk90", {100, 90}, &L::_kruClk90Max, &L::_kruClk90Max2x, 'F', "CLK90", 'T'},
        FlagCase{"Clk180", {100, 180}, &L::_kruClk0Max, &L::_kruClk0Max2x, 'F', "CLK180", 'F'},
        FlagCase{"Clk270", {100, 270}, &L::_kruClk90Max, &L::_kruClk90Max2x, 'F', "CLK270",
                 'F'},
        FlagCase{"HalfClkdv", {50, 0}, &L::_kruClkdvMax, &L::_kruClkdvMax2x, 'F', "CLKDV", 'F'},
        FlagCase{"HalfClk0", {50, 0}, &L::_kruClk0Max, &L::_kruClk0Max2x, 'T', "CLK0", 'T'},
        FlagCase{"HalfClk90", {50, 90}, &L::_kruClk90Max, &L::_kruClk90Max2x, 'T', "CLK90",
                 'T'},
        FlagCase{"HalfClk180", {50, 180}, &L::_kruClk0Max, &L::_kruClk0Max2x, 'T', "CLK180",
                 'T'},
        FlagCase{"HalfClk270", {50, 270}, &L::_kruClk90Max, &L::_kruClk90Max2x, 'T', "CLK270",
                 'T'},
        FlagCase{"OtherClkdvOfListF", {40, 0}, &L::_kruClkdvMax, &L::_kruClkdvMax2x, 'F',
                 "CLKDV", 'F', "CLKFX"},
        FlagCase{"OtherClkdvOfListT", {20, 0}, &L::_kruClkdvMax, &L::_kruClkdvMax2x, 'T',
                 "CLKDV", 'T', "CLKFX"}),
    [](const auto& parameter) { return std::string(parameter.param.name); });

class FeedbackFlagTest : public PinAssignmentTest {
 protected:
  // Whether the 2X maximum governs CLK0 (list F) and CLK90 (by the flag of list T) of the last
  // two of the outputs.
  std::string FlagsBehind(std::vector<KruOutput> outputs, bool feedbackUsed = true) {
    limits_._kruClk0Max2x = 99;
    limits_._kruClk90Max2x = 99;
    outputs.push_back({100, 0});
    outputs.push_back({100, 90});
    Assign(outputs, feedbackUsed);
    const auto& list = imp_.kru._kruPinsDivBy2F;
    return std::string(list[outputs.size() - 2] == KruPin::NONE ? "F" : "") +
           (list[outputs.size() - 1] == KruPin::NONE ? "T" : "");
  }
};

TEST_F(FeedbackFlagTest, AreSetByClk2xOnOutput0) {
  EXPECT_EQ(FlagsBehind({{300}}), "");
  EXPECT_EQ(FlagsBehind({{200}}), "F");
  EXPECT_EQ(FlagsBehind({{100}}), "T");
}

TEST_F(FeedbackFlagTest, AreNotSetByAnotherOutput) {
  EXPECT_EQ(FlagsBehind({{300}, {200}, {100}}), "");
  EXPECT_EQ(FlagsBehind({{200}, {100}}), "F");
  EXPECT_EQ(FlagsBehind({{100}, {200}}), "T");
}

TEST_F(FeedbackFlagTest, AreNotSetByClk2x180) {
  EXPECT_EQ(FlagsBehind({{200, 180}}), "");
  EXPECT_EQ(FlagsBehind({{100, 180}}), "");
}

TEST_F(FeedbackFlagTest, AreNotSetWhenClk2xIsOutOfRange) {
  limits_._kruClk2xMin = Above(200);
  EXPECT_EQ(FlagsBehind({{200}}), "");
  EXPECT_EQ(FlagsBehind({{100}}), "");
}

TEST_F(FeedbackFlagTest, AreSetWhateverTheOtherListGets) {
  limits_._kruClkfxMax = 50;  // list T refuses output 0
  EXPECT_EQ(FlagsBehind({{200}}), "F");
  limits_._kruClk0Max = 50;   // list F refuses every CLK0
  EXPECT_EQ(FlagsBehind({{100}}), "FT");
}

TEST_F(FeedbackFlagTest, AreClearAtTheStartOfEveryRun) {
  EXPECT_EQ(FlagsBehind({{200}}), "F");
  EXPECT_EQ(FlagsBehind({{300}}), "");
  EXPECT_EQ(FlagsBehind({{100}}), "T");
  EXPECT_EQ(FlagsBehind({{300}}), "");
}

TEST_F(FeedbackFlagTest, Clk2xAndClkfxHaveOneMaximum) {
  limits_._kruClk0Max2x = limits_._kruClk90Max2x = limits_._kruClkdvMax2x = 1;
  Assign({{200}, {200}, {200, 180}});
  EXPECT_EQ(F(), "CLK2X CLK2X CLK2X180");
  Assign({{100}, {200}, {300}, {100, 180}});
  EXPECT_EQ(T(), "CLK2X CLKFX CLKFX CLK2X180");
}

// --- Which frequency counts as which -----------------------------------------------------------

TEST_F(PinAssignmentTest, AFrequencyMatchesWithinAThousandth) {
  for (const double phase : {90.0, 270.0}) {
    // Only the table of the input frequency gives list F a pin for these phases, and only that
    // of its half list T.
    const std::string pin = phase == 90 ? "CLK90" : "CLK270";
    ExpectOne({100 + 0.001, phase}, true, pin, "");
    ExpectOne({100 - 0.001, phase}, true, pin, "");
    ExpectOne({Above(100 + 0.001), phase}, true, "", "");
    ExpectOne({Below(100 - 0.001), phase}, true, "", "");
    ExpectOne({50 + 0.001, phase}, true, "", pin);
    ExpectOne({50 - 0.001, phase}, true, "", pin);
    ExpectOne({Above(50 + 0.001), phase}, true, "", "");
    ExpectOne({Below(50 - 0.001), phase}, true, "", "");
  }
  ExpectOne({200 + 0.001, 180}, true, "CLK2X180", "");
  ExpectOne({200 - 0.001, 180}, true, "CLK2X180", "");
  ExpectOne({Above(200 + 0.001), 180}, true, "CLKFX180", "CLKFX180");
  ExpectOne({Below(200 - 0.001), 180}, true, "CLKFX180", "CLKFX180");
}

// The tables and then CLKDV, in this order: at a few kHz one frequency matches all of them.
TEST_F(PinAssignmentTest, TheFirstTableThatMatchesIsTaken) {
  Assign({{0.001}}, true, 0.001);
  EXPECT_EQ(F(), "CLK0");
  EXPECT_EQ(T(), "CLK2X");
  // 0.003 is neither the input nor its double, but half of it and divided by 2.5 or 3.
  Assign({{0.003}}, true, 0.006);
  EXPECT_EQ(F(), "CLKDV");
  EXPECT_EQ(T(), "CLK0");
  EXPECT_THAT(clkdv_.f, ElementsAre(2.0, 0, 0, 0, 0, 0));
  EXPECT_THAT(clkdv_.t, Each(0.0));
}

TEST_F(PinAssignmentTest, ADividedFrequencyMatchesWithinAThousandth) {
  for (const double f : {40 - 0.001, 40 + 0.001}) {
    Assign({{f}});
    EXPECT_EQ(F(), "CLKDV") << f;
    EXPECT_EQ(T(), "CLKFX") << f;
  }
  for (const double f : {Below(40 - 0.001), Above(40 + 0.001)}) {
    Assign({{f}});
    EXPECT_EQ(F(), "CLKFX") << f;
    EXPECT_EQ(T(), "CLKFX") << f;
  }
  for (const double f : {20 - 0.001, 20 + 0.001}) {
    Assign({{f}});
    EXPECT_EQ(F(), "CLKDV") << f;
    EXPECT_EQ(T(), "CLKDV") << f;
  }
  for (const double f : {Below(20 - 0.001), Above(20 + 0.001)}) {
    Assign({{f}});
    EXPECT_EQ(F(), "CLKFX") << f;
    EXPECT_EQ(T(), "CLKFX") << f;
  }
}

// --- CLKDV -------------------------------------------------------------------------------------

struct DividedCase {
  const char* name;
  double divide;  // of an input of 1200 MHz
  double clkdvF;  // 0: CLKFX
  double clkdvT;
};

std::ostream& operator<<(std::ostream& out, const DividedCase& divided) {
  return out << divided.name;
}

class DividedTest : public PinAssignmentTest, public testing::WithParamInterface<DividedCase> {};

TEST_P(DividedTest, HasItsPins) {
  const DividedCase& c = GetParam();
  Assign({{1200 / c.divide}}, true, 1200);
  EXPECT_EQ(F(), c.clkdvF != 0 ? "CLKDV" : "CLKFX");
  EXPECT_EQ(T(), c.clkdvT != 0 ? "CLKDV" : "CLKFX");
  EXPECT_THAT(clkdv_.f, ElementsAre(c.clkdvF, 0, 0, 0, 0, 0));
  EXPECT_THAT(clkdv_.t, ElementsAre(c.clkdvT, 0, 0, 0, 0, 0));
  EXPECT_EQ(CountOf("Can't", trace_), 0);
}

TEST_P(DividedTest, WithoutFeedbackThereIsNoClkdv) {
  const DividedCase& c = GetParam();
  Assign({{1200 / c.divide}}, false, 1200);
  EXPECT_EQ(F(), "CLKFX");
  EXPECT_EQ(T(), "CLKFX");
  EXPECT_THAT(clkdv_.f, Each(0.0));
  EXPECT_THAT(clkdv_.t, Each(0.0));
}

// List T divides half the input, so it needs half the value: 1.25, 1.75, 2.25 and 8.5 are none.
INSTANTIATE_TEST_SUITE_P(
    Values, DividedTest,
    testing::Values(
        DividedCase{"By2p5", 2.5, 2.5, 0}, DividedCase{"By3", 3, 3, 0},
        DividedCase{"By3p5", 3.5, 3.5, 0}, DividedCase{"By4", 4, 4, 2},
        DividedCase{"By4p5", 4.5, 4.5, 0}, DividedCase{"By5", 5, 5, 2.5},
        DividedCase{"By5p5", 5.5, 5.5, 0}, DividedCase{"By6", 6, 6, 3},
        DividedCase{"By6p5", 6.5, 6.5, 0}, DividedCase{"By7", 7, 7, 3.5},
        DividedCase{"By7p5", 7.5, 7.5, 0}, DividedCase{"By8", 8, 8, 4},
        DividedCase{"By9", 9, 9, 4.5}, DividedCase{"By10", 10, 10, 5},
        DividedCase{"By11", 11, 11, 5.5}, DividedCase{"By12", 12, 12, 6},
        DividedCase{"By13", 13, 13, 6.5}, DividedCase{"By14", 14, 14, 7},
        DividedCase{"By15", 15, 15, 7.5}, DividedCase{"By16", 16, 16, 8},
        DividedCase{"By17", 17, 17, 0}, DividedCase{"By18", 18, 0, 9},
        DividedCase{"By20", 20, 0, 10}, DividedCase{"By22", 22, 0, 11},
        DividedCase{"By24", 24, 0, 12}, DividedCase{"By26", 26, 0, 13},
        DividedCase{"By28", 28, 0, 14}, DividedCase{"By30", 30, 0, 15},
        DividedCase{"By32", 32, 0, 16}, DividedCase{"By34", 34, 0, 17}),
    [](const auto& parameter) { return std::string(parameter.param.name); });

// 1.5 is missing on purpose; 17 is the last value.
INSTANTIATE_TEST_SUITE_P(
    NoValues, DividedTest,
    testing::Values(
        DividedCase{"By1p25", 1.25, 0, 0}, DividedCase{"By1p5", 1.5, 0, 0},
        DividedCase{"By2p25", 2.25, 0, 0}, DividedCase{"By8p5", 8.5, 0, 0},
        DividedCase{"By9p5", 9.5, 0, 0}, DividedCase{"By16p5", 16.5, 0, 0},
        DividedCase{"By17p5", 17.5, 0, 0}, DividedCase{"By19", 19, 0, 0},
        DividedCase{"By33", 33, 0, 0}, DividedCase{"By36", 36, 0, 0}),
    [](const auto& parameter) { return std::string(parameter.param.name); });

// 2 in list F is never met there: half the input frequency has a table of its own.
TEST_F(PinAssignmentTest, AQuarterIsDividedBy4AndBy2) {
  Assign({{25}});
  EXPECT_EQ(trace_, TraceOfOne({25}, "", "CLKDV", "CLKDV"));
  EXPECT_THAT(clkdv_.f, ElementsAre(4.0, 0, 0, 0, 0, 0));
  EXPECT_THAT(clkdv_.t, ElementsAre(2.0, 0, 0, 0, 0, 0));
}

TEST_F(PinAssignmentTest, ClkdvOfListFWithClkfxOfListT) {
  Assign({{40}});
  EXPECT_EQ(trace_, TraceOfOne({40}, "", "CLKDV", "CLKFX"));
  EXPECT_THAT(clkdv_.f, ElementsAre(2.5, 0, 0, 0, 0, 0));
  EXPECT_THAT(clkdv_.t, Each(0.0));
}

// At 50 kHz, 3 kHz lies within 1 kHz of 50 / 13 to 50 / 17 and of 25 / 6.5 to 25 / 12.
TEST_F(PinAssignmentTest, TheSmallestValueThatFitsIsTaken) {
  Assign({{0.003}}, true, 0.05);
  EXPECT_EQ(F(), "CLKDV");
  EXPECT_EQ(T(), "CLKDV");
  EXPECT_THAT(clkdv_.f, ElementsAre(13.0, 0, 0, 0, 0, 0));
  EXPECT_THAT(clkdv_.t, ElementsAre(6.5, 0, 0, 0, 0, 0));
}

// At 20 kHz, 2 kHz lies within 1 kHz of 10 / 3.5 to 10 / 10 and of 20 / 7 to 20 / 17.
TEST_F(PinAssignmentTest, AValueThatFitsListFIsNotTriedForListT) {
  // Every value from 3.5 to 6.5 is refused for list T; 7 to 10 fit both lists.
  Assign({{0.002, 90}}, true, 0.02);
  EXPECT_EQ(F(), "");
  EXPECT_EQ(T(), "");
  EXPECT_EQ(CountOf(Refused("CLKDV", 0.002), trace_), 7);
  EXPECT_EQ(CountOf("Can't", trace_), 7);
}

TEST_F(PinAssignmentTest, ListFIsRefusedOnceForEachValueThatFits) {
  limits_._kruClkdvMin = 0.0021;
  limits_._kruClkfxMin = 1;
  // 7, 7.5, 8 and 9 to 17 for list F; list T is refused in silence.
  Assign({{0.002}}, true, 0.02);
  EXPECT_EQ(F(), "");
  EXPECT_EQ(T(), "");
  EXPECT_EQ(trace_, "DLL ---- Checking if KRU will work\n"
                    "DLL ------ Clk_Out0 ofreq = 0.002; phase = 0.000\n" +
                        engine_test::Repeat(Refused("CLKDV", 0.002), 12) +
                        PotentiallyRefused("CLKFX", 0.002) +
                        "DLL --------- _kruPinsDivBy2False[0] = NONE\n"
                        "DLL --------- _kruPinsDivBy2True[0] = NONE\n");
}

TEST_F(PinAssignmentTest, ARefusedClkdvGoesToClkfx) {
  for (double KruLimits::*limit : {&KruLimits::_kruClkdvMin, &KruLimits::_kruClkdvMax}) {
    limits_ = Wide();
    const bool isMin = limit == &KruLimits::_kruClkdvMin;
    limits_.*limit = 40;
    ExpectOne({40}, true, "CLKDV", "CLKFX", "", 2.5);
    limits_.*limit = isMin ? Above(40) : Below(40);
    ExpectOne({40}, true, "CLKFX", "CLKFX", Refused("CLKDV", 40));
    // List F is refused at 5, list T in silence at 2.5.
    limits_.*limit = isMin ? Above(20) : Below(20);
    ExpectOne({20}, true, "CLKFX", "CLKFX", Refused("CLKDV", 20));
    limits_.*limit = 20;
    Assign({{20}});
    EXPECT_EQ(trace_, TraceOfOne({20}, "", "CLKDV", "CLKDV"));
    EXPECT_THAT(clkdv_.f, ElementsAre(5.0, 0, 0, 0, 0, 0));
    EXPECT_THAT(clkdv_.t, ElementsAre(2.5, 0, 0, 0, 0, 0));
  }
}

TEST_F(PinAssignmentTest, OneListOnClkdvAndClkfxOutOfRange) {
  limits_._kruClkfxMin = 100;
  Assign({{40}});
  EXPECT_EQ(trace_, TraceOfOne({40}, PotentiallyRefused("CLKFX", 40), "CLKDV", ""));
  // 1200 / 18 in list T only.
  Assign({{1200.0 / 18}}, true, 1200);
  EXPECT_EQ(F(), "");
  EXPECT_EQ(T(), "CLKDV");
  EXPECT_EQ(CountOf(PotentiallyRefused("CLKFX", 1200.0 / 18), trace_), 1);
}

TEST_F(PinAssignmentTest, BothListsOnClkdvDoNotAskForClkfx) {
  limits_._kruClkfxMin = 100;
  Assign({{20}});
  EXPECT_EQ(trace_, TraceOfOne({20}, "", "CLKDV", "CLKDV"));
}

// A phase that CLKDV does not have is told in words of the frequency, and for list T only.
TEST_F(PinAssignmentTest, ClkdvHasNoPhase) {
  for (const double phase : {90.0, 270.0, 45.0, 360.0}) {
    ExpectOne({20, phase}, true, "", "", Refused("CLKDV", 20));
    ExpectOne({40, phase}, true, "", "");
  }
  ExpectOne({20, 180}, true, "CLKFX180", "CLKFX180", Refused("CLKDV", 20));
  ExpectOne({40, 180}, true, "CLKFX180", "CLKFX180");
  limits_._kruClkfxMin = 100;
  ExpectOne({20, 180}, true, "", "",
            Refused("CLKDV", 20) + PotentiallyRefused("CLKFX180", 20));
  ExpectOne({20, 90}, true, "", "", Refused("CLKDV", 20));
  ExpectOne({20, 90}, false, "", "");
}

TEST_F(PinAssignmentTest, TheOffsetIsThePhaseOfClkdv) {
  imp_.kru._kruPhaseOffset = 30;
  ExpectOne({20, 0}, true, "", "", Refused("CLKDV", 20));
  Assign({{20, 30}});
  EXPECT_EQ(F(), "CLKDV");
  EXPECT_EQ(T(), "CLKDV");
}

// Three times the input goes through the values without a match.
TEST_F(PinAssignmentTest, AMultipleWithoutAPinOfItsOwn) {
  ExpectOne({300}, true, "CLKFX", "CLKFX");
}

// --- Whole runs --------------------------------------------------------------------------------

TEST_F(PinAssignmentTest, SixOutputs) {
  Assign({{100, 0}, {100, 90}, {50, 0}, {25, 0}, {150, 180}, {200, 90}});
  EXPECT_EQ(trace_,
            "DLL ---- Checking if KRU will work\n"
            "DLL ------ Clk_Out0 ofreq = 100.000; phase = 0.000\n"
            "DLL ------ Clk_Out1 ofreq = 100.000; phase = 90.000\n"
            "DLL ------ Clk_Out2 ofreq = 50.000; phase = 0.000\n"
            "DLL ------ Clk_Out3 ofreq = 25.000; phase = 0.000\n"
            "DLL ------ Clk_Out4 ofreq = 150.000; phase = 180.000\n"
            "DLL ------ Clk_Out5 ofreq = 200.000; phase = 90.000\n"
            "DLL --------- _kruPinsDivBy2False[0] = CLK0\n"
            "DLL --------- _kruPinsDivBy2False[1] = CLK90\n"
            "DLL --------- _kruPinsDivBy2False[2] = CLKDV\n"
            "DLL --------- _kruPinsDivBy2False[3] = CLKDV\n"
            "DLL --------- _kruPinsDivBy2False[4] = CLKFX180\n"
            "DLL --------- _kruPinsDivBy2False[5] = NONE\n"
            "DLL --------- _kruPinsDivBy2True[0] = CLK2X\n"
            "DLL --------- _kruPinsDivBy2True[1] = NONE\n"
            "DLL --------- _kruPinsDivBy2True[2] = CLK0\n"
            "DLL --------- _kruPinsDivBy2True[3] = CLKDV\n"
            "DLL --------- _kruPinsDivBy2True[4] = CLKFX180\n"
            "DLL --------- _kruPinsDivBy2True[5] = NONE\n");
  EXPECT_THAT(clkdv_.f, ElementsAre(0, 0, 2, 4, 0, 0));
  EXPECT_THAT(clkdv_.t, ElementsAre(0, 0, 0, 2, 0, 0));
}

TEST_F(PinAssignmentTest, ClearsWhatAnEarlierRunLeft) {
  Ip::KruState& kru = imp_.kru;
  kru._kruPinsDivBy2F.fill(KruPin::CLK0);
  kru._kruPinsDivBy2T.fill(KruPin::CLK0);
  kru._kruChosenPin.fill(KruPin::CLK0);
  kru._kruChosenM = 3;
  kru._kruChosenD = 2;
  Assign({{100, 45}});
  EXPECT_EQ(F(), "");
  EXPECT_EQ(T(), "");
  EXPECT_EQ(Names(kru._kruChosenPin), "");
  EXPECT_EQ(kru._kruChosenM, 0);
  EXPECT_EQ(kru._kruChosenD, 0);
}

TEST_F(PinAssignmentTest, LeavesTheOtherChosenValues) {
  Ip::KruState& kru = imp_.kru;
  kru._kruChosenDivBy2 = true;
  kru._kruChosenClkdv = 4;
  kru._kruPhaseOffset = 45;
  Assign({{100, 45}});
  EXPECT_TRUE(kru._kruChosenDivBy2);
  EXPECT_EQ(kru._kruChosenClkdv, 4.0);
  EXPECT_EQ(kru._kruPhaseOffset, 45.0);
}

TEST_F(PinAssignmentTest, OutputsBeyondTheCountGetNoPin) {
  imp_.requests.reqOutFreq.fill(100);
  imp_.requests.reqPhase.fill(0);
  Assign({{100}, {100}});
  EXPECT_EQ(F(), "CLK0 CLK0");
  EXPECT_EQ(T(), "CLK2X CLK2X");
}

TEST_F(PinAssignmentTest, IsSilentWithTheTraceOff) {
  limits_ = KruLimits{};
  Request(imp_, {{1000, 0}, {20, 90}, {100, 0}, {2000, 0}, {500, 180}, {0.1, 0}});
  EXPECT_EQ(engine_test::TraceOf(
                [&](const Trace& trace) {
                  Ip::Kru::AssignPins(imp_, {100, 6, true, trace});
                  Ip::Kru::AssignPins(imp_, {1000, 6, true, trace});
                  Ip::Kru::AssignPins(imp_, {1000, 6, false, trace});
                },
                false),
            "");
}

// --- Bad numbers -------------------------------------------------------------------------------

TEST_F(PinAssignmentTest, FrequenciesThatAreNoNumbers) {
  for (const bool feedback : {false, true}) {
    ExpectOne({kNan}, feedback, "", "", PotentiallyRefused("CLKFX", kNan));
    ExpectOne({kInfinity}, feedback, "", "", PotentiallyRefused("CLKFX", kInfinity));
    ExpectOne({-kInfinity}, feedback, "", "", PotentiallyRefused("CLKFX", -kInfinity));
    ExpectOne({100, kNan}, feedback, "", "");
    ExpectOne({300, kNan}, feedback, "", "");
  }
}

TEST_F(PinAssignmentTest, FrequenciesOf0AndBelow) {
  limits_ = KruLimits{};
  for (const bool feedback : {false, true}) {
    ExpectOne({0}, feedback, "", "", PotentiallyRefused("CLKFX", 0));
    ExpectOne({-100}, feedback, "", "", PotentiallyRefused("CLKFX", -100));
  }
}

TEST_F(PinAssignmentTest, ANegativeInputFrequencyIsTakenAsItStands) {
  limits_ = KruLimits{};
  Assign({{-100}}, true, -100);
  EXPECT_EQ(trace_, TraceOfOne({-100}, Refused("CLK0", -100) + Refused("CLK2X", -100), "", ""));
  Assign({{100}}, true, -100);
  EXPECT_EQ(trace_, TraceOfOne({100}, "", "CLKFX", "CLKFX"));
}

TEST_F(PinAssignmentTest, InputFrequenciesThatAreNoNumbers) {
  limits_ = KruLimits{};
  for (const double inFreq : {kNan, kInfinity, -kInfinity}) {
    Assign({{100}}, true, inFreq);
    EXPECT_EQ(trace_, TraceOfOne({100}, "", "CLKFX", "CLKFX")) << inFreq;
  }
  Assign({{kInfinity}}, true, kInfinity);
  EXPECT_EQ(trace_, TraceOfOne({kInfinity}, Refused("CLK0", kInfinity) +
                                                Refused("CLK2X", kInfinity),
                               "", ""));
}

// Doubling overflows; the halves still match.
TEST_F(PinAssignmentTest, TheLargestInputFrequency) {
  const double largest = std::numeric_limits<double>::max();
  Assign({{kInfinity, 180}}, true, largest);
  EXPECT_EQ(trace_, TraceOfOne({kInfinity, 180}, Refused("CLK2X180", kInfinity), "", ""));
  Assign({{largest / 2, 270}}, true, largest);
  EXPECT_EQ(CountOf("Can't use CLK270", trace_), 1);
}

TEST_F(PinAssignmentTest, LimitsThatAreNoNumbersHoldNothing) {
  limits_._kruClk0Min = kNan;
  limits_._kruClk2xMax = kNan;
  ExpectOne({100}, true, "", "", Refused("CLK0", 100) + Refused("CLK2X", 100));
}

}  // namespace
