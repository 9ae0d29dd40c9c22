#include "host/bundled/script/TclAccess.h"

#include <atomic>
#include <mutex>

#include "host/TclVersion.h"

namespace Script {
namespace {

// Whether the stubs table is there for all threads.
constinit std::atomic<bool> reached = false;
constinit std::mutex reaching;

}  // namespace

bool ReachTcl(Tcl_Interp* interp) {
  if (interp == nullptr) return false;
  if (reached) return true;
  const std::lock_guard lock(reaching);
  // Asking twice would be right as well, but Tcl_InitStubs empties the interpreter's result.
  if (!reached) reached = tclStubsPtr != nullptr || Tcl_InitStubs(interp, Tcl::kOldest, 0) != nullptr;
  return reached;
}

int SetResultObject(Tcl_Interp* interp, Tcl_Obj* object) {
  if (object == nullptr || !ReachTcl(interp)) return TCL_ERROR;
  Tcl_SetObjResult(interp, object);
  return TCL_OK;
}

int SetVariableObject(Tcl_Interp* interp, const char* name, Tcl_Obj* object) {
  if (object == nullptr || name == nullptr || !ReachTcl(interp)) return TCL_ERROR;
  const Tcl_Obj* const stored = Tcl_SetVar2Ex(interp, name, nullptr, object, TCL_LEAVE_ERR_MSG);
  return stored != nullptr ? TCL_OK : TCL_ERROR;
}

int ErrorResult(Tcl_Interp* interp, const char* text) {
  if (ReachTcl(interp)) Tcl_SetObjResult(interp, Tcl_NewStringObj(text, -1));
  return TCL_ERROR;
}

}  // namespace Script
