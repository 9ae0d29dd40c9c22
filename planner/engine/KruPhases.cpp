#include "planner/engine/KruPhases.h"

#include <algorithm>
#include <cstddef>
#include <optional>

#include "hardware/Kru.h"
#include "planner/answer/Demands.h"

namespace planner::engine {
namespace {

using hardware::TurnedToFull;

// A phase of each output, or none where it does not matter.
using Phases = std::vector<std::optional<Rational>>;

// How far a phase stays below the next one of a pin, degrees: from there on it is that of the pin.
const Rational kBelow(1, 1000);

// Rests are in binary fractions, so that nothing of them is lost beside the phase of a pin.
constexpr int kFractions = 1024;

class PhaseLists {
 public:
  PhaseLists(const Request& request, Primitive primitive, bool feedback)
      : request_(request),
        // Without feedback there are only CLKFX and CLKFX180, as on a KRU_CLKGEN.
        quarter_(primitive == Primitive::kKruSp && feedback ? 90 : 180),
        has_shift_(primitive == Primitive::kKruSp) {}

  std::vector<std::vector<double>> Make() {
    const Phases asked = Asked();
    Add(asked);
    Add(Turned(asked));
    Add(Stepped(asked, 0));
    if (has_shift_) Add(Stepped(asked, 1));
    return std::move(lists_);
  }

 private:
  Phases Asked() const {
    Phases phases;
    for (const Output& output : request_.outputs) {
      phases.push_back(output.used ? output.phase : std::nullopt);
    }
    return phases;
  }

  static Phases Turned(Phases phases) {
    for (auto& phase : phases) {
      if (phase) phase = TurnedToFull(*phase);
    }
    return phases;
  }

  // The phases that the pins make with the step of PHASE_SHIFT, from `first` on and below the
  // phase of the next pin, whose largest error is the smallest; without PHASE_SHIFT, those of the
  // pins. As they are where that is larger than it may be.
  Phases Stepped(const Phases& phases, int first) const {
    const int last = has_shift_ ? LastStep() : 0;
    std::optional<Rational> least;
    Phases best = phases;
    if (std::all_of(phases.begin(), phases.end(), [](const auto& one) { return !one; }))
      return best;
    for (int step = first; step <= last; ++step) {
      const Rational offset(360 * step, hardware::kShiftSteps);
      const std::optional<Rational> worst = WorstError(phases, offset);
      if (!worst || (least && *worst >= *least)) continue;
      least = worst;
      best = Made(phases, offset);
      if (*least == Rational(0)) break;
    }
    return best;
  }

  // The largest step below the next pin: steps are rounded, and half a step is one only from there
  // on, which is a pin already.
  int LastStep() const {
    const Rational steps(quarter_ * hardware::kShiftSteps, 360);
    const Rational last = -(Rational(1, 2) - steps).Floor();
    return static_cast<int>(*last.Whole());
  }

  // The pin that comes nearest to a phase with such an offset.
  Rational PinOf(const Rational& phase, const Rational& offset) const {
    return ((phase - offset) / quarter_).Round() * quarter_;
  }

  // How far a phase is from the nearest that the pins make with an offset.
  Rational ErrorOf(const Rational& phase, const Rational& offset) const {
    const Rational distance = (phase - offset).Absolute();
    return ((distance / quarter_).Round() * quarter_ - distance).Absolute();
  }

  // The largest error with an offset, in units of the tolerances; none where one is larger than it
  // may be.
  std::optional<Rational> WorstError(const Phases& phases, const Rational& offset) const {
    Rational worst = 0;
    for (std::size_t i = 0; i < phases.size(); ++i) {
      if (!phases[i]) continue;
      const Rational error = ErrorOf(*phases[i], offset);
      const Rational& allowed = request_.PhaseToleranceOf(request_.outputs[i]);
      if (error > allowed) return std::nullopt;
      worst = std::max(worst, error / answer::PhaseUnit(allowed));
    }
    return worst;
  }

  // What the engine is to be asked for, of which it makes this offset.
  Phases Made(const Phases& phases, const Rational& offset) const {
    const Rational rest = (std::min(offset, quarter_ - kBelow) * kFractions).Floor() / kFractions;
    Phases made = phases;
    for (auto& phase : made) {
      if (phase) phase = TurnedToFull(PinOf(*phase, offset)) + rest;
    }
    return made;
  }

  // The phases to try for the outputs that ask for none.
  static std::vector<Rational> Fillings(const Phases& phases) {
    std::vector<Rational> fillings = {0};
    if (std::find(phases.begin(), phases.end(), std::nullopt) == phases.end()) return fillings;
    for (const int turn : {0, 90, 180, 270}) {
      for (const auto& phase : phases) {
        if (!phase) continue;
        const Rational filling = turn == 0 ? *phase : TurnedToFull(*phase + turn);
        if (std::find(fillings.begin(), fillings.end(), filling) == fillings.end()) {
          fillings.push_back(filling);
        }
      }
    }
    return fillings;
  }

  void Add(const Phases& phases) {
    for (const Rational& filling : Fillings(phases)) {
      std::vector<double> list;
      for (std::size_t i = 0; i < phases.size(); ++i) {
        const bool used = request_.outputs[i].used;
        list.push_back(used ? phases[i].value_or(filling).ToDouble() : 0.0);
      }
      if (std::find(lists_.begin(), lists_.end(), list) == lists_.end()) {
        lists_.push_back(std::move(list));
      }
    }
  }

  const Request& request_;
  const int quarter_;
  const bool has_shift_;
  std::vector<std::vector<double>> lists_;
};

}  // namespace

std::vector<std::vector<double>> KruPhases(const Request& request, Primitive primitive,
                                           bool feedback) {
  return PhaseLists(request, primitive, feedback).Make();
}

}  // namespace planner::engine
