// Tested by report_text_test.cpp.
#include "planner/report/SettingsText.h"

#include <algorithm>
#include <cmath>
#include <cstddef>
#include <vector>

#include "planner/answer/Evaluate.h"
#include "planner/answer/Moved.h"
#include "planner/report/Numbers.h"
#include "planner/report/Words.h"

namespace planner::report {

namespace {

using std::string;

// A frequency that the first input makes, and what the second makes of it.
string Both(const Request& request, const Rational& frequency) {
  string text = Short(frequency, kFrequencyDecimals) + " MHz";
  if (request.inputs.size() > 1) {
    const Rational second = frequency * request.inputs[1] / request.inputs[0];
    text += ", with the second input " + Short(second, kFrequencyDecimals) + " MHz";
  }
  return text;
}

Pairs LoopPairs(const Request& request, const Answer& answer, const LoopSettings& settings) {
  string vco = Both(request, answer.vco);
  // With two inputs there is no room for it, and a note says it.
  if (request.inputs.size() == 1 && IsVcoOff(answer)) {
    vco += " (the search took it as " + Fixed(*answer.searched_vco, 3) + ")";
  }
  Pairs pairs = {{"input", Both(request, request.inputs[0])},
                 {"VCO", vco},
                 {"PFD", Both(request, answer.pfd)},
                 {"M", Eighths(settings.m)},
                 {"D", std::to_string(settings.d)}};
  if (HasJitter(answer)) {
    pairs.emplace_back("bandwidth", Name(settings.bandwidth));
    pairs.emplace_back("input jitter", Short(request.input_jitter, 6) + " ps");
  }
  return pairs;
}

// PHASE_SHIFT, and the phase that it makes.
string ShiftText(int shift) {
  if (shift == 0) return "0";
  const Rational degrees = Rational(shift) * 360 / hardware::kShiftSteps;
  return std::to_string(shift) + " (" + Short(degrees, 3) + " degrees)";
}

// Settings that no output uses are left out.
Pairs KruPairs(const Request& request, const Answer& answer) {
  const auto& settings = std::get<KruSettings>(answer.settings);
  const bool is_sp = settings.primitive == Primitive::kKruSp;
  Pairs pairs = {{"input", Short(request.inputs[0], kFrequencyDecimals) + " MHz"}};
  if (is_sp) pairs.emplace_back("CLKIN_DIVIDE_BY_2", settings.divide_by_2 ? "true" : "false");
  if (settings.m != 0) {
    pairs.emplace_back("M", std::to_string(settings.m));
    pairs.emplace_back("D", std::to_string(settings.d));
  }
  if (settings.divide_halves != 0) {
    pairs.emplace_back(is_sp ? "CLKDV" : "CLKFXDV", Short(Rational(settings.divide_halves, 2), 1));
  }
  if (is_sp) {
    pairs.emplace_back("phase offset", Short(PhaseOffset(request, answer), 3) + " degrees");
    pairs.emplace_back("PHASE_SHIFT", ShiftText(settings.phase_shift));
  }
  return pairs;
}

string LoopWords(const LoopSettings& settings) {
  std::vector<string> dividers;
  for (const LoopOutput& output : settings.outputs) {
    if (output.divider != 0) dividers.push_back(Eighths(output.divider));
  }
  return "M " + Eighths(settings.m) + ", D " + std::to_string(settings.d) +
         (dividers.size() > 1 ? " and dividers " : " and divider ") + Enumerated(dividers);
}

string KruWords(const KruSettings& settings) {
  std::vector<string> words;
  if (settings.divide_by_2) words.emplace_back("CLKIN_DIVIDE_BY_2");
  if (settings.m != 0) {
    words.push_back("M " + std::to_string(settings.m));
    words.push_back("D " + std::to_string(settings.d));
  }
  if (settings.divide_halves != 0) {
    words.push_back(string(settings.primitive == Primitive::kKruSp ? "CLKDV " : "CLKFXDV ") +
                    Short(Rational(settings.divide_halves, 2), 1));
  }
  if (settings.phase_shift != 0) {
    words.push_back("PHASE_SHIFT " + std::to_string(settings.phase_shift));
  }
  std::vector<string> pins;
  for (const hardware::Pin pin : settings.pins) {
    if (pin != hardware::Pin::kNone) pins.emplace_back(hardware::FactsOf(pin).name);
  }
  words.push_back((pins.size() > 1 ? "pins " : "pin ") + Enumerated(pins));
  return Join(words, ", ");
}

}  // namespace

bool HasJitter(const Answer& answer) {
  return std::any_of(answer.outputs.begin(), answer.outputs.end(),
                     [](const OutputAnswer& output) { return output.jitter.has_value(); });
}

int RequestIndex(const Request& request, const Answer& answer, int place) {
  return answer::OrderOf(request, answer)[static_cast<std::size_t>(place)];
}

const Output& RequestedAt(const Request& request, const Answer& answer, int place) {
  return request.outputs[static_cast<std::size_t>(RequestIndex(request, answer, place))];
}

bool IsVcoOff(const Answer& answer) {
  return answer.searched_vco &&
         std::abs(*answer.searched_vco - answer.vco.ToDouble()) > answer::kVisible;
}

Rational PhaseOffset(const Request& request, const Answer& answer) {
  const auto& settings = std::get<KruSettings>(answer.settings);
  if (settings.phase_shift == 0) return 0;
  const Rational made = Rational(settings.phase_shift) * 360 / hardware::kShiftSteps;
  for (std::size_t place = 0; place < settings.pins.size(); ++place) {
    const Output& output = RequestedAt(request, answer, static_cast<int>(place));
    if (!output.used || !output.phase) continue;
    const int pin_phase = hardware::FactsOf(settings.pins[place]).phase;
    // The turn of it that is nearest to what the shift makes.
    return made + hardware::TurnedToHalf(*output.phase - pin_phase - made);
  }
  return made;
}

Pairs SettingsPairs(const Request& request, const Device& device, const Answer& answer) {
  Pairs pairs = {{"device", device.part + " " + string(Name(answer.primitive))}};
  const auto* loop = std::get_if<LoopSettings>(&answer.settings);
  Pairs rest = loop != nullptr ? LoopPairs(request, answer, *loop) : KruPairs(request, answer);
  for (auto& pair : rest) pairs.push_back(std::move(pair));
  if (request.input_tolerance > Rational(0)) {
    pairs.emplace_back("input tolerance", Short(request.input_tolerance, 6) + " ppm");
  }
  if (answer.phase_error) pairs.emplace_back("phase error", Ps(*answer.phase_error) + " ps");
  return pairs;
}

string Place(const Settings& settings, int output) {
  const auto index = static_cast<std::size_t>(output);
  if (const auto* loop = std::get_if<LoopSettings>(&settings)) {
    return Eighths(loop->outputs[index].divider);
  }
  return string(hardware::FactsOf(std::get<KruSettings>(settings).pins[index]).name);
}

Range OutputRange(const Device& device, const Settings& settings, std::size_t index) {
  if (const auto* loop = std::get_if<LoopSettings>(&settings)) {
    return device.Loop(loop->primitive).OutputOf(static_cast<int>(index));
  }
  const auto& kru = std::get<KruSettings>(settings);
  return device.Pins(kru.primitive).Of(kru.pins[index], kru.pins[0] == hardware::Pin::kClk2x);
}

string SettingsWords(const Settings& settings) {
  if (const auto* loop = std::get_if<LoopSettings>(&settings)) return LoopWords(*loop);
  return KruWords(std::get<KruSettings>(settings));
}

}  // namespace planner::report
