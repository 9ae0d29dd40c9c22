// Tested by explain_text_test.cpp.
#include "planner/report/ExplainText.h"

#include <algorithm>
#include <optional>
#include <vector>

#include "planner/answer/Evaluate.h"
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
    string text = Verdict();
    for (const OfPrimitive& one : explanation_.primitives) text += Of(one);
    return text + Inputs();
  }

 private:
  string Verdict() const;
  string Of(const OfPrimitive& one) const;
  string Inputs() const;
  string Demands(const std::vector<Demand>& demands, Primitive primitive) const;
  string Changes(const std::vector<Change>& changes, Primitive primitive) const;
  string Together(const OfPrimitive& one) const;
  string Corrections(const OfPrimitive& one) const;
  const OfPrimitive* Nearest() const;

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

string Texts::Changes(const std::vector<Change>& changes, Primitive primitive) const {
  std::vector<string> words;
  for (const Change& change : changes) {
    string one = ChangeWords(change, request_, device_, primitive);
    if (std::find(words.begin(), words.end(), one) == words.end()) words.push_back(std::move(one));
  }
  return Enumerated(words, "or");
}

// The primitive whose common tolerance is the smallest; null when none has one.
const OfPrimitive* Texts::Nearest() const {
  const OfPrimitive* nearest = nullptr;
  for (const OfPrimitive& one : explanation_.primitives) {
    if (one.together.empty()) continue;
    if (!nearest || one.together.front().value < nearest->together.front().value) nearest = &one;
  }
  return nearest;
}

// The frequencies of all outputs together.
string Texts::Together(const OfPrimitive& one) const {
  const Change& change = one.together.front();
  const Answer answer = answer::Evaluate(request_, device_, change.settings, Source{});
  std::vector<string> frequencies;
  for (const OutputAnswer& output : answer.outputs) {
    frequencies.push_back(output.used ? Short(output.frequency, kFrequencyDecimals) : "-");
  }
  return Join(frequencies, ", ") + " MHz, with a tolerance of " + RoundedUp(change.value, 2) +
         " ppm";
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
  string text = Paragraph(style_, "Not possible as it stands with any primitive of " +
                                      device_.part + ".");
  const OfPrimitive* nearest = Nearest();
  if (!nearest) return text;
  text += Prose(style_, "nearest: ", Together(*nearest) + " (" + NameOf(*nearest) + ")");
  if (!nearest->conflicts.empty()) {
    text += Prose(style_, "in the way: ",
                  Demands(nearest->conflicts.front().demands, nearest->primitive));
  }
  return text;
}

// What single outputs or demands have to go; more at once are no advice.
string Texts::Corrections(const OfPrimitive& one) const {
  std::vector<string> words;
  for (const std::vector<Demand>& correction : one.corrections) {
    const bool are_outputs =
        std::all_of(correction.begin(), correction.end(), [](const Demand& demand) {
          return demand.kind == DemandKind::kFrequency;
        });
    if (!are_outputs || correction.size() > 2) continue;
    std::vector<int> outputs;
    for (const Demand& demand : correction) outputs.push_back(demand.output);
    words.push_back(Outputs(outputs));
  }
  return words.empty() ? "" : Prose(style_, "  without: ", Enumerated(words, "or"));
}

string Texts::Of(const OfPrimitive& one) const {
  if (one.is_met) return "";
  string text = "\n" + NameOf(one) + "\n";
  if (!one.refusals.empty()) {
    for (const Finding& refusal : one.refusals) {
      text += Prose(style_, "  ", FindingText(refusal, device_));
    }
    return text;
  }
  for (const Conflict& conflict : one.conflicts) {
    text += Prose(style_, "  in the way: ", Demands(conflict.demands, one.primitive));
    if (conflict.changes.empty()) continue;
    text += Prose(style_, conflict.lifts_all ? "    works with " : "    out of the way with ",
                  Changes(conflict.changes, one.primitive));
  }
  text += Corrections(one);
  if (!one.together.empty()) text += Prose(style_, "  all together: ", Together(one));
  for (const explain::Swap& swap : one.swaps) {
    text += Prose(style_, "  ", "works when outputs " + std::to_string(swap.first) + " and " +
                                    std::to_string(swap.second) + " change places");
  }
  if (!one.is_complete) {
    text += Prose(style_, "  ", "There may be more: " + std::to_string(one.questions) +
                                    " sets of demands were looked at.");
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
