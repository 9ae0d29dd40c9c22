// What the interpreter sees of the library: the entry that `load` calls.
//
// Tested by commands.test.
#include <tcl.h>

#include "tcl/Commands.h"

extern "C" __attribute__((visibility("default"))) int Vorkel_Init(Tcl_Interp* interp) {
  if (Tcl_InitStubs(interp, TCL_VERSION, 0) == nullptr) return TCL_ERROR;
  tcl::MakeCommands(interp);
  return Tcl_PkgProvide(interp, "vorkel", "1.1");
}
