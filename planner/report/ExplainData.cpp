// Tested by explain_text_test.cpp and explain_data_test.cpp.
#include <nlohmann/json.hpp>
#include <string_view>

#include "planner/answer/Evaluate.h"
#include "planner/report/Data.h"
#include "planner/report/ExplainText.h"
#include "planner/report/ExplainWords.h"
#include "planner/report/JsonText.h"
#include "planner/report/TclDict.h"

namespace planner::report {

namespace {

using explain::Change;
using explain::ChangeKind;
using explain::Demand;
using explain::DemandKind;
using explain::Explanation;
using explain::OfPrimitive;
using nlohmann::ordered_json;

// Counts up when an entry goes, is added, or changes its meaning or type.
constexpr int kExplanationVersion = 2;

std::string_view KindName(DemandKind kind) {
  switch (kind) {
    case DemandKind::kFrequency:
      return "frequency";
    case DemandKind::kPhase:
      return "phase";
    case DemandKind::kDuty:
      return "duty";
    case DemandKind::kJitter:
      return "jitter";
    case DemandKind::kOutputRange:
      return "output_range";
    case DemandKind::kVco:
      return "vco";
    case DemandKind::kPfd:
      return "pfd";
    case DemandKind::kM:
      return "m";
    case DemandKind::kD:
      return "d";
    case DemandKind::kDividers:
      return "dividers";
    case DemandKind::kWhole:
      return "whole";
    case DemandKind::kNothingMoves:
      return "nothing_moves";
    case DemandKind::kBandwidth:
      return "bandwidth";
    case DemandKind::kFeedback:
      return "feedback";
    case DemandKind::kInputTolerance:
      return "input_tolerance";
    case DemandKind::kSecondInput:
      break;
  }
  return "second_input";
}

std::string_view KindName(ChangeKind kind) {
  switch (kind) {
    case ChangeKind::kWithout:
      return "without";
    case ChangeKind::kTolerance:
      return "tolerance";
    case ChangeKind::kFrequency:
      return "frequency";
    case ChangeKind::kPhase:
      return "phase";
    case ChangeKind::kDuty:
      return "duty";
    case ChangeKind::kJitter:
      return "jitter";
    case ChangeKind::kLowest:
      return "minimum";
    case ChangeKind::kHighest:
      return "maximum";
    case ChangeKind::kInputTolerance:
      return "input_tolerance";
    case ChangeKind::kBandwidth:
      break;
  }
  return "bandwidth";
}

class Data {
 public:
  Data(const Explanation& explanation, const Device& device)
      : explanation_(explanation), request_(explanation.request), device_(device) {}

  ordered_json All() const {
    ordered_json data = ordered_json::object();
    data["format"] = "vorkel-explanation";
    data["version"] = kExplanationVersion;
    data["request"] = RequestData(request_, device_);
    data["possible"] = explanation_.IsMet();
    data["primitives"] = ordered_json::array();
    for (const OfPrimitive& one : explanation_.primitives) data["primitives"].push_back(Of(one));
    data["inputs"] = ordered_json::array();
    for (const explain::InputThatServes& input : explanation_.inputs) {
      ordered_json entry = ordered_json::object();
      AddExact(&entry, "frequency", input.frequency);
      entry["primitives"] = ordered_json::array();
      for (const Primitive primitive : input.primitives) {
        entry["primitives"].push_back(Name(primitive));
      }
      data["inputs"].push_back(std::move(entry));
    }
    return data;
  }

 private:
  ordered_json Of(const Demand& demand, Primitive primitive) const {
    ordered_json data = ordered_json::object();
    data["kind"] = KindName(demand.kind);
    data["output"] = demand.output >= 0 ? ordered_json(demand.output) : ordered_json(nullptr);
    // Of all outputs together no words are told.
    const bool is_of_output =
        demand.kind == DemandKind::kFrequency || demand.kind == DemandKind::kJitter;
    if (!is_of_output || demand.output >= 0) {
      data["text"] = DemandWords(demand, request_, device_, primitive);
    }
    return data;
  }

  ordered_json Of(const std::vector<Demand>& demands, Primitive primitive) const {
    ordered_json data = ordered_json::array();
    for (const Demand& demand : demands) data.push_back(Of(demand, primitive));
    return data;
  }

  ordered_json Of(const Change& change, Primitive primitive) const {
    ordered_json data = ordered_json::object();
    data["kind"] = KindName(change.kind);
    data["demand"] = Of(change.demand, primitive);
    AddExact(&data, "value", change.value);
    AddExact(&data, "before", change.before);
    data["text"] = ChangeWords(change, primitive);
    return data;
  }

  ordered_json Of(const std::vector<Change>& changes, Primitive primitive) const {
    ordered_json data = ordered_json::array();
    for (const Change& change : changes) data.push_back(Of(change, primitive));
    return data;
  }

  ordered_json Of(const OfPrimitive& one) const {
    ordered_json data = ordered_json::object();
    data["primitive"] = Name(one.primitive);
    data["possible"] = one.is_met;
    data["refusals"] = ordered_json::array();
    for (const Finding& refusal : one.refusals) {
      data["refusals"].push_back(FindingData(refusal, device_));
    }
    data["conflicts"] = ordered_json::array();
    for (const explain::Conflict& conflict : one.conflicts) {
      data["conflicts"].push_back({{"demands", Of(conflict.demands, one.primitive)},
                                   {"changes", Of(conflict.changes, one.primitive)},
                                   {"changes_lift_all", conflict.lifts_all}});
    }
    data["corrections"] = ordered_json::array();
    for (const std::vector<Demand>& correction : one.corrections) {
      data["corrections"].push_back(Of(correction, one.primitive));
    }
    data["together"] = Of(one.together, one.primitive);
    data["swaps"] = ordered_json::array();
    for (const explain::Swap& swap : one.swaps) {
      data["swaps"].push_back({swap.first, swap.second});
    }
    data["questions"] = one.questions;
    data["complete"] = one.is_complete;
    return data;
  }

  const Explanation& explanation_;
  const Request& request_;
  const Device& device_;
};

}  // namespace

std::string ExplainJson(const Explanation& explanation, const Device& device) {
  return JsonText(Data(explanation, device).All(), 2) + "\n";
}

std::string ExplainTcl(const Explanation& explanation, const Device& device) {
  return TclDict(Data(explanation, device).All());
}

}  // namespace planner::report
