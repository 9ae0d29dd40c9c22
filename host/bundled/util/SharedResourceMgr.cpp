// Tested by shared_objects_test.cpp.
#include <functional>
#include <map>
#include <mutex>
#include <string>

#include "host/Util_SharedResourceMgr.h"

namespace Util {
namespace {

struct Resources {
  std::mutex mutex;
  std::map<std::string, void*, std::less<>> by_name;
};

// Never destroyed: statics of other libraries may ask until the very end of the process.
Resources& AllResources() {
  static auto* const resources = new Resources;
  return *resources;
}

}  // namespace

void* Details::SharedResourceMgr::find(const Port::StringBase& name) {
  Resources& resources = AllResources();
  const std::lock_guard lock(resources.mutex);
  const auto found = resources.by_name.find(name.View());
  return found == resources.by_name.end() ? nullptr : found->second;
}

void Details::SharedResourceMgr::insert(const Port::StringBase& name, void* resource) {
  Resources& resources = AllResources();
  const std::lock_guard lock(resources.mutex);
  resources.by_name.try_emplace(std::string(name.View()), resource);
}

IllegalMethodCalledException::~IllegalMethodCalledException() = default;

}  // namespace Util
