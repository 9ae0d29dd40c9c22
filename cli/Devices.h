// The devices that the program finds, and what is wrong with names of them.
#ifndef VORKEL_CLI_DEVICES_H_
#define VORKEL_CLI_DEVICES_H_

#include <memory>
#include <string>

#include "cli/Setting.h"
#include "planner/Device.h"
#include "planner/device/Catalogue.h"
#include "planner/device/Files.h"
#include "planner/read/Draft.h"

namespace cli {

inline constexpr const char* kDefaultDevice = "vk40";

// The files of the folders of VORKEL_DEVICES, and those that come with the program.
std::unique_ptr<const planner::device::Files> DeviceFiles(const Setting& setting);

// The device that a request is for. Throws Failure when there is none, or it has not the primitive.
planner::Device FindDevice(const planner::read::Reading& reading, const Setting& setting);

// The limits of a device that contradict each other so that a primitive can do nothing, as a
// sentence: "The reason: ..."; mostly nothing.
std::string LimitsInTheWay(const planner::Device& device, planner::Primitive primitive,
                           const Setting& setting);

}  // namespace cli

#endif  // VORKEL_CLI_DEVICES_H_
