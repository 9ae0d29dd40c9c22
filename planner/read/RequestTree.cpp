// Tested by request_json_test.cpp, request_toml_test.cpp and request_tcl_test.cpp.
#include "planner/read/RequestTree.h"

#include <algorithm>
#include <cstddef>
#include <initializer_list>
#include <string>
#include <utility>
#include <vector>

#include "planner/read/Names.h"

namespace planner::read {

namespace {

using Types = std::initializer_list<NodeType>;

// Entries that are a switch, and demands, of a request or of an output.
struct Switch {
  std::string_view name;
  Entry<bool> Draft::*entry;
};
constexpr Switch kSwitches[] = {
    {"exact", &Draft::exact},
    {"feedback", &Draft::feedback},
    {"prefer_max_vco", &Draft::prefer_max_vco},
    {"int_div0", &Draft::int_div0},
    {"engine", &Draft::engine},
    {"any_order", &Draft::any_order},
};
struct DemandEntry {
  std::string_view name;
  ValueKind kind;
  Entry<Demand> Draft::*entry;
};
constexpr DemandEntry kDemands[] = {
    {"tolerance", ValueKind::kTolerance, &Draft::tolerance},
    {"phase_tolerance", ValueKind::kPhaseTolerance, &Draft::phase_tolerance},
    {"duty_tolerance", ValueKind::kDutyTolerance, &Draft::duty_tolerance},
    {"max_jitter", ValueKind::kMaxJitter, &Draft::max_jitter},
};

const std::vector<std::string>& KnownEntries() {
  static const std::vector<std::string> kNames = {
      "device",    "primitive", "inputs",    "outputs",         "input_jitter",   "input_tolerance",
      "bandwidth", "tolerance", "exact",     "feedback",        "prefer_max_vco", "int_div0",
      "rank",      "engine",    "any_order", "phase_tolerance", "duty_tolerance", "max_jitter"};
  return kNames;
}
const std::vector<std::string>& KnownOutputEntries() {
  static const std::vector<std::string> kNames = {
      "frequency", "phase", "duty", "tolerance", "phase_tolerance", "duty_tolerance", "max_jitter"};
  return kNames;
}

class TreeReader {
 public:
  TreeReader(std::string_view file, Naming naming, Mistakes* mistakes)
      : file_(file), naming_(naming), mistakes_(mistakes) {}

  Draft Read(const Node& root) {
    if (!IsOf(root, {NodeType::kObject}, At(root.position, ""))) return {};
    for (const Member& member : root.members) ReadEntry(member);
    return std::move(draft_);
  }

 private:
  Place At(Position position, std::string_view entry, int index = -1,
           std::string_view key = {}) const {
    Place place;
    place.file = file_;
    place.line = position.line;
    place.column = position.column;
    place.entry = entry;
    place.index = index;
    place.key = key;
    if (naming_ == Naming::kCommands) NameAsCommand(&place);
    return place;
  }

  static void NameAsCommand(Place* place) {
    place->column = 0;
    if (place->entry == "input_jitter") {
      place->entry = "input";
      place->key = "jitter";
    } else if (place->entry == "inputs") {
      place->entry = "input";
      place->index = -1;
    } else if (place->entry == "outputs") {
      place->entry = "output";
    }
    if (place->key == "frequency") place->key.clear();
    if (!place->key.empty()) place->key.insert(0, 1, '-');
  }

  // Whether a value is of one of some types.
  bool IsOf(const Node& node, Types types, const Place& place) {
    if (std::find(types.begin(), types.end(), node.type) != types.end()) return true;
    Mistake mistake;
    mistake.kind = MistakeKind::kWrongType;
    mistake.place = place;
    mistake.other = Name(node.type);
    for (const NodeType type : types) mistake.known.emplace_back(Name(type));
    mistakes_->push_back(std::move(mistake));
    return false;
  }

  void Unknown(const Member& member, Place place, const std::vector<std::string>& known) {
    Mistake mistake;
    mistake.kind = MistakeKind::kUnknownEntry;
    mistake.place = std::move(place);
    mistake.text = member.name;
    mistake.known = known;
    mistakes_->push_back(std::move(mistake));
  }

  // A number or a text with a unit.
  std::optional<Rational> Value(const Node& node, ValueKind kind, const Place& place) {
    if (!IsOf(node, {NodeType::kNumber, NodeType::kString}, place)) return std::nullopt;
    return ReadValue(node.text, kind, place, mistakes_);
  }

  void ReadEntry(const Member& member) {
    const Place place = At(member.value.position, member.name);
    for (const Switch& one : kSwitches) {
      if (one.name != member.name) continue;
      if (IsOf(member.value, {NodeType::kBoolean}, place)) {
        draft_.*one.entry = {member.value.truth, place, ""};
      }
      return;
    }
    for (const DemandEntry& demand : kDemands) {
      if (demand.name == member.name) return ReadDemand(member.value, demand, place);
    }
    if (member.name == "inputs") return ReadInputs(member.value, place);
    if (member.name == "outputs") return ReadOutputs(member.value, place);
    if (member.name == "input_jitter") {
      const auto jitter = Value(member.value, ValueKind::kJitter, place);
      if (jitter) draft_.input_jitter = {*jitter, place, ""};
      return;
    }
    if (member.name == "input_tolerance") {
      const auto tolerance = Value(member.value, ValueKind::kInputTolerance, place);
      if (tolerance) draft_.input_tolerance = {*tolerance, place, ""};
      return;
    }
    ReadName(member, place);
  }

  void ReadName(const Member& member, const Place& place) {
    const std::string& name = member.name;
    if (name != "device" && name != "primitive" && name != "bandwidth" && name != "rank") {
      return Unknown(member, At(member.position, ""), KnownEntries());
    }
    if (!IsOf(member.value, {NodeType::kString}, place)) return;
    const std::string& text = member.value.text;
    if (name == "device") draft_.device = {text, place, ""};
    if (name == "primitive") draft_.primitive = WithoutText(ReadPrimitive(text, place, mistakes_));
    if (name == "bandwidth") draft_.bandwidth = WithoutText(ReadBandwidth(text, place, mistakes_));
    if (name == "rank") draft_.rank = WithoutText(ReadRank(text, place, mistakes_));
  }

  // What a file says is shown by its usual name.
  template <typename T>
  static Entry<T> WithoutText(Entry<T> entry) {
    if (entry) entry->text.clear();
    return entry;
  }

  // Outputs may have said something of themselves already.
  void ReadDemand(const Node& node, const DemandEntry& demand, const Place& place) {
    const auto value = Value(node, demand.kind, place);
    if (!value) return;
    Entry<Demand>& entry = draft_.*demand.entry;
    if (!entry) entry = {Demand{}, place, ""};
    entry->place = place;
    entry->value.all = value;
  }

  void ReadInputs(const Node& node, const Place& place) {
    if (!IsOf(node, {NodeType::kArray}, place)) return;
    std::vector<Rational> inputs;
    for (std::size_t i = 0; i < node.items.size(); ++i) {
      const Node& item = node.items[i];
      const auto value =
          Value(item, ValueKind::kFrequency, At(item.position, "inputs", static_cast<int>(i)));
      if (value) inputs.push_back(*value);
    }
    // A value that is wrong is told already.
    if (!node.items.empty()) draft_.inputs = {std::move(inputs), place, ""};
  }

  void ReadOutputs(const Node& node, const Place& place) {
    if (!IsOf(node, {NodeType::kArray}, place)) return;
    if (node.items.empty()) return;
    outputs_ = node.items.size();
    draft_.outputs = {Values(outputs_), place, ""};
    const std::size_t before = mistakes_->size();
    for (std::size_t i = 0; i < outputs_; ++i) ReadOutput(node.items[i], i);
    if (mistakes_->size() != before) draft_.outputs.reset();
  }

  void ReadOutput(const Node& node, std::size_t index) {
    const int number = static_cast<int>(index);
    const Place place = At(node.position, "outputs", number);
    if (!IsOf(node, {NodeType::kNumber, NodeType::kString, NodeType::kObject}, place)) return;
    if (node.type != NodeType::kObject) return ReadFrequency(node, index, place);
    bool is_known = true;
    for (const Member& member : node.members) {
      const Place at = At(member.value.position, "outputs", number, member.name);
      if (member.name == "frequency") {
        ReadFrequency(member.value, index, at);
      } else if (member.name == "asked") {
        ReadAsked(member.value, index, at);
      } else {
        is_known = is_known && KindOf(member.name);
        ReadOfOutput(member, index, at);
      }
    }
    // An entry that there is not may have been meant for it.
    if (node.Find("frequency") || !is_known) return;
    Mistake mistake;
    mistake.kind = MistakeKind::kNoFrequency;
    mistake.place = place;
    mistakes_->push_back(std::move(mistake));
  }

  // "-" for an output that is not used.
  void ReadFrequency(const Node& node, std::size_t index, const Place& place) {
    if (node.type == NodeType::kString && node.text == "-") return;
    draft_.outputs->value[index] = Value(node, ValueKind::kFrequency, place);
  }

  void ReadAsked(const Node& node, std::size_t index, const Place& place) {
    if (!IsOf(node, {NodeType::kBoolean}, place) || node.truth) return;
    if (!draft_.unasked) draft_.unasked = {std::vector<bool>(outputs_), place, ""};
    draft_.unasked->value[index] = true;
  }

  // Phase, duty cycle and demands; nothing is asked for by null, "-" and an empty text.
  void ReadOfOutput(const Member& member, std::size_t index, const Place& place) {
    const auto kind = KindOf(member.name);
    if (!kind) {
      return Unknown(member, At(member.position, "outputs", static_cast<int>(index)),
                     KnownOutputEntries());
    }
    const Node& node = member.value;
    if (!IsOf(node, {NodeType::kNumber, NodeType::kString, NodeType::kNull}, place)) return;
    if (node.type == NodeType::kNull || node.text.empty() || node.text == "-") return;
    const auto value = ReadValue(node.text, *kind, place, mistakes_);
    if (!value) return;
    if (member.name == "phase") return Put(*value, index, place, &draft_.phases);
    if (member.name == "duty") return Put(*value, index, place, &draft_.duties);
    for (const DemandEntry& demand : kDemands) {
      if (demand.name != member.name) continue;
      Entry<Demand>& entry = draft_.*demand.entry;
      if (!entry) entry = {Demand{}, place, ""};
      entry->value.each.resize(outputs_);
      entry->value.each[index] = value;
    }
  }

  static std::optional<ValueKind> KindOf(std::string_view name) {
    if (name == "phase") return ValueKind::kPhase;
    if (name == "duty") return ValueKind::kDuty;
    for (const DemandEntry& demand : kDemands) {
      if (demand.name == name) return demand.kind;
    }
    return std::nullopt;
  }

  void Put(const Rational& value, std::size_t index, const Place& place, Entry<Values>* entry) {
    if (!*entry) *entry = {Values(outputs_), place, ""};
    (*entry)->value[index] = value;
  }

  std::string file_;
  Naming naming_;
  Mistakes* mistakes_;
  Draft draft_;
  std::size_t outputs_ = 0;
};

}  // namespace

Draft ReadTree(const Node& root, std::string_view file, Naming naming, Mistakes* mistakes) {
  return TreeReader(file, naming, mistakes).Read(root);
}

}  // namespace planner::read
