// Tested by tests/python/test_errors.py.
#include "python/Asked.h"

#include <utility>

#include "planner/device/Catalogue.h"
#include "planner/device/Files.h"
#include "planner/read/RequestJson.h"
#include "planner/report/PartText.h"
#include "python/Refused.h"

namespace python {

namespace {

constexpr const char* kUsualDevice = "vk40";

[[noreturn]] void RefusePrimitive(const planner::Device& device, const std::string& message) {
  RefuseEntry("no_primitive", "device", device.part, message);
}

}  // namespace

planner::read::Draft ReadDraft(const std::string& json) {
  planner::read::Mistakes mistakes;
  planner::read::Draft draft = planner::read::ReadJson(json, "", &mistakes);
  if (!mistakes.empty()) RefuseMistakes(mistakes);
  return draft;
}

planner::Device DeviceOf(const planner::read::Entry<std::string>& name,
                         const std::optional<planner::Primitive>& primitive) {
  planner::Device device;
  try {
    const auto files = planner::device::HostFiles();
    device = planner::device::Catalogue(*files).FindDevice(name ? name->value : kUsualDevice);
  } catch (const planner::device::PartError& error) {
    RefusePart(error);
  }
  if (device.primitives.empty()) {
    RefusePrimitive(device, planner::report::LacksAllText(device));
  }
  if (primitive && !device.Has(*primitive)) {
    RefusePrimitive(device, planner::report::LacksText(device, *primitive));
  }
  return device;
}

Asked Read(const std::string& json) {
  planner::read::Mistakes mistakes;
  auto reading = planner::read::Finish(ReadDraft(json), {}, &mistakes);
  if (!reading) RefuseMistakes(mistakes);
  Asked asked;
  asked.reading = std::move(*reading);
  asked.device = DeviceOf(asked.reading.device, asked.request().primitive);
  return asked;
}

}  // namespace python
