#include "host/bundled/device/Shipped.h"

#include <filesystem>
#include <system_error>

namespace Device {

namespace fs = std::filesystem;

std::string Shipped(const std::string& folder, const std::string& name) {
  if (folder.empty()) return {};
  constexpr int kDeepest = 4;
  constexpr const char* kPackage = "ip_vorkel1.1";
  std::error_code error;
  const fs::path own = folder;
  for (const fs::path& path :
       {own / name, own / kPackage / name, own.parent_path() / kPackage / name}) {
    if (fs::exists(path, error)) return path.native();
  }
  fs::path prefix = own;
  for (int i = 0; i < kDeepest && prefix.has_relative_path(); ++i) {
    prefix = prefix.parent_path();
    const fs::path path = prefix / "share" / "vorkel" / name;
    if (fs::exists(path, error)) return path.native();
  }
  return {};
}

}  // namespace Device
