// The 40 methods of a handle by name.
//
// Tested by method_table_test.cpp.
#ifndef VORKEL_BINDING_METHODTABLE_H_
#define VORKEL_BINDING_METHODTABLE_H_

#include <array>
#include <string_view>

#include "binding/VorkelPtrHandle.h"
#include "host/Port_StringBase.h"

namespace Ip {

struct Method {
  Port::StringBase name;
  int (VorkelPtrHandle::*function)(int objc, Words objv, Tcl_Interp* interp);
};

inline constexpr int kMethods = 40;

// All methods in the order in which they are searched. Static initialisation builds the table;
// where there was no memory for it, all names are empty until FindMethod has built it.
const std::array<Method, kMethods>& MethodTable();

// The first method with exactly that name, or null. Throws std::bad_alloc when there is no memory
// for a table that is not built yet.
const Method* FindMethod(std::string_view name);

}  // namespace Ip

#endif  // VORKEL_BINDING_METHODTABLE_H_
