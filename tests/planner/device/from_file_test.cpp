#include "planner/device/FromFile.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <stdexcept>

#include "hardware/Loop.h"
#include "host/Dly_SpeedController.h"
#include "host/bundled/device/DeviceCatalogue.h"
#include "host/bundled/device/DeviceFile.h"
#include "planner/device/SpeedData.h"

namespace {

using ::Device::DeviceFile;
using hardware::Bandwidth;
using hardware::Pin;
using hardware::Primitive;
using hardware::Range;
using hardware::Rational;
using testing::ElementsAre;

DeviceFile Bundled(const std::string& name) {
  const auto catalogue = ::Device::DeviceCatalogue::ListFolders({BUNDLED_DEVICES});
  return DeviceFile::Read(*catalogue.FindFile(name), name);
}

DeviceFile WithGrade(const std::string& figures) {
  return DeviceFile::Parse("device = \"dev\"\npackages = [\"p\"]\n[grade.1]\n" + figures,
                           "dev.toml", "dev");
}

const std::string kPll =
    "VCOCLK_FREQ_MIN = 400.1\nVCOCLK_FREQ_MAX = 1_080.3\nCLKOUT_FREQ_MIN_GCLK = 3.125\n"
    "CLKOUT_FREQ_MAX_GCLK = 4e2\nCLKOUT_FREQ_MAX_IOCLK = 1080.7\nCLKPFD_FREQ_MIN = 19.1\n"
    "CLKPFD_FREQ_MAX = 500.9\nO_MAX_HT_LT = 64\n";

const std::string kTsyn =
    "TSYN_VCOCLK_FREQ_MIN = 600.1\nTSYN_VCOCLK_FREQ_MAX = 1200.3\n"
    "TSYN_VCOCLK_FREQ_TARGET = 1000.7\nTSYN_CLKOUT_FREQ_MIN = 4.69\n"
    "TSYN_CLKOUT_FREQ_MAX = 800.1\nTSYN_CLKPFD_FREQ_MIN = 10.3\nTSYN_CLKPFD_FREQ_MAX = 450.9\n"
    "TSYN_CLKPFD_FREQ_MAX_LBW = 300.1\n";

std::string With(std::string text, const std::string& from, const std::string& to) {
  return text.replace(text.find(from), from.size(), to);
}

TEST(FromFile, TakesTheLimitsOfAPllExactly) {
  const planner::Device device = planner::device::FromFile(WithGrade(kPll), "p", "1");
  EXPECT_EQ(device.name, "dev");
  EXPECT_EQ(device.package, "p");
  EXPECT_EQ(device.grade, "1");
  EXPECT_EQ(device.part, "devp-1");
  EXPECT_THAT(device.primitives, ElementsAre(Primitive::kPll));
  EXPECT_FALSE(device.tsyn || device.kru_sp || device.kru_clkgen);
  EXPECT_FALSE(device.has_loop_jitter || device.has_kru_jitter);
  const planner::LoopLimits& pll = device.Loop(Primitive::kPll);
  EXPECT_EQ(pll.vco, (Range{Rational(4001, 10), Rational(10803, 10)}));
  EXPECT_EQ(pll.output, (Range{Rational(25, 8), 400}));
  EXPECT_EQ(pll.OutputOf(0), pll.output);
  EXPECT_EQ(pll.OutputOf(1), (Range{Rational(25, 8), Rational(10807, 10)}));
  EXPECT_EQ(pll.PfdOf(Bandwidth::kHigh), (Range{Rational(191, 10), Rational(5009, 10)}));
  EXPECT_EQ(pll.PfdOf(Bandwidth::kLow), (Range{Rational(191, 10), 300}));
  EXPECT_EQ(pll.max_count, 64);
  EXPECT_EQ(pll.vco_target, Rational(0));
}

TEST(FromFile, NeverHasALowPfdAboveTheUsualOne) {
  const auto low = [](const std::string& figures) {
    const planner::Device device = planner::device::FromFile(WithGrade(figures), "p", "1");
    return device.Loop(device.primitives.front()).pfd_low.highest;
  };
  EXPECT_EQ(low(With(kPll, "500.9", "299.9")), Rational(2999, 10));
  EXPECT_EQ(low(kTsyn + "O_MAX_HT_LT = 64\n"), Rational(3001, 10));
  EXPECT_EQ(low(With(kTsyn, "300.1", "460") + "O_MAX_HT_LT = 64\n"), Rational(4509, 10));
}

TEST(FromFile, TakesTheLimitsOfATsynExactly) {
  const planner::Device device =
      planner::device::FromFile(WithGrade(kTsyn + "O_MAX_HT_LT = 64\n"), "", "1");
  EXPECT_EQ(device.part, "dev-1");
  EXPECT_THAT(device.primitives, ElementsAre(Primitive::kTsyn));
  const planner::LoopLimits& tsyn = device.Loop(Primitive::kTsyn);
  EXPECT_EQ(tsyn.vco, (Range{Rational(6001, 10), Rational(12003, 10)}));
  EXPECT_EQ(tsyn.pfd, (Range{Rational(103, 10), Rational(4509, 10)}));
  EXPECT_EQ(tsyn.output, (Range{Rational(469, 100), Rational(8001, 10)}));
  EXPECT_EQ(tsyn.output_1, tsyn.output);
  EXPECT_EQ(tsyn.vco_target, Rational(10007, 10));
}

TEST(FromFile, CutsTheCountOff) {
  const auto count = [](const std::string& figure) {
    const planner::Device device = planner::device::FromFile(
        WithGrade(With(kPll, "O_MAX_HT_LT = 64", "O_MAX_HT_LT = " + figure)), "p", "1");
    return device.pll->max_count;
  };
  EXPECT_EQ(count("63.999999999999999999999"), 63);
  EXPECT_EQ(count("0.5"), 0);
  EXPECT_EQ(hardware::LargestDivider(count("1e300")), 128);
}

TEST(FromFile, HasThoseLimitsThatAreThere) {
  EXPECT_THAT(planner::device::FromFile(WithGrade(kPll + kTsyn), "p", "1").primitives,
              ElementsAre(Primitive::kPll, Primitive::kTsyn));
  EXPECT_THAT(planner::device::FromFile(WithGrade(kTsyn), "p", "1").primitives, ElementsAre());
}

// vk10: a period of 3.571 ns is 1000 / 3.571 MHz, 1000000 / 3571.
TEST(FromFile, TurnsPeriodsIntoFrequenciesExactly) {
  const planner::Device device = planner::device::FromFile(Bundled("vk10"), "b256", "1");
  EXPECT_EQ(device.part, "vk10b256-1");
  EXPECT_THAT(device.primitives,
              ElementsAre(Primitive::kPll, Primitive::kKruSp, Primitive::kKruClkgen));
  EXPECT_TRUE(device.has_loop_jitter && device.has_kru_jitter);
  const planner::PinLimits& sp = device.Pins(Primitive::kKruSp);
  EXPECT_EQ(sp.Of(Pin::kClk0, false), (Range{5, Rational(1000000, 3571)}));
  EXPECT_EQ(sp.Of(Pin::kClk180, false), (Range{5, Rational(1000000, 3571)}));
  EXPECT_EQ(sp.Of(Pin::kClk0, true), (Range{5, Rational(1000000, 5333)}));
  EXPECT_EQ(sp.Of(Pin::kClk90, false), (Range{5, 200}));
  EXPECT_EQ(sp.Of(Pin::kClk270, true), (Range{5, Rational(1000000, 5333)}));
  EXPECT_EQ(sp.Of(Pin::kClkdv, false), (Range{Rational(5, 16), Rational(1000000, 5333)}));
  EXPECT_EQ(sp.Of(Pin::kClkdv, true), (Range{Rational(5, 16), 125}));
  // These have no other limits with feedback from CLK2X.
  for (const bool feedback_2x : {false, true}) {
    EXPECT_EQ(sp.Of(Pin::kClk2x180, feedback_2x), (Range{10, Rational(1000000, 2667)}));
    EXPECT_EQ(sp.Of(Pin::kClkfx, feedback_2x), (Range{5, Rational(1000000, 2667)}));
  }
  const planner::PinLimits& clkgen = device.Pins(Primitive::kKruClkgen);
  EXPECT_EQ(clkgen.Of(Pin::kClkfx180, false), (Range{5, Rational(1000000, 2667)}));
  EXPECT_EQ(clkgen.Of(Pin::kClkfxdv, false), (Range{Rational(5, 32), Rational(1000000, 5333)}));
  EXPECT_EQ(clkgen.usual.size(), 2u);
}

// The exact limits are those of the engine, but for its rounding.
TEST(FromFile, HasTheSpeedDataOfItsGrade) {
  const DeviceFile file = Bundled("vk40");
  for (const std::string grade : {"1", "2"}) {
    const planner::Device device = planner::device::FromFile(file, "", grade);
    const planner::SpeedData& data = *device.speed_data;
    EXPECT_EQ(data.grade().name, grade);
    EXPECT_NEAR(data.controller()->GetBelDelay("VCOCLK_FREQ_MAX", nullptr) * 1e9,
                device.pll->vco.highest.ToDouble(), 1e-9);
    EXPECT_EQ(data.grade().Figure("VCOCLK_FREQ_MAX"), device.pll->vco.highest.ToDouble());
  }
}

TEST(FromFile, RefusesWhatTheFileDoesNotHave) {
  const DeviceFile file = WithGrade(kPll);
  EXPECT_THROW(planner::device::FromFile(file, "q", "1"), std::invalid_argument);
  EXPECT_THROW(planner::device::FromFile(file, "p", "2"), std::invalid_argument);
  EXPECT_THROW(planner::SpeedData(file, "2"), std::invalid_argument);
}

}  // namespace
