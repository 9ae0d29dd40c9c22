// Objects that a script can hold and call.
#ifndef VORKEL_HOST_SCRIPT_HANDLE_H_
#define VORKEL_HOST_SCRIPT_HANDLE_H_

struct Tcl_Interp;
struct Tcl_Obj;

namespace Script {

class PtrHandleBase;

// What a script sees of a native object. The virtual operations stand in the order of the
// interface's slots; the order is part of it.
class Handle {
 public:
  // Called when the handle has become visible to scripts, and when its command ends before it
  // does. Native code that deletes a handle needs no call.
  virtual void Attached() {}
  virtual void Detached() {}

  virtual ~Handle();

  // One script call on the handle. `objv[0]` is the handle itself, the others are the words
  // of the call. Returns a Tcl status; the text is in the interpreter's result.
  virtual int Execute(int objc, const Handle* const objv[], Tcl_Interp* interp);

  // The handle's Tcl object; owned by the handle. Null when it cannot be made.
  virtual Tcl_Obj* GetTclObj() const = 0;

  // The handle's text; valid as long as its Tcl object is unchanged. Null as above.
  virtual const char* GetString() const = 0;

  // Makes the handle the interpreter's result. A Tcl status.
  virtual int SetResult(Tcl_Interp* interp) = 0;

  // Stores the handle in a variable of the interpreter. A Tcl status.
  virtual int SetVariable(Tcl_Interp* interp, const char* name) = 0;

  // A new handle of the same class without a native object; the caller owns it. Null when
  // there is no memory, or when handles of the class do not stand for native objects.
  virtual Handle* CreateHandle(Tcl_Interp* interp) const = 0;

  // The prototype handle of the class, one in the process and never freed. Null as above.
  virtual PtrHandleBase* GetPtrHandleBase() const = 0;

 protected:
  Handle() = default;
  Handle(const Handle&) = delete;
  Handle& operator=(const Handle&) = delete;
};

}  // namespace Script

#endif  // VORKEL_HOST_SCRIPT_HANDLE_H_
