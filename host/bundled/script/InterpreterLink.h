// What outlives an interpreter: the knowledge of whether it still lives.
//
// A handle that no script has seen yet has no command that would end with the interpreter, so
// it can outlive it; a prototype handle always does. Such handles share one link.
//
// Tested by handle_test.cpp.
#ifndef VORKEL_HOST_BUNDLED_SCRIPT_INTERPRETERLINK_H_
#define VORKEL_HOST_BUNDLED_SCRIPT_INTERPRETERLINK_H_

#include <tcl.h>

#include <atomic>
#include <memory>

namespace Script {

class InterpreterLink {
 public:
  // The link of an interpreter. Null when `interp` is null, is being deleted or its Tcl is out
  // of reach, and when there is no memory.
  static std::shared_ptr<const InterpreterLink> Of(Tcl_Interp* interp) noexcept;

  // The interpreter; null once it has ended. Prototypes are asked for theirs in other threads than
  // its own, too.
  Tcl_Interp* interp() const { return interp_; }

 private:
  explicit InterpreterLink(Tcl_Interp* interp) : interp_(interp) {}

  static void InterpreterEnds(ClientData link, Tcl_Interp* interp);

  std::atomic<Tcl_Interp*> interp_;
};

}  // namespace Script

#endif  // VORKEL_HOST_BUNDLED_SCRIPT_INTERPRETERLINK_H_
