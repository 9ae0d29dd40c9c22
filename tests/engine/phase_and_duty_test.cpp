// Tests of the phases and duty cycles of candidates.

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <climits>
#include <cmath>
#include <string>

#include "engine/pll/Stages.h"
#include "tests/engine/EngineTest.h"

namespace {

using engine_test::Above;
using engine_test::Below;
using engine_test::kInfinity;
using engine_test::kNan;
using Ip::Trace;
using Ip::VorkelImp;
using Ip::Pll::VcoCandidate;
using Ip::Pll::VcoCandidateTable;
using testing::Each;

constexpr int kTsyn = 0;
constexpr int kPll = 1;

class PhaseAndDutyTest : public testing::Test {
 protected:
  // A candidate in `slot` with whole M, and these dividers of outputs 0 and 1.
  VcoCandidate& Put(int slot, double div0, std::uint32_t div1 = 1) {
    engine_test::PutBare(table_, slot, 800, div0);
    table_[slot].m = 8;
    table_[slot].d = 1;
    table_[slot].divN[1] = div1;
    return table_[slot];
  }

  void Get(int count = 1, int prim = kPll) {
    trace_ = engine_test::TraceOf([&](const Trace& trace) {
      Ip::Pll::GetPhasesAndDutyCycles(imp_, {100, count, prim, trace});
    });
  }

  // Phase and difference of output 0 for one divider and request.
  double Phase(double divider, double request) {
    Put(0, divider);
    imp_.requests.reqPhase[0] = request;
    Get();
    return table_[0].phase[0];
  }
  double PhaseDiff() const { return imp_.pll._vcoCandidates[0].phaseDiff[0]; }

  double DutyCycle(double divider, double request) {
    Put(0, divider);
    imp_.requests.reqDutyCycle[0] = request;
    Get();
    return table_[0].dutyCycle[0];
  }
  double DutyDiff() const { return imp_.pll._vcoCandidates[0].dutyDiff[0]; }

  VorkelImp& imp_ = engine_test::NewImp();
  VcoCandidateTable& table_ = imp_.pll._vcoCandidates;
  std::string trace_;
};

TEST_F(PhaseAndDutyTest, PrintsOneLine) {
  Put(0, 4);
  Put(5, 6);
  Get(2);
  EXPECT_EQ(trace_, "DLL ------ getting phases and duty cycles\n");
  table_.EmptyAll();
  Get(1);
  EXPECT_EQ(trace_, "DLL ------ getting phases and duty cycles\n");
  const std::string silent = engine_test::TraceOf(
      [&](const Trace& trace) { Ip::Pll::GetPhasesAndDutyCycles(imp_, {100, 1, kPll, trace}); },
      false);
  EXPECT_EQ(silent, "");
}

TEST_F(PhaseAndDutyTest, PhaseNearestToTheRequest) {
  EXPECT_EQ(Phase(4, 100), 101.25);
  EXPECT_EQ(PhaseDiff(), 1.25);
  EXPECT_EQ(Phase(1, 22.5), 45.0);
  EXPECT_EQ(PhaseDiff(), 22.5);
  EXPECT_EQ(Phase(4, 90), 90.0);
  EXPECT_EQ(PhaseDiff(), 0.0);
  EXPECT_EQ(Phase(4, 400), 360.0);
  EXPECT_EQ(PhaseDiff(), 40.0);
}

// Downward the walk goes on from -101.25 to -90; output_steps_test.cpp has it step by step.
TEST_F(PhaseAndDutyTest, NegativePhases) {
  EXPECT_EQ(Phase(4, -100), -90.0);
  EXPECT_EQ(PhaseDiff(), 10.0);
  EXPECT_EQ(Phase(4, -90), -90.0);
  EXPECT_EQ(PhaseDiff(), 0.0);
  EXPECT_EQ(Phase(1, -400), -360.0);
  EXPECT_EQ(PhaseDiff(), 40.0);
}

TEST_F(PhaseAndDutyTest, NoRequestedPhaseIsPhase0) {
  EXPECT_EQ(Phase(4, 0), 0.0);
  EXPECT_EQ(PhaseDiff(), 0.0);
  EXPECT_EQ(Phase(4, -0.0), 0.0);
}

TEST_F(PhaseAndDutyTest, PhasesThatAreNoNumbers) {
  EXPECT_EQ(Phase(4, kNan), 0.0);
  EXPECT_TRUE(std::isnan(PhaseDiff()));
  EXPECT_EQ(Phase(4, kInfinity), 360.0);
  EXPECT_EQ(PhaseDiff(), kInfinity);
  EXPECT_EQ(Phase(4, -kInfinity), -360.0);
  EXPECT_EQ(PhaseDiff(), kInfinity);
}

// 388 degrees are 28 from the nearest step, and 2900 % are 28 times the period from 100 %, of which
// a divider of 128 comes to 127.5 / 128.
TEST_F(PhaseAndDutyTest, OfSeveralOnlyThoseInReachOnOutput0HaveTheOtherOutputs) {
  struct {
    double phase;
    double dutyCycle;
    bool isInReach;
  } const requests[] = {{388, 50, true},         {Above(388), 50, false},   {-388, 50, true},
                        {Below(-388), 50, false}, {0, 2899, true},          {0, 2900, false},
                        {0, -2799, true},         {0, -2801, false},         {kNan, 50, true}};
  imp_.pllLimits.maxHighLowCount = 128;
  for (const auto& request : requests) {
    SCOPED_TRACE(testing::Message() << request.phase << ", " << request.dutyCycle);
    imp_.requests.reqPhase[0] = request.phase;
    imp_.requests.reqDutyCycle[0] = request.dutyCycle;
    imp_.requests.reqPhase[1] = 90;
    for (const bool isAlone : {false, true}) {
      table_.EmptyAll();
      Put(0, 128, 4);
      if (!isAlone) Put(5, 128, 4);
      Get(2);
      EXPECT_EQ(table_[0].phase[1], isAlone || request.isInReach ? 90.0 : 0.0);
    }
  }
}

TEST_F(PhaseAndDutyTest, DutyCycleNearestToTheRequest) {
  EXPECT_EQ(DutyCycle(3, 50), 0.5);
  EXPECT_EQ(DutyDiff(), 0.0);
  EXPECT_EQ(DutyCycle(1, 30), 0.5);
  EXPECT_EQ(DutyDiff(), std::fabs(0.3 - 0.5));
  EXPECT_EQ(DutyCycle(4, 45), 0.5);
  EXPECT_EQ(DutyDiff(), std::fabs(0.45 - 0.5));
}

TEST_F(PhaseAndDutyTest, NoRequestedDutyCycleIs0) {
  EXPECT_EQ(DutyCycle(4, 0), 0.0);
  EXPECT_EQ(DutyDiff(), 0.0);
  EXPECT_EQ(DutyCycle(1, 0), 0.0);
  EXPECT_EQ(DutyDiff(), 0.0);
}

TEST_F(PhaseAndDutyTest, DutyCyclesThatAreNoNumbers) {
  EXPECT_EQ(DutyCycle(4, kNan), 0.25);
  EXPECT_TRUE(std::isnan(DutyDiff()));
  EXPECT_EQ(DutyCycle(4, kInfinity), 0.875);
  EXPECT_EQ(DutyDiff(), kInfinity);
  EXPECT_EQ(DutyCycle(4, -25), 0.25);
  EXPECT_EQ(DutyDiff(), 0.5);
}

TEST_F(PhaseAndDutyTest, TheCountersOfTheDeviceLimitTheDutyCycle) {
  imp_.pllLimits.maxHighLowCount = 5;
  EXPECT_EQ(DutyCycle(8, 1), 0.375);
  imp_.pllLimits.maxHighLowCount = 8;
  EXPECT_EQ(DutyCycle(8, 1), 0.125);
}

// --- Differences that count as none ----------------------------------------------------------

TEST_F(PhaseAndDutyTest, APhaseDifferenceUpToItsBoundIsNone) {
  // The nearest phase is 0.
  EXPECT_EQ(Phase(4, 0.0001), 0.0);
  EXPECT_EQ(PhaseDiff(), 0.0);
  EXPECT_EQ(Phase(4, Above(0.0001)), 0.0);
  EXPECT_EQ(PhaseDiff(), Above(0.0001));
}

TEST_F(PhaseAndDutyTest, ADutyDifferenceUpToItsBoundIsNone) {
  // Divider 128 and counts of 63 leave only 0, so the difference is the request.
  imp_.pllLimits.maxHighLowCount = 63;
  ASSERT_EQ(0.01 / 100.0, 0.0001);
  EXPECT_EQ(DutyCycle(128, 0.01), 0.0);
  EXPECT_EQ(DutyDiff(), 0.0);
  double percent = 0.01;
  while (percent / 100.0 == 0.0001) percent = Above(percent);
  EXPECT_EQ(DutyCycle(128, percent), 0.0);
  EXPECT_EQ(DutyDiff(), percent / 100.0);
}

// --- Outputs and candidates ------------------------------------------------------------------

TEST_F(PhaseAndDutyTest, EveryOutputHasItsOwnDividerAndRequest) {
  VcoCandidate& candidate = Put(3, 2, 4);
  candidate.divN[6] = 8;
  imp_.requests.reqPhase = {45, 100, 0, 0, 0, 0, -45};
  imp_.requests.reqDutyCycle = {75, 40, 0, 0, 0, 0, 12.5};
  Get(7);
  EXPECT_EQ(candidate.phase[0], 45.0);
  EXPECT_EQ(candidate.phase[1], 101.25);
  EXPECT_EQ(candidate.phase[6], -45.0);
  EXPECT_EQ(candidate.phaseDiff[1], 1.25);
  EXPECT_EQ(candidate.dutyCycle[0], 0.75);
  EXPECT_EQ(candidate.dutyCycle[1], 0.375);
  EXPECT_EQ(candidate.dutyDiff[1], std::fabs(0.4 - 0.375));
  EXPECT_EQ(candidate.dutyCycle[6], 0.125);
}

TEST_F(PhaseAndDutyTest, AllCandidatesOfTheTable) {
  imp_.requests.reqPhase[0] = 45;
  for (const int slot : {0, 64, 1009}) Put(slot, 1);
  table_.Put(70, 800, 1);
  table_[70].phase[0] = -1;
  table_.Empty(70);
  Get();
  for (const int slot : {0, 64, 1009}) EXPECT_EQ(table_[slot].phase[0], 45.0) << slot;
  EXPECT_EQ(table_[70].phase[0], -1.0) << "an empty slot is skipped";
}

TEST_F(PhaseAndDutyTest, OutputsBeyondTheCountStay) {
  VcoCandidate& candidate = Put(0, 4, 4);
  candidate.phase.fill(-1);
  candidate.phaseDiff.fill(-1);
  candidate.dutyCycle.fill(-1);
  candidate.dutyDiff.fill(-1);
  for (const int count : {0, -1, INT_MIN}) {
    Get(count);
    EXPECT_THAT(candidate.phase, Each(-1.0)) << count;
    EXPECT_THAT(candidate.dutyDiff, Each(-1.0)) << count;
  }
  Get(1);
  EXPECT_EQ(candidate.phase[0], 0.0);
  EXPECT_EQ(candidate.phase[1], -1.0);
  EXPECT_EQ(candidate.phaseDiff[1], -1.0);
  EXPECT_EQ(candidate.dutyCycle[1], -1.0);
  EXPECT_EQ(candidate.dutyDiff[1], -1.0);
}

TEST_F(PhaseAndDutyTest, ADividerOf0KeepsPhaseAndDutyCycleAt0) {
  VcoCandidate& candidate = Put(0, 4, 0);
  imp_.requests.reqPhase[1] = -30;
  imp_.requests.reqDutyCycle[1] = 25;
  Get(2);
  EXPECT_EQ(candidate.phase[1], 0.0);
  EXPECT_EQ(candidate.phaseDiff[1], 30.0);
  EXPECT_EQ(candidate.dutyCycle[1], 0.0);
  EXPECT_EQ(candidate.dutyDiff[1], 0.25);
}

TEST_F(PhaseAndDutyTest, OverwritesWhatAnEarlierRunFound) {
  VcoCandidate& candidate = Put(0, 4);
  candidate.phase[0] = 99;
  candidate.phaseDiff[0] = 99;
  candidate.dutyCycle[0] = 99;
  candidate.dutyDiff[0] = 99;
  Get();
  EXPECT_EQ(candidate.phase[0], 0.0);
  EXPECT_EQ(candidate.phaseDiff[0], 0.0);
  EXPECT_EQ(candidate.dutyCycle[0], 0.0);
  EXPECT_EQ(candidate.dutyDiff[0], 0.0);
}

// --- Fractions of a TSYN ---------------------------------------------------------------------

class FractionalTsynTest : public PhaseAndDutyTest {
 protected:
  FractionalTsynTest() {
    imp_.requests.reqPhase.fill(90);
    imp_.requests.reqDutyCycle.fill(25);
  }

  // Whether the fraction fixes phases and duty cycles of a candidate; both outputs agree.
  bool Fixed(double div0, double m, int prim = kTsyn) {
    VcoCandidate& candidate = Put(0, div0, 4);
    candidate.m = m;
    candidate.phaseDiff.fill(-1);
    candidate.dutyDiff.fill(-1);
    Get(2, prim);
    const bool fixed = candidate.dutyCycle[1] == 0.5;
    EXPECT_EQ(candidate.phase[1], fixed ? 0.0 : 90.0);
    EXPECT_EQ(candidate.phaseDiff[1], 0.0);
    EXPECT_EQ(candidate.dutyCycle[1], fixed ? 0.5 : 0.25);
    EXPECT_EQ(candidate.dutyDiff[1], 0.0);
    if (fixed) {
      EXPECT_EQ(candidate.phase[0], 0.0);
      EXPECT_EQ(candidate.phaseDiff[0], 0.0);
      EXPECT_EQ(candidate.dutyCycle[0], 0.5);
      EXPECT_EQ(candidate.dutyDiff[0], 0.0);
    }
    return fixed;
  }
};

TEST_F(FractionalTsynTest, AFractionalDiv0OrMFixesEveryOutput) {
  EXPECT_TRUE(Fixed(2.125, 8));
  EXPECT_TRUE(Fixed(2.875, 8));
  EXPECT_TRUE(Fixed(2, 8.125));
  EXPECT_TRUE(Fixed(2.125, 8.5));
  EXPECT_FALSE(Fixed(2, 8));
  EXPECT_FALSE(Fixed(128, 64));
}

TEST_F(FractionalTsynTest, HalvesAreFractions) { EXPECT_TRUE(Fixed(2.5, 8)); }

TEST_F(FractionalTsynTest, RequestsOf0AreFixedToo) {
  imp_.requests.reqPhase.fill(0);
  imp_.requests.reqDutyCycle.fill(0);
  EXPECT_EQ(Put(0, 2.125).dutyCycle[0], 0.0);
  Get(1, kTsyn);
  EXPECT_EQ(table_[0].dutyCycle[0], 0.5);
  EXPECT_EQ(table_[0].dutyDiff[0], 0.0);
}

TEST_F(FractionalTsynTest, AWholeDividerAloneIsNotFixed) {
  imp_.pll._intDiv0Only = true;
  EXPECT_FALSE(Fixed(2.125, 8));
  EXPECT_FALSE(Fixed(2, 8.125));
}

TEST_F(FractionalTsynTest, OtherPrimitivesAreNotFixed) {
  for (const int prim : {kPll, -1, 2}) {
    EXPECT_FALSE(Fixed(2.125, 8, prim)) << prim;
    EXPECT_FALSE(Fixed(2, 8.125, prim)) << prim;
  }
}

TEST_F(FractionalTsynTest, EachCandidateIsTestedForItself) {
  Put(0, 2.125, 4);
  Put(1, 4, 4);
  Get(2, kTsyn);
  EXPECT_EQ(table_[0].phase[1], 0.0);
  EXPECT_EQ(table_[1].phase[1], 90.0);
}

TEST_F(FractionalTsynTest, AFractionBeginsAt0Point0001) {
  EXPECT_TRUE(Fixed(2, 8.0002));
  EXPECT_FALSE(Fixed(2, 8.00005));
  EXPECT_FALSE(Fixed(2, 7.99995));
  // Next to 0 the distance from the whole number is M itself.
  EXPECT_TRUE(Fixed(2, 0.0001));
  EXPECT_FALSE(Fixed(2, Below(0.0001)));
}

}  // namespace
