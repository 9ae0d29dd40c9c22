// The command reach: which frequencies an output can have.
#ifndef VORKEL_CLI_REACHCOMMAND_H_
#define VORKEL_CLI_REACHCOMMAND_H_

#include <string>
#include <string_view>
#include <vector>

#include "cli/Setting.h"

namespace cli {

int RunReach(std::string_view command, const std::vector<std::string>& words,
             const Setting& setting);

}  // namespace cli

#endif  // VORKEL_CLI_REACHCOMMAND_H_
