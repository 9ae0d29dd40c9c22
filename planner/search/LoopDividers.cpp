// Tested by loop_dividers_test.cpp.
#include "planner/search/LoopDividers.h"

#include <cstdint>
#include <tuple>


namespace planner::search {

using hardware::kEighths;

LoopDividers::LoopDividers(const Request& request, int index, const Inputs& inputs,
                           const LoopLimits& limits)
    : request_(request),
      asked_(request.outputs[static_cast<std::size_t>(index)]),
      index_(index),
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
  if (!shape_.AsksForPhase() && !shape_.AsksForDuty()) return;
  for (int whole = 1; whole <= largest_ / kEighths; ++whole) {
    moving_[static_cast<std::size_t>(whole)] =
        together(shape_.Phase(whole * kEighths), shape_.Duty(whole * kEighths));
  }
}

LoopDividers::Choice LoopDividers::ChoiceOf(Kind kind, int m, int d, int divider) const {
  const ShapeError& shape = ShapeOf(kind, divider);
  Choice choice;
  choice.divider = divider;
  choice.error = LargerOf(frequency_.Error(m, std::int64_t{d} * divider), shape.error);
  choice.is_met = shape.is_met && frequency_.IsMet(m, std::int64_t{d} * divider);
  if (by_margin_) {
    choice.margin = range_.Margin(static_cast<double>(m) / (d * divider));
  }
  return choice;
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
  if (IsSurelyBelow(a.error, b.error)) return true;
  if (IsSurelyBelow(b.error, a.error)) return false;
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
  if (by_margin_ || !best.is_met) {
    if (least_error <= frequency_.AllowedUnits() * (1 + kRounding)) return true;
    if (best.is_met) return false;
  }
  return least_error <= best.error.value + best.error.slack;
}

LoopDividers::Choice LoopDividers::Choose(Kind kind, int m, int d) const {
  const double ratio = static_cast<double>(m) / d;
  const double ideal = ratio * frequency_.InputPerAsked();
  const double most = largest_;
  Choice best;
  const auto take = [&](int divider) {
    const Choice choice = ChoiceOf(kind, m, d, divider);
    if (best.divider == 0 || IsBetter(kind, m, d, choice, best)) best = choice;
  };
  const int middle = static_cast<int>(std::min(ideal, most));
  // Downwards the frequency rises, and upwards it falls. The first to be asked is one divider beyond
  // the rounded end of the range.
  const int last = static_cast<int>(std::min(ratio / range_.Lowest(), most)) + kEighths;
  for (int divider = DownTo(kind, std::min(middle, last)); divider != 0;
       divider = DownTo(kind, divider - 1)) {
    if (!CanMatter(LeastErrorOf(ideal, divider), best)) break;
    const std::int64_t whole = std::int64_t{d} * divider;
    if (!range_.IsNotAbove(m, whole)) break;
    if (range_.IsNotBelow(m, whole)) take(divider);
  }
  const int first = static_cast<int>(std::min(ratio / range_.Highest(), most)) - kEighths;
  for (int divider = UpTo(kind, std::max(middle + 1, first)); divider != 0;
       divider = UpTo(kind, divider + 1)) {
    if (!CanMatter(LeastErrorOf(ideal, divider), best)) break;
    const std::int64_t whole = std::int64_t{d} * divider;
    if (!range_.IsNotBelow(m, whole)) break;
    if (range_.IsNotAbove(m, whole)) take(divider);
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

Rational LoopDividers::WorstError(Kind kind, int m, int d, int divider) const {
  return answer::WorstError(request_, asked_, ErrorsOf(kind, m, d, divider));
}

LoopOutput LoopDividers::Set(Kind kind, int divider) const {
  if (kind != Kind::kMoving) return {.divider = divider};
  return {.divider = divider, .phase = shape_.Step(divider), .high_time = shape_.HighTime(divider)};
}

}  // namespace planner::search
