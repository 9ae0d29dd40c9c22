#include "host/bundled/device/KeptFiles.h"

#include <algorithm>
#include <list>
#include <mutex>
#include <utility>

#include "host/bundled/device/FileText.h"

namespace Device {
namespace {

struct KeptFile {
  std::string text;
  std::shared_ptr<const DeviceFile> file;
};

// Those that were asked for last are in front.
struct KeptFiles {
  std::mutex mutex;
  std::list<KeptFile> files;
};

// Never destroyed: statics of other libraries may ask until the very end of the process.
KeptFiles& AllKeptFiles() {
  static auto* const files = new KeptFiles;
  return *files;
}

// The file at `path` if it is kept with that text, and moves it to the front; null else.
std::shared_ptr<const DeviceFile> FindKept(const std::string& path, std::string_view device,
                                           std::string_view text) {
  KeptFiles& kept = AllKeptFiles();
  const std::lock_guard lock(kept.mutex);
  const auto found = std::find_if(kept.files.begin(), kept.files.end(), [&](const KeptFile& one) {
    return one.file->path == path && one.file->device == device && one.text == text;
  });
  if (found == kept.files.end()) return nullptr;
  kept.files.splice(kept.files.begin(), kept.files, found);
  return found->file;
}

void Keep(KeptFile file) {
  std::list<KeptFile> made;
  made.push_back(std::move(file));
  KeptFiles& kept = AllKeptFiles();
  const std::lock_guard lock(kept.mutex);
  // What the file said before is of no use any more.
  kept.files.remove_if([&made](const KeptFile& one) {
    return one.file->path == made.front().file->path &&
           one.file->device == made.front().file->device;
  });
  kept.files.splice(kept.files.begin(), made);
  if (kept.files.size() > kMostKeptFiles) kept.files.pop_back();
}

}  // namespace

std::shared_ptr<const DeviceFile> ReadKept(const std::string& path, std::string_view device) {
  std::string text = ReadFileText(path);
  if (auto kept = FindKept(path, device, text)) return kept;
  auto read = std::make_shared<const DeviceFile>(DeviceFile::Parse(text, path, device));
  Keep({std::move(text), read});
  return read;
}

}  // namespace Device
