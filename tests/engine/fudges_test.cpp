// The table of the fudges against the sums that it stands for.

#include "engine/pll/Fudges.h"

#include <gtest/gtest.h>

namespace {

TEST(Fudges, AreTheSumsOfTheirSteps) {
  volatile double fudge = 0.0;  // so that nothing is added up in advance
  for (int pass = 0; pass <= Ip::Pll::kPasses; ++pass) {
    ASSERT_EQ(Ip::Pll::FudgeOf(pass), fudge) << pass;
    fudge = fudge + 0.001;
  }
}

TEST(Fudges, EndAtElevenMHz) {
  EXPECT_EQ(Ip::Pll::FudgeOf(0), 0.0);
  EXPECT_NEAR(Ip::Pll::FudgeOf(Ip::Pll::kPasses - 1), 10.999, 1e-9);
  EXPECT_LE(Ip::Pll::FudgeOf(Ip::Pll::kPasses - 1), 10.999);
  EXPECT_GT(Ip::Pll::FudgeOf(Ip::Pll::kPasses), 10.999);
}

}  // namespace
