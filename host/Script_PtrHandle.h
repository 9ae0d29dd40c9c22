// Handles that stand for a native object, held by plain pointer and not owned.
//
// Tested by handle_test.cpp.
#ifndef VORKEL_HOST_SCRIPT_PTRHANDLE_H_
#define VORKEL_HOST_SCRIPT_PTRHANDLE_H_

#include <atomic>
#include <memory>
#include <new>

#include "host/Script_Handle.h"

namespace Script {

class InterpreterLink;

// A handle with an untyped pointer to a native object, its value.
//
// The handle becomes visible to scripts, as a Tcl command with a name of its own, when it is
// first made a result or a variable's value, or asked for its Tcl object or text. From then on the command owns the handle:
// `rename $handle {}` and the end of the interpreter delete it.
class PtrHandleBase : public Handle {
 public:
  // A handle without a value.
  explicit PtrHandleBase(Tcl_Interp* interp);
  PtrHandleBase(void* value, Tcl_Interp* interp);
  ~PtrHandleBase() override;

  Tcl_Obj* GetTclObj() const override;
  const char* GetString() const override;
  int SetResult(Tcl_Interp* interp) override;
  int SetVariable(Tcl_Interp* interp, const char* name) override;

  // Stores the value and returns 0 (TCL_OK); returns non-zero, with nothing stored, when the
  // handle has none.
  int GetValue(void** value) const;
  // Keeps the handle from scripts for good: no command is ever made for it, and so none owns
  // it. For prototypes, which native code holds on to.
  void StayInvisible() { invisible_ = true; }

  // The interpreter of the handle; null when it was given none, and once it has ended.
  Tcl_Interp* GetTclInterp() const;

 private:
  struct Visible;  // the Tcl command and object of a handle that scripts can see

  Visible* EnsureVisible() const;

  void* value_ = nullptr;
  std::shared_ptr<const InterpreterLink> link_;
  mutable Visible* visible_ = nullptr;
  bool invisible_ = false;
};

// The prototype handle of class H, which stays in `place`: the one that is there, or a new one.
// Null when there is no memory. Can be asked for from several threads at once.
template <typename H>
H* PrototypeIn(std::atomic<H*>* place, Tcl_Interp* interp) {
  H* prototype = place->load();
  if (prototype != nullptr) return prototype;
  std::unique_ptr<H> made(new (std::nothrow) H(interp));
  if (made == nullptr) return nullptr;
  made->StayInvisible();
  // Another thread may have been first; then that is the one.
  return place->compare_exchange_strong(prototype, made.get()) ? made.release() : prototype;
}

// The typed level: handles that stand for objects of class T.
template <typename T>
class PtrHandle : public PtrHandleBase {
 public:
  explicit PtrHandle(Tcl_Interp* interp) : PtrHandleBase(interp) {}
  PtrHandle(T* value, Tcl_Interp* interp) : PtrHandleBase(value, interp) {}
  ~PtrHandle() override {}

  Handle* CreateHandle(Tcl_Interp* interp) const override {
    return new (std::nothrow) PtrHandle<T>(interp);
  }

  PtrHandleBase* GetPtrHandleBase() const override {
    static constinit std::atomic<PtrHandle<T>*> prototype = nullptr;
    return PrototypeIn(&prototype, GetTclInterp());
  }
};

}  // namespace Script

#endif  // VORKEL_HOST_SCRIPT_PTRHANDLE_H_
