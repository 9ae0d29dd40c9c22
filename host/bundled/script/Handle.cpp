// Tested by handle_call_test.cpp.
#include "host/Script_Handle.h"
#include "host/bundled/script/TclAccess.h"

namespace Script {

Handle::~Handle() = default;

int Handle::Execute(int /*objc*/, const Handle* const /*objv*/[], Tcl_Interp* interp) {
  return ErrorResult(interp, "this handle has no methods");
}

}  // namespace Script
