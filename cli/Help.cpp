#include "cli/Help.h"

#include <fmt/format.h>

#include <algorithm>
#include <utility>

#include "cli/Commands.h"
#include "cli/Failure.h"
#include "cli/Options.h"
#include "cli/Output.h"
#include "cli/Words.h"
#include "planner/read/Letters.h"
#include "planner/read/Shown.h"
#include "planner/report/Table.h"

namespace cli {

namespace {

using planner::report::Pairs;
using planner::report::Style;

// How values are written, with an option that a command has for them.
struct ValueHelp {
  std::string_view option;
  const char* name;
  const char* description;
};
constexpr ValueHelp kValues[] = {
    {"--in", "frequencies", "148.5, 148.5MHz, 100/3, or 8ns for a period; MHz without a unit"},
    {"--phase", "phases", "90, 90deg, -45; degrees without a unit"},
    {"--duty", "duty cycles", "50, 50%"},
    {"--input-jitter", "jitter", "50, 50ps, 0.05ns; ps without a unit"},
    {"--tolerance", "tolerance", "100, 100ppm, 0.01%; ppm without a unit"},
    {"--in", "lists",
     "each entry has a unit of its own or none: 24,27,33.3MHz are 24, 27 and 33.3 MHz. One without "
     "a unit beside one that is not in MHz, as in 8,16ns, is refused, because 8 could be meant in "
     "ns; write 8ns,16ns. A decimal number has a point, 148.5."},
};

Style StyleOfHelp(const Setting& setting) { return {false, setting.out_width}; }

std::string Section(const std::string& heading, const Pairs& lines, const Style& style) {
  return heading + ":\n" + planner::report::Described(style, lines);
}

std::string Labelled(const OptionRow& row) {
  return row.placeholder.empty() ? std::string(row.name)
                                 : fmt::format("{} {}", row.name, row.placeholder);
}

Pairs Described(const std::vector<const OptionRow*>& rows) {
  Pairs lines;
  for (const OptionRow* row : rows) lines.emplace_back(Labelled(*row), row->description);
  return lines;
}

// The options that other commands have beside those of plan, with the commands.
Pairs OtherOptions() {
  std::vector<std::string_view> known;
  for (const OptionRow* row : OptionsOf("plan")) known.push_back(row->name);
  Pairs lines;
  for (const Command& command : Commands()) {
    for (const OptionRow* row : OptionsOf(command.name)) {
      if (std::find(known.begin(), known.end(), row->name) != known.end()) continue;
      known.push_back(row->name);
      std::string takers;
      for (const std::string& taker : TakersOf(row->name)) {
        takers += (takers.empty() ? "" : ", ") + taker;
      }
      lines.emplace_back(Labelled(*row), fmt::format("{}: {}", takers, row->description));
    }
  }
  return lines;
}

std::string Values(std::string_view command, const Style& style) {
  const Pairs lines = ValuesOf(command);
  return lines.empty() ? "" : "\n" + Section("Values", lines, style);
}

std::string Example(const Command& command, const Setting& setting) {
  std::string text = fmt::format("  {} {}", setting.program, command.name);
  if (!command.example.empty()) text += " " + std::string(command.example);
  return text + "\n";
}

std::string WholeHelp(const Setting& setting) {
  const Style style = StyleOfHelp(setting);
  Pairs commands;
  for (const Command& command : Commands()) {
    commands.emplace_back(command.name, command.description);
  }
  std::string text = fmt::format("usage: {} COMMAND [OPTION...]\n\n", setting.program);
  text += planner::report::Paragraph(
      style,
      "Plans clocks: finds the settings of a device's clock primitives, VCO, M, D, dividers "
      "and pins, with their errors and their jitter.");
  text += "\n" + Section("Commands", commands, style);
  text += "\n" + Section("Options of plan", Described(OptionsOf("plan")), style);
  text += "\n" + Section("Options of other commands", OtherOptions(), style);
  text +=
      fmt::format("\n{} help COMMAND lists exactly those that a command takes.\n", setting.program);
  text += Values("plan", style);
  text += "\n" + Section("Exit status", ExitStatuses(), style);
  text += "\nExamples:\n";
  for (const Command& command : Commands()) {
    if (command.is_shown) text += Example(command, setting);
  }
  return text;
}

std::string HelpOn(const Command& command, const Setting& setting) {
  const Style style = StyleOfHelp(setting);
  std::string description(command.description);
  description[0] = static_cast<char>(description[0] - ('a' - 'A'));
  std::string text = UsageLine(command.name, setting) + "\n\n" +
                     planner::report::Paragraph(style, description + ".");
  const std::vector<const OptionRow*> options = OptionsOf(command.name);
  if (!options.empty()) {
    text += "\n" + Section("Options", Described(options), style) + Values(command.name, style);
  }
  if (!command.remark.empty()) {
    text += "\n" + planner::report::Paragraph(style, std::string(command.remark));
  }
  return text + "\nExample:\n" + Example(command, setting);
}

}  // namespace

Lines ValuesOf(std::string_view command) {
  Lines lines;
  for (const ValueHelp& value : kValues) {
    if (Takes(command, value.option)) lines.emplace_back(value.name, value.description);
  }
  return lines;
}

const Lines& ExitStatuses() {
  static const Lines kStatuses = {
      {"0", "solved, or shown what was asked for; explain: also what is not possible"},
      {"1", "there is no configuration; the reason is on standard error"},
      {"2",
       "wrong usage, or a file or standard output that cannot be read or written; check and verify: "
       "also what is wrong in the file"},
      {"3", "solved, but something is outside its tolerance or range"},
      {"4", "the program itself failed"},
      {"5", "it could not be set up: packages cannot be installed, or the build fails"},
  };
  return kStatuses;
}

std::string UsageLine(std::string_view name, const Setting& setting) {
  const Command* command = FindCommand(name);
  if (!command) return fmt::format("usage: {0} COMMAND [OPTION...], or {0} help", setting.program);
  std::string line = fmt::format("usage: {} {}", setting.program, name);
  if (!command->arguments.empty()) line += " " + std::string(command->arguments);
  return line;
}

int RunHelp(std::string_view name, const std::vector<std::string>& words, const Setting& setting) {
  const Given given = ReadWords(name, words, 1);
  if (given.operands.empty()) {
    WriteOut(WholeHelp(setting));
    return kDone;
  }
  const Command* command = FindCommand(given.operands.front());
  if (!command) throw Failure::OfUsage(UnknownCommand(given.operands.front()));
  WriteOut(HelpOn(*command, setting));
  return kDone;
}

int RunVersion(std::string_view name, const std::vector<std::string>& words, const Setting&) {
  ReadWords(name, words);
  WriteOut(fmt::format("vorkel {}\n", kVersion));
  return kDone;
}

std::string UnknownCommand(std::string_view name) {
  std::vector<std::string> names;
  for (const Command& command : Commands()) names.emplace_back(command.name);
  return fmt::format("unknown command \"{}\"{}", planner::read::Shown(name),
                     planner::read::DidYouMean(name, names));
}

}  // namespace cli
