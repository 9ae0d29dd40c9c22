// What the interpreter sees of the library: the entry point that `load` calls, and the
// command "Ip::Vorkel::Init" that makes a handle.
//
// Tested by package.test.

#include <new>

#include "binding/TclCalls.h"
#include "binding/VorkelPtrHandle.h"

extern "C" {

// "Ip::Vorkel::Init ?word ...?": a new implementation object and a new handle around it, which
// is the result. All words are ignored.
int InitVorkel(ClientData, Tcl_Interp* interp, int, Tcl_Obj* const*) {
  if (!Tcl::Bind(interp)) return TCL_ERROR;
  // Without memory for the object the handle has none, and its methods say so.
  auto* imp = new (std::nothrow) Ip::VorkelImp(interp);
  Ip::VorkelPtrHandle* handle = nullptr;
  try {
    handle = new (std::nothrow) Ip::VorkelPtrHandle(imp, interp);
    if (handle != nullptr && handle->SetResult(interp) == TCL_OK) return TCL_OK;
  } catch (const std::bad_alloc&) {
    // Tcl is C: nothing may be thrown through it.
  }
  // No script has seen the object: it goes, unlike one that a handle was made for.
  delete handle;
  delete imp;
  Tcl::SetResult(interp, "Ip::Vorkel::Init: out of memory.");
  return TCL_ERROR;
}

// Fails only where no Tcl can be called, with Tcl's own message.
int Ip_vorkel_Init(Tcl_Interp* interp) {
  if (!Tcl::Bind(interp)) return TCL_ERROR;
  Tcl::CreateObjCommand(interp, "Ip::Vorkel::Init", InitVorkel);
  // The handle library is in the process already, since this one is linked against it; the
  // load makes it known to the interpreter. The package works without that, too.
  Tcl::Eval(interp, "load libPtrHandleQrm.dll");
  Tcl::PkgProvide(interp, "Ip_vorkel", "1.1");
  return TCL_OK;
}

}  // extern "C"
