#include "cli/Run.h"

#include <fmt/format.h>

#include <algorithm>
#include <cstdlib>
#include <exception>
#include <new>

#include "cli/Commands.h"
#include "cli/Failure.h"
#include "cli/Help.h"
#include "cli/Options.h"
#include "cli/Output.h"
#include "planner/read/Shown.h"

namespace cli {

namespace {

bool IsAmong(const std::string& word, std::initializer_list<const char*> words) {
  return std::find(words.begin(), words.end(), word) != words.end();
}

// Runs a command. Without words that is the help.
int Dispatch(const std::vector<std::string>& words, const Setting& setting) {
  if (words.empty()) return RunHelp("help", {}, setting);
  std::string name = words.front();
  std::vector<std::string> arguments(words.begin() + 1, words.end());
  if (IsAmong(name, {"--help", "-h"})) return RunHelp("help", arguments, setting);
  if (name == "--version") return RunVersion("version", arguments, setting);
  const Command* command = FindCommand(name);
  if (!command) {
    const std::string option = name.substr(0, name.find('='));
    if (!TakersOf(option).empty()) {
      throw Failure::OfUsage(fmt::format("a command must come before {}, such as plan", option));
    }
    if (!name.empty() && name.front() == '-') {
      throw Failure::OfUsage(fmt::format("unknown option \"{}\"", planner::read::Shown(name)));
    }
    throw Failure::OfUsage(UnknownCommand(name));
  }
  const bool wants_help =
      std::any_of(arguments.begin(), arguments.end(), [](const std::string& word) {
        return IsAmong(word, {"--help", "-h"});
      });
  if (wants_help) return RunHelp("help", {name}, setting);
  return command->run(name, arguments, setting);
}

}  // namespace

int RunWords(const std::vector<std::string>& words, const Setting& setting) {
  // A debugger stops where the program has failed when nothing catches that.
  const char* const debug = std::getenv("VORKEL_DEBUG");
  const bool is_debugged = debug && *debug != '\0';
  try {
    return Dispatch(words, setting);
  } catch (const Failure& failure) {
    std::string text = failure.text();
    if (failure.shows_usage()) text += UsageLine(words.empty() ? "" : words[0], setting) + "\n";
    WriteError(text);
    return failure.status();
  } catch (const std::exception& error) {
    if (is_debugged) throw;
    WriteError(
        fmt::format("vorkel: {} has failed: {}; with VORKEL_DEBUG=1 it stops there, for a "
                    "debugger\n",
                    words.empty() ? "help" : planner::read::Shown(words[0]),
                    planner::read::ShownWhole(error.what())));
    return kFailed;
  }
}

}  // namespace cli
