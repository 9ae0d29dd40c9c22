// Tests of the calculator's pin codes.

#include <gtest/gtest.h>

#include <set>
#include <string>
#include <utility>
#include <vector>

#include "engine/timing/PinCode.h"

namespace {

using Ip::CalculatorPinCode;

constexpr int kUnknown = 12;

const std::vector<std::pair<std::string, int>> kPins = {
    {"CLK0", 1},     {"CLK90", 2}, {"CLK180", 3},   {"CLK270", 4}, {"CLK2X", 5},
    {"CLK2X180", 7}, {"CLKFX", 8}, {"CLKFX180", 9}, {"CLKDV", 10},
};

int CodeOf(const std::string& pin) { return CalculatorPinCode(Port::StringBase(pin)); }

TEST(CalculatorPinCode, OfEveryPin) {
  for (const auto& [pin, code] : kPins) EXPECT_EQ(CodeOf(pin), code) << pin;
}

TEST(CalculatorPinCode, OfAnyOtherTextIs12) {
  for (const char* text :
       {"", "NONE", "CLKFXDV", "CLK", "CLK0 ", " CLK0", "CLK00", "clk0", "Clk2x", "CLK2X90",
        "CLK2X270", "CLKFX90", "CLKDV180", "1", "12", "CLK0\n", "true"}) {
    EXPECT_EQ(CodeOf(text), kUnknown) << '"' << text << '"';
  }
  EXPECT_EQ(CodeOf(std::string("CLK0\0", 5)), kUnknown);
  EXPECT_EQ(CodeOf(std::string(100000, 'C')), kUnknown);
}

// Part of each name is no name, and neither is a name with more behind it.
TEST(CalculatorPinCode, TakesWholeNamesOnly) {
  std::set<std::string> names;
  for (const auto& [pin, code] : kPins) names.insert(pin);
  for (const std::string& name : names) {
    const std::string shorter = name.substr(0, name.size() - 1);
    if (!names.contains(shorter)) {
      EXPECT_EQ(CodeOf(shorter), kUnknown) << shorter;
    }
    EXPECT_EQ(CodeOf(name + "X"), kUnknown) << name;
  }
}

TEST(CalculatorPinCode, Never6Or11) {
  std::set<int> codes;
  for (const auto& [pin, code] : kPins) codes.insert(CodeOf(pin));
  EXPECT_EQ(codes, (std::set<int>{1, 2, 3, 4, 5, 7, 8, 9, 10}));
}

}  // namespace
