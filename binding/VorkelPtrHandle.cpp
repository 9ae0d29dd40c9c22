#include "binding/VorkelPtrHandle.h"

#include <atomic>
#include <new>
#include <string>
#include <string_view>

#include "binding/MethodTable.h"
#include "binding/TclCalls.h"

namespace Ip {

VorkelPtrHandle::VorkelPtrHandle(Tcl_Interp* interp) : PtrHandle(interp) {}

VorkelPtrHandle::VorkelPtrHandle(VorkelImp* imp, Tcl_Interp* interp) : PtrHandle(imp, interp) {}

// The implementation object outlives its handle: it lives until the process ends.
VorkelPtrHandle::~VorkelPtrHandle() = default;

int VorkelPtrHandle::Execute(int objc, Words objv, Tcl_Interp* interp) {
  if (objc < 2) {
    Tcl::SetResult(interp, "Error: Missing Tcl command.");
    return TCL_ERROR;
  }
  std::string_view name = Tcl::GetString(objv[1]->GetTclObj());
  if (name.empty()) {
    name = "NULL";
  } else if (const Method* method = FindMethod(name)) {
    return (this->*method->function)(objc, objv, interp);
  }
  const std::string message = "Error: Unknown Tcl command \"" + std::string(name) + "\".";
  Tcl::SetResult(interp, message.c_str());
  return TCL_ERROR;
}

Script::Handle* VorkelPtrHandle::CreateHandle(Tcl_Interp* interp) const {
  return new (std::nothrow) VorkelPtrHandle(interp);
}

Script::PtrHandleBase* VorkelPtrHandle::GetPtrHandleBase() const {
  static constinit std::atomic<VorkelPtrHandle*> prototype = nullptr;
  return Script::PrototypeIn(&prototype, GetTclInterp());
}

}  // namespace Ip
