// The command verify: whether every number of a plan in JSON is right.
//
// Tested by verify.test.
#ifndef VORKEL_CLI_VERIFYCOMMAND_H_
#define VORKEL_CLI_VERIFYCOMMAND_H_

#include <string>
#include <string_view>
#include <vector>

#include "cli/Setting.h"

namespace cli {

int RunVerify(std::string_view command, const std::vector<std::string>& words,
              const Setting& setting);

}  // namespace cli

#endif  // VORKEL_CLI_VERIFYCOMMAND_H_
