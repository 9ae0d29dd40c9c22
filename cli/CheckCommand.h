// The command check: mistakes in a device file with their places, and what a good one leaves out.
#ifndef VORKEL_CLI_CHECKCOMMAND_H_
#define VORKEL_CLI_CHECKCOMMAND_H_

#include <string>
#include <string_view>
#include <vector>

#include "cli/Setting.h"

namespace cli {

int RunCheck(std::string_view command, const std::vector<std::string>& words,
             const Setting& setting);

}  // namespace cli

#endif  // VORKEL_CLI_CHECKCOMMAND_H_
