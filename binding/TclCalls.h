// The five Tcl functions that the package calls, through the interpreter's stubs table.
//
// The table is the one that the Tcl library exports, where it exports one; so the package
// loads into Tcl 8.4 to 8.6 and is linked against none. Compiled with the headers of Tcl 9 it loads
// into that.
#ifndef VORKEL_BINDING_TCLCALLS_H_
#define VORKEL_BINDING_TCLCALLS_H_

#include <tcl.h>

namespace Tcl {

// Finds the stubs table: the exported one when the process has a non-null one, else that of
// `interp`. False, with Tcl's own message as the interpreter's result, when there is neither. A
// table once found serves the whole process. Can be called from several threads at once.
bool Bind(Tcl_Interp* interp);

// The functions; Bind has succeeded.
void CreateObjCommand(Tcl_Interp* interp, const char* name, Tcl_ObjCmdProc* procedure);
int Eval(Tcl_Interp* interp, const char* script);
void PkgProvide(Tcl_Interp* interp, const char* name, const char* version);
const char* GetString(Tcl_Obj* object);
void SetResult(Tcl_Interp* interp, const char* text);  // copied

}  // namespace Tcl

#endif  // VORKEL_BINDING_TCLCALLS_H_
