// The entry point that Tcl's `load` calls; its name is the one that Tcl derives from the name
// of the library's file.
//
// Tested by entry_test.cpp.
#include "host/bundled/script/DeviceCommand.h"
#include "host/bundled/script/TclAccess.h"

extern "C" int Ptrhandleqrm_Init(Tcl_Interp* interp) {
  if (!Script::ReachTcl(interp)) return TCL_ERROR;
  Script::CreateDeviceCommand(interp);
  return Tcl_PkgProvide(interp, "PtrHandleQrm", "1.0");
}
