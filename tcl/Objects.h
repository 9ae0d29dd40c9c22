// Words, lists and dicts of Tcl, as strings.
#ifndef VORKEL_TCL_OBJECTS_H_
#define VORKEL_TCL_OBJECTS_H_

#include <tcl.h>

#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace tcl {

// In UTF-8; Tcl's own form of a zero byte is taken back.
std::string Text(Tcl_Obj* object);
Tcl_Obj* Object(std::string_view text);

// Nothing when it is none.
std::optional<std::vector<Tcl_Obj*>> List(Tcl_Obj* object);
std::optional<std::vector<std::pair<std::string, Tcl_Obj*>>> Dict(Tcl_Obj* object);
std::optional<bool> Boolean(Tcl_Obj* object);

Tcl_Obj* ListOf(const std::vector<Tcl_Obj*>& objects);

}  // namespace tcl

#endif  // VORKEL_TCL_OBJECTS_H_
