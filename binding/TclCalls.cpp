#include "binding/TclCalls.h"

#include <dlfcn.h>

namespace Tcl {

namespace {

const TclStubs* table = nullptr;

const TclStubs* ExportedTable() {
  const void* symbol = dlsym(RTLD_DEFAULT, "tclStubsPtr");
  return symbol == nullptr ? nullptr : *static_cast<const TclStubs* const*>(symbol);
}

}  // namespace

bool Bind(Tcl_Interp* interp) {
  if (table != nullptr) return true;
  table = ExportedTable();
  if (table == nullptr && Tcl_InitStubs(interp, "8.4", 0) != nullptr) table = tclStubsPtr;
  return table != nullptr;
}

void CreateObjCommand(Tcl_Interp* interp, const char* name, Tcl_ObjCmdProc* procedure) {
  table->tcl_CreateObjCommand(interp, name, procedure, nullptr, nullptr);
}

int Eval(Tcl_Interp* interp, const char* script) { return table->tcl_Eval(interp, script); }

void PkgProvide(Tcl_Interp* interp, const char* name, const char* version) {
  table->tcl_PkgProvide(interp, name, version);
}

const char* GetString(Tcl_Obj* object) { return table->tcl_GetString(object); }

void SetResult(Tcl_Interp* interp, const char* text) {
  // Volatile: Tcl copies the text and writes nothing to it.
  table->tcl_SetResult(interp, const_cast<char*>(text), TCL_VOLATILE);
}

}  // namespace Tcl
