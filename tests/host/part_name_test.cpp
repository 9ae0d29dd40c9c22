#include <gtest/gtest.h>

#include "host/bundled/device/PartName.h"
#include "tests/host/device_folder.h"

namespace {

using Device::DeviceCatalogue;
using Device::FindPart;
using Device::Part;

class PartNameTest : public testing::Test {
 protected:
  DeviceCatalogue Catalogue() { return DeviceCatalogue::ListFolders({folder_.path()}); }

  // "<device> <package> <grade>" with - for what the name leaves out, or the error.
  std::string Meaning(const std::string& part_name) {
    try {
      const Part part = FindPart(Catalogue(), part_name);
      return part.file->device + ' ' + part.package.value_or("-") + ' ' + part.grade.value_or("-");
    } catch (const Device::DeviceError& error) {
      return error.what();
    }
  }

  std::string DeviceMeaning(const std::string& device) {
    try {
      return FindDevice(Catalogue(), device)->device;
    } catch (const Device::DeviceError& error) {
      return error.what();
    }
  }

  void WriteWithPackage(const std::string& device, const std::string& package) {
    folder_.Write(device + ".toml", "device = \"" + device + "\"\npackages = [\"" + package +
                                        "\"]\n[grade.1]\nO_MAX_HT_LT = 64\n");
  }

  DeviceFolder folder_;
};

TEST_F(PartNameTest, MayLeaveOutPackageAndGrade) {
  folder_.WriteDevice("dev");
  EXPECT_EQ(Meaning("dev"), "dev - -");
  EXPECT_EQ(Meaning("devp1"), "dev p1 -");
  EXPECT_EQ(Meaning("dev-g1"), "dev - g1");
  EXPECT_EQ(Meaning("devp2-g2"), "dev p2 g2");
}

TEST_F(PartNameTest, ReportsUnknownDevices) {
  folder_.WriteDevice("one");
  folder_.WriteDevice("two");
  const std::string known = "\": the devices are one, two; the folders searched are ";
  for (const char* name : {"", "three", "on", "One", " one", "-g1", "../one"}) {
    EXPECT_EQ(Meaning(name),
              "unknown device in part name \"" + std::string(name) + known + folder_.path());
  }
}

TEST_F(PartNameTest, ReportsThatThereAreNoDevices) {
  EXPECT_EQ(Meaning("dev"),
            "unknown device in part name \"dev\": the devices are none; "
            "the folders searched are " +
                folder_.path());
  EXPECT_THROW(FindPart(DeviceCatalogue::ListFolders({}), "dev"), Device::DeviceError);
}

TEST_F(PartNameTest, ReportsUnknownPackages) {
  const std::string path = folder_.WriteDevice("dev");
  EXPECT_EQ(Meaning("devp3-g1"), path +
                                     ":2:1: unknown package \"p3\" in part name "
                                     "\"devp3-g1\": device dev has p1, p2");
  EXPECT_EQ(Meaning("devP1"), path +
                                  ":2:1: unknown package \"P1\" in part name "
                                  "\"devP1\": device dev has p1, p2");
  EXPECT_EQ(Meaning("dev "), path +
                                 ":2:1: unknown package \" \" in part name "
                                 "\"dev \": device dev has p1, p2");
}

TEST_F(PartNameTest, ReportsUnknownGrades) {
  const std::string path = folder_.WriteDevice("dev");
  for (const std::string grade : {"g3", "", "G1", "g1-g2", "g1 "}) {
    EXPECT_EQ(Meaning("devp1-" + grade), path + ":5:2: unknown grade \"" + grade +
                                             "\" in part name \"devp1-" + grade +
                                             "\": device dev has g1, g2");
  }
}

TEST_F(PartNameTest, MeansTheLongestDevice) {
  WriteWithPackage("dev", "b256");
  WriteWithPackage("devb", "q144");
  WriteWithPackage("devb2", "56");
  EXPECT_EQ(Meaning("dev"), "dev - -");
  EXPECT_EQ(Meaning("devb"), "devb - -");
  EXPECT_EQ(Meaning("devbq144"), "devb q144 -");
  EXPECT_EQ(Meaning("devb256"), "devb2 56 -");
}

TEST_F(PartNameTest, MeansTheLongestDeviceThatHasThePackage) {
  WriteWithPackage("dev", "b256");
  WriteWithPackage("devb", "q144");
  EXPECT_EQ(Meaning("devb256"), "dev b256 -");
  EXPECT_EQ(Meaning("devb256-1"), "dev b256 1");
}

TEST_F(PartNameTest, ComplainsAboutTheLongestDeviceWhenNoneFits) {
  WriteWithPackage("dev", "b256");
  WriteWithPackage("devb", "q144");
  EXPECT_EQ(Meaning("devb484"), folder_.File("devb.toml") +
                                    ":2:1: unknown package \"484\" in part name \"devb484\": "
                                    "device devb has q144");
}

TEST_F(PartNameTest, NeverPassesOverABadFile) {
  WriteWithPackage("dev", "b256");
  const std::string bad = folder_.Write("devb.toml", "device = \"devb\"\nwhat = 1\n");
  EXPECT_TRUE(Meaning("devb256").starts_with(bad + ":2:1: unknown key")) << Meaning("devb256");
  EXPECT_EQ(Meaning("dev-1"), "dev - 1");
}

TEST_F(PartNameTest, BlamesABadFileForItsOwnDevice) {
  const std::string bad = folder_.Write("dev.toml", "what = 1\n");
  for (const char* name : {"dev", "dev-1", "dev-"}) {
    EXPECT_TRUE(Meaning(name).starts_with(bad + ":1:1: unknown key")) << Meaning(name);
  }
}

TEST_F(PartNameTest, DoesNotBlameABadFileForALongerName) {
  folder_.WriteDevice("other");
  const std::string bad = folder_.Write("dev.toml", "what = 1\n");
  for (const std::string name : {"dev0", "devb256", "devb256-1"}) {
    EXPECT_TRUE(Meaning(name).starts_with(
        "unknown device in part name \"" + name +
        "\": the devices are dev, other; the folders searched are " + folder_.path() +
        "; it could be a part of dev, whose file is bad: " + bad + ":1:1: unknown key"))
        << Meaning(name);
  }
}

TEST_F(PartNameTest, ComplainsAboutTheLongestDeviceBesideABadFile) {
  WriteWithPackage("devb", "q144");
  folder_.Write("dev.toml", "what = 1\n");
  EXPECT_EQ(Meaning("devbq144-1"), "devb q144 1");
  EXPECT_TRUE(Meaning("devbx").starts_with(folder_.File("devb.toml") + ":2:1: unknown package"))
      << Meaning("devbx");
}

TEST_F(PartNameTest, TakesABareDeviceNameAsItIs) {
  folder_.WriteDevice("dev");
  EXPECT_EQ(DeviceMeaning("dev"), "dev");
  EXPECT_EQ(DeviceMeaning("devp1"),
            "unknown device in device name \"devp1\": the devices are "
            "dev; the folders searched are " +
                folder_.path());
}

TEST_F(PartNameTest, ReportsADirectoryInPlaceOfAFile) {
  std::filesystem::create_directory(folder_.File("dir.toml"));
  EXPECT_EQ(Meaning("dir"), folder_.File("dir.toml") + ": cannot be read: it is a directory");
}

}  // namespace
