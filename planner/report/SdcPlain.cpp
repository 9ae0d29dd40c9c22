// Tested by sdc_plain_test.cpp.
#include "planner/report/SdcPlain.h"

#include <cstddef>

#include "planner/relations/Clocks.h"
#include "planner/report/SdcWords.h"
#include "planner/report/Words.h"

namespace planner::report {

namespace {

using relations::Clock;
using std::string;

string Create(const Clock& clock, const string& name, const string& object) {
  return "create_clock -name " + name + " -period " + SdcExact(clock.period) + " -waveform {" +
         SdcExact(clock.rise) + " " + SdcExact(clock.Fall()) + "} [" + object + "]\n";
}

string InputText(const Request& request, const Clock& clock) {
  const string number = std::to_string(clock.input + 1);
  const string name = "clk_in" + number;
  return "\n" +
         SdcComment("Input " + number + ": " +
                    SdcFigure(request.inputs[static_cast<std::size_t>(clock.input)]) + " MHz") +
         Create(clock, name, "get_ports " + name);
}

string OutputText(const Request& request, const Answer& answer, const Clock& clock) {
  const auto index = static_cast<std::size_t>(clock.output);
  const string number = std::to_string(clock.output);
  const Rational frequency =
      request.inputs[static_cast<std::size_t>(clock.input)] * answer.outputs[index].ratio;
  string text = "Output " + number + ": " + SdcFigure(frequency) + " MHz";
  if (!clock.also.empty()) {
    text +=
        "; " + Outputs(clock.also) + (clock.also.size() > 1 ? " are" : " is") + " on the same pin";
  }
  return "\n" + SdcComment(text) +
         Create(clock, "clk_out" + number,
                "get_pins " + SdcInstance(answer) + "/" + SdcPin(answer, index));
}

}  // namespace

// With two inputs a pin would have two clocks; that of the faster input asks for all that the other
// one does.
string SdcPlain(const Request& request, const Device& device, const Answer& answer) {
  string text = SdcSettings(request, device, answer);
  text += SdcComment(
      "Periods and edges are in ns. Nothing here tells that the clocks are related, nor their "
      "jitter.");
  int fastest = 0;
  if (request.inputs.size() > 1) {
    if (request.inputs[1] > request.inputs[0]) fastest = 1;
    text += SdcComment("The outputs are as with input " + std::to_string(fastest + 1) +
                       ", the faster one.");
  }
  text += SdcTolerance(request) + SdcOff(device, answer);
  for (const Clock& clock : relations::ClocksOf(relations::Fastest(request), answer)) {
    if (clock.IsInput()) text += InputText(request, clock);
    if (!clock.IsInput() && clock.input == fastest) text += OutputText(request, answer, clock);
  }
  return text;
}

}  // namespace planner::report
