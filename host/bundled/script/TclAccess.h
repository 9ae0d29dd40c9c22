// Access to Tcl through the stubs table, and what all handles do with it.
#ifndef VORKEL_HOST_BUNDLED_SCRIPT_TCLACCESS_H_
#define VORKEL_HOST_BUNDLED_SCRIPT_TCLACCESS_H_

#include <tcl.h>

namespace Script {

// Makes Tcl callable through `interp`. False when it is null or its Tcl has no usable stubs
// table; Tcl must not be called then. Handles can be made before this library's own entry
// point has run, so everything that can be first to call Tcl asks here.
bool ReachTcl(Tcl_Interp* interp);

// Makes `object` the result of the interpreter. TCL_ERROR when either is null or Tcl is out of
// reach.
int SetResultObject(Tcl_Interp* interp, Tcl_Obj* object);

// Stores `object` in a variable of the interpreter. TCL_ERROR as above, and with Tcl's message
// when the variable cannot be set.
int SetVariableObject(Tcl_Interp* interp, const char* name, Tcl_Obj* object);

// Makes `text` the result of the interpreter, where one can be set, and returns TCL_ERROR.
int ErrorResult(Tcl_Interp* interp, const char* text);

}  // namespace Script

#endif  // VORKEL_HOST_BUNDLED_SCRIPT_TCLACCESS_H_
