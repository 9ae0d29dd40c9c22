// Where device files come from. All files of the planner are read through this.
#ifndef VORKEL_PLANNER_DEVICE_FILES_H_
#define VORKEL_PLANNER_DEVICE_FILES_H_

#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace Device {
class DeviceCatalogue;
}

namespace planner::device {

class Files {
 public:
  virtual ~Files() = default;
  // The devices, sorted, each once.
  virtual std::vector<std::string> Names() const = 0;
  // How messages name the file of one of them.
  virtual std::string PathOf(std::string_view device) const = 0;
  // Its bytes. Throws ::Device::DeviceError when it cannot be read.
  virtual std::string TextOf(std::string_view device) const = 0;
};

// The files of the host: those of the folders in VORKEL_DEVICES, and the bundled ones. The
// folders are listed now, and the files read when they are asked for.
std::unique_ptr<const Files> HostFiles();
// Those that a catalogue of the host lists.
std::unique_ptr<const Files> HostFiles(::Device::DeviceCatalogue catalogue);

}  // namespace planner::device

#endif  // VORKEL_PLANNER_DEVICE_FILES_H_
