// The settings and the request of a plan in JSON.
//
// Tested by settings_test.cpp.
#include <algorithm>
#include <cstddef>
#include <initializer_list>
#include <utility>

#include "planner/PlanVersion.h"
#include "planner/read/JsonTree.h"
#include "planner/read/Names.h"
#include "planner/read/RequestTree.h"
#include "planner/read/Settings.h"

namespace planner::read {

namespace {

constexpr int kEighths = 8;
constexpr int kHalves = 2;

class PlanReader {
 public:
  PlanReader(std::string_view file, Mistakes* mistakes) : file_(file), mistakes_(mistakes) {}

  PlanFile Read(const Node& root, std::optional<int> number) {
    const Node* const answers = root.Find("answers");
    const Node* const format = root.Find("format");
    const bool is_plan = format == nullptr || format->text == "vorkel-plan";
    if (!is_plan || answers == nullptr || answers->type != NodeType::kArray ||
        answers->items.empty()) {
      Add(MistakeKind::kNotAPlan, At(root, ""));
      return {};
    }
    const Node* const version = root.Find("version");
    if (version != nullptr && version->text != std::to_string(kPlanVersion)) {
      Refuse(*version, "version", "version of plans that can be read",
             std::to_string(kPlanVersion));
    }
    if (const Node* const request = root.Find("request")) {
      plan_.request = WithoutChoices(ReadTree(*request, file_, Naming::kEntries, mistakes_));
    }
    for (std::size_t i = 0; i < answers->items.size(); ++i) {
      if (!IsMeant(answers->items[i], number)) continue;
      path_ = "answers[" + std::to_string(i) + "]";
      ReadAnswer(answers->items[i]);
      return std::move(plan_);
    }
    Mistake& mistake = Add(MistakeKind::kNoAnswer, At(root, ""));
    mistake.count = *number;
    return {};
  }

 private:
  Place At(const Node& node, std::string path) const {
    Place place;
    place.file = file_;
    place.line = node.position.line;
    place.column = node.position.column;
    place.entry = std::move(path);
    return place;
  }

  Mistake& Add(MistakeKind kind, Place place) {
    Mistake mistake;
    mistake.kind = kind;
    mistake.place = std::move(place);
    return mistakes_->emplace_back(std::move(mistake));
  }

  // What stands at `path` is no `what`, which would be `right`.
  void Refuse(const Node& node, std::string path, std::string what, const std::string& right) {
    Mistake& mistake = Add(MistakeKind::kNoSetting, At(node, std::move(path)));
    mistake.text = node.text;
    mistake.other = std::move(what);
    mistake.hint = "it is " + right;
  }

  static bool IsMeant(const Node& answer, std::optional<int> number) {
    if (!number) return true;
    const Node* const own = answer.Find("number");
    return own != nullptr && own->type == NodeType::kNumber && own->text == std::to_string(*number);
  }

  // An entry that is there and is not null, of a type.
  const Node* EntryOf(const Node& object, const std::string& path, std::string_view name,
                      NodeType type) {
    const Node* const node = object.Find(name);
    if (node == nullptr || node->type == NodeType::kNull) return nullptr;
    if (node->type == type) return node;
    Mistake& mistake = Add(MistakeKind::kWrongType, At(*node, path + "." + std::string(name)));
    mistake.other = Name(node->type);
    mistake.known = {std::string(Name(type))};
    return nullptr;
  }

  std::optional<Said<Rational>> Number(const Node& object, const std::string& path,
                                       std::string_view name) {
    const Node* const node = EntryOf(object, path, name, NodeType::kNumber);
    if (node == nullptr) return std::nullopt;
    const Place place = At(*node, path + "." + std::string(name));
    const auto value = ReadValue(node->text, ValueKind::kNumber, place, mistakes_);
    if (!value) return std::nullopt;
    return Said<Rational>{*value, place, node->text};
  }

  // A number that stands there in parts, too: either will do, but they must not contradict.
  std::optional<Said<Rational>> InParts(const Node& object, const std::string& path,
                                        std::string_view name, std::string_view in_parts,
                                        int parts) {
    auto number = Number(object, path, name);
    auto counted = Number(object, path, in_parts);
    if (!counted) return number;
    counted->value /= parts;
    if (number && number->value != counted->value) {
      Add(MistakeKind::kContradiction, counted->place).other = std::string(name);
    }
    return number ? number : counted;
  }

  void ReadAnswer(const Node& answer) {
    SettingsDraft& settings = plan_.settings;
    const Node* const set = EntryOf(answer, path_, "settings", NodeType::kObject);
    const Node* const outputs = EntryOf(answer, path_, "outputs", NodeType::kArray);
    const Node* const primitive = EntryOf(answer, path_, "primitive", NodeType::kString);
    if (set == nullptr || outputs == nullptr || primitive == nullptr) {
      Add(MistakeKind::kNotAPlan, At(answer, path_));
      return;
    }
    const Place place = At(*primitive, path_ + ".primitive");
    const auto named = ReadPrimitive(primitive->text, place, mistakes_);
    if (!named || !named->value) return;
    settings.primitive = {*named->value, place, ""};
    if (const Node* const name = EntryOf(answer, path_, "bandwidth", NodeType::kString)) {
      settings.bandwidth = ReadBandwidth(name->text, At(*name, path_ + ".bandwidth"), mistakes_);
    }
    const std::string path = path_ + ".settings";
    settings.m = InParts(*set, path, "m", "m_eighths", kEighths);
    settings.d = Number(*set, path, "d");
    if (hardware::IsLoop(*named->value)) {
      ReadLoopOutputs(*outputs);
    } else {
      ReadKru(*set, path, *outputs);
    }
    MoveOutputs(*outputs);
  }

  void ReadKru(const Node& set, const std::string& path, const Node& outputs) {
    SettingsDraft& settings = plan_.settings;
    const bool is_sp = settings.primitive->value == Primitive::kKruSp;
    if (const auto divide =
            InParts(set, path, is_sp ? "clkdv" : "clkfxdv", "divide_halves", kHalves)) {
      settings.dividers = {Values{divide->value}, divide->place, ""};
    }
    settings.phase_shift = Number(set, path, "phase_shift");
    for (const auto& [name, entry] : {std::pair{"feedback", &settings.feedback},
                                      {"clkin_divide_by_2", &settings.divide_by_2}}) {
      const Node* const node = EntryOf(set, path, name, NodeType::kBoolean);
      if (node != nullptr) *entry = {node->truth, At(*node, path + "." + name), ""};
    }
    std::vector<std::string> pins;
    ForEachOutput(outputs, [&](const Node& output, const std::string& own, bool used) {
      const Node* const pin = used ? EntryOf(output, own, "pin", NodeType::kString) : nullptr;
      pins.push_back(pin != nullptr ? pin->text : "-");
    });
    settings.pins = {std::move(pins), At(outputs, path_ + ".outputs"), ""};
  }

  void ReadLoopOutputs(const Node& outputs) {
    Values dividers;
    Values steps;
    Values high_times;
    ForEachOutput(outputs, [&](const Node& output, const std::string& own, bool used) {
      const auto add = [&](Values* values, const std::optional<Said<Rational>>& said) {
        values->push_back(used && said ? std::optional(said->value) : std::nullopt);
      };
      add(&dividers,
          used ? InParts(output, own, "divider", "divider_eighths", kEighths) : std::nullopt);
      add(&steps, used ? Number(output, own, "phase_step") : std::nullopt);
      add(&high_times, used ? Number(output, own, "high_time") : std::nullopt);
    });
    const Place place = At(outputs, path_ + ".outputs");
    plan_.settings.dividers = {std::move(dividers), place, ""};
    plan_.settings.phase_steps = {std::move(steps), place, ""};
    plan_.settings.high_times = {std::move(high_times), place, ""};
  }

  template <typename Do>
  void ForEachOutput(const Node& outputs, Do act) {
    for (std::size_t i = 0; i < outputs.items.size(); ++i) {
      const Node& output = outputs.items[i];
      const std::string path = path_ + ".outputs[" + std::to_string(i) + "]";
      if (output.type != NodeType::kObject) {
        act(output, path, false);
        continue;
      }
      const Node* const index = EntryOf(output, path, "index", NodeType::kNumber);
      if (index != nullptr && index->text != std::to_string(i)) {
        Refuse(*index, path + ".index", "index of the output at this place", std::to_string(i));
      }
      const Node* const used = EntryOf(output, path, "used", NodeType::kBoolean);
      act(output, path, used == nullptr || used->truth);
    }
  }

  // Outputs of the request go to the places where the answer has them.
  void MoveOutputs(const Node& outputs) {
    if (!plan_.request.outputs) return;
    const std::size_t count = plan_.request.outputs->value.size();
    if (outputs.items.size() != count) return;
    std::vector<std::size_t> order;
    for (const Node& output : outputs.items) {
      const Node* const index = output.Find("request");
      const bool is_digit = index != nullptr && index->text.size() == 1 && index->text[0] >= '0';
      order.push_back(is_digit ? static_cast<std::size_t>(index->text[0] - '0') : count);
    }
    // Those without an index, which are not used, are left for the other places.
    for (std::size_t& place : order) {
      if (place < count) continue;
      for (std::size_t i = 0; i < count && place >= count; ++i) {
        if (std::find(order.begin(), order.end(), i) == order.end()) place = i;
      }
    }
    std::vector<std::size_t> sorted = order;
    std::sort(sorted.begin(), sorted.end());
    for (std::size_t i = 0; i < count; ++i) {
      if (sorted[i] != i) return;
    }
    Draft& draft = plan_.request;
    for (auto* const entry : {&draft.outputs, &draft.phases, &draft.duties}) {
      if (*entry) Move(order, &(*entry)->value);
    }
    for (auto* const entry :
         {&draft.tolerance, &draft.phase_tolerance, &draft.duty_tolerance, &draft.max_jitter}) {
      if (*entry) Move(order, &(*entry)->value.each);
    }
    if (draft.unasked) Move(order, &draft.unasked->value);
  }

  template <typename T>
  static void Move(const std::vector<std::size_t>& order, std::vector<T>* list) {
    if (list->size() != order.size()) return;
    const std::vector<T> before = *list;
    for (std::size_t i = 0; i < order.size(); ++i) (*list)[i] = before[order[i]];
  }

  std::string file_;
  Mistakes* mistakes_;
  std::string path_;  // of the answer
  PlanFile plan_;
};

}  // namespace

PlanFile ReadPlan(std::string_view text, std::string_view file, std::optional<int> number,
                  Mistakes* mistakes) {
  const std::optional<Node> root = ReadJsonTree(text, file, mistakes);
  if (!root) return {};
  const std::size_t before = mistakes->size();
  PlanFile plan = PlanReader(file, mistakes).Read(*root, number);
  return mistakes->size() == before ? plan : PlanFile{};
}

}  // namespace planner::read
