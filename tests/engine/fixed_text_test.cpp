// Decimals against those of printf.

#include "engine/FixedText.h"

#include <gtest/gtest.h>

#include <cfenv>
#include <cmath>
#include <cstdint>
#include <limits>
#include <string>
#include <vector>

#include "engine/CLocale.h"
#include "tests/engine/fixed_text.h"

namespace {

using engine_test::FixedMismatch;

constexpr double kInfinity = std::numeric_limits<double>::infinity();

std::string Fixed3(double x) {
  char text[Ip::kLongestFixed];
  char* const end = Ip::WriteFixed3(x, text);
  return end == nullptr ? "left to printf" : std::string(text, end);
}

std::string Fixed6(double x) {
  char text[Ip::kLongestFixed];
  char* const end = Ip::WriteFixed6(x, text);
  return end == nullptr ? "left to printf" : std::string(text, end);
}

// Neither of them is a tie as a double: 0.0005 is a little above, 0.0015 a little below half.
TEST(FixedText, RoundsTheNumberAndNotItsDecimal) {
  EXPECT_EQ(Fixed3(0.0005), "0.001");
  EXPECT_EQ(Fixed3(std::nextafter(0.0005, 0.0)), "0.000");
  EXPECT_EQ(Fixed3(1.0005), "1.000");
  EXPECT_EQ(Fixed3(2.0015), "2.002");
}

// 1/16 is 62.5 thousandths, and 3/16 are 187.5.
TEST(FixedText, RoundsHalvesToEven) {
  EXPECT_EQ(Fixed3(0.0625), "0.062");
  EXPECT_EQ(Fixed3(0.1875), "0.188");
  EXPECT_EQ(Fixed3(-0.0625), "-0.062");
  EXPECT_EQ(Fixed3(1048576.0625), "1048576.062");
  EXPECT_EQ(Fixed3(std::nextafter(0.0625, 1.0)), "0.063");
  EXPECT_EQ(Fixed3(std::nextafter(0.1875, 0.0)), "0.187");
  EXPECT_EQ(Fixed6(0.0078125), "0.007812");  // 7812.5 millionths
  EXPECT_EQ(Fixed6(0.0234375), "0.023438");  // 23437.5
}

TEST(FixedText, CarriesIntoTheWholeNumber) {
  EXPECT_EQ(Fixed3(0.9996), "1.000");
  EXPECT_EQ(Fixed3(999.9995), "1000.000");
  EXPECT_EQ(Fixed3(9999999.99951), "10000000.000");
  EXPECT_EQ(Fixed6(99.9999999), "100.000000");
}

TEST(FixedText, KeepsTheSignOfNothing) {
  EXPECT_EQ(Fixed3(0.0), "0.000");
  EXPECT_EQ(Fixed3(-0.0), "-0.000");
  EXPECT_EQ(Fixed3(-0.0001), "-0.000");
  EXPECT_EQ(Fixed6(-std::numeric_limits<double>::denorm_min()), "-0.000000");
  EXPECT_EQ(Fixed6(std::numeric_limits<double>::min()), "0.000000");
}

TEST(FixedText, LeavesTheRestToPrintf) {
  EXPECT_EQ(Fixed3(std::nextafter(0x1p63, 0.0)), "9223372036854774784.000");
  for (const double x : {0x1p63, 1e300, std::numeric_limits<double>::max(), kInfinity}) {
    EXPECT_EQ(Fixed3(x), "left to printf") << x;
    EXPECT_EQ(Fixed3(-x), "left to printf") << x;
    EXPECT_EQ(Fixed6(x), "left to printf") << x;
  }
  EXPECT_EQ(Fixed3(std::numeric_limits<double>::quiet_NaN()), "left to printf");
}

// printf rounds as the processor does.
TEST(FixedText, LeavesOtherRoundingsToPrintf) {
  for (const int rounding : {FE_UPWARD, FE_DOWNWARD, FE_TOWARDZERO}) {
    ASSERT_EQ(std::fesetround(rounding), 0);
    const std::string text = Fixed3(1.0);
    std::fesetround(FE_TONEAREST);
    EXPECT_EQ(text, "left to printf");
  }
}

// Every power of two and every half of a last digit, with their neighbours.
TEST(FixedText, IsThatOfPrintfWhereRoundingIsHard) {
  const Ip::CLocale cLocale;
  std::vector<double> hard;
  for (int exponent = -1074; exponent <= 63; ++exponent) hard.push_back(std::ldexp(1.0, exponent));
  for (int k = 1; k < 4000; ++k) {
    hard.push_back((k + 0.5) / 1e3);
    hard.push_back((k + 0.5) / 1e6);
    hard.push_back(k / 16.0);
    hard.push_back(k / 128.0);
    hard.push_back(k + 0.0625);
    hard.push_back(k * 1048576.0 + 0.4995);
    hard.push_back(k * 1e12 + 0.5 / 16.0);
  }
  for (const double x : hard) {
    for (const double near : {x, std::nextafter(x, kInfinity), std::nextafter(x, -kInfinity)}) {
      ASSERT_EQ(FixedMismatch(near), "");
      ASSERT_EQ(FixedMismatch(-near), "");
    }
  }
}

TEST(FixedText, IsThatOfPrintfForDrawnNumbers) {
  const Ip::CLocale cLocale;
  EXPECT_EQ(engine_test::FirstDrawnMismatch(1000000), "");
}

}  // namespace
