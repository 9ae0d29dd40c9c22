#include "tcl/Objects.h"

#include "host/TclVersion.h"

namespace tcl {

std::string Text(Tcl_Obj* object) {
  Tcl::Size length = 0;
  const char* const bytes = Tcl_GetStringFromObj(object, &length);
  std::string text(bytes, static_cast<std::size_t>(length));
  for (std::size_t i = text.find("\xc0\x80"); i != std::string::npos;
       i = text.find("\xc0\x80", i + 1)) {
    text.replace(i, 2, 1, '\0');
  }
  return text;
}

Tcl_Obj* Object(std::string_view text) {
  return Tcl_NewStringObj(text.data(), static_cast<int>(text.size()));
}

std::optional<std::vector<Tcl_Obj*>> List(Tcl_Obj* object) {
  Tcl::Size count = 0;
  Tcl_Obj** items = nullptr;
  if (Tcl_ListObjGetElements(nullptr, object, &count, &items) != TCL_OK) return std::nullopt;
  return std::vector<Tcl_Obj*>(items, items + count);
}

std::optional<std::vector<std::pair<std::string, Tcl_Obj*>>> Dict(Tcl_Obj* object) {
  Tcl_DictSearch search;
  Tcl_Obj* key = nullptr;
  Tcl_Obj* value = nullptr;
  int is_done = 0;
  if (Tcl_DictObjFirst(nullptr, object, &search, &key, &value, &is_done) != TCL_OK) {
    return std::nullopt;
  }
  std::vector<std::pair<std::string, Tcl_Obj*>> entries;
  while (is_done == 0) {
    entries.emplace_back(Text(key), value);
    Tcl_DictObjNext(&search, &key, &value, &is_done);
  }
  Tcl_DictObjDone(&search);
  return entries;
}

std::optional<bool> Boolean(Tcl_Obj* object) {
  int truth = 0;
  if (Tcl_GetBooleanFromObj(nullptr, object, &truth) != TCL_OK) return std::nullopt;
  return truth != 0;
}

Tcl_Obj* ListOf(const std::vector<Tcl_Obj*>& objects) {
  return Tcl_NewListObj(static_cast<int>(objects.size()), objects.data());
}

}  // namespace tcl
