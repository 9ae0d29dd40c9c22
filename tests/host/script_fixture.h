// An interpreter, and handles that tell what happens to them.
#ifndef VORKEL_TESTS_HOST_SCRIPT_FIXTURE_H_
#define VORKEL_TESTS_HOST_SCRIPT_FIXTURE_H_

#include <tcl.h>

#include <functional>
#include <string>
#include <utility>

#include "host/Script_PtrHandle.h"

// The entry point of the library of script handles.
extern "C" int Ptrhandleqrm_Init(Tcl_Interp* interp);

class Interpreter {
 public:
  Interpreter() : interp_(NewInterpreter()) {}
  ~Interpreter() { End(); }
  Interpreter(const Interpreter&) = delete;
  Interpreter& operator=(const Interpreter&) = delete;

  Tcl_Interp* get() const { return interp_; }

  void End() {
    if (interp_ != nullptr) Tcl_DeleteInterp(interp_);
    interp_ = nullptr;
  }

  // The result of a script, with "error: " in front when it failed.
  std::string Eval(const std::string& script) const {
    const int status = Tcl_EvalEx(interp_, script.c_str(), -1, TCL_EVAL_GLOBAL);
    return (status == TCL_OK ? "" : "error: ") + Result();
  }

  std::string Result() const { return Tcl_GetStringResult(interp_); }

 private:
  static Tcl_Interp* NewInterpreter() {
    Tcl_FindExecutable(nullptr);
    return Tcl_CreateInterp();
  }

  Tcl_Interp* interp_;
};

// What has happened to a handle.
struct HandleLog {
  int attached = 0;
  int detached = 0;
  int deleted = 0;
  int executed = 0;
};

class LoggedHandle : public Script::PtrHandleBase {
 public:
  using Body = std::function<int(int, const Script::Handle* const[], Tcl_Interp*)>;

  LoggedHandle(HandleLog* log, Tcl_Interp* interp, Body body = nullptr)
      : PtrHandleBase(log, interp), log_(log), body_(std::move(body)) {}
  ~LoggedHandle() override { ++log_->deleted; }

  void Attached() override { ++log_->attached; }
  void Detached() override { ++log_->detached; }

  int Execute(int objc, const Script::Handle* const objv[], Tcl_Interp* interp) override {
    ++log_->executed;
    return body_ ? body_(objc, objv, interp) : TCL_OK;
  }

  Handle* CreateHandle(Tcl_Interp*) const override { return nullptr; }
  PtrHandleBase* GetPtrHandleBase() const override { return nullptr; }

 private:
  HandleLog* log_;
  Body body_;
};

#endif  // VORKEL_TESTS_HOST_SCRIPT_FIXTURE_H_
