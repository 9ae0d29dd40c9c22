#include <gtest/gtest.h>

#include <set>
#include <string>

#include "host/bundled/device/KeywordTable.h"

namespace {

using Device::Keywords;

std::set<std::string> KeywordsOf(Device::Primitive primitive) {
  std::set<std::string> names;
  for (const Device::Keyword& keyword : Keywords()) {
    if ((keyword.primitives & primitive) != 0) names.emplace(keyword.name);
  }
  return names;
}

std::string Kru(const std::string& pin_and_feedback) {
  const std::size_t blank = pin_and_feedback.find(' ');
  return "D_KRU_" + pin_and_feedback.substr(0, blank) + "_CLKIN_DIVIDE_BY_2_FALSE_" +
         pin_and_feedback.substr(blank + 1);
}

TEST(KeywordTable, HasEachKeywordOnce) {
  std::set<std::string_view> names;
  for (const Device::Keyword& keyword : Keywords()) {
    EXPECT_TRUE(names.insert(keyword.name).second) << keyword.name;
    EXPECT_NE(keyword.primitives, 0U) << keyword.name;
  }
  EXPECT_EQ(names.size(), 31U);
}

TEST(KeywordTable, HasTheKeywordsOfThePll) {
  const std::set<std::string> expected = {
      "VCOCLK_FREQ_MIN", "VCOCLK_FREQ_MAX", "CLKOUT_FREQ_MIN_GCLK", "CLKOUT_FREQ_MAX_GCLK",
      "CLKPFD_FREQ_MIN", "CLKPFD_FREQ_MAX", "O_MAX_HT_LT",          "CLKOUT_FREQ_MAX_IOCLK"};
  EXPECT_EQ(KeywordsOf(Device::kPll), expected);
}

TEST(KeywordTable, HasTheKeywordsOfTheTsyn) {
  const std::set<std::string> expected = {
      "TSYN_VCOCLK_FREQ_MIN",    "TSYN_VCOCLK_FREQ_MAX", "TSYN_CLKOUT_FREQ_MIN",
      "TSYN_CLKOUT_FREQ_MAX",    "TSYN_CLKPFD_FREQ_MIN", "TSYN_CLKPFD_FREQ_MAX",
      "TSYN_VCOCLK_FREQ_TARGET", "O_MAX_HT_LT",          "TSYN_CLKPFD_FREQ_MAX_LBW"};
  EXPECT_EQ(KeywordsOf(Device::kTsyn), expected);
}

TEST(KeywordTable, HasTheKeywordsOfTheKruSp) {
  std::set<std::string> expected;
  for (const std::string pin : {"CLK0", "CLK90", "CLK2X", "CLKDV", "CLKFX"}) {
    expected.insert(Kru(pin + " CLK_FEEDBACK_1X_MINPERIOD"));
    expected.insert(Kru(pin + " CLK_FEEDBACK_1X_MAXPERIOD"));
  }
  for (const std::string pin : {"CLK0", "CLK90", "CLKDV"}) {
    expected.insert(Kru(pin + " CLK_FEEDBACK_2X_MINPERIOD"));
  }
  EXPECT_EQ(KeywordsOf(Device::kKruSp), expected);
}

TEST(KeywordTable, HasTheKeywordsOfTheKruClkgen) {
  const std::set<std::string> expected = {Kru("CLKFX CLK_FEEDBACK_1X_MINPERIOD"),
                                          Kru("CLKFX CLK_FEEDBACK_1X_MAXPERIOD"),
                                          Kru("CLKFXDV MAXPERIOD"), Kru("CLKFXDV MINPERIOD")};
  EXPECT_EQ(KeywordsOf(Device::kKruClkgen), expected);
}

TEST(KeywordTable, KnowsTheUnits) {
  for (const Device::Keyword& keyword : Keywords()) {
    const std::string_view unit = Device::UnitName(keyword.unit);
    if (keyword.name.ends_with("PERIOD")) {
      EXPECT_EQ(unit, "ns") << keyword.name;
    } else if (keyword.name.find("_FREQ_") != std::string_view::npos) {
      EXPECT_EQ(unit, "MHz") << keyword.name;
    } else {
      EXPECT_EQ(unit, "count") << keyword.name;
    }
  }
}

TEST(KeywordTable, FindsEveryKeywordAndNoOther) {
  for (std::size_t i = 0; i < Keywords().size(); ++i) {
    EXPECT_EQ(Device::FindKeyword(Keywords()[i].name), i);
  }
  EXPECT_EQ(Device::FindKeyword(""), std::nullopt);
  EXPECT_EQ(Device::FindKeyword("vcoclk_freq_min"), std::nullopt);
  EXPECT_EQ(Device::FindKeyword("VCOCLK_FREQ_MIN "), std::nullopt);
}

TEST(KeywordTable, NamesThePrimitivesInTheirOrder) {
  std::string names;
  for (const Device::Primitive primitive : Device::kPrimitives) {
    names += Device::PrimitiveName(primitive);
    names += ' ';
  }
  EXPECT_EQ(names, "PLL TSYN KRU_SP KRU_CLKGEN ");
}

}  // namespace
