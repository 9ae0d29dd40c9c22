#include "cli/Manual.h"

#include <fmt/format.h>

#include <algorithm>
#include <string_view>
#include <vector>

#include "cli/Commands.h"
#include "cli/Help.h"
#include "cli/Options.h"

namespace cli {

namespace {

// A text as troff shows it as it is: dashes that can be pasted, no requests.
std::string Escaped(std::string_view text) {
  std::string escaped;
  for (const char letter : text) {
    if (letter == '\\') {
      escaped += "\\e";
    } else if (letter == '-') {
      escaped += "\\-";
    } else if (letter == '\'' || letter == '.') {
      escaped += (escaped.empty() ? "\\&" : "") + std::string(1, letter);
    } else {
      escaped += letter;
    }
  }
  return escaped;
}

std::string Bold(std::string_view text) { return fmt::format("\\fB{}\\fR", Escaped(text)); }
std::string Italic(std::string_view text) { return fmt::format("\\fI{}\\fR", Escaped(text)); }

std::string Sentence(std::string_view text) {
  std::string sentence(text);
  if (!sentence.empty() && sentence[0] >= 'a' && sentence[0] <= 'z') {
    sentence[0] = static_cast<char>(sentence[0] - ('a' - 'A'));
  }
  return Escaped(sentence) + (sentence.ends_with('.') ? "" : ".");
}

std::string Entry(const std::string& label, const std::string& text) {
  return ".TP\n" + label + "\n" + text + "\n";
}

std::string CommandEntries() {
  std::string text;
  for (const Command& command : Commands()) {
    std::string label = Bold(command.name);
    if (!command.arguments.empty()) label += " " + Italic(command.arguments);
    std::string about = Sentence(command.description);
    if (!command.remark.empty()) about += "\n" + Escaped(command.remark);
    text += Entry(label, about);
  }
  return text;
}

// The commands that take the option as a row describes it.
std::string Takers(const OptionRow* row) {
  std::string takers;
  for (const Command& command : Commands()) {
    const auto rows = OptionsOf(command.name);
    if (std::find(rows.begin(), rows.end(), row) == rows.end()) continue;
    takers += (takers.empty() ? "" : ", ") + Bold(command.name);
  }
  return takers;
}

std::string OptionEntries() {
  std::string text;
  std::vector<const OptionRow*> known;
  for (const Command& command : Commands()) {
    for (const OptionRow* row : OptionsOf(command.name)) {
      if (std::find(known.begin(), known.end(), row) != known.end()) continue;
      known.push_back(row);
    }
  }
  // Those of one name stand together, however the commands follow each other.
  std::vector<std::string_view> names;
  for (const OptionRow* row : known) {
    if (std::find(names.begin(), names.end(), row->name) == names.end()) names.push_back(row->name);
  }
  for (const std::string_view name : names) {
    for (const OptionRow* row : known) {
      if (row->name != name) continue;
      std::string label = Bold(name);
      if (!row->placeholder.empty()) label += " " + Italic(row->placeholder);
      text += Entry(label, Sentence(row->description) + "\nOf " + Takers(row) + ".");
    }
  }
  return text;
}

std::string Described(const Lines& lines) {
  std::string text;
  for (const auto& [name, about] : lines) text += Entry(Bold(name), Sentence(about));
  return text;
}

std::string Examples() {
  std::string text;
  for (const Command& command : Commands()) {
    if (!command.is_shown) continue;
    text += fmt::format(
        ".PP\n{}:\n.PP\n.RS 4\n.EX\n{}\n.EE\n.RE\n",
        Sentence(command.description).substr(0, Sentence(command.description).size() - 1),
        Escaped(fmt::format("vorkel {} {}", command.name, command.example)));
  }
  return text;
}

constexpr std::string_view kAbout =
    R"(Plans clocks.
Given the input clock of a device and the clocks that a design needs, it finds the settings of the
device's clock primitives, PLL, TSYN, KRU_SP and KRU_CLKGEN: the VCO, the multiplier M, the dividers
and the pins, with their errors and their jitter.
It searches all settings that the hardware has, in exact arithmetic, and tells what stands in the
way of a request and what would work.
.PP
A request stands in options, in a file in JSON, TOML or Tcl, or in both; options then replace what
the file says.
.PP
\fBvorkel help\fR \fICOMMAND\fR lists exactly the options that a command takes.
)";

constexpr std::string_view kEnvironment =
    R"(.TP
\fBVORKEL_DEVICES\fR
Folders with device files, \fIDEVICE\fR.toml, separated by colons; they go before the bundled ones.
.TP
\fBNO_COLOR\fR
No colour on a terminal when it is set.
)";

constexpr std::string_view kFiles =
    R"(.TP
\fIPREFIX\fR/share/vorkel/devices
The bundled devices.
\fIPREFIX\fR is where the program is installed.
.TP
\fIPREFIX\fR/share/doc/vorkel
Guides to the formats, requests, Tcl, C++ and Python, and examples.
)";

}  // namespace

std::string Manual() {
  std::string text = fmt::format(".TH VORKEL 1 \"\" \"vorkel {}\" \"Clock planning\"\n", kVersion);
  text += ".SH NAME\nvorkel \\- plan the clocks of a device\n";
  text += ".SH SYNOPSIS\n\\fBvorkel\\fR \\fICOMMAND\\fR [\\fIOPTION\\fR...]\n";
  text += ".SH DESCRIPTION\n" + std::string(kAbout);
  text += ".SH COMMANDS\n" + CommandEntries();
  text += ".SH OPTIONS\n" + OptionEntries();
  text += ".SH VALUES\n" + Described(ValuesOf("plan"));
  Lines statuses = ExitStatuses();
  std::erase_if(statuses, [](const auto& status) { return status.first == "5"; });
  text += ".SH EXIT STATUS\n" + Described(statuses);
  text += ".SH ENVIRONMENT\n" + std::string(kEnvironment);
  text += ".SH FILES\n" + std::string(kFiles);
  text += ".SH EXAMPLES\n" + Examples();
  text += ".SH SEE ALSO\n\\fBvorkel\\fR(n), \\fBip_vorkel\\fR(n)\n";
  return text;
}

}  // namespace cli
