// The command batch: many requests, a line each, and as many answers.
#ifndef VORKEL_CLI_BATCHCOMMAND_H_
#define VORKEL_CLI_BATCHCOMMAND_H_

#include <string>
#include <string_view>
#include <vector>

#include "cli/Setting.h"

namespace cli {

int RunBatch(std::string_view command, const std::vector<std::string>& words,
             const Setting& setting);

}  // namespace cli

#endif  // VORKEL_CLI_BATCHCOMMAND_H_
