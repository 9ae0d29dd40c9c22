// Tested by finding_text_test.cpp.
#include "planner/report/FindingText.h"

#include <algorithm>
#include <cstddef>
#include <string_view>

#include "planner/answer/Demands.h"
#include "planner/report/Numbers.h"
#include "planner/report/Words.h"

namespace planner::report {

namespace {

using std::string;

// "output 1 with the second input"; "the VCO".
string Subject(const Finding& finding) {
  string text = finding.quantity == Quantity::kVco   ? "the VCO"
                : finding.quantity == Quantity::kPfd ? "the PFD"
                                                     : Outputs({finding.output});
  if (finding.input > 0) text += " with the second input";
  if (finding.corner != Rational(0)) {
    text += finding.input > 0 ? " at " : " with the input at ";
    text += (finding.corner > Rational(0) ? "+" : "") + Short(finding.corner, 6) + " ppm";
  }
  return text;
}

string OutsideText(const Finding& finding) {
  const Range& range = finding.range;
  const Rational& broken = finding.value < range.lowest ? range.lowest : range.highest;
  string text = Subject(finding) + " is at " + Distinct(finding.value, broken, kFrequencyDecimals) +
                " MHz, outside the device's range";
  if (!finding.pin.empty()) text += " for " + finding.pin;
  if (finding.feedback_2x) text += " with feedback from CLK2X";
  return text + " of " + Short(range.lowest, kFrequencyDecimals) + " to " +
         Short(range.highest, kFrequencyDecimals) + " MHz";
}

string DividerText(const Finding& finding) {
  return Outputs({finding.output}) + ": divider " + Short(finding.value, 3) +
         " needs a high or low time above " + Short(finding.range.highest, 0) +
         " VCO periods, the device's most";
}

// An error with two decimals, or with as many as it takes not to look like none, or like what is
// allowed.
string Figure(const Rational& error, const Rational& allowed) {
  if (error.Absolute() < Rational(5, 1000)) return General(error, 2);
  const string text = Fixed(error, 2);
  const bool is_distinct = text != Fixed(error < Rational(0) ? -allowed : allowed, 2);
  return is_distinct ? text : Distinct(error, error < Rational(0) ? -allowed : allowed, 2);
}

// A jitter as all of them are shown, or with as many decimals as it takes not to look like what is
// allowed.
string JitterFigure(const Rational& jitter, const Rational& allowed) {
  const string text = Fixed(jitter, 3);
  return text != Fixed(allowed, 3) ? text : Distinct(jitter, allowed, 3);
}

// "frequency is off by 1001.00 ppm, with 100 allowed", which stands behind "the".
string MissPart(const Finding& finding) {
  const Rational& allowed = finding.range.highest;
  const string limit = ", with " + Short(allowed, 6) + " allowed";
  const auto off = [&](const char* what, const char* unit) {
    return string(what) + " is off by " + Figure(finding.value, allowed) + " " + unit + limit;
  };
  switch (finding.quantity) {
    case Quantity::kPhase:
      return off("phase", "degrees");
    case Quantity::kDuty:
      return off("duty cycle", "percent points");
    case Quantity::kJitter:
      if (finding.value == Rational(0)) return "jitter is not known" + limit;
      return "jitter is " + JitterFigure(finding.value, allowed) + " ps" + limit;
    default:
      return off("frequency", "ppm");
  }
}

string MissText(const std::vector<Finding>& misses) {
  std::vector<string> parts;
  for (const Finding& miss : misses) parts.push_back(MissPart(miss));
  return Outputs({misses.front().output}) + ": the " + Join(parts, "; the ");
}

// How much a miss weighs, in units of its tolerance (answer/Demands.h).
Rational Weight(const Finding& miss) {
  const Rational& allowed = miss.range.highest;
  const Rational error = miss.value.Absolute();
  switch (miss.quantity) {
    case Quantity::kPhase:
      return error / answer::PhaseUnit(allowed);
    case Quantity::kDuty:
      return error / answer::DutyUnit(allowed);
    case Quantity::kJitter:
      return error / answer::JitterUnit(allowed);
    default:
      return error / answer::FrequencyUnit(allowed);
  }
}

// Numbers as the engine shows them.
string SearchedText(const Finding& finding) {
  std::vector<string> figures;
  for (const Rational& number : finding.numbers) figures.push_back(Fixed(number, 3));
  return "the search counted with " + Join(figures, ", ") + " MHz, which M and D do not make";
}

// What of an answer is a fraction.
string FractionWords(const Answer* answer) {
  if (answer == nullptr || !IsLoop(answer->primitive)) return "M or divider";
  const auto& settings = std::get<LoopSettings>(answer->settings);
  std::vector<string> words;
  if (settings.m % hardware::kEighths != 0) words.emplace_back("M");
  if (settings.outputs[0].divider % hardware::kEighths != 0) words.emplace_back("divider");
  return Enumerated(words);
}

// The outputs that have changed places.
string MovedText(const Finding& finding) {
  std::vector<string> parts;
  for (std::size_t place = 0; place < finding.outputs.size(); ++place) {
    const auto here = static_cast<int>(place);
    const int requested = finding.outputs[place];
    if (requested == here) continue;
    parts.push_back("output " + std::to_string(here) + " is what was asked for as output " +
                    std::to_string(requested));
  }
  return "outputs have changed places: " + Enumerated(parts);
}

string TooManyText(const Finding& finding, bool are_inputs) {
  const Primitive primitive = finding.primitive.value_or(Primitive::kPll);
  const string most = Short(finding.range.highest, 0);
  const string what = are_inputs ? most + (most == "1" ? " input clock" : " input clocks")
                                 : "at most " + most + " outputs";
  return "A " + string(Name(primitive)) + " has " + what + ", not " + Short(finding.value, 0) + ".";
}

bool IsMissingFigure(const Finding& finding) {
  return finding.kind == FindingKind::kNoJitter || finding.kind == FindingKind::kNoPhaseError;
}

// Why there is no figure: in the words of the calculator, or because the device has nothing that
// it could count with.
string MissingReason(const Finding& finding, const Device& device) {
  if (!finding.text.empty()) return finding.text;
  const char* const has = " has no calculator coefficients";
  if (!device.has_loop_jitter && !device.has_kru_jitter) return device.part + has;
  // As the calculator says it, which knows no packages.
  return "Device " + device.name + "-" + device.grade + has +
         (device.has_loop_jitter ? " for KRU_SP and KRU_CLKGEN" : " for PLL and TSYN");
}

// What figures there are not for a reason: "no jitter of output 1 and no phase error: ...".
string MissingText(const std::vector<Finding>& same, const Device& device) {
  std::vector<string> missing;
  for (const Finding& finding : same) {
    if (finding.kind == FindingKind::kNoPhaseError) {
      missing.emplace_back("no phase error");
      continue;
    }
    missing.push_back(finding.outputs.empty() ? "no jitter"
                                              : "no jitter of " + Outputs(finding.outputs));
  }
  return Join(missing, " and ") + ": " + MissingReason(same.front(), device);
}

}  // namespace

string FindingText(const Finding& finding, const Device& device, const Answer* answer) {
  switch (finding.kind) {
    case FindingKind::kOutsideLimit:
      return OutsideText(finding);
    case FindingKind::kDividerTooLarge:
      return DividerText(finding);
    case FindingKind::kOffTarget:
      return MissText({finding});
    case FindingKind::kSearchedVco:
      return "the search took the VCO as " + Fixed(finding.value, 3) + " MHz";
    case FindingKind::kSearchedFrequencies:
      return SearchedText(finding);
    case FindingKind::kNothingMoves:
      return "with a fractional " + FractionWords(answer) +
             " all phases are 0 and all duty cycles 50 %; --int-div0 avoids it";
    case FindingKind::kPreferMaxVcoUnused:
      return "--prefer-max-vco counts only with --phase or --duty";
    case FindingKind::kWholeDividerUnused:
      return "--int-div0 changes nothing: all dividers of a PLL are whole numbers";
    case FindingKind::kOutput0Phase:
      return "output 0 is at phase 0: a KRU_CLKGEN has it on CLKFX whatever its phase";
    case FindingKind::kBandwidthUnused:
      return "--bandwidth changes nothing: a KRU has no such setting";
    case FindingKind::kInputJitterPasses:
      return "the jitter of each output is with all of the input's, " + Short(finding.value, 6) +
             " ps, which passes through a KRU";
    case FindingKind::kNoJitter:
    case FindingKind::kNoPhaseError:
      return MissingText({finding}, device);
    case FindingKind::kMoved:
      return MovedText(finding);
    case FindingKind::kTooManyInputs:
      return TooManyText(finding, true);
    case FindingKind::kTooManyOutputs:
      return TooManyText(finding, false);
    case FindingKind::kUnsolved:
      return finding.text;
    case FindingKind::kNoSettings:
      break;
  }
  return "No setting has everything in the device's ranges.";
}

std::vector<string> FindingTexts(const std::vector<Finding>& findings, const Device& device,
                                 const Answer& answer) {
  std::vector<string> texts;
  std::vector<bool> told(findings.size());
  for (std::size_t i = 0; i < findings.size(); ++i) {
    if (told[i]) continue;
    const Finding& first = findings[i];
    if (!IsMissingFigure(first)) {
      texts.push_back(FindingText(first, device, &answer));
      continue;
    }
    std::vector<Finding> same;
    for (std::size_t j = i; j < findings.size(); ++j) {
      const Finding& other = findings[j];
      if (!IsMissingFigure(other) || other.text != first.text) continue;
      told[j] = true;
      same.push_back(other);
    }
    // The jitter comes before the phase error.
    std::stable_sort(same.begin(), same.end(), [](const Finding& a, const Finding& b) {
      return a.kind == FindingKind::kNoJitter && b.kind != FindingKind::kNoJitter;
    });
    texts.push_back(MissingText(same, device));
  }
  return texts;
}

std::vector<string> MissTexts(const Answer& answer) {
  std::vector<string> texts;
  for (const OutputAnswer& output : answer.outputs) {
    if (!output.misses.empty()) texts.push_back(MissText(output.misses));
  }
  return texts;
}

string WorstMissText(const Answer& answer) {
  const Finding* worst = nullptr;
  std::size_t outputs = 0;
  for (const OutputAnswer& output : answer.outputs) {
    if (!output.misses.empty()) ++outputs;
    for (const Finding& miss : output.misses) {
      if (worst == nullptr || Weight(miss) > Weight(*worst)) worst = &miss;
    }
  }
  string text = MissText({*worst});
  if (outputs == 2) text += ", and 1 more output is off";
  if (outputs > 2) text += ", and " + std::to_string(outputs - 1) + " more outputs are off";
  return text;
}

std::vector<string> RemarkTexts(const Answer& answer, const Device& device) {
  std::vector<string> texts = MissTexts(answer);
  std::vector<Finding> rest = answer.violations;
  rest.insert(rest.end(), answer.notes.begin(), answer.notes.end());
  for (string& text : FindingTexts(rest, device, answer)) texts.push_back(std::move(text));
  return texts;
}

string RefusalText(const Answer& answer, const Device& device) {
  std::vector<string> texts;
  for (const Finding& refusal : answer.refusals) texts.push_back(FindingText(refusal, device));
  return Join(texts, " ");
}

}  // namespace planner::report
