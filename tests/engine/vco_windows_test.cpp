#include "engine/pll/VcoWindows.h"

#include <gtest/gtest.h>

#include "tests/engine/EngineTest.h"
#include "tests/support/FakeHost.h"

namespace Ip::Pll {
namespace {

// A prepared run: 100 MHz into a TSYN with a VCO of 600 to 1440 MHz and a PFD of 10 to 500 MHz.
class VcoWindowsTest : public testing::Test {
 protected:
  VcoWindowsTest() {
    FakeHost::Instance().Reset();
    SetTsyn("windows", {});
    imp_.SetDevice("windows");
  }

  VcoWindows Windows(const char* outFreqs, int count, double inFreq = 100.0) {
    const Pll::Run run = {inFreq, count, kTsyn, trace_};
    VorkelImp::_prim = kTsyn;
    EXPECT_EQ(PrepareVcoRange(imp_, outFreqs, 0.0, run), kSolved);
    return FindVcoWindows(imp_, run);
  }

  bool Accepted(double vco, double inFreq = 100.0) {
    VcoCandidate candidate{};
    candidate.vco = vco;
    return SearchMAndD(candidate, inFreq, imp_.pllLimits.pfdMin, PfdMax(), true, trace_);
  }

  double PfdMax() const {
    return imp_.lowBandwidth ? imp_.pllLimits._maxPfdLowB : imp_.pllLimits.pfdMax;
  }

  static bool Holds(const VcoWindows& windows, double vco) {
    for (const VcoWindow& window : windows) {
      if (window.low <= vco && vco <= window.high) return true;
    }
    return false;
  }

  Trace trace_{false};
  VorkelImp& imp_ = engine_test::NewImp();
};

// M = 6, D = 1 accepts 100 x 6 / 1.0005 = 599.70015 to 100 x 6 / 0.9995 = 600.30015 MHz, of
// which the VCO range cuts off what is below 600. M / D = 6.01 would need a D of 100.
TEST_F(VcoWindowsTest, FirstWindowIsThatOfSixAndOne) {
  const VcoWindows windows = Windows("100", 1);
  ASSERT_FALSE(windows.empty());
  EXPECT_NEAR(windows.front().low, 600.0, 1e-5);
  EXPECT_NEAR(windows.front().high, 600.30015, 1e-4);
  EXPECT_TRUE(Holds(windows, 600.0));
  EXPECT_FALSE(Holds(windows, 601.0));
}

TEST_F(VcoWindowsTest, RisesWithoutOverlaps) {
  const VcoWindows windows = Windows("100", 1);
  for (std::size_t i = 0; i < windows.size(); ++i) {
    EXPECT_LE(windows[i].low, windows[i].high);
    if (i > 0) {
      EXPECT_GT(windows[i].low, windows[i - 1].high);
    }
  }
}

// Outer bound: no VCO outside the windows is accepted; and no wider than it has to be: halfway
// in each window one is.
TEST_F(VcoWindowsTest, HoldsWhatTheSearchAcceptsAndLittleElse) {
  for (const double inFreq : {100.0, 27.0, 33.333, 300.0, 12.288}) {
    for (const bool low : {false, true}) {
      imp_.SetLowBandwidth(low);
      const VcoWindows windows = Windows("100", 1, inFreq);
      int accepted = 0;
      for (double vco = 600.0; vco <= 1440.0; vco += 0.0107) {
        if (!Accepted(vco, inFreq)) continue;
        ++accepted;
        EXPECT_TRUE(Holds(windows, vco)) << inFreq << " MHz, VCO " << vco;
      }
      EXPECT_GT(accepted, 0) << inFreq;
      for (const VcoWindow& window : windows) {
        if (window.high - window.low < 1e-5) continue;  // nothing but margin
        EXPECT_TRUE(Accepted(0.5 * (window.low + window.high), inFreq)) << inFreq;
      }
    }
  }
}

// 1500 MHz needs a VCO of 1500 x 0.74 = 1110 MHz and more (divider 1), and is above the highest
// output frequency of 800 MHz unless the output is as low as that.
TEST_F(VcoWindowsTest, NothingForAnOutputThatNoVcoServes) {
  EXPECT_TRUE(Windows("100 1500", 2).empty());
  // 1000 x 0.74 = 740 MHz is an output that 800 MHz allows.
  const VcoWindows windows = Windows("100 1000", 2);
  ASSERT_FALSE(windows.empty());
  EXPECT_GE(windows.front().low, 739.9);
  EXPECT_LE(windows.back().high, 800.1);
}

TEST_F(VcoWindowsTest, NothingWithoutAnInputFrequency) {
  const Pll::Run run = {-100.0, 1, kTsyn, trace_};
  EXPECT_TRUE(FindVcoWindows(imp_, run).empty());
}

// Divider 2 of 400 MHz: within 1 percent, 792 to 808 MHz, cut at 800 MHz times 2; divider 1
// would be 396 to 404 MHz.
TEST_F(VcoWindowsTest, WindowsOfOneOutput) {
  Windows("100 400", 2);
  VcoWindows windows;
  FindOutputWindows(imp_, 1, 1, windows);
  ASSERT_GE(windows.size(), 2u);
  EXPECT_NEAR(windows[0].low, 396.0, 1e-5);
  EXPECT_NEAR(windows[0].high, 404.0, 1e-5);
  EXPECT_NEAR(windows[1].low, 792.0, 1e-5);
  EXPECT_NEAR(windows[1].high, 808.0, 1e-5);
}

TEST(VcoWindowsIntersect, TakesWhatBothHave) {
  VcoWindows common;
  Intersect({{1, 3}, {5, 9}}, {{2, 6}, {7, 8}, {10, 11}}, common);
  ASSERT_EQ(common.size(), 3u);
  EXPECT_EQ(common[0].low, 2);
  EXPECT_EQ(common[0].high, 3);
  EXPECT_EQ(common[1].low, 5);
  EXPECT_EQ(common[1].high, 6);
  EXPECT_EQ(common[2].low, 7);
  EXPECT_EQ(common[2].high, 8);
}

}  // namespace
}  // namespace Ip::Pll
