// The command evaluate: what settings of the user's own make, from options or from a plan in JSON.
//
// Tested by evaluate.test.
#ifndef VORKEL_CLI_EVALUATECOMMAND_H_
#define VORKEL_CLI_EVALUATECOMMAND_H_

#include <string>
#include <string_view>
#include <vector>

#include "cli/Setting.h"

namespace cli {

int RunEvaluate(std::string_view command, const std::vector<std::string>& words,
                const Setting& setting);

}  // namespace cli

#endif  // VORKEL_CLI_EVALUATECOMMAND_H_
