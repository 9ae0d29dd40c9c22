// Requests in Tcl: a program of its own reads them, within bounds (tcl_request.tcl).
//
// Tested by request_file.test; that program by tcl_request.test.
#ifndef VORKEL_CLI_TCLREQUEST_H_
#define VORKEL_CLI_TCLREQUEST_H_

#include <string>

#include "cli/Setting.h"

namespace cli {

// What that program answers to the text of a request, in JSON. Throws Failure when it cannot be
// run, or fails itself.
std::string AskTcl(const std::string& text, const Setting& setting);

}  // namespace cli

#endif  // VORKEL_CLI_TCLREQUEST_H_
