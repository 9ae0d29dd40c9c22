// Tested by verify_test.cpp.
#include "planner/verify/Entries.h"

#include <cassert>
#include <nlohmann/json.hpp>
#include <utility>
#include <vector>

#include "planner/verify/Formulas.h"

namespace planner::verify {

namespace {

using nlohmann::ordered_json;
using std::string;

constexpr int kOneText = 1;
constexpr int kManyTexts = 2;

ordered_json Marker(int kind) {
  return ordered_json::binary({}, static_cast<ordered_json::binary_t::subtype_type>(kind));
}

bool IsMarker(const ordered_json& value, int kind) {
  return value.is_binary() &&
         value.get_binary().subtype() == static_cast<ordered_json::binary_t::subtype_type>(kind);
}

void Put(ordered_json* object, const string& name, const std::optional<Rational>& value) {
  (*object)[name] = value ? ordered_json(value->ToDouble()) : ordered_json(nullptr);
  (*object)[name + "_exact"] = value ? ordered_json(QuotientText(*value)) : ordered_json(nullptr);
}

ordered_json Number(const std::optional<double>& value) {
  return value ? ordered_json(*value) : ordered_json(nullptr);
}

// A count of parts, as whole as it is.
ordered_json Parts(int count, int of) {
  return count % of == 0 ? ordered_json(count / of) : ordered_json(static_cast<double>(count) / of);
}

ordered_json Ends(const Range& range) {
  ordered_json object = ordered_json::object();
  Put(&object, "lowest", range.lowest);
  Put(&object, "highest", range.highest);
  return object;
}

const char* WordOf(Quantity quantity) {
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

class Entries {
 public:
  Entries(const Request& request, const Device& device, const Answer& answer,
          const PlaceOrder& order, const Sentences* sentences)
      : request_(request), device_(device), answer_(answer), order_(order), sentences_(sentences) {}

  ordered_json All() {
    ordered_json all = ordered_json::object();
    all["primitive"] = Name(answer_.primitive);
    const Source& source = answer_.source;
    const bool is_given = answer_.solved && !source.engine && !source.search;
    all["source"] = is_given ? "given" : verify::WordOf(source);
    all["variant"] = answer_.source.variant;
    all["solved"] = answer_.solved;
    all["within"] = answer_.within;
    all["reason"] =
        sentences_ != nullptr ? ordered_json(sentences_->Reason(answer_, device_)) : AnyText();
    all["refusals"] = ordered_json::array();
    for (const Finding& one : answer_.refusals) all["refusals"].push_back(FindingOf(one));
    if (answer_.solved) AddSolved(&all);
    return all;
  }

 private:
  ordered_json FindingOf(const Finding& finding) const {
    ordered_json entry = ordered_json::object();
    entry["kind"] = verify::WordOf(finding.kind);
    entry["primitive"] =
        finding.primitive ? ordered_json(Name(*finding.primitive)) : ordered_json(nullptr);
    const char* const quantity = WordOf(finding.quantity);
    entry["quantity"] = quantity != nullptr ? ordered_json(quantity) : ordered_json(nullptr);
    entry["output"] = finding.output < 0 ? ordered_json(nullptr) : ordered_json(finding.output);
    entry["input"] = finding.input;
    Put(&entry, "corner", finding.corner);
    Put(&entry, "value", finding.value);
    entry["range"] = Ends(finding.range);
    entry["pin"] = finding.pin.empty() ? ordered_json(nullptr) : ordered_json(finding.pin);
    entry["feedback_2x"] = finding.feedback_2x;
    entry["outputs"] = finding.outputs;
    entry["numbers"] = ordered_json::array();
    for (const Rational& one : finding.numbers) entry["numbers"].push_back(one.ToDouble());
    entry["words"] = finding.text;
    entry["text"] =
        sentences_ != nullptr ? ordered_json(sentences_->Of(finding, device_, answer_)) : AnyText();
    return entry;
  }

  void AddSolved(ordered_json* all) const {
    const auto* const loop = std::get_if<LoopSettings>(&answer_.settings);
    const auto* const kru = std::get_if<KruSettings>(&answer_.settings);
    (*all)["settings"] = loop != nullptr ? LoopEntries(*loop) : KruEntries(*kru);
    (*all)["bandwidth"] =
        loop != nullptr ? ordered_json(Name(loop->bandwidth)) : ordered_json(nullptr);
    (*all)["limits"] = loop != nullptr ? LimitsOf(*loop) : ordered_json(nullptr);
    (*all)["search_vco"] = Number(answer_.searched_vco);
    Put(all, "input_jitter", request_.input_jitter);
    Put(all, "input_tolerance", request_.input_tolerance);
    (*all)["phase_error"] = Number(answer_.phase_error);
    Put(all, "worst_ppm", answer_.worst_ppm);
    (*all)["max_jitter"] = Number(answer_.max_jitter);
    (*all)["ranking"] = Ranking();
    (*all)["outputs"] = ordered_json::array();
    for (std::size_t i = 0; i < answer_.outputs.size(); ++i) {
      (*all)["outputs"].push_back(OutputAt(i));
    }
    AddFindings(all);
  }

  void AddFindings(ordered_json* all) const {
    ordered_json entries = ordered_json::array();
    for (const OutputAnswer& output : answer_.outputs) {
      for (const Finding& one : output.misses) entries.push_back(FindingOf(one));
    }
    for (const Finding& one : answer_.violations) entries.push_back(FindingOf(one));
    for (const Finding& one : answer_.notes) entries.push_back(FindingOf(one));
    const bool has = sentences_ != nullptr;
    (*all)["misses"] = has ? ordered_json(sentences_->Misses(answer_)) : AnyTexts();
    (*all)["violations"] =
        has ? ordered_json(sentences_->All(answer_.violations, device_, answer_)) : AnyTexts();
    (*all)["notes"] =
        has ? ordered_json(sentences_->All(answer_.notes, device_, answer_)) : AnyTexts();
    (*all)["findings"] = std::move(entries);
  }

  ordered_json LoopEntries(const LoopSettings& set) const {
    ordered_json entries = ordered_json::object();
    const bool has_second = request_.inputs.size() > 1;
    Put(&entries, "vco", VcoOf(request_.inputs[0], set.m, set.d));
    if (has_second) Put(&entries, "vco_second", VcoOf(request_.inputs[1], set.m, set.d));
    Put(&entries, "pfd", PfdOf(request_.inputs[0], set.d));
    if (has_second) Put(&entries, "pfd_second", PfdOf(request_.inputs[1], set.d));
    entries["m"] = Parts(set.m, 8);
    entries["m_eighths"] = set.m;
    entries["d"] = set.d;
    return entries;
  }

  ordered_json KruEntries(const KruSettings& set) const {
    ordered_json entries = ordered_json::object();
    const bool is_sp = set.primitive == Primitive::kKruSp;
    if (is_sp) {
      entries["feedback"] = set.feedback;
      entries["clkin_divide_by_2"] = set.divide_by_2;
    }
    if (set.m != 0) {
      entries["m"] = set.m;
      entries["d"] = set.d;
    }
    if (set.divide_halves != 0) {
      entries[is_sp ? "clkdv" : "clkfxdv"] = Parts(set.divide_halves, 2);
      entries["divide_halves"] = set.divide_halves;
    }
    if (is_sp) {
      entries["phase_offset"] = PhaseOffset(set).ToDouble();
      entries["phase_shift"] = set.phase_shift;
    }
    return entries;
  }

  const Output& AskedAt(std::size_t place) const {
    return request_.outputs[static_cast<std::size_t>(order_[place])];
  }

  // What the first output with a phase asks for beyond the phase of its pin, in that of its turns
  // which is nearest to the PHASE_SHIFT.
  Rational PhaseOffset(const KruSettings& set) const {
    if (set.phase_shift == 0) return 0;
    const Rational made = Rational(set.phase_shift) * 360 / hardware::kShiftSteps;
    for (std::size_t place = 0; place < set.pins.size(); ++place) {
      const Output& asked = AskedAt(place);
      if (!asked.used || !asked.phase) continue;
      return made + Turned(*asked.phase - verify::PhaseOf(set.pins[place], 0) - made);
    }
    return made;
  }

  ordered_json LimitsOf(const LoopSettings& set) const {
    const LoopLimits& limits = device_.Loop(set.primitive);
    ordered_json entries = ordered_json::object();
    entries["vco"] = Ends(limits.vco);
    Put(&entries, "vco_margin", answer_.vco_margin);
    entries["pfd"] = Ends(set.bandwidth == Bandwidth::kLow ? limits.pfd_low : limits.pfd);
    Put(&entries, "pfd_margin", answer_.pfd_margin);
    entries["largest_count"] = limits.max_count;
    return entries;
  }

  ordered_json Ranking() const {
    ordered_json entries = ordered_json::object();
    entries["class"] = !answer_.violations.empty() ? "broken" : answer_.within ? "met" : "missed";
    Put(&entries, "worst_error", answer_.worst_error);
    entries["max_jitter"] = Number(answer_.max_jitter);
    Put(&entries, "margin", answer_.margin);
    Put(&entries, "vco", answer_.vco);
    return entries;
  }

  ordered_json OutputAt(std::size_t place) const {
    const OutputAnswer& output = answer_.outputs[place];
    const Output& asked = AskedAt(place);
    ordered_json entries = ordered_json::object();
    entries["index"] = place;
    entries["used"] = asked.used;
    if (!asked.used) return entries;
    entries["request"] = order_[place];
    AddPlace(place, &entries);
    entries["multiply"] = output.ratio.InWords()->numerator;
    entries["divide"] = output.ratio.InWords()->denominator;
    Put(&entries, "requested", asked.asked ? std::optional(asked.frequency) : std::nullopt);
    Put(&entries, "actual", output.frequency);
    Put(&entries, "actual_second", output.frequency_second);
    entries["search"] = Number(output.searched);
    Put(&entries, "error_ppm", asked.asked ? std::optional(output.error_ppm) : std::nullopt);
    Put(&entries, "requested_phase", asked.phase);
    Put(&entries, "phase", output.phase);
    Put(&entries, "phase_error", output.phase_error);
    Put(&entries, "requested_duty", asked.duty);
    Put(&entries, "duty", output.duty);
    Put(&entries, "duty_error", output.duty_error);
    entries["jitter"] = Number(output.jitter);
    entries["jitter_rms"] = Number(output.jitter_rms);
    entries["range"] = Ends(RangeAt(place));
    Put(&entries, "margin", output.margin);
    entries["within"] = output.misses.empty() && output.violations.empty();
    return entries;
  }

  void AddPlace(std::size_t place, ordered_json* entries) const {
    if (const auto* const kru = std::get_if<KruSettings>(&answer_.settings)) {
      (*entries)["pin"] = hardware::FactsOf(kru->pins[place]).name;
      (*entries)["divider"] = nullptr;
      (*entries)["divider_eighths"] = nullptr;
      (*entries)["phase_step"] = nullptr;
      (*entries)["high_time"] = nullptr;
      return;
    }
    const LoopOutput& set = std::get<LoopSettings>(answer_.settings).outputs[place];
    (*entries)["pin"] = nullptr;
    (*entries)["divider"] = Parts(set.divider, 8);
    (*entries)["divider_eighths"] = set.divider;
    (*entries)["phase_step"] = set.phase;
    (*entries)["high_time"] = set.high_time;
  }

  Range RangeAt(std::size_t place) const {
    if (const auto* const kru = std::get_if<KruSettings>(&answer_.settings)) {
      return device_.Pins(kru->primitive)
          .Of(kru->pins[place], kru->pins[0] == hardware::Pin::kClk2x);
    }
    const LoopLimits& limits = device_.Loop(answer_.primitive);
    return place == 1 ? limits.output_1 : limits.output;
  }

  const Request& request_;
  const Device& device_;
  const Answer& answer_;
  const PlaceOrder& order_;
  const Sentences* const sentences_;
};

}  // namespace

ordered_json AnyText() { return Marker(kOneText); }
ordered_json AnyTexts() { return Marker(kManyTexts); }
bool IsAnyText(const ordered_json& value) { return IsMarker(value, kOneText); }
bool IsAnyTexts(const ordered_json& value) { return IsMarker(value, kManyTexts); }

string QuotientText(const Rational& value) {
  const string denominator = value.DenominatorText();
  return denominator == "1" ? value.NumeratorText() : value.NumeratorText() + "/" + denominator;
}

string WordOf(FindingKind kind) {
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
      return "no_settings";
  }
  return (assert(false), "");  // not reached: those are all kinds
}

string WordOf(const Source& source) {
  if (source.engine) return source.search ? "both" : "engine";
  return "search";
}

ordered_json EntriesOf(const Request& request, const Device& device, const Answer& answer,
                       const PlaceOrder& order, const Sentences* sentences) {
  return Entries(request, device, answer, order, sentences).All();
}

ordered_json Units() {
  return {{"frequency", "MHz"},
          {"frequency_error", "ppm"},
          {"phase", "degrees"},
          {"duty", "percent"},
          {"jitter", "ps, peak to peak at a bit error rate of 1e-12"},
          {"jitter_rms", "ps, rms of the random part"},
          {"phase_error_of_primitive", "ps"}};
}

}  // namespace planner::verify
