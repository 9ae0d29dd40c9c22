// Tested by answerer_test.cpp.
#include "planner/batch/Devices.h"

#include "planner/device/Catalogue.h"

namespace planner::batch {

std::shared_ptr<const Device> Devices::Find(const std::string& name) {
  // One name can be written in many ways.
  constexpr std::size_t kMost = 256;
  const auto known = known_.find(name);
  if (known != known_.end()) return known->second;
  auto device = std::make_shared<const Device>(device::Catalogue(files_).FindDevice(name));
  if (known_.size() >= kMost) known_.clear();
  known_.emplace(name, device);
  return device;
}

}  // namespace planner::batch
