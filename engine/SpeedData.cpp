// The device's speed data: the controller that has them, and one value by keyword.
//
// Tested by speed_data_test.cpp.

#include <limits>
#include <memory>

#include "engine/Ip_VorkelImp.h"
#include "engine/Messages.h"
#include "host/Dly_SpeedController.h"
#include "host/PM_PIC.h"
#include "host/Util_SharedObjects.h"

namespace Ip {

namespace {

// What the speed-data service answers for a keyword that it does not have.
constexpr double kNoSuchKey = std::numeric_limits<double>::max();

// Speed data are scaled so that this gives MHz, ns or a plain count.
constexpr double kSpeedDataUnit = 1e9;

// The controller for `pic`: that of the registry, or a new one that goes into it.
Dly_SpeedController* ShareController(const PM_PIC* pic) {
  auto& controllers = Util::SharedObjects<PM_PIC, Dly_SpeedController>::Instance(pic);
  if (Dly_SpeedController* shared = controllers.Get()) return shared;
  auto created = std::make_unique<Dly_SpeedController>(pic);
  controllers.Create(created.get());
  return created.release();
}

}  // namespace

bool VorkelImp::EnsureSpeedController() {
  if (speedController != nullptr) return true;
  if (partName.IsEmpty()) return false;
  // The host says by an exception that it has no such device or no data for it. One of any other
  // type comes to the same: there is no controller, and no exception leaves the engine.
  try {
    auto personality = std::make_unique<PM_PIC>(partName, true, PM_PARTNAME_BINDING{});
    personality->fill_defaults();  // what stays open is the controller's to judge
    speedController = ShareController(personality.get());
    pic = personality.release();
  } catch (...) {
    return false;
  }
  return speedController != nullptr;
}

bool VorkelImp::GetSpdKeyValue(Port::StringBase keyword, double* value) {
  return ReadSpeedData(keyword, value);
}

bool VorkelImp::ReadSpeedData(const Port::StringBase& keyword, double* value) {
  if (keyword.IsEmpty()) {
    Message()->issueError("Internal GetSpdKeyValue() error -- keyword is empty\n");
    return false;
  }
  if (partName.IsEmpty()) {
    Message()->issueError("Internal GetSpdKeyValue() error -- no device was specified yet\n");
    return false;
  }
  if (!EnsureSpeedController()) {
    Message()->issueError("Internal GetSpdKeyValue() error -- speedsfile could not be loaded\n");
    return false;
  }
  const double figure = speedController->GetBelDelay(keyword, nullptr);
  if (figure == kNoSuchKey) {
    Message()->issueError(
        "Internal GetSpdKeyValue() error -- could not get speedsfile data for key %s\n",
        keyword.CStr());
    return false;
  }
  *value = figure * kSpeedDataUnit;
  return true;
}

}  // namespace Ip
