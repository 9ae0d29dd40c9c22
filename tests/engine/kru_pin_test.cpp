// Tests of the pin codes and their names.

#include <gtest/gtest.h>

#include <climits>
#include <cstdint>
#include <string>

#include "engine/kru/KruPin.h"

namespace {

using Ip::KruPin;

std::string NameOf(std::int32_t code) {
  return Ip::KruPinName(static_cast<KruPin>(code)).CStr();
}

// Scripts see the names, and index 6 of the accessors the codes of another list: neither may
// move.
TEST(KruPinTest, EveryCodeHasItsName) {
  EXPECT_EQ(NameOf(0), "NONE");
  EXPECT_EQ(NameOf(1), "CLK0");
  EXPECT_EQ(NameOf(2), "CLK90");
  EXPECT_EQ(NameOf(3), "CLK180");
  EXPECT_EQ(NameOf(4), "CLK270");
  EXPECT_EQ(NameOf(5), "CLKDV");
  EXPECT_EQ(NameOf(6), "CLK2X");
  EXPECT_EQ(NameOf(7), "CLK2X180");
  EXPECT_EQ(NameOf(8), "CLKFX");
  EXPECT_EQ(NameOf(9), "CLKFX180");
  EXPECT_EQ(NameOf(10), "CLKFXDV");
}

TEST(KruPinTest, AnyOtherCodeIsNone) {
  for (const std::int32_t code : {-1, 11, 12, 255, 256, 264, INT_MIN, INT_MAX}) {
    EXPECT_EQ(NameOf(code), "NONE") << code;
  }
}

TEST(KruPinTest, TheNamedConstantsHaveTheirCodes) {
  EXPECT_EQ(static_cast<int>(KruPin::NONE), 0);
  EXPECT_EQ(static_cast<int>(KruPin::CLK0), 1);
  EXPECT_EQ(static_cast<int>(KruPin::CLK90), 2);
  EXPECT_EQ(static_cast<int>(KruPin::CLK180), 3);
  EXPECT_EQ(static_cast<int>(KruPin::CLK270), 4);
  EXPECT_EQ(static_cast<int>(KruPin::CLKDV), 5);
  EXPECT_EQ(static_cast<int>(KruPin::CLK2X), 6);
  EXPECT_EQ(static_cast<int>(KruPin::CLK2X180), 7);
  EXPECT_EQ(static_cast<int>(KruPin::CLKFX), 8);
  EXPECT_EQ(static_cast<int>(KruPin::CLKFX180), 9);
  EXPECT_EQ(static_cast<int>(KruPin::CLKFXDV), 10);
  EXPECT_EQ(sizeof(KruPin), 4u);
}

}  // namespace
