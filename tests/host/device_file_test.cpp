#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/stat.h>

#include <fstream>
#include <iterator>
#include <string>

#include "host/bundled/device/DeviceFile.h"
#include "host/bundled/device/FileText.h"
#include "host/bundled/device/KeywordTable.h"
#include "tests/host/device_folder.h"

namespace {

using Device::DeviceFile;
using testing::HasSubstr;
using testing::StartsWith;

const std::string kHead = "device = \"dev\"\npackages = [\"p1\"]\n";
const std::string kGrade = "[grade.1]\nO_MAX_HT_LT = 64\n";

std::optional<double> FigureOf(const DeviceFile& file, std::string_view grade,
                               std::string_view keyword) {
  return file.FindGrade(grade)->figures.at(*Device::FindKeyword(keyword));
}

class DeviceFileTest : public testing::Test {
 protected:
  DeviceFile Read(const std::string& text) {
    return DeviceFile::Read(folder_.Write("dev.toml", text), "dev");
  }

  // The complaint about a file, or a text that says there was none.
  std::string ErrorAtPath(const std::string& path) {
    try {
      DeviceFile::Read(path, "dev");
      return "no error";
    } catch (const Device::DeviceError& error) {
      return error.what();
    }
  }

  // The complaint about the text of a file, with the path cut off: ":<line>:<column>: ...".
  std::string Error(const std::string& text) {
    const std::string path = folder_.Write("dev.toml", text);
    const std::string error = ErrorAtPath(path);
    return error.starts_with(path) ? error.substr(path.size()) : error;
  }

  DeviceFolder folder_;
};

TEST_F(DeviceFileTest, ReadsAllThatIsThere) {
  const DeviceFile file = Read(
      "device = \"dev\"\n"
      "description = \"for tests\"\n"
      "packages = [\"p1\", \"Q_2\"]\n"
      "default_package = \"Q_2\"\n"
      "default_grade = \"fast\"\n"
      "[grade.slow]\n"
      "VCOCLK_FREQ_MAX = 1_000\n"
      "[grade.fast]\n"
      "VCOCLK_FREQ_MAX = 1080.5\n"
      "VCOCLK_FREQ_MIN = 4e2\n");
  EXPECT_EQ(file.path, folder_.File("dev.toml"));
  EXPECT_EQ(file.device, "dev");
  EXPECT_EQ(file.description, "for tests");
  EXPECT_EQ(file.packages, (std::vector<std::string>{"p1", "Q_2"}));
  EXPECT_EQ(file.default_package, "Q_2");
  EXPECT_EQ(file.default_grade, "fast");
  EXPECT_EQ(file.GradeNames(), (std::vector<std::string>{"slow", "fast"}));
  EXPECT_EQ(FigureOf(file, "slow", "VCOCLK_FREQ_MAX"), 1000.0);
  EXPECT_EQ(FigureOf(file, "slow", "VCOCLK_FREQ_MIN"), std::nullopt);
  EXPECT_EQ(FigureOf(file, "fast", "VCOCLK_FREQ_MAX"), 1080.5);
  EXPECT_EQ(FigureOf(file, "fast", "VCOCLK_FREQ_MIN"), 400.0);
  EXPECT_EQ(file.FindGrade("1"), nullptr);
  EXPECT_FALSE(file.HasPackage("q_2"));
}

TEST_F(DeviceFileTest, NeedsNoDefaultsAndNoDescription) {
  const DeviceFile file = Read(kHead + kGrade);
  EXPECT_EQ(file.default_package, std::nullopt);
  EXPECT_EQ(file.default_grade, std::nullopt);
  EXPECT_EQ(file.description, "");
}

TEST_F(DeviceFileTest, ReportsWhatCannotBeRead) {
  EXPECT_EQ(ErrorAtPath(folder_.File("absent.toml")),
            folder_.File("absent.toml") + ": cannot be read: No such file or directory");
  EXPECT_EQ(ErrorAtPath(folder_.path()), folder_.path() + ": cannot be read: it is a directory");
  const std::string pipe = folder_.File("pipe.toml");
  ASSERT_EQ(mkfifo(pipe.c_str(), 0600), 0);
  EXPECT_EQ(ErrorAtPath(pipe), pipe + ": cannot be read: it is not a regular file");
  const std::string loop = folder_.File("loop.toml");
  std::filesystem::create_symlink(loop, loop);
  EXPECT_THAT(ErrorAtPath(loop), StartsWith(loop + ": cannot be read: "));
}

// A regular file that opens, and has nothing at its beginning that could be read: the memory of
// this process.
TEST_F(DeviceFileTest, ReportsWhatStopsInReading) {
  const std::string link = folder_.File("memory.toml");
  std::filesystem::create_symlink("/proc/self/mem", link);
  EXPECT_EQ(ErrorAtPath(link), link + ": cannot be read: Input/output error");
}

// A regular file of which the system says that it is empty.
TEST_F(DeviceFileTest, ReadsAFileThatHasMoreThanItsSize) {
  std::ifstream file("/proc/version");
  const std::string text{std::istreambuf_iterator<char>(file), {}};
  EXPECT_GT(text.size(), 1u);
  EXPECT_EQ(Device::ReadFileText("/proc/version"), text);
}

TEST_F(DeviceFileTest, ReportsHugeFiles) {
  EXPECT_EQ(Error(std::string(Device::kLargestFile + 1, '#')),
            ": is longer than 262144 bytes, which no device file is");
  EXPECT_EQ(
      Error(kHead + kGrade + std::string(Device::kLargestFile - kHead.size() - kGrade.size(), '#')),
      "no error");
}

TEST_F(DeviceFileTest, ReportsDeepNesting) {
  std::string key;
  for (std::size_t i = 0; i <= Device::kMostDots; ++i) key += "a.";
  EXPECT_EQ(Error("\n" + key + "a = 1\n"), ":2:8194: no device file has more than 4096 dots");
  EXPECT_THAT(Error(key.substr(2) + "a = 1\n"), StartsWith(":1:1: unknown key \"a\""));
  EXPECT_THAT(Error("a = " + std::string(100'000, '[')), StartsWith(":1:"));
}

TEST_F(DeviceFileTest, ReportsMalformedToml) {
  EXPECT_THAT(Error("device = \"dev\"\npackages = \n"), StartsWith(":2:"));
  EXPECT_THAT(Error("device \"dev\"\n"), StartsWith(":1:8: Error while parsing"));
  EXPECT_THAT(Error(std::string("\0\x01\xff\xfe", 4)), StartsWith(":1:"));
  EXPECT_THAT(Error("\x7f"
                    "ELF\x02\x01\x01"),
              StartsWith(":1:1: Error while parsing"));
  EXPECT_THAT(Error("device = \"\xff\"\n"), StartsWith(":1:10: Encountered invalid utf-8"));
}

TEST_F(DeviceFileTest, ReportsDuplicateKeywords) {
  EXPECT_THAT(Error(kHead + "[grade.1]\nO_MAX_HT_LT = 64\nO_MAX_HT_LT = 63\n"),
              testing::AllOf(StartsWith(":5:"), HasSubstr("O_MAX_HT_LT")));
  EXPECT_THAT(Error(kHead + kGrade + kGrade), StartsWith(":5:"));
  EXPECT_THAT(Error(kHead + "device = \"dev\"\n" + kGrade), StartsWith(":3:"));
}

TEST_F(DeviceFileTest, ReportsUnknownKeys) {
  EXPECT_EQ(Error(kHead + "[grade.1]\n  O_MAX_HT = 64\n"), ":4:3: unknown keyword \"O_MAX_HT\"");
  EXPECT_EQ(Error(kHead + "[grade.1]\no_max_ht_lt = 64\n"),
            ":4:1: unknown keyword \"o_max_ht_lt\"");
  EXPECT_EQ(Error(kHead + "default_speed = \"1\"\n" + kGrade),
            ":3:1: unknown key \"default_speed\": must be device, description, packages, "
            "default_package, default_grade or grade");
}

// Quoted keys and texts can have any letter.
TEST_F(DeviceFileTest, ReportsWithoutControlCharacters) {
  EXPECT_THAT(Error("\"a\\u001b[31m\\n\\u009b\" = 1\n"),
              StartsWith(R"(:1:1: unknown key "a\x1b[31m\n\x9b": must be)"));
  EXPECT_EQ(Error(kHead + "[grade.1]\n\"X\\u0007\" = 1\n"), R"(:4:1: unknown keyword "X\x07")");
  EXPECT_THAT(Error("device = \"\\u001b]0;x\\u0007\"\n"),
              StartsWith(R"(:1:10: device name "\x1b]0;x\x07" must be)"));
  EXPECT_THAT(Error("\"\\u001b\" = 1\n\"\\u001b\" = 2\n"),
              testing::AllOf(StartsWith(":2:"), testing::Not(HasSubstr("\x1b"))));
  EXPECT_THAT(Error(kHead + "default_grade = \"\\u001b[2J\"\n" + kGrade),
              StartsWith(R"(:3:17: "\x1b[2J" is not one of the grades)"));
}

TEST_F(DeviceFileTest, ReportsTheBeginningOfWhatIsEndless) {
  const std::string endless(200'000, 'x');
  EXPECT_EQ(Error(kHead + "[grade.1]\n" + endless + " = 1\n"),
            ":4:1: unknown keyword \"" + std::string(100, 'x') + "...\"");
  EXPECT_LT(Error(endless + " = 1\n" + endless.substr(0, 60'000) + " = 1\n" +
                  endless.substr(0, 60'000) + " = 1\n")
                .size(),
            1100U);
  std::string packages;
  for (int i = 0; i < 10'000; ++i) packages += "\"p" + std::to_string(i) + "\", ";
  EXPECT_LT(
      Error("device = \"dev\"\npackages = [" + packages + "]\ndefault_package = \"q\"\n" + kGrade)
          .size(),
      1100U);
}

TEST_F(DeviceFileTest, ReportsTheFirstOfSeveralMistakes) {
  EXPECT_EQ(Error(kHead + "[grade.1]\nZZZ = 1\nAAA = 1\n"), ":4:1: unknown keyword \"ZZZ\"");
}

TEST_F(DeviceFileTest, ReportsWrongTypes) {
  EXPECT_EQ(Error("device = 1\n"), ":1:10: \"device\" must be a text");
  EXPECT_EQ(Error("device = \"dev\"\npackages = \"p1\"\n" + kGrade),
            ":2:12: \"packages\" must be a list of texts");
  EXPECT_EQ(Error("device = \"dev\"\npackages = [\"p1\", 2]\n" + kGrade),
            ":2:19: \"packages\" must be a text");
  EXPECT_EQ(Error("description = [1]\n" + kHead + kGrade), ":1:15: \"description\" must be a text");
  EXPECT_EQ(Error(kHead + "default_grade = 1\n" + kGrade),
            ":3:17: \"default_grade\" must be a text");
  EXPECT_EQ(Error(kHead + "default_package = true\n" + kGrade),
            ":3:19: \"default_package\" must be a text");
  EXPECT_EQ(Error(kHead + "grade = 1\n"), ":3:9: \"grade\" must be made of [grade.<name>] tables");
  EXPECT_EQ(Error(kHead + "[[grade]]\n"), ":3:1: \"grade\" must be made of [grade.<name>] tables");
  EXPECT_EQ(Error(kHead + "[grade]\nfast = 1\n"),
            ":4:1: grade \"fast\" must be a [grade.<name>] table");
  EXPECT_EQ(Error(kHead + "[grade.1]\nO_MAX_HT_LT = \"64\"\n"),
            ":4:15: \"O_MAX_HT_LT\" must be a number");
  EXPECT_EQ(Error(kHead + "[grade.1]\nO_MAX_HT_LT = true\n"),
            ":4:15: \"O_MAX_HT_LT\" must be a number");
  EXPECT_EQ(Error(kHead + "[grade.1]\nO_MAX_HT_LT = [64]\n"),
            ":4:15: \"O_MAX_HT_LT\" must be a number");
}

TEST_F(DeviceFileTest, ReportsNumbersThatAreNoLimits) {
  for (const std::string number : {"0", "-1", "0.0", "-0.0", "-2.5", "inf", "-inf", "nan"}) {
    EXPECT_EQ(Error(kHead + "[grade.1]\nO_MAX_HT_LT = " + number + "\n"),
              ":4:15: \"O_MAX_HT_LT\" must be a finite positive number")
        << number;
  }
  EXPECT_EQ(Error(kHead + "[grade.1]\nO_MAX_HT_LT = 9223372036854775807\n"), "no error");
  EXPECT_EQ(Error(kHead + "[grade.1]\nO_MAX_HT_LT = 1e-300\n"), "no error");
}

TEST_F(DeviceFileTest, ReportsADeviceThatIsNotNamedAsItsFile) {
  EXPECT_EQ(Error("device = \"Dev\"\npackages = [\"p1\"]\n" + kGrade),
            ":1:10: device \"Dev\" must be named as its file, \"dev\"");
}

TEST_F(DeviceFileTest, ReportsDefaultsThatAreNotThere) {
  EXPECT_EQ(Error(kHead + "default_package = \"p2\"\n" + kGrade),
            ":3:19: \"p2\" is not in the list of packages, which are p1");
  EXPECT_EQ(Error(kHead + "default_grade = \"2\"\n" + kGrade),
            ":3:17: \"2\" is not one of the grades, which are 1");
}

TEST_F(DeviceFileTest, ReportsWhatIsMissing) {
  EXPECT_EQ(Error("packages = [\"p1\"]\n" + kGrade), ":1:1: the key \"device\" is missing");
  EXPECT_EQ(Error("device = \"dev\"\n" + kGrade), ":1:1: the key \"packages\" is missing");
  EXPECT_EQ(Error(kHead), ":1:1: the key \"grade\" is missing");
  EXPECT_EQ(Error(""), ":1:1: the key \"device\" is missing");
  EXPECT_EQ(Error("device = \"dev\"\npackages = []\n" + kGrade),
            ":2:12: \"packages\" must name at least one package");
  EXPECT_EQ(Error(kHead + "[grade]\n"), ":3:2: there must be at least one [grade.<name>] table");
  EXPECT_EQ(Error("device = \"dev\"\npackages = [\"p1\", \"p1\"]\n" + kGrade),
            ":2:19: duplicate package \"p1\"");
}

TEST_F(DeviceFileTest, ReportsNamesWithOtherCharacters) {
  const std::string rule = " must be made of letters, digits and _";
  EXPECT_EQ(Error("device = \"d-v\"\n"), ":1:10: device name \"d-v\"" + rule);
  EXPECT_EQ(Error("device = \"\"\n"), ":1:10: device name \"\"" + rule);
  EXPECT_EQ(Error("device = \"dev\"\npackages = [\"p 1\"]\n" + kGrade),
            ":2:13: package name \"p 1\"" + rule);
  EXPECT_EQ(Error(kHead + "[grade.\"1-2\"]\nO_MAX_HT_LT = 64\n"),
            ":3:8: grade name \"1-2\"" + rule);
  EXPECT_EQ(Error("device = \"dev\"\npackages = [\"\xc3\xbc\"]\n" + kGrade),
            ":2:13: package name \"\xc3\xbc\"" + rule);
}

}  // namespace
