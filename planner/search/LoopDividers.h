// The divider of an output of a loop, for an M and a D.
//
// Search.h says which one is preferred. Around the divider that makes the frequency exactly, the
// error of the frequency grows both ways; so the walk goes outwards from there and ends where the
// frequency alone is worse than the best so far. Where no phase and no duty cycle is asked for it
// takes one step each way. Likewise the margin falls both ways from a divider in the middle of the
// range.
//
// M and dividers are in eighths.
//
// Tested by loop_dividers_test.cpp.
#ifndef VORKEL_PLANNER_SEARCH_LOOPDIVIDERS_H_
#define VORKEL_PLANNER_SEARCH_LOOPDIVIDERS_H_

#include <algorithm>
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <vector>

#include "hardware/Loop.h"
#include "planner/Device.h"
#include "planner/Request.h"
#include "planner/Settings.h"
#include "planner/answer/Demands.h"
#include "planner/search/FrequencyDemand.h"
#include "planner/search/LoopGrid.h"
#include "planner/search/Near.h"
#include "planner/search/OutputShape.h"
#include "planner/search/RatioRange.h"

namespace planner::search {

// What dividers there are, and whether they move anything.
enum class Kind {
  kMoving,         // whole ones, with phases and high times
  kStill,          // output 0 also in eighths; no phase, 50 percent
  kStillFraction,  // output 0 in eighths that are no whole number; no phase, 50 percent
};

// An error of an output, |error| / unit, with all that it takes to work it out again exactly.
struct LoopError {
  // kShape is the worse of phase and duty cycle. The jitter is that of all outputs.
  enum class Demand : std::uint8_t { kNone, kFrequency, kShape, kJitter };
  Near near;
  Demand demand = Demand::kNone;
  std::uint8_t place = 0;  // of the output among the used ones
  // kFrequency: the ratio to the input. kShape: the divider, or 0 where nothing moves.
  std::int32_t a = 0;
  std::int32_t b = 0;
  double jitter = 0;  // kJitter
};

class LoopDividers {
 public:
  // What a divider makes of its output; 0 where there is none that keeps the output's range.
  struct Choice {
    int divider = 0;
    LoopError error;      // the worst of frequency, phase and duty cycle
    bool is_met = false;  // all three
    Near margin;          // only where the request ranks by it
  };

  // Of a used output, at a place among those.
  LoopDividers(const Request& request, int index, std::size_t place, const Inputs& inputs,
               const LoopLimits& limits);

  int Index() const { return index_; }
  const FrequencyDemand& Frequency() const { return frequency_; }
  const RatioRange& Limits() const { return range_; }
  const OutputShape& Shape() const { return shape_; }

  int Largest() const { return largest_; }
  // All dividers of a kind are multiples of this.
  int StepOf(Kind kind) const { return IsWhole(kind) ? hardware::kEighths : 1; }

  // No divider of the kind has a smaller error behind a ratio M / D. Quick.
  double LeastError(Kind kind, double ratio) const {
    // The divider that makes the frequency exactly, as a real number.
    const double ideal = ratio * frequency_.InputPerAsked();
    const int middle = static_cast<int>(std::min(ideal, static_cast<double>(largest_)));
    const int below = DownTo(kind, middle);
    const int above = UpTo(kind, middle + 1);
    const double error = std::min(below == 0 ? HUGE_VAL : LeastErrorOf(ideal, below),
                                  above == 0 ? HUGE_VAL : LeastErrorOf(ideal, above));
    return kind == Kind::kMoving ? error : std::max(error, still_.error.value);
  }
  Choice Choose(Kind kind, int m, int d) const {
    const Choice widest = by_margin_ ? ChooseWidest(kind, m, d) : Choice();
    return widest.divider != 0 ? widest : ChooseNearest(kind, m, d);
  }

  // Phase and duty cycle together.
  const ShapeError& ShapeOf(Kind kind, int divider) const {
    return kind == Kind::kMoving ? moving_[static_cast<std::size_t>(divider / hardware::kEighths)]
                                 : still_;
  }
  // An error of this output, exactly.
  Rational Exact(const LoopError& error) const;
  // The output as it is set.
  LoopOutput Set(Kind kind, int divider) const;

  // The dividers of a kind: the largest up to a number, and the smallest from it on; 0 where there
  // is none.
  int DownTo(Kind kind, int divider) const {
    constexpr int kOne = hardware::kEighths;
    constexpr int kFirst = hardware::kSmallestFractionalDivider * kOne;
    divider = std::min(divider, largest_);
    if (IsWhole(kind)) return divider / kOne * kOne;
    if (kind == Kind::kStillFraction && divider % kOne == 0) --divider;
    if (divider >= kFirst) return divider;
    return divider >= kOne && kind == Kind::kStill ? kOne : 0;
  }
  int UpTo(Kind kind, int divider) const {
    constexpr int kOne = hardware::kEighths;
    constexpr int kFirst = hardware::kSmallestFractionalDivider * kOne;
    divider = std::max(divider, kOne);
    if (IsWhole(kind)) {
      divider = (divider + kOne - 1) / kOne * kOne;
    } else if (kind == Kind::kStill) {
      if (divider > kOne) divider = std::max(divider, kFirst);
    } else {
      divider = std::max(divider, kFirst + 1);
      if (divider % kOne == 0) ++divider;
    }
    return divider <= largest_ ? divider : 0;
  }

 private:
  double LeastErrorOf(double ideal, int divider) const {
    const double quotient = ideal / divider;
    return frequency_.QuickError(quotient) - frequency_.Slack() * (1 + quotient);
  }
  // The place of the shape of a whole divider among those of all, by their exact errors; the same
  // for equal ones. Worked out when it is first asked for, which is seldom.
  int ShapePlace(int divider) const;
  bool IsBetter(Kind kind, int m, int d, const Choice& a, const Choice& b) const;
  Choice ChoiceOf(Kind kind, int m, int d, int divider) const;
  answer::Errors ErrorsOf(Kind kind, int m, int d, int divider) const;
  bool CanMatter(double least_error, const Choice& best) const;
  Choice ChooseWidest(Kind kind, int m, int d) const;
  Choice ChooseNearest(Kind kind, int m, int d) const;
  bool HasShape() const { return shape_.AsksForPhase() || shape_.AsksForDuty(); }
  bool IsWhole(Kind kind) const { return kind == Kind::kMoving || index_ != 0; }

  const Request& request_;
  const Output& asked_;
  int index_;
  std::uint8_t place_;
  bool by_margin_;
  int largest_;  // in eighths
  FrequencyDemand frequency_;
  RatioRange range_;
  OutputShape shape_;
  std::vector<ShapeError> moving_;  // by the whole divider
  ShapeError still_;
  mutable std::vector<int> places_;  // of the shapes, by the whole divider
};

}  // namespace planner::search

#endif  // VORKEL_PLANNER_SEARCH_LOOPDIVIDERS_H_
