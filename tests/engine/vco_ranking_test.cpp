// The ranking of the VCO frequencies, held against the fits and the M and D search that it stands
// for.

#include "engine/pll/filter/VcoRanking.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <random>
#include <string>
#include <string_view>
#include <vector>

#include "engine/pll/OutputDividers.h"
#include "tests/engine/EngineTest.h"
#include "tests/support/FakeHost.h"

namespace Ip::Pll {
namespace {

using Kind = RankedRange::Kind;

// 100 MHz into a TSYN with a VCO of 600 to 1440 MHz, a PFD of 10 to 500 MHz and outputs of 4.6875
// to 800 MHz.
class VcoRankingTest : public testing::Test {
 protected:
  VcoRankingTest() {
    FakeHost::Instance().Reset();
    SetTsyn("ranking", {});
    imp_.SetDevice("ranking");
  }

  VcoRanking Rank(const char* outFreqs, int count, double inFreq = 100.0) {
    const Pll::Run run = {inFreq, count, kTsyn, trace_};
    EXPECT_EQ(PrepareVcoRange(imp_, outFreqs, 0.0, run), kSolved);
    return RankVcos(imp_, run);
  }

  // The key of a VCO by the fits of the divider search; 1 stands for 0, too, when `coarse`.
  ToleranceKey KeyByFit(double vco, int count, bool coarse) const {
    ToleranceKey key = 0;
    bool served = true;
    for (int n = 1; n < count; ++n) {
      const double requested = imp_.requests.reqOutFreq[static_cast<std::size_t>(n)];
      int digit = FitOutput(vco, requested, RangeOfOutput(imp_.pllLimits, kTsyn, n)).tolerance;
      if (coarse && requested > 0.0) digit = std::max(digit, 1);
      key = key << 5 | static_cast<ToleranceKey>(served ? digit : 0);
      if (digit == kTolerances) served = false;
    }
    return key;
  }

  bool Accepted(double vco, double inFreq) {
    VcoCandidate candidate{};
    candidate.vco = vco;
    return SearchMAndD(candidate, imp_.pllLimits.pfdMin, imp_.pllLimits.pfdMax, true,
                       {inFreq, 1, kTsyn, trace_});
  }

  // Prepares a run for 100 and 70 MHz.
  void PrepareForTwo() { Rank("100 70", 2); }

  // Expects that the ranking for two outputs with the limits as they stand foretells what becomes
  // of the VCOs up to the highest that 100 MHz can make. Returns whether any is accepted.
  bool ExpectForetold(const std::string& limits) {
    const VcoRanking ranking = RankVcos(imp_, {100.0, 2, kTsyn, trace_});
    bool anyAccepted = false;
    for (double vco = 20.0; vco <= 6400.0; vco += 20.0) {
      if (!(vco >= imp_.pll.minAdjVco && vco <= imp_.pll.maxAdjVco)) continue;
      const ToleranceKey key = KeyByFit(vco, 2, true);
      if (key == kTolerances || !Accepted(vco, 100.0)) continue;
      anyAccepted = true;
      EXPECT_TRUE(std::ranges::any_of(ranking, [&](const RankedRange& range) {
        return range.kind == Kind::kAccepted && range.key == key && range.low <= vco &&
               vco <= range.high;
      })) << limits << ": " << vco;
    }
    EXPECT_EQ(std::ranges::any_of(
                  ranking, [](const RankedRange& range) { return range.kind == Kind::kAccepted; }),
              anyAccepted)
        << limits;
    return anyAccepted;
  }

  static std::vector<RankedRange> Stretches(const VcoRanking& ranking) {
    std::vector<RankedRange> stretches;
    for (const RankedRange& range : ranking) {
      if (range.kind != Kind::kAccepted && !range.IsPoint()) stretches.push_back(range);
    }
    return stretches;
  }

  static const RankedRange* StretchAt(const std::vector<RankedRange>& stretches, double vco) {
    for (const RankedRange& stretch : stretches) {
      if (stretch.low <= vco && vco <= stretch.high) return &stretch;
    }
    return nullptr;
  }

  Trace trace_{false};
  VorkelImp& imp_ = engine_test::NewImp();
};

// 70 MHz divides 600 MHz by 9 (66.67 MHz, 4.8 percent too little), and 990 MHz by 14 (1.02 too
// much). Around 600 MHz, 5 percent are missing at 598.5 and 4 at 604.8 MHz; around 990 MHz the
// error comes to 1 percent at 989.8 and to 2 at 999.6 MHz.
TEST_F(VcoRankingTest, AStretchEndsWhereTheErrorComesToTheNextTolerance) {
  const auto stretches = Stretches(Rank("100 70", 2));
  const RankedRange* first = StretchAt(stretches, 601.0);
  ASSERT_NE(first, nullptr);
  EXPECT_EQ(first->key, 5u);
  EXPECT_EQ(first->low, 600.0);  // of the VCO range
  EXPECT_NEAR(first->high, 604.8, 1e-9);
  const RankedRange* above = StretchAt(stretches, 990.0);
  ASSERT_NE(above, nullptr);
  EXPECT_EQ(above->key, 2u);
  EXPECT_NEAR(above->low, 989.8, 1e-9);
  EXPECT_NEAR(above->high, 999.6, 1e-9);
}

// 1000 MHz is half way between 2 and 3 times 400 MHz; the higher divider has it. 400 x 2 is off
// by 25 percent there, 400 x 3 by 16.7.
TEST_F(VcoRankingTest, AStretchEndsHalfWayBetweenTwoDividers) {
  const auto stretches = Stretches(Rank("100 400", 2));
  EXPECT_EQ(StretchAt(stretches, 999.0)->key, 25u);
  EXPECT_EQ(StretchAt(stretches, 999.0)->high, 1000.0);
  EXPECT_EQ(StretchAt(stretches, 1001.0)->key, 17u);
}

// The highest output frequency is 800 MHz. 760 MHz divides VCOs below 1140 MHz by 1, so outputs 1
// and 2 have no divider from 800 MHz on, whatever is left of the tolerance.
TEST_F(VcoRankingTest, AStretchEndsWhereTheOutputLeavesItsRange) {
  const auto stretches = Stretches(Rank("100 760", 2));
  EXPECT_EQ(StretchAt(stretches, 799.0)->key, 6u);
  EXPECT_EQ(StretchAt(stretches, 799.0)->high, 800.0);
  EXPECT_EQ(StretchAt(stretches, 801.0)->key, 27u);
  EXPECT_EQ(StretchAt(stretches, 801.0)->kind, Kind::kUnserved);
}

// At 801 MHz, 760 MHz has no divider; the digit of 50 MHz is then 0 though 801 / 16 fits.
TEST_F(VcoRankingTest, BehindAnOutputWithoutDividerDigitsAreZero) {
  const auto stretches = Stretches(Rank("100 760 50", 3));
  EXPECT_EQ(StretchAt(stretches, 799.0)->key, 6u << 5 | 1u);
  EXPECT_EQ(StretchAt(stretches, 801.0)->key, 27u << 5);
}

TEST_F(VcoRankingTest, OneOutputHasOneStretch) {
  const auto stretches = Stretches(Rank("100", 1));
  ASSERT_EQ(stretches.size(), 1u);
  EXPECT_EQ(stretches[0].low, 600.0);
  EXPECT_EQ(stretches[0].high, 1440.0);
  EXPECT_EQ(stretches[0].key, 0u);
  EXPECT_EQ(stretches[0].kind, Kind::kServed);
}

// 1000 MHz is a multiple of 500, 250 and 40 MHz, 1200 MHz of 40 MHz only among these, and no
// multiple of 500 or 250 MHz.
TEST_F(VcoRankingTest, MultiplesAreThereAsPointsWithTheirZeros) {
  const VcoRanking ranking = Rank("100 500 250 40", 4);
  auto keysAt = [&](double vco, Kind kind) {
    std::vector<ToleranceKey> keys;
    for (const RankedRange& range : ranking) {
      if (range.IsPoint() && range.low == vco && range.kind == kind) keys.push_back(range.key);
    }
    return keys;
  };
  EXPECT_THAT(keysAt(1000.0, Kind::kAccepted), testing::ElementsAre(0u));  // M = 10, D = 1
  // 1200 / 2 is 20 percent above 500 MHz, 1200 / 5 is 4 percent below 250 MHz. Both may be
  // rounded to either side.
  const auto keys = keysAt(1200.0, Kind::kAccepted);  // M = 12
  ASSERT_FALSE(keys.empty());
  for (const ToleranceKey key : keys) EXPECT_EQ(key & 31u, 0u);
  for (const ToleranceKey key : keys) EXPECT_THAT(key >> 10, testing::AnyOf(20u, 21u));
}

TEST_F(VcoRankingTest, IsSortedByKeyAndKind) {
  const VcoRanking ranking = Rank("100 70 45 148.5", 4);
  EXPECT_GT(ranking.size(), 100u);
  EXPECT_TRUE(std::is_sorted(ranking.begin(), ranking.end(), [](const auto& a, const auto& b) {
    return a.key < b.key || (a.key == b.key && a.kind < b.kind);
  }));
}

// Every VCO lies in one stretch, and that has its key.
TEST_F(VcoRankingTest, StretchesHaveTheKeysOfTheFits) {
  std::mt19937 random(2);
  for (const char* outFreqs :
       {"100 70", "100 400 5", "100 12.288 75 80 5", "10 27 148.5 74.25 297 33.333 600",
        "100 -5 60", "100 -0 800", "100 1e-3 60", "100 1500", "100 0 50", "100 6 1e9"}) {
    const int count = static_cast<int>(std::ranges::count(std::string_view(outFreqs), ' ')) + 1;
    const auto stretches = Stretches(Rank(outFreqs, count));
    double covered = 0.0;
    for (const RankedRange& stretch : stretches) covered += stretch.high - stretch.low;
    EXPECT_NEAR(covered, 840.0, 1e-6) << outFreqs;
    for (int i = 0; i < 3000; ++i) {
      const double vco = std::uniform_real_distribution<double>(600.0, 1440.0)(random);
      const RankedRange* stretch = StretchAt(stretches, vco);
      ASSERT_NE(stretch, nullptr) << outFreqs << " at " << vco;
      const ToleranceKey key = KeyByFit(vco, count, true);
      EXPECT_EQ(stretch->key, key) << outFreqs << " at " << vco;
      EXPECT_EQ(stretch->kind == Kind::kUnserved,
                (key & 31u) == 27u || (key >> 5 & 31u) == 27u || (key >> 10 & 31u) == 27u ||
                    (key >> 15 & 31u) == 27u || (key >> 20 & 31u) == 27u ||
                    (key >> 25 & 31u) == 27u)
          << outFreqs << " at " << vco;
    }
  }
}

// The fits have no smaller key than a point has.
TEST_F(VcoRankingTest, PointsHaveLowerBoundsOfTheKeysOfTheFits) {
  int points = 0;
  for (const char* outFreqs : {"100 62.5 12.5 33.3 148.5", "100 4.6875 600 800 75"}) {
    for (const RankedRange& range : Rank(outFreqs, 5)) {
      if (!range.IsPoint()) continue;
      ++points;
      for (const double vco : {engine_test::Below(range.low), range.low,
                               engine_test::Above(range.low)}) {
        EXPECT_LE(range.key, KeyByFit(vco, 5, false)) << vco << " for " << outFreqs;
      }
    }
  }
  EXPECT_GT(points, 80);
}

// The highest output is 450 MHz. Below 900 MHz, half way between the dividers 1 and 2 of 600 MHz,
// the output would be the VCO itself, and above 900 MHz half of it is too high. At 900 MHz it is
// 450 MHz, 25 percent below the request.
TEST_F(VcoRankingTest, AVcoWhereTwoEndsOfAnOutputMeetIsAPoint) {
  Rank("100 600", 2);
  imp_.pllLimits.clkoutMax = 450.0;
  const Pll::Run run = {100.0, 2, kTsyn, trace_};
  const VcoRanking ranking = RankVcos(imp_, run);
  int served = 0;
  for (const RankedRange& range : ranking) {
    if (range.kind == Kind::kUnserved) continue;
    ++served;
    EXPECT_EQ(range.low, 900.0);
    EXPECT_EQ(range.high, 900.0);
    EXPECT_EQ(range.key, 25u);
  }
  EXPECT_EQ(served, 1);  // accepted: 100 x 9
}

// The highest output is 300 MHz, the VCO goes from 600 to 700 MHz. Half of the lowest VCO is 300
// MHz; half of the others is too high.
TEST_F(VcoRankingTest, AVcoWhereAnEndMeetsTheVcoRangeIsAPoint) {
  Rank("100 300", 2);
  imp_.pllLimits.clkoutMax = 300.0;
  imp_.pll.maxAdjVco = 700.0;
  const Pll::Run run = {100.0, 2, kTsyn, trace_};
  int served = 0;
  for (const RankedRange& range : RankVcos(imp_, run)) {
    if (range.kind == Kind::kUnserved) continue;
    ++served;
    EXPECT_EQ(range.low, 600.0);
    EXPECT_EQ(range.high, 600.0);
    EXPECT_EQ(range.key, 0u);
  }
  EXPECT_EQ(served, 1);  // accepted: 100 x 6
}

// A VCO with dividers is accepted by the M and D search where the ranking says so.
TEST_F(VcoRankingTest, AcceptedRangesAreThoseOfTheMAndDSearch) {
  const VcoRanking ranking = Rank("100 70 45", 3, 27.0);
  int accepted = 0;
  int refused = 0;
  for (double vco = 600.0; vco <= 1440.0; vco += 0.0173) {
    const ToleranceKey key = KeyByFit(vco, 3, true);
    const bool served = (key & 31u) != 27u && key >> 5 != 27u;
    double distance = 1e300;  // to the nearest accepted range with the key
    for (const RankedRange& range : ranking) {
      if (range.kind != Kind::kAccepted || range.IsPoint() || range.key != key) continue;
      distance = std::min(distance, std::max({range.low - vco, vco - range.high, 0.0}));
    }
    if (served && Accepted(vco, 27.0)) {
      ++accepted;
      EXPECT_EQ(distance, 0.0) << vco;
    } else {
      ++refused;
      EXPECT_GT(distance, 0.0) << vco;
    }
  }
  EXPECT_GT(accepted, 100);
  EXPECT_GT(refused, 100);
}

TEST_F(VcoRankingTest, NothingWhereNoVcoHasAnMAndAD) {
  EXPECT_TRUE(Rank("100 70", 2, 8.0).empty());  // the PFD needs 10 MHz
  const VcoRanking ranking = Rank("100 1500", 2);
  EXPECT_FALSE(ranking.empty());
  for (const RankedRange& range : ranking) EXPECT_EQ(range.kind, Kind::kUnserved);
}

// Limits that hardly a VCO keeps, as an odd device may have them. Whatever the fits and the M and D
// search make of them, the ranking foretells it: a VCO that they accept lies in an accepted range
// with its key, and where they accept none there is no such range.
TEST_F(VcoRankingTest, ForetellsWhatOddLimitsLeave) {
  int withAccepted = 0;
  int withoutAccepted = 0;
  const auto expectForetold = [&](const std::string& limits) {
    ++(ExpectForetold(limits) ? withAccepted : withoutAccepted);
  };
  for (const double odd : {engine_test::kNan, engine_test::kInfinity, -engine_test::kInfinity,
                           0.0, -5.0, 1e-320, 1e308}) {
    const std::string name = std::to_string(odd);
    PrepareForTwo();
    imp_.pllLimits.clkoutMin = odd;
    expectForetold("output minimum " + name);
    PrepareForTwo();
    imp_.pllLimits.clkoutMax = odd;
    expectForetold("output maximum " + name);
    PrepareForTwo();
    imp_.pll.minAdjVco = odd;
    expectForetold("VCO minimum " + name);
    PrepareForTwo();
    imp_.pll.maxAdjVco = odd;
    expectForetold("VCO maximum " + name);
  }
  // Of the 28, a minimum that is no number or above every VCO leaves none, and likewise a maximum.
  EXPECT_EQ(withAccepted, 12);
  EXPECT_EQ(withoutAccepted, 16);
}

}  // namespace
}  // namespace Ip::Pll
