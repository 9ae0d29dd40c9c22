// Tested by mutation_test.cpp.
#include "planner/verify/Claim.h"

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <functional>
#include <string_view>
#include <utility>
#include <vector>

#include "hardware/Kru.h"
#include "hardware/Loop.h"
#include "planner/verify/Formulas.h"

namespace planner::verify {

namespace {

using read::Node;
using read::NodeType;
using std::string;

string Quoted(std::string_view word) { return "\"" + string(word) + "\""; }

string From(int lowest, int highest) {
  return std::to_string(lowest) + " to " + std::to_string(highest);
}

string Entries(std::size_t count) {
  return std::to_string(count) + (count == 1 ? " entry" : " entries");
}

// Reads entries of one object after the other; what is wrong with one is told, and makes the whole
// wrong.
class Reader {
 public:
  explicit Reader(Discrepancies* discrepancies) : discrepancies_(discrepancies) {}

  bool IsRight() const { return is_right_; }

  // Null when there is none of that type.
  const Node* Entry(const Node& object, const string& path, const string& name, NodeType type) {
    const Node* const node = object.Find(name);
    if (node == nullptr) {
      Add(object, DiscrepancyKind::kMissing, path + "." + name, string(read::Name(type)));
      discrepancies_->back().found.clear();
      return nullptr;
    }
    if (node->type == type) return node;
    Add(*node, DiscrepancyKind::kWrongType, path + "." + name, string(read::Name(type)));
    return nullptr;
  }

  bool Flag(const Node& object, const string& path, const string& name) {
    const Node* const node = Entry(object, path, name, NodeType::kBoolean);
    return node != nullptr && node->truth;
  }

  string Word(const Node& object, const string& path, const string& name) {
    const Node* const node = Entry(object, path, name, NodeType::kString);
    return node != nullptr ? node->text : string();
  }

  // A whole number in a range, and of those only what `is_one`, or all without it; the lowest when
  // it is none. `expected` is the range in words.
  int Count(const Node& object, const string& path, const string& name, int lowest, int highest,
            const std::function<bool(int)>& is_one = {}, string expected = "") {
    const Node* const node = Entry(object, path, name, NodeType::kNumber);
    if (node == nullptr) return lowest;
    const auto number = NumberOf(node->text);
    const auto whole = number ? number->Whole() : std::nullopt;
    if (whole && lowest <= *whole && *whole <= highest &&
        (!is_one || is_one(static_cast<int>(*whole)))) {
      return static_cast<int>(*whole);
    }
    Add(*node, number ? DiscrepancyKind::kNoSetting : DiscrepancyKind::kAbsurd, path + "." + name,
        expected.empty() ? From(lowest, highest) : std::move(expected));
    return lowest;
  }

  // Says that an entry, which is there, cannot be so; `found` is what to call it.
  void Refuse(const Node& object, const string& path, const string& name, string expected,
              const string& found = "") {
    const Node* const node = object.Find(name);
    Add(node != nullptr ? *node : object, DiscrepancyKind::kNoSetting, path + "." + name,
        std::move(expected));
    if (node == nullptr || !found.empty()) discrepancies_->back().found = found;
  }
  void RefuseType(const Node& node, const string& path, NodeType expected) {
    Add(node, DiscrepancyKind::kWrongType, path, string(read::Name(expected)));
  }

 private:
  void Add(const Node& node, DiscrepancyKind kind, const string& path, string expected) {
    is_right_ = false;
    discrepancies_->push_back(At(node, kind, path, std::move(expected)));
  }

  Discrepancies* const discrepancies_;
  bool is_right_ = true;
};

// One of `all`, by its name; nothing when there is none.
template <typename T, typename All>
std::optional<T> Named(const All& all, std::string_view name) {
  for (const T one : all) {
    if (Name(one) == name) return one;
  }
  return std::nullopt;
}

class ClaimReader {
 public:
  ClaimReader(const Request& request, const Device& device, const Node& node, const string& path,
              Discrepancies* discrepancies)
      : request_(request), device_(device), node_(node), read_(discrepancies) {
    claim_.node = &node;
    claim_.path = path;
  }

  std::optional<Claim> Do() {
    if (!ReadHead()) return std::nullopt;
    if (claim_.solved) {
      ReadOutputs();
      if (read_.IsRight()) {
        claim_.order = Order();
        if (hardware::IsLoop(claim_.primitive)) {
          ReadLoop();
        } else {
          ReadKru();
        }
      }
    }
    if (!read_.IsRight()) return std::nullopt;
    return std::move(claim_);
  }

 private:
  bool ReadHead() {
    const string name = read_.Word(node_, claim_.path, "primitive");
    claim_.solved = read_.Flag(node_, claim_.path, "solved");
    const string source = read_.Word(node_, claim_.path, "source");
    claim_.is_engine = source == "engine" || source == "both";
    claim_.variant = read_.Word(node_, claim_.path, "variant");
    claim_.is_tradeoff = read_.Flag(node_, claim_.path, "tradeoff");
    if (const Node* const number = node_.Find("number");
        number && number->type != NodeType::kNull) {
      const auto place = read_.Count(node_, claim_.path, "number", 1, 1'000'000);
      claim_.number = static_cast<std::size_t>(place);
    }
    if (!read_.IsRight()) return false;
    const auto primitive = Named<Primitive>(hardware::kPrimitives, name);
    if (!primitive || !device_.Has(*primitive) ||
        (request_.primitive && *request_.primitive != *primitive)) {
      read_.Refuse(node_, claim_.path, "primitive", PrimitiveNames());
      return false;
    }
    claim_.primitive = *primitive;
    // A loop has an output for each place; the pins of a KRU go to those that are used.
    const std::size_t outputs =
        hardware::IsLoop(*primitive) ? request_.outputs.size() : request_.CountOfUsed();
    const std::size_t inputs = request_.inputs.size();
    if (claim_.solved && (outputs > static_cast<std::size_t>(hardware::MostOutputs(*primitive)) ||
                          inputs > static_cast<std::size_t>(hardware::MostInputs(*primitive)))) {
      read_.Refuse(node_, claim_.path, "solved", "false");
      return false;
    }
    return true;
  }

  string PrimitiveNames() const {
    if (request_.primitive) return Quoted(Name(*request_.primitive));
    string names;
    for (const Primitive one : device_.primitives) {
      names += (names.empty() ? "" : " or ") + Quoted(Name(one));
    }
    return names;
  }

  // --- Outputs ----------------------------------------------------------------------------

  void ReadOutputs() {
    const Node* const outputs = read_.Entry(node_, claim_.path, "outputs", NodeType::kArray);
    if (outputs == nullptr) return read_.Refuse(node_, claim_.path, "solved", "false");
    const std::size_t count = request_.outputs.size();
    if (outputs->items.size() < count) {
      return read_.Refuse(node_, claim_.path, "outputs", Entries(count),
                          Entries(outputs->items.size()));
    }
    for (std::size_t i = 0; i < count; ++i) {
      const string path = claim_.path + ".outputs[" + std::to_string(i) + "]";
      const Node& one = outputs->items[i];
      if (one.type != NodeType::kObject) return read_.RefuseType(one, path, NodeType::kObject);
      outputs_.push_back({&one, path, read_.Flag(one, path, "used")});
    }
  }

  // The order in which the outputs say that they stand, if it is one; else that of the note on it.
  PlaceOrder Order() const {
    PlaceOrder order;
    std::vector<int> unused;
    for (std::size_t i = 0; i < request_.outputs.size(); ++i) {
      if (!request_.outputs[i].used) unused.push_back(static_cast<int>(i));
    }
    const PlaceOrder noted = NotedOrder();
    for (std::size_t i = 0; i < outputs_.size(); ++i) {
      int index = -1;
      if (outputs_[i].is_used) {
        index = RequestOf(*outputs_[i].node);
      } else if (!unused.empty()) {
        const int own = noted.empty() ? static_cast<int>(i) : noted[i];
        const auto place = std::find(unused.begin(), unused.end(), own);
        const auto taken = place != unused.end() ? place : unused.begin();
        index = *taken;
        unused.erase(taken);
      }
      const bool is_there = std::find(order.begin(), order.end(), index) != order.end();
      if (index < 0 || is_there) return noted.empty() ? OwnPlaces(request_) : noted;
      order.push_back(index);
    }
    if (!request_.any_order && order != OwnPlaces(request_)) return OwnPlaces(request_);
    return order;
  }

  // The output of the request that an output in use says it is.
  int RequestOf(const Node& output) const {
    const Node* const node = output.Find("request");
    if (node == nullptr || node->type != NodeType::kNumber) return -1;
    const auto number = NumberOf(node->text);
    const auto whole = number ? number->Whole() : std::nullopt;
    const auto count = static_cast<std::int64_t>(request_.outputs.size());
    if (!whole || *whole < 0 || *whole >= count) return -1;
    return request_.outputs[static_cast<std::size_t>(*whole)].used ? static_cast<int>(*whole) : -1;
  }

  // That of the finding `moved`; empty when there is none that is an order.
  PlaceOrder NotedOrder() const {
    const Node* const findings = node_.Find("findings");
    if (findings == nullptr || !request_.any_order) return {};
    for (const Node& one : findings->items) {
      const Node* const kind = one.Find("kind");
      const Node* const outputs = one.Find("outputs");
      if (kind == nullptr || outputs == nullptr || kind->text != "moved") continue;
      PlaceOrder order;
      for (const Node& item : outputs->items) {
        const auto number = item.type == NodeType::kNumber ? NumberOf(item.text) : std::nullopt;
        const auto whole = number ? number->Whole() : std::nullopt;
        if (!whole || *whole < 0 || *whole > 6) return {};
        order.push_back(static_cast<int>(*whole));
      }
      PlaceOrder sorted = order;
      std::sort(sorted.begin(), sorted.end());
      return sorted == OwnPlaces(request_) ? order : PlaceOrder{};
    }
    return {};
  }

  bool IsAsked(std::size_t place) const {
    return request_.outputs[static_cast<std::size_t>(claim_.order[place])].used;
  }

  // --- Settings ---------------------------------------------------------------------------

  void ReadLoop() {
    LoopSettings set;
    set.primitive = claim_.primitive;
    const auto bandwidth =
        Named<Bandwidth>(hardware::kBandwidths, read_.Word(node_, claim_.path, "bandwidth"));
    if (!read_.IsRight()) return;
    if (!bandwidth || (request_.bandwidth && *request_.bandwidth != *bandwidth)) {
      return read_.Refuse(node_, claim_.path, "bandwidth",
                          request_.bandwidth ? Quoted(Name(*request_.bandwidth))
                                             : R"("OPTIMIZED", "LOW" or "HIGH")");
    }
    set.bandwidth = *bandwidth;
    const Node* const settings = read_.Entry(node_, claim_.path, "settings", NodeType::kObject);
    if (settings == nullptr) return;
    const string path = claim_.path + ".settings";
    const bool fractions = hardware::HasFractions(
        set.primitive, static_cast<int>(request_.outputs.size()), request_.whole_divider_0);
    const auto is_m = [&](int eighths) { return hardware::IsM(set.primitive, eighths, fractions); };
    set.m = read_.Count(*settings, path, "m_eighths", 8, 8 * hardware::kLargestM, is_m,
                        fractions ? "8 or 40 to 512" : "8 times a whole M from 1 to 64");
    set.d = read_.Count(*settings, path, "d", 1, hardware::kLargestD);
    for (std::size_t i = 0; i < outputs_.size(); ++i) {
      set.outputs.push_back(IsAsked(i) ? ReadLoopOutput(i, fractions) : LoopOutput{});
    }
    if (set.HasFraction()) RefuseMoves(set);
    claim_.settings = std::move(set);
  }

  LoopOutput ReadLoopOutput(std::size_t i, bool fractions) {
    const Node& node = *outputs_[i].node;
    const string& path = outputs_[i].path;
    LoopOutput set;
    const auto is_divider = [&](int eighths) {
      return hardware::IsDivider(eighths, static_cast<int>(i), fractions,
                                 hardware::kLargestDivider);
    };
    set.divider = read_.Count(
        node, path, "divider_eighths", 8, 8 * hardware::kLargestDivider, is_divider,
        i == 0 && fractions ? "8 or 16 to 1024" : "8 times a whole divider from 1 to 128");
    // A turn either way; and less than a period high.
    set.phase = read_.Count(node, path, "phase_step", -set.divider, set.divider);
    set.high_time = read_.Count(node, path, "high_time", 0, std::max(1, set.divider / 4 - 1));
    return set;
  }

  // Beside a fraction there is nothing to be set of phases and high times.
  void RefuseMoves(const LoopSettings& set) {
    for (std::size_t i = 0; i < set.outputs.size(); ++i) {
      if (set.outputs[i].phase != 0) {
        read_.Refuse(*outputs_[i].node, outputs_[i].path, "phase_step", "0");
      }
      if (set.outputs[i].high_time != 0) {
        read_.Refuse(*outputs_[i].node, outputs_[i].path, "high_time", "0");
      }
    }
  }

  void ReadKru() {
    KruSettings set;
    set.primitive = claim_.primitive;
    const bool is_sp = set.primitive == Primitive::kKruSp;
    const Node* const settings = read_.Entry(node_, claim_.path, "settings", NodeType::kObject);
    if (settings == nullptr) return;
    const string path = claim_.path + ".settings";
    if (is_sp) {
      set.feedback = read_.Flag(*settings, path, "feedback");
      set.divide_by_2 = read_.Flag(*settings, path, "clkin_divide_by_2");
      set.phase_shift = read_.Count(*settings, path, "phase_shift", 0, hardware::kShiftSteps);
    }
    bool has_m = false;
    bool has_divide = false;
    for (std::size_t i = 0; i < outputs_.size(); ++i) {
      set.pins.push_back(IsAsked(i) ? ReadPin(i, set) : hardware::Pin::kNone);
      has_m = has_m || HasM(set.pins.back());
      has_divide = has_divide || HasDivide(set.pins.back());
    }
    if (has_m) {
      const int largest = hardware::LargestKruRatioPart(set.primitive);
      set.m = read_.Count(*settings, path, "m", hardware::kSmallestKruM, largest);
      set.d = read_.Count(*settings, path, "d", 1, largest);
    }
    if (has_divide) {
      set.divide_halves = read_.Count(*settings, path, "divide_halves", 4, is_sp ? 34 : 64);
      const auto is_one = [&](const auto& all) {
        return std::find(all.begin(), all.end(), set.divide_halves) != all.end();
      };
      if (read_.IsRight() &&
          !(is_sp ? is_one(hardware::kClkdvHalves) : is_one(hardware::kClkfxdvHalves))) {
        read_.Refuse(*settings, path, "divide_halves",
                     is_sp ? "4 to 16, or an even number to 34" : "4, 8, 16, 32 or 64");
      }
    }
    if (is_sp && request_.feedback && !set.feedback) {
      read_.Refuse(*settings, path, "feedback", "true");
    }
    claim_.settings = std::move(set);
  }

  hardware::Pin ReadPin(std::size_t i, const KruSettings& set) {
    const Node& node = *outputs_[i].node;
    const string name = read_.Word(node, outputs_[i].path, "pin");
    const bool is_sp = set.primitive == Primitive::kKruSp;
    string names;
    for (const hardware::PinFacts& facts : hardware::kPins) {
      if (!(is_sp ? facts.is_sp : facts.is_clkgen)) continue;
      if (facts.needs_feedback && !set.feedback) continue;
      if (!is_sp && i == 0 && facts.pin != hardware::Pin::kClkfx) continue;
      if (facts.name == name) return facts.pin;
      names += (names.empty() ? "" : " or ") + Quoted(facts.name);
    }
    read_.Refuse(node, outputs_[i].path, "pin", names);
    // That the pin needs the feedback can be what is wrong.
    for (const hardware::PinFacts& facts : hardware::kPins) {
      if (is_sp && facts.name == name && facts.needs_feedback) {
        read_.Refuse(*node_.Find("settings"), claim_.path + ".settings", "feedback", "true");
      }
    }
    return hardware::Pin::kNone;
  }

  struct OutputNode {
    const Node* node;
    string path;
    bool is_used;
  };

  const Request& request_;
  const Device& device_;
  const Node& node_;
  Reader read_;
  Claim claim_;
  std::vector<OutputNode> outputs_;
};

}  // namespace

std::optional<Claim> ReadClaim(const Request& request, const Device& device, const Node& node,
                               const string& path, Discrepancies* discrepancies) {
  if (node.type != NodeType::kObject) {
    discrepancies->push_back(At(node, DiscrepancyKind::kWrongType, path, "object"));
    return std::nullopt;
  }
  return ClaimReader(request, device, node, path, discrepancies).Do();
}

}  // namespace planner::verify
