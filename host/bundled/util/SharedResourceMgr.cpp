// Tested by shared_objects_test.cpp.
#include <functional>
#include <map>
#include <string>

#include "host/Util_SharedResourceMgr.h"

namespace Util {
namespace {

using Resources = std::map<std::string, void*, std::less<>>;

// Never destroyed: statics of other libraries may ask until the very end of the process.
Resources& AllResources() {
  static auto* const resources = new Resources;
  return *resources;
}

}  // namespace

void* Details::SharedResourceMgr::find(const Port::StringBase& name) {
  const auto found = AllResources().find(name.View());
  return found == AllResources().end() ? nullptr : found->second;
}

void Details::SharedResourceMgr::insert(const Port::StringBase& name, void* resource) {
  AllResources().try_emplace(std::string(name.View()), resource);
}

IllegalMethodCalledException::~IllegalMethodCalledException() = default;

}  // namespace Util
