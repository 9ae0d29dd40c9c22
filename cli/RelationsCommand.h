// The command relations: how the clocks of a plan relate, and how data can cross between them.
#ifndef VORKEL_CLI_RELATIONSCOMMAND_H_
#define VORKEL_CLI_RELATIONSCOMMAND_H_

#include <string>
#include <string_view>
#include <vector>

#include "cli/Setting.h"

namespace cli {

int RunRelations(std::string_view command, const std::vector<std::string>& words,
                 const Setting& setting);

}  // namespace cli

#endif  // VORKEL_CLI_RELATIONSCOMMAND_H_
