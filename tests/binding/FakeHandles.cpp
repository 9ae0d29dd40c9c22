#include "tests/binding/FakeHandles.h"

#include <tcl.h>

#include "host/Script_PtrHandle.h"

namespace {

void Note(const char* call) { FakeHandles::Instance().calls.emplace_back(call); }

void Run(const std::function<void()>& action) {
  if (action) action();
}

}  // namespace

FakeHandles& FakeHandles::Instance() {
  static FakeHandles handles;
  return handles;
}

namespace Script {

Handle::~Handle() = default;

int Handle::Execute(int, const Handle* const*, Tcl_Interp*) { return TCL_ERROR; }

PtrHandleBase::PtrHandleBase(Tcl_Interp* interp) : PtrHandleBase(nullptr, interp) {}

PtrHandleBase::PtrHandleBase(void* value, Tcl_Interp*) : value_(value) {
  Note("make");
  if (value != nullptr) FakeHandles::Instance().value = value;
  Run(FakeHandles::Instance().whileMade);
}

PtrHandleBase::~PtrHandleBase() { Note("destroy"); }

Tcl_Obj* PtrHandleBase::GetTclObj() const { return nullptr; }

const char* PtrHandleBase::GetString() const { return nullptr; }

int PtrHandleBase::SetResult(Tcl_Interp*) {
  Note("result");
  Run(FakeHandles::Instance().whileMadeTheResult);
  return FakeHandles::Instance().setResultStatus;
}

int PtrHandleBase::SetVariable(Tcl_Interp*, const char*) { return TCL_ERROR; }

int PtrHandleBase::GetValue(void** value) const {
  if (value_ == nullptr) return TCL_ERROR;
  *value = value_;
  return TCL_OK;
}

Tcl_Interp* PtrHandleBase::GetTclInterp() const { return nullptr; }

}  // namespace Script
