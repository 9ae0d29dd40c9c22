#include "hardware/Kru.h"

#include <gtest/gtest.h>

namespace hardware {
namespace {

TEST(Kru, HasTheRatioOfEachPin) {
  EXPECT_EQ(PinRatio(Pin::kClkfx, {true, 3, 2, 0}), Rational(3, 4));
}

}  // namespace
}  // namespace hardware
