#include "cli/Devices.h"

#include <fmt/format.h>

#include <algorithm>
#include <utility>
#include <vector>

#include "cli/Failure.h"
#include "host/bundled/device/DeviceCatalogue.h"
#include "host/bundled/device/Shipped.h"
#include "planner/device/Check.h"
#include "planner/read/MistakeText.h"
#include "planner/report/DoubtText.h"
#include "planner/report/PartText.h"

namespace cli {

namespace {

using planner::device::PartError;

}  // namespace

std::unique_ptr<const planner::device::Files> DeviceFiles(const Setting& setting) {
  std::vector<std::string> folders = setting.device_folders;
  std::string own = ::Device::Shipped(setting.folder, "devices");
  if (!own.empty()) folders.push_back(std::move(own));
  return planner::device::HostFiles(::Device::DeviceCatalogue::ListFolders(std::move(folders)));
}

planner::Device FindDevice(const planner::read::Reading& reading, const Setting& setting) {
  const auto files = DeviceFiles(setting);
  // Without a file the complaints name the device; that is enough.
  const bool is_of_file = reading.device && reading.device->place.IsInFile();
  const std::string label = is_of_file ? planner::read::TextOf(reading.device->place) + ": " : "";
  try {
    planner::Device device = planner::device::Catalogue(*files).FindDevice(
        reading.device ? reading.device->value : kDefaultDevice);
    if (device.primitives.empty()) {
      throw Failure::OfUsage(label + planner::report::LacksAllText(device), !is_of_file);
    }
    const auto& primitive = reading.request.primitive;
    if (primitive && !device.Has(*primitive)) {
      throw Failure::OfUsage(label + planner::report::LacksText(device, *primitive), !is_of_file);
    }
    return device;
  } catch (const PartError& error) {
    throw Failure::OfUsage(label + planner::report::PartText(error),
                           !is_of_file && error.kind != PartError::Kind::kBadFile);
  }
}

std::string LimitsInTheWay(const planner::Device& device, planner::Primitive primitive,
                           const Setting& setting) {
  const auto files = DeviceFiles(setting);
  const planner::device::Part part = planner::device::Catalogue(*files).Find(device.part);
  const planner::device::Description description = planner::device::Describe(part.file);
  std::string text;
  for (const planner::device::Doubt& doubt : Doubts(*description.Find(device.grade))) {
    if (std::find(doubt.lost.begin(), doubt.lost.end(), primitive) == doubt.lost.end()) continue;
    text += fmt::format("{}The reason: {}.", text.empty() ? "" : " ",
                        planner::report::DoubtText(doubt));
  }
  return text;
}

}  // namespace cli
