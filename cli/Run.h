// The program: words in, text on standard output, an exit status back.
#ifndef VORKEL_CLI_RUN_H_
#define VORKEL_CLI_RUN_H_

#include <string>
#include <vector>

#include "cli/Setting.h"

namespace cli {

// Runs the command that the words are, says on standard error what went wrong, and answers the
// exit status.
int RunWords(const std::vector<std::string>& words, const Setting& setting);

}  // namespace cli

#endif  // VORKEL_CLI_RUN_H_
