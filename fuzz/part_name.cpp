// Names of parts: what the host takes for a part is that part to the planner, too, which also takes
// other cases and beginnings of names.

#include "fuzz/Fuzz.h"
#include "host/bundled/device/PartName.h"
#include "planner/device/Catalogue.h"

namespace {

std::string Full(const Device::Part& part) {
  std::string name = part.file->device + "/";
  if (part.package) {
    name += *part.package;
  } else if (part.file->default_package) {
    name += *part.file->default_package;
  }
  name += "/";
  if (part.grade) {
    name += *part.grade;
  } else if (part.file->default_grade) {
    name += *part.file->default_grade;
  }
  return name;
}

std::string Full(const planner::device::Part& part) {
  return part.file.device + "/" + part.package + "/" + part.grade;
}

// What `find` finds; empty when that is nothing.
template <typename Find>
std::string OrNothing(const Find& find) {
  try {
    return Full(find());
  } catch (const Device::DeviceError&) {
    return "";
  } catch (const planner::device::PartError& error) {
    fuzz::Require(*error.what() != '\0', "an error without a word");
    return "";
  }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  static const Device::DeviceCatalogue host =
      Device::DeviceCatalogue::ListFolders({VORKEL_SOURCE_DIR "/devices"});
  static const auto files = planner::device::HostFiles(host);
  static const planner::device::Catalogue catalogue(*files);

  const std::string name(fuzz::TextOf(data, size));
  const std::string of_host = OrNothing([&] { return Device::FindPart(host, name); });
  const std::string resolved = OrNothing([&] { return catalogue.Resolve(name); });
  const std::string found = OrNothing([&] { return catalogue.Find(name); });
  fuzz::Require(of_host.empty() || of_host == resolved, "host " + of_host + ", planner " + resolved);
  fuzz::Require(resolved.empty() || resolved == found, "resolved " + resolved + ", found " + found);
  if (!resolved.empty()) {
    const planner::device::Part part = catalogue.Resolve(name);
    fuzz::Require(Full(catalogue.Resolve(part.Name())) == resolved, "the full name " + part.Name());
  }
  for (const std::string& longer : catalogue.Completions(name)) {
    fuzz::Require(longer.size() >= name.size(), "a completion that is shorter: " + longer);
  }
  return 0;
}
