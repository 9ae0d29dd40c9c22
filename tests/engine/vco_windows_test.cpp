#include "engine/pll/filter/VcoWindows.h"

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

  VcoWindows Windows(double inFreq = 100.0) {
    const Pll::Run run = {inFreq, 1, kTsyn, trace_};
    EXPECT_EQ(PrepareVcoRange(imp_, "100", 0.0, run), kSolved);
    return FindVcoWindows(imp_, run);
  }

  bool Accepted(double vco, double inFreq = 100.0) {
    VcoCandidate candidate{};
    candidate.vco = vco;
    return SearchMAndD(candidate, imp_.pllLimits.pfdMin, PfdMax(), true,
                       {inFreq, 1, kTsyn, trace_});
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
  const VcoWindows windows = Windows();
  ASSERT_FALSE(windows.empty());
  EXPECT_NEAR(windows.front().low, 600.0, 1e-5);
  EXPECT_NEAR(windows.front().high, 600.30015, 1e-4);
  EXPECT_TRUE(Holds(windows, 600.0));
  EXPECT_FALSE(Holds(windows, 601.0));
}

TEST_F(VcoWindowsTest, RisesWithoutOverlaps) {
  const VcoWindows windows = Windows();
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
      const VcoWindows windows = Windows(inFreq);
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

TEST_F(VcoWindowsTest, NothingWithoutAnInputFrequency) {
  const Pll::Run run = {-100.0, 1, kTsyn, trace_};
  EXPECT_TRUE(FindVcoWindows(imp_, run).empty());
}

}  // namespace
}  // namespace Ip::Pll
