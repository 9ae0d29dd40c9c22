// The bundled devices.
#ifndef VORKEL_TESTS_PLANNER_ANSWER_BUNDLED_DEVICE_H_
#define VORKEL_TESTS_PLANNER_ANSWER_BUNDLED_DEVICE_H_

#include <string>

#include "host/bundled/device/DeviceFile.h"
#include "planner/Device.h"
#include "planner/device/FromFile.h"

namespace planner::answer_test {

// BUNDLED_DEVICES is the folder of their files.
inline ::Device::DeviceFile BundledFile(const std::string& name) {
  return ::Device::DeviceFile::Read(std::string(BUNDLED_DEVICES) + '/' + name + ".toml", name);
}
inline Device Bundled(const std::string& name, const std::string& grade) {
  return device::FromFile(BundledFile(name), "", grade);
}

}  // namespace planner::answer_test

#endif  // VORKEL_TESTS_PLANNER_ANSWER_BUNDLED_DEVICE_H_
