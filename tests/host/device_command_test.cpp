// The command by which scripts ask what devices there are.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstdlib>

#include "tests/host/device_folder.h"
#include "tests/host/script_fixture.h"

namespace {

using testing::HasSubstr;
using testing::StartsWith;

class DeviceCommandTest : public testing::Test {
 protected:
  DeviceCommandTest() { Ptrhandleqrm_Init(tcl_.get()); }

  std::string Devices(const std::string& words) { return tcl_.Eval("::Vorkel::Devices " + words); }

  std::string Described(const std::string& device, const std::string& keys) {
    return tcl_.Eval("dict get [::Vorkel::Devices describe " + device + "] " + keys);
  }

  Interpreter tcl_;
  DeviceFolder folder_;
  SearchPath path_{folder_.path()};
};

TEST_F(DeviceCommandTest, ListsTheNames) {
  EXPECT_EQ(Devices("names"), "vk10 vk20 vk40");
  folder_.Write("vk15.toml", "not TOML");
  folder_.Write("a b.toml", "");
  EXPECT_EQ(Devices("names"), "{a b} vk10 vk15 vk20 vk40");
}

TEST_F(DeviceCommandTest, DescribesADevice) {
  const std::string path = folder_.Write("dev.toml",
                                         "device = \"dev\"\n"
                                         "description = \"for t\xc3\xa9sts\"\n"
                                         "packages = [\"p1\", \"p2\"]\n"
                                         "default_package = \"p2\"\n"
                                         "default_grade = \"fast\"\n"
                                         "[grade.slow]\n"
                                         "O_MAX_HT_LT = 64\n"
                                         "VCOCLK_FREQ_MAX = 1000.50\n"
                                         "VCOCLK_FREQ_MIN = 400.0\n"
                                         "[grade.fast]\n"
                                         "CLKPFD_FREQ_MAX = 1e-7\n");
  EXPECT_EQ(tcl_.Eval("dict keys [::Vorkel::Devices describe dev]"),
            "name description file packages default_package grades default_grade primitives "
            "limits calculator");
  EXPECT_EQ(Described("dev", "name"), "dev");
  EXPECT_EQ(Described("dev", "description"), "for t\xc3\xa9sts");
  EXPECT_EQ(Described("dev", "file"), path);
  EXPECT_EQ(Described("dev", "packages"), "p1 p2");
  EXPECT_EQ(Described("dev", "default_package"), "p2");
  EXPECT_EQ(Described("dev", "grades"), "slow fast");
  EXPECT_EQ(Described("dev", "default_grade"), "fast");
  EXPECT_EQ(Described("dev", "primitives"), "");
  EXPECT_EQ(Described("dev", "limits slow"),
            "VCOCLK_FREQ_MIN 400 VCOCLK_FREQ_MAX 1000.5 O_MAX_HT_LT 64");
  EXPECT_EQ(Described("dev", "limits fast"), "CLKPFD_FREQ_MAX 1e-07");
  EXPECT_EQ(Described("dev", "calculator slow"), "");
}

// Of one group and of both: those that a grade lacks are left out, and no more.
TEST_F(DeviceCommandTest, ListsTheCoefficients) {
  const std::string kru =
      "KRU_KAPPA = 80\nKRU_TAP_STEP = 40.5\nKRU_BUFFER_JITTER = 4\nKRU_PHASE_ERROR = 200\n";
  const std::string loop =
      "LOOP_LEAKAGE = 60\nLOOP_KAPPA = 40\nLOOP_KAPPA_VCO = 800\nLOOP_BANDWIDTH_LOW = 0.01\n"
      "LOOP_BANDWIDTH_OPTIMIZED = 0.02\nLOOP_BANDWIDTH_HIGH = 0.04\nLOOP_BUFFER_JITTER = 3\n"
      "LOOP_DETERMINISTIC_JITTER = 30\nLOOP_STATIC_OFFSET = 60\n";
  folder_.Write("dev.toml", "device = \"dev\"\npackages = [\"p1\"]\n[grade.1.calculator]\n" + kru +
                                "[grade.2.calculator]\n" + loop + "[grade.3.calculator]\n" + kru +
                                loop);
  const std::string kru_listed =
      "KRU_KAPPA 80 KRU_TAP_STEP 40.5 KRU_BUFFER_JITTER 4 KRU_PHASE_ERROR 200";
  const std::string loop_listed =
      "LOOP_KAPPA 40 LOOP_KAPPA_VCO 800 LOOP_BANDWIDTH_LOW 0.01 LOOP_BANDWIDTH_OPTIMIZED 0.02 "
      "LOOP_BANDWIDTH_HIGH 0.04 LOOP_BUFFER_JITTER 3 LOOP_DETERMINISTIC_JITTER 30 "
      "LOOP_STATIC_OFFSET 60 LOOP_LEAKAGE 60";
  EXPECT_EQ(Described("dev", "calculator 1"), kru_listed);
  EXPECT_EQ(Described("dev", "calculator 2"), loop_listed);
  EXPECT_EQ(Described("dev", "calculator 3"), loop_listed + " " + kru_listed);
}

TEST_F(DeviceCommandTest, DescribesADeviceWithoutDefaults) {
  folder_.Write("dev.toml",
                "device = \"dev\"\npackages = [\"p1\"]\n[grade.1]\n"
                "D_KRU_CLKFX_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MINPERIOD = 2.5\n"
                "D_KRU_CLKFX_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MAXPERIOD = 200\n"
                "D_KRU_CLKFXDV_CLKIN_DIVIDE_BY_2_FALSE_MAXPERIOD = 6400\n"
                "D_KRU_CLKFXDV_CLKIN_DIVIDE_BY_2_FALSE_MINPERIOD = 5\n"
                "[grade.2]\nO_MAX_HT_LT = 64\n");
  EXPECT_EQ(Described("dev", "description"), "");
  EXPECT_EQ(Described("dev", "default_package"), "");
  EXPECT_EQ(Described("dev", "default_grade"), "");
  EXPECT_EQ(Described("dev", "primitives"), "KRU_CLKGEN");
}

TEST_F(DeviceCommandTest, ListsPrimitivesOfTheBundledDevices) {
  EXPECT_EQ(Described("vk10", "primitives"), "PLL KRU_SP KRU_CLKGEN");
  EXPECT_EQ(Described("vk20", "primitives"), "TSYN");
  EXPECT_EQ(Described("vk40", "primitives"), "PLL TSYN KRU_SP KRU_CLKGEN");
  EXPECT_EQ(Described("vk10", "file"), VORKEL_PACKAGE_DIR "/devices/vk10.toml");
}

TEST_F(DeviceCommandTest, FollowsTheVariableOfTheScript) {
  const DeviceFolder other;
  other.WriteDevice("elsewhere");
  EXPECT_THAT(Devices("describe elsewhere"), StartsWith("error: unknown device"));
  EXPECT_EQ(tcl_.Eval("set env(VORKEL_DEVICES) " + other.path()), other.path());
  EXPECT_EQ(Described("elsewhere", "name"), "elsewhere");
}

TEST_F(DeviceCommandTest, ListsTheKeywords) {
  EXPECT_EQ(tcl_.Eval("llength [::Vorkel::Devices keywords]"), "31");
  EXPECT_EQ(tcl_.Eval("lindex [::Vorkel::Devices keywords] 0"), "VCOCLK_FREQ_MIN MHz PLL");
  const std::string keywords = Devices("keywords");
  EXPECT_THAT(keywords, HasSubstr("{O_MAX_HT_LT count {PLL TSYN}}"));
  EXPECT_THAT(keywords,
              HasSubstr("{D_KRU_CLKFX_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MAXPERIOD ns "
                        "{KRU_SP KRU_CLKGEN}}"));
}

TEST_F(DeviceCommandTest, ReportsABadFile) {
  const std::string bad = folder_.Write("bad.toml", "device = \"bad\"\n  nonsense = 1\n");
  EXPECT_THAT(Devices("describe bad"), StartsWith("error: " + bad + ":2:3: unknown key"));
  std::filesystem::create_directory(folder_.File("dir.toml"));
  EXPECT_EQ(Devices("describe dir"),
            "error: " + folder_.File("dir.toml") + ": cannot be read: it is a directory");
}

TEST_F(DeviceCommandTest, ReportsWrongUse) {
  EXPECT_EQ(Devices(""), "error: wrong # args: should be \"::Vorkel::Devices option ?arg?\"");
  EXPECT_EQ(Devices("list"), "error: bad option \"list\": must be describe, keywords, or names");
  EXPECT_EQ(Devices("names x"), "error: wrong # args: should be \"::Vorkel::Devices names\"");
  EXPECT_EQ(Devices("keywords x"), "error: wrong # args: should be \"::Vorkel::Devices keywords\"");
  for (const char* words : {"describe", "describe a b"}) {
    EXPECT_EQ(Devices(words), "error: wrong # args: should be \"::Vorkel::Devices describe name\"");
  }
  EXPECT_EQ(Devices("describe vk"), "error: unknown device \"vk\": must be vk10, vk20 or vk40");
  EXPECT_EQ(Devices("describe {}"), "error: unknown device \"\": must be vk10, vk20 or vk40");
}

}  // namespace
