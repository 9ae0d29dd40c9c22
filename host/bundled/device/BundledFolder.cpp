#include "host/bundled/device/BundledFolder.h"

#include <dlfcn.h>

#include <filesystem>
#include <system_error>

#include "host/bundled/device/Shipped.h"

namespace Device {
namespace {

// An address inside this library.
const char anchor = 0;

std::string FindFolder() {
  Dl_info info{};
  if (dladdr(&anchor, &info) == 0 || info.dli_fname == nullptr) return {};
  std::error_code error;
  std::filesystem::path library = std::filesystem::canonical(info.dli_fname, error);
  if (error) library = std::filesystem::absolute(info.dli_fname, error);
  if (error) return {};
  const std::filesystem::path folder = library.parent_path();
  const std::string found = Shipped(folder.native(), "devices");
  return found.empty() ? (folder / "devices").native() : found;
}

bool IsFound() noexcept {
  try {
    return !BundledFolder().empty();
  } catch (...) {
    return false;
  }
}

// The system may know the library by a path relative to the current directory of the time
// when it was loaded, so the question is asked then and not at the first use. Nobody could be told
// that there is no memory for the answer: then the first use asks again.
[[maybe_unused]] const bool asked_at_load = IsFound();

}  // namespace

const std::string& BundledFolder() {
  static const auto* const folder = new std::string(FindFolder());
  return *folder;
}

}  // namespace Device
