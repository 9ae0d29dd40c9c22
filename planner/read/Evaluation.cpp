// Settings of the user's own, held against what the primitive can be set to, and the request that
// they are to be compared with.
//
// Tested by settings_test.cpp.
#include <algorithm>
#include <cstddef>
#include <utility>

#include "hardware/Kru.h"
#include "hardware/Loop.h"
#include "planner/read/Settings.h"

namespace planner::read {

namespace {

using hardware::kEighths;
using hardware::Pin;

constexpr int kLargestAnything = 1'000'000;

// A whole number that fits; nothing else.
std::optional<int> Whole(const Rational& value) {
  const auto whole = value.Whole();
  if (!whole || *whole > kLargestAnything || *whole < -kLargestAnything) return std::nullopt;
  return static_cast<int>(*whole);
}

class Finisher {
 public:
  Finisher(const Draft& draft, const SettingsDraft& settings, const Device& device,
           Mistakes* mistakes)
      : draft_(draft),
        said_(settings),
        device_(device),
        primitive_(PrimitiveOf(draft, settings, device)),
        mistakes_(*mistakes) {}

  std::optional<Evaluation> Finish() {
    const bool is_loop = hardware::IsLoop(primitive_);
    if (!draft_.inputs) Missing("--in", "the input frequency, such as --in 100");
    RefuseOthers(is_loop);
    if (mistakes_.empty()) {
      Count(is_loop);
      if (is_loop) {
        Loop();
      } else {
        Kru();
      }
    }
    if (!mistakes_.empty()) return std::nullopt;
    return Compared();
  }

 private:
  // --- Mistakes ---------------------------------------------------------------------------

  static Place OfOption(std::string_view name) {
    Place place;
    place.entry = name;
    return place;
  }

  Mistake& Add(MistakeKind kind, const Place& place) {
    Mistake mistake;
    mistake.kind = kind;
    mistake.place = place;
    mistake.primitive = primitive_;
    return mistakes_.emplace_back(std::move(mistake));
  }

  void Missing(std::string_view option, std::string what) {
    Add(MistakeKind::kMissing, OfOption(option)).hint = std::move(what);
  }

  // `value` is no `what` of the primitive, which is `right`.
  void Refuse(const Place& place, std::string value, std::string what, std::string right) {
    Mistake& mistake = Add(MistakeKind::kNoSetting, place);
    mistake.text = std::move(value);
    mistake.other = std::move(what);
    mistake.hint = std::move(right);
  }

  std::string Of(std::string_view what) const {
    return std::string(what) + " of a " + std::string(Name(primitive_));
  }

  // What another primitive has. What a plan says beside its settings has no say.
  void RefuseOthers(bool is_loop) {
    const auto refuse = [&](const auto& entry) {
      if (entry) Add(MistakeKind::kNotOfPrimitive, entry->place);
    };
    if (is_loop) {
      refuse(said_.pins);
      refuse(said_.divide_by_2);
      refuse(said_.phase_shift);
      if (draft_.feedback && draft_.feedback->value) refuse(draft_.feedback);
      if (said_.feedback && said_.feedback->value) refuse(said_.feedback);
      return;
    }
    refuse(said_.phase_steps);
    refuse(said_.phases);
    refuse(said_.high_times);
    refuse(said_.duties);
    refuse(draft_.bandwidth);
    refuse(draft_.low_bandwidth);
    refuse(said_.bandwidth);
    if (primitive_ == Primitive::kKruSp) return;
    refuse(said_.phase_shift);
    if (said_.divide_by_2 && said_.divide_by_2->value) refuse(said_.divide_by_2);
    if (draft_.feedback && draft_.feedback->value) refuse(draft_.feedback);
  }

  // --- How many outputs there are, and which are used -----------------------------------------

  void Count(bool is_loop) {
    if (is_loop && said_.dividers) {
      for (const auto& divider : said_.dividers->value) used_.push_back(divider.has_value());
      place_ = said_.dividers->place;
    } else if (!is_loop && said_.pins) {
      for (const std::string& pin : said_.pins->value) used_.push_back(pin != "-");
      place_ = said_.pins->place;
    } else {
      is_loop ? Missing("--divide", "the divider of each output, such as --divide 8,16")
              : Missing("--pins", "the pin of each output, such as --pins CLKFX,CLK0");
      return;
    }
    const int most = hardware::MostOutputs(primitive_);
    if (static_cast<int>(used_.size()) > most) {
      Refuse(place_, std::to_string(used_.size()), Of("number of outputs"),
             "it has at most " + std::to_string(most));
    }
    if (std::none_of(used_.begin(), used_.end(), [](bool one) { return one; })) {
      Add(MistakeKind::kNothingUsed, place_);
    }
    if (!draft_.outputs) return;
    if (!Fits(draft_.outputs->value.size(), place_)) return;
    for (std::size_t i = 0; i < used_.size(); ++i) {
      if (!draft_.outputs->value[i] || used_[i]) continue;
      Mistake& mistake = Add(MistakeKind::kUnset, place_);
      mistake.count = static_cast<int>(i);
      mistake.other = is_loop ? "divider" : "pin";
    }
  }

  // Whether a list of the settings is as long as that of the outputs.
  bool Fits(std::size_t outputs, const Place& place) {
    if (outputs == used_.size()) return true;
    Mistake& mistake = Add(MistakeKind::kCountDiffers, place);
    mistake.count = static_cast<int>(used_.size());
    mistake.most = static_cast<int>(outputs);
    return false;
  }

  // A list with an entry for each output.
  bool IsComplete(const Entry<Values>& entry) {
    if (!entry) return false;
    if (entry->value.size() == used_.size()) return true;
    Mistake& mistake = Add(MistakeKind::kCountDiffers, entry->place);
    mistake.count = static_cast<int>(entry->value.size());
    mistake.most = static_cast<int>(used_.size());
    return false;
  }

  // A whole number from the lowest to the highest; the lowest where it is none, or missing.
  int Bounded(const Entry<Rational>& entry, int lowest, int highest, std::string_view option,
              std::string_view what) {
    if (!entry) {
      Missing(option,
              "of the settings, such as " + std::string(option) + " " + std::to_string(lowest));
      return lowest;
    }
    const auto whole = Whole(entry->value);
    if (whole && *whole >= lowest && *whole <= highest) return *whole;
    Refuse(
        entry->place, Written(entry->value), Of(what),
        "it is a whole number from " + std::to_string(lowest) + " to " + std::to_string(highest));
    return lowest;
  }

  // --- PLL and TSYN -----------------------------------------------------------------------

  void Loop() {
    LoopSettings set;
    set.primitive = primitive_;
    set.bandwidth = Bandwidth::kOptimized;
    if (said_.bandwidth) set.bandwidth = said_.bandwidth->value;
    if (draft_.bandwidth) set.bandwidth = draft_.bandwidth->value;
    if (draft_.low_bandwidth && draft_.low_bandwidth->value) set.bandwidth = Bandwidth::kLow;
    fractions_ = hardware::HasFractions(primitive_, static_cast<int>(used_.size()), false);
    set.m = M();
    set.d = Bounded(said_.d, 1, hardware::kLargestD, "--d", "D");
    if (!mistakes_.empty()) return;
    for (std::size_t i = 0; i < used_.size(); ++i) set.outputs.push_back({Divider(i)});
    if (!mistakes_.empty()) return;
    Phases(&set);
    HighTimes(&set);
    settings_ = std::move(set);
  }

  int M() {
    if (!said_.m) {
      Missing("--m", "of the settings, such as --m 44");
      return 0;
    }
    const auto eighths = Whole(said_.m->value * kEighths);
    if (eighths && hardware::IsM(primitive_, *eighths, fractions_)) return *eighths;
    const std::string most = std::to_string(hardware::kLargestM);
    const bool is_tsyn = primitive_ == Primitive::kTsyn;
    std::string right = "it is a whole number from 1 to " + most;
    if (is_tsyn) {
      right = "it is 1, or " + std::to_string(hardware::kSmallestTsynM) + " to " + most +
              (fractions_ ? " in steps of 1/8" : " as a whole number");
    }
    Refuse(said_.m->place, Written(said_.m->value), Of("M"), std::move(right));
    return 0;
  }

  int Divider(std::size_t i) {
    if (!used_[i]) return 0;
    const Rational& value = *said_.dividers->value[i];
    const auto eighths = Whole(value * kEighths);
    const int output = static_cast<int>(i);
    if (eighths && hardware::IsDivider(*eighths, output, fractions_, hardware::kLargestDivider)) {
      return *eighths;
    }
    const std::string most = std::to_string(hardware::kLargestDivider);
    Refuse(said_.dividers->place, Written(value), Of("divider of output " + std::to_string(i)),
           fractions_ && i == 0 ? "it is 1, or 2 to " + most + " in steps of 1/8"
                                : "it is a whole number from 1 to " + most);
    return 0;
  }

  // Whether the same is said twice, in counts and in numbers.
  bool Contradicts(const Entry<Values>& counts, const Entry<Values>& numbers) {
    if (!counts || !numbers) return false;
    Mistake& mistake = Add(MistakeKind::kContradiction, numbers->place);
    mistake.other = counts->place.entry;
    mistake.text = counts->text;
    return true;
  }

  void Phases(LoopSettings* set) {
    if (Contradicts(said_.phase_steps, said_.phases)) return;
    const Entry<Values>& entry = said_.phases ? said_.phases : said_.phase_steps;
    if (!IsComplete(entry)) return;
    for (std::size_t i = 0; i < used_.size(); ++i) {
      const auto& value = entry->value[i];
      if (!used_[i] || !value || *value == Rational(0)) continue;
      const int divider = set->outputs[i].divider;
      const Rational steps = said_.phases ? *value * divider / 360 : *value;
      const auto step = Whole(steps);
      const std::string what = "phase of output " + std::to_string(i);
      if (set->HasFraction()) {
        Refuse(entry->place, Written(*value), what,
               "beside a fraction of M or of the divider of output 0 all phases are 0");
      } else if (said_.phases && !step) {
        const int below = *Whole(steps.Floor());
        Refuse(entry->place, Written(*value), what,
               "the nearest steps are " + Written(hardware::PhaseOfStep(below, divider)) + " and " +
                   Written(hardware::PhaseOfStep(below + 1, divider)) + " degrees");
      } else if (!step || *step > divider || *step < -divider) {
        Refuse(entry->place, Written(*value), what,
               "it is a whole number of eighths of a VCO period, at most a turn, " +
                   std::to_string(divider) + ", either way");
      } else {
        set->outputs[i].phase = *step;
      }
    }
  }

  void HighTimes(LoopSettings* set) {
    if (Contradicts(said_.high_times, said_.duties)) return;
    const Entry<Values>& entry = said_.duties ? said_.duties : said_.high_times;
    if (!IsComplete(entry)) return;
    for (std::size_t i = 0; i < used_.size(); ++i) {
      const auto& value = entry->value[i];
      if (!used_[i] || !value) continue;
      // Not set: 50 percent.
      if (said_.duties ? *value == Rational(50) && set->HasFraction() : *value == Rational(0)) {
        continue;
      }
      HighTime(i, *value, entry->place, set);
    }
  }

  void HighTime(std::size_t i, const Rational& value, const Place& place, LoopSettings* set) {
    const std::string what =
        (said_.duties ? "duty cycle of output " : "high time of output ") + std::to_string(i);
    if (set->HasFraction()) {
      return Refuse(place, Written(value), what,
                    "beside a fraction of M or of the divider of output 0 all duty cycles are 50 "
                    "percent");
    }
    const int divider = set->outputs[i].divider / kEighths;
    const hardware::HighTimes times = TimesOf(divider);
    const Rational halves = said_.duties ? value * divider / 50 : value;
    const auto high = Whole(halves);
    if (high && *high >= times.shortest && *high <= times.longest) {
      set->outputs[i].high_time = *high;
      return;
    }
    if (!said_.duties) {
      return Refuse(place, Written(value), what,
                    "behind a divider of " + std::to_string(divider) + " it is " +
                        std::to_string(times.shortest) + " to " + std::to_string(times.longest) +
                        " halves of a VCO period");
    }
    const int below = std::clamp(*Whole(halves.Floor()), times.shortest, times.longest);
    const int above = std::clamp(below + 1, times.shortest, times.longest);
    const std::string first = Written(hardware::DutyOfHighTime(below, divider));
    const std::string second = Written(hardware::DutyOfHighTime(above, divider));
    const bool is_short = halves < Rational(times.shortest);
    const bool is_outside = is_short || halves > Rational(times.longest);
    Refuse(place, Written(value), what,
           first == second || is_outside
               ? "the nearest is " + (is_short ? first : second) + " percent"
               : "the nearest are " + first + " and " + second + " percent");
  }

  // What the counters of the device can do; behind a divider that these cannot make, any time.
  hardware::HighTimes TimesOf(int divider) const {
    const int count = device_.Loop(primitive_).max_count;
    if (divider > hardware::LargestDivider(count)) return {1, 2 * divider - 1};
    return hardware::HighTimesOf(divider, count);
  }

  // --- KRU --------------------------------------------------------------------------------

  void Kru() {
    if (!mistakes_.empty()) return;
    KruSettings set;
    set.primitive = primitive_;
    set.feedback =
        (said_.feedback && said_.feedback->value) || (draft_.feedback && draft_.feedback->value);
    set.divide_by_2 = said_.divide_by_2 && said_.divide_by_2->value;
    for (std::size_t i = 0; i < used_.size(); ++i) {
      set.pins.push_back(used_[i] ? PinOf(i, set.feedback) : Pin::kNone);
    }
    if (!mistakes_.empty()) return;
    const auto any = [&](auto holds) {
      return std::any_of(set.pins.begin(), set.pins.end(), [&](Pin pin) {
        return pin != Pin::kNone && holds(hardware::FactsOf(pin).source);
      });
    };
    using hardware::PinSource;
    const bool is_sp = primitive_ == Primitive::kKruSp;
    if (any([](PinSource source) {
          return source == PinSource::kSynthesiser || source == PinSource::kDividedSynthesiser;
        })) {
      const int largest = hardware::LargestKruRatioPart(primitive_);
      set.m = Bounded(said_.m, hardware::kSmallestKruM, largest, "--m", "M");
      set.d = Bounded(said_.d, 1, largest, "--d", "D");
    }
    if (any([](PinSource source) {
          return source == PinSource::kDivider || source == PinSource::kDividedSynthesiser;
        })) {
      set.divide_halves = is_sp
                              ? DivideOf("CLKDV", hardware::kClkdvHalves,
                                         "2 to 8 in steps of 0.5, or 9 to 17 as a whole number")
                              : DivideOf("CLKFXDV", hardware::kClkfxdvHalves, "2, 4, 8, 16 or 32");
    }
    if (said_.phase_shift) {
      set.phase_shift =
          Bounded(said_.phase_shift, 0, hardware::kShiftSteps, "--phase-shift", "PHASE_SHIFT");
    }
    settings_ = std::move(set);
  }

  Pin PinOf(std::size_t i, bool feedback) {
    const std::string& name = said_.pins->value[i];
    const bool is_sp = primitive_ == Primitive::kKruSp;
    std::string names;
    for (const hardware::PinFacts& facts : hardware::kPins) {
      if (!(is_sp ? facts.is_sp : facts.is_clkgen)) continue;
      // The first output of a KRU_CLKGEN stands nowhere else.
      if (!is_sp && i == 0 && facts.pin != Pin::kClkfx) continue;
      if (facts.name == name && facts.needs_feedback && !feedback) {
        Refuse(said_.pins->place, name, "pin without feedback",
               "it needs the feedback, --feedback; without that there are CLKFX and CLKFX180");
        return Pin::kNone;
      }
      if (facts.name == name) return facts.pin;
      names += (names.empty() ? "" : ", ") + std::string(facts.name);
    }
    Refuse(said_.pins->place, name, Of("pin of output " + std::to_string(i)), "it is " + names);
    return Pin::kNone;
  }

  template <typename All>
  int DivideOf(std::string_view pin, const All& all, std::string_view right) {
    if (!said_.dividers) {
      Missing("--divide", "the divide of " + std::string(pin) + ", such as --divide 2");
      return 0;
    }
    const Values& values = said_.dividers->value;
    const bool is_one = values.size() == 1 && values[0];
    const auto halves = is_one ? Whole(*values[0] * 2) : std::nullopt;
    if (halves && std::find(all.begin(), all.end(), *halves) != all.end()) return *halves;
    std::string text = is_one ? Written(*values[0]) : said_.dividers->text;
    Refuse(said_.dividers->place, std::move(text), "divide of " + std::string(pin),
           "it is one value, " + std::string(right));
    return 0;
  }

  // --- The request ------------------------------------------------------------------------

  // The ratio of an output to the input.
  Rational RatioOf(std::size_t i) const {
    if (const auto* const loop = std::get_if<LoopSettings>(&settings_)) {
      return hardware::OutputRatio(loop->m, loop->d, loop->outputs[i].divider);
    }
    const auto& kru = std::get<KruSettings>(settings_);
    return hardware::PinRatio(kru.pins[i], kru.Ratios());
  }

  // Frequencies that nobody asked for are those that come out. How settings are to be chosen is
  // nothing to settings that are there.
  std::optional<Evaluation> Compared() {
    Draft draft = WithoutChoices(draft_);
    Values frequencies(used_.size());
    std::vector<bool> unasked(used_.size());
    for (std::size_t i = 0; i < used_.size(); ++i) {
      if (!used_[i]) continue;
      const bool was_asked =
          draft.outputs && draft.outputs->value[i] && !(draft.unasked && draft.unasked->value[i]);
      unasked[i] = !was_asked;
      frequencies[i] = was_asked ? draft.outputs->value[i]
                                 : std::optional(draft.inputs->value.front() * RatioOf(i));
    }
    const Place place = draft.outputs ? draft.outputs->place : place_;
    const std::string text = draft.outputs ? draft.outputs->text : "";
    draft.outputs = {std::move(frequencies), place, text};
    draft.unasked = {std::move(unasked), place, ""};
    draft.primitive = {primitive_, draft.primitive ? draft.primitive->place : Place{}, ""};
    std::optional<Reading> reading =
        read::Finish(draft, {.primitive = primitive_, .evaluates = true}, &mistakes_);
    if (!reading) return std::nullopt;
    return Evaluation{*std::move(reading), std::move(settings_)};
  }

  const Draft& draft_;
  const SettingsDraft& said_;
  const Device& device_;
  const Primitive primitive_;
  Mistakes& mistakes_;
  std::vector<bool> used_;  // of each output
  Place place_;             // where that is said
  bool fractions_ = false;
  Settings settings_;
};

}  // namespace

std::optional<Evaluation> FinishEvaluation(const Draft& draft, const SettingsDraft& settings,
                                           const Device& device, Mistakes* mistakes) {
  return Finisher(draft, settings, device, mistakes).Finish();
}

}  // namespace planner::read
