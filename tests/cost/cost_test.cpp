// No call takes longer than usual on a device of which `check` warns nothing, and of those on which
// calls do it warns. Work is counted (Blocks.h).
//
// VORKEL_TEST_LONG in the environment asks for more devices and longer climbs.

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <cstdlib>

#include "engine/Ip_VorkelImp.h"
#include "tests/compare/KruGenerator.h"
#include "tests/engine/EngineTest.h"
#include "tests/cost/Blocks.h"
#include "tests/cost/Climb.h"
#include "tests/cost/CountedCalls.h"
#include "tests/cost/Device.h"

namespace cost {
namespace {

int Times(int normal, int inLong) {
  return std::getenv("VORKEL_TEST_LONG") == nullptr ? normal : inLong;
}

double Millions(std::uint64_t work) { return static_cast<double>(work) / 1e6; }

// The most work that `climbs` climbs find on a device.
Summit MostOn(const Device& device, int firstNumber, int climbs, int steps,
              Clocks clocks = Clocks::kAboveZero) {
  Summit most;
  for (int i = 0; i < climbs; ++i) {
    const Summit summit = Climb(device, firstNumber + i, steps, clocks);
    if (summit.work > most.work) most = summit;
  }
  return most;
}

TEST(Cost, IsCountedAndTheSameEachTime) {
  Device device;
  device.limits.vcoTarget = 1000;
  const plain::PllRequest request = Climb(device, 0, 0).drawn.request;
  CountedCalls calls(FileOf(device));
  calls.WorkOf(request);  // makes what is made once
  const std::uint64_t once = calls.WorkOf(request);
  EXPECT_GT(once, 10'000u);
  EXPECT_EQ(calls.WorkOf(request), once);
}

TEST(Cost, OfTheBundledDevicesIsAsUsual) {
  std::uint64_t most = 0;
  int devices = 0;
  for (const char* const name : {"vk10", "vk20", "vk40"}) {
    const std::string path = std::string(BUNDLED_DEVICES) + "/" + name + ".toml";
    for (const Device& device : ReadDevices(path, name)) {
      ++devices;
      EXPECT_TRUE(Check(device).isAccepted) << FileOf(device);
      const Summit summit = MostOn(device, 0, Times(4, 8), Times(25, 400));
      EXPECT_LT(summit.work, kUsual) << Describe(summit.drawn);
      EXPECT_LT(AskForNoPhase(device).work, kUsual) << FileOf(device);
      const Summit odd = MostOn(device, 16, Times(4, 8), Times(25, 400), Clocks::kBelowZeroToo);
      EXPECT_LT(odd.work, kUsual) << Describe(odd.drawn);
      most = std::max({most, summit.work, odd.work});
    }
  }
  EXPECT_EQ(devices, 6);  // a PLL, a TSYN, and both in two grades
  EXPECT_GT(most, kUsual / 4);  // else these were not the slow ones
  std::printf("%.1f million blocks at the most\n", Millions(most));
}

// Limits as odd as they can be without a warning.
TEST(Cost, OfDevicesThatCheckAcceptsIsAsUsual) {
  std::uint64_t most = 0;
  int accepted = 0;
  for (int i = 0; i < Times(60, 500); ++i) {
    compare::Random random(static_cast<unsigned>(i) + 1000);
    const Device device = DrawDevice(random.OneIn(2) ? 300 : 10, 10'000, random);
    if (!Check(device).isAccepted) continue;
    ++accepted;
    Summit summit = MostOn(device, i, 2, Times(10, 150));
    EXPECT_LT(summit.work, kUsual) << Describe(summit.drawn);
    most = std::max(most, summit.work);
    summit = AskForNoPhase(device);
    EXPECT_LT(summit.work, kUsual) << Describe(summit.drawn);
    most = std::max(most, summit.work);
  }
  EXPECT_GT(accepted, Times(20, 200));
  std::printf("%d devices, %.1f million blocks at the most\n", accepted, Millions(most));
}

// Limits of any size: where a call is longer, there is a warning of just that.
TEST(Cost, OfMoreThanUsualIsWarnedOf) {
  int longer = 0;
  for (int i = 0; i < Times(30, 300); ++i) {
    compare::Random random(static_cast<unsigned>(i) + 5000);
    const bool isSlow = random.OneIn(2);
    const Device device = DrawDevice(isSlow ? 0.5 : 300, isSlow ? 100 : 100'000, random);
    const Summit summit = isSlow ? MostOn(device, 17, 5, Times(1, 50)) : AskForNoPhase(device);
    if (summit.work < kUsual) continue;
    ++longer;
    EXPECT_TRUE(Check(device).isLong) << Describe(summit.drawn);
  }
  EXPECT_GE(longer, Times(2, 20));  // else the warning would be of nothing
  std::printf("%d devices with longer calls\n", longer);
}

// The bounds of the warning leave what is usual on their one side, and the work grows beyond them.
TEST(Cost, GrowsBeyondTheBoundsOfTheWarning) {
  const auto withVco = [](double vcoMin, double vcoMax) {
    Device device;
    plain::PllLimits& limits = device.limits;
    limits.vcoMin = vcoMin;
    limits.vcoMax = vcoMax;
    limits.vcoTarget = vcoMin;
    limits.clkoutMin = vcoMin / 128;
    limits.clkoutMax = limits.clkoutMaxIo = vcoMax;
    limits.pfdMin = vcoMin / 60;
    limits.pfdMax = limits.maxPfdLowB = vcoMax;
    return device;
  };
  const Device usual = withVco(10, 10'000);
  EXPECT_TRUE(Check(usual).isAccepted);
  EXPECT_LT(AskForNoPhase(usual).work, kUsual);
  EXPECT_LT(MostOn(usual, 0, 8, 3).work, kUsual);
  const Device fast = withVco(300, 30'000);
  EXPECT_TRUE(Check(fast).isLong);
  EXPECT_GT(AskForNoPhase(fast).work, kUsual);
  const Device slow = withVco(0.5, 1.35);
  EXPECT_TRUE(Check(slow).isLong);
  EXPECT_GT(MostOn(slow, 20, 1, 300).work, kUsual);
}

// The search of a KRU has at most 32 values of M and D, whatever the limits are.
TEST(Cost, OfAKruIsLittle) {
  std::uint64_t most = 0;
  for (int i = 0; i < 500; ++i) {
    compare::Random random(static_cast<unsigned>(i));
    const compare::KruCase drawn = compare::DrawKruCase(random);
    most = std::max(most, CountedCalls(FileOf(drawn)).WorkOf(drawn));
  }
  EXPECT_GT(most, 100u);
  EXPECT_LT(most, kUsual / 100);
}

// Steps of phases and duty cycles, of dividers and requests of all sizes, and of counts that a
// device file can have.
TEST(Cost, OfStepsIsLittle) {
  Ip::VorkelImp& imp = engine_test::NewImp();
  std::uint64_t most = 0;
  for (int i = 0; i < 20'000; ++i) {
    compare::Random random(static_cast<unsigned>(i));
    const auto number = [&random] {
      const double size = std::pow(10.0, random.Real(-300, 300));
      const double usual = random.Real(-400, 400);
      return random.OneIn(2) ? usual : random.OneIn(2) ? size : -size;
    };
    const double divider = number();
    const double asked = number();
    imp.pllLimits.maxHighLowCount = number();
    const std::uint64_t before = Blocks();
    imp.TSYNCalculateActualPhase(&asked, &divider, false);
    imp.TSYNCalculateActualDutyCycle(&asked, &divider);
    most = std::max(most, Blocks() - before);
  }
  EXPECT_GT(most, 100u);
  EXPECT_LT(most, kUsual / 100);
}

}  // namespace
}  // namespace cost
