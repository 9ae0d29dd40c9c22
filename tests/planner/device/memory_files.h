// Device files in memory.
#ifndef VORKEL_TESTS_PLANNER_DEVICE_MEMORY_FILES_H_
#define VORKEL_TESTS_PLANNER_DEVICE_MEMORY_FILES_H_

#include <map>
#include <string>
#include <string_view>
#include <vector>

#include "host/bundled/device/DeviceError.h"
#include "planner/device/Files.h"

class MemoryFiles final : public planner::device::Files {
 public:
  std::map<std::string, std::string, std::less<>> texts;  // by device
  std::string unreadable;                                 // one that is listed and cannot be read

  std::vector<std::string> Names() const override {
    std::vector<std::string> names;
    for (const auto& [name, text] : texts) names.push_back(name);
    return names;
  }
  std::string PathOf(std::string_view device) const override {
    return "memory/" + std::string(device) + ".toml";
  }
  std::string TextOf(std::string_view device) const override {
    if (device == unreadable) throw Device::DeviceError(PathOf(device), {}, "is gone");
    return texts.find(device)->second;
  }

  // A device with packages p1 and P2 (default) and grades 1 and 2 (default), whose highest VCO
  // frequencies are 1000 and 1100 MHz.
  void Add(const std::string& device, const std::string& packages = "\"p1\", \"P2\"",
           const std::string& defaults = "default_package = \"P2\"\ndefault_grade = \"2\"\n") {
    texts[device] = "device = \"" + device + "\"\npackages = [" + packages + "]\n" + defaults +
                    "[grade.1]\nVCOCLK_FREQ_MAX = 1000\n[grade.2]\nVCOCLK_FREQ_MAX = 1100\n";
  }
};

#endif  // VORKEL_TESTS_PLANNER_DEVICE_MEMORY_FILES_H_
