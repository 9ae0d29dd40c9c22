// Objects that are shared process-wide, one for each key, and counted.
//
// Tested by shared_objects_test.cpp.
#ifndef VORKEL_HOST_UTIL_SHAREDOBJECTS_H_
#define VORKEL_HOST_UTIL_SHAREDOBJECTS_H_

#include <map>
#include <memory>
#include <mutex>
#include <string>
#include <typeinfo>

#include "host/Util_SharedResourceMgr.h"

namespace Util {

// The map from `const Key*` to a shared `Value` and its use count. There is one such map for
// each pair of types in the process; Instance finds it in the registry under a name made of
// the two type names. Entries are never removed, and the values are never deleted here.
//
// Several threads can use a map at once: the key of a request is that of the thread that makes it.
template <typename Key, typename Value>
class SharedObjects {
 public:
  struct Entry {
    Value* object = nullptr;
    int useCount = 0;
  };

  // The map of the process, made on first use, with `key` as the key of the request at hand.
  static SharedObjects& Instance(const Key* key) {
    const Port::StringBase name(std::string(typeid(const Key*).name()) + typeid(Value).name());
    auto* objects = static_cast<SharedObjects*>(SharedResourceMgr::find(name));
    if (objects == nullptr) {
      std::unique_ptr<SharedObjects> made(new SharedObjects);
      SharedResourceMgr::insert(name, made.get());
      // Another thread may have been first.
      objects = static_cast<SharedObjects*>(SharedResourceMgr::find(name));
      if (objects == made.get()) made.release();
    }
    key_ = key;
    return *objects;
  }

  // The entry of the request's key, or null. Does not count.
  Entry* Find() {
    const std::lock_guard lock(mutex_);
    return FindLocked();
  }

  // Counts one more user of the request's object and returns it; null when there is none.
  Value* Get() {
    const std::lock_guard lock(mutex_);
    Entry* entry = FindLocked();
    if (entry == nullptr) return nullptr;
    ++entry->useCount;
    return entry->object;
  }

  // Stores `object` under the request's key, with a use count of 1. The key must be free:
  // IllegalMethodCalledException otherwise, and nothing is stored.
  Value* Create(Value* object) {
    const std::lock_guard lock(mutex_);
    if (FindLocked() != nullptr) {
      throw IllegalMethodCalledException(
          "DesignEntry", "Shared Object already exists. Use Get() instead of Create().\n");
    }
    entries_[key_] = Entry{object, 1};
    return object;
  }

 private:
  SharedObjects() = default;

  // The mutex is held.
  Entry* FindLocked() {
    const auto found = entries_.find(key_);
    return found == entries_.end() ? nullptr : &found->second;
  }

  // Of the map that this thread has asked for last, which is the one that it uses now.
  static inline constinit thread_local const Key* key_ = nullptr;

  std::mutex mutex_;
  std::map<const Key*, Entry> entries_;
};

}  // namespace Util

#endif  // VORKEL_HOST_UTIL_SHAREDOBJECTS_H_
