#include "cli/Options.h"

#include <algorithm>
#include <utility>

#include "cli/Commands.h"
#include "planner/read/Settings.h"

namespace cli {

namespace {

constexpr std::pair<std::string_view, std::string_view> kGroups[] = {
    {"any", "plan compare best explain relations tsyn pll kru clkgen"},
    {"planning", "plan compare best explain relations"},
    {"loops", "plan compare best explain relations tsyn pll"},
    {"loop", "tsyn pll"},
    {"krus", "kru clkgen"},
    {"single", "tsyn pll kru clkgen"},
    {"written", "plan best relations tsyn pll kru clkgen evaluate"},
};

constexpr OptionRow kRows[] = {
    {"--in", "F[,F2]", "loops reach",
     "input frequency; F2 is that of a second input clock, with which all must stay in range; "
     "errors are for the first"},
    {"--in", "F", "krus", "input frequency"},
    {"--out", "LIST", "loops", "frequencies of 1 to 7 outputs; - for one that is not used"},
    {"--in", "F[,F2]", "evaluate",
     "input frequency; F2 is that of a second input clock, with which all limits count, too"},
    {"--out", "LIST", "evaluate",
     "frequencies to compare with, one for each output; - for one that is not asked for"},
    {"--out", "LIST", "krus", "frequencies of 1 to 6 outputs; - for one that is not used"},
    {"--phase", "LIST", "any evaluate", "phase of each output; - where any will do"},
    {"--duty", "LIST", "loops evaluate",
     "duty cycle of each output, above 0 and below 100; - or 0 where any will do"},
    {"--any-order", "", "planning batch",
     "outputs may change places, where not all places can make a frequency"},
    {"--output", "N", "reach", "the place of the output, 0 by default, up to 6"},
    {"--from", "F", "reach", "only frequencies from this one on"},
    {"--to", "F", "reach", "only frequencies up to this one"},
    {"--near", "F", "reach", "the frequencies that are nearest to this one, 5 by default"},
    {"--gaps", "N", "reach", "the N widest gaps between frequencies"},
    {"--count", "", "reach", "only how many there are"},
    {"--most", "N", "reach",
     "at most so many frequencies, 0 for all; by default 40 as text, else all"},
    {"--device", "NAME", "any batch evaluate reach",
     "DEVICE[PACKAGE][-GRADE] or its beginning; vk40 by default"},
    {"--primitive", "NAME", "planning batch reach",
     "auto (default), PLL, TSYN, KRU_SP or KRU_CLKGEN"},
    {"--primitive", "NAME", "evaluate",
     "PLL, TSYN, KRU_SP or KRU_CLKGEN; TSYN by default, with --pins KRU_SP, or KRU_CLKGEN where "
     "CLKFXDV is among them"},
    {"--engine", "", "plan compare explain relations batch",
     "only what the design flow's own search answers, not all settings"},
    {"--bandwidth", "NAME", "planning batch reach",
     "LOW, HIGH or OPTIMIZED; of the loop, all by default"},
    {"--bandwidth", "NAME", "loop",
     "LOW, HIGH or OPTIMIZED (default); with LOW, the maximum of the PFD is lower"},
    {"--bandwidth", "NAME", "evaluate", "LOW, HIGH or OPTIMIZED (default); of the loop"},
    {"--low-bandwidth", "", "loops batch evaluate reach", "short for --bandwidth LOW"},
    {"--rank", "NAME", "planning batch",
     "jitter (default), error, margin or vco; what counts first among settings that meet all "
     "demands: the least jitter, the smallest error, the largest margin to the device's limits or "
     "the lowest VCO"},
    {"--prefer-max-vco", "", "planning batch",
     "the highest VCO counts instead of the lowest; without --rank it counts first"},
    {"--prefer-max-vco", "", "loop", "with --phase or --duty: take the highest VCO"},
    {"--int-div0", "", "planning batch reach", "of a TSYN only whole M and whole dividers"},
    {"--int-div0", "", "tsyn", "a whole divider for output 0"},
    {"--feedback", "", "planning batch reach",
     "a KRU_SP only with its feedback connected; both by default"},
    {"--feedback", "", "kru", "use the feedback, without which there are only CLKFX pins"},
    {"--feedback", "", "evaluate", "of a KRU_SP: the feedback is connected"},
    {"--input-jitter", "PS", "any batch evaluate reach",
     "peak-to-peak jitter of the input clock, 0 by default"},
    {"--input-tolerance", "PPM", "any batch evaluate reach",
     "how far the input can be off over temperature and age, 0 by default; every limit of the "
     "device has to be kept with all of it"},
    {"--tolerance", "PPM", "any batch evaluate",
     "how far a frequency may be off, 100 by default; a list has one for each output, and so has "
     "that of the next options"},
    {"--exact", "", "any batch evaluate", "short for --tolerance 0"},
    {"--phase-tolerance", "DEG", "any batch evaluate",
     "how far a phase may be off, 0.5 by default"},
    {"--duty-tolerance", "POINTS", "loops batch evaluate",
     "how far a duty cycle may be off, 0.5 by default"},
    {"--max-jitter", "PS", "any batch evaluate",
     "the most jitter that an output may have, peak to peak"},
    {"--pick", "N", "plan compare best relations",
     "the candidate to take, by its number in compare"},
    {"--front", "N", "best", "trade-offs to show, the best settings as the first; 6 by default"},
    {"--oscillators", "LIST", "explain", "input frequencies to try instead of stock oscillators"},
    {"--m", "M", "evaluate", "M; of a TSYN in steps of 1/8, as 41.625"},
    {"--d", "D", "evaluate", "D"},
    {"--divide", "LIST", "evaluate",
     "divider of each output, - for one that is not used; that of output 0 of a TSYN in steps of "
     "1/8. Of a KRU the divide of CLKDV or CLKFXDV"},
    {"--phase-steps", "LIST", "evaluate", "phase of each output, in eighths of a VCO period"},
    {"--set-phase", "LIST", "evaluate", "the same in degrees, each of them on a step"},
    {"--high-times", "LIST", "evaluate",
     "how long each output is high, in halves of a VCO period; - for 50 %"},
    {"--set-duty", "LIST", "evaluate",
     "the same in percent, each of them a whole number of halves"},
    {"--pins", "LIST", "evaluate", "pin of each output of a KRU, - for one that is not used"},
    {"--divide-by-2", "", "evaluate", "of a KRU_SP: CLKIN_DIVIDE_BY_2"},
    {"--phase-shift", "N", "evaluate", "of a KRU_SP: PHASE_SHIFT, 0 to 255"},
    {"--pick", "N", "evaluate",
     "the answer of the plan to take, by its number; the first by default"},
    {"--request", "FILE", "any evaluate",
     "take from a file what no option says; - is standard input"},
    {"--format", "NAME", "written",
     "text (default), json, tcl, sdc, sdc-plain, verilog, vhdl or testbench"},
    {"--format", "NAME", "compare",
     "text (default), json, tcl, verilog, vhdl or testbench; the last three with --pick"},
    {"--format", "NAME", "explain", "text (default), json or tcl"},
    {"--gap", "NS", "written",
     "the least gap between edges of two clocks in which data can cross, or a share of the shorter "
     "period such as 20%; 25% by default; of relations and --format sdc"},
    {"--sdc-plain", "", "written",
     "short for --format sdc-plain: create_clock alone, for readers that know nothing else"},
    {"--sdc-fifos", "", "written",
     "short for --format sdc, where all data that needs a FIFO or a handshake to cross goes through "
     "one: the constraints then say so"},
    {"--format", "NAME", "devices", "text (default) or json"},
    {"--jobs", "N", "batch", "processes to work with, 1 by default; 0 for one on each processor"},
    {"--shard", "I/N", "batch", "only part I of N parts: every N-th line, from line I on"},
    {"--resume", "", "batch", "go on with the file of -o that an interrupted run has left"},
    {"--all", "", "batch", "all candidates of each request, not only the best"},
    {"--csv", "", "batch", "rows for a spreadsheet instead of JSON, one for each output"},
    {"--quiet", "", "batch", "no table at the end and no progress"},
    {"--name", "NAME", "written compare",
     "of the module or entity, with --format verilog, vhdl or testbench; clocks by default"},
    {"--language", "NAME", "written compare", "verilog (default) or vhdl; of --format testbench"},
    {"--format", "NAME", "reach", "text (default), json, csv or tcl"},
    {"-o", "FILE", "any batch evaluate reach", "write to a file; - is standard output"},
    {"--trace", "", "single",
     "print first what the engine itself tells of its search, a line for each step; text format "
     "only"},
};

// Why some commands have no use for an option, and what to do.
struct Reason {
  std::string_view option;  // or several, with blanks between
  std::string_view commands;
  std::string_view sentence;
};
constexpr Reason kReasons[] = {
    {"--duty", "krus", "a KRU has no choice of its duty cycles; leave --duty out"},
    {"--duty-tolerance", "krus",
     "a KRU has no choice of its duty cycles; leave --duty-tolerance out"},
    {"--bandwidth", "krus", "a KRU has no loop; leave --bandwidth out"},
    {"--low-bandwidth", "krus", "a KRU has no loop; leave --low-bandwidth out"},
    {"--prefer-max-vco", "krus", "a KRU has no VCO; leave --prefer-max-vco out"},
    {"--int-div0", "pll", "all dividers of a PLL are whole; leave --int-div0 out"},
    {"--int-div0", "krus", "a KRU has no such divider; leave --int-div0 out"},
    {"--feedback", "loop clkgen", "only a KRU_SP has a feedback to connect"},
    {"--primitive", "single", "the command itself names the primitive"},
    {"--rank", "single", "the engine ranks its settings itself; use plan"},
    {"--any-order", "single", "the engine takes the outputs as they come; use plan"},
    {"--engine", "single", "the command asks the engine anyway"},
    {"--rank --any-order --engine --prefer-max-vco --int-div0 --front", "evaluate",
     "nothing is chosen where all settings are there"},
    {"--engine", "best", "best searches all settings; use plan"},
    {"--gap", "compare explain", "it is about the clocks of one plan; use relations"},
    {"--pick", "single explain", "only plan, compare, best and relations have candidates to pick"},
    {"--trace", "planning", "a trace is of one search; take the command of a primitive"},
};

// The options that do not ask for anything: they belong to one call.
constexpr std::string_view kOfOneCall[] = {"--format",    "--name",      "--language",
                                           "-o",          "--trace",     "--pick",
                                           "--sdc-plain", "--sdc-fifos", "--gap"};

// Whether a list of words has one.
bool Has(std::string_view list, std::string_view word) {
  for (std::size_t end = 0; end != std::string_view::npos;) {
    end = list.find(' ');
    if (list.substr(0, end) == word) return true;
    if (end != std::string_view::npos) list.remove_prefix(end + 1);
  }
  return false;
}

// Whether a list of commands and groups means a command.
bool Means(std::string_view takers, std::string_view command) {
  if (Has(takers, command)) return true;
  return std::any_of(std::begin(kGroups), std::end(kGroups), [&](const auto& group) {
    return Has(takers, group.first) && Has(group.second, command);
  });
}

const OptionRow* Find(std::string_view option) {
  for (const OptionRow& row : kRows) {
    if (row.name == option) return &row;
  }
  return nullptr;
}

}  // namespace

std::vector<const OptionRow*> OptionsOf(std::string_view command) {
  std::vector<const OptionRow*> rows;
  for (const OptionRow& row : kRows) {
    if (Means(row.takers, command)) rows.push_back(&row);
  }
  return rows;
}

bool Takes(std::string_view command, std::string_view option) {
  const std::vector<const OptionRow*> rows = OptionsOf(command);
  return std::any_of(rows.begin(), rows.end(),
                     [&](const OptionRow* row) { return row->name == option; });
}

std::vector<std::string> TakersOf(std::string_view option) {
  std::vector<std::string> takers;
  for (const Command& command : Commands()) {
    if (Takes(command.name, option)) takers.emplace_back(command.name);
  }
  return takers;
}

bool IsSwitch(std::string_view option) {
  const OptionRow* row = Find(option);
  return row && row->placeholder.empty();
}

std::string_view ReasonAgainst(std::string_view command, std::string_view option) {
  for (const Reason& reason : kReasons) {
    if (Has(reason.option, option) && Means(reason.commands, command)) return reason.sentence;
  }
  return "";
}

std::optional<ValueFacts> ValueOf(std::string_view option) {
  if (option == "--oscillators") return {{planner::read::ValueKind::kFrequency, true}};
  for (const char* const name : {"--from", "--to", "--near"}) {
    if (option == name) return {{planner::read::ValueKind::kFrequency, false}};
  }
  if (option == "--gap") return {{planner::read::ValueKind::kGap, false}};
  const planner::read::OptionFacts* facts = planner::read::FindOption(option);
  if (!facts) facts = planner::read::FindSettingOption(option);
  if (!facts || !facts->kind) return std::nullopt;
  return {{*facts->kind, facts->is_list}};
}

std::vector<planner::read::Option> KeptFor(std::string_view command,
                                           std::vector<planner::read::Option> options) {
  std::erase_if(options, [&](const planner::read::Option& option) {
    return !Takes(command, option.name) || std::find(std::begin(kOfOneCall), std::end(kOfOneCall),
                                                     option.name) != std::end(kOfOneCall);
  });
  return options;
}

}  // namespace cli
