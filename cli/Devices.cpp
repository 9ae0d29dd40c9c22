#include "cli/Devices.h"

#include <fmt/format.h>
#include <sys/stat.h>

#include <utility>
#include <vector>

#include "cli/Failure.h"
#include "host/bundled/device/DeviceCatalogue.h"
#include "planner/read/MistakeText.h"
#include "planner/read/Shown.h"

namespace cli {

namespace {

using planner::device::PartError;
using planner::read::Shown;
using planner::read::ShownWhole;

bool IsFolder(const std::string& path) {
  struct stat status {};
  return stat(path.c_str(), &status) == 0 && S_ISDIR(status.st_mode);
}

std::string Listed(const std::vector<std::string>& names) {
  std::string text;
  for (const std::string& name : names) text += (text.empty() ? "" : ", ") + ShownWhole(name);
  return text;
}

std::string Lacks(const PartError& error, const char* kind) {
  return fmt::format("{} has no {} \"{}\"; it has {}", error.device, kind, Shown(error.detail),
                     Listed(error.candidates));
}

std::string Primitives(const planner::Device& device) {
  std::vector<std::string> names;
  for (const planner::Primitive primitive : device.primitives) names.emplace_back(Name(primitive));
  return Listed(names);
}

}  // namespace

std::unique_ptr<const planner::device::Files> DeviceFiles(const Setting& setting) {
  std::vector<std::string> folders = setting.device_folders;
  // Installed, the program stands beside the folder; in the build tree, above the package.
  for (const char* const folder : {"/devices", "/ip_vorkel1.1/devices"}) {
    if (!IsFolder(setting.folder + folder)) continue;
    folders.push_back(setting.folder + folder);
    break;
  }
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
      throw Failure::OfUsage(
          fmt::format("{}{} has the limits of no primitive", label, device.part), !is_of_file);
    }
    const auto& primitive = reading.request.primitive;
    if (primitive && !device.Has(*primitive)) {
      throw Failure::OfUsage(fmt::format("{}{} has no {}; it has {}", label, device.part,
                                         Name(*primitive), Primitives(device)),
                             !is_of_file);
    }
    return device;
  } catch (const PartError& error) {
    throw Failure::OfUsage(label + TextOf(error),
                           !is_of_file && error.kind != PartError::Kind::kBadFile);
  }
}

std::string TextOf(const planner::device::FileComplaint& complaint) {
  std::string text = ShownWhole(complaint.file);
  if (complaint.line) text += fmt::format(":{}", *complaint.line);
  if (complaint.column) text += fmt::format(":{}", *complaint.column);
  return fmt::format("{}: {}", text, ShownWhole(complaint.reason));
}

std::string TextOf(const PartError& error) {
  switch (error.kind) {
    case PartError::Kind::kUnknownPackage:
      return Lacks(error, "package");
    case PartError::Kind::kUnknownGrade:
      return Lacks(error, "grade");
    case PartError::Kind::kNoDefaultGrade:
      return fmt::format("{} has no default grade; it has {}", error.device,
                         Listed(error.candidates));
    case PartError::Kind::kAmbiguous:
      return fmt::format("device \"{}\" could be {}", Shown(error.name), Listed(error.candidates));
    case PartError::Kind::kBadFile:
      return TextOf(error.complaints.front());
    case PartError::Kind::kUnknownDevice:
      break;
  }
  std::string text = fmt::format("unknown device \"{}\"; the devices are {}", Shown(error.name),
                                 Listed(error.candidates));
  for (const planner::device::FileComplaint& complaint : error.complaints) {
    text += fmt::format("; it could be a part of {}, whose file is bad: {}",
                        ShownWhole(complaint.device), TextOf(complaint));
  }
  return text;
}

}  // namespace cli
