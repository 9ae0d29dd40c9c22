// Device files: the reader refuses exactly those in which the check finds mistakes, and what it
// takes becomes devices.

#include <optional>

#include "fuzz/Fuzz.h"
#include "host/bundled/device/DeviceFile.h"
#include "planner/device/Check.h"
#include "planner/device/FromFile.h"

namespace {

constexpr const char* kPath = "dut.toml";
constexpr const char* kDevice = "dut";

void MakeDevices(const Device::DeviceFile& file) {
  fuzz::Require(!file.packages.empty() && !file.grades.empty(), "a device without parts");
  for (const Device::Grade& grade : file.grades) {
    planner::device::FromFile(file, "", grade.name);
    for (const std::string& package : file.packages) {
      planner::device::FromFile(file, package, grade.name);
    }
  }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const std::string_view text = fuzz::TextOf(data, size);
  std::optional<Device::DeviceFile> file;
  std::string reason;
  try {
    file = Device::DeviceFile::Parse(text, kPath, kDevice);
  } catch (const Device::DeviceError& error) {
    reason = error.what();
  }
  const planner::device::Checked checked = planner::device::Check(text, kPath, kDevice);
  fuzz::Require(file.has_value() == checked.mistakes.empty(), "reader and check differ: " + reason);
  if (file) {
    MakeDevices(*file);
    return 0;
  }
  fuzz::Require(!reason.empty(), "a refusal without a word");
  fuzz::Require(checked.mistakes.size() <= planner::device::kMostMistakes, "too many mistakes");
  for (const planner::device::Mistake& mistake : checked.mistakes) {
    fuzz::Require(!mistake.reason.empty(), "a mistake without a word");
  }
  return 0;
}
