// What the host knows of a device personality and of its speed data.
#ifndef VORKEL_HOST_BUNDLED_DEVICE_PERSONALITY_H_
#define VORKEL_HOST_BUNDLED_DEVICE_PERSONALITY_H_

#include <atomic>
#include <functional>
#include <memory>
#include <string>
#include <string_view>
#include <unordered_map>

#include "host/Dly_SpeedController.h"
#include "host/PM_PIC.h"
#include "host/bundled/device/PartName.h"

class Tw_BmCMBCalculator;

struct PM_PIC::Data {
  Device::Part part;
};

namespace Device {

struct KeywordHash {
  using is_transparent = void;
  std::size_t operator()(std::string_view keyword) const {
    return std::hash<std::string_view>()(keyword);
  }
};

}  // namespace Device

struct Dly_SpeedController::Data {
  std::string device;
  std::string grade;
  // By keyword, as GetBelDelay returns them.
  std::unordered_map<std::string, double, Device::KeywordHash, std::equal_to<>> figures;
  // The same and more, as the device file gives them.
  Device::Grade speed_data;
  // The calculator that was made for this controller, null when there is none. Calculators
  // belong to those who asked for them: one that is destroyed clears this place, and one that
  // outlives the controller keeps the place alive.
  std::shared_ptr<std::atomic<Tw_BmCMBCalculator*>> calculator;
};

#endif  // VORKEL_HOST_BUNDLED_DEVICE_PERSONALITY_H_
