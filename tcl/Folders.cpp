#include "tcl/Folders.h"

#include <filesystem>
#include <string>
#include <utility>
#include <vector>

#include "host/bundled/device/BundledFolder.h"
#include "host/bundled/device/DeviceCatalogue.h"

namespace tcl {

std::unique_ptr<const planner::device::Files> DeviceFiles() {
  // The host's last folder is the one beside this library, which has none.
  std::vector<std::string> folders = ::Device::DeviceCatalogue::List().folders();
  const std::filesystem::path own = ::Device::BundledFolder();
  folders.push_back((own.parent_path().parent_path() / "ip_vorkel1.1" / "devices").native());
  return planner::device::HostFiles(::Device::DeviceCatalogue::ListFolders(std::move(folders)));
}

}  // namespace tcl
