// Tests of reading one value of the speed data, and of what is reported when that fails.

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <set>
#include <string>

#include "tests/engine/EngineTest.h"
#include "tests/support/FakeHost.h"

namespace {

using engine_test::kInfinity;
using engine_test::kNan;
using Ip::VorkelImp;
using testing::ElementsAre;
using testing::IsEmpty;

constexpr char kPart[] = "speedy";
constexpr double kUntouched = -77.0;

constexpr char kEmptyKeyword[] = "Internal GetSpdKeyValue() error -- keyword is empty\n";
constexpr char kNoDevice[] = "Internal GetSpdKeyValue() error -- no device was specified yet\n";
constexpr char kNotLoaded[] = "Internal GetSpdKeyValue() error -- speedsfile could not be loaded\n";

class SpeedDataTest : public testing::Test {
 protected:
  SpeedDataTest() {
    host_.Reset();
    host_.devices[kPart] = {{"KEY", 2.5e-7}};
  }

  // An object with the device selected.
  VorkelImp& DeviceImp() {
    VorkelImp& imp = engine_test::NewImp();
    imp.SetDevice(kPart);
    return imp;
  }

  // The value that a figure of the device reads as.
  double ValueOf(double figure) {
    host_.devices[kPart]["FIGURE"] = figure;
    double value = kUntouched;
    EXPECT_TRUE(DeviceImp().GetSpdKeyValue("FIGURE", &value)) << figure;
    return value;
  }

  FakeHost& host_ = FakeHost::Instance();
  double value_ = kUntouched;
};

TEST_F(SpeedDataTest, ReadsAValueInItsNaturalUnit) {
  VorkelImp& imp = DeviceImp();
  EXPECT_TRUE(imp.GetSpdKeyValue("KEY", &value_));
  EXPECT_EQ(value_, 2.5e-7 * 1e9);
  EXPECT_THAT(host_.reads, ElementsAre("KEY"));
  EXPECT_THAT(host_.messages, IsEmpty());
}

TEST_F(SpeedDataTest, EveryFigureButTheLargestDoubleIsAValue) {
  EXPECT_EQ(ValueOf(0.0), 0.0);
  EXPECT_EQ(ValueOf(-3.0), -3e9);
  EXPECT_EQ(ValueOf(FigureFor(1080)), 1080.0);
  EXPECT_EQ(ValueOf(kInfinity), kInfinity);
  EXPECT_EQ(ValueOf(-std::numeric_limits<double>::max()), -kInfinity);
  EXPECT_EQ(ValueOf(std::nextafter(std::numeric_limits<double>::max(), 0.0)), kInfinity);
  EXPECT_TRUE(std::isnan(ValueOf(kNan)));
  EXPECT_THAT(host_.messages, IsEmpty());
}

TEST_F(SpeedDataTest, AMissingKeywordIsReportedByName) {
  EXPECT_FALSE(DeviceImp().GetSpdKeyValue("NO_SUCH_KEY", &value_));
  EXPECT_EQ(value_, kUntouched);
  EXPECT_THAT(host_.reads, ElementsAre("NO_SUCH_KEY"));
  EXPECT_THAT(host_.MessageTexts(),
              ElementsAre("Internal GetSpdKeyValue() error -- could not get speedsfile data for "
                          "key NO_SUCH_KEY\n"));
}

TEST_F(SpeedDataTest, TheLargestDoubleIsAMissingKeywordToo) {
  host_.devices[kPart]["FULL"] = 1.7976931348623157e308;
  EXPECT_FALSE(DeviceImp().GetSpdKeyValue("FULL", &value_));
  EXPECT_EQ(value_, kUntouched);
  EXPECT_THAT(host_.MessageTexts(),
              ElementsAre("Internal GetSpdKeyValue() error -- could not get speedsfile data for "
                          "key FULL\n"));
}

TEST_F(SpeedDataTest, AKeywordIsNoFormat) {
  EXPECT_FALSE(DeviceImp().GetSpdKeyValue("%s%n 100%", &value_));
  EXPECT_THAT(host_.MessageTexts(),
              ElementsAre("Internal GetSpdKeyValue() error -- could not get speedsfile data for "
                          "key %s%n 100%\n"));
}

TEST_F(SpeedDataTest, KeywordsAreTakenAsTheyStand) {
  EXPECT_FALSE(DeviceImp().GetSpdKeyValue("key", &value_));
  EXPECT_FALSE(DeviceImp().GetSpdKeyValue(" KEY", &value_));
  EXPECT_THAT(host_.reads, ElementsAre("key", " KEY"));
}

TEST_F(SpeedDataTest, AnEmptyKeywordIsReportedBeforeAnythingElse) {
  EXPECT_FALSE(engine_test::NewImp().GetSpdKeyValue("", &value_));
  VorkelImp& imp = DeviceImp();
  EXPECT_FALSE(imp.GetSpdKeyValue("", &value_));
  EXPECT_EQ(value_, kUntouched);
  EXPECT_THAT(host_.MessageTexts(), ElementsAre(kEmptyKeyword, kEmptyKeyword));
  EXPECT_EQ(imp.speedController, nullptr);
  EXPECT_THAT(host_.reads, IsEmpty());
}

TEST_F(SpeedDataTest, NoDeviceIsReported) {
  EXPECT_FALSE(engine_test::NewImp().GetSpdKeyValue("KEY", &value_));
  EXPECT_EQ(value_, kUntouched);
  EXPECT_THAT(host_.MessageTexts(), ElementsAre(kNoDevice));
  EXPECT_THAT(host_.reads, IsEmpty());
}

TEST_F(SpeedDataTest, AnUnknownDeviceIsReportedAtEveryRead) {
  VorkelImp& imp = engine_test::NewImp();
  imp.SetDevice("unknown");
  EXPECT_FALSE(imp.GetSpdKeyValue("KEY", &value_));
  EXPECT_FALSE(imp.GetSpdKeyValue("KEY", &value_));
  EXPECT_EQ(value_, kUntouched);
  EXPECT_THAT(host_.MessageTexts(), ElementsAre(kNotLoaded, kNotLoaded));
}

TEST_F(SpeedDataTest, ADeviceWithoutSpeedDataIsReported) {
  host_.withoutSpeedData.push_back(kPart);
  EXPECT_FALSE(DeviceImp().GetSpdKeyValue("KEY", &value_));
  EXPECT_EQ(value_, kUntouched);
  EXPECT_THAT(host_.MessageTexts(), ElementsAre(kNotLoaded));
  EXPECT_THAT(host_.reads, IsEmpty());
}

TEST_F(SpeedDataTest, ADeviceAtWhichTheHostThrowsIsReported) {
  for (const auto& action : engine_test::Throwers()) {
    host_.messages.clear();
    host_.whileControllerIsMade = action;
    EXPECT_FALSE(DeviceImp().GetSpdKeyValue("KEY", &value_));
    EXPECT_EQ(value_, kUntouched);
    EXPECT_THAT(host_.MessageTexts(), ElementsAre(kNotLoaded));
  }
}

TEST_F(SpeedDataTest, MessagesSayWhereTheyComeFrom) {
  engine_test::NewImp().GetSpdKeyValue("", &value_);
  engine_test::NewImp().GetSpdKeyValue("KEY", &value_);
  VorkelImp& unknown = engine_test::NewImp();
  unknown.SetDevice("unknown");
  unknown.GetSpdKeyValue("KEY", &value_);
  DeviceImp().GetSpdKeyValue("NO_SUCH_KEY", &value_);

  ASSERT_EQ(host_.messages.size(), 4u);
  std::set<int> lines;
  for (const FakeHost::Message& message : host_.messages) {
    EXPECT_EQ(message.category, "DesignEntry") << message.text;
    EXPECT_EQ(message.source, "../s/Ip_VorkelImp") << message.text;
    EXPECT_EQ(message.revision, host_.messages[0].revision) << message.text;
    EXPECT_GT(message.line, 0) << message.text;
    lines.insert(message.line);
  }
  EXPECT_EQ(lines.size(), 4u) << "each line is that of the statement that reports";
}

TEST_F(SpeedDataTest, AFailedReadDoesNotHinderTheNext) {
  VorkelImp& imp = DeviceImp();
  EXPECT_FALSE(imp.GetSpdKeyValue("NO_SUCH_KEY", &value_));
  EXPECT_TRUE(imp.GetSpdKeyValue("KEY", &value_));
  EXPECT_EQ(value_, 250.0);
}

}  // namespace
