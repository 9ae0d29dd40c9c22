// Lines of a trace against those of printf.

#include "engine/LineText.h"

#include <gtest/gtest.h>

#include <array>
#include <climits>
#include <cstdarg>
#include <cstddef>
#include <cstdio>
#include <limits>
#include <string>

#include "engine/CLocale.h"

namespace {

constexpr char kNone[] = "left to printf";

// What WriteLine makes of a format in so much room.
[[gnu::format(printf, 2, 3)]] std::string Written(std::size_t room, const char* format, ...) {
  std::array<char, 1000> text;
  std::va_list arguments;
  va_start(arguments, format);
  const char* const end = Ip::WriteLine(text.data(), text.data() + room, format, arguments);
  va_end(arguments);
  return end == nullptr ? kNone : std::string(text.data(), static_cast<std::size_t>(end - text.data()));
}

// What printf makes of it, if WriteLine makes the same; else both.
template <typename... Arguments>
std::string Both(const char* format, Arguments... arguments) {
  const Ip::CLocale cLocale;
  std::array<char, 1000> text;
  // NOLINTNEXTLINE: the formats are those of the tests
  std::snprintf(text.data(), text.size(), format, arguments...);
  const std::string expected = text.data();
  const std::string written = Written(text.size(), format, arguments...);
  return written == expected ? expected : written + " in place of " + expected;
}

TEST(LineText, IsThatOfPrintf) {
  EXPECT_EQ(Both("DLL------- Calculating M and D\n"), "DLL------- Calculating M and D\n");
  EXPECT_EQ(Both(""), "");
  EXPECT_EQ(Both("%d%d", 1, -2), "1-2");
  EXPECT_EQ(Both("DLL - RK --> _prim = %d \n", -1), "DLL - RK --> _prim = -1 \n");
  EXPECT_EQ(Both("[%d, %d, %u]", INT_MIN, INT_MAX, UINT_MAX),
            "[-2147483648, 2147483647, 4294967295]");
  EXPECT_EQ(Both("pin %s%c", "CLK2X", 'T'), "pin CLK2XT");
  EXPECT_EQ(Both("%s|%s", "", "x"), "|x");
  EXPECT_EQ(Both("VCO = %f: M = %3.3f\n", 700.0, 0.0625), "VCO = 700.000000: M = 0.062\n");
  EXPECT_EQ(Both("%1.3f %2.3f %3.3f %4.3f %5.3f", 0.0, -0.0, 1e9, -1e9, 1.0),
            "0.000 -0.000 1000000000.000 -1000000000.000 1.000");
}

TEST(LineText, LeavesOtherConversionsToPrintf) {
  EXPECT_EQ(Written(1000, "%x", 10u), kNone);
  EXPECT_EQ(Written(1000, "%5d", 1), kNone);
  EXPECT_EQ(Written(1000, "%6.3f", 1.0), kNone);
  EXPECT_EQ(Written(1000, "%3.2f", 1.0), kNone);
  EXPECT_EQ(Written(1000, "100%%"), kNone);
  EXPECT_EQ(Written(1000, "%f", std::numeric_limits<double>::infinity()), kNone);
  EXPECT_EQ(Written(1000, "%3.3f and %d", 1e300, 1), kNone);
}

TEST(LineText, WritesNothingBehindItsRoom) {
  EXPECT_EQ(Written(5, "12345"), "12345");
  EXPECT_EQ(Written(4, "12345"), kNone);
  EXPECT_EQ(Written(4, "1%s", "234"), "1234");
  EXPECT_EQ(Written(4, "1%s", "2345"), kNone);
  EXPECT_EQ(Written(1, "%c", 'x'), "x");
  EXPECT_EQ(Written(0, "%c", 'x'), kNone);
  // Of numbers it wants room for the longest.
  EXPECT_EQ(Written(32, "%d", 1), "1");
  EXPECT_EQ(Written(31, "%d", 1), kNone);
  EXPECT_EQ(Written(31, "%f", 1.0), kNone);
}

}  // namespace
