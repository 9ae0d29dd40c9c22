// KRU_SP and KRU_CLKGEN, tried one by one.
#include <algorithm>
#include <cstddef>
#include <map>
#include <optional>
#include <set>
#include <tuple>
#include <utility>

#include "hardware/Kru.h"
#include "plain_enumeration.h"
#include "planner/answer/Demands.h"
#include "planner/answer/Jitter.h"
#include "planner/answer/Margin.h"

namespace plain {

namespace {

using hardware::Pin;
using hardware::PinSource;
using hardware::Rational;
using planner::KruSettings;
using planner::Primitive;
using planner::Request;
using planner::answer::Class;
using planner::answer::RankKey;

// What a pin makes of an output.
struct Judged {
  Pin pin;
  bool is_met;
  Rational worst;
  double jitter;
  Rational margin;
};

bool UsesM(Pin pin) {
  const PinSource source = hardware::FactsOf(pin).source;
  return source == PinSource::kSynthesiser || source == PinSource::kDividedSynthesiser;
}

bool UsesDivide(Pin pin) {
  const PinSource source = hardware::FactsOf(pin).source;
  return source == PinSource::kDivider || source == PinSource::kDividedSynthesiser;
}

class Kru {
 public:
  Kru(const Request& request, const planner::Device& device, Primitive primitive, Effort effort)
      : request_(request),
        limits_(device.Pins(primitive)),
        primitive_(primitive),
        is_sp_(primitive == Primitive::kKruSp),
        effort_(effort),
        jitter_(device, request, primitive) {}

  Found Run() {
    const int largest = hardware::LargestKruRatioPart(primitive_);
    for (const bool feedback : {false, true}) {
      if (is_sp_ ? request_.feedback && !feedback : feedback) continue;
      for (const bool divide_by_2 : {false, true}) {
        if (divide_by_2 && !is_sp_) continue;
        KruSettings settings{.primitive = primitive_,
                             .feedback = feedback,
                             .divide_by_2 = divide_by_2,
                             .pins = {}};
        WithM(settings);
        for (int d = 1; d <= largest; ++d) {
          for (int m = hardware::kSmallestKruM; m <= largest; ++m) {
            settings.m = m;
            settings.d = d;
            WithM(settings);
          }
        }
      }
    }
    Found found;
    found.tried = tried_;
    if (best_) found.best.push_back(*best_);
    found.front = FrontOf(request_, front_);
    return found;
  }

 private:
  // With each divide, and each PHASE_SHIFT.
  void WithM(KruSettings settings) {
    if (settings.m != 0 && !CanUseM(settings)) return;
    WithDivide(settings);
    if (is_sp_) {
      for (const int halves : hardware::kClkdvHalves) {
        settings.divide_halves = halves;
        WithDivide(settings);
      }
    } else {
      for (const int halves : hardware::kClkfxdvHalves) {
        settings.divide_halves = halves;
        WithDivide(settings);
      }
    }
  }

  void WithDivide(KruSettings settings) {
    // With feedback from CLK2X and without: output 0 is on that pin or it is not.
    for (const bool doubled : {false, true}) {
      if (doubled && !is_sp_) continue;
      pins_.assign(request_.outputs.size(), {});
      bool uses_m = false;
      bool uses_divide = false;
      bool have_all = true;
      for (std::size_t i = 0; i < request_.outputs.size(); ++i) {
        if (request_.outputs[i].used) {
          pins_[i] = PinsOf(i, settings, doubled);
          have_all = have_all && !pins_[i].empty();
          for (const Pin pin : pins_[i]) {
            uses_m = uses_m || UsesM(pin);
            uses_divide = uses_divide || UsesDivide(pin);
          }
        } else if (i == 0) {
          have_all = !doubled;
        }
        if (!have_all) break;
      }
      // What is set and not used is 0; the search of these has it elsewhere.
      if (!have_all || uses_m != (settings.m != 0)) continue;
      if (uses_divide != (settings.divide_halves != 0)) continue;
      for (int shift = 0; shift <= (is_sp_ ? hardware::kShiftSteps : 0); ++shift) {
        settings.phase_shift = shift;
        // The phases do not matter where none is asked for. That they could all the same is tried
        // with kAll.
        if (shift > 1 && effort_ == Effort::kLess && !AsksForPhase()) break;
        WithShift(settings, doubled);
      }
    }
  }

  bool AsksForPhase() const {
    return std::any_of(request_.outputs.begin(), request_.outputs.end(),
                       [](const auto& output) { return output.used && output.phase; });
  }

  // Whether CLKFX keeps its range, without which M and D are only of use for CLKFXDV.
  bool CanUseM(const KruSettings& settings) const {
    if (!is_sp_ && !request_.outputs[0].used) return true;
    const Rational frequency = request_.inputs[0] * PinRatio(Pin::kClkfx, settings.Ratios());
    return limits_.Of(Pin::kClkfx, false).Contains(frequency) ||
           (is_sp_ && limits_.Of(Pin::kClkfx, true).Contains(frequency));
  }

  // The pins that an output can be on, in the order of their codes.
  std::vector<Pin> PinsOf(std::size_t output, const KruSettings& settings, bool doubled) {
    std::vector<Pin> pins;
    for (const hardware::PinFacts& facts : hardware::kPins) {
      if (!(is_sp_ ? facts.is_sp : facts.is_clkgen)) continue;
      if (facts.needs_feedback && !settings.feedback) continue;
      if (UsesM(facts.pin) && settings.m == 0) continue;
      if (UsesDivide(facts.pin) && settings.divide_halves == 0) continue;
      if (output == 0 && !is_sp_ && facts.pin != Pin::kClkfx) continue;
      if (output == 0 && is_sp_ && doubled != (facts.pin == Pin::kClk2x)) continue;
      if (output != 0 && doubled && !request_.outputs[0].used) continue;
      if (PartOf(output, facts.pin, settings).is_inside[doubled ? 1 : 0]) {
        pins.push_back(facts.pin);
      }
    }
    return pins;
  }

  // What a pin makes of an output but for its phase and jitter; worked out once.
  struct Part {
    bool is_inside[2];    // of its range without and with feedback from CLK2X
    Rational margin[2];
    bool is_met;
    Rational worst;
  };
  const Part& PartOf(std::size_t output, Pin pin, const KruSettings& settings) {
    const auto key = std::tuple(output, pin, settings.divide_by_2, UsesM(pin) ? settings.m : 0,
                                UsesM(pin) ? settings.d : 0,
                                UsesDivide(pin) ? settings.divide_halves : 0);
    const auto known = parts_.find(key);
    if (known != parts_.end()) return known->second;
    const Rational frequency = request_.inputs[0] * PinRatio(pin, settings.Ratios());
    Part part{};
    for (const int doubled : {0, 1}) {
      const hardware::Range& range = limits_.Of(pin, is_sp_ && doubled == 1);
      part.is_inside[doubled] = true;
      std::optional<Rational> margin;
      for (const Rational& corner : corners_) {
        const Rational there = corner * PinRatio(pin, settings.Ratios());
        part.is_inside[doubled] = part.is_inside[doubled] && range.Contains(there);
        const Rational own = planner::answer::MarginOf(there, range);
        if (!margin || own < *margin) margin = own;
      }
      if (!part.is_inside[doubled]) continue;
      part.margin[doubled] = *margin;
    }
    if (!part.is_inside[0] && !part.is_inside[1]) return parts_.emplace(key, part).first->second;
    planner::Output asked = request_.outputs[output];
    asked.phase.reset();
    const planner::answer::Errors errors = planner::answer::ErrorsOf(
        asked, frequency, 0, hardware::PinDuty(pin, settings.divide_halves));
    part.is_met = planner::answer::AreMet(request_, asked, errors);
    part.worst = planner::answer::WorstError(request_, asked, errors);
    return parts_.emplace(key, part).first->second;
  }

  // Likewise the phase.
  struct Turn {
    bool is_met = true;
    Rational error = 0;
  };
  const Turn& TurnOf(std::size_t output, Pin pin, int shift) {
    const auto key = std::tuple(output, pin, shift);
    const auto known = turns_.find(key);
    if (known != turns_.end()) return known->second;
    const planner::Output& asked = request_.outputs[output];
    Turn turn;
    if (asked.phase) {
      const Rational& tolerance = request_.PhaseToleranceOf(asked);
      const Rational error =
          hardware::TurnedToHalf(hardware::PinPhase(pin, shift) - *asked.phase).Absolute();
      turn.is_met = error <= tolerance;
      turn.error = error / planner::answer::PhaseUnit(tolerance);
    }
    return turns_.emplace(key, turn).first->second;
  }

  void WithShift(const KruSettings& settings, bool doubled) {
    std::vector<std::vector<Judged>> judged(request_.outputs.size());
    for (std::size_t i = 0; i < judged.size(); ++i) {
      for (const Pin pin : pins_[i]) judged[i].push_back(Judge(i, pin, settings, doubled));
    }
    if (effort_ == Effort::kAll) {
      KruSettings one = settings;
      one.pins.assign(judged.size(), Pin::kNone);
      TryAll(judged, 0, RankKey{.jitter = 0}, true, &one);
    } else {
      TryOneByOne(judged, settings);
    }
  }

  Judged Judge(std::size_t output, Pin pin, const KruSettings& settings, bool doubled) {
    const planner::Output& asked = request_.outputs[output];
    const Part& part = PartOf(output, pin, settings);
    const Turn& turn = TurnOf(output, pin, settings.phase_shift);
    Judged one{pin, false, 0, jitter_.PeakToPeak(settings, pin), part.margin[doubled ? 1 : 0]};
    one.is_met = part.is_met && turn.is_met &&
                 planner::answer::IsJitterMet(request_, asked, one.jitter);
    one.worst = std::max({part.worst, turn.error,
                          planner::answer::JitterError(request_, asked, one.jitter)});
    return one;
  }

  // Every pin of an output with every pin of those behind it.
  void TryAll(const std::vector<std::vector<Judged>>& judged, std::size_t output, const RankKey& key,
              bool is_first, KruSettings* settings) {
    if (output == judged.size()) {
      Take({*settings, key});
      return;
    }
    if (judged[output].empty()) {
      TryAll(judged, output + 1, key, is_first, settings);
      return;
    }
    for (const Judged& one : judged[output]) {
      settings->pins[output] = one.pin;
      TryAll(judged, output + 1, With(key, one, is_first), false, settings);
    }
  }

  static RankKey With(RankKey key, const Judged& one, bool is_first) {
    if (!one.is_met) key.rank_class = Class::kMissed;
    key.worst_error = std::max(key.worst_error, one.worst);
    key.jitter = std::max(key.jitter, one.jitter);
    key.margin = is_first ? one.margin : std::min(key.margin, one.margin);
    return key;
  }

  // For each jitter and each margin that is not to be exceeded, the pins with the smallest errors,
  // and with the lowest codes that come up to them.
  void TryOneByOne(const std::vector<std::vector<Judged>>& judged, const KruSettings& settings) {
    std::set<double> jitters;
    std::set<Rational> margins;
    for (const auto& ones : judged) {
      for (const Judged& one : ones) {
        jitters.insert(one.jitter);
        if (request_.rank == planner::Rank::kMargin) margins.insert(one.margin);
      }
    }
    if (margins.empty()) margins.insert(Rational(-1));
    for (const bool must_meet : {true, false}) {
      for (const double jitter : jitters) {
        for (const Rational& margin : margins) {
          TryWithin(judged, jitter, margin, must_meet, settings);
        }
      }
    }
  }

  void TryWithin(const std::vector<std::vector<Judged>>& judged, double jitter,
                 const Rational& margin, bool must_meet, KruSettings settings) {
    const auto can = [&](const Judged& one) {
      return one.jitter <= jitter && margin <= one.margin && (one.is_met || !must_meet);
    };
    Rational worst = 0;
    for (const auto& ones : judged) {
      if (ones.empty()) continue;
      std::optional<Rational> least;
      for (const Judged& one : ones) {
        if (can(one) && (!least || one.worst < *least)) least = one.worst;
      }
      if (!least) return;
      worst = std::max(worst, *least);
    }
    RankKey key{.jitter = 0};
    bool is_first = true;
    settings.pins.assign(judged.size(), Pin::kNone);
    for (std::size_t i = 0; i < judged.size(); ++i) {
      for (const Judged& one : judged[i]) {
        if (!can(one) || worst < one.worst) continue;
        settings.pins[i] = one.pin;
        key = With(key, one, is_first);
        is_first = false;
        break;
      }
    }
    Take({settings, key});
  }

  void Take(Ranked one) {
    ++tried_;
    const KruSettings& settings = std::get<KruSettings>(one.settings);
    bool uses_m = false;
    bool uses_divide = false;
    for (const Pin pin : settings.pins) {
      if (pin == Pin::kNone) continue;
      uses_m = uses_m || UsesM(pin);
      uses_divide = uses_divide || UsesDivide(pin);
    }
    if (uses_m != (settings.m != 0) || uses_divide != (settings.divide_halves != 0)) return;
    if (!best_ || IsBefore(request_, one, *best_)) best_ = one;
    front_.push_back(std::move(one));
    // What is no trade-off among some of the settings is none among all.
    if (front_.size() > 100000) front_ = FrontOf(request_, front_);
  }

  const Request& request_;
  const planner::PinLimits& limits_;
  const std::vector<Rational> corners_ = CornersOf(request_);
  Primitive primitive_;
  bool is_sp_;
  Effort effort_;
  planner::answer::KruJitter jitter_;
  std::vector<std::vector<Pin>> pins_;
  std::map<std::tuple<std::size_t, Pin, bool, int, int, int>, Part> parts_;
  std::map<std::tuple<std::size_t, Pin, int>, Turn> turns_;
  std::optional<Ranked> best_;
  std::vector<Ranked> front_;
  std::int64_t tried_ = 0;
};

}  // namespace

Found EnumerateKru(const Request& request, const planner::Device& device, Primitive primitive,
                   Effort effort) {
  return Kru(request, device, primitive, effort).Run();
}

}  // namespace plain
