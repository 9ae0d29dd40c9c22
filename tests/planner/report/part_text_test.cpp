// Why a name is no part, as sentences.
#include <gtest/gtest.h>

#include "planner/report/PartText.h"

namespace planner::report {

namespace {

using device::PartError;

PartError Error(PartError::Kind kind, std::vector<std::string> candidates) {
  PartError error(kind);
  error.name = "vk4";
  error.device = "vk40";
  error.detail = "b9";
  error.candidates = std::move(candidates);
  return error;
}

TEST(PartText, EachKindHasASentence) {
  EXPECT_EQ(PartText(Error(PartError::Kind::kUnknownDevice, {"vk10", "vk40"})),
            "unknown device \"vk4\"; the devices are vk10, vk40");
  EXPECT_EQ(PartText(Error(PartError::Kind::kUnknownPackage, {"q144"})),
            "vk40 has no package \"b9\"; it has q144");
  EXPECT_EQ(PartText(Error(PartError::Kind::kUnknownGrade, {"1", "2"})),
            "vk40 has no grade \"b9\"; it has 1, 2");
  EXPECT_EQ(PartText(Error(PartError::Kind::kNoDefaultGrade, {"1", "2"})),
            "vk40 has no default grade; it has 1, 2");
  EXPECT_EQ(PartText(Error(PartError::Kind::kAmbiguous, {"vk40", "vk41"})),
            "device \"vk4\" could be vk40, vk41");
}

TEST(PartText, FilesThatAreBad) {
  PartError error = Error(PartError::Kind::kBadFile, {});
  error.complaints = {{"vk40", "a/vk40.toml", 3, 5, "a number is missing"}};
  EXPECT_EQ(PartText(error), "a/vk40.toml:3:5: a number is missing");
  error.kind = PartError::Kind::kUnknownDevice;
  error.candidates = {"vk10"};
  EXPECT_EQ(PartText(error),
            "unknown device \"vk4\"; the devices are vk10; it could be a part of vk40, whose file "
            "is bad: a/vk40.toml:3:5: a number is missing");
}

TEST(PartText, DevicesWithoutAPrimitive) {
  planner::Device device;
  device.part = "small-1";
  EXPECT_EQ(LacksAllText(device), "small-1 has the limits of no primitive");
  device.primitives = {Primitive::kPll, Primitive::kKruSp};
  EXPECT_EQ(LacksText(device, Primitive::kTsyn), "small-1 has no TSYN; it has PLL, KRU_SP");
}

}  // namespace

}  // namespace planner::report
