// Tested by sdc_test.cpp.
#include "planner/report/Sdc.h"

#include <algorithm>
#include <cstddef>
#include <map>
#include <optional>
#include <vector>

#include "planner/report/Numbers.h"
#include "planner/report/SdcCrossings.h"
#include "planner/report/SdcPlain.h"
#include "planner/report/SdcWords.h"
#include "planner/report/SettingsText.h"
#include "planner/report/Words.h"

namespace planner::report {

namespace {

using std::string;

// A clock that is more than so many times as fast as the input has all its edges from one edge of
// the input. A timing tool may count in floats, of which little is left where a shift takes away
// nearly all of a period of the input.
constexpr int kFast = 4;

// Half of a jitter in ps, in ns: down to a ten-thousandth of a fs.
string Half(const Rational& jitter) { return Short(jitter / 2000, 10); }

class Constraints {
 public:
  Constraints(const Request& request, const Device& device, const Answer& answer,
              const SdcOptions& options)
      : request_(request),
        timed_(relations::Fastest(request)),
        device_(device),
        answer_(answer),
        options_(options) {}

  string Text() const;

 private:
  string Head() const;
  string Input(int input) const;
  string Clock(std::size_t index, std::map<string, string>* at) const;
  string Figures(std::size_t index) const;
  string Generated(std::size_t index, int input) const;
  string Uncertainty(std::size_t index) const;
  string Groups() const;
  string ClockName(std::size_t index, int input) const;

  int Inputs() const { return static_cast<int>(request_.inputs.size()); }
  const Rational& InputOf(int input) const {
    return request_.inputs[static_cast<std::size_t>(input)];
  }
  const Rational& TimedInput(int input) const {
    return timed_.inputs[static_cast<std::size_t>(input)];
  }

  const Request& request_;
  const Request timed_;  // what all periods and shifts are counted with
  const Device& device_;
  const Answer& answer_;
  const SdcOptions& options_;
};

// What the file is about, what is off, and the names that a design has its own for.
string Constraints::Head() const {
  string text = SdcSettings(request_, device_, answer_);
  text += SdcComment(
      "Periods and shifts are in ns. The uncertainty of a clock is half of its peak-to-peak "
      "jitter, at a bit error rate of 1e-12, by which an edge can be early or late.");
  if (answer_.phase_error) {
    text += SdcComment("The outputs are up to " + Short(*answer_.phase_error, 6) +
                       " ps beside the phase of the input.");
  }
  text += SdcTolerance(request_) + SdcOff(device_, answer_);
  text += "\n" + SdcComment("The names of the input ports and of the primitive in the design.");
  for (int n = 1; n <= Inputs(); ++n) {
    text += "set input_port_" + std::to_string(n) + " clk_in" + std::to_string(n) + "\n";
  }
  return text + "set primitive " + SdcInstance(answer_) + "\n";
}

string Constraints::Input(int input) const {
  const string n = std::to_string(input + 1);
  string text = SdcComment("Input " + n + ": " + SdcFigure(InputOf(input)) + " MHz, jitter " +
                           SdcFigure(request_.input_jitter) + " ps peak to peak");
  text += "create_clock -name clk_in" + n + " -period " +
          SdcExact(Rational(1000) / TimedInput(input)) + " [get_ports $input_port_" + n + "]\n";
  if (request_.input_jitter > Rational(0)) {
    text +=
        "set_clock_uncertainty " + Half(request_.input_jitter) + " [get_clocks clk_in" + n + "]\n";
  }
  return text;
}

// A phase or a duty cycle, what was asked for, and the difference.
string ShapeWords(const char* what, const char* unit, const Rational& actual,
                  const std::optional<Rational>& requested, const std::optional<Rational>& error) {
  string text = string("; ") + what + " " + SdcFigure(actual) + " " + unit;
  if (requested) {
    text += ", " + SdcFigure(*requested) + " asked for, " + SdcFigure(error.value_or(0)) + " off";
  }
  return text;
}

// The numbers of an output, for the first input where nothing else is said.
string Constraints::Figures(std::size_t index) const {
  const OutputAnswer& output = answer_.outputs[index];
  const Output& asked = RequestedAt(request_, answer_, static_cast<int>(index));
  string text = "Output " + std::to_string(index) + ": " + SdcFigure(output.frequency) + " MHz, " +
                output.ratio.NumeratorText() + " / " + output.ratio.DenominatorText() +
                " of the input";
  if (asked.asked) {
    text += ", " + SdcFigure(asked.frequency) + " MHz asked for, " + Fixed(output.error_ppm, 2) +
            " ppm off";
  }
  text += ShapeWords("phase", "degrees", output.phase, asked.phase, output.phase_error);
  text += ShapeWords("duty", "percent", output.duty, asked.duty, output.duty_error);
  text += output.jitter ? "; jitter " + Short(*output.jitter, 3) + " ps peak to peak"
                        : string("; jitter unknown");
  if (!output.IsWithin()) text += "; OFF";
  if (Inputs() > 1) {
    text +=
        "; from input 2 " + SdcFigure(InputOf(1) * output.ratio) +
        " MHz, whose jitter is unknown: it is worked out for the first input only, so that this "
        "clock has no uncertainty here and needs one of your own";
  }
  return text;
}

// Edges of the source and their shifts. `source` is its period, ns.
string EdgesWords(const OutputAnswer& output, const Rational& phase, const Rational& source) {
  const Rational length = Rational(1) / output.ratio;  // of a period, in periods of the source
  const bool is_fast = output.ratio > Rational(kFast);
  // Whole periods of the source between the rising edges.
  const Rational whole = is_fast ? Rational(0) : std::max(Rational(1), length.Floor());
  const Rational rise = length * phase / 360;
  const Rational fall = rise + length * output.duty / 100 - whole / 2;
  const Rational again = rise + length - whole;
  return "-edges {1 " + SdcFigure(whole + 1) + " " + SdcFigure(whole * 2 + 1) + "} -edge_shift {" +
         SdcExact(rise * source) + " " + SdcExact(fall * source) + " " + SdcExact(again * source) +
         "}";
}

// When a clock rises and falls, in the plainest of the descriptions that there are.
string WaveformWords(const OutputAnswer& output, const Rational& input) {
  const Rational phase = hardware::TurnedToFull(output.phase);
  const bool is_even = output.duty == Rational(50);
  if (phase == Rational(0) && output.ratio.IsWhole()) {
    return "-multiply_by " + output.ratio.NumeratorText() +
           (is_even ? "" : " -duty_cycle " + SdcExact(output.duty));
  }
  if (phase == Rational(0) && output.ratio.NumeratorText() == "1" && is_even) {
    return "-divide_by " + output.ratio.DenominatorText();
  }
  return EdgesWords(output, phase, Rational(1000) / input);
}

string Constraints::ClockName(std::size_t index, int input) const {
  string name = "clk_out" + std::to_string(index);
  if (Inputs() > 1) name += "_in" + std::to_string(input + 1);
  return name;
}

// A clock that the primitive makes. With two inputs it is one of two at its pin.
string Constraints::Generated(std::size_t index, int input) const {
  const string n = std::to_string(input + 1);
  return "create_generated_clock -name " + ClockName(index, input) +
         " -source [get_ports $input_port_" + n + "] -master_clock clk_in" + n +
         (input > 0 ? " -add" : "") + " \\\n  " +
         WaveformWords(answer_.outputs[index], TimedInput(input)) + " \\\n  [get_pins $primitive/" +
         SdcPin(answer_, index) + "]\n";
}

// The jitter is worked out for the first input, and with another one it is another.
string Constraints::Uncertainty(std::size_t index) const {
  const std::optional<double>& jitter = answer_.outputs[index].jitter;
  if (!jitter) return "";
  return "set_clock_uncertainty " + Half(Rational::FromDouble(*jitter)) + " [get_clocks " +
         ClockName(index, 0) + "]\n";
}

// `at` has the clock of each pin that has one.
string Constraints::Clock(std::size_t index, std::map<string, string>* at) const {
  string text = "\n" + SdcComment(Figures(index));
  const string pin = SdcPin(answer_, index);
  const auto [place, is_new] = at->emplace(pin, ClockName(index, 0));
  if (!is_new) {
    return text + SdcComment("Output " + std::to_string(index) + " is on the pin " + pin +
                             ", too: its clock is " + place->second + ".");
  }
  for (int input = 0; input < Inputs(); ++input) text += Generated(index, input);
  return text + Uncertainty(index);
}

// Only one of two inputs drives the primitive at a time.
string Constraints::Groups() const {
  string text = "\n" + SdcComment("The outputs follow one input or the other.") +
                "set_clock_groups -physically_exclusive";
  for (int input = 0; input < Inputs(); ++input) {
    std::vector<string> names;
    for (std::size_t i = 0; i < answer_.outputs.size(); ++i) {
      if (answer_.outputs[i].used) names.push_back(ClockName(i, input));
    }
    text += " \\\n  -group [get_clocks {" + Join(names, " ") + "}]";
  }
  return text + "\n";
}

string Constraints::Text() const {
  string text = Head();
  for (int input = 0; input < Inputs(); ++input) text += "\n" + Input(input);
  std::map<string, string> at;
  for (std::size_t i = 0; i < answer_.outputs.size(); ++i) {
    if (answer_.outputs[i].used) text += Clock(i, &at);
  }
  if (Inputs() > 1) text += Groups();
  return text + SdcInterclockUncertainties(timed_, answer_) +
         SdcCrossings(timed_, answer_, options_);
}

}  // namespace

string Sdc(const Request& request, const Device& device, const Answer& answer,
           const SdcOptions& options) {
  if (options.plain) return SdcPlain(request, device, answer);
  return Constraints(request, device, answer, options).Text();
}

}  // namespace planner::report
