// Tested by options_test.cpp.
#include "planner/read/Options.h"

#include <algorithm>
#include <array>
#include <cstddef>
#include <utility>

#include "planner/read/Letters.h"
#include "planner/read/Names.h"

namespace planner::read {

namespace {

constexpr std::array<OptionFacts, 21> kOptions = {{
    {"--in", "F[,F2]", ValueKind::kFrequency, true},
    {"--out", "LIST", ValueKind::kFrequency, true},
    {"--phase", "LIST", ValueKind::kPhase, true},
    {"--duty", "LIST", ValueKind::kDuty, true},
    {"--any-order", "", {}},
    {"--device", "NAME", {}},
    {"--primitive", "NAME", {}},
    {"--engine", "", {}},
    {"--bandwidth", "NAME", {}},
    {"--low-bandwidth", "", {}},
    {"--rank", "NAME", {}},
    {"--prefer-max-vco", "", {}},
    {"--int-div0", "", {}},
    {"--feedback", "", {}},
    {"--input-jitter", "PS", ValueKind::kJitter},
    {"--input-tolerance", "PPM", ValueKind::kInputTolerance},
    {"--tolerance", "PPM", ValueKind::kTolerance, true},
    {"--exact", "", {}},
    {"--phase-tolerance", "DEG", ValueKind::kPhaseTolerance, true},
    {"--duty-tolerance", "POINTS", ValueKind::kDutyTolerance, true},
    {"--max-jitter", "PS", ValueKind::kMaxJitter, true},
}};

std::span<const OptionFacts> Options() { return kOptions; }

Place OfOption(std::string_view name) {
  Place place;
  place.entry = name;
  return place;
}

// --- Reading --------------------------------------------------------------------------------

class OptionReader {
 public:
  explicit OptionReader(Mistakes* mistakes) : mistakes_(mistakes) {}

  void Read(const OptionFacts& facts, const std::string& value) {
    place_ = OfOption(facts.name);
    value_ = value;
    if (facts.placeholder.empty()) {
      ReadSwitch(facts.name);
    } else if (facts.kind && facts.is_list) {
      ReadList(facts);
    } else if (facts.kind) {
      ReadOne(facts);
    } else {
      ReadName(facts.name);
    }
  }

  Draft& draft() { return draft_; }

 private:
  void ReadSwitch(std::string_view name) {
    const bool is_set = value_.empty() || value_ == "1" || IsSameWord(value_, "true");
    if (!is_set && value_ != "0" && !IsSameWord(value_, "false")) {
      Mistake mistake;
      mistake.kind = MistakeKind::kNotASwitch;
      mistake.place = place_;
      mistake.text = value_;
      mistakes_->push_back(std::move(mistake));
      return;
    }
    const std::pair<std::string_view, Entry<bool> Draft::*> switches[] = {
        {"--any-order", &Draft::any_order},
        {"--engine", &Draft::engine},
        {"--low-bandwidth", &Draft::low_bandwidth},
        {"--prefer-max-vco", &Draft::prefer_max_vco},
        {"--int-div0", &Draft::int_div0},
        {"--feedback", &Draft::feedback},
        {"--exact", &Draft::exact}};
    for (const auto& [switch_name, member] : switches) {
      if (switch_name == name) draft_.*member = {is_set, place_, value_};
    }
  }

  void ReadOne(const OptionFacts& facts) {
    const auto value = ReadValue(value_, *facts.kind, place_, mistakes_);
    if (!value) return;
    const bool is_jitter = facts.name == "--input-jitter";
    (is_jitter ? draft_.input_jitter : draft_.input_tolerance) = {*value, place_, value_};
  }

  void ReadList(const OptionFacts& facts) {
    const bool is_input = facts.name == "--in";
    std::optional<Values> values = ReadValues(value_, *facts.kind, place_, !is_input, mistakes_);
    if (!values) return;
    if (is_input) {
      std::vector<Rational> inputs;
      for (const auto& value : *values) inputs.push_back(*value);
      draft_.inputs = {std::move(inputs), place_, value_};
      return;
    }
    const std::pair<std::string_view, Entry<Values> Draft::*> lists[] = {
        {"--out", &Draft::outputs}, {"--phase", &Draft::phases}, {"--duty", &Draft::duties}};
    for (const auto& [name, member] : lists) {
      if (name == facts.name) draft_.*member = {*values, place_, value_};
    }
    const std::pair<std::string_view, Entry<Demand> Draft::*> demands[] = {
        {"--tolerance", &Draft::tolerance},
        {"--phase-tolerance", &Draft::phase_tolerance},
        {"--duty-tolerance", &Draft::duty_tolerance},
        {"--max-jitter", &Draft::max_jitter}};
    for (const auto& [name, member] : demands) {
      if (name == facts.name) draft_.*member = {DemandOf(*values), place_, value_};
    }
  }

  // A single value is for all outputs, a list has one for each.
  static Demand DemandOf(const Values& values) {
    if (values.size() == 1 && values[0]) return {values[0], {}};
    return {std::nullopt, values};
  }

  void ReadName(std::string_view name) {
    if (name == "--device") {
      draft_.device = {value_, place_, value_};
    } else if (name == "--primitive") {
      draft_.primitive = ReadPrimitive(value_, place_, mistakes_);
    } else if (name == "--bandwidth") {
      draft_.bandwidth = ReadBandwidth(value_, place_, mistakes_);
    } else {
      draft_.rank = ReadRank(value_, place_, mistakes_);
    }
  }

  Mistakes* mistakes_;
  Draft draft_;
  Place place_;
  std::string value_;
};

// --- Writing ----------------------------------------------------------------------------------

std::string Written(const Values& values) {
  std::string text;
  for (const auto& value : values) {
    if (!text.empty()) text += ",";
    text += value ? planner::read::Written(*value) : "-";
  }
  return text;
}

class OptionWriter {
 public:
  explicit OptionWriter(const Draft& draft) : draft_(draft) {}

  std::vector<Option> Write() {
    Inputs();
    List("--out", draft_.outputs);
    List("--phase", draft_.phases);
    List("--duty", draft_.duties);
    Switch("--any-order", draft_.any_order);
    if (draft_.device) Add("--device", draft_.device->value);
    if (draft_.primitive) {
      const std::optional<Primitive>& primitive = draft_.primitive->value;
      Add("--primitive", draft_.primitive->text,
          primitive ? std::string(Name(*primitive)) : "auto");
    }
    Switch("--engine", draft_.engine);
    if (draft_.bandwidth) {
      Add("--bandwidth", draft_.bandwidth->text, std::string(Name(draft_.bandwidth->value)));
    }
    Switch("--low-bandwidth", draft_.low_bandwidth);
    if (draft_.rank) Add("--rank", draft_.rank->text, std::string(NameOf(draft_.rank->value)));
    Switch("--prefer-max-vco", draft_.prefer_max_vco);
    Switch("--int-div0", draft_.int_div0);
    Switch("--feedback", draft_.feedback);
    if (draft_.input_jitter) {
      Add("--input-jitter", draft_.input_jitter->text,
          planner::read::Written(draft_.input_jitter->value));
    }
    if (draft_.input_tolerance) {
      Add("--input-tolerance", draft_.input_tolerance->text,
          planner::read::Written(draft_.input_tolerance->value));
    }
    Tolerance();
    Demands("--phase-tolerance", draft_.phase_tolerance);
    Demands("--duty-tolerance", draft_.duty_tolerance);
    Demands("--max-jitter", draft_.max_jitter);
    return std::move(options_);
  }

 private:
  void Add(std::string name, std::string value) {
    options_.push_back({std::move(name), std::move(value)});
  }
  // In the words of the user, where these are known.
  void Add(std::string name, const std::string& text, std::string value) {
    Add(std::move(name), text.empty() ? std::move(value) : text);
  }

  void Inputs() {
    if (!draft_.inputs) return;
    const std::vector<Rational>& inputs = draft_.inputs->value;
    Add("--in", draft_.inputs->text, Written(Values(inputs.begin(), inputs.end())));
  }

  void List(std::string name, const Entry<Values>& entry) {
    if (entry) Add(std::move(name), entry->text, Written(entry->value));
  }

  void Switch(std::string name, const Entry<bool>& entry) {
    if (entry && entry->value) Add(std::move(name), "");
  }

  void Demands(std::string name, const Entry<Demand>& entry) {
    if (!entry) return;
    const Demand& demand = entry->value;
    Values values = demand.each;
    if (values.empty()) {
      values.push_back(demand.all);
    } else {
      for (auto& value : values) {
        if (!value) value = demand.all;
      }
    }
    Add(std::move(name), entry->text, Written(values));
  }

  void Tolerance() {
    const bool is_exact = draft_.exact && draft_.exact->value;
    Entry<Demand> tolerance = draft_.tolerance;
    if (is_exact && tolerance && !tolerance->value.each.empty()) {
      // A file can say of single outputs that they may be off; one list says the same.
      tolerance->value.all = 0;
      Demands("--tolerance", tolerance);
      return;
    }
    Demands("--tolerance", tolerance);
    Switch("--exact", draft_.exact);
  }

  const Draft& draft_;
  std::vector<Option> options_;
};

// --- Drafts of requests -----------------------------------------------------------------

template <typename T>
void Say(Entry<T>* entry, T value) {
  *entry = {std::move(value), Place{}, ""};
}

void SaySwitch(Entry<bool>* entry, bool is_set) {
  if (is_set) Say(entry, true);
}

// The members of the outputs as a list, nothing when all are empty.
void SayEach(const Request& request, std::optional<Rational> Output::*member,
             Entry<Values>* entry) {
  Values values;
  for (const Output& output : request.outputs) {
    values.push_back(output.used ? output.*member : std::nullopt);
  }
  if (std::any_of(values.begin(), values.end(), [](const auto& value) { return value; })) {
    Say(entry, std::move(values));
  }
}

void SayDemand(const Request& request, std::optional<Rational> Output::*member,
               const std::optional<Rational>& all, const std::optional<Rational>& usual,
               Entry<Demand>* entry) {
  Entry<Values> each;
  SayEach(request, member, &each);
  const bool is_usual = all == usual;
  if (is_usual && !each) return;
  Say(entry, Demand{is_usual ? std::nullopt : all, each ? each->value : Values{}});
}

Draft DraftOf(const Request& request) {
  const Request usual;
  Draft draft;
  Say(&draft.inputs, request.inputs);
  Values frequencies;
  for (const Output& output : request.outputs) {
    frequencies.push_back(output.used ? std::optional(output.frequency) : std::nullopt);
  }
  Say(&draft.outputs, std::move(frequencies));
  SayEach(request, &Output::phase, &draft.phases);
  SayEach(request, &Output::duty, &draft.duties);
  SaySwitch(&draft.any_order, request.any_order);
  if (request.primitive) Say(&draft.primitive, request.primitive);
  SaySwitch(&draft.engine, request.engine_only);
  if (request.bandwidth) Say(&draft.bandwidth, *request.bandwidth);
  const Rank rank = request.prefer_max_vco ? Rank::kVco : usual.rank;
  if (request.rank != rank) Say(&draft.rank, request.rank);
  SaySwitch(&draft.prefer_max_vco, request.prefer_max_vco);
  SaySwitch(&draft.int_div0, request.whole_divider_0);
  SaySwitch(&draft.feedback, request.feedback);
  if (request.input_jitter != usual.input_jitter) Say(&draft.input_jitter, request.input_jitter);
  if (request.input_tolerance != usual.input_tolerance) {
    Say(&draft.input_tolerance, request.input_tolerance);
  }
  SayDemand(request, &Output::tolerance, request.tolerance, usual.tolerance, &draft.tolerance);
  SayDemand(request, &Output::phase_tolerance, request.phase_tolerance, usual.phase_tolerance,
            &draft.phase_tolerance);
  SayDemand(request, &Output::duty_tolerance, request.duty_tolerance, usual.duty_tolerance,
            &draft.duty_tolerance);
  SayDemand(request, &Output::max_jitter, request.max_jitter, usual.max_jitter, &draft.max_jitter);
  return draft;
}

}  // namespace

std::span<const OptionFacts> RequestOptions() { return Options(); }

const OptionFacts* FindOption(std::string_view name) {
  for (const OptionFacts& facts : Options()) {
    if (facts.name == name) return &facts;
  }
  return nullptr;
}

Draft ReadOptions(std::span<const Option> options, Mistakes* mistakes) {
  OptionReader reader(mistakes);
  std::vector<std::string_view> seen;
  for (const Option& option : options) {
    Mistake mistake;
    const OptionFacts* facts = FindOption(option.name);
    if (!facts) {
      mistake.kind = MistakeKind::kUnknownOption;
      mistake.text = option.name;
      for (const OptionFacts& known : Options()) mistake.known.emplace_back(known.name);
      mistakes->push_back(std::move(mistake));
    } else if (std::find(seen.begin(), seen.end(), facts->name) != seen.end()) {
      mistake.kind = MistakeKind::kTwice;
      mistake.place = OfOption(facts->name);
      mistakes->push_back(std::move(mistake));
    } else {
      seen.push_back(facts->name);
      reader.Read(*facts, option.value);
    }
  }
  return std::move(reader.draft());
}

std::vector<Option> OptionsOf(const Draft& draft) { return OptionWriter(draft).Write(); }
std::vector<Option> OptionsOf(const Request& request) { return OptionsOf(DraftOf(request)); }

}  // namespace planner::read
