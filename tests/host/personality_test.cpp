// Device personality and speed data, through the interfaces that the engine uses.
#include "host/bundled/device/Personality.h"

#include <gtest/gtest.h>

#include <limits>

#include "host/Port_Exception.h"
#include "host/Tw_BmCMBCalculator.h"
#include "tests/host/device_folder.h"

namespace {

constexpr double kNoFigure = std::numeric_limits<double>::max();

class PersonalityTest : public testing::Test {
 protected:
  // Runs what must throw Port::Exception: its text. It must be what was issued, once.
  template <typename Action>
  std::string Failure(Action action) {
    std::string text;
    testing::internal::CaptureStderr();
    try {
      action();
    } catch (const Port::Exception& error) {
      text = error.what();
      EXPECT_EQ(error.Category(), Port::StringBase("DesignEntry"));
    }
    EXPECT_EQ(testing::internal::GetCapturedStderr(), "ERROR:DesignEntry: " + text + "\n");
    return text;
  }

  DeviceFolder folder_;
  SearchPath path_{folder_.path()};
};

PM_PIC Personality(const char* part_name, bool is_part_name = true) {
  return PM_PIC(part_name, is_part_name, PM_PARTNAME_BINDING_USUAL);
}

TEST_F(PersonalityTest, KeepsWhatThePartNameSays) {
  folder_.WriteDevice("dev");
  PM_PIC pic = Personality("devp1-g1");
  EXPECT_TRUE(pic.fill_defaults());
  EXPECT_EQ(pic.data().part.package, "p1");
  EXPECT_EQ(pic.data().part.grade, "g1");
}

TEST_F(PersonalityTest, FillsWhatThePartNameLeavesOut) {
  folder_.WriteDevice("dev");
  PM_PIC pic = Personality("dev");
  EXPECT_EQ(pic.data().part.package, std::nullopt);
  EXPECT_EQ(pic.data().part.grade, std::nullopt);
  EXPECT_TRUE(pic.fill_defaults());
  EXPECT_EQ(pic.data().part.package, "p2");
  EXPECT_EQ(pic.data().part.grade, "g2");
}

// Without a file or a search path: the controller has the figures of the given device.
TEST_F(PersonalityTest, CanBeThatOfADeviceInMemory) {
  auto file = std::make_shared<const Device::DeviceFile>(Device::DeviceFile::Parse(
      "device = \"dev\"\npackages = [\"p\"]\n[grade.1]\nO_MAX_HT_LT = 64\n", "nowhere", "dev"));
  PM_PIC pic(std::make_unique<PM_PIC::Data>(
      PM_PIC::Data{Device::Part{std::move(file), std::nullopt, "1"}}));
  const Dly_SpeedController controller(&pic);
  EXPECT_EQ(controller.GetBelDelay("O_MAX_HT_LT", nullptr) * 1e9, 64.0);
  EXPECT_EQ(controller.GetBelDelay("VCOCLK_FREQ_MAX", nullptr), kNoFigure);
}

TEST_F(PersonalityTest, CannotFillWithoutDefaults) {
  const std::string head = "device = \"dev\"\npackages = [\"p1\"]\n";
  const std::string grade = "[grade.1]\nO_MAX_HT_LT = 64\n";
  folder_.Write("dev.toml", head + "default_package = \"p1\"\n" + grade);
  PM_PIC without_grade = Personality("dev");
  EXPECT_FALSE(without_grade.fill_defaults());
  EXPECT_EQ(without_grade.data().part.package, "p1");
  EXPECT_TRUE(Personality("dev-1").fill_defaults());
  folder_.Write("dev.toml", head + "default_grade = \"1\"\n" + grade);
  PM_PIC without_package = Personality("dev");
  EXPECT_FALSE(without_package.fill_defaults());
  EXPECT_EQ(without_package.data().part.grade, "1");
  EXPECT_TRUE(Personality("devp1").fill_defaults());
}

TEST_F(PersonalityTest, TakesABareDeviceName) {
  folder_.WriteDevice("dev");
  EXPECT_TRUE(Personality("dev", false).fill_defaults());
  EXPECT_NE(Failure([] { Personality("devp1", false); }), "");
}

TEST_F(PersonalityTest, IssuesWhatItThrows) {
  const std::string path = folder_.WriteDevice("dev");
  EXPECT_EQ(Failure([] { Personality("devx"); }),
            path + ":2:1: unknown package \"x\" in part name \"devx\": device dev has p1, p2");
  EXPECT_TRUE(Failure([] { Personality("other"); }).starts_with("unknown device"));
  const std::string bad = folder_.Write("bad.toml", "device = \"bad\"\n\nx = 1\n");
  EXPECT_TRUE(Failure([] { Personality("bad"); }).starts_with(bad + ":3:1: unknown key \"x\""));
}

TEST_F(PersonalityTest, ReadsTheSpeedDataOfTheGrade) {
  folder_.WriteDevice("dev");
  const auto highest_vco = [](const char* part_name) {
    PM_PIC pic = Personality(part_name);
    EXPECT_TRUE(pic.fill_defaults());
    return Dly_SpeedController(&pic).GetBelDelay("VCOCLK_FREQ_MAX", nullptr) * 1e9;
  };
  EXPECT_EQ(highest_vco("dev-g1"), 1000.0);
  EXPECT_EQ(highest_vco("devp1-g2"), 1100.0);
  EXPECT_EQ(highest_vco("dev"), 1100.0);
}

TEST_F(PersonalityTest, HasNoFigureForOtherKeywords) {
  folder_.WriteDevice("dev");
  PM_PIC pic = Personality("dev-g1");
  const Dly_SpeedController controller(&pic);
  EXPECT_NE(controller.GetBelDelay("VCOCLK_FREQ_MAX", nullptr), kNoFigure);
  for (const char* keyword : {"VCOCLK_FREQ_MIN", "", "vcoclk_freq_max", "nonsense"}) {
    EXPECT_EQ(controller.GetBelDelay(keyword, nullptr), kNoFigure) << keyword;
  }
}

TEST_F(PersonalityTest, OutlivesFileAndPersonality) {
  folder_.WriteDevice("dev");
  auto pic = std::make_unique<PM_PIC>("dev-g1", true, PM_PARTNAME_BINDING_USUAL);
  std::filesystem::remove(folder_.File("dev.toml"));
  const Dly_SpeedController controller(pic.get());
  pic.reset();
  EXPECT_EQ(controller.GetBelDelay("VCOCLK_FREQ_MAX", nullptr) * 1e9, 1000.0);
  EXPECT_EQ(controller.data().file->device, "dev");
  EXPECT_EQ(controller.data().grade->name, "g1");
}

TEST_F(PersonalityTest, SharesWhatTheFileSays) {
  folder_.WriteDevice("dev");
  const PM_PIC one = Personality("dev-g1");
  const PM_PIC other = Personality("devp1-g2");
  EXPECT_EQ(one.data().part.file, other.data().part.file);
  const Dly_SpeedController controller(&one);
  EXPECT_EQ(controller.data().file, one.data().part.file);
}

TEST_F(PersonalityTest, HasNoSpeedDataWithoutAGrade) {
  const std::string path = folder_.WriteDevice("dev");
  const PM_PIC pic = Personality("dev");
  EXPECT_EQ(Failure([&] { Dly_SpeedController controller(&pic); }),
            path + ":5:2: no speed grade was given for device \"dev\", which has g1, g2");
  EXPECT_EQ(Failure([] { Dly_SpeedController controller(nullptr); }),
            "there is no device to read the speed data of");
}

TEST_F(PersonalityTest, HasNoCalculator) {
  folder_.WriteDevice("dev");
  const PM_PIC pic = Personality("dev-g1");
  Dly_SpeedController controller(&pic);
  EXPECT_EQ(Tw_BmPhysicalBlockModeler::GetCMBCalculator(&controller), nullptr);
}

}  // namespace
