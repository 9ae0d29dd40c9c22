// What the interpreter sees of the library: the entry point that `load` calls, and the
// command "Ip::Vorkel::Init" that makes a handle.
//
// Tested by package.test, creation_test.cpp and allocation_test.cpp.

#include <new>

#include "binding/TclCalls.h"
#include "binding/VorkelPtrHandle.h"

namespace {

// A new object; null when there is no memory for it or for what it is made of.
template <typename Object, typename... Arguments>
Object* NewOrNull(Arguments... arguments) {
  try {
    return new (std::nothrow) Object(arguments...);
  } catch (...) {
    return nullptr;
  }
}

}  // namespace

extern "C" {

// "Ip::Vorkel::Init ?word ...?": a new implementation object and a new handle around it, which
// is the result. All words are ignored. It fails only without Tcl and without a handle: what
// the host answers to the handle as a result is the host's affair, and an object lives until the
// process ends, whatever has become of its handle.
int InitVorkel(ClientData, Tcl_Interp* interp, int, Tcl_Obj* const*) {
  if (!Tcl::Bind(interp)) return TCL_ERROR;
  // Without memory for the object the handle has none, and its methods say so.
  auto* const imp = NewOrNull<Ip::VorkelImp>(interp);
  auto* const handle = NewOrNull<Ip::VorkelPtrHandle>(imp, interp);
  if (handle == nullptr) {
    Tcl::SetResult(interp, "Ip::Vorkel::Init: out of memory.");
    return TCL_ERROR;
  }
  try {
    handle->SetResult(interp);
  } catch (...) {
    // Tcl is C: nothing may be thrown through it.
  }
  return TCL_OK;
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
