#include "host/bundled/script/InterpreterLink.h"

#include <new>

#include "host/bundled/script/TclAccess.h"

namespace Script {
namespace {

constexpr char kAssociation[] = "Script::InterpreterLink";

}  // namespace

std::shared_ptr<const InterpreterLink> InterpreterLink::Of(Tcl_Interp* interp) noexcept {
  using Owner = std::shared_ptr<InterpreterLink>;
  if (!ReachTcl(interp) || Tcl_InterpDeleted(interp)) return nullptr;
  try {
    auto* owner = static_cast<Owner*>(Tcl_GetAssocData(interp, kAssociation, nullptr));
    if (owner == nullptr) {
      auto made = std::make_unique<Owner>();
      made->reset(new InterpreterLink(interp));
      owner = made.release();
      Tcl_SetAssocData(interp, kAssociation, &InterpreterEnds, owner);
    }
    return *owner;
  } catch (const std::bad_alloc&) {
    return nullptr;
  }
}

void InterpreterLink::InterpreterEnds(ClientData link, Tcl_Interp* /*interp*/) {
  const std::unique_ptr<std::shared_ptr<InterpreterLink>> owner(
      static_cast<std::shared_ptr<InterpreterLink>*>(link));
  (*owner)->interp_ = nullptr;
}

}  // namespace Script
