// Tested by verify_test.cpp.
#include "planner/verify/ReadRequest.h"

#include <cstddef>
#include <cstdint>
#include <string>
#include <utility>

#include "planner/read/Draft.h"
#include "planner/read/RequestTree.h"
#include "planner/verify/Entries.h"

namespace planner::verify {

namespace {

using read::Node;
using read::NodeType;
using std::string;

constexpr std::string_view kRequest = "request";

// "request.outputs[1].phase".
string PathOf(const read::Place& place) {
  string path(kRequest);
  if (!place.entry.empty()) path += "." + place.entry;
  if (place.index >= 0) path += "[" + std::to_string(place.index) + "]";
  if (!place.key.empty()) path += "." + place.key;
  return path;
}

void AddMistakes(const read::Mistakes& mistakes, Discrepancies* discrepancies) {
  for (const read::Mistake& mistake : mistakes) {
    discrepancies->push_back({.kind = DiscrepancyKind::kNoRequest,
                              .path = PathOf(mistake.place),
                              .found = mistake.text,
                              .expected = "",
                              .line = mistake.place.line,
                              .column = mistake.place.column,
                              .mistake = mistake});
  }
}

// "297/2" as a document has it; nothing when it is none.
std::optional<Rational> Quotient(const Node& node) {
  if (node.type != NodeType::kString) return std::nullopt;
  const std::size_t stroke = node.text.find('/');
  const auto part = [](const string& digits) -> std::optional<Rational> {
    const std::size_t first = !digits.empty() && digits[0] == '-' ? 1 : 0;
    if (digits.size() == first || digits.find_first_not_of("0123456789", first) != string::npos) {
      return std::nullopt;
    }
    return NumberOf(digits);
  };
  const auto numerator = part(node.text.substr(0, stroke));
  if (stroke == string::npos || !numerator) return numerator;
  const auto denominator = part(node.text.substr(stroke + 1));
  if (!denominator || *denominator <= Rational(0)) return std::nullopt;
  return *numerator / *denominator;
}

// What the answers of a document say of one number of the request: a value when they all agree.
class Saying {
 public:
  void Hear(const std::optional<Rational>& value) {
    if (!value) return Disagree();
    if (!value_ && agree_) value_ = value;
    if (!(*value_ == *value)) Disagree();
  }
  const std::optional<Rational>& Value() const { return value_; }
  // Whether they agree on another value.
  bool Contradicts(const std::optional<Rational>& value) const {
    return agree_ && value_ && (!value || !(*value_ == *value));
  }

 private:
  void Disagree() {
    agree_ = false;
    value_ = Rational(0);
  }
  bool agree_ = true;
  std::optional<Rational> value_;
};

class Holder {
 public:
  Holder(const Request& request, const Node& document, Discrepancies* discrepancies)
      : request_(request), document_(document), discrepancies_(*discrepancies) {}

  void Do() {
    Hear();
    Hold(jitter_, request_.input_jitter, "request.input_jitter", Entry("input_jitter"));
    for (std::size_t i = 0; i < request_.inputs.size(); ++i) {
      Hold(inputs_[i], request_.inputs[i], "request.inputs[" + std::to_string(i) + "]",
           Item("inputs", i));
    }
    for (std::size_t i = 0; i < request_.outputs.size(); ++i) {
      const Output& output = request_.outputs[i];
      if (output.used) HoldOutput(output, i);
    }
  }

 private:
  void Hear() {
    sayings_.resize(request_.outputs.size());
    const Node* const answers = document_.Find("answers");
    for (const Node& answer : answers->items) {
      const Node* const outputs = answer.Find("outputs");
      if (outputs == nullptr) continue;
      HearEntry(answer, "input_jitter_exact", &jitter_);
      for (const Node& output : outputs->items) HearOutput(output);
    }
  }

  static void HearEntry(const Node& object, const char* name, Saying* saying) {
    const Node* const node = object.Find(name);
    if (node != nullptr && node->type != NodeType::kNull) saying->Hear(Quotient(*node));
  }

  void HearOutput(const Node& output) {
    const auto index = Number(output, "request");
    const auto whole = index ? index->Whole() : std::nullopt;
    if (!whole || *whole < 0 || *whole >= static_cast<std::int64_t>(sayings_.size())) return;
    OfOutput& own = sayings_[static_cast<std::size_t>(*whole)];
    HearEntry(output, "requested_exact", &own.frequency);
    HearEntry(output, "requested_phase_exact", &own.phase);
    HearEntry(output, "requested_duty_exact", &own.duty);
    // Frequencies are the inputs times the ratios.
    const auto multiply = Number(output, "multiply");
    const auto divide = Number(output, "divide");
    if (!multiply || !divide || *multiply == Rational(0)) return;
    const char* const names[] = {"actual_exact", "actual_second_exact"};
    for (std::size_t i = 0; i < 2; ++i) {
      const Node* const made = output.Find(names[i]);
      const auto value = made != nullptr ? Quotient(*made) : std::nullopt;
      if (value) inputs_[i].Hear(*value * *divide / *multiply);
    }
  }

  static std::optional<Rational> Number(const Node& object, const char* name) {
    const Node* const node = object.Find(name);
    if (node == nullptr || node->type != NodeType::kNumber) return std::nullopt;
    return NumberOf(node->text);
  }

  void HoldOutput(const Output& output, std::size_t i) {
    const Node* const node = Item("outputs", i);
    const string path = "request.outputs[" + std::to_string(i) + "]";
    const auto entry = [&](const char* name) -> const Node* {
      const Node* const one = node != nullptr ? node->Find(name) : nullptr;
      return one != nullptr ? one : node;
    };
    Hold(sayings_[i].frequency, output.frequency, path + ".frequency", entry("frequency"));
    Hold(sayings_[i].phase, output.phase, path + ".phase", entry("phase"));
    Hold(sayings_[i].duty, output.duty, path + ".duty", entry("duty"));
  }

  void Hold(const Saying& saying, const std::optional<Rational>& value, const string& path,
            const Node* node) {
    if (!saying.Contradicts(value)) return;
    discrepancies_.push_back(At(node != nullptr ? *node : *document_.Find(kRequest),
                                DiscrepancyKind::kContradicts, path,
                                QuotientText(*saying.Value())));
    if (node == nullptr || !value) discrepancies_.back().found.clear();
  }

  const Node* Entry(const char* name) const { return document_.Find(kRequest)->Find(name); }
  const Node* Item(const char* name, std::size_t i) const {
    const Node* const list = Entry(name);
    return list != nullptr && i < list->items.size() ? &list->items[i] : nullptr;
  }

  struct OfOutput {
    Saying frequency;
    Saying phase;
    Saying duty;
  };
  const Request& request_;
  const Node& document_;
  Discrepancies& discrepancies_;
  Saying jitter_;
  Saying inputs_[2];
  std::vector<OfOutput> sayings_;
};

}  // namespace

std::optional<Request> ReadRequest(const Node& document, const Device& device,
                                   Discrepancies* discrepancies) {
  const Node* const node = document.Find(kRequest);
  if (node == nullptr) {
    discrepancies->push_back(At(document, DiscrepancyKind::kMissing, string(kRequest), "object"));
    discrepancies->back().found.clear();
    return std::nullopt;
  }
  // The reader refuses other types with a mistake of its own.
  read::Mistakes mistakes;
  const read::Draft draft = read::ReadTree(*node, "", read::Naming::kEntries, &mistakes);
  std::optional<read::Reading> reading;
  if (mistakes.empty()) reading = read::Finish(draft, {.evaluates = true}, &mistakes);
  AddMistakes(mistakes, discrepancies);
  if (!reading) return std::nullopt;
  const Node* const part = node->Find("device");
  if (part == nullptr || part->text != device.part) {
    discrepancies->push_back(At(part != nullptr ? *part : *node, DiscrepancyKind::kDiffers,
                                "request.device", "\"" + device.part + "\""));
    if (part == nullptr) discrepancies->back().found.clear();
  }
  Request request = std::move(reading->request);
  if (!request.primitive || device.Has(*request.primitive)) return request;
  discrepancies->push_back(
      At(*node->Find("primitive"), DiscrepancyKind::kNoSetting, "request.primitive", ""));
  return std::nullopt;
}

void HoldRequest(const Request& request, const Node& document, Discrepancies* discrepancies) {
  Holder(request, document, discrepancies).Do();
}

}  // namespace planner::verify
