// Tested by sdc_test.cpp.
#include "planner/report/SdcWords.h"

#include <cctype>
#include <utility>

#include "planner/report/FindingText.h"
#include "planner/report/Numbers.h"
#include "planner/report/SettingsText.h"
#include "planner/report/Table.h"
#include "planner/report/Words.h"

namespace planner::report {

namespace {

using std::string;

constexpr int kCommentWidth = 78;
// Decimals of ns and percent, as exactly as a double has them.
constexpr int kExactDecimals = 15;

}  // namespace

string SdcExact(const Rational& value) { return Short(value, kExactDecimals); }
string SdcFigure(const Rational& value) { return Short(value, 6); }

string SdcComment(const string& sentence) {
  string text = "# ";
  for (const char letter : Filled(sentence, kCommentWidth)) {
    text += letter;
    if (letter == '\n') text += "#   ";
  }
  return text + "\n";
}

string SdcSettings(const Request& request, const Device& device, const Answer& answer) {
  std::vector<string> words;
  if (const auto* loop = std::get_if<LoopSettings>(&answer.settings)) {
    words = {"VCO " + SdcFigure(answer.vco), "PFD " + SdcFigure(answer.pfd),
             "M " + Eighths(loop->m), "D " + std::to_string(loop->d),
             "bandwidth " + string(Name(loop->bandwidth))};
  } else {
    for (const auto& [label, value] : SettingsPairs(request, device, answer)) {
      if (label != "device" && label != "input" && label != "phase error") {
        words.push_back(label + " " + value);
      }
    }
  }
  return SdcComment(device.part + " " + string(Name(answer.primitive)) + ": " + Join(words, ", "));
}

string SdcTolerance(const Request& request) {
  if (request.input_tolerance == Rational(0)) return "";
  return SdcComment("An input can be off by " + SdcFigure(request.input_tolerance) +
                    " ppm: all periods and shifts are those of the fastest one, which is the worst "
                    "case of every path. Frequencies in comments are as they are meant.");
}

string SdcOff(const Device& device, const Answer& answer) {
  if (answer.within) return "";
  string text = SdcComment("OFF: not everything is as asked for, or in the device's range.");
  for (const Finding& violation : answer.violations) {
    text += SdcComment("OFF: " + FindingText(violation, device));
  }
  return text;
}

string SdcInstance(const Answer& answer) {
  string instance(Name(answer.primitive));
  for (char& letter : instance) {
    letter = static_cast<char>(std::tolower(static_cast<unsigned char>(letter)));
  }
  return instance + "_inst";
}

string SdcPin(const Answer& answer, std::size_t index) {
  if (IsLoop(answer.primitive)) return "CLKOUT" + std::to_string(index);
  return Place(answer.settings, static_cast<int>(index));
}

string SdcClocks(const std::vector<string>& names) {
  return names.size() == 1 ? "[get_clocks " + names.front() + "]"
                           : "[get_clocks {" + Join(names, " ") + "}]";
}

}  // namespace planner::report
