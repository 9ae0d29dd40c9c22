// Tested by commands.test.
#include "tcl/Commands.h"

#include <exception>
#include <new>

#include "tcl/Failure.h"
#include "tcl/Objects.h"

namespace tcl {

namespace {

using Command = std::string (*)(Words);

struct Entry {
  const char* name;
  Command command;
};

constexpr Entry kEntries[] = {
    {"::vorkel::plan", Plan},           {"::vorkel::compare", Compare},
    {"::vorkel::best", Best},           {"::vorkel::explain", Explain},
    {"::vorkel::evaluate", Evaluate},   {"::vorkel::devices", Devices},
    {"::vorkel::check", Check},         {"::vorkel::reach", Reach},
    {"::vorkel::relations", Relations},
};

// Tcl is C: nothing may be thrown through it.
int Call(ClientData data, Tcl_Interp* interp, int count, Tcl_Obj* const* words) {
  try {
    const auto* const entry = static_cast<const Entry*>(data);
    const std::string answer =
        entry->command(Words(words + 1, static_cast<std::size_t>(count - 1)));
    Tcl_SetObjResult(interp, Object(answer));
    return TCL_OK;
  } catch (const Failure& failure) {
    return failure.Set(interp);
  } catch (const std::bad_alloc&) {
    return Failure{"out of memory", {"VORKEL", "MEMORY"}}.Set(interp);
  } catch (const std::exception& error) {
    return Failure{std::string("an unexpected failure: ") + error.what(),
                   {"VORKEL", "UNEXPECTED", error.what()}}
        .Set(interp);
  }
}

}  // namespace

void MakeCommands(Tcl_Interp* interp) {
  for (const Entry& entry : kEntries) {
    Tcl_CreateObjCommand(interp, entry.name, Call, const_cast<Entry*>(&entry), nullptr);
  }
  // "vorkel plan ..." is the same as "vorkel::plan ...".
  Tcl_Namespace* const own = Tcl_FindNamespace(interp, "::vorkel", nullptr, 0);
  if (own == nullptr) return;
  Tcl_Export(interp, own, "*", 0);
  Tcl_CreateEnsemble(interp, "::vorkel", own, 0);
}

}  // namespace tcl
