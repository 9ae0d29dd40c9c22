// The commands tsyn, pll, kru and clkgen: the engine's answer of one primitive.
#ifndef VORKEL_CLI_ENGINECOMMAND_H_
#define VORKEL_CLI_ENGINECOMMAND_H_

#include <string>
#include <string_view>
#include <vector>

#include "cli/Setting.h"

namespace cli {

int RunEngine(std::string_view command, const std::vector<std::string>& words,
              const Setting& setting);

}  // namespace cli

#endif  // VORKEL_CLI_ENGINECOMMAND_H_
