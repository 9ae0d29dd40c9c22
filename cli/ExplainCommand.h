// The command explain: why a request cannot be had as it stands, and what could be had instead.
#ifndef VORKEL_CLI_EXPLAINCOMMAND_H_
#define VORKEL_CLI_EXPLAINCOMMAND_H_

#include <string>
#include <string_view>
#include <vector>

#include "cli/Setting.h"

namespace cli {

int RunExplain(std::string_view command, const std::vector<std::string>& words,
               const Setting& setting);

}  // namespace cli

#endif  // VORKEL_CLI_EXPLAINCOMMAND_H_
