// Every setting of a KRU.
//
// Feedback, CLKIN_DIVIDE_BY_2, whether the feedback is taken from CLK2X, D, M, the divide and
// PHASE_SHIFT are nested loops. Given these, the outputs do not depend on each other, so the pins
// are not multiplied out: for each jitter, and each margin where that is ranked by, that must not
// be passed, each output has the pins that come nearest.
//
// Tested by all_settings_test.cpp.
#include <algorithm>
#include <array>
#include <cmath>
#include <cstddef>
#include <limits>
#include <map>
#include <optional>
#include <set>
#include <tuple>
#include <utility>
#include <vector>

#include "hardware/Kru.h"
#include "planner/answer/Jitter.h"
#include "planner/verify/AllSettings.h"
#include "planner/verify/Formulas.h"

namespace planner::verify {

namespace {

using hardware::Pin;

constexpr double kMuch = std::numeric_limits<double>::infinity();

// The best that outputs could come to, were each free to take another pin for each figure. With M
// set some output has to use it, and with a divide likewise.
class Bound {
 public:
  struct Figures {
    int rank_class = 0;
    double error = 0;
    double jitter = 0;
    double margin = kMuch;
    void Worsen(const Figures& other) {
      rank_class = std::max(rank_class, other.rank_class);
      error = std::max(error, other.error);
      jitter = std::max(jitter, other.jitter);
      margin = std::min(margin, other.margin);
    }
    void Improve(const Figures& other) {
      rank_class = std::min(rank_class, other.rank_class);
      error = std::min(error, other.error);
      jitter = std::min(jitter, other.jitter);
      margin = std::max(margin, other.margin);
    }
  };
  static Figures Worst() { return {9, kMuch, kMuch, -kMuch}; }

  void AddPin(Pin pin, const Figures& figures) {
    has_pin_ = true;
    output_.Improve(figures);
    if (HasM(pin)) with_m_.Improve(figures);
    if (HasDivide(pin)) with_divide_.Improve(figures);
    uses_m_ = uses_m_ || HasM(pin);
    uses_divide_ = uses_divide_ || HasDivide(pin);
  }
  // Behind the pins of an output. False when it has none.
  bool EndOutput() {
    all_.Worsen(output_);
    output_ = Worst();
    return std::exchange(has_pin_, false);
  }
  // Nothing when M or the divide is set and no output can use it.
  std::optional<Figures> Take(bool has_m, bool has_divide) {
    if ((has_m && !uses_m_) || (has_divide && !uses_divide_)) return std::nullopt;
    if (has_m) all_.Worsen(with_m_);
    if (has_divide) all_.Worsen(with_divide_);
    return all_;
  }

 private:
  Figures all_;
  Figures output_ = Worst();
  Figures with_m_ = Worst();
  Figures with_divide_ = Worst();
  bool has_pin_ = false;
  bool uses_m_ = false;
  bool uses_divide_ = false;
};

// A pin for one output, exactly; but for the phase as long as PHASE_SHIFT is not chosen.
struct Option {
  Pin pin;
  bool is_met;
  Rational error;
  Rational margin;
  double jitter;
};
using Options = std::vector<std::vector<Option>>;  // by output

class Krus {
 public:
  Krus(const Request& request, const Device& device, Primitive primitive, BestSettings* best)
      : request_(request),
        limits_(device.Pins(primitive)),
        is_sp_(primitive == Primitive::kKruSp),
        best_(*best),
        model_(device, request, primitive),
        corners_(CornersOf(request.inputs, request.input_tolerance)) {
    set_.primitive = primitive;
    set_.pins.assign(request.outputs.size(), Pin::kNone);
    for (const Output& output : request.outputs) {
      has_phase_ = has_phase_ || (output.used && output.phase);
      const Rational tolerance = output.tolerance.value_or(request.tolerance);
      rough_.push_back({output.frequency.ToDouble(), tolerance.ToDouble()});
    }
  }

  void TryAll() {
    for (const bool feedback : {false, true}) {
      if (is_sp_ ? request_.feedback && !feedback : feedback) continue;
      for (const bool half : {false, true}) {
        if (half && !is_sp_) continue;
        for (const bool doubled : {false, true}) {
          // Output 0 is on CLK2X, which needs the feedback.
          if (doubled && !(is_sp_ && feedback && request_.outputs[0].used)) continue;
          set_.feedback = feedback;
          set_.divide_by_2 = half;
          doubled_ = doubled;
          TryRatios();
        }
      }
    }
  }

 private:
  void TryRatios() {
    set_.m = set_.d = 0;
    TryDivides();
    const int largest = hardware::LargestKruRatioPart(set_.primitive);
    for (set_.d = 1; set_.d <= largest; ++set_.d) {
      for (set_.m = hardware::kSmallestKruM; set_.m <= largest; ++set_.m) TryDivides();
    }
  }

  void TryDivides() {
    set_.divide_halves = 0;
    TryPins();
    if (is_sp_) {
      for (const int halves : hardware::kClkdvHalves) {
        set_.divide_halves = halves;
        TryPins();
      }
    } else if (set_.m != 0) {
      for (const int halves : hardware::kClkfxdvHalves) {
        set_.divide_halves = halves;
        TryPins();
      }
    }
  }

  // Whether an output could be on a pin as things are set, but for its frequency.
  bool CanBe(std::size_t output, const hardware::PinFacts& facts) const {
    if (!(is_sp_ ? facts.is_sp : facts.is_clkgen)) return false;
    if (facts.needs_feedback && !set_.feedback) return false;
    if (HasM(facts.pin) && set_.m == 0) return false;
    if (HasDivide(facts.pin) && set_.divide_halves == 0) return false;
    if (output > 0) return true;
    return is_sp_ ? doubled_ == (facts.pin == Pin::kClk2x) : facts.pin == Pin::kClkfx;
  }

  void TryPins() {
    const std::optional<Bound::Figures> rough = RoughBound();
    if (!rough || IsBehind(*rough)) return;
    // All steps of PHASE_SHIFT are alike where no phase is asked for; but one that is 0 is not in
    // the way of the jitter.
    const int last = !is_sp_ ? 0 : has_phase_ ? hardware::kShiftSteps : 1;
    std::optional<Options> options;
    for (int shift = 0; shift <= last; ++shift) {
      const std::optional<Bound::Figures> bound = RoughBound(shift);
      if (!bound || IsBehind(*bound)) continue;
      if (!options) {
        options = ExactOptions();
        if (options->empty() || IsBehindExactly(*options)) break;
      }
      set_.phase_shift = shift;
      TryShift(*options);
      set_.phase_shift = 0;
    }
  }

  // --- In doubles -------------------------------------------------------------------------

  bool IsBehind(const Bound::Figures& bound) const {
    return best_.IsBehind(0, bound.rank_class, bound.error, bound.jitter, bound.margin);
  }

  // With any PHASE_SHIFT. Nothing when some output has no pin. Keeps what it finds.
  std::optional<Bound::Figures> RoughBound() {
    Bound bound;
    const double input = request_.inputs[0].ToDouble();
    rough_pins_.clear();
    for (std::size_t i = 0; i < request_.outputs.size(); ++i) {
      if (!request_.outputs[i].used) continue;
      for (const hardware::PinFacts& facts : hardware::kPins) {
        if (!CanBe(i, facts)) continue;
        const auto figures = Rough(i, facts.pin, input * RoughRatio(facts.pin));
        if (!figures) continue;
        bound.AddPin(facts.pin, *figures);
        rough_pins_.push_back({i, facts.pin, *figures});
      }
      if (!bound.EndOutput()) return std::nullopt;
    }
    return bound.Take(set_.m != 0, set_.divide_halves != 0);
  }

  // The same with the phases that a PHASE_SHIFT makes.
  std::optional<Bound::Figures> RoughBound(int shift) {
    Bound bound;
    for (std::size_t place = 0; place < rough_pins_.size(); ++place) {
      const RoughPin& one = rough_pins_[place];
      if (place > 0 && one.output != rough_pins_[place - 1].output) bound.EndOutput();
      Bound::Figures figures = one.figures;
      if (request_.outputs[one.output].phase) figures.Worsen(RoughPhase(one, shift));
      bound.AddPin(one.pin, figures);
    }
    bound.EndOutput();
    return bound.Take(set_.m != 0, set_.divide_halves != 0);
  }

  double RoughRatio(Pin pin) const {
    double ratio = set_.divide_by_2 ? 0.5 : 1;
    if (pin == Pin::kClk2x || pin == Pin::kClk2x180) ratio *= 2;
    if (HasM(pin)) ratio *= static_cast<double>(set_.m) / set_.d;
    if (HasDivide(pin)) ratio *= 2.0 / set_.divide_halves;
    return ratio;
  }

  // Not worse than the pin is; nothing when its frequency is out of its range.
  std::optional<Bound::Figures> Rough(std::size_t output, Pin pin, double frequency) const {
    constexpr double kRounding = 1e-12;
    const auto& range = RoughRange(pin);
    if (frequency < range.first * (1 - kRounding)) return std::nullopt;
    if (frequency > range.second * (1 + kRounding)) return std::nullopt;
    const double allowed = rough_[output].tolerance;
    double ppm = std::abs(frequency / rough_[output].frequency - 1) * 1e6;
    ppm = std::max(0.0, ppm * (1 - kRounding) - 1e-8);
    Bound::Figures figures;
    figures.rank_class = ppm <= allowed * (1 + kRounding) ? 0 : 1;
    figures.error = ppm / (allowed > 0 ? allowed : 100);
    figures.margin = std::min(range.first > 0 ? frequency / range.first - 1 : kMuch,
                              range.second > 0 ? 1 - frequency / range.second : kMuch) +
                     kRounding;
    figures.jitter = LeastJitter(pin);
    return figures;
  }

  const std::pair<double, double>& RoughRange(Pin pin) const {
    auto& known = ranges_[doubled_ ? 1 : 0][static_cast<std::size_t>(pin)];
    if (!known) {
      const Range& range = limits_.Of(pin, doubled_);
      // Of the nominal frequency, so that the corners of the input are in the range.
      const double off = request_.input_tolerance.ToDouble() / 1e6;
      known = {range.lowest.ToDouble() / (1 - off), range.highest.ToDouble() / (1 + off)};
    }
    return *known;
  }

  double JitterAt(Pin pin, int shift) const {
    KruSettings set = set_;
    set.phase_shift = shift;
    return model_.PeakToPeak(set, pin);
  }

  // With PHASE_SHIFT and without.
  double LeastJitter(Pin pin) const {
    const JitterKey key(set_.feedback, set_.divide_by_2, HasM(pin) ? set_.m : 0,
                        HasM(pin) ? set_.d : 0, HasDivide(pin) ? set_.divide_halves : 0);
    auto& last = last_[static_cast<std::size_t>(pin)];
    if (last && last->first == key) return last->second;
    double least = JitterAt(pin, 0);
    if (is_sp_) least = std::min(least, JitterAt(pin, 1));
    last = {key, least};
    return least;
  }

  // --- Exactly ----------------------------------------------------------------------------

  // Empty when some output has no pin.
  Options ExactOptions() const {
    Options options(request_.outputs.size());
    for (std::size_t i = 0; i < options.size(); ++i) {
      if (!request_.outputs[i].used) continue;
      for (const hardware::PinFacts& facts : hardware::kPins) {
        if (CanBe(i, facts)) AddOption(i, facts.pin, &options[i]);
      }
      if (options[i].empty()) return {};
    }
    return options;
  }

  void AddOption(std::size_t output, Pin pin, std::vector<Option>* options) const {
    const Output& asked = request_.outputs[output];
    const Range& range = limits_.Of(pin, doubled_);
    const Rational made = FrequencyOf(request_.inputs[0], pin, set_.Ratios());
    Option option{pin, true, 0, MarginIn(range, made), LeastJitter(pin)};
    for (const Rational& corner : corners_) {
      const Rational there = FrequencyOf(corner, pin, set_.Ratios());
      if (there < range.lowest || range.highest < there) return;
      option.margin = std::min(option.margin, MarginIn(range, there));
    }
    const Rational tolerance = asked.tolerance.value_or(request_.tolerance);
    const Rational ppm = Ppm(made, asked.frequency).Absolute();
    option.is_met = ppm <= tolerance;
    option.error = PpmInUnits(ppm, tolerance);
    if (asked.duty) {
      const Rational allowed = asked.duty_tolerance.value_or(request_.duty_tolerance);
      const Rational points = (verify::DutyOf(pin, set_.divide_halves) - *asked.duty).Absolute();
      option.is_met = option.is_met && points <= allowed;
      option.error = std::max(option.error, PointsInUnits(points, allowed));
    }
    options->push_back(std::move(option));
  }

  // An option with the jitter that it has, and what is demanded of it.
  Option WithShift(std::size_t output, Option option) {
    const Output& asked = request_.outputs[output];
    option.jitter = JitterAt(option.pin, set_.phase_shift);
    if (asked.phase) {
      const Rational allowed = asked.phase_tolerance.value_or(request_.phase_tolerance);
      const Rational& degrees = PhaseError(output, option.pin);
      option.is_met = option.is_met && degrees <= allowed;
      option.error = std::max(option.error, DegreesInUnits(degrees, allowed));
    }
    const auto& allowed = asked.max_jitter ? asked.max_jitter : request_.max_jitter;
    if (!allowed) return option;
    if (option.jitter == kNoJitter) {
      option.is_met = false;
      return option;
    }
    const Rational jitter = Rational::FromDouble(option.jitter);
    option.is_met = option.is_met && jitter <= *allowed;
    option.error = std::max(option.error, PsInUnits(jitter, *allowed));
    return option;
  }

  const Rational& PhaseError(std::size_t output, Pin pin) {
    const auto key = std::tuple(output, pin, set_.phase_shift);
    const auto known = phases_.find(key);
    if (known != phases_.end()) return known->second;
    const Rational error =
        Turned(verify::PhaseOf(pin, set_.phase_shift) - *request_.outputs[output].phase);
    return phases_.emplace(key, error.Absolute()).first->second;
  }

  struct RoughPin {
    std::size_t output;
    Pin pin;
    Bound::Figures figures;
  };

  // The error of a phase, not above what it is.
  const Bound::Figures& RoughPhase(const RoughPin& one, int shift) {
    constexpr double kRounding = 1e-12;
    auto& known = rough_phases_[one.output][static_cast<std::size_t>(one.pin)];
    if (known.empty()) {
      const Output& asked = request_.outputs[one.output];
      const Rational allowed = asked.phase_tolerance.value_or(request_.phase_tolerance);
      for (int i = 0; i <= hardware::kShiftSteps; ++i) {
        const Rational degrees = Turned(verify::PhaseOf(one.pin, i) - *asked.phase).Absolute();
        Bound::Figures figures;
        figures.rank_class = degrees <= allowed ? 0 : 1;
        figures.error = DegreesInUnits(degrees, allowed).ToDouble() * (1 - kRounding);
        known.push_back(figures);
      }
    }
    return known[static_cast<std::size_t>(shift)];
  }

  // Whether nothing that these options allow could be the best or a trade-off.
  bool IsBehindExactly(const Options& options) const {
    Figures bound{.rank_class = 0, .worst_error = 0, .jitter = 0, .margin = 0, .vco = 0};
    std::optional<Rational> margin;
    Figures with_m{.rank_class = 9};
    Figures with_divide{.rank_class = 9};
    for (const std::vector<Option>& of_output : options) {
      if (of_output.empty()) continue;
      Figures least{.rank_class = 9};
      std::optional<Rational> most;
      for (const Option& one : of_output) {
        Improve(one, &least);
        if (HasM(one.pin)) Improve(one, &with_m);
        if (HasDivide(one.pin)) Improve(one, &with_divide);
        if (!most || *most < one.margin) most = one.margin;
      }
      Worsen(least, &bound);
      if (!margin || *most < *margin) margin = most;
    }
    if (set_.m != 0) Worsen(with_m, &bound);
    if (set_.divide_halves != 0) Worsen(with_divide, &bound);
    // No output can use what is set.
    if (bound.rank_class == 9) return true;
    bound.margin = *margin;
    return best_.IsBehind(0, {set_, bound});
  }

  static void Improve(const Option& option, Figures* figures) {
    const bool is_first = figures->rank_class == 9;
    if (is_first || option.error < figures->worst_error) figures->worst_error = option.error;
    figures->jitter = std::min(figures->jitter, option.jitter);
    figures->rank_class = std::min(figures->rank_class, option.is_met ? 0 : 1);
  }

  static void Worsen(const Figures& other, Figures* figures) {
    figures->worst_error = std::max(figures->worst_error, other.worst_error);
    figures->jitter = std::max(figures->jitter, other.jitter);
    figures->rank_class = std::max(figures->rank_class, other.rank_class);
  }

  // --- All that can be taken --------------------------------------------------------------

  void TryShift(const Options& options) {
    Options shifted(options.size());
    for (std::size_t i = 0; i < options.size(); ++i) {
      for (const Option& one : options[i]) shifted[i].push_back(WithShift(i, one));
    }
    if (IsBehindExactly(shifted)) return;
    std::set<double> jitters;
    std::set<Rational> margins;
    for (const std::vector<Option>& of_output : shifted) {
      for (const Option& one : of_output) {
        jitters.insert(one.jitter);
        margins.insert(one.margin);
      }
    }
    // The margin counts only where it is ranked by: then each of them, else all.
    if (request_.rank != Rank::kMargin) margins = {*margins.begin()};
    for (const bool must_meet : {true, false}) {
      for (const double jitter : jitters) {
        for (const Rational& margin : margins) Take(shifted, must_meet, jitter, margin);
      }
    }
  }

  // The smallest errors with no more jitter and no less margin than this, on the first such pins.
  void Take(const Options& options, bool must_meet, double jitter, const Rational& margin) {
    const auto can = [&](const Option& one) {
      return (one.is_met || !must_meet) && one.jitter <= jitter && margin <= one.margin;
    };
    Rational worst = 0;
    for (const std::vector<Option>& of_output : options) {
      if (of_output.empty()) continue;
      std::optional<Rational> least;
      for (const Option& one : of_output) {
        if (can(one) && (!least || one.error < *least)) least = one.error;
      }
      if (!least) return;
      worst = std::max(worst, *least);
    }
    KruSettings set = set_;
    Figures figures{.rank_class = 0, .worst_error = worst, .jitter = 0, .margin = 0, .vco = 0};
    std::optional<Rational> least_margin;
    for (std::size_t i = 0; i < options.size(); ++i) {
      const auto one = std::find_if(options[i].begin(), options[i].end(), [&](const Option& pin) {
        return can(pin) && pin.error <= worst;
      });
      if (one == options[i].end()) continue;
      set.pins[i] = one->pin;
      if (!one->is_met) figures.rank_class = 1;
      figures.jitter = std::max(figures.jitter, one->jitter);
      if (!least_margin || one->margin < *least_margin) least_margin = one->margin;
    }
    figures.margin = *least_margin;
    AddUsed(std::move(set), figures);
  }

  // What no pin uses is not set: such settings come with M, D and divide of 0.
  void AddUsed(KruSettings set, const Figures& figures) {
    const auto uses = [&](bool (*has)(Pin)) {
      return std::any_of(set.pins.begin(), set.pins.end(), has);
    };
    if (uses(HasM) != (set.m != 0) || uses(HasDivide) != (set.divide_halves != 0)) return;
    best_.Add(0, {std::move(set), figures});
  }

  const Request& request_;
  const PinLimits& limits_;
  const bool is_sp_;
  BestSettings& best_;
  const answer::KruJitter model_;
  const std::vector<Rational> corners_;  // what the input can be
  bool has_phase_ = false;
  bool doubled_ = false;
  KruSettings set_;  // what the loops are at
  struct RoughDemand {
    double frequency;
    double tolerance;
  };
  std::vector<RoughDemand> rough_;    // by output
  std::vector<RoughPin> rough_pins_;  // of what is tried, output by output
  // By output, pin and PHASE_SHIFT.
  std::array<std::array<std::vector<Bound::Figures>, hardware::kPins.size() + 1>, 7> rough_phases_;
  std::map<std::tuple<std::size_t, Pin, int>, Rational> phases_;
  // By the code of the pin: its range, as usual and with feedback from CLK2X; and the jitter that
  // was asked for last.
  template <typename T>
  using ByPin = std::array<std::optional<T>, hardware::kPins.size() + 1>;
  mutable std::array<ByPin<std::pair<double, double>>, 2> ranges_;
  using JitterKey = std::tuple<bool, bool, int, int, int>;
  mutable ByPin<std::pair<JitterKey, double>> last_;
};

}  // namespace

void TryKrus(const Request& request, const Device& device, Primitive primitive,
             BestSettings* best) {
  Krus(request, device, primitive, best).TryAll();
}

}  // namespace planner::verify
