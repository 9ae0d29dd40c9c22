#include "hardware/Loop.h"

#include <gtest/gtest.h>

namespace hardware {
namespace {

// Divider 4: steps of 360 / 32 = 11.25 degrees.
TEST(Loop, TakesTheNearestPhaseStep) {
  EXPECT_EQ(PhaseOfStep(NearestPhaseStep(100, 4 * kEighths), 4 * kEighths), Rational(405, 4));
}

}  // namespace
}  // namespace hardware
