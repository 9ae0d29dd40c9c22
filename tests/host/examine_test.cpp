// All mistakes of a device file at once, and what is read of it all the same.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "host/bundled/device/DeviceFile.h"
#include "host/bundled/device/FileText.h"

namespace {

using Device::DeviceFile;
using Device::Examination;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

const std::string kHead = "device = \"dev\"\npackages = [\"p1\"]\n";

Examination Examine(const std::string& text) {
  return DeviceFile::Examine(text, "dev.toml", "dev");
}

// The mistakes as lines: "line:column: reason".
std::vector<std::string> Mistakes(const std::string& text) {
  std::vector<std::string> lines;
  for (const Device::Mistake& mistake : Examine(text).mistakes) {
    std::string line;
    if (mistake.position) {
      line = std::to_string(mistake.position->line) + ":" +
             std::to_string(mistake.position->column) + ": ";
    }
    lines.push_back(line + mistake.reason);
  }
  return lines;
}

TEST(Examine, FindsNothingInAGoodFile) {
  const Examination examination = Examine(kHead + "[grade.1]\nO_MAX_HT_LT = 64\n");
  EXPECT_THAT(examination.mistakes, IsEmpty());
  EXPECT_EQ(examination.file.path, "dev.toml");
  EXPECT_EQ(examination.file.grades.front().Figure("O_MAX_HT_LT"), 64.0);
}

TEST(Examine, FindsAllMistakesAndReadsTheRest) {
  const std::string text =
      "device = \"other\"\n"
      "packages = [\"p1\", 2, \"p1\", \"p-2\", \"p3\"]\n"
      "speed = 3\n"
      "description = 5\n"
      "[grade.1]\n"
      "FAST = 1\n"
      "VCOCLK_FREQ_MIN = 0\n"
      "VCOCLK_FREQ_MAX = 1000\n"
      "[grade.\"2-\"]\n"
      "O_MAX_HT_LT = \"64\"\n"
      "[grade.3]\n"
      "O_MAX_HT_LT = 64\n";
  EXPECT_THAT(Mistakes(text),
              ElementsAre("1:10: device \"other\" must be named as its file, \"dev\"",
                          "2:19: \"packages\" must be a text",
                          "2:22: duplicate package \"p1\"",
                          "2:28: package name \"p-2\" must be made of letters, digits and _",
                          HasSubstr("3:1: unknown key \"speed\""),
                          "4:15: \"description\" must be a text",
                          "6:1: unknown keyword \"FAST\"",
                          "7:19: \"VCOCLK_FREQ_MIN\" must be a finite positive number",
                          "9:8: grade name \"2-\" must be made of letters, digits and _",
                          "10:15: \"O_MAX_HT_LT\" must be a number"));
  const Examination examination = Examine(text);
  EXPECT_EQ(examination.mistakes[4].kind, Device::NameKind::kKey);
  EXPECT_EQ(examination.mistakes[4].unknown, "speed");
  EXPECT_EQ(examination.mistakes[6].kind, Device::NameKind::kKeyword);
  EXPECT_EQ(examination.mistakes[6].unknown, "FAST");
  EXPECT_EQ(examination.mistakes[7].kind, Device::NameKind::kNone);
  EXPECT_EQ(examination.mistakes[7].unknown, "");
  const DeviceFile& file = examination.file;
  EXPECT_EQ(file.device, "dev");
  EXPECT_THAT(file.packages, ElementsAre("p1", "p3"));
  EXPECT_THAT(file.GradeNames(), ElementsAre("1", "3"));
  EXPECT_EQ(file.FindGrade("1")->Figure("VCOCLK_FREQ_MIN"), std::nullopt);
  EXPECT_EQ(file.FindGrade("1")->Figure("VCOCLK_FREQ_MAX"), 1000.0);
}

// A default that is not in a list is one only where all of the list could be read.
TEST(Examine, DoesNotTellWhatFollowsFromAnotherMistake) {
  EXPECT_THAT(Mistakes("device = \"dev\"\npackages = [1]\ndefault_package = \"p\"\n"
                       "default_grade = \"2\"\n[grade.1]\nO_MAX_HT_LT = 64\n[grade.\"-\"]\n"),
              ElementsAre("2:13: \"packages\" must be a text",
                          "7:8: grade name \"-\" must be made of letters, digits and _"));
  EXPECT_THAT(Mistakes("default_package = \"p\"\ndefault_grade = \"2\"\n"),
              ElementsAre("1:1: the key \"device\" is missing",
                          "1:1: the key \"packages\" is missing",
                          "1:1: the key \"grade\" is missing"));
  EXPECT_THAT(Mistakes(kHead + "default_package = \"p\"\ndefault_grade = \"2\"\n[grade.1]\n"),
              ElementsAre("3:19: \"p\" is not in the list of packages, which are p1",
                          "4:17: \"2\" is not one of the grades, which are 1"));
}

const std::string kLoop =
    "LOOP_KAPPA = 30\nLOOP_KAPPA_VCO = 1000\nLOOP_BANDWIDTH_LOW = 0.01\n"
    "LOOP_BANDWIDTH_OPTIMIZED = 0.02\nLOOP_BANDWIDTH_HIGH = 0.04\nLOOP_BUFFER_JITTER = 2\n"
    "LOOP_DETERMINISTIC_JITTER = 20\nLOOP_STATIC_OFFSET = 40\nLOOP_LEAKAGE = 40\n";

std::string With(std::string text, const std::string& from, const std::string& to) {
  return text.replace(text.find(from), from.size(), to);
}

// The coefficients begin in line 4.
TEST(Examine, TellsMissingCoefficientsOnce) {
  const std::string head = kHead + "[grade.1.calculator]\n";
  EXPECT_THAT(Mistakes(head + kLoop), IsEmpty());
  EXPECT_THAT(Mistakes(head + With(kLoop, "LOOP_KAPPA = 30\n", "")),
              ElementsAre("3:10: the coefficient \"LOOP_KAPPA\" is missing, which goes with "
                          "\"LOOP_KAPPA_VCO\""));
  EXPECT_THAT(Mistakes(head + kLoop + "KRU_KAPPA = 1\n"),
              ElementsAre("3:10: the coefficients \"KRU_TAP_STEP\", \"KRU_BUFFER_JITTER\" and "
                          "\"KRU_PHASE_ERROR\" are missing, which go with \"KRU_KAPPA\""));
  // One that is there and wrong is not missing.
  EXPECT_THAT(Mistakes(head + With(kLoop, "LOOP_KAPPA = 30", "LOOP_KAPPA = 0")),
              ElementsAre("4:14: \"LOOP_KAPPA\" must be a finite positive number"));
}

TEST(Examine, ComparesTheBandwidthsThatAreThere) {
  const std::string head = kHead + "[grade.1.calculator]\n";
  EXPECT_THAT(Mistakes(head + With(With(kLoop, "0.02", "-1"), "0.04", "0.005")),
              ElementsAre("7:28: \"LOOP_BANDWIDTH_OPTIMIZED\" must be a finite positive number"));
  EXPECT_THAT(Mistakes(head + With(With(kLoop, "0.01", "0.03"), "0.04", "0.2")),
              ElementsAre("7:28: \"LOOP_BANDWIDTH_OPTIMIZED\" must be above "
                          "\"LOOP_BANDWIDTH_LOW\"",
                          "8:23: \"LOOP_BANDWIDTH_HIGH\" must be at most 0.1, a tenth of the PFD "
                          "frequency"));
}

TEST(Examine, KnowsOfWhichKindANameIsToBe) {
  const auto mistakes =
      Examine(kHead + "[grade.1.calculator]\nLOOP_KAPA = 1\n").mistakes;
  ASSERT_EQ(mistakes.size(), 1u);
  EXPECT_EQ(mistakes[0].kind, Device::NameKind::kCoefficient);
  EXPECT_EQ(mistakes[0].unknown, "LOOP_KAPA");
  EXPECT_THAT(Device::NamesOf(mistakes[0].kind), testing::Contains("LOOP_KAPPA"));
  EXPECT_THAT(Device::NamesOf(Device::NameKind::kKeyword), testing::Contains("O_MAX_HT_LT"));
  EXPECT_THAT(Device::NamesOf(Device::NameKind::kKey), testing::Contains("default_grade"));
  EXPECT_THAT(Device::NamesOf(Device::NameKind::kNone), IsEmpty());
}

TEST(Examine, KnowsNoMoreBehindMalformedToml) {
  const Examination examination = Examine(kHead + "FAST = 1\n[grade.1\nO_MAX_HT_LT = 64\n");
  ASSERT_EQ(examination.mistakes.size(), 1u);
  EXPECT_EQ(examination.mistakes[0].position->line, 4u);
  EXPECT_THAT(examination.file.grades, IsEmpty());
}

TEST(Examine, RefusesWhatIsNotSafeToParse) {
  const Examination huge = Examine(std::string(Device::kLargestFile + 1, '#'));
  ASSERT_EQ(huge.mistakes.size(), 1u);
  EXPECT_EQ(huge.mistakes[0].position, std::nullopt);
  EXPECT_EQ(huge.mistakes[0].reason, "is longer than 262144 bytes, which no device file is");
  const Examination dots = Examine(std::string(Device::kMostDots + 1, '.'));
  ASSERT_EQ(dots.mistakes.size(), 1u);
  EXPECT_EQ(dots.mistakes[0].position, (Device::SourcePosition{1, 4097}));
}

TEST(Parse, ThrowsTheFirstMistakeWithItsPlace) {
  try {
    DeviceFile::Parse(kHead + "ZZZ = 1\nAAA = 1\n", "some/dev.toml", "dev");
    FAIL() << "no error";
  } catch (const Device::DeviceError& error) {
    EXPECT_EQ(error.path(), "some/dev.toml");
    EXPECT_EQ(error.position(), (Device::SourcePosition{3, 1}));
    EXPECT_THAT(error.reason(), testing::StartsWith("unknown key \"ZZZ\""));
    EXPECT_EQ(error.what(), "some/dev.toml:3:1: " + error.reason());
  }
}

TEST(Parse, ErrorsOfNoFileHaveNoPlace) {
  const Device::DeviceError error("there is none");
  EXPECT_EQ(error.path(), "");
  EXPECT_EQ(error.position(), std::nullopt);
  EXPECT_EQ(error.reason(), "there is none");
  EXPECT_STREQ(error.what(), "there is none");
}

}  // namespace
