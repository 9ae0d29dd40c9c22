// Tested by draft_test.cpp.
#include "planner/read/Draft.h"

#include <algorithm>
#include <cstddef>
#include <span>
#include <utility>

#include "planner/read/Letters.h"

namespace planner::read {

namespace {

// Keeps of a demand what holds for all outputs.
void DropEach(Entry<Demand>* entry) {
  if (!*entry) return;
  (*entry)->value.each.clear();
  if (!(*entry)->value.all) entry->reset();
}

template <typename T>
void Take(const Entry<T>& from, Entry<T>* to) {
  if (from) *to = from;
}

// --- Decimal commas ---------------------------------------------------------------------------

// The number that a list of two is with a decimal point, when it looks as if it was meant as one:
// 148,5 or 33,333 or 27,0. With `is_input` the two would be input clocks, which are seldom far
// apart.
std::string DecimalComma(std::string_view text, bool is_input) {
  const std::string_view list = Trimmed(text);
  const std::size_t comma = list.find(',');
  if (comma == std::string_view::npos) return "";
  const std::string_view whole = list.substr(0, comma);
  const std::string_view decimals = list.substr(comma + 1);
  const auto is_bare = [](std::string_view part, std::size_t most) {
    return !part.empty() && part.size() <= most && std::all_of(part.begin(), part.end(), IsDigit);
  };
  // A number of MHz: below 1 GHz, down to 1 Hz.
  if (!is_bare(whole, 3) || !is_bare(decimals, 6)) return "";
  const long first = std::stol(std::string(whole));
  const long second = std::stol(std::string(decimals));
  const bool is_far = is_input
                          ? first > 4 * second || second > 4 * first
                          : first > 20 * second || (decimals.size() == 3 && second > 4 * first);
  if (!is_far && decimals.front() != '0') return "";
  return std::string(whole) + "." + std::string(decimals);
}

// --- A request of a draft -----------------------------------------------------------------

class Finisher {
 public:
  Finisher(const Draft& draft, const Reader& reader, Mistakes* mistakes)
      : draft_(draft), reader_(reader), mistakes_(mistakes) {}

  std::optional<Reading> Finish() {
    Inputs();
    Outputs();
    Switches();
    Choice();
    if (mistakes_->empty()) Missing();
    SortByPlace();
    if (!mistakes_->empty()) return std::nullopt;
    Doubts();
    reading_.device = draft_.device;
    reading_.draft = draft_;
    return std::move(reading_);
  }

 private:
  Mistake& Add(MistakeKind kind, const Place& place) {
    Mistake mistake;
    mistake.kind = kind;
    mistake.place = place;
    return mistakes_->emplace_back(std::move(mistake));
  }

  // Refuses a list that is longer than a primitive has clocks: that of the command, or the one
  // that has most.
  void Limit(std::size_t count, int (*most_of)(Primitive), const Place& place) {
    int most = 0;
    for (const Primitive primitive : hardware::kPrimitives) {
      most = std::max(most, most_of(primitive));
    }
    if (reader_.primitive) most = most_of(*reader_.primitive);
    if (count <= static_cast<std::size_t>(most)) return;
    Mistake& mistake = Add(MistakeKind::kTooMany, place);
    mistake.count = static_cast<int>(count);
    mistake.most = most;
    mistake.primitive = reader_.primitive;
  }

  void Inputs() {
    if (!draft_.inputs) return;
    Limit(draft_.inputs->value.size(), hardware::MostInputs, draft_.inputs->place);
    request().inputs = draft_.inputs->value;
  }

  void Outputs() {
    if (!draft_.outputs) return;
    const Values& frequencies = draft_.outputs->value;
    // The pins of a KRU go to those outputs that are used.
    const bool counts_used = reader_.primitive && !hardware::IsLoop(*reader_.primitive) &&
                             frequencies.size() <= kMostPlaces;
    const auto used = static_cast<std::size_t>(
        std::count_if(frequencies.begin(), frequencies.end(),
                      [](const auto& frequency) { return frequency.has_value(); }));
    Limit(counts_used ? used : frequencies.size(), hardware::MostOutputs, draft_.outputs->place);
    for (const std::optional<Rational>& frequency : frequencies) {
      Output output;
      output.used = frequency.has_value();
      if (frequency) output.frequency = *frequency;
      request().outputs.push_back(std::move(output));
    }
    if (std::none_of(frequencies.begin(), frequencies.end(),
                     [](const auto& frequency) { return frequency.has_value(); })) {
      Add(MistakeKind::kNothingUsed, draft_.outputs->place);
    }
    if (draft_.unasked && reader_.evaluates) {
      for (std::size_t i = 0; i < frequencies.size(); ++i) {
        request().outputs[i].asked = !draft_.unasked->value[i];
      }
    }
    Spread(draft_.phases, &Output::phase);
    Spread(draft_.duties, &Output::duty);
    // No divider makes a clock without an edge: 0 asks for nothing.
    for (Output& output : request().outputs) {
      if (output.duty && *output.duty == 0) output.duty.reset();
    }
    Spread(draft_.tolerance, &Output::tolerance, &request().tolerance);
    Spread(draft_.phase_tolerance, &Output::phase_tolerance, &request().phase_tolerance);
    Spread(draft_.duty_tolerance, &Output::duty_tolerance, &request().duty_tolerance);
    Spread(draft_.max_jitter, &Output::max_jitter, &request().max_jitter);
  }

  // Whether a list has an entry for each output.
  bool Fits(std::size_t count, const Place& place) {
    const std::size_t outputs = request().outputs.size();
    if (count == outputs) return true;
    Mistake& mistake = Add(MistakeKind::kCountDiffers, place);
    mistake.count = static_cast<int>(count);
    mistake.most = static_cast<int>(outputs);
    if (count == 1) {
      mistake.other = draft_.outputs->place.entry + " " + draft_.outputs->text;
      mistake.hint = DecimalComma(draft_.outputs->text, false);
    }
    return false;
  }

  void SpreadEach(const Values& values, std::optional<Rational> Output::*member) {
    for (std::size_t i = 0; i < values.size(); ++i) request().outputs[i].*member = values[i];
  }

  void Spread(const Entry<Values>& entry, std::optional<Rational> Output::*member) {
    if (entry && Fits(entry->value.size(), entry->place)) SpreadEach(entry->value, member);
  }

  template <typename All>
  void Spread(const Entry<Demand>& entry, std::optional<Rational> Output::*member, All* all) {
    if (!entry) return;
    if (entry->value.all) *all = *entry->value.all;
    const Values& each = entry->value.each;
    if (!each.empty() && Fits(each.size(), entry->place)) SpreadEach(each, member);
  }

  static bool IsSet(const Entry<bool>& entry) { return entry && entry->value; }

  void Switches() {
    request().feedback = IsSet(draft_.feedback);
    request().whole_divider_0 = IsSet(draft_.int_div0);
    request().prefer_max_vco = IsSet(draft_.prefer_max_vco);
    request().any_order = IsSet(draft_.any_order);
    request().engine_only = IsSet(draft_.engine);
    if (draft_.input_jitter) request().input_jitter = draft_.input_jitter->value;
    if (draft_.input_tolerance) request().input_tolerance = draft_.input_tolerance->value;
    if (IsSet(draft_.exact)) Exact();
    if (draft_.bandwidth) request().bandwidth = draft_.bandwidth->value;
    if (IsSet(draft_.low_bandwidth)) {
      if (request().bandwidth && *request().bandwidth != Bandwidth::kLow) {
        Contradicts(draft_.low_bandwidth->place, draft_.bandwidth->place,
                    std::string(Name(*request().bandwidth)));
      }
      request().bandwidth = Bandwidth::kLow;
    }
  }

  void Exact() {
    if (draft_.tolerance) {
      const Demand& tolerance = draft_.tolerance->value;
      // Outputs of a file can have tolerances of their own beside it.
      const bool has_list = draft_.tolerance->place.file.empty() && !tolerance.each.empty();
      if (has_list || (tolerance.all && *tolerance.all != 0)) {
        Contradicts(draft_.exact->place, draft_.tolerance->place, draft_.tolerance->text);
      }
    }
    request().tolerance = 0;
  }

  void Contradicts(const Place& place, const Place& other, std::string text) {
    Mistake& mistake = Add(MistakeKind::kContradiction, place);
    mistake.other = other.entry;
    mistake.text = std::move(text);
  }

  // The primitive, and how answers are ranked.
  void Choice() {
    if (draft_.primitive) request().primitive = draft_.primitive->value;
    if (reader_.primitive) {
      if (request().primitive && *request().primitive != *reader_.primitive) {
        Mistake& mistake = Add(MistakeKind::kOtherPrimitive, draft_.primitive->place);
        mistake.text = Name(*request().primitive);
        mistake.primitive = reader_.primitive;
      }
      request().primitive = reader_.primitive;
    }
    if (draft_.rank) {
      request().rank = draft_.rank->value;
    } else if (request().prefer_max_vco) {
      request().rank = Rank::kVco;
    }
  }

  void Missing() {
    for (const auto& [is_there, name] :
         {std::pair{draft_.inputs.has_value(), "--in"}, {draft_.outputs.has_value(), "--out"}}) {
      if (is_there) continue;
      Place place;
      place.file = reader_.file;
      place.entry = name;
      Add(MistakeKind::kMissing, place);
      // Of a file all is told that it does not say; who has not said anything sees an example.
      if (!place.IsInFile()) return;
    }
  }

  // Options as they come, and then files from their beginning on.
  void SortByPlace() {
    std::stable_sort(mistakes_->begin(), mistakes_->end(),
                     [](const Mistake& one, const Mistake& other) {
                       const auto key = [](const Mistake& mistake) {
                         const Place& place = mistake.place;
                         return std::pair(place.line, place.column);
                       };
                       return key(one) < key(other);
                     });
  }

  void Doubts() {
    const auto look = [this](const auto& entry, bool is_input) {
      const std::string meant = DecimalComma(entry->text, is_input);
      if (meant.empty()) return;
      reading_.doubts.push_back({DoubtKind::kDecimalComma, entry->place, entry->text, meant});
    };
    look(draft_.inputs, true);
    look(draft_.outputs, false);
    DoubtJitter();
    DoubtDuties();
  }

  // A clock whose edges move by more than its period is none.
  void DoubtJitter() {
    constexpr int kPicoseconds = 1'000'000;  // in a period of 1 MHz
    constexpr int kDecimals = 3;
    if (!draft_.input_jitter) return;
    const std::vector<Rational>& inputs = request().inputs;
    const Rational shortest = kPicoseconds / *std::max_element(inputs.begin(), inputs.end());
    const Rational& jitter = draft_.input_jitter->value;
    if (jitter <= shortest) return;
    reading_.doubts.push_back({DoubtKind::kJitterAbovePeriod, draft_.input_jitter->place,
                               Written(jitter), shortest.Fixed(kDecimals)});
  }

  // Of several, a 0 leaves one out; alone it looks like a duty cycle.
  void DoubtDuties() {
    if (!draft_.duties) return;
    const Values& duties = draft_.duties->value;
    const bool are_none = std::all_of(duties.begin(), duties.end(),
                                      [](const auto& duty) { return duty && *duty == 0; });
    if (are_none) reading_.doubts.push_back({DoubtKind::kNoDuty, draft_.duties->place, "", ""});
  }

  Request& request() { return reading_.request; }

  const Draft& draft_;
  const Reader& reader_;
  Mistakes* mistakes_;
  Reading reading_;
};

}  // namespace

Draft Over(const Draft& options, const Draft& file) {
  Draft all = file;
  if (options.outputs) {
    all.unasked.reset();
    all.phases.reset();
    all.duties.reset();
    for (Entry<Demand>* demand :
         {&all.tolerance, &all.phase_tolerance, &all.duty_tolerance, &all.max_jitter}) {
      DropEach(demand);
    }
  }
  // Two ways to say one thing: of the file neither counts beside one of them.
  if (options.bandwidth || options.low_bandwidth) {
    all.bandwidth.reset();
    all.low_bandwidth.reset();
  }
  if (options.tolerance || options.exact) {
    all.tolerance.reset();
    all.exact.reset();
  }
  Take(options.device, &all.device);
  Take(options.primitive, &all.primitive);
  Take(options.inputs, &all.inputs);
  Take(options.outputs, &all.outputs);
  Take(options.unasked, &all.unasked);
  Take(options.phases, &all.phases);
  Take(options.duties, &all.duties);
  Take(options.tolerance, &all.tolerance);
  Take(options.phase_tolerance, &all.phase_tolerance);
  Take(options.duty_tolerance, &all.duty_tolerance);
  Take(options.max_jitter, &all.max_jitter);
  Take(options.input_jitter, &all.input_jitter);
  Take(options.input_tolerance, &all.input_tolerance);
  Take(options.bandwidth, &all.bandwidth);
  Take(options.rank, &all.rank);
  Take(options.low_bandwidth, &all.low_bandwidth);
  Take(options.exact, &all.exact);
  Take(options.feedback, &all.feedback);
  Take(options.prefer_max_vco, &all.prefer_max_vco);
  Take(options.int_div0, &all.int_div0);
  Take(options.engine, &all.engine);
  Take(options.any_order, &all.any_order);
  return all;
}

Draft WithoutChoices(Draft draft) {
  draft.primitive.reset();
  draft.bandwidth.reset();
  draft.low_bandwidth.reset();
  draft.feedback.reset();
  draft.rank.reset();
  draft.prefer_max_vco.reset();
  draft.int_div0.reset();
  draft.engine.reset();
  draft.any_order.reset();
  return draft;
}

std::optional<Reading> Finish(const Draft& draft, const Reader& reader, Mistakes* mistakes) {
  return Finisher(draft, reader, mistakes).Finish();
}

}  // namespace planner::read
