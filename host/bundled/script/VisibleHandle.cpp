#include "host/bundled/script/VisibleHandle.h"

#include <atomic>
#include <string>
#include <string_view>

namespace Script {
namespace {

constexpr char kNamePrefix[] = "::Script::handle";

// Interpreters can live in several threads.
std::atomic<unsigned long long> last_number = 0;

// A command name that was not given out before and is free in `interp`.
std::string NewName(Tcl_Interp* interp) {
  Tcl_CmdInfo taken;
  std::string name;
  do {
    name = kNamePrefix + std::to_string(++last_number);
  } while (Tcl_GetCommandInfo(interp, name.c_str(), &taken) != 0);
  return name;
}

// The full name of a command, with its namespace. Tcl has one function for this since 8.5; the
// two calls used here are older.
std::string FullName(Tcl_Interp* interp, Tcl_Command command) {
  Tcl_CmdInfo info;
  if (Tcl_GetCommandInfoFromToken(command, &info) == 0 || info.namespacePtr == nullptr) return {};
  const std::string_view space = info.namespacePtr->fullName;
  std::string name(space);
  if (space != "::") name += "::";
  return name + Tcl_GetCommandName(interp, command);
}

Tcl_Obj* NewNameObject(std::string_view name) {
  Tcl_Obj* const object = Tcl_NewStringObj(name.data(), static_cast<int>(name.size()));
  Tcl_IncrRefCount(object);
  return object;
}

}  // namespace

PtrHandleBase::Visible* PtrHandleBase::Visible::Create(PtrHandleBase* handle, Tcl_Interp* interp) {
  const std::string name = NewName(interp);
  auto* const visible = new Visible(handle, interp);
  visible->command_ =
      Tcl_CreateObjCommand(interp, name.c_str(), &Visible::Call, visible, &Visible::CommandEnds);
  if (visible->command_ == nullptr) {  // the interpreter is being deleted
    delete visible;
    return nullptr;
  }
  visible->name_ = NewNameObject(name);
  return visible;
}

PtrHandleBase::Visible::~Visible() {
  if (name_ != nullptr) Tcl_DecrRefCount(name_);
}

Tcl_Obj* PtrHandleBase::Visible::Name() {
  if (command_ == nullptr) return name_;
  const std::string name = FullName(interp_, command_);
  if (!name.empty() && name != Tcl_GetString(name_)) {
    Tcl_DecrRefCount(name_);
    name_ = NewNameObject(name);
  }
  return name_;
}

void PtrHandleBase::Visible::HandleEnds() {
  const Running running(this);
  handle_ = nullptr;
  if (command_ != nullptr) Tcl_DeleteCommandFromToken(interp_, command_);
}

void PtrHandleBase::Visible::CommandEnds(ClientData visible) {
  auto* const self = static_cast<Visible*>(visible);
  const Running running(self);
  self->command_ = nullptr;
  if (self->handle_ != nullptr) self->handle_->Detached();
}

void PtrHandleBase::Visible::Settle() {
  if (command_ != nullptr || running_ > 0) return;
  if (handle_ != nullptr) {
    // Its destructor comes back here, with no handle left.
    delete handle_;
  } else {
    delete this;
  }
}

}  // namespace Script
