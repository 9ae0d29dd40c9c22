// What the host knows of a device personality and of its speed data.
#ifndef VORKEL_HOST_BUNDLED_DEVICE_PERSONALITY_H_
#define VORKEL_HOST_BUNDLED_DEVICE_PERSONALITY_H_

#include <atomic>
#include <memory>
#include <vector>

#include "host/Dly_SpeedController.h"
#include "host/PM_PIC.h"
#include "host/bundled/device/PartName.h"

class Tw_BmCMBCalculator;

struct PM_PIC::Data {
  Device::Part part;
};

struct Dly_SpeedController::Data {
  // What the device file says, and the grade of it that this is about.
  std::shared_ptr<const Device::DeviceFile> file;
  const Device::Grade* grade;
  // By keyword index, as GetBelDelay returns them.
  std::vector<double> figures;
  // The calculator that was made for this controller, null when there is none. Calculators
  // belong to those who asked for them: one that is destroyed clears this place, and one that
  // outlives the controller keeps the place alive.
  std::shared_ptr<std::atomic<Tw_BmCMBCalculator*>> calculator;
};

#endif  // VORKEL_HOST_BUNDLED_DEVICE_PERSONALITY_H_
