// Tested by json_test.cpp.
#include "planner/report/Data.h"

#include <cstddef>
#include <cstdint>
#include <nlohmann/json.hpp>
#include <optional>
#include <string_view>
#include <vector>

#include "planner/report/Cells.h"
#include "planner/report/FindingText.h"
#include "planner/report/Numbers.h"
#include "planner/report/SettingsText.h"

namespace planner::report {

namespace {

using nlohmann::ordered_json;
using std::string;

template <typename T>
ordered_json OrNull(const std::optional<T>& value) {
  return value ? ordered_json(*value) : ordered_json(nullptr);
}

// A number that may be missing, as a double and exactly.
void AddExact(ordered_json* object, const string& name, const std::optional<Rational>& value) {
  if (value) {
    report::AddExact(object, name, *value);
  } else {
    (*object)[name] = nullptr;
    (*object)[name + "_exact"] = nullptr;
  }
}

// What a finding is, by the name of its kind in Finding.h.
std::string_view KindName(FindingKind kind) {
  switch (kind) {
    case FindingKind::kOutsideLimit:
      return "outside_limit";
    case FindingKind::kDividerTooLarge:
      return "divider_too_large";
    case FindingKind::kOffTarget:
      return "off_target";
    case FindingKind::kSearchedVco:
      return "searched_vco";
    case FindingKind::kSearchedFrequencies:
      return "searched_frequencies";
    case FindingKind::kNothingMoves:
      return "nothing_moves";
    case FindingKind::kPreferMaxVcoUnused:
      return "prefer_max_vco_unused";
    case FindingKind::kWholeDividerUnused:
      return "whole_divider_unused";
    case FindingKind::kOutput0Phase:
      return "output_0_phase";
    case FindingKind::kBandwidthUnused:
      return "bandwidth_unused";
    case FindingKind::kInputJitterPasses:
      return "input_jitter_passes";
    case FindingKind::kNoJitter:
      return "no_jitter";
    case FindingKind::kNoPhaseError:
      return "no_phase_error";
    case FindingKind::kMoved:
      return "moved";
    case FindingKind::kTooManyInputs:
      return "too_many_inputs";
    case FindingKind::kTooManyOutputs:
      return "too_many_outputs";
    case FindingKind::kUnsolved:
      return "unsolved";
    case FindingKind::kNoSettings:
      break;
  }
  return "no_settings";
}

ordered_json QuantityName(Quantity quantity) {
  switch (quantity) {
    case Quantity::kNone:
      break;
    case Quantity::kVco:
      return "vco";
    case Quantity::kPfd:
      return "pfd";
    case Quantity::kFrequency:
      return "frequency";
    case Quantity::kPhase:
      return "phase";
    case Quantity::kDuty:
      return "duty";
    case Quantity::kJitter:
      return "jitter";
    case Quantity::kDivider:
      return "divider";
  }
  return nullptr;
}

const char* RankName(Rank rank) {
  switch (rank) {
    case Rank::kJitter:
      break;
    case Rank::kError:
      return "error";
    case Rank::kMargin:
      return "margin";
    case Rank::kVco:
      return "vco";
  }
  return "jitter";
}

const char* SourceName(const Answer& answer) {
  const Source& source = answer.source;
  if (source.engine) return source.search ? "both" : "engine";
  // What has no settings has not been given any.
  return source.search || !answer.solved ? "search" : "given";
}

void AddWritten(ordered_json* object, const char* name, const std::optional<Rational>& value) {
  if (value) (*object)[name] = WrittenNumber(*value);
}

ordered_json RequestedOutput(const Output& output) {
  // As the readers of requests have it.
  if (!output.used) return "-";
  ordered_json data = ObjectOf(8);
  data["frequency"] = WrittenNumber(output.frequency);
  if (!output.asked) data["asked"] = false;
  AddWritten(&data, "phase", output.phase);
  AddWritten(&data, "duty", output.duty);
  AddWritten(&data, "tolerance", output.tolerance);
  AddWritten(&data, "phase_tolerance", output.phase_tolerance);
  AddWritten(&data, "duty_tolerance", output.duty_tolerance);
  AddWritten(&data, "max_jitter", output.max_jitter);
  return data;
}

void AddOfInputs(ordered_json* data, const Request& request, const char* name,
                 const Rational& frequency) {
  AddExact(data, name, frequency);
  if (request.inputs.size() > 1) {
    AddExact(data, string(name) + "_second", frequency * request.inputs[1] / request.inputs[0]);
  }
}

ordered_json LoopData(const Request& request, const Answer& answer, const LoopSettings& settings) {
  ordered_json data = ObjectOf(12);
  AddOfInputs(&data, request, "vco", answer.vco);
  AddOfInputs(&data, request, "pfd", answer.pfd);
  if (settings.m % hardware::kEighths == 0) {
    data["m"] = settings.m / hardware::kEighths;
  } else {
    data["m"] = Rational(settings.m, hardware::kEighths).ToDouble();
  }
  data["m_eighths"] = settings.m;
  data["d"] = settings.d;
  return data;
}

ordered_json KruData(const Request& request, const Answer& answer, const KruSettings& settings) {
  const bool is_sp = settings.primitive == Primitive::kKruSp;
  ordered_json data = ObjectOf(9);
  if (is_sp) {
    data["feedback"] = settings.feedback;
    data["clkin_divide_by_2"] = settings.divide_by_2;
  }
  if (settings.m != 0) {
    data["m"] = settings.m;
    data["d"] = settings.d;
  }
  if (settings.divide_halves != 0) {
    data[is_sp ? "clkdv" : "clkfxdv"] = Rational(settings.divide_halves, 2).ToDouble();
    data["divide_halves"] = settings.divide_halves;
  }
  if (is_sp) {
    data["phase_offset"] = PhaseOffset(request, answer).ToDouble();
    data["phase_shift"] = settings.phase_shift;
  }
  return data;
}

// The ranges that the settings must keep, beside those of outputs, with their margins; null for a
// KRU.
ordered_json LimitsData(const Device& device, const Answer& answer) {
  const auto* loop = std::get_if<LoopSettings>(&answer.settings);
  if (loop == nullptr) return nullptr;
  const LoopLimits& limits = device.Loop(loop->primitive);
  ordered_json data = ObjectOf(8);
  data["vco"] = RangeData(limits.vco);
  AddExact(&data, "vco_margin", answer.vco_margin);
  data["pfd"] = RangeData(limits.PfdOf(loop->bandwidth));
  AddExact(&data, "pfd_margin", answer.pfd_margin);
  data["largest_count"] = limits.max_count;
  return data;
}

ordered_json WholeNumber(const string& digits) { return std::int64_t{std::stoll(digits)}; }

// Where an output is, in whole numbers.
void AddPlace(ordered_json* data, const Settings& settings, std::size_t index) {
  const auto* loop = std::get_if<LoopSettings>(&settings);
  if (loop == nullptr) {
    (*data)["pin"] = Place(settings, static_cast<int>(index));
    for (const char* name : {"divider", "divider_eighths", "phase_step", "high_time"}) {
      (*data)[name] = nullptr;
    }
    return;
  }
  const LoopOutput& output = loop->outputs[index];
  (*data)["pin"] = nullptr;
  if (output.divider % hardware::kEighths == 0) {
    (*data)["divider"] = output.divider / hardware::kEighths;
  } else {
    (*data)["divider"] = Rational(output.divider, hardware::kEighths).ToDouble();
  }
  (*data)["divider_eighths"] = output.divider;
  (*data)["phase_step"] = output.phase;
  (*data)["high_time"] = output.high_time;
}

ordered_json OutputData(const Request& request, const Device& device, const Answer& answer,
                        std::size_t index) {
  const OutputAnswer& output = answer.outputs[index];
  ordered_json data = ObjectOf(36);
  data["index"] = index;
  data["used"] = output.used;
  if (!output.used) return data;
  const auto place = static_cast<int>(index);
  const Output& asked = RequestedAt(request, answer, place);
  data["request"] = RequestIndex(request, answer, place);
  AddPlace(&data, answer.settings, index);
  data["multiply"] = WholeNumber(output.ratio.NumeratorText());
  data["divide"] = WholeNumber(output.ratio.DenominatorText());
  const auto if_asked = [&](const Rational& value) {
    return asked.asked ? std::optional(value) : std::nullopt;
  };
  AddExact(&data, "requested", if_asked(asked.frequency));
  AddExact(&data, "actual", output.frequency);
  AddExact(&data, "actual_second", output.frequency_second);
  data["search"] = OrNull(output.searched);
  AddExact(&data, "error_ppm", if_asked(output.error_ppm));
  AddExact(&data, "requested_phase", asked.phase);
  AddExact(&data, "phase", output.phase);
  AddExact(&data, "phase_error", output.phase_error);
  AddExact(&data, "requested_duty", asked.duty);
  AddExact(&data, "duty", output.duty);
  AddExact(&data, "duty_error", output.duty_error);
  data["jitter"] = OrNull(output.jitter);
  data["jitter_rms"] = OrNull(output.jitter_rms);
  data["range"] = RangeData(OutputRange(device, answer.settings, index));
  AddExact(&data, "margin", output.margin);
  data["within"] = output.IsWithin();
  return data;
}

// What the ranking goes by.
ordered_json RankingData(const Answer& answer) {
  ordered_json data = ObjectOf(8);
  data["class"] = answer.within ? "met" : answer.violations.empty() ? "missed" : "broken";
  AddExact(&data, "worst_error", answer.worst_error);
  data["max_jitter"] = OrNull(answer.max_jitter);
  AddExact(&data, "margin", answer.margin);
  AddExact(&data, "vco", answer.vco);
  return data;
}

ordered_json FindingsData(const std::vector<Finding>& findings, const Device& device,
                          const Answer& answer) {
  ordered_json data = ordered_json::array();
  for (const Finding& finding : findings) data.push_back(FindingData(finding, device, &answer));
  return data;
}

// All findings of a solved answer, in the order in which a report has them.
std::vector<Finding> FindingsOf(const Answer& answer) {
  std::vector<Finding> findings;
  for (const OutputAnswer& output : answer.outputs) {
    findings.insert(findings.end(), output.misses.begin(), output.misses.end());
  }
  findings.insert(findings.end(), answer.violations.begin(), answer.violations.end());
  findings.insert(findings.end(), answer.notes.begin(), answer.notes.end());
  return findings;
}

void AddSolved(ordered_json* data, const Request& request, const Device& device,
               const Answer& answer) {
  const auto* loop = std::get_if<LoopSettings>(&answer.settings);
  (*data)["settings"] = loop != nullptr
                            ? LoopData(request, answer, *loop)
                            : KruData(request, answer, std::get<KruSettings>(answer.settings));
  (*data)["bandwidth"] =
      loop != nullptr ? ordered_json(Name(loop->bandwidth)) : ordered_json(nullptr);
  (*data)["limits"] = LimitsData(device, answer);
  (*data)["search_vco"] = OrNull(answer.searched_vco);
  AddExact(data, "input_jitter", request.input_jitter);
  AddExact(data, "input_tolerance", request.input_tolerance);
  (*data)["phase_error"] = OrNull(answer.phase_error);
  AddExact(data, "worst_ppm", answer.worst_ppm);
  (*data)["max_jitter"] = OrNull(answer.max_jitter);
  (*data)["ranking"] = RankingData(answer);
  ordered_json outputs = ordered_json::array();
  for (std::size_t i = 0; i < answer.outputs.size(); ++i) {
    outputs.push_back(OutputData(request, device, answer, i));
  }
  (*data)["outputs"] = std::move(outputs);
  (*data)["misses"] = MissTexts(answer);
  (*data)["violations"] = FindingTexts(answer.violations, device, answer);
  (*data)["notes"] = FindingTexts(answer.notes, device, answer);
  (*data)["findings"] = FindingsData(FindingsOf(answer), device, answer);
}

}  // namespace

ordered_json ObjectOf(std::size_t members) {
  ordered_json data = ordered_json::object();
  data.get_ref<ordered_json::object_t&>().reserve(members);
  return data;
}

void AddExact(ordered_json* object, const string& name, const Rational& value) {
  (*object)[name] = value.ToDouble();
  (*object)[name + "_exact"] = Quotient(value);
}

ordered_json WrittenNumber(const Rational& value) {
  // Doubles of this size count whole numbers.
  constexpr std::int64_t kLargest = std::int64_t{1} << 53;
  const std::optional<std::int64_t> whole = value.Whole();
  if (whole && *whole <= kLargest && *whole >= -kLargest) return *whole;
  const string text = Decimal(value);
  const ordered_json number = value.ToDouble();
  // What a reader makes of the digits, it must make of the number.
  return number.dump() == text ? number : ordered_json(text);
}

ordered_json RangeData(const Range& range) {
  ordered_json data = ObjectOf(4);
  AddExact(&data, "lowest", range.lowest);
  AddExact(&data, "highest", range.highest);
  return data;
}

ordered_json RequestData(const Request& request, const Device& device) {
  ordered_json data = ObjectOf(16);
  data["device"] = device.part;
  if (request.primitive) data["primitive"] = Name(*request.primitive);
  data["inputs"] = ordered_json::array();
  for (const Rational& input : request.inputs) data["inputs"].push_back(WrittenNumber(input));
  data["outputs"] = ordered_json::array();
  for (const Output& output : request.outputs) data["outputs"].push_back(RequestedOutput(output));
  data["input_jitter"] = WrittenNumber(request.input_jitter);
  data["input_tolerance"] = WrittenNumber(request.input_tolerance);
  data["tolerance"] = WrittenNumber(request.tolerance);
  data["phase_tolerance"] = WrittenNumber(request.phase_tolerance);
  data["duty_tolerance"] = WrittenNumber(request.duty_tolerance);
  AddWritten(&data, "max_jitter", request.max_jitter);
  if (request.bandwidth) data["bandwidth"] = Name(*request.bandwidth);
  data["feedback"] = request.feedback;
  data["prefer_max_vco"] = request.prefer_max_vco;
  data["int_div0"] = request.whole_divider_0;
  data["any_order"] = request.any_order;
  data["engine"] = request.engine_only;
  data["rank"] = RankName(request.rank);
  return data;
}

ordered_json FindingData(const Finding& finding, const Device& device, const Answer* answer) {
  ordered_json data = ObjectOf(17);
  data["kind"] = KindName(finding.kind);
  data["primitive"] =
      finding.primitive ? ordered_json(Name(*finding.primitive)) : ordered_json(nullptr);
  data["quantity"] = QuantityName(finding.quantity);
  data["output"] = finding.output >= 0 ? ordered_json(finding.output) : ordered_json(nullptr);
  data["input"] = finding.input;
  AddExact(&data, "corner", finding.corner);
  AddExact(&data, "value", finding.value);
  data["range"] = RangeData(finding.range);
  data["pin"] = finding.pin.empty() ? ordered_json(nullptr) : ordered_json(finding.pin);
  data["feedback_2x"] = finding.feedback_2x;
  data["outputs"] = finding.outputs;
  data["numbers"] = ordered_json::array();
  for (const Rational& number : finding.numbers) data["numbers"].push_back(number.ToDouble());
  data["words"] = finding.text;
  data["text"] = FindingText(finding, device, answer);
  return data;
}

void AddAnswer(ordered_json* data, const Request& request, const Device& device,
               const Answer& answer) {
  (*data)["primitive"] = Name(answer.primitive);
  (*data)["source"] = SourceName(answer);
  (*data)["variant"] = answer.source.variant;
  (*data)["solved"] = answer.solved;
  (*data)["within"] = answer.within;
  (*data)["reason"] = RefusalText(answer, device);
  (*data)["refusals"] = FindingsData(answer.refusals, device, answer);
  if (answer.solved) AddSolved(data, request, device, answer);
}

}  // namespace planner::report
