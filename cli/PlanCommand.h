// The commands plan, compare and best: all primitives, engine and search, in one ranking.
#ifndef VORKEL_CLI_PLANCOMMAND_H_
#define VORKEL_CLI_PLANCOMMAND_H_

#include <string>
#include <string_view>
#include <vector>

#include "cli/Setting.h"

namespace cli {

int RunPlan(std::string_view command, const std::vector<std::string>& words,
            const Setting& setting);

}  // namespace cli

#endif  // VORKEL_CLI_PLANCOMMAND_H_
