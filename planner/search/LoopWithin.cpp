// Tested by within_test.cpp.
#include "planner/search/LoopWithin.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <utility>

#include "hardware/Loop.h"
#include "planner/search/Denominators.h"
#include "planner/search/LoopSweeps.h"

namespace planner::search {

using hardware::kEighths;

LoopWithin::Asked::Asked(std::size_t place, Cause all, const LoopWithin& within)
    : index(place),
      cause(std::move(all)),
      frequency(within.request_, cause.demand),
      range(within.inputs_, cause.range),
      first_range(within.first_input_, cause.range),
      shape(within.request_, cause.demand, cause.largest_count),
      long_shape(within.request_, cause.demand, kRelaxedDivider),
      max_jitter(cause.demand.max_jitter) {}

LoopWithin::Cause LoopWithin::CauseOf(std::size_t index) const {
  Cause cause = {request_.inputs, request_.outputs[index],
                 limits_.OutputOf(static_cast<int>(index)), limits_.max_count};
  Output& demand = cause.demand;
  demand.tolerance = request_.ToleranceOf(demand);
  demand.phase_tolerance = request_.PhaseToleranceOf(demand);
  demand.duty_tolerance = request_.DutyToleranceOf(demand);
  demand.max_jitter = request_.MaxJitterOf(demand);
  return cause;
}

LoopWithin::LoopWithin(const Request& request, const Device& device, Primitive primitive,
                       const LoopWithin* like)
    : request_(request),
      limits_(device.Loop(primitive)),
      primitive_(primitive),
      fractions_(hardware::HasFractions(primitive, static_cast<int>(request.outputs.size()),
                                        request.whole_divider_0)),
      inputs_(InputsOf(request.inputs)),
      first_input_{request.inputs.front(), request.inputs.front()},
      jitter_(device, request) {
  for (std::size_t i = 0; i < request_.outputs.size(); ++i) {
    if (!request_.outputs[i].used) continue;
    Cause cause = CauseOf(i);
    AskedPointer asked;
    if (like != nullptr) {
      const auto same = std::find_if(
          like->outputs_.begin(), like->outputs_.end(),
          [&](const AskedPointer& one) { return one->index == i && one->cause == cause; });
      if (same != like->outputs_.end()) asked = *same;
    }
    if (!asked) asked = std::make_shared<const Asked>(i, std::move(cause), *this);
    outputs_.push_back(std::move(asked));
  }
  // Those with the fewest dividers come first.
  std::sort(outputs_.begin(), outputs_.end(), [](const AskedPointer& a, const AskedPointer& b) {
    return a->frequency.InputPerAsked() < b->frequency.InputPerAsked();
  });
}

// A question, and how far its answer is.
class LoopWithin::Question {
 public:
  Question(const LoopWithin& within, const Relaxed& relaxed)
      : within_(within),
        relaxed_(relaxed),
        fractions_(within.fractions_ || relaxed.whole),
        inputs_(relaxed.second_input ? within.first_input_ : within.inputs_),
        largest_((relaxed.dividers ? kRelaxedDivider
                                   : hardware::LargestDivider(within.limits_.max_count)) *
                 kEighths) {
    for (const AskedPointer& output : within_.outputs_) {
      const Relaxed::OfOutput& own = relaxed_.outputs[output->index];
      if (!own.jitter && output->max_jitter) jitter_.Add(*output->max_jitter);
      const bool has_shape = (output->shape.AsksForPhase() && !own.phase) ||
                             (output->shape.AsksForDuty() && !own.duty);
      asks_for_shape_ = asks_for_shape_ || has_shape;
    }
  }

  std::optional<Settings> Answer() {
    const std::optional<Bandwidth>& only = within_.request_.bandwidth;
    const Range* tried = nullptr;
    for (const Bandwidth bandwidth : hardware::kBandwidths) {
      if (only && !relaxed_.bandwidth && *only != bandwidth) continue;
      const Range& pfd = within_.limits_.PfdOf(bandwidth);
      // Only the PFD and the jitter depend on the bandwidth.
      const bool is_no_wider = tried != nullptr && (relaxed_.pfd || IsInside(pfd, *tried));
      if (is_no_wider && !jitter_.IsAsked()) continue;
      tried = &pfd;
      bandwidth_ = bandwidth;
      hopeless_ = HopelessUpTo();
      if (auto settings = AnswerWithin(pfd)) return settings;
    }
    return std::nullopt;
  }

 private:
  static bool IsInside(const Range& range, const Range& other) {
    return other.lowest <= range.lowest && range.highest <= other.highest;
  }

  std::optional<Settings> AnswerWithin(const Range& pfd) {
    MSet m = MSetOf(within_.primitive_, fractions_);
    if (relaxed_.m) m = {kEighths, kRelaxedM * kEighths, fractions_ ? 1 : kEighths, false};
    const LoopGrid grid =
        LoopGridOf(inputs_, m, relaxed_.d ? kRelaxedD : hardware::kLargestD,
                   relaxed_.vco ? std::nullopt : std::optional(within_.limits_.vco),
                   relaxed_.pfd ? std::nullopt : std::optional(pfd));
    if (grid.rows.empty() || grid.lowest > grid.highest) return std::nullopt;
    // Beside a fraction nothing moves, unless that does not count. Without a demand on phase or
    // duty cycle whole numbers are but some of the eighths.
    if (!fractions_) return AnswerWith(grid, MKind::kWhole, true, false);
    if (relaxed_.nothing_moves || !asks_for_shape_) {
      return AnswerWith(grid, MKind::kAll, true, true);
    }
    if (auto settings = AnswerWith(grid, MKind::kWhole, true, false)) return settings;
    return AnswerWith(grid, MKind::kAll, false, true);
  }

  // With M of a kind, dividers that are whole or can be fractions, and phases and high times or
  // none.
  std::optional<Settings> AnswerWith(const LoopGrid& grid, MKind m_kind, bool moves,
                                     bool with_fractions) {
    moves_ = moves;
    with_fractions_ = with_fractions;
    Spans spans = {{grid.lowest, grid.highest}};
    Spans left;
    for (const AskedPointer& output : within_.outputs_) {
      left.clear();
      MeetOutput(*output, spans, &left);
      if (left.empty()) return std::nullopt;
      std::swap(spans, left);
    }
    const int step = m_kind == MKind::kWhole ? kEighths : grid.step;
    const int largest = grid.rows.back().d;
    const double largest_m = LargestM(grid) * (1 + kWider);
    for (const Span& span : spans) {
      const Denominators ds({span.lowest / step, span.highest / step}, largest);
      auto at = grid.rows.begin();
      for (int d = ds.First(); d <= largest && span.lowest * d <= largest_m; d = ds.Next(d)) {
        at = std::lower_bound(at, grid.rows.end(), d,
                              [](const Row& one, int wanted) { return one.d < wanted; });
        if (at->d != d) continue;
        const Row& row = *at;
        if (span.highest * (1 + kWider) <= hopeless_ * row.d) break;
        Settings settings;
        Outcome outcome = Outcome::kNot;
        ForEachM(row, grid.step, m_kind, span, [&](int m) {
          outcome = Try(m, row.d, &settings);
          return outcome == Outcome::kNot;
        });
        if (outcome == Outcome::kFound) return settings;
      }
    }
    return std::nullopt;
  }

  static int LargestM(const LoopGrid& grid) {
    int largest = kEighths;
    for (const Row& row : grid.rows) largest = std::max(largest, row.last);
    return largest;
  }

  int StepOf(const Asked& output) const {
    return with_fractions_ && (relaxed_.whole || output.index == 0) ? 1 : kEighths;
  }

  bool IsDivider(int divider) const {
    if (divider < kEighths || divider > largest_) return false;
    return relaxed_.dividers || divider == kEighths ||
           divider >= hardware::kSmallestFractionalDivider * kEighths;
  }

  // Leaves of spans what an output leaves.
  void MeetOutput(const Asked& output, const Spans& spans, Spans* left) const {
    const Relaxed::OfOutput& own = relaxed_.outputs[output.index];
    const SpanCase one = {.frequency = own.frequency,
                          .phase = own.phase,
                          .duty = own.duty,
                          .range = own.range,
                          .dividers = relaxed_.dividers,
                          .second_input = relaxed_.second_input,
                          .moves = moves_,
                          .in_eighths = StepOf(output) == 1};
    constexpr std::size_t kMany = 64;
    const SpanStore::Kept kept = output.spans.Of(one, spans.size() > kMany, [&] {
      Spans all;
      WorkOutSpans(output, {{0, HUGE_VAL}}, &all);
      return all;
    });
    if (kept) return Common(spans, *kept, left);
    WorkOutSpans(output, spans, left);
  }

  void WorkOutSpans(const Asked& output, const Spans& spans, Spans* left) const {
    const Relaxed::OfOutput& own = relaxed_.outputs[output.index];
    const RatioRange& range = relaxed_.second_input ? output.first_range : output.range;
    SpanOutput ends = {.lowest = 0,
                       .highest = HUGE_VAL,
                       .first = kEighths,
                       .last = largest_,
                       .step = StepOf(output)};
    if (!own.frequency) {
      const double exact = 1 / output.frequency.InputPerAsked();
      ends.lowest = exact * (1 - output.frequency.Allowed());
      ends.highest = exact * (1 + output.frequency.Allowed());
    }
    if (!own.range) {
      ends.lowest = std::max(ends.lowest, range.Lowest());
      ends.highest = std::min(ends.highest, range.Highest());
    }
    const auto is_allowed = [&](int divider) {
      return IsDivider(divider) && IsShapeMet(output, divider);
    };
    if (ends.highest < HUGE_VAL) return Meet(spans, ends, is_allowed, left);
    // Any frequency, with any divider that has the shape.
    for (int divider = ends.first; divider <= ends.last; divider += ends.step) {
      if (!is_allowed(divider)) continue;
      *left = spans;
      return;
    }
  }

  bool IsShapeMet(const Asked& output, int divider) const {
    const Relaxed::OfOutput& own = relaxed_.outputs[output.index];
    const OutputShape& shape = ShapeOf(output);
    if (output.shape.AsksForPhase() && !own.phase) {
      if (!(moves_ ? shape.Phase(divider) : shape.StillPhase()).is_met) return false;
    }
    if (output.shape.AsksForDuty() && !own.duty) {
      if (!(moves_ ? shape.Duty(divider) : shape.StillDuty()).is_met) return false;
    }
    return true;
  }

  bool IsSurelyTooLarge(double jitter) const {
    return !jitter_.IsMet(jitter * (1 - 10 * answer::LoopJitter::kRounding));
  }

  // An M / D^2, M in eighths, with which and below which the jitter is surely too large: it falls
  // when that rises. A large D stands for all, as its M are close together.
  double HopelessUpTo() const {
    if (!jitter_.IsAsked() || !within_.jitter_.FallsWithRatio()) return 0;
    constexpr int kFineD = 256;
    constexpr int kSquare = kFineD * kFineD;
    int hopeless = 0;
    int most = kRelaxedM * kEighths * kSquare;
    while (hopeless < most) {
      const int middle = hopeless + (most - hopeless + 1) / 2;
      if (IsSurelyTooLarge(within_.jitter_.PeakToPeak(middle, kFineD, bandwidth_))) {
        hopeless = middle;
      } else {
        most = middle - 1;
      }
    }
    return static_cast<double>(hopeless) / kSquare;
  }

  // What came of an M and a D. With a jitter that is surely too large, a smaller M has a larger
  // one.
  enum class Outcome { kFound, kNot, kNorSmallerM };

  Outcome Try(int m, int d, Settings* settings) const {
    if (jitter_.IsAsked()) {
      const double jitter = within_.jitter_.PeakToPeak(m, d, bandwidth_);
      if (!jitter_.IsMet(jitter)) {
        const bool is_sure = within_.jitter_.FallsWithRatio() && IsSurelyTooLarge(jitter);
        return is_sure ? Outcome::kNorSmallerM : Outcome::kNot;
      }
    }
    std::array<int, kMostOutputs> dividers{};
    for (const AskedPointer& output : within_.outputs_) {
      dividers[output->index] = DividerOf(*output, m, d);
      if (dividers[output->index] == 0) return Outcome::kNot;
    }
    *settings = SettingsOf(m, d, dividers);
    return Outcome::kFound;
  }

  LoopSettings SettingsOf(int m, int d, const std::array<int, kMostOutputs>& dividers) const {
    LoopSettings made{within_.primitive_, bandwidth_, m, d, {}};
    made.outputs.resize(within_.request_.outputs.size());
    bool is_whole = m % kEighths == 0;
    for (const int divider : dividers) is_whole = is_whole && divider % kEighths == 0;
    for (const AskedPointer& output : within_.outputs_) {
      LoopOutput& set = made.outputs[output->index];
      set.divider = dividers[output->index];
      if (!is_whole && !relaxed_.nothing_moves) continue;
      const OutputShape& shape = ShapeOf(*output);
      set.phase = shape.Step(set.divider);
      set.high_time = shape.HighTime(set.divider);
    }
    return made;
  }

  const OutputShape& ShapeOf(const Asked& output) const {
    return relaxed_.dividers ? output.long_shape : output.shape;
  }

  // A divider that is as asked for, the smallest; 0 when there is none.
  int DividerOf(const Asked& output, int m, int d) const {
    const Relaxed::OfOutput& own = relaxed_.outputs[output.index];
    const RatioRange& range = relaxed_.second_input ? output.first_range : output.range;
    const double ratio = static_cast<double>(m) / d;
    double from = 0;
    double to = largest_;
    if (!own.frequency) {
      const double ideal = ratio * output.frequency.InputPerAsked();
      from = ideal / (1 + output.frequency.Allowed());
      const double least = 1 - output.frequency.Allowed();
      if (least > 0) to = std::min(to, ideal / least);
    }
    if (!own.range) {
      from = std::max(from, ratio / range.Highest());
      to = std::min(to, ratio / range.Lowest());
    }
    const int step = StepOf(output);
    const double end = largest_ / step + 1;  // NOLINT: rounded down, and one more
    const int first = std::max(static_cast<int>(std::min(from / step, end)) * step, kEighths);
    const int last = std::min((static_cast<int>(to / step) + 1) * step, largest_);
    for (int divider = first; divider <= last; divider += step) {
      const std::int64_t whole = std::int64_t{d} * divider;
      if (!IsDivider(divider) || !IsShapeMet(output, divider)) continue;
      if (!own.frequency && !output.frequency.IsMet(m, whole)) continue;
      if (own.range || range.Contains(m, whole)) return divider;
    }
    return 0;
  }

  const LoopWithin& within_;
  const Relaxed& relaxed_;
  bool fractions_;
  const Inputs& inputs_;
  int largest_;
  JitterDemand jitter_;
  bool asks_for_shape_ = false;
  Bandwidth bandwidth_ = Bandwidth::kOptimized;
  double hopeless_ = 0;  // HopelessUpTo of that bandwidth
  bool moves_ = true;
  bool with_fractions_ = false;
};

std::optional<Settings> LoopWithin::Find(const Relaxed& relaxed) const {
  return Question(*this, relaxed).Answer();
}

}  // namespace planner::search
