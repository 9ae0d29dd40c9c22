#include "host/bundled/device/DeviceCatalogue.h"

#include <dirent.h>

#include <algorithm>
#include <cerrno>
#include <cstdlib>
#include <memory>
#include <new>
#include <utility>

#include "host/bundled/device/BundledFolder.h"

namespace Device {
namespace {

constexpr char kSearchPathVariable[] = "VORKEL_DEVICES";
constexpr std::string_view kExtension = ".toml";

struct CloseFolder {
  void operator()(DIR* folder) const { closedir(folder); }
};

// The system's own: the walk of the standard library ends the process when it gets no memory.
using OpenFolder = std::unique_ptr<DIR, CloseFolder>;

std::vector<std::string> SearchFolders() {
  std::vector<std::string> folders;
  const char* const variable = std::getenv(kSearchPathVariable);
  std::string_view rest = variable == nullptr ? "" : variable;
  while (!rest.empty()) {
    const std::size_t length = std::min(rest.find(':'), rest.size());
    if (length > 0) folders.emplace_back(rest.substr(0, length));
    rest.remove_prefix(std::min(length + 1, rest.size()));
  }
  if (!BundledFolder().empty()) folders.push_back(BundledFolder());
  return folders;
}

}  // namespace

DeviceCatalogue DeviceCatalogue::List() { return ListFolders(SearchFolders()); }

DeviceCatalogue DeviceCatalogue::ListFolders(std::vector<std::string> folders) {
  DeviceCatalogue catalogue;
  for (const std::string& folder : folders) catalogue.AddFolder(folder);
  catalogue.folders_ = std::move(folders);
  return catalogue;
}

void DeviceCatalogue::AddFolder(const std::string& folder) {
  const OpenFolder open(opendir(folder.c_str()));
  if (open == nullptr) {
    if (errno == ENOMEM) throw std::bad_alloc();
    return;
  }
  const std::string beginning = folder.ends_with('/') ? folder : folder + '/';
  while (const dirent* const entry = readdir(open.get())) {
    const std::string_view name = entry->d_name;
    if (name.size() <= kExtension.size() || !name.ends_with(kExtension)) continue;
    files_.try_emplace(std::string(name.substr(0, name.size() - kExtension.size())),
                       beginning + std::string(name));
  }
}

std::vector<std::string> DeviceCatalogue::Names() const {
  std::vector<std::string> names;
  for (const auto& [name, path] : files_) names.push_back(name);
  return names;
}

std::vector<std::string> DeviceCatalogue::PrefixesOf(std::string_view part_name) const {
  std::vector<std::string> prefixes;
  for (const auto& [name, path] : files_) {
    if (part_name.starts_with(name)) prefixes.push_back(name);
  }
  // Prefixes of one text sort by their length.
  std::reverse(prefixes.begin(), prefixes.end());
  return prefixes;
}

const std::string* DeviceCatalogue::FindFile(std::string_view device) const {
  const auto found = files_.find(device);
  return found == files_.end() ? nullptr : &found->second;
}

}  // namespace Device
