#include <gtest/gtest.h>

#include "descriptions.h"
#include "planner/report/CheckText.h"
#include "planner/report/DoubtText.h"

namespace planner::report {
namespace {

using device::Checked;
using device::Doubt;
using device::DoubtKind;
using device::RangeOf;

Checked Good() {
  Checked checked;
  checked.description = Round();
  checked.description.grades.pop_back();
  return checked;
}

TEST(CheckText, AFileWithoutMistakes) {
  EXPECT_EQ(CheckText(Good(), "round.toml", {}),
            "round.toml: device round, packages p1, p2\n"
            "\n"
            "grade a     keywords\n"
            "PLL           8 of 8  yes, with jitter\n"
            "TSYN          1 of 9  left out\n"
            "KRU_SP       0 of 13  left out\n"
            "KRU_CLKGEN    0 of 4  left out\n");
}

TEST(CheckText, WhatThereIsNoDefaultFor) {
  Checked checked = Good();
  checked.description.default_package.reset();
  checked.description.default_grade.reset();
  EXPECT_NE(CheckText(checked, "f", {})
                .find("\nnote: there is no default_package: a part name must have the package\n"
                      "note: there is no default_grade: a part name must have the grade\n\n"),
            std::string::npos);
}

TEST(CheckText, WhatMissingKeywordsCost) {
  Checked checked = Good();
  device::GradeDescription& grade = checked.description.grades[0];
  grade.limits.erase(grade.limits.begin());  // VCOCLK_FREQ_MIN
  grade.primitives.clear();
  grade.has_loop_jitter = false;
  const std::string text = CheckText(checked, "f", {});
  EXPECT_NE(text.find("PLL           7 of 8  NO\n"), std::string::npos) << text;
  EXPECT_NE(text.find("\nmissing          unit  costs\nVCOCLK_FREQ_MIN  MHz   PLL\n"),
            std::string::npos)
      << text;
  EXPECT_NE(
      text.find("\nf: warning: grade a has all limits of no primitive: nothing can be planned "
                "for\n  it\n"),
      std::string::npos)
      << text;
}

TEST(CheckText, LimitsThatContradictEachOther) {
  Checked checked = Good();
  SetLimit(&checked.description, "a", "VCOCLK_FREQ_MIN", "6000");
  checked.doubts = device::Doubts(checked.description);
  const std::string text = CheckText(checked, "f.toml", {});
  EXPECT_NE(text.find("PLL           8 of 8  NO, there is no VCO frequency\n"), std::string::npos)
      << text;
  // The keyword is the second of the grade, which begins in line 10.
  EXPECT_NE(text.find("\nf.toml:11: warning: grade a: VCOCLK_FREQ_MIN, 6000, is above "
                      "VCOCLK_FREQ_MAX,\n  900: there is no VCO frequency\n"),
            std::string::npos)
      << text;
}

TEST(CheckText, LimitsThatCostNothing) {
  Checked checked = Good();
  SetLimit(&checked.description, "a", "O_MAX_HT_LT", "64.5");
  checked.doubts = device::Doubts(checked.description);
  const std::string text = CheckText(checked, "f.toml", {});
  EXPECT_NE(text.find("PLL           8 of 8  yes, with jitter; see below\n"), std::string::npos);
  EXPECT_NE(text.find("grade a: O_MAX_HT_LT, 64.5, is a count of VCO cycles and\n  should be a "
                      "whole number\n"),
            std::string::npos)
      << text;
}

device::Mistake MistakeAt(std::vector<device::Mistake::Place> places, const std::string& reason) {
  device::Mistake mistake;
  mistake.places = std::move(places);
  mistake.reason = reason;
  return mistake;
}

TEST(MistakesText, ALineForEachPlaceInTheirOrder) {
  Checked checked;
  checked.mistakes = {MistakeAt({{7, 14}, {19, 14}}, "must be a number"),
                      MistakeAt({{9, 1}}, "unknown keyword \"VCOCLK_FREQ_MNI\"")};
  checked.mistakes[1].kind = ::Device::NameKind::kKeyword;
  checked.mistakes[1].unknown = "VCOCLK_FREQ_MNI";
  checked.mistakes[1].known = {"VCOCLK_FREQ_MAX", "VCOCLK_FREQ_MIN"};
  EXPECT_EQ(MistakesText(checked, "f.toml", {}),
            "f.toml:7:14: must be a number\n"
            "f.toml:9:1: unknown keyword \"VCOCLK_FREQ_MNI\"; did you mean VCOCLK_FREQ_MIN?\n"
            "f.toml:19:14: must be a number\n");
}

TEST(MistakesText, TheSameAtManyPlacesIsToldOnce) {
  Checked checked;
  checked.mistakes = {MistakeAt({{7, 1}, {9, 1}, {11, 1}, {13, 1}}, "must be a number")};
  checked.untold = 3;
  EXPECT_EQ(MistakesText(checked, "f.toml", {}),
            "f.toml:7:1: must be a number; the same in lines 9, 11 and 13\n"
            "f.toml: 3 more mistakes\n");
}

TEST(MistakesText, MistakesOfTheFileAsAWholeAndDoubtsBesideThem) {
  Checked checked = Good();
  checked.mistakes = {MistakeAt({}, "it is empty")};
  SetLimit(&checked.description, "a", "VCOCLK_FREQ_MIN", "6000");
  checked.doubts = device::Doubts(checked.description);
  EXPECT_EQ(MistakesText(checked, "f", {}),
            "f: it is empty\n"
            "f:11: warning: grade a: VCOCLK_FREQ_MIN, 6000, is above VCOCLK_FREQ_MAX, 900:\n"
            "  there is no VCO frequency\n");
}

Doubt Made(DoubtKind kind, int value, int other, int bound) {
  Doubt doubt;
  doubt.kind = kind;
  doubt.keyword = "ONE";
  doubt.value = value;
  doubt.text = std::to_string(value);
  doubt.other = "OTHER";
  doubt.other_value = other;
  doubt.other_text = std::to_string(other);
  doubt.bound = bound;
  doubt.pin = "CLK0";
  doubt.grades = {"1", "2"};
  return doubt;
}

TEST(DoubtText, LimitsThatCannotBeMeant) {
  EXPECT_EQ(DoubtText(Made(DoubtKind::kLowUnused, 600, 500, 0)),
            "ONE, 600, is above OTHER, 500, which is the highest PFD frequency with bandwidth LOW, "
            "too");
  EXPECT_EQ(
      DoubtText(Made(DoubtKind::kTargetOutside, 500, 600, 0)),
      "ONE, 500, is below OTHER, 600: the VCO frequency that is recommended is outside of its "
      "range");
  EXPECT_EQ(
      DoubtText(Made(DoubtKind::kDoubledAbove, 3, 4, 0)),
      "ONE, 3, is below OTHER, 4: with feedback from CLK2X, CLK0 would be faster than without");
  EXPECT_EQ(DoubtText(Made(DoubtKind::kNeverReached, 90000, 500, 32000)),
            "ONE, 90000, is never reached: with OTHER, 500, settings go up to 32000 MHz");
  EXPECT_EQ(DoubtText(Made(DoubtKind::kNeverReached, 1, 500, 3)),
            "ONE, 1, is never reached: with OTHER, 500, settings go down to 3 MHz");
  EXPECT_EQ(
      DoubtText(Made(DoubtKind::kFewDividers, 16, 0, 32)),
      "ONE, 16, is so low that no divider can be above twice that, 32: its high and low times "
      "do not fit; the engine takes up to 128 all the same");
  EXPECT_EQ(DoubtText(Made(DoubtKind::kLongSearch, 6, 0, 10)),
            "ONE, 6, is below 10 MHz: so slow a VCO has many dividers for an output 0 that is "
            "shifted; a call of the engine that finds nothing can take longer than 10 ms");
  EXPECT_EQ(DoubtText(Made(DoubtKind::kLongSearch, 20000, 0, 10000)),
            "ONE, 20000, is above 10000 MHz: so fast a VCO makes nothing else of an output 0 that is "
            "shifted, and no other phases; a call of the engine that finds nothing can take longer "
            "than 10 ms, and up to a second");
}

TEST(DoubtText, WhatThereIsNoneOf) {
  Doubt doubt = Made(DoubtKind::kNothingBetween, 6000, 1000, 0);
  doubt.range = RangeOf::kPeriod;
  EXPECT_EQ(DoubtText(doubt), "ONE, 6000, is above OTHER, 1000: there is no period of CLK0");
  EXPECT_EQ(NothingWords(doubt), "period of CLK0");
  doubt.range = RangeOf::kPfdLow;
  EXPECT_EQ(NothingWords(doubt), "PFD frequency with bandwidth LOW");
  EXPECT_EQ(NothingWords(Made(DoubtKind::kLowUnused, 1, 1, 1)), "");
  EXPECT_EQ(GradesWords(doubt), "grades 1 and 2");
}

}  // namespace
}  // namespace planner::report
