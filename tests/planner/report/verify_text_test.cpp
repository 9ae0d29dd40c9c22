// What is wrong in a plan, as sentences.
#include <gtest/gtest.h>

#include "planner/report/VerifyText.h"

namespace planner::report {

namespace {

using verify::Discrepancy;
using verify::DiscrepancyKind;

Discrepancy Of(DiscrepancyKind kind, const std::string& found, const std::string& expected) {
  return {.kind = kind,
          .path = "answers[0].d",
          .found = found,
          .expected = expected,
          .line = 3,
          .column = 7};
}

std::string Text(const Discrepancy& one) { return DiscrepancyText(one, "plan.json"); }

TEST(VerifyText, EachKindHasASentence) {
  EXPECT_EQ(Text(Of(DiscrepancyKind::kDiffers, "2", "1")),
            "plan.json:3:7: answers[0].d is 2, should be 1");
  EXPECT_EQ(Text(Of(DiscrepancyKind::kContradicts, "2", "1")),
            "plan.json:3:7: answers[0].d is 2, should be 1 as all else of it says");
  EXPECT_EQ(Text(Of(DiscrepancyKind::kMissing, "", "1")),
            "plan.json:3:7: answers[0].d is missing: 1");
  EXPECT_EQ(Text(Of(DiscrepancyKind::kUnknown, "2", "")),
            "plan.json:3:7: answers[0].d should not be there");
  EXPECT_EQ(Text(Of(DiscrepancyKind::kWrongType, "\"2\"", "number")),
            "plan.json:3:7: answers[0].d must be number, not \"2\"");
  EXPECT_EQ(Text(Of(DiscrepancyKind::kNoSetting, "81", "1 to 80")),
            "plan.json:3:7: answers[0].d cannot be 81: it must be 1 to 80");
  EXPECT_EQ(Text(Of(DiscrepancyKind::kAbsurd, "1e999", "1")),
            "plan.json:3:7: answers[0].d is no number that can be right: it is 1");
  EXPECT_EQ(Text(Of(DiscrepancyKind::kMisplaced, "object", "3")),
            "plan.json:3:7: answers[0].d is not in the order of the ranking, where it has "
            "number 3");
}

TEST(VerifyText, SettingsThatRankBefore) {
  Discrepancy one = Of(DiscrepancyKind::kRanksBefore, "object", "");
  LoopSettings set;
  set.m = 499;
  set.d = 3;
  set.outputs = {{.divider = 32}, {}, {.divider = 64}};
  one.settings = set;
  EXPECT_EQ(Text(one),
            "plan.json:3:7: answers[0].d is not what its number says: PLL with M 62.375, D 3 and "
            "dividers 4 and 8 has that place");
}

TEST(VerifyText, MistakesAreThoseOfTheReader) {
  Discrepancy one = Of(DiscrepancyKind::kNotJson, "", "");
  read::Mistake mistake;
  mistake.kind = read::MistakeKind::kSyntax;
  mistake.fault = read::SyntaxFault::kTextNotClosed;
  mistake.place.line = 3;
  mistake.place.column = 7;
  one.mistake = mistake;
  EXPECT_EQ(Text(one).substr(0, 14), "plan.json:3:7:");
}

TEST(VerifyText, WhatIsFoundStaysOnALine) {
  const std::string text = Text(Of(DiscrepancyKind::kDiffers, std::string(1000, '9') + "\n", "1"));
  EXPECT_LT(text.size(), 200u);
  EXPECT_EQ(text.find('\n'), std::string::npos);
}

TEST(VerifyText, TheWholeCounts) {
  EXPECT_EQ(VerifyText({}, "plan.json", {}), "every number is right\n");
  const Discrepancy one = Of(DiscrepancyKind::kDiffers, "2", "1");
  EXPECT_EQ(VerifyText({one}, "plan.json", {}), Text(one) + "\n1 entry is wrong\n");
  EXPECT_EQ(VerifyText({one, one}, "plan.json", {}),
            Text(one) + "\n" + Text(one) + "\n2 entries are wrong\n");
}

}  // namespace

}  // namespace planner::report
