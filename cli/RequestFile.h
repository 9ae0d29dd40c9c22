// Files that say what to plan.
#ifndef VORKEL_CLI_REQUESTFILE_H_
#define VORKEL_CLI_REQUESTFILE_H_

#include <string>

#include "cli/Setting.h"
#include "planner/read/Draft.h"

namespace cli {

// What a file says, "-" for standard input, in JSON, TOML or Tcl. What is wrong in it is added to
// `mistakes`; that it cannot be read is thrown as Failure.
planner::read::Draft ReadRequestFile(const std::string& name, const Setting& setting,
                                     planner::read::Mistakes* mistakes);

}  // namespace cli

#endif  // VORKEL_CLI_REQUESTFILE_H_
