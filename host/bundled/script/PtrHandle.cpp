// Tested by handle_test.cpp.
#include "host/Script_PtrHandle.h"
#include "host/bundled/script/InterpreterLink.h"
#include "host/bundled/script/TclAccess.h"
#include "host/bundled/script/VisibleHandle.h"

namespace Script {

PtrHandleBase::PtrHandleBase(Tcl_Interp* interp) : PtrHandleBase(nullptr, interp) {}

PtrHandleBase::PtrHandleBase(void* value, Tcl_Interp* interp)
    : value_(value), link_(InterpreterLink::Of(interp)) {}

// Detached is not called here: what a derived class does in it is gone with the derived part.
PtrHandleBase::~PtrHandleBase() {
  if (visible_ != nullptr) visible_->HandleEnds();
}

Tcl_Interp* PtrHandleBase::GetTclInterp() const {
  return link_ == nullptr ? nullptr : link_->interp();
}

int PtrHandleBase::GetValue(void** value) const {
  if (value_ == nullptr) return TCL_ERROR;
  *value = value_;
  return TCL_OK;
}

PtrHandleBase::Visible* PtrHandleBase::EnsureVisible() const {
  Tcl_Interp* const interp = GetTclInterp();
  if (visible_ == nullptr && interp != nullptr && !invisible_) {
    // From here on the command owns the handle, constant or not.
    auto* const self = const_cast<PtrHandleBase*>(this);
    visible_ = Visible::Create(self, interp);
    if (visible_ != nullptr) self->Attached();
  }
  return visible_;
}

Tcl_Obj* PtrHandleBase::GetTclObj() const {
  Visible* const visible = EnsureVisible();
  return visible == nullptr ? nullptr : visible->Name();
}

const char* PtrHandleBase::GetString() const {
  Tcl_Obj* const object = GetTclObj();
  return object == nullptr ? nullptr : Tcl_GetString(object);
}

int PtrHandleBase::SetResult(Tcl_Interp* interp) {
  Tcl_Obj* const object = GetTclObj();
  if (object == nullptr) return ErrorResult(interp, "the handle cannot be made a command");
  return SetResultObject(interp, object);
}

int PtrHandleBase::SetVariable(Tcl_Interp* interp, const char* name) {
  Tcl_Obj* const object = GetTclObj();
  if (object == nullptr) return ErrorResult(interp, "the handle cannot be made a command");
  return SetVariableObject(interp, name, object);
}

}  // namespace Script
