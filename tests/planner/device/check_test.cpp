#include "planner/device/Check.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "host/bundled/device/DeviceCatalogue.h"
#include "hardware/Exact.h"

namespace {

using hardware::Primitive;
using hardware::Rational;
using planner::device::Check;
using planner::device::Checked;
using planner::device::Doubt;
using planner::device::DoubtKind;
using planner::device::GradeDescription;
using planner::device::RangeOf;
using testing::ElementsAre;
using testing::IsEmpty;

const std::string kHead = "device = \"dev\"\npackages = [\"p\"]\n";

const std::string kPll =
    "VCOCLK_FREQ_MIN = 400\nVCOCLK_FREQ_MAX = 1000\nCLKOUT_FREQ_MIN_GCLK = 3.125\n"
    "CLKOUT_FREQ_MAX_GCLK = 400\nCLKOUT_FREQ_MAX_IOCLK = 1000\nCLKPFD_FREQ_MIN = 19\n"
    "CLKPFD_FREQ_MAX = 500\nO_MAX_HT_LT = 64\n";

const std::string kTsyn =
    "TSYN_VCOCLK_FREQ_MIN = 600\nTSYN_VCOCLK_FREQ_MAX = 1200\nTSYN_VCOCLK_FREQ_TARGET = 1000\n"
    "TSYN_CLKOUT_FREQ_MIN = 5\nTSYN_CLKOUT_FREQ_MAX = 800\nTSYN_CLKPFD_FREQ_MIN = 10\n"
    "TSYN_CLKPFD_FREQ_MAX = 450\nTSYN_CLKPFD_FREQ_MAX_LBW = 300\nO_MAX_HT_LT = 64\n";

std::string Kru(const std::string& pin, const std::string& what) {
  return "D_KRU_" + pin + "_CLKIN_DIVIDE_BY_2_FALSE_" + what;
}
const std::string kClk0 = Kru("CLK0", "CLK_FEEDBACK_1X_MINPERIOD") + " = 5\n" +
                          Kru("CLK0", "CLK_FEEDBACK_1X_MAXPERIOD") + " = 200\n" +
                          Kru("CLK0", "CLK_FEEDBACK_2X_MINPERIOD") + " = 8\n";
const std::string kClkgen = Kru("CLKFX", "CLK_FEEDBACK_1X_MINPERIOD") + " = 2.5\n" +
                            Kru("CLKFX", "CLK_FEEDBACK_1X_MAXPERIOD") + " = 50\n" +
                            Kru("CLKFXDV", "MINPERIOD") + " = 5\n" +
                            Kru("CLKFXDV", "MAXPERIOD") + " = 1000\n";

std::string With(std::string text, const std::string& from, const std::string& to) {
  EXPECT_NE(text.find(from), std::string::npos) << from;
  return text.replace(text.find(from), from.size(), to);
}

Checked CheckText(const std::string& text) { return Check(text, "dev.toml", "dev"); }
Checked CheckGrade(const std::string& figures) {
  return CheckText(kHead + "[grade.g]\n" + figures);
}
// The only doubt about such a grade.
Doubt TheDoubt(const std::string& figures) {
  const Checked checked = CheckGrade(figures);
  EXPECT_THAT(checked.mistakes, IsEmpty());
  EXPECT_EQ(checked.doubts.size(), 1u);
  return checked.doubts.empty() ? Doubt{} : checked.doubts.front();
}

TEST(Check, DoubtsNothingOfTheBundledDevices) {
  const auto catalogue = ::Device::DeviceCatalogue::ListFolders({BUNDLED_DEVICES});
  int grades = 0;
  for (const std::string& name : catalogue.Names()) {
    const auto description = planner::device::Describe(
        ::Device::DeviceFile::Read(*catalogue.FindFile(name), name));
    EXPECT_THAT(planner::device::Doubts(description), IsEmpty()) << name;
    for (const GradeDescription& grade : description.grades) {
      EXPECT_THAT(planner::device::MissingOf(grade), IsEmpty()) << name;
      ++grades;
    }
  }
  EXPECT_EQ(grades, 4);
}

TEST(Check, DoubtsNoGoodLimits) {
  EXPECT_THAT(CheckGrade(kPll).doubts, IsEmpty());
  EXPECT_THAT(CheckGrade(kTsyn).doubts, IsEmpty());
  EXPECT_THAT(CheckGrade(kClk0 + kClkgen).doubts, IsEmpty());
  // A range of one frequency is one, and so are limits that are just reached.
  EXPECT_THAT(CheckGrade(With(kPll, "MAX = 1000", "MAX = 400")).doubts, IsEmpty());
  EXPECT_THAT(CheckGrade(With(With(kPll, "MAX = 1000", "MAX = 1280"), "PFD_FREQ_MAX = 500",
                              "PFD_FREQ_MAX = 20"))
                  .doubts,
              IsEmpty());
  EXPECT_THAT(CheckGrade(With(kPll, "IOCLK = 1000", "IOCLK = 10000")).doubts, IsEmpty());
}

TEST(Check, TellsRangesThatAreEmpty) {
  const Doubt doubt = TheDoubt(With(kPll, "CLKPFD_FREQ_MIN = 19", "CLKPFD_FREQ_MIN = 500.1"));
  EXPECT_EQ(doubt.kind, DoubtKind::kNothingBetween);
  EXPECT_EQ(doubt.range, RangeOf::kPfd);
  EXPECT_EQ(doubt.keyword, "CLKPFD_FREQ_MIN");
  EXPECT_EQ(doubt.value, Rational(5001, 10));
  EXPECT_EQ(doubt.text, "500.1");
  EXPECT_EQ(doubt.other, "CLKPFD_FREQ_MAX");
  EXPECT_EQ(doubt.other_value, Rational(500));
  EXPECT_EQ(doubt.other_text, "500");
  EXPECT_THAT(doubt.grades, ElementsAre("g"));
  EXPECT_THAT(doubt.lines, ElementsAre(9u));
  EXPECT_THAT(doubt.touched, ElementsAre(Primitive::kPll));
  EXPECT_THAT(doubt.lost, ElementsAre(Primitive::kPll));
}

TEST(Check, TellsWhichRangeIsEmptyAndWhatThatCosts) {
  const auto expect = [](const std::string& figures, RangeOf range,
                         const std::vector<Primitive>& lost) {
    const Doubt doubt = TheDoubt(figures);
    EXPECT_EQ(doubt.kind, DoubtKind::kNothingBetween) << figures;
    EXPECT_EQ(doubt.range, range) << figures;
    EXPECT_EQ(doubt.lost, lost) << figures;
  };
  expect(With(kPll, "MAX = 1000", "MAX = 399"), RangeOf::kVco, {Primitive::kPll});
  expect(With(kPll, "MAX_GCLK = 400", "MAX_GCLK = 3.12"), RangeOf::kOutput, {Primitive::kPll});
  expect(With(kPll, "IOCLK = 1000", "IOCLK = 3"), RangeOf::kOutput1, {});
  expect(With(kTsyn, "CLKOUT_FREQ_MIN = 5", "CLKOUT_FREQ_MIN = 801"), RangeOf::kOutput,
         {Primitive::kTsyn});
  expect(With(kTsyn, "LBW = 300", "LBW = 9.9"), RangeOf::kPfdLow, {});
  expect(With(kClkgen, "MAXPERIOD = 50", "MAXPERIOD = 2.49"), RangeOf::kPeriod,
         {Primitive::kKruClkgen});
  expect(With(kClkgen, "MAXPERIOD = 1000", "MAXPERIOD = 4"), RangeOf::kPeriod, {});
}

// The longest period of CLK0 is that of both feedbacks.
TEST(Check, ComparesThePeriodsOfAPin) {
  const Checked checked = CheckGrade(With(kClk0, "= 200", "= 7"));
  ASSERT_EQ(checked.doubts.size(), 1u);
  EXPECT_EQ(checked.doubts[0].pin, "CLK0");
  EXPECT_EQ(checked.doubts[0].keyword, Kru("CLK0", "CLK_FEEDBACK_2X_MINPERIOD"));
  EXPECT_EQ(checked.doubts[0].other, Kru("CLK0", "CLK_FEEDBACK_1X_MAXPERIOD"));
  // The other limits of a KRU_SP are missing.
  EXPECT_THAT(checked.doubts[0].touched, IsEmpty());
  const Doubt doubled = TheDoubt(With(kClk0, "= 8", "= 4.9"));
  EXPECT_EQ(doubled.kind, DoubtKind::kDoubledAbove);
  EXPECT_EQ(doubled.pin, "CLK0");
  EXPECT_EQ(doubled.other, Kru("CLK0", "CLK_FEEDBACK_1X_MINPERIOD"));
}

TEST(Check, TellsALowMaximumAboveTheMaximum) {
  const Doubt doubt = TheDoubt(With(kTsyn, "LBW = 300", "LBW = 450.1"));
  EXPECT_EQ(doubt.kind, DoubtKind::kLowUnused);
  EXPECT_EQ(doubt.keyword, "TSYN_CLKPFD_FREQ_MAX_LBW");
  EXPECT_EQ(doubt.other, "TSYN_CLKPFD_FREQ_MAX");
  EXPECT_THAT(doubt.lost, IsEmpty());
  EXPECT_THAT(CheckGrade(With(kTsyn, "LBW = 300", "LBW = 450")).doubts, IsEmpty());
}

TEST(Check, TellsATargetOutsideOfTheRange) {
  const Doubt low = TheDoubt(With(kTsyn, "TARGET = 1000", "TARGET = 599"));
  EXPECT_EQ(low.kind, DoubtKind::kTargetOutside);
  EXPECT_EQ(low.keyword, "TSYN_VCOCLK_FREQ_TARGET");
  EXPECT_EQ(low.other, "TSYN_VCOCLK_FREQ_MIN");
  const Doubt high = TheDoubt(With(kTsyn, "TARGET = 1000", "TARGET = 1201"));
  EXPECT_EQ(high.keyword, "TSYN_VCOCLK_FREQ_TARGET");
  EXPECT_EQ(high.other, "TSYN_VCOCLK_FREQ_MAX");
}

// M is at most 64: from a PFD of 500 MHz a VCO of 32000 MHz can be had.
TEST(Check, TellsLimitsThatNothingReaches) {
  const Checked endless = CheckGrade(With(kPll, "MAX = 1000", "MAX = 1e300"));
  ASSERT_EQ(endless.doubts.size(), 2u);
  EXPECT_EQ(endless.doubts[0].kind, DoubtKind::kLongSearch);
  Doubt doubt = endless.doubts[1];
  EXPECT_EQ(doubt.kind, DoubtKind::kNeverReached);
  EXPECT_EQ(doubt.range, RangeOf::kVco);
  EXPECT_EQ(doubt.keyword, "VCOCLK_FREQ_MAX");
  EXPECT_EQ(doubt.text, "1e300");
  EXPECT_EQ(doubt.other, "CLKPFD_FREQ_MAX");
  EXPECT_EQ(doubt.bound, Rational(32000));
  EXPECT_THAT(doubt.lost, IsEmpty());

  doubt = TheDoubt(With(kPll, "IOCLK = 1000", "IOCLK = 10000.001"));
  EXPECT_EQ(doubt.kind, DoubtKind::kNeverReached);
  EXPECT_EQ(doubt.range, RangeOf::kOutput1);
  EXPECT_EQ(doubt.bound, Rational(1000));

  doubt = TheDoubt(With(kTsyn, "CLKOUT_FREQ_MAX = 800", "CLKOUT_FREQ_MAX = 12001"));
  EXPECT_EQ(doubt.keyword, "TSYN_CLKOUT_FREQ_MAX");
  EXPECT_EQ(doubt.other, "TSYN_VCOCLK_FREQ_MAX");

  doubt = TheDoubt(With(kPll, "CLKPFD_FREQ_MAX = 500", "CLKPFD_FREQ_MAX = 1e250"));
  EXPECT_EQ(doubt.range, RangeOf::kPfd);
  EXPECT_EQ(doubt.bound, Rational(1000));
}

TEST(Check, TellsLimitsThatLeaveNothing) {
  // The highest VCO from a PFD of 25 MHz is 1600.
  Doubt doubt = TheDoubt(With(
      With(With(kPll, "MIN = 400", "MIN = 1601"), "MAX = 1000", "MAX = 1700"),
      "CLKPFD_FREQ_MAX = 500", "CLKPFD_FREQ_MAX = 25"));
  EXPECT_EQ(doubt.kind, DoubtKind::kNeverReached);
  EXPECT_EQ(doubt.keyword, "VCOCLK_FREQ_MIN");
  EXPECT_EQ(doubt.bound, Rational(1600));
  EXPECT_THAT(doubt.lost, ElementsAre(Primitive::kPll));

  // The slowest output of a VCO from 400 MHz on is 3.125 MHz.
  doubt = TheDoubt(With(With(With(kPll, "MIN_GCLK = 3.125", "MIN_GCLK = 1"), "MAX_GCLK = 400",
                             "MAX_GCLK = 3.12"), "IOCLK = 1000", "IOCLK = 4"));
  EXPECT_EQ(doubt.keyword, "CLKOUT_FREQ_MAX_GCLK");
  EXPECT_EQ(doubt.bound, Rational(25, 8));
  EXPECT_THAT(doubt.lost, ElementsAre(Primitive::kPll));

  // No VCO is below its PFD.
  doubt = TheDoubt(With(With(With(kTsyn, "CLKPFD_FREQ_MIN = 10", "CLKPFD_FREQ_MIN = 1300"),
                             "CLKPFD_FREQ_MAX = 450", "CLKPFD_FREQ_MAX = 1400"),
                        "MAX_LBW = 300", "MAX_LBW = 1350"));
  EXPECT_EQ(doubt.kind, DoubtKind::kNeverReached);
  EXPECT_EQ(doubt.keyword, "TSYN_VCOCLK_FREQ_MAX");
  EXPECT_EQ(doubt.other, "TSYN_CLKPFD_FREQ_MIN");
  EXPECT_EQ(doubt.bound, Rational(1300));
  EXPECT_THAT(doubt.lost, ElementsAre(Primitive::kTsyn));

  doubt = TheDoubt(With(With(kTsyn, "CLKOUT_FREQ_MIN = 5", "CLKOUT_FREQ_MIN = 1300"),
                        "CLKOUT_FREQ_MAX = 800", "CLKOUT_FREQ_MAX = 1400"));
  EXPECT_EQ(doubt.keyword, "TSYN_CLKOUT_FREQ_MIN");
  EXPECT_THAT(doubt.lost, ElementsAre(Primitive::kTsyn));
}

// A TSYN has eight times as many dividers for output 0 as a PLL, and a slow VCO makes use of them.
TEST(Check, TellsVcosOverWhichSearchesAreLong) {
  Doubt doubt = TheDoubt(With(kTsyn, "MIN = 600", "MIN = 9.9"));
  EXPECT_EQ(doubt.kind, DoubtKind::kLongSearch);
  EXPECT_EQ(doubt.keyword, "TSYN_VCOCLK_FREQ_MIN");
  EXPECT_EQ(doubt.text, "9.9");
  EXPECT_EQ(doubt.bound, Rational(10));
  EXPECT_THAT(doubt.touched, ElementsAre(Primitive::kTsyn));
  EXPECT_THAT(doubt.lost, IsEmpty());
  EXPECT_THAT(CheckGrade(With(kTsyn, "MIN = 600", "MIN = 10")).doubts, IsEmpty());
  EXPECT_THAT(CheckGrade(With(kPll, "MIN = 400", "MIN = 1")).doubts, IsEmpty());

  for (const std::string& figures : {kPll, With(kTsyn, "MAX = 1200", "MAX = 1000")}) {
    doubt = TheDoubt(With(figures, "VCOCLK_FREQ_MAX = 1000", "VCOCLK_FREQ_MAX = 10000.1"));
    EXPECT_EQ(doubt.kind, DoubtKind::kLongSearch);
    EXPECT_EQ(doubt.text, "10000.1");
    EXPECT_EQ(doubt.bound, Rational(10'000));
    EXPECT_THAT(CheckGrade(With(figures, "VCOCLK_FREQ_MAX = 1000", "VCOCLK_FREQ_MAX = 10000"))
                    .doubts, IsEmpty());
  }
}

TEST(Check, TellsCountsThatAreNone) {
  Doubt doubt = TheDoubt(With(kPll, "HT_LT = 64", "HT_LT = 64.5"));
  EXPECT_EQ(doubt.kind, DoubtKind::kNotWhole);
  EXPECT_EQ(doubt.value, Rational(129, 2));
  EXPECT_THAT(CheckGrade(With(kPll, "HT_LT = 64", "HT_LT = 64.0")).doubts, IsEmpty());
  doubt = TheDoubt(With(kPll, "HT_LT = 64", "HT_LT = 63"));
  EXPECT_EQ(doubt.kind, DoubtKind::kFewDividers);
  EXPECT_EQ(doubt.bound, Rational(126));
}

// A count that two primitives share, in three grades of which two are alike.
TEST(Check, TellsTheSameOfSeveralGradesOnce) {
  const std::string few = With(kPll, "HT_LT = 64", "HT_LT = 60") +
                          With(kTsyn, "O_MAX_HT_LT = 64\n", "");
  const Checked checked = CheckText(kHead + "[grade.a]\n" + few + "[grade.b]\n" +
                                    With(few, "HT_LT = 60", "HT_LT = 61") + "[grade.c]\n" + few);
  ASSERT_EQ(checked.doubts.size(), 2u);
  EXPECT_THAT(checked.doubts[0].grades, ElementsAre("a", "c"));
  EXPECT_THAT(checked.doubts[0].lines, ElementsAre(11u, 45u));
  EXPECT_THAT(checked.doubts[0].touched, ElementsAre(Primitive::kPll, Primitive::kTsyn));
  EXPECT_THAT(checked.doubts[1].grades, ElementsAre("b"));
}

TEST(Check, CountsTheKeywordsOfAPrimitive) {
  const Checked checked = CheckGrade(With(kPll, "VCOCLK_FREQ_MIN = 400\n", "") +
                                     With(kClkgen, Kru("CLKFXDV", "MINPERIOD") + " = 5\n", ""));
  const GradeDescription& grade = checked.description.grades.front();
  const auto coverage = planner::device::CoverageOf(grade);
  ASSERT_EQ(coverage.size(), 4u);
  EXPECT_EQ(coverage[0].there, 7);
  EXPECT_EQ(coverage[0].needed, 8);
  EXPECT_EQ(coverage[0].own, 6);  // all but the count
  EXPECT_TRUE(coverage[0].IsBegun() && !coverage[0].IsComplete());
  EXPECT_EQ(coverage[1].there, 1);
  EXPECT_EQ(coverage[1].own, 0);
  EXPECT_FALSE(coverage[1].IsBegun());
  EXPECT_EQ(coverage[2].there, 2);  // the two of CLKFX
  EXPECT_FALSE(coverage[2].IsBegun());
  EXPECT_TRUE(coverage[3].IsBegun());
  const auto missing = planner::device::MissingOf(grade);
  ASSERT_EQ(missing.size(), 2u);
  EXPECT_EQ(missing[0].keyword.name, "VCOCLK_FREQ_MIN");
  EXPECT_THAT(missing[0].costs, ElementsAre(Primitive::kPll));
  EXPECT_EQ(missing[1].keyword.name, Kru("CLKFXDV", "MINPERIOD"));
  EXPECT_THAT(missing[1].costs, ElementsAre(Primitive::kKruClkgen));
}

TEST(Check, AMissingKeywordOfTwoPrimitivesCostsBoth) {
  const Checked checked =
      CheckGrade(With(kPll, "O_MAX_HT_LT = 64\n", "") + With(kTsyn, "O_MAX_HT_LT = 64\n", ""));
  const auto missing = planner::device::MissingOf(checked.description.grades.front());
  ASSERT_EQ(missing.size(), 1u);
  EXPECT_THAT(missing[0].costs, ElementsAre(Primitive::kPll, Primitive::kTsyn));
}

TEST(Check, PutsTheSameMistakesTogether) {
  const Checked checked = CheckText(
      "device = \"dev\"\npackages = []\n[grade.b]\nFAST = 1\nVCOCLK_FREQ_MIN = 2\n"
      "VCOCLK_FREQ_MAX = 1\n[grade.a]\nSLOW = 1\nFAST = 1\n");
  ASSERT_EQ(checked.mistakes.size(), 3u);
  EXPECT_EQ(checked.mistakes[0].reason, "\"packages\" must name at least one package");
  EXPECT_EQ(checked.mistakes[1].unknown, "FAST");
  EXPECT_THAT(checked.mistakes[1].known, testing::Contains("O_MAX_HT_LT"));
  ASSERT_EQ(checked.mistakes[1].places.size(), 2u);
  EXPECT_EQ(checked.mistakes[1].places[0].line, 4u);
  EXPECT_EQ(checked.mistakes[1].places[1].line, 9u);
  EXPECT_EQ(checked.mistakes[2].unknown, "SLOW");
  EXPECT_EQ(checked.untold, 0u);
  // What can be read is judged all the same.
  ASSERT_EQ(checked.doubts.size(), 1u);
  EXPECT_EQ(checked.doubts[0].range, RangeOf::kVco);
  EXPECT_THAT(checked.doubts[0].lost, IsEmpty());
}

TEST(Check, DoesNotTellMoreThanAnyoneReads) {
  std::string figures;
  for (int i = 0; i < 100; ++i) figures += "X" + std::to_string(i) + " = 1\n";
  const Checked checked = CheckGrade(figures);
  EXPECT_EQ(checked.mistakes.size(), 20u);
  EXPECT_EQ(checked.untold, 80u);
  EXPECT_EQ(checked.mistakes[0].unknown, "X0");
  EXPECT_EQ(checked.mistakes[19].unknown, "X19");
}

TEST(Check, TellsMistakesOfTheFileAsAWhole) {
  const Checked checked = CheckText(std::string(300'000, '#'));
  ASSERT_EQ(checked.mistakes.size(), 1u);
  EXPECT_THAT(checked.mistakes[0].places, IsEmpty());
  EXPECT_THAT(checked.description.grades, IsEmpty());
}

}  // namespace
