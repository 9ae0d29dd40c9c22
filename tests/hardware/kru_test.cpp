#include "hardware/Kru.h"

#include <gtest/gtest.h>

namespace hardware {
namespace {

TEST(Kru, TheRatioOfEachPin) {
  const KruRatios whole{false, 3, 2, 5};
  EXPECT_EQ(PinRatio(Pin::kClk0, whole), Rational(1));
  EXPECT_EQ(PinRatio(Pin::kClk270, whole), Rational(1));
  EXPECT_EQ(PinRatio(Pin::kClk2x, whole), Rational(2));
  EXPECT_EQ(PinRatio(Pin::kClkdv, whole), Rational(2, 5));  // a divide of 2.5
  EXPECT_EQ(PinRatio(Pin::kClkfx180, whole), Rational(3, 2));
  const KruRatios halved{true, 3, 2, 8};
  EXPECT_EQ(PinRatio(Pin::kClk90, halved), Rational(1, 2));
  EXPECT_EQ(PinRatio(Pin::kClk2x180, halved), Rational(1));
  EXPECT_EQ(PinRatio(Pin::kClkdv, halved), Rational(1, 8));
  EXPECT_EQ(PinRatio(Pin::kClkfx, halved), Rational(3, 4));
  EXPECT_EQ(PinRatio(Pin::kClkfxdv, {false, 3, 2, 8}), Rational(3, 8));
}

TEST(Kru, ThePhaseOfEachPin) {
  EXPECT_EQ(PinPhase(Pin::kClk270, 0), Rational(270));
  EXPECT_EQ(PinPhase(Pin::kClkfx180, 17), Rational(204));  // 17 x 360 / 255 = 24
  EXPECT_EQ(PinPhase(Pin::kClk0, 255), Rational(0));
  EXPECT_EQ(PinPhase(Pin::kClk270, 85), Rational(30));     // 270 + 120 - 360
}

TEST(Kru, TheDutyCycleOfEachPin) {
  EXPECT_EQ(PinDuty(Pin::kClk2x, 0), Rational(50));
  EXPECT_EQ(PinDuty(Pin::kClkdv, 4), Rational(50));
  EXPECT_EQ(PinDuty(Pin::kClkdv, 5), Rational(40));  // 2 of 5 halves
  EXPECT_EQ(PinDuty(Pin::kClkdv, 15), Rational(140, 3));
  EXPECT_EQ(PinDuty(Pin::kClkfxdv, 4), Rational(50));
}

TEST(Kru, EachPinIsInTheTableOnce) {
  for (std::size_t i = 0; i < kPins.size(); ++i) {
    EXPECT_EQ(&FactsOf(kPins[i].pin), &kPins[i]);
    EXPECT_TRUE(kPins[i].is_sp || kPins[i].is_clkgen);
  }
}

}  // namespace
}  // namespace hardware
