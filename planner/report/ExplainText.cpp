// Tested by explain_text_test.cpp.
#include "planner/report/ExplainText.h"

#include <algorithm>
#include <optional>
#include <vector>

#include "planner/answer/Evaluate.h"
#include "planner/answer/Rank.h"
#include "planner/report/ExplainWords.h"
#include "planner/report/FindingText.h"
#include "planner/report/Numbers.h"
#include "planner/report/Table.h"
#include "planner/report/Words.h"

namespace planner::report {

namespace {

using explain::Change;
using explain::ChangeKind;
using explain::Conflict;
using explain::Demand;
using explain::DemandKind;
using explain::Explanation;
using explain::OfPrimitive;
using std::string;

// A tolerance above this, ppm, and a number that moves by more than this part of it is no advice.
constexpr int kLargestTolerance = 20000;
constexpr int kFarthest = 10;

// Of the labels in front of what a primitive has to say.
constexpr int kLabelWidth = 14;

// So many conflicts of a primitive are told, and so many changes; the data have all.
constexpr std::size_t kMostConflicts = 4;
constexpr std::size_t kMostChanges = 6;
constexpr const char* kDataHaveAll = "; --format json has all";

string NameOf(const OfPrimitive& one) { return string(Name(one.primitive)); }

class Texts {
 public:
  Texts(const Explanation& explanation, const Device& device, const Style& style,
        const Calls& calls, bool own_inputs)
      : explanation_(explanation),
        request_(explanation.request),
        device_(device),
        style_(style),
        calls_(calls),
        own_inputs_(own_inputs) {}

  string All() const {
    string text = Verdict() + EngineOnly();
    for (const OfPrimitive& one : explanation_.primitives) text += Of(one);
    return text + Inputs();
  }

 private:
  string Verdict() const;
  string EngineOnly() const;
  string Of(const OfPrimitive& one) const;
  string Inputs() const;
  string Demands(const std::vector<Demand>& demands, Primitive primitive) const;
  string Changes(const std::vector<const Change*>& changes, Primitive primitive) const;
  string Works(const OfPrimitive& one) const;
  string Line(const string& label, const string& value) const {
    return Labelled(style_, kLabelWidth, "  " + label, value);
  }
  string Together(const OfPrimitive& one) const;
  string Corrections(const OfPrimitive& one) const;
  const OfPrimitive* Nearest() const;
  Rational Distance(const Settings& settings) const;
  string NearestText() const;

  const Explanation& explanation_;
  const Request& request_;
  const Device& device_;
  const Style& style_;
  const Calls& calls_;
  bool own_inputs_;
};

string Texts::Demands(const std::vector<Demand>& demands, Primitive primitive) const {
  std::vector<string> words;
  for (const Demand& demand : demands) {
    words.push_back(DemandWords(demand, request_, device_, primitive));
  }
  return Enumerated(words);
}

// Changes that a user can make, without those that nobody would: a loss of what the hardware is, or
// a number so far away that it is another request.
bool IsAdvice(const Change& change) {
  switch (change.kind) {
    case ChangeKind::kWithout:
      return change.demand.kind == DemandKind::kPhase || change.demand.kind == DemandKind::kDuty ||
             change.demand.kind == DemandKind::kJitter ||
             change.demand.kind == DemandKind::kFeedback ||
             change.demand.kind == DemandKind::kSecondInput;
    case ChangeKind::kTolerance:
      return change.value <= kLargestTolerance;
    case ChangeKind::kFrequency:
      return (change.value - change.before).Absolute() <= change.before / kFarthest;
    case ChangeKind::kLowest:
    case ChangeKind::kHighest:
      return (change.value - change.before).Absolute() <= change.before / kFarthest;
    default:
      return true;
  }
}

// What works, each once: the changes of some conflicts, in words.
string Texts::Changes(const std::vector<const Change*>& changes, Primitive primitive) const {
  std::vector<string> words;
  std::size_t others = 0;
  for (const Change* change : changes) {
    string one = ChangeWords(*change, primitive);
    if (std::find(words.begin(), words.end(), one) != words.end()) continue;
    if (!IsAdvice(*change) || words.size() == kMostChanges) {
      ++others;
    } else {
      words.push_back(std::move(one));
    }
  }
  if (words.empty()) return "";
  if (others > 0) words.push_back(std::to_string(others) + " more" + kDataHaveAll);
  return Join(words, "; ");
}

// What all outputs could have together, of a kind; null when it is not enough.
const Change* CommonOf(const OfPrimitive& one, ChangeKind kind) {
  for (const Change& change : one.together) {
    if (change.kind == kind) return &change;
  }
  return nullptr;
}

// The primitive whose common tolerance is the smallest; null when none has one.
const OfPrimitive* Texts::Nearest() const {
  const OfPrimitive* nearest = nullptr;
  const Change* least = nullptr;
  for (const OfPrimitive& one : explanation_.primitives) {
    const Change* const tolerance = CommonOf(one, ChangeKind::kTolerance);
    if (!tolerance || (least && least->value <= tolerance->value)) continue;
    least = tolerance;
    nearest = &one;
  }
  return nearest;
}

// The frequencies of all outputs together.
string Texts::Together(const OfPrimitive& one) const {
  const Change& change = *CommonOf(one, ChangeKind::kTolerance);
  const Answer answer = answer::Evaluate(request_, device_, change.settings, Source{});
  std::vector<string> frequencies;
  for (const OutputAnswer& output : answer.outputs) {
    frequencies.push_back(output.used ? Short(output.frequency, kFrequencyDecimals) : "-");
  }
  return Join(frequencies, ", ") + " MHz, with a tolerance of " + RoundedUp(change.value, 2) +
         " ppm";
}

// How far settings are from the request, in tolerances.
Rational Texts::Distance(const Settings& settings) const {
  return answer::KeyOf(answer::Evaluate(request_, device_, settings, Source{})).worst_error;
}

// All outputs moved, or all limits of their jitter; or the one phase, duty cycle or jitter that is
// nearer.
string Texts::NearestText() const {
  string text;
  std::optional<Rational> least;
  if (const OfPrimitive* const moved = Nearest()) {
    text = Together(*moved) + " (" + NameOf(*moved) + ")";
    least = Distance(CommonOf(*moved, ChangeKind::kTolerance)->settings);
  }
  const auto hold = [&](const Change& change, const OfPrimitive& one) {
    const Rational distance = Distance(change.settings);
    if (least && *least <= distance) return;
    least = distance;
    text = ChangeWords(change, one.primitive) + " (" + NameOf(one) + ")";
  };
  for (const OfPrimitive& one : explanation_.primitives) {
    if (const Change* const jitter = CommonOf(one, ChangeKind::kJitter)) hold(*jitter, one);
    for (const Conflict& conflict : one.conflicts) {
      if (!conflict.lifts_all) continue;
      for (const Change& change : conflict.changes) {
        if (change.kind != ChangeKind::kPhase && change.kind != ChangeKind::kDuty &&
            change.kind != ChangeKind::kJitter) {
          continue;
        }
        hold(change, one);
      }
    }
  }
  return text;
}

string Texts::Verdict() const {
  std::vector<string> able;
  for (const OfPrimitive& one : explanation_.primitives) {
    if (one.is_met) able.push_back(NameOf(one));
  }
  if (!able.empty()) {
    string text = Paragraph(style_, "Possible as it stands with " + Enumerated(able, "or") + ".");
    if (!calls_.best.empty()) text += "hint: the settings: " + calls_.best + "\n";
    return text;
  }
  string text =
      Paragraph(style_, "Not possible as it stands with any primitive of " + device_.part + ".");
  const string nearest = NearestText();
  return nearest.empty() ? text : text + Prose(style_, "nearest: ", nearest);
}

// What is explained is what the hardware can do. The engine may still not find it.
string Texts::EngineOnly() const {
  if (!request_.engine_only) return "";
  return Prose(style_, "note: ",
               "all settings count here, those that the design flow's own search does not find, "
               "too");
}

// What single outputs or demands have to go; more at once are no advice.
string Texts::Corrections(const OfPrimitive& one) const {
  if (request_.outputs.size() < 2) return "";
  std::vector<string> words;
  for (const std::vector<Demand>& correction : one.corrections) {
    const bool are_outputs =
        std::all_of(correction.begin(), correction.end(),
                    [](const Demand& demand) { return demand.kind == DemandKind::kFrequency; });
    if (!are_outputs || correction.size() > 2) continue;
    std::vector<int> outputs;
    for (const Demand& demand : correction) outputs.push_back(demand.output);
    words.push_back(Outputs(outputs));
  }
  return words.empty() ? "" : Line("without", Enumerated(words, "or"));
}

// The changes with which the whole request goes; or, where conflicts remain beside each, with which
// each of them is out of the way.
string Texts::Works(const OfPrimitive& one) const {
  std::vector<const Change*> lifting;
  std::vector<const Change*> others;
  if (const Change* const jitter = CommonOf(one, ChangeKind::kJitter)) lifting.push_back(jitter);
  for (const Conflict& conflict : one.conflicts) {
    for (const Change& change : conflict.changes) {
      (conflict.lifts_all ? lifting : others).push_back(&change);
    }
  }
  const string works = Changes(lifting, one.primitive);
  if (!works.empty()) return Line("works with", works);
  const string helps = Changes(others, one.primitive);
  return helps.empty() ? "" : Line("helps", helps);
}

string Texts::Of(const OfPrimitive& one) const {
  if (one.is_met) return "";
  string text = "\n" + NameOf(one) + "\n";
  if (!one.refusals.empty()) {
    for (const Finding& refusal : one.refusals) text += Line("", FindingText(refusal, device_));
    return text;
  }
  std::size_t told = 0;
  for (const Conflict& conflict : one.conflicts) {
    if (told == kMostConflicts) break;
    text += Line(told++ == 0 ? "in the way" : "and", Demands(conflict.demands, one.primitive));
  }
  if (one.conflicts.size() > told) {
    text += Line("", std::to_string(one.conflicts.size() - told) + " more" + kDataHaveAll);
  }
  text += Works(one) + Corrections(one);
  const Change* const tolerance = CommonOf(one, ChangeKind::kTolerance);
  if (tolerance && tolerance->value <= kLargestTolerance) {
    text += Line("all moved", Together(one));
  }
  for (const explain::Swap& swap : one.swaps) {
    text += Line("", "works when outputs " + std::to_string(swap.first) + " and " +
                         std::to_string(swap.second) + " change places: --any-order");
  }
  if (!one.is_complete) {
    text += Line("", "there may be more: " + std::to_string(one.questions) +
                         " sets of demands were looked at");
  }
  return text;
}

string Texts::Inputs() const {
  if (explanation_.IsMet() && !own_inputs_) return "";
  const string what = own_inputs_ ? "oscillators of your list" : "stock oscillators";
  if (explanation_.inputs.empty()) {
    return "\n" + Paragraph(style_, "None of the " + what + " makes every frequency exact.");
  }
  std::vector<string> words;
  for (const explain::InputThatServes& input : explanation_.inputs) {
    std::vector<string> names;
    for (const Primitive primitive : input.primitives) names.emplace_back(Name(primitive));
    words.push_back(FrequencyWords(input.frequency) + " (" + Join(names, ", ") + ")");
  }
  const string first = request_.inputs.size() > 1 ? " in place of the first input" : "";
  return "\n" + Prose(style_, "exact from " + what + first + ": ", Enumerated(words, "or"));
}

}  // namespace

string ExplainText(const Explanation& explanation, const Device& device, const Style& style,
                   const Calls& calls, bool own_inputs) {
  return Texts(explanation, device, style, calls, own_inputs).All();
}

}  // namespace planner::report
