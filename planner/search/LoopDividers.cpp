// Tested by loop_dividers_test.cpp.
#include "planner/search/LoopDividers.h"

#include <algorithm>
#include <cstdint>
#include <tuple>
#include <utility>

namespace planner::search {

using hardware::kEighths;

LoopDividers::LoopDividers(const Request& request, int index, std::size_t place,
                           const Inputs& inputs, const LoopLimits& limits)
    : request_(request),
      asked_(request.outputs[static_cast<std::size_t>(index)]),
      index_(index),
      place_(static_cast<std::uint8_t>(place)),
      by_margin_(request.rank == Rank::kMargin),
      largest_(hardware::LargestDivider(limits.max_count) * kEighths),
      frequency_(request, asked_),
      range_(inputs, limits.OutputOf(index)),
      shape_(request, asked_, limits.max_count) {
  const auto together = [](const ShapeError& phase, const ShapeError& duty) {
    return ShapeError{LargerOf(phase.error, duty.error), phase.is_met && duty.is_met};
  };
  still_ = together(shape_.StillPhase(), shape_.StillDuty());
  moving_.resize(static_cast<std::size_t>(largest_ / kEighths) + 1);
  if (!HasShape()) return;
  for (int whole = 1; whole <= largest_ / kEighths; ++whole) {
    moving_[static_cast<std::size_t>(whole)] =
        together(shape_.Phase(whole * kEighths), shape_.Duty(whole * kEighths));
  }
}

LoopDividers::Choice LoopDividers::ChoiceOf(Kind kind, int m, int d, int divider) const {
  const ShapeError& shape = ShapeOf(kind, divider);
  const int whole = d * divider;
  const LoopError by_frequency{.near = frequency_.Error(m, whole),
                               .demand = LoopError::Demand::kFrequency,
                               .place = place_,
                               .a = m,
                               .b = whole};
  const LoopError by_shape{.near = shape.error,
                           .demand = LoopError::Demand::kShape,
                           .place = place_,
                           .a = kind == Kind::kMoving ? divider : 0};
  Choice choice;
  choice.divider = divider;
  choice.error = by_frequency;
  const bool is_shape_off = shape.error.value + shape.error.slack > 0;
  if (is_shape_off && !IsSurelyBelow(by_shape.near, by_frequency.near) &&
      (IsSurelyBelow(by_frequency.near, by_shape.near) || Exact(by_frequency) < Exact(by_shape))) {
    choice.error = by_shape;
  }
  choice.is_met = shape.is_met && frequency_.IsMet(m, whole);
  if (by_margin_) choice.margin = range_.Margin(static_cast<double>(m) / whole);
  return choice;
}

int LoopDividers::ShapePlace(int divider) const {
  if (places_.empty()) {
    const int last = largest_ / kEighths;
    std::vector<std::pair<Rational, int>> order;
    for (int whole = 1; whole <= last; ++whole) {
      LoopError error;
      error.demand = LoopError::Demand::kShape;
      error.a = whole * kEighths;
      order.emplace_back(Exact(error), whole);
    }
    std::sort(order.begin(), order.end());
    places_.resize(static_cast<std::size_t>(last) + 1);
    int place = 0;
    for (std::size_t i = 0; i < order.size(); ++i) {
      if (i > 0 && order[i].first != order[i - 1].first) ++place;
      places_[static_cast<std::size_t>(order[i].second)] = place;
    }
  }
  return places_[static_cast<std::size_t>(divider / kEighths)];
}

bool LoopDividers::IsBetter(Kind kind, int m, int d, const Choice& a, const Choice& b) const {
  if (a.is_met != b.is_met) return a.is_met;
  if (by_margin_ && a.is_met) {
    if (IsSurelyBelow(a.margin, b.margin)) return false;
    if (IsSurelyBelow(b.margin, a.margin)) return true;
    const Rational own = range_.ExactMargin(m, std::int64_t{d} * a.divider);
    const Rational other = range_.ExactMargin(m, std::int64_t{d} * b.divider);
    if (own != other) return other < own;
  }
  if (IsSurelyBelow(a.error.near, b.error.near)) return true;
  if (IsSurelyBelow(b.error.near, a.error.near)) return false;
  // Where nothing moves, phase and duty cycle are the same with all dividers.
  if (kind != Kind::kMoving || !HasShape()) {
    const auto by_frequency = FrequencyDemand::Compare(frequency_, m, std::int64_t{d} * a.divider,
                                                       frequency_, m, std::int64_t{d} * b.divider);
    if (by_frequency) {
      return *by_frequency != 0 ? *by_frequency < 0 : a.divider < b.divider;
    }
  }
  // Where phase or duty cycle are the worst, many dividers have the same error.
  constexpr auto kShape = LoopError::Demand::kShape;
  if (kind == Kind::kMoving && a.error.demand == kShape && b.error.demand == kShape) {
    const int own = ShapePlace(a.divider);
    const int other = ShapePlace(b.divider);
    if (own != other) return own < other;
    const auto by_frequency = FrequencyDemand::Compare(frequency_, m, std::int64_t{d} * a.divider,
                                                       frequency_, m, std::int64_t{d} * b.divider);
    if (by_frequency && *by_frequency != 0) return *by_frequency < 0;
  }
  const auto key = [&](const Choice& choice) {
    const answer::Errors errors = ErrorsOf(kind, m, d, choice.divider);
    return std::tuple(answer::WorstError(request_, asked_, errors), errors.ppm.Absolute(),
                      errors.phase.value_or(0).Absolute(), errors.duty.value_or(0).Absolute(),
                      choice.divider);
  };
  return key(a) < key(b);
}

// Whether a divider can be better than the best so far, as far as the error of its frequency tells;
// beyond one with which it cannot, none can.
bool LoopDividers::CanMatter(double least_error, const Choice& best) const {
  if (best.divider == 0) return true;
  if (!best.is_met && least_error <= frequency_.AllowedUnits() * (1 + kRounding)) return true;
  return least_error <= best.error.near.value + best.error.near.slack;
}

LoopDividers::Choice LoopDividers::ChooseNearest(Kind kind, int m, int d) const {
  const double ratio = static_cast<double>(m) / d;
  const double ideal = ratio * frequency_.InputPerAsked();
  const double most = largest_;
  Choice best;
  // Where phase and duty cycle are the same with all dividers, the first on either side is the best
  // there.
  const bool is_first_best = kind != Kind::kMoving || !HasShape();
  const auto take = [&](int divider) {
    const Choice choice = ChoiceOf(kind, m, d, divider);
    if (best.divider == 0 || IsBetter(kind, m, d, choice, best)) best = choice;
    return is_first_best;
  };
  const int middle = static_cast<int>(std::min(ideal, most));
  // Downwards the frequency rises, and upwards it falls. The first to be asked is one divider
  // beyond the rounded end of the range.
  const int last = static_cast<int>(std::min(ratio / range_.Lowest(), most)) + kEighths;
  for (int divider = DownTo(kind, std::min(middle, last)); divider != 0;
       divider = DownTo(kind, divider - 1)) {
    if (!CanMatter(LeastErrorOf(ideal, divider), best)) break;
    const std::int64_t whole = std::int64_t{d} * divider;
    if (!range_.IsNotAbove(m, whole)) break;
    if (range_.IsNotBelow(m, whole) && take(divider)) break;
  }
  const int first = static_cast<int>(std::min(ratio / range_.Highest(), most)) - kEighths;
  for (int divider = UpTo(kind, std::max(middle + 1, first)); divider != 0;
       divider = UpTo(kind, divider + 1)) {
    if (!CanMatter(LeastErrorOf(ideal, divider), best)) break;
    const std::int64_t whole = std::int64_t{d} * divider;
    if (!range_.IsNotBelow(m, whole)) break;
    if (range_.IsNotAbove(m, whole) && take(divider)) break;
  }
  return best;
}

// Of the dividers that meet the demands, the one with the largest margin. The first of them on
// either side of the middle has the largest on that side.
LoopDividers::Choice LoopDividers::ChooseWidest(Kind kind, int m, int d) const {
  const double ratio = static_cast<double>(m) / d;
  const double ideal = ratio * frequency_.InputPerAsked();
  const double most = largest_;
  // All that meet the frequency and keep the range are between these, rounded outwards.
  const double from = std::max(ideal / (1 + frequency_.Allowed()), ratio / range_.Highest());
  const double least = 1 - frequency_.Allowed();
  const double to = std::min(least > 0 ? ideal / least : HUGE_VAL, ratio / range_.Lowest());
  const int first = static_cast<int>(std::min(from, most)) - kEighths;
  const int last = static_cast<int>(std::min(to, most)) + kEighths;
  const int middle = std::clamp(static_cast<int>(std::min(ratio / range_.Middle(), most)),
                                std::min(first, last), last);
  Choice best;
  const auto take = [&](int divider) {
    const std::int64_t whole = std::int64_t{d} * divider;
    if (!range_.Contains(m, whole) || !ShapeOf(kind, divider).is_met ||
        !frequency_.IsMet(m, whole)) {
      return false;
    }
    const Choice choice = ChoiceOf(kind, m, d, divider);
    if (best.divider == 0 || IsBetter(kind, m, d, choice, best)) best = choice;
    return true;
  };
  for (int divider = DownTo(kind, middle); divider != 0 && divider >= first;
       divider = DownTo(kind, divider - 1)) {
    if (take(divider)) break;
  }
  for (int divider = UpTo(kind, middle + 1); divider != 0 && divider <= last;
       divider = UpTo(kind, divider + 1)) {
    if (take(divider)) break;
  }
  return best;
}

answer::Errors LoopDividers::ErrorsOf(Kind kind, int m, int d, int divider) const {
  const LoopOutput set = Set(kind, divider);
  const Rational frequency = request_.inputs.front() * hardware::OutputRatio(m, d, divider);
  const Rational duty = set.high_time == 0
                            ? Rational(50)
                            : hardware::DutyOfHighTime(set.high_time, divider / kEighths);
  return answer::ErrorsOf(asked_, frequency, hardware::PhaseOfStep(set.phase, divider), duty);
}

Rational LoopDividers::Exact(const LoopError& error) const {
  if (error.demand == LoopError::Demand::kFrequency) {
    return frequency_.Ppm(error.a, error.b) / answer::FrequencyUnit(request_.ToleranceOf(asked_));
  }
  // Of phase and duty cycle alone: with the frequency as it is asked for.
  const int divider = error.a != 0 ? error.a : kEighths;
  const LoopOutput set = Set(error.a != 0 ? Kind::kMoving : Kind::kStill, divider);
  const Rational duty = set.high_time == 0
                            ? Rational(50)
                            : hardware::DutyOfHighTime(set.high_time, divider / kEighths);
  return answer::WorstError(
      request_, asked_,
      answer::ErrorsOf(asked_, asked_.frequency, hardware::PhaseOfStep(set.phase, divider), duty));
}

LoopOutput LoopDividers::Set(Kind kind, int divider) const {
  if (kind != Kind::kMoving) return {.divider = divider};
  return {.divider = divider, .phase = shape_.Step(divider), .high_time = shape_.HighTime(divider)};
}

}  // namespace planner::search
