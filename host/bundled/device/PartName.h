// What a part name means.
//
// A part name is <device>[<package>][-<grade>], in exact case: with a device vk10 in packages
// q144 and b256 and grades 1 and 2, "vk10", "vk10q144", "vk10-2" and "vk10b256-1" are part
// names. Nothing marks where the device ends and the package begins, so a name can begin with
// several devices: "vk10b256" does with vk10 and, if there is one, with vk10b. The longest
// device that has such a package and grade is meant.
//
// Tested by part_name_test.cpp.
#ifndef VORKEL_HOST_BUNDLED_DEVICE_PARTNAME_H_
#define VORKEL_HOST_BUNDLED_DEVICE_PARTNAME_H_

#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include "host/bundled/device/DeviceCatalogue.h"
#include "host/bundled/device/DeviceFile.h"

namespace Device {

// A device in one package and speed grade, as far as the part name tells them. Parts of one device
// share what its file says.
struct Part {
  std::shared_ptr<const DeviceFile> file;  // never null
  std::optional<std::string> package;
  std::optional<std::string> grade;
};

// The part of that name. Throws DeviceError when the device, package or grade is unknown or
// the device file is bad. A bad file is never passed over in favour of a shorter device name. It is
// not to blame for a name that only begins like its device, where no other device has such a part.
Part FindPart(const DeviceCatalogue& catalogue, std::string_view part_name);

// The device of exactly that name, without package and grade. Throws as above.
std::shared_ptr<const DeviceFile> FindDevice(const DeviceCatalogue& catalogue,
                                             std::string_view device);

}  // namespace Device

#endif  // VORKEL_HOST_BUNDLED_DEVICE_PARTNAME_H_
