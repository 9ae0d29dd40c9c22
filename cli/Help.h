// What the program says about its own use.
#ifndef VORKEL_CLI_HELP_H_
#define VORKEL_CLI_HELP_H_

#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "cli/Setting.h"

namespace cli {

inline constexpr const char* kVersion = "1.1";

// Words and what they mean.
using Lines = std::vector<std::pair<std::string, std::string>>;
// How the values are written that a command takes.
Lines ValuesOf(std::string_view command);
const Lines& ExitStatuses();

// The usage line of a command; of none, or of one that there is not, that of the program.
std::string UsageLine(std::string_view command, const Setting& setting);

// The commands help and version.
int RunHelp(std::string_view command, const std::vector<std::string>& words,
            const Setting& setting);
int RunVersion(std::string_view command, const std::vector<std::string>& words,
               const Setting& setting);

// That there is no such command, with the nearest one.
std::string UnknownCommand(std::string_view name);

}  // namespace cli

#endif  // VORKEL_CLI_HELP_H_
