// What differs between the versions of Tcl. The sources compile with the headers of 8.4 to 8.6, and
// then load into each of these, and with those of 9.0.
#ifndef VORKEL_HOST_TCLVERSION_H_
#define VORKEL_HOST_TCLVERSION_H_

#include <tcl.h>

namespace Tcl {

#if TCL_MAJOR_VERSION >= 9
using Size = Tcl_Size;
// The oldest Tcl whose stubs table has all the functions that are called.
inline constexpr char kOldest[] = "9.0";
#else
using Size = int;
inline constexpr char kOldest[] = "8.4";
#endif

}  // namespace Tcl

#endif  // VORKEL_HOST_TCLVERSION_H_
