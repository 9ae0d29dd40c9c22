// Which options each command takes, and what its help says of them. What stands here is what the
// commands accept, what their help lists and what bash completes.
//
// Tested by program.test and completion.test.
#ifndef VORKEL_CLI_OPTIONS_H_
#define VORKEL_CLI_OPTIONS_H_

#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "planner/read/Mistake.h"
#include "planner/read/Options.h"

namespace cli {

struct OptionRow {
  std::string_view name;         // with its dashes
  std::string_view placeholder;  // of its value; empty for a switch
  std::string_view takers;       // commands and groups of them, with blanks between
  // Where the value is one of several words, the description begins with them, up to a semicolon;
  // the completion relies on it.
  std::string_view description;
};

// The options of a command. One that commands describe differently has several rows.
std::vector<const OptionRow*> OptionsOf(std::string_view command);
bool Takes(std::string_view command, std::string_view option);
// The commands that take an option, in the order of the help.
std::vector<std::string> TakersOf(std::string_view option);
// Whether an option of some command has no value.
bool IsSwitch(std::string_view option);
// Why a command does not take an option that others take: a sentence, or nothing.
std::string_view ReasonAgainst(std::string_view command, std::string_view option);

// What the value of an option is, where it is a value with a unit or a list of such.
struct ValueFacts {
  planner::read::ValueKind kind;
  bool is_list;
};
std::optional<ValueFacts> ValueOf(std::string_view option);

// Of the options of a call those that another command takes, too, and that ask for something: not
// those that say where the output goes, what it looks like, and which candidate it is about.
std::vector<planner::read::Option> KeptFor(std::string_view command,
                                           std::vector<planner::read::Option> options);

}  // namespace cli

#endif  // VORKEL_CLI_OPTIONS_H_
