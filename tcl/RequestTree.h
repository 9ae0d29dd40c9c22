// A request that is a dict, as the tree of a request file.
#ifndef VORKEL_TCL_REQUESTTREE_H_
#define VORKEL_TCL_REQUESTTREE_H_

#include <tcl.h>

#include <string>

#include "planner/read/Tree.h"

namespace tcl {

// The entries of a dict are those of a request in JSON: `inputs` and `outputs` are lists, an output
// a frequency or a dict, and switches are any booleans of Tcl. What is empty is not there. Throws
// Failure when the object is no dict.
planner::read::Node TreeOf(Tcl_Obj* request);

// A list of values in words of Tcl, with commas between them: "148.5 74.25", "27 MHz 50 MHz" and
// "{27 MHz} 50MHz" are two each.
std::string WithCommas(Tcl_Obj* list);

}  // namespace tcl

#endif  // VORKEL_TCL_REQUESTTREE_H_
