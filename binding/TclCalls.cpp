#include "binding/TclCalls.h"

#include <dlfcn.h>

#include <atomic>
#include <mutex>

#include "host/TclVersion.h"

namespace Tcl {

namespace {

constinit std::atomic<const TclStubs*> table = nullptr;
constinit std::mutex binding;

const TclStubs* Table() { return table.load(std::memory_order_acquire); }

const TclStubs* ExportedTable() {
  const void* symbol = dlsym(RTLD_DEFAULT, "tclStubsPtr");
  return symbol == nullptr ? nullptr : *static_cast<const TclStubs* const*>(symbol);
}

}  // namespace

bool Bind(Tcl_Interp* interp) {
  if (Table() != nullptr) return true;
  const std::lock_guard lock(binding);
  if (Table() == nullptr) table = ExportedTable();
  if (Table() == nullptr && Tcl_InitStubs(interp, kOldest, 0) != nullptr) table = tclStubsPtr;
  return Table() != nullptr;
}

void CreateObjCommand(Tcl_Interp* interp, const char* name, Tcl_ObjCmdProc* procedure) {
  Table()->tcl_CreateObjCommand(interp, name, procedure, nullptr, nullptr);
}

const char* GetString(Tcl_Obj* object) { return Table()->tcl_GetString(object); }

#if TCL_MAJOR_VERSION >= 9

// Of these there is only the general form.
int Eval(Tcl_Interp* interp, const char* script) {
  return Table()->tcl_EvalEx(interp, script, TCL_INDEX_NONE, 0);
}

void PkgProvide(Tcl_Interp* interp, const char* name, const char* version) {
  Table()->tcl_PkgProvideEx(interp, name, version, nullptr);
}

void SetResult(Tcl_Interp* interp, const char* text) {
  Table()->tcl_SetObjResult(interp, Table()->tcl_NewStringObj(text, TCL_INDEX_NONE));
}

#else

int Eval(Tcl_Interp* interp, const char* script) { return Table()->tcl_Eval(interp, script); }

void PkgProvide(Tcl_Interp* interp, const char* name, const char* version) {
  Table()->tcl_PkgProvide(interp, name, version);
}

void SetResult(Tcl_Interp* interp, const char* text) {
  // Volatile: Tcl copies the text and writes nothing to it.
  Table()->tcl_SetResult(interp, const_cast<char*>(text), TCL_VOLATILE);
}

#endif

}  // namespace Tcl
