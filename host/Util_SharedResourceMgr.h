// The process-wide registry of named resources, and the exception of its users.
#ifndef VORKEL_HOST_UTIL_SHAREDRESOURCEMGR_H_
#define VORKEL_HOST_UTIL_SHAREDRESOURCEMGR_H_

#include "host/Port_Exception.h"

namespace Util {

namespace Details {

// Names are unique in the process; a resource stays registered until the process ends. Can be
// asked from several threads at once.
class SharedResourceMgr {
 public:
  // The resource of that name, or null when there is none.
  static void* find(const Port::StringBase& name);

  // Registers `resource` under `name`. A name that is taken keeps what it has.
  static void insert(const Port::StringBase& name, void* resource);
};

}  // namespace Details

using Details::SharedResourceMgr;

// A method was called at a time when its object does not allow it.
class IllegalMethodCalledException : public Port::Exception {
 public:
  using Port::Exception::Exception;
  ~IllegalMethodCalledException() override;
};

}  // namespace Util

#endif  // VORKEL_HOST_UTIL_SHAREDRESOURCEMGR_H_
