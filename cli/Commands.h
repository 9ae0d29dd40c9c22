// The commands of the program.
#ifndef VORKEL_CLI_COMMANDS_H_
#define VORKEL_CLI_COMMANDS_H_

#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "cli/Setting.h"

namespace cli {

// Runs a command with the words behind its name: it writes what it has to say and answers the exit
// status. What goes wrong is thrown as Failure.
using Run = int (*)(std::string_view command, const std::vector<std::string>& words,
                    const Setting& setting);

struct Command {
  std::string_view name;
  std::string_view arguments;
  std::string_view description;
  std::string_view example;  // words that can be pasted
  std::string_view remark;   // what else there is to say
  bool is_shown = false;     // its example is in the whole help
  Run run = nullptr;
};

// In the order of the help.
std::span<const Command> Commands();
// Nothing when there is no such command.
const Command* FindCommand(std::string_view name);

}  // namespace cli

#endif  // VORKEL_CLI_COMMANDS_H_
