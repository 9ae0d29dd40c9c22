// The Tcl command of a handle that scripts can see.
//
// Handle and command each can end first, and either can end while the handle runs a call:
//
// - The command ends (`rename $handle {}`, the namespace or the interpreter is deleted): the
//   command owned the handle, which is deleted, after the call that runs on it, if any.
// - The handle is deleted by native code: it takes its command with it.
//
// This object ends with the last of the handle, the command and the running calls.
//
// Tested by handle_test.cpp.
#ifndef VORKEL_HOST_BUNDLED_SCRIPT_VISIBLEHANDLE_H_
#define VORKEL_HOST_BUNDLED_SCRIPT_VISIBLEHANDLE_H_

#include <tcl.h>

#include "host/Script_PtrHandle.h"

namespace Script {

struct PtrHandleBase::Visible {
  // Makes a command for `handle` under a name that was never used in this process and that no
  // script has taken. Null when that is impossible.
  static Visible* Create(PtrHandleBase* handle, Tcl_Interp* interp);

  // A Tcl object with the current full name of the command; its last name once the command
  // has ended. Never null.
  Tcl_Obj* Name();

  // The handle is being deleted: deletes the command, if it is still there.
  void HandleEnds();

 private:
  // Keeps the object, and with it the handle, alive during a call.
  class Running {
   public:
    explicit Running(Visible* visible) : visible_(visible) { ++visible_->running_; }
    ~Running() {
      --visible_->running_;
      if (visible_->command_ == nullptr) visible_->Settle();
    }
    Running(const Running&) = delete;
    Running& operator=(const Running&) = delete;

   private:
    Visible* visible_;
  };

  Visible(PtrHandleBase* handle, Tcl_Interp* interp) : handle_(handle), interp_(interp) {}
  ~Visible();

  // Deletes what has lost its reason to live.
  void Settle();

  // The command's procedures.
  static int Call(ClientData visible, Tcl_Interp* interp, int objc, Tcl_Obj* const objv[]);
  static void CommandEnds(ClientData visible);

  PtrHandleBase* handle_;          // null once deleted
  Tcl_Interp* interp_;             // lives as long as the command does
  Tcl_Command command_ = nullptr;  // null once deleted
  Tcl_Obj* name_ = nullptr;
  int running_ = 0;  // calls on their way
};

}  // namespace Script

#endif  // VORKEL_HOST_BUNDLED_SCRIPT_VISIBLEHANDLE_H_
