// The only place of the planner that reads files.
//
// Tested by catalogue_test.cpp.
#include <utility>

#include "host/bundled/device/DeviceCatalogue.h"
#include "host/bundled/device/DeviceError.h"
#include "host/bundled/device/FileText.h"
#include "planner/device/Files.h"

namespace planner::device {
namespace {

class FilesOfTheHost final : public Files {
 public:
  explicit FilesOfTheHost(::Device::DeviceCatalogue catalogue) : catalogue_(std::move(catalogue)) {}

  std::vector<std::string> Names() const override { return catalogue_.Names(); }

  std::string PathOf(std::string_view device) const override {
    const std::string* const path = catalogue_.FindFile(device);
    return path == nullptr ? std::string() : *path;
  }

  std::string TextOf(std::string_view device) const override {
    const std::string* const path = catalogue_.FindFile(device);
    if (path == nullptr) {
      throw ::Device::DeviceError("there is no file of device " + std::string(device));
    }
    return ::Device::ReadFileText(*path);
  }

 private:
  ::Device::DeviceCatalogue catalogue_;
};

}  // namespace

std::unique_ptr<const Files> HostFiles() { return HostFiles(::Device::DeviceCatalogue::List()); }

std::unique_ptr<const Files> HostFiles(::Device::DeviceCatalogue catalogue) {
  return std::make_unique<FilesOfTheHost>(std::move(catalogue));
}

}  // namespace planner::device
