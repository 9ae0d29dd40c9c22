// The keys of VCO frequencies.

#include "engine/pll/filter/ToleranceKey.h"

#include <gtest/gtest.h>

#include "tests/engine/EngineTest.h"
#include "tests/support/FakeHost.h"

namespace Ip::Pll {
namespace {

TEST(KeyDigits, TheFirstDigitIsTheHighest) {
  KeyDigits digits;
  digits.Append(1);
  digits.Append(26);
  EXPECT_EQ(digits.key, 1u * 32 + 26);
  EXPECT_TRUE(digits.isServed);
}

TEST(KeyDigits, BehindAnOutputWithoutDividerTheyAreZero) {
  KeyDigits digits;
  for (const int digit : {3, kTolerances, 5}) digits.Append(digit);
  EXPECT_EQ(digits.key, (3u * 32 + 27) * 32);
  EXPECT_FALSE(digits.isServed);
}

// A TSYN with outputs from 4.6875 to 800 MHz. 600 MHz is 6 times 100 MHz exactly; 70 MHz divides it
// by 9, which gives 66.67 MHz, 4.8 percent too little; and 800.5 MHz divides it by 1, 25.05 percent
// too little. 900 MHz is above what an output may have, and 70 MHz divides it by 13: 1.1 percent.
TEST(KeyOf, ReadsTheTolerancesOfTheFits) {
  FakeHost::Instance().Reset();
  SetTsyn("keys", {});
  VorkelImp& imp = engine_test::NewImp();
  imp.SetDevice("keys");
  const Trace trace(false);
  const Pll::Run run = {100.0, 4, kTsyn, trace};
  ASSERT_EQ(PrepareVcoRange(imp, "100 100 70 800.5", 0.0, run), kSolved);
  EXPECT_EQ(KeyOf(imp, run, 600.0).key, (0u * 32 + 5) * 32 + 26);
  EXPECT_TRUE(KeyOf(imp, run, 600.0).isServed);
  EXPECT_EQ(KeyOf(imp, run, engine_test::Above(600.0)).key, (1u * 32 + 5) * 32 + 26);
  EXPECT_EQ(KeyOf(imp, run, 900.0).key, (0u * 32 + 2) * 32 + 27);
  EXPECT_FALSE(KeyOf(imp, run, 900.0).isServed);
  EXPECT_EQ(KeyOf(imp, {100.0, 1, kTsyn, trace}, 900.0), KeyDigits{});
}

}  // namespace
}  // namespace Ip::Pll
