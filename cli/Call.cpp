#include "cli/Call.h"

#include <fmt/format.h>
#include <sys/stat.h>

#include <algorithm>
#include <utility>

#include "cli/Devices.h"
#include "cli/Failure.h"
#include "cli/Hdl.h"
#include "cli/Options.h"
#include "cli/Output.h"
#include "cli/RequestFile.h"
#include "planner/read/Letters.h"
#include "planner/read/MistakeText.h"
#include "planner/read/Options.h"
#include "planner/read/Shown.h"
#include "planner/relations/Rule.h"
#include "planner/report/Table.h"

namespace cli {

namespace {

using planner::read::Option;
using planner::read::Shown;

constexpr const char* kPlainSdc = "sdc-plain";

// What is wrong with a call, all of it.
struct Complaints {
  std::vector<std::string> reasons;
  bool words_were_wrong = false;

  void Add(std::string reason) {
    reasons.push_back(std::move(reason));
    words_were_wrong = true;
  }
  void Add(const planner::read::Mistake& mistake) {
    reasons.push_back(TextOf(mistake));
    if (!mistake.place.IsInFile()) words_were_wrong = true;
  }
  void Throw() const {
    if (!reasons.empty()) throw Failure::OfUsage(reasons, words_were_wrong);
  }
};

// The words that a command takes as --format, in the order of its help.
std::vector<std::pair<std::string, Format>> FormatsOf(std::string_view command) {
  std::vector<std::pair<std::string, Format>> formats = {
      {"text", Format::kText}, {"json", Format::kJson}, {"tcl", Format::kTcl}};
  if (command == "explain") return formats;
  if (command != "compare") {
    formats.emplace_back("sdc", Format::kSdc);
    formats.emplace_back(kPlainSdc, Format::kSdc);
  }
  formats.emplace_back("verilog", Format::kVerilog);
  formats.emplace_back("vhdl", Format::kVhdl);
  formats.emplace_back("testbench", Format::kTestbench);
  return formats;
}

Format ReadFormat(std::string_view command, const Given& given, Complaints* complaints) {
  const std::optional<std::string> name = given.Value("--format");
  if (!name) return Format::kText;
  std::vector<std::string> known;
  for (const auto& [word, format] : FormatsOf(command)) {
    known.push_back(word);
    if (!planner::read::IsSameWord(word, *name)) continue;
    if (command == "compare" && IsHdl(format) && !given.Has("--pick")) {
      complaints->Add(
          fmt::format("--format {} is about one candidate: say which with --pick N", word));
    }
    return format;
  }
  complaints->Add(command == "compare" && planner::read::IsSameWord(*name, "sdc")
                      ? "compare has no --format sdc: constraints are those of one plan; use plan, "
                        "best or the command of a primitive"
                      : fmt::format("--format: \"{}\" must be {}", Shown(*name),
                                    planner::read::Enumerated(known, "or")));
  return Format::kText;
}

// What constraints are to say, and by which rule crossings are told apart. Sets the format, too:
// --sdc-plain and --sdc-fifos are about one.
void ReadSdc(Call* call, Complaints* complaints) {
  const Given& given = call->given;
  const std::string format = given.Value("--format").value_or("");
  const bool is_plain = planner::read::IsSameWord(format, kPlainSdc);
  call->sdc.plain = given.Has("--sdc-plain") || is_plain;
  call->sdc.fifos = given.Has("--sdc-fifos");
  for (const char* const option : {"--sdc-plain", "--sdc-fifos"}) {
    if (!given.Has(option)) continue;
    if (!format.empty() && !is_plain && !planner::read::IsSameWord(format, "sdc")) {
      complaints->Add(fmt::format("{} contradicts --format {}", option, Shown(format)));
    }
    call->format = Format::kSdc;
  }
  if (call->sdc.fifos && call->sdc.plain) {
    complaints->Add("--sdc-fifos has no place in the plain form, which has create_clock alone");
  }
  const std::optional<std::string> gap = given.Value("--gap");
  if (!gap) return;
  planner::read::Place place;
  place.entry = "--gap";
  planner::read::Mistakes mistakes;
  if (const auto rule = planner::relations::ReadRule(*gap, place, &mistakes)) {
    call->sdc.rule = *rule;
  }
  for (const planner::read::Mistake& mistake : mistakes) complaints->Add(mistake);
}

// Those of the options that make the request.
std::vector<Option> OfRequest(const Given& given) {
  std::vector<Option> options;
  for (const Option& option : given.options) {
    if (planner::read::FindOption(option.name)) options.push_back(option);
  }
  return options;
}

// Options that ask the same when they are pasted into a shell: what standard input or a pipe has
// said is gone, and the options say it instead.
std::vector<Option> Pasted(const Given& given, const planner::read::Draft& draft) {
  const std::optional<std::string> file = given.Value("--request");
  if (!file) return given.options;
  struct stat status {};
  const bool stays = *file != "-" && file->compare(0, 5, "/dev/") != 0 &&
                     file->compare(0, 6, "/proc/") != 0 && stat(file->c_str(), &status) == 0 &&
                     S_ISREG(status.st_mode);
  if (stays) return given.options;
  std::vector<Option> options = planner::read::OptionsOf(draft);
  for (const Option& option : given.options) {
    if (option.name != "--request" && !planner::read::FindOption(option.name)) {
      options.push_back(option);
    }
  }
  return options;
}

std::string Quoted(const std::string& word) {
  constexpr std::string_view kPlain =
      "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789-_./,=:%+@";
  if (!word.empty() && word.find_first_not_of(kPlain) == std::string::npos) return word;
  std::string quoted = "'";
  for (const char letter : word) {
    if (letter == '\'') {
      quoted += "'\\''";
    } else {
      quoted += letter;
    }
  }
  return quoted + "'";
}

}  // namespace

Call ReadCall(std::string_view command, const std::vector<std::string>& words,
              std::optional<planner::Primitive> primitive, const Setting& setting) {
  const auto make = [&](const Given& given, const planner::read::Draft& draft,
                        planner::read::Mistakes* mistakes) {
    return Finish(draft, {primitive, given.Value("--request").value_or("")}, mistakes);
  };
  return ReadCall(command, words, 0, make, setting);
}

Call ReadCall(std::string_view command, const std::vector<std::string>& words,
              std::size_t most_operands, const MakeReading& make, const Setting& setting) {
  Call call;
  call.command = command;
  call.given = ReadWords(command, words, most_operands);
  planner::read::Mistakes mistakes;
  planner::read::Draft draft;
  if (const auto file = call.given.Value("--request")) {
    draft = ReadRequestFile(*file, setting, &mistakes);
  }
  const std::vector<Option> options = OfRequest(call.given);
  draft = Over(planner::read::ReadOptions(options, &mistakes), draft);
  Complaints complaints;
  call.format = ReadFormat(command, call.given, &complaints);
  ReadSdc(&call, &complaints);
  for (const std::string& mistake : HdlMistakes(call)) complaints.Add(mistake);
  call.file = call.given.Value("-o").value_or("");
  if (call.file.empty() && call.given.Has("-o")) {
    complaints.Add("-o: the name of the file is empty");
  }
  std::optional<planner::read::Reading> reading = make(call.given, draft, &mistakes);
  for (const planner::read::Mistake& mistake : mistakes) complaints.Add(mistake);
  complaints.Throw();
  call.reading = std::move(*reading);
  call.device = FindDevice(call.reading, setting);
  call.pasted = Pasted(call.given, draft);
  return call;
}

void Refuse(const planner::read::Mistakes& mistakes) {
  std::vector<std::string> reasons;
  for (const planner::read::Mistake& mistake : mistakes) reasons.push_back(TextOf(mistake));
  throw Failure::OfUsage(reasons);
}

std::optional<int> WholeNumber(const Given& given, std::string_view name, int lowest, int highest) {
  const std::optional<std::string> text = given.Value(name);
  if (!text) return std::nullopt;
  constexpr std::size_t kMostDigits = 9;
  const bool is_whole = !text->empty() && text->size() <= kMostDigits &&
                        text->find_first_not_of("0123456789") == std::string::npos;
  const int number = is_whole ? std::stoi(*text) : -1;
  if (is_whole && number >= lowest && number <= highest) return number;
  throw Failure::OfUsage(fmt::format("{}: \"{}\" must be a whole number from {} to {}", name,
                                     Shown(*text), lowest, highest));
}

planner::report::Style StyleOf(const Call& call, const Setting& setting) {
  if (!call.file.empty() && call.file != "-") return {};
  return {setting.out_has_colour, setting.out_width};
}

std::string PastedCall(std::string_view command, const std::vector<Option>& options,
                       const Setting& setting) {
  std::string text = setting.program + " " + std::string(command);
  for (const Option& option : options) {
    text += " " + option.name;
    if (IsSwitch(option.name)) continue;
    // What looks like an option is a value only behind an equals sign.
    text += (option.value.compare(0, 2, "--") == 0 ? "=" : " ") + Quoted(option.value);
  }
  return text;
}

std::string PastedCall(std::string_view command, const Call& call, const Setting& setting) {
  return PastedCall(command, KeptFor(command, call.pasted), setting);
}

std::string DoubtLines(const Call& call, const planner::report::Style& style) {
  std::string lines;
  for (const planner::read::Doubt& doubt : call.reading.doubts) {
    lines += planner::report::Prose(style, "hint: ", TextOf(doubt));
  }
  return lines;
}

void Write(const Call& call, const std::string& text, const Setting& setting) {
  const std::string doubts = DoubtLines(call, StyleOf(call, setting));
  const bool is_text = call.format == Format::kText;
  if (call.file.empty()) {
    WriteOut(is_text ? doubts + text : text);
  } else {
    WriteFile(is_text ? doubts + text : text, call.file);
  }
  if (!is_text) WriteError(doubts);
}

}  // namespace cli
