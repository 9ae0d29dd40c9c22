#include "host/bundled/device/PartName.h"

#include <utility>

#include "host/bundled/device/KeptFiles.h"

namespace Device {
namespace {

std::string UnknownDevice(const DeviceCatalogue& catalogue, std::string_view what,
                          std::string_view name) {
  std::string text = "unknown device in ";
  text += what;
  text += ' ' + Quoted(name) + ": the devices are ";
  const std::vector<std::string> names = catalogue.Names();
  text += names.empty() ? "none" : JoinNames(names);
  text += "; the folders searched are ";
  text += catalogue.folders().empty() ? "none" : JoinNames(catalogue.folders());
  return text;
}

// "unknown package "x" in part name "vk10x": device vk10 has q144, b256"
std::string UnknownDetail(std::string_view what, std::string_view detail,
                          std::string_view part_name, const DeviceFile& file,
                          const std::vector<std::string>& known) {
  std::string text = "unknown ";
  text += what;
  text += ' ' + Quoted(detail) + " in part name " + Quoted(part_name);
  text += ": device " + file.device + " has " + JoinNames(known);
  return text;
}

// Fills in the package and grade that `rest`, the part name behind the device, names. What is
// wrong with them, or nothing.
std::optional<DeviceError> TakeRest(std::string_view rest, std::string_view part_name, Part* part) {
  const DeviceFile& file = *part->file;
  const std::size_t dash = rest.find('-');
  const std::string_view package = rest.substr(0, dash);
  if (!package.empty()) {
    if (!file.HasPackage(package)) {
      return ErrorAt(file.path, file.packages_position,
                     UnknownDetail("package", package, part_name, file, file.packages));
    }
    part->package = package;
  }
  if (dash != std::string_view::npos) {
    const std::string_view grade = rest.substr(dash + 1);
    if (file.FindGrade(grade) == nullptr) {
      return ErrorAt(file.path, file.grades_position,
                     UnknownDetail("grade", grade, part_name, file, file.GradeNames()));
    }
    part->grade = grade;
  }
  return std::nullopt;
}

}  // namespace

Part FindPart(const DeviceCatalogue& catalogue, std::string_view part_name) {
  std::optional<DeviceError> complaint;
  std::optional<DeviceError> bad_file;
  for (const std::string& device : catalogue.PrefixesOf(part_name)) {
    const std::string_view rest = part_name.substr(device.size());
    std::optional<DeviceError> wrong;
    try {
      Part part{FindDevice(catalogue, device), {}, {}};
      wrong = TakeRest(rest, part_name, &part);
      if (!wrong && !bad_file) return part;
    } catch (const DeviceError& error) {
      const bool names_device = rest.empty() || rest.front() == '-';
      if (names_device) throw;
      // The rest may be a package of this device, or the name that of another one.
      wrong = DeviceError(UnknownDevice(catalogue, "part name", part_name) +
                          "; it could be a part of " + JoinNames({device}) +
                          ", whose file is bad: " + error.what());
      if (!bad_file) bad_file = error;
    }
    if (!wrong) throw *bad_file;
    if (!complaint) complaint = std::move(wrong);
  }
  if (complaint) throw *complaint;
  throw DeviceError(UnknownDevice(catalogue, "part name", part_name));
}

std::shared_ptr<const DeviceFile> FindDevice(const DeviceCatalogue& catalogue,
                                             std::string_view device) {
  const std::string* const path = catalogue.FindFile(device);
  if (path == nullptr) throw DeviceError(UnknownDevice(catalogue, "device name", device));
  return ReadKept(*path, device);
}

}  // namespace Device
