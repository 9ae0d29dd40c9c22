// A script's call of a handle, on its way from Tcl to Execute.
//
// Tested by handle_call_test.cpp.
#include <exception>
#include <new>

#include "host/bundled/script/TclAccess.h"
#include "host/bundled/script/VisibleHandle.h"
#include "host/bundled/script/WordHandle.h"

namespace Script {
namespace {

// Native code prints on C's standard output, which knows nothing of what the script has
// written to its own and Tcl still buffers. Passing that on first keeps the two in order.
void FlushScriptOutput() {
  Tcl_Channel const output = Tcl_GetStdChannel(TCL_STDOUT);
  if (output != nullptr && Tcl_OutputBuffered(output) > 0) Tcl_Flush(output);
}

// Tcl is C: no exception may pass it on its way to the caller.
int Execute(Handle* handle, int objc, Tcl_Obj* const objv[], Tcl_Interp* interp) {
  try {
    const WordList words(handle, objc, objv);
    return handle->Execute(objc, words.handles(), interp);
  } catch (const std::bad_alloc&) {
    return ErrorResult(interp, "out of memory");
  } catch (const std::exception& error) {
    return ErrorResult(interp, error.what());
  } catch (...) {
    return ErrorResult(interp, "unknown error");
  }
}

}  // namespace

int PtrHandleBase::Visible::Call(ClientData visible, Tcl_Interp* interp, int objc,
                                 Tcl_Obj* const objv[]) {
  auto* const self = static_cast<Visible*>(visible);
  const Running running(self);
  FlushScriptOutput();
  return Script::Execute(self->handle_, objc, objv, interp);
}

}  // namespace Script
