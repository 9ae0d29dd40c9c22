// Tests of the search for M and D.

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cmath>
#include <cstdint>
#include <string>

#include "engine/pll/Stages.h"
#include "tests/compare/Random.h"
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

constexpr int kTsyn = 0;
constexpr int kPll = 1;
constexpr double kNoMinimum = 0.0;
constexpr double kNoMaximum = 1e9;

// One candidate. D before rounding is inFreq * M / vco and the PFD frequency vco / M.
class MultiplierSearchTest : public testing::Test {
 protected:
  MultiplierSearchTest() { SetPrim(kPll); }

  // The primitive of the run and, as a pass sets it, of the process.
  void SetPrim(int prim) {
    prim_ = prim;
    VorkelImp::_prim = prim;
  }

  bool Search(double vco, double inFreq, double pfdMin = kNoMinimum, double pfdMax = kNoMaximum,
              bool integerStep = true) {
    candidate_ = VcoCandidate{};
    candidate_.vco = vco;
    bool found = false;
    trace_ = engine_test::TraceOf([&](const Trace& trace) {
      found = Ip::Pll::SearchMAndD(candidate_, pfdMin, pfdMax, integerStep,
                                   {inFreq, 1, prim_, trace});
    });
    return found;
  }

  bool SearchFractional(double vco, double inFreq) {
    return Search(vco, inFreq, kNoMinimum, kNoMaximum, false);
  }

  int prim_ = kPll;
  VcoCandidate candidate_{};
  std::string trace_;
};

TEST_F(MultiplierSearchTest, FindsTheSmallestM) {
  EXPECT_TRUE(Search(600, 100));
  EXPECT_EQ(candidate_.m, 6.0);
  EXPECT_EQ(candidate_.d, 1u);
  EXPECT_EQ(trace_,
            "DLL - RK --> _prim = 1 \n"
            "DLL-- For VCO = 600.000000: M = 6.000000, D = (float) 1.000000, (int) 1\n");
}

TEST_F(MultiplierSearchTest, ALowerPfdMaximumTakesAMultiple) {
  EXPECT_TRUE(Search(600, 100, kNoMinimum, 99));
  EXPECT_EQ(candidate_.m, 12.0);
  EXPECT_EQ(candidate_.d, 2u);
  EXPECT_TRUE(Search(600, 100, kNoMinimum, 49));
  EXPECT_EQ(candidate_.m, 18.0);
  EXPECT_EQ(candidate_.d, 3u);
}

TEST_F(MultiplierSearchTest, BothEndsOfThePfdRangeBelongToIt) {
  EXPECT_TRUE(Search(600, 100, 100, 100));
  EXPECT_EQ(candidate_.m, 6.0);
  EXPECT_TRUE(Search(600, 100, kNoMinimum, Below(100)));
  EXPECT_EQ(candidate_.m, 12.0);
  EXPECT_TRUE(Search(600, 100, 50, Below(100)));
  EXPECT_EQ(candidate_.m, 12.0);
  EXPECT_FALSE(Search(600, 100, Above(50), Below(100)));
  EXPECT_FALSE(Search(600, 100, Above(100), kNoMaximum));
  EXPECT_EQ(trace_, "DLL - RK --> _prim = 1 \n");
}

// For D = 1.0004 the detector runs at 512 MHz; by the whole D it would be 512.2.
TEST_F(MultiplierSearchTest, ThePfdFrequencyIsThatOfTheRealD) {
  EXPECT_TRUE(Search(512, 512 * 1.0004, kNoMinimum, 512.1));
  EXPECT_FALSE(Search(512, 512 * 1.0004, 512.1, kNoMaximum));
}

// 33.333 / 3 is one unit in the last place less than 55.555 / 5.
TEST_F(MultiplierSearchTest, ThePfdFrequencyIsTheInputByD) {
  volatile double inFreq = 33.333;
  volatile double vco = 55.555;
  ASSERT_EQ(inFreq * 5 / vco, 3.0);
  ASSERT_LT(inFreq / 3, vco / 5);
  EXPECT_TRUE(Search(vco, inFreq, kNoMinimum, inFreq / 3));
  EXPECT_EQ(candidate_.m, 5.0);
  EXPECT_EQ(candidate_.d, 3u);
}

// 27 * 49 / 1323 is 1, and 27 / 1323 * 49 is one unit in the last place less.
TEST_F(MultiplierSearchTest, DIsTheProductByTheVco) {
  volatile double inFreq = 27;
  volatile double vco = 1323;
  ASSERT_NE(inFreq / vco * 49, 1.0);
  EXPECT_TRUE(Search(vco, inFreq));
  EXPECT_EQ(trace_,
            "DLL - RK --> _prim = 1 \n"
            "DLL-- For VCO = 1323.000000: M = 49.000000, D = (float) 1.000000, (int) 1\n");
}

// --- Remainder of D: a VCO of a power of two makes inFreq / vco exact --------------------------

TEST_F(MultiplierSearchTest, ASmallRemainderIsAcceptedAndTraced) {
  EXPECT_TRUE(Search(512, 512 * 1.0004));
  EXPECT_EQ(candidate_.m, 1.0);
  EXPECT_EQ(candidate_.d, 1u);
  EXPECT_EQ(trace_,
            "DLL - RK --> _prim = 1 \n"
            "DLL-- For VCO = 512.000000: M = 1.000000, D = (float) 1.000400, (int) 1; "
            "remainder = 0.000400\n");
  EXPECT_TRUE(Search(512, 512 * 0.9996));
  EXPECT_EQ(candidate_.d, 1u);
  EXPECT_EQ(trace_,
            "DLL - RK --> _prim = 1 \n"
            "DLL-- For VCO = 512.000000: M = 1.000000, D = (float) 0.999600, (int) 1; "
            "remainder = 0.000400\n");
}

TEST_F(MultiplierSearchTest, OnlyARemainderOfExactlyZeroGoesUntraced) {
  EXPECT_TRUE(Search(512, 512 * Above(1.0)));
  EXPECT_EQ(trace_,
            "DLL - RK --> _prim = 1 \n"
            "DLL-- For VCO = 512.000000: M = 1.000000, D = (float) 1.000000, (int) 1; "
            "remainder = 0.000000\n");
}

// As doubles, 1.0005 - 1 and 1 - 0.9995 lie just below 0.0005, and those of the neighbours
// farther from 1 just above it. Larger M have larger remainders of both.
TEST_F(MultiplierSearchTest, TheRemainderLiesBelowItsBound) {
  ASSERT_LT(1.0005 - 1.0, 0.0005);
  ASSERT_GT(Above(1.0005) - 1.0, 0.0005);
  EXPECT_TRUE(Search(512, 512 * 1.0005));
  EXPECT_FALSE(Search(512, 512 * Above(1.0005)));
  ASSERT_LT(1.0 - 0.9995, 0.0005);
  ASSERT_GT(1.0 - Below(0.9995), 0.0005);
  EXPECT_TRUE(Search(512, 512 * 0.9995));
  EXPECT_FALSE(Search(512, 512 * Below(0.9995)));
}

// Further from 1 the doubles lie less dense; at 8 it is 8.0005 that has the larger remainder.
TEST_F(MultiplierSearchTest, TheRemainderLiesBelowItsBoundForLargerD) {
  ASSERT_GT(8.0005 - 8.0, 0.0005);
  ASSERT_LT(Below(8.0005) - 8.0, 0.0005);
  EXPECT_FALSE(Search(512, 512 * 8.0005));
  EXPECT_TRUE(Search(512, 512 * Below(8.0005)));
  EXPECT_EQ(candidate_.d, 8u);
}

// --- Range of D --------------------------------------------------------------------------------

TEST_F(MultiplierSearchTest, DIsAtMost80) {
  EXPECT_TRUE(Search(8, 8 * 80.0));
  EXPECT_EQ(candidate_.d, 80u);
  EXPECT_EQ(candidate_.m, 1.0);
  EXPECT_TRUE(Search(8, 8 * 80.0004));
  EXPECT_EQ(candidate_.d, 80u);
  EXPECT_FALSE(Search(8, 8 * 80.5));
  EXPECT_FALSE(Search(8, 8 * 81.0));
  EXPECT_FALSE(Search(8, 8 * 80.9996));
}

TEST_F(MultiplierSearchTest, DIsAbove0Point5) {
  // M = 1 gives D = 0.5, M = 2 gives D = 1.
  EXPECT_TRUE(Search(1024, 512));
  EXPECT_EQ(candidate_.m, 2.0);
  // M = 1 gives D = 0.0004: near 0, which is no divider. Nor do 2 to 64, up to D = 0.0256.
  EXPECT_FALSE(Search(1024, 1024 * 0.0004));
}

// --- Range of M --------------------------------------------------------------------------------

TEST_F(MultiplierSearchTest, MIsAtMost64) {
  // D is M / 64, and M / 65.
  for (const int prim : {kPll, kTsyn}) {
    SetPrim(prim);
    EXPECT_TRUE(Search(640, 10));
    EXPECT_EQ(candidate_.m, 64.0);
    EXPECT_EQ(candidate_.d, 1u);
    EXPECT_FALSE(Search(650, 10));
  }
}

TEST_F(MultiplierSearchTest, MOf1IsTried) {
  for (const int prim : {kPll, kTsyn}) {
    SetPrim(prim);
    EXPECT_TRUE(Search(600, 600));
    EXPECT_EQ(candidate_.m, 1.0);
    EXPECT_EQ(candidate_.d, 1u);
    EXPECT_TRUE(Search(600, 1800));
    EXPECT_EQ(candidate_.m, 1.0);
    EXPECT_EQ(candidate_.d, 3u);
  }
}

TEST_F(MultiplierSearchTest, ATsynGoesFrom1To5) {
  SetPrim(kTsyn);
  EXPECT_TRUE(Search(600, 100));
  EXPECT_EQ(candidate_.m, 6.0);
  EXPECT_EQ(trace_,
            "DLL - RK --> _prim = 0 \n"
            "DLL-- For VCO = 600.000000: M = 6.000000, D = (float) 1.000000, (int) 1\n");
  // 2, 3 and 4 times 100 are made by a larger M and D.
  EXPECT_TRUE(Search(200, 100));
  EXPECT_EQ(candidate_.m, 6.0);
  EXPECT_EQ(candidate_.d, 3u);
  EXPECT_TRUE(Search(300, 100));
  EXPECT_EQ(candidate_.m, 6.0);
  EXPECT_EQ(candidate_.d, 2u);
  EXPECT_TRUE(Search(400, 100));
  EXPECT_EQ(candidate_.m, 8.0);
  EXPECT_EQ(candidate_.d, 2u);
  EXPECT_TRUE(Search(500, 100));
  EXPECT_EQ(candidate_.m, 5.0);
  EXPECT_EQ(candidate_.d, 1u);
}

TEST_F(MultiplierSearchTest, EveryOtherPrimitiveHas2To4) {
  for (const int prim : {kPll, -1, 2}) {
    SetPrim(prim);
    for (const int m : {2, 3, 4}) {
      EXPECT_TRUE(Search(m * 100, 100));
      EXPECT_EQ(candidate_.m, m);
      EXPECT_EQ(candidate_.d, 1u);
    }
    EXPECT_TRUE(trace_.starts_with("DLL - RK --> _prim = " + std::to_string(prim) + " \n"));
  }
}

// The trace prints the primitive of the process; the gap is that of the run's own.
TEST_F(MultiplierSearchTest, ThePrimitiveOfTheProcessIsForTheTraceOnly) {
  VorkelImp::_prim = kTsyn;
  EXPECT_TRUE(Search(200, 100));
  EXPECT_EQ(candidate_.m, 2.0);
  EXPECT_TRUE(trace_.starts_with("DLL - RK --> _prim = 0 \n"));
  prim_ = kTsyn;
  VorkelImp::_prim = kPll;
  EXPECT_TRUE(Search(200, 100));
  EXPECT_EQ(candidate_.m, 6.0);
  EXPECT_TRUE(trace_.starts_with("DLL - RK --> _prim = 1 \n"));
}

// --- Steps of an eighth ------------------------------------------------------------------------

TEST_F(MultiplierSearchTest, FractionalStepsBeginAt2) {
  EXPECT_TRUE(SearchFractional(212.5, 100));
  EXPECT_EQ(candidate_.m, 2.125);
  EXPECT_EQ(candidate_.d, 1u);
  EXPECT_EQ(trace_,
            "DLL - RK --> _prim = 1 \n"
            "DLL-- For VCO = 212.500000: M = 2.125000, D = (float) 1.000000, (int) 1\n");
  // 1.5 is no step: 3 with D = 2 makes the same.
  EXPECT_TRUE(SearchFractional(150, 100));
  EXPECT_EQ(candidate_.m, 3.0);
  EXPECT_EQ(candidate_.d, 2u);
}

TEST_F(MultiplierSearchTest, WholeStepsHaveNoFractions) {
  EXPECT_TRUE(Search(212.5, 100));
  EXPECT_EQ(candidate_.m, 17.0);
  EXPECT_EQ(candidate_.d, 8u);
}

TEST_F(MultiplierSearchTest, FractionalStepsOfATsynBeginAt5) {
  SetPrim(kTsyn);
  EXPECT_TRUE(SearchFractional(512.5, 100));
  EXPECT_EQ(candidate_.m, 5.125);
  EXPECT_EQ(candidate_.d, 1u);
  // 2.125 lies in the gap, 4.25 too; 6.375 is three times it.
  EXPECT_TRUE(SearchFractional(212.5, 100));
  EXPECT_EQ(candidate_.m, 6.375);
  EXPECT_EQ(candidate_.d, 3u);
}

TEST_F(MultiplierSearchTest, FractionalStepsEndAt64) {
  for (const int prim : {kPll, kTsyn}) {
    SetPrim(prim);
    EXPECT_TRUE(SearchFractional(640, 10)) << prim;
    EXPECT_EQ(candidate_.m, 64.0) << prim;
    EXPECT_TRUE(SearchFractional(638.75, 10)) << prim;
    EXPECT_EQ(candidate_.m, 63.875) << prim;
    EXPECT_FALSE(SearchFractional(641.25, 10)) << prim;
  }
}

// --- Odd input ---------------------------------------------------------------------------------

TEST_F(MultiplierSearchTest, OddFrequenciesHaveNoMAndD) {
  for (const double inFreq : {0.0, -100.0, kNan, kInfinity, -kInfinity, 1e-300, 1e300}) {
    EXPECT_FALSE(Search(600, inFreq)) << inFreq;
    EXPECT_FALSE(SearchFractional(600, inFreq)) << inFreq;
  }
  EXPECT_FALSE(Search(600, 100, kNan, kNoMaximum));
  EXPECT_FALSE(Search(600, 100, kNoMinimum, kNan));
}

// The VCO is twice the input: M = 1 has a D of 0.5, which is none, M = 2 has 1.
TEST_F(MultiplierSearchTest, FrequenciesOfAnySizeBeginWithTheSameM) {
  for (const double inFreq : {1e-110, 1.0, 1e110}) {
    ASSERT_TRUE(Search(2.0 * inFreq, inFreq, kNoMinimum, kInfinity)) << inFreq;
    EXPECT_EQ(candidate_.m, 2.0);
    EXPECT_EQ(candidate_.d, 1u);
  }
}

TEST_F(MultiplierSearchTest, AVcoBelow0OfAnInputAbove0HasNone) {
  EXPECT_FALSE(Search(-200.0, 100.0, -kInfinity, kInfinity));
  EXPECT_EQ(trace_, "DLL - RK --> _prim = 1 \n");
}

TEST_F(MultiplierSearchTest, TwoNegativeFrequenciesMakeAPositiveD) {
  // inFreq / D is negative then, and below any minimum but a negative one.
  EXPECT_FALSE(Search(-600, -100));
  EXPECT_TRUE(Search(-600, -100, -100, 0));
  EXPECT_EQ(candidate_.m, 6.0);
}

TEST_F(MultiplierSearchTest, ASearchThatFailsLeavesTheCandidate) {
  candidate_.vco = 7000;
  candidate_.m = 3;
  candidate_.d = 2;
  const Trace silent(false);
  EXPECT_FALSE(Ip::Pll::SearchMAndD(candidate_, 0, 1e9, true, {100, 1, kPll, silent}));
  EXPECT_EQ(candidate_.m, 3.0);
  EXPECT_EQ(candidate_.d, 2u);
}

// --- The table ---------------------------------------------------------------------------------

// The rule in plain words, M after M.
bool PlainSearch(VcoCandidate& candidate, double inFreq, double pfdMin, double pfdMax, double step,
                 bool hasGap) {
  for (double m = 1.0; m <= 64.0; m = m == 1.0 ? 2.0 : m + step) {
    if (hasGap && m >= 2.0 && m < 5.0) continue;
    const double realD = inFreq * m / candidate.vco;
    if (!(realD > 0.5 && realD < 80.5)) continue;
    const double pfd = inFreq / realD;
    const double d = std::floor(realD + 0.5);
    if (!(pfd >= pfdMin && pfd <= pfdMax && std::fabs(d - realD) < 0.0005)) continue;
    candidate.m = m;
    candidate.d = static_cast<std::uint32_t>(d);
    return true;
  }
  return false;
}

// Candidates at an M and a D, and where these just are or just are not near enough; limits at the
// PFD frequency and beside it, none, and such that nothing passes.
TEST_F(MultiplierSearchTest, IsThePlainSearchOfDrawnCandidates) {
  compare::Random random(3);
  const auto beside = [&](double value) {
    return random.OneIn(3) ? Above(value) : random.OneIn(2) ? Below(value) : value;
  };
  int found = 0;
  for (int i = 0; i < 20000; ++i) {
    SetPrim(random.OneIn(2) ? kPll : kTsyn);
    const double step = random.OneIn(2) ? 1.0 : 0.125;
    const double inFreq = random.OneIn(40) ? random.Pick<double>({0, -100, 1e-320, 1e300, kNan})
                                           : random.Real(5, random.OneIn(3) ? 1000 : 50);
    const double m = random.Int(1, static_cast<int>(70 / step)) * step;
    const int d = random.OneIn(3) ? random.Int(1, 82) : random.Int(1, 4);
    const double realD = random.OneIn(2) ? d : beside(d + (random.OneIn(2) ? 0.0005 : -0.0005));
    const double vco = beside(inFreq * m / realD);
    const double pfd = inFreq / realD;
    const double pfdMin = random.Pick<double>({0, -1, 10, beside(pfd), pfd / 2, kNan});
    const double pfdMax = random.Pick<double>({kInfinity, 500, beside(pfd), pfd * 3, 0});
    VcoCandidate plain{};
    plain.vco = vco;
    const bool expected = PlainSearch(plain, inFreq, pfdMin, pfdMax, step, prim_ == kTsyn);
    ASSERT_EQ(Search(vco, inFreq, pfdMin, pfdMax, step == 1.0), expected)
        << inFreq << " " << vco << " " << pfdMin << " " << pfdMax << " " << step;
    ASSERT_EQ(candidate_.m, plain.m);
    ASSERT_EQ(candidate_.d, plain.d);
    found += expected ? 1 : 0;
  }
  EXPECT_GT(found, 4000);
}

class CalculateMAndDTest : public testing::Test {
 protected:
  CalculateMAndDTest() {
    VorkelImp::_prim = kPll;
    imp_.pllLimits.pfdMin = 10;
    imp_.pllLimits.pfdMax = 550;
    imp_.pllLimits._maxPfdLowB = 60;
  }

  bool Calculate(double inFreq, bool integerStep = true) {
    bool found = false;
    trace_ = engine_test::TraceOf([&](const Trace& trace) {
      found = Ip::Pll::CalculateMAndD(imp_, integerStep, {inFreq, 1, kPll, trace});
    });
    return found;
  }

  VorkelImp& imp_ = engine_test::NewImp();
  VcoCandidateTable& table_ = imp_.pll._vcoCandidates;
  std::string trace_;
};

// 7000 MHz is more than 64 times 100.
TEST_F(CalculateMAndDTest, DropsCandidatesWithoutMAndD) {
  table_.Put(0, 7000, 1);
  table_.Put(2, 600, 3);
  table_.Put(500, 7000, 1);
  table_.Put(1009, 650, 128);
  EXPECT_TRUE(Calculate(100));
  EXPECT_THAT(SlotsOf(table_.Occupied()), ElementsAre(2, 1009));
  EXPECT_EQ(table_[2].m, 6.0);
  EXPECT_EQ(table_[2].d, 1u);
  EXPECT_EQ(table_[1009].m, 13.0);
  EXPECT_EQ(table_[1009].d, 2u);
  EXPECT_EQ(trace_,
            "DLL------- Calculating M and D\n"
            "DLL - RK --> _prim = 1 \n"
            "DLL - RK --> _prim = 1 \n"
            "DLL-- For VCO = 600.000000: M = 6.000000, D = (float) 1.000000, (int) 1\n"
            "DLL - RK --> _prim = 1 \n"
            "DLL - RK --> _prim = 1 \n"
            "DLL-- For VCO = 650.000000: M = 13.000000, D = (float) 2.000000, (int) 2\n");
}

TEST_F(CalculateMAndDTest, IsFalseWhenNoneIsLeft) {
  table_.Put(0, 7000, 1);
  EXPECT_FALSE(Calculate(100));
  EXPECT_THAT(SlotsOf(table_.Occupied()), IsEmpty());
  EXPECT_EQ(trace_,
            "DLL------- Calculating M and D\n"
            "DLL - RK --> _prim = 1 \n"
            "DLL------------ No valid M and D was found!\n");
}

TEST_F(CalculateMAndDTest, IsFalseForAnEmptyTable) {
  EXPECT_FALSE(Calculate(100));
  EXPECT_EQ(trace_,
            "DLL------- Calculating M and D\n"
            "DLL------------ No valid M and D was found!\n");
}

TEST_F(CalculateMAndDTest, LowBandwidthHasItsOwnPfdMaximum) {
  table_.Put(0, 600, 3);
  imp_.SetLowBandwidth(true);
  EXPECT_TRUE(Calculate(100));
  EXPECT_EQ(table_[0].m, 12.0);
  EXPECT_EQ(table_[0].d, 2u);
  EXPECT_EQ(trace_,
            "DLL------- Calculating M and D\n"
            "DLL  --- Using _maxPfdLowB (60.000000) for PFD max\n"
            "DLL - RK --> _prim = 1 \n"
            "DLL-- For VCO = 600.000000: M = 12.000000, D = (float) 2.000000, (int) 2\n");
  imp_.SetLowBandwidth(false);
  EXPECT_TRUE(Calculate(100));
  EXPECT_EQ(table_[0].m, 6.0);
}

TEST_F(CalculateMAndDTest, TheLowBandwidthMaximumIsInclusiveAndReplacesTheOther) {
  table_.Put(0, 600, 3);
  imp_.SetLowBandwidth(true);
  imp_.pllLimits._maxPfdLowB = 100;
  EXPECT_TRUE(Calculate(100));
  EXPECT_EQ(table_[0].m, 6.0);
  imp_.pllLimits._maxPfdLowB = Below(100);
  EXPECT_TRUE(Calculate(100));
  EXPECT_EQ(table_[0].m, 12.0);
  // Not the smaller of the two: here the normal maximum would forbid M = 6.
  imp_.pllLimits._maxPfdLowB = 200;
  imp_.pllLimits.pfdMax = 60;
  EXPECT_TRUE(Calculate(100));
  EXPECT_EQ(table_[0].m, 6.0);
}

TEST_F(CalculateMAndDTest, UsesThePfdLimitsOfTheDevice) {
  table_.Put(0, 600, 3);
  imp_.pllLimits.pfdMin = 100;
  imp_.pllLimits.pfdMax = 100;
  EXPECT_TRUE(Calculate(100));
  imp_.pllLimits.pfdMin = Above(100);
  imp_.pllLimits.pfdMax = 550;
  EXPECT_FALSE(Calculate(100));
}

TEST_F(CalculateMAndDTest, PassesTheStepOn) {
  table_.Put(0, 212.5, 1);
  EXPECT_TRUE(Calculate(100, false));
  EXPECT_EQ(table_[0].m, 2.125);
  EXPECT_TRUE(Calculate(100, true));
  EXPECT_EQ(table_[0].m, 17.0);
}

TEST_F(CalculateMAndDTest, DropsACandidateThatHadMAndDFromAnEarlierSearch) {
  table_.Put(0, 7000, 1);
  table_[0].m = 6;
  table_[0].d = 1;
  EXPECT_FALSE(Calculate(100));
  EXPECT_THAT(SlotsOf(table_.Occupied()), IsEmpty());
}

TEST_F(CalculateMAndDTest, IsSilentWithTheTraceOff) {
  table_.Put(0, 600, 1);
  imp_.SetLowBandwidth(true);
  const std::string text = engine_test::TraceOf(
      [&](const Trace& trace) {
        Ip::Pll::CalculateMAndD(imp_, true, {100, 1, kPll, trace});
        table_.EmptyAll();
        Ip::Pll::CalculateMAndD(imp_, true, {100, 1, kPll, trace});
      },
      false);
  EXPECT_EQ(text, "");
}

}  // namespace
