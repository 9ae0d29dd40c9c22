// Devices for many requests: each is read once.
//
// Tested by answerer_test.cpp.
#ifndef VORKEL_PLANNER_BATCH_DEVICES_H_
#define VORKEL_PLANNER_BATCH_DEVICES_H_

#include <map>
#include <memory>
#include <string>

#include "planner/Device.h"
#include "planner/device/Files.h"

namespace planner::batch {

class Devices {
 public:
  // The files must outlive it.
  explicit Devices(const device::Files& files) : files_(files) {}

  // The device that a name, or its beginning, stands for. Throws device::PartError. A file that is
  // changed later is not read again.
  std::shared_ptr<const Device> Find(const std::string& name);

 private:
  const device::Files& files_;
  std::map<std::string, std::shared_ptr<const Device>> known_;
};

}  // namespace planner::batch

#endif  // VORKEL_PLANNER_BATCH_DEVICES_H_
