// The command devices: which devices there are, and all limits of one.
#ifndef VORKEL_CLI_DEVICESCOMMAND_H_
#define VORKEL_CLI_DEVICESCOMMAND_H_

#include <string>
#include <string_view>
#include <vector>

#include "cli/Setting.h"

namespace cli {

int RunDevices(std::string_view command, const std::vector<std::string>& words,
               const Setting& setting);

}  // namespace cli

#endif  // VORKEL_CLI_DEVICESCOMMAND_H_
