// Tested by search_test.cpp.
#include "planner/search/KruSolver.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <tuple>

namespace planner::search {

namespace {

constexpr std::strong_ordering kEqual = std::strong_ordering::equal;
constexpr double kAnyJitter = std::numeric_limits<double>::infinity();

bool IsSynthesised(PinSource source) {
  return source == PinSource::kSynthesiser || source == PinSource::kDividedSynthesiser;
}

bool IsDivided(PinSource source) {
  return source == PinSource::kDivider || source == PinSource::kDividedSynthesiser;
}

std::strong_ordering CompareSettings(const KruEntry& a, const KruEntry& b) {
  const auto key = [](const KruEntry& entry) {
    const KruBase& base = entry.base;
    return std::tie(base.feedback, base.divide_by_2, base.d, base.m, base.divide_halves,
                    entry.pins, entry.shift);
  };
  return key(a) <=> key(b);
}

}  // namespace

KruSolver::KruSolver(const KruTask& task)
    : task_(task), by_margin_(task.Asked().rank == Rank::kMargin) {}

double KruSolver::BoundOf(double jitter) const {
  for (const KruEntry& entry : front_.Entries()) {
    if (entry.jitter <= jitter) return entry.error.near.value + entry.error.near.slack;
  }
  return HUGE_VAL;
}

void KruSolver::Solve(const KruBase& base, bool all_met) {
  all_met_ = all_met;
  ++solved_;
  // Output 0 on CLK2X takes the feedback from there.
  const bool can_double = task_.IsSp() && base.feedback && task_.Outputs().front().Index() == 0;
  for (const bool doubled : {false, true}) {
    if (doubled && !can_double) continue;
    for (const bool shifted : {false, true}) {
      if (shifted && !(task_.IsSp() && task_.AsksForPhase())) continue;
      if (!Prepare(base, doubled, shifted)) continue;
      std::vector<double> jitters;
      for (std::size_t i = 0; i < task_.Outputs().size(); ++i) {
        for (const Choice& choice : choices_[i]) jitters.push_back(choice.jitter);
      }
      std::sort(jitters.begin(), jitters.end());
      jitters.erase(std::unique(jitters.begin(), jitters.end()), jitters.end());
      for (const double jitter : jitters) SolveWithin(base, jitter, shifted);
      if (!by_margin_ || !all_met) continue;
      const Shifts shifts = ShiftsMet(kAnyJitter);
      for (int shift = shifted ? 1 : 0; shift <= (shifted ? hardware::kShiftSteps : 0); ++shift) {
        if (shifts[static_cast<std::size_t>(shift)]) TakeByMargin(base, shift);
      }
    }
  }
}

// The pins that each output can be on. False when one has none, or what is set is of no use: the
// same settings without it are looked at anyway.
bool KruSolver::Prepare(const KruBase& base, bool doubled, bool shifted) {
  bool is_synthesised = false;
  bool is_divided = false;
  std::array<double, hardware::kPins.size() + 1> jitters;
  for (const KruPin& pin : task_.Pins()) {
    const PinSource source = pin.facts->source;
    const bool has_m = base.m != 0 || !IsSynthesised(source);
    const bool has_divide = base.divide_halves != 0 || !IsDivided(source);
    if (!has_m || !has_divide) continue;
    jitters[static_cast<std::size_t>(pin.facts->pin)] =
        task_.JitterOf(base, pin.facts->pin, shifted);
  }
  for (std::size_t i = 0; i < task_.Outputs().size(); ++i) {
    choices_[i].clear();
    for (const KruPin& pin : task_.Pins()) {
      AddChoice(i, base, pin, doubled, jitters[static_cast<std::size_t>(pin.facts->pin)]);
    }
    if (choices_[i].empty()) return false;
    for (const Choice& choice : choices_[i]) {
      is_synthesised = is_synthesised || IsSynthesised(choice.pin->facts->source);
      is_divided = is_divided || IsDivided(choice.pin->facts->source);
    }
  }
  return (base.m == 0 || is_synthesised) && (base.divide_halves == 0 || is_divided);
}

void KruSolver::AddChoice(std::size_t place, const KruBase& base, const KruPin& pin, bool doubled,
                          double jitter) {
  const KruOutput& output = task_.Outputs()[place];
  const PinSource source = pin.facts->source;
  if (pin.facts->needs_feedback && !base.feedback) return;
  if (IsSynthesised(source) && base.m == 0) return;
  if (IsDivided(source) && base.divide_halves == 0) return;
  if (output.Index() == 0) {
    if (task_.IsSp() ? doubled != (pin.facts->pin == Pin::kClk2x)
                     : pin.facts->pin != Pin::kClkfx) {
      return;
    }
  }
  const KruRatio ratio = RatioOf(source, base);
  const RatioRange& range = doubled ? pin.doubled : pin.usual;
  if (!range.Contains(ratio.a, ratio.b)) return;
  const FrequencyDemand& frequency = output.Frequency();
  if (all_met_ && !(frequency.IsMet(ratio.a, ratio.b) && output.Jitter().IsMet(jitter) &&
                    output.IsDutyMet(source, base.divide_halves))) {
    return;
  }
  Choice choice{&pin, ratio, &range, {}, jitter, {}};
  choice.base.near = frequency.Error(ratio.a, ratio.b);
  choice.base.demand = KruError::Demand::kFrequency;
  choice.base.output = place;
  choice.base.ratio = ratio;
  if (output.AsksForDuty()) {
    KruError duty{.near = output.DutyError(source, base.divide_halves),
                  .demand = KruError::Demand::kDuty,
                  .output = place,
                  .source = source,
                  .divide_halves = base.divide_halves};
    choice.base = task_.LargerOf(choice.base, duty);
  }
  if (output.Jitter().IsAsked()) {
    KruError error{.near = output.Jitter().Error(jitter),
                   .demand = KruError::Demand::kJitter,
                   .output = place,
                   .jitter = jitter};
    choice.base = task_.LargerOf(choice.base, error);
  }
  if (by_margin_) {
    choice.margin =
        range.Margin(static_cast<double>(ratio.a) / static_cast<double>(ratio.b));
  }
  choices_[place].push_back(choice);
}

// --- Errors and jitters ------------------------------------------------------------------------

bool KruSolver::IsAllowed(std::size_t place, const Choice& choice, double most_jitter,
                          int shift) const {
  if (choice.jitter > most_jitter) return false;
  const PhaseTable* const phases = task_.Outputs()[place].Phases();
  return !all_met_ || phases == nullptr ||
         phases->Met(static_cast<std::size_t>(choice.pin->quarter))[static_cast<std::size_t>(shift)];
}

KruError KruSolver::ErrorOf(std::size_t place, const Choice& choice, int shift) const {
  const PhaseTable* const phases = task_.Outputs()[place].Phases();
  if (phases == nullptr) return choice.base;
  const KruError phase{.near = phases->Error(static_cast<std::size_t>(choice.pin->quarter),
                                             static_cast<std::size_t>(shift)),
                       .demand = KruError::Demand::kPhase,
                       .output = place,
                       .quarter = choice.pin->quarter,
                       .shift = shift};
  return task_.LargerOf(choice.base, phase);
}

// The same as LeastError, to within its slack.
Near KruSolver::QuickError(double most_jitter, int shift) const {
  double worst = 0;
  double slack = 0;
  for (std::size_t i = 0; i < task_.Outputs().size(); ++i) {
    const PhaseTable* const phases = task_.Outputs()[i].Phases();
    double least = HUGE_VAL;
    for (const Choice& choice : choices_[i]) {
      if (!IsAllowed(i, choice, most_jitter, shift)) continue;
      double error = choice.base.near.value;
      slack = std::max(slack, choice.base.near.slack);
      if (phases != nullptr) {
        const Near phase = phases->Error(static_cast<std::size_t>(choice.pin->quarter),
                                         static_cast<std::size_t>(shift));
        error = std::max(error, phase.value);
        slack = std::max(slack, phase.slack);
      }
      least = std::min(least, error);
    }
    worst = std::max(worst, least);
  }
  return {worst, slack};
}

std::optional<KruError> KruSolver::LeastError(double most_jitter, int shift) const {
  KruError worst;
  for (std::size_t i = 0; i < task_.Outputs().size(); ++i) {
    std::optional<KruError> least;
    for (const Choice& choice : choices_[i]) {
      if (!IsAllowed(i, choice, most_jitter, shift)) continue;
      const KruError error = ErrorOf(i, choice, shift);
      if (!least || task_.Compare(error, *least) < 0) least = error;
    }
    if (!least) return std::nullopt;
    worst = task_.LargerOf(worst, *least);
  }
  return worst;
}

// With all demands to be met, the shifts with which the phases of all outputs are.
Shifts KruSolver::ShiftsMet(double most_jitter) const {
  Shifts all;
  all.set();
  for (std::size_t i = 0; i < task_.Outputs().size(); ++i) {
    const PhaseTable* const phases = task_.Outputs()[i].Phases();
    Shifts own;
    for (const Choice& choice : choices_[i]) {
      if (choice.jitter > most_jitter) continue;
      if (phases == nullptr || !all_met_) {
        own.set();
      } else {
        own |= phases->Met(static_cast<std::size_t>(choice.pin->quarter));
      }
    }
    all &= own;
  }
  return all;
}

void KruSolver::SolveWithin(const KruBase& base, double most_jitter, bool shifted) {
  const Shifts shifts = ShiftsMet(most_jitter);
  if (shifts.none()) return;
  const int last = shifted ? hardware::kShiftSteps : 0;
  for (int shift = shifted ? 1 : 0; shift <= last; ++shift) {
    if (!shifts[static_cast<std::size_t>(shift)]) continue;
    const Near error = QuickError(most_jitter, shift);
    if (error.value - error.slack > BoundOf(most_jitter)) continue;
    SolveShift(base, most_jitter, shift);
  }
}

void KruSolver::SolveShift(const KruBase& base, double most_jitter, int shift) {
  const std::optional<KruError> error = LeastError(most_jitter, shift);
  if (!error) return;
  LeaveNearest(most_jitter, *error, shift);
  if (by_margin_ && all_met_) LeaveWidest();
  KruEntry entry;
  if (!MakeEntry(base, shift, &entry)) return;
  front_.Take(
      entry, [&](const auto& a, const auto& b) { return task_.Compare(a.error, b.error); },
      [&](const auto& a, const auto& b) { return IsBefore(a, b); });
}

// Leaves the pins with which an error is not exceeded.
void KruSolver::LeaveNearest(double most_jitter, const KruError& error, int shift) {
  for (std::size_t i = 0; i < task_.Outputs().size(); ++i) {
    left_[i].clear();
    for (const Choice& choice : choices_[i]) {
      if (IsAllowed(i, choice, most_jitter, shift) &&
          task_.Compare(ErrorOf(i, choice, shift), error) <= 0) {
        left_[i].push_back(&choice);
      }
    }
  }
}

// --- Margins -----------------------------------------------------------------------------------

// Leaves the pins with which the smallest margin of all outputs is the largest.
void KruSolver::LeaveWidest() {
  const auto is_below = [](const Choice& a, const Choice& b) {
    if (IsSurelyBelow(a.margin, b.margin)) return true;
    if (IsSurelyBelow(b.margin, a.margin)) return false;
    if (a.range == b.range && a.ratio.a * b.ratio.b == b.ratio.a * a.ratio.b) return false;
    return a.range->ExactMargin(a.ratio.a, a.ratio.b) < b.range->ExactMargin(b.ratio.a, b.ratio.b);
  };
  const Choice* narrowest = nullptr;
  for (std::size_t i = 0; i < task_.Outputs().size(); ++i) {
    const Choice* widest = left_[i].front();
    for (const Choice* const choice : left_[i]) {
      if (is_below(*widest, *choice)) widest = choice;
    }
    if (narrowest == nullptr || is_below(*widest, *narrowest)) narrowest = widest;
  }
  for (std::size_t i = 0; i < task_.Outputs().size(); ++i) {
    std::erase_if(left_[i],
                  [&](const Choice* choice) { return is_below(*choice, *narrowest); });
  }
}

// The settings with the largest margin; of those the ones with the least jitter, and of those the
// ones with the smallest error.
void KruSolver::TakeByMargin(const KruBase& base, int shift) {
  for (std::size_t i = 0; i < task_.Outputs().size(); ++i) {
    left_[i].clear();
    for (const Choice& choice : choices_[i]) {
      if (IsAllowed(i, choice, kAnyJitter, shift)) left_[i].push_back(&choice);
    }
    if (left_[i].empty()) return;
  }
  LeaveWidest();
  double most = 0;
  for (std::size_t i = 0; i < task_.Outputs().size(); ++i) {
    double least = kAnyJitter;
    for (const Choice* const choice : left_[i]) least = std::min(least, choice->jitter);
    most = std::max(most, least);
  }
  KruError worst;
  for (std::size_t i = 0; i < task_.Outputs().size(); ++i) {
    std::erase_if(left_[i], [&](const Choice* choice) { return choice->jitter > most; });
    KruError least = ErrorOf(i, *left_[i].front(), shift);
    for (const Choice* const choice : left_[i]) {
      const KruError error = ErrorOf(i, *choice, shift);
      if (task_.Compare(error, least) < 0) least = error;
    }
    worst = task_.LargerOf(worst, least);
  }
  for (std::size_t i = 0; i < task_.Outputs().size(); ++i) {
    std::erase_if(left_[i], [&](const Choice* choice) {
      return task_.Compare(ErrorOf(i, *choice, shift), worst) > 0;
    });
  }
  KruEntry entry;
  if (!MakeEntry(base, shift, &entry)) return;
  if (!widest_ || IsBeforeByMargin(entry, *widest_)) widest_ = entry;
}

// --- Entries -----------------------------------------------------------------------------------

// From the pins with the lowest codes that are left. False when M and D or the divide are not used.
bool KruSolver::MakeEntry(const KruBase& base, int shift, KruEntry* entry) const {
  entry->base = base;
  entry->shift = shift;
  bool is_synthesised = false;
  bool is_divided = false;
  for (std::size_t i = 0; i < task_.Outputs().size(); ++i) {
    const Choice& choice = *left_[i].front();
    const PinSource source = choice.pin->facts->source;
    is_synthesised = is_synthesised || IsSynthesised(source);
    is_divided = is_divided || IsDivided(source);
    entry->pins[i] = choice.pin->facts->pin;
    entry->jitter = std::max(entry->jitter, choice.jitter);
    entry->error = task_.LargerOf(entry->error, ErrorOf(i, choice, shift));
    if (!by_margin_) continue;
    KruEntry other;
    other.margin = choice.margin;
    other.margin_ratio = choice.ratio;
    other.margin_range = choice.range;
    if (entry->margin_range == nullptr || CompareMargins(*entry, other) < 0) {
      entry->margin = other.margin;
      entry->margin_ratio = other.margin_ratio;
      entry->margin_range = other.margin_range;
    }
  }
  return (base.m == 0 || is_synthesised) && (base.divide_halves == 0 || is_divided);
}

// The largest first.
std::strong_ordering KruSolver::CompareMargins(const KruEntry& a, const KruEntry& b) const {
  if (IsSurelyBelow(b.margin, a.margin)) return std::strong_ordering::less;
  if (IsSurelyBelow(a.margin, b.margin)) return std::strong_ordering::greater;
  if (a.margin_range == b.margin_range &&
      a.margin_ratio.a * b.margin_ratio.b == b.margin_ratio.a * a.margin_ratio.b) {
    return kEqual;
  }
  return b.margin_range->ExactMargin(b.margin_ratio.a, b.margin_ratio.b) <=>
         a.margin_range->ExactMargin(a.margin_ratio.a, a.margin_ratio.b);
}

// Of two with the same error and jitter.
bool KruSolver::IsBefore(const KruEntry& a, const KruEntry& b) const {
  if (by_margin_ && all_met_) {
    const std::strong_ordering order = CompareMargins(a, b);
    if (order != kEqual) return order < 0;
  }
  return CompareSettings(a, b) < 0;
}

bool KruSolver::IsBeforeByMargin(const KruEntry& a, const KruEntry& b) const {
  const std::strong_ordering by_margin = CompareMargins(a, b);
  if (by_margin != kEqual) return by_margin < 0;
  if (a.jitter != b.jitter) return a.jitter < b.jitter;
  const std::strong_ordering by_error = task_.Compare(a.error, b.error);
  if (by_error != kEqual) return by_error < 0;
  return CompareSettings(a, b) < 0;
}

Candidate KruSolver::CandidateOf(const KruEntry& entry) const {
  KruSettings settings{.primitive = task_.Which(),
                       .feedback = entry.base.feedback,
                       .divide_by_2 = entry.base.divide_by_2,
                       .m = entry.base.m,
                       .d = entry.base.d,
                       .divide_halves = entry.base.divide_halves,
                       .phase_shift = entry.shift,
                       .pins = {}};
  settings.pins.resize(task_.Asked().outputs.size(), Pin::kNone);
  for (std::size_t i = 0; i < task_.Outputs().size(); ++i) {
    settings.pins[static_cast<std::size_t>(task_.Outputs()[i].Index())] = entry.pins[i];
  }
  Candidate candidate{.settings = std::move(settings),
                      .within = all_met_,
                      .worst_error = task_.Exact(entry.error),
                      .max_jitter = std::nullopt};
  if (entry.jitter != answer::kUnknownJitter) candidate.max_jitter = entry.jitter;
  return candidate;
}

std::vector<Candidate> KruSolver::Front(std::size_t most) const {
  std::vector<Candidate> front;
  for (const KruEntry& entry : front_.Entries()) {
    if (front.size() == most) break;
    front.push_back(CandidateOf(entry));
  }
  return front;
}

// Where all demands are met the least jitter counts before the error, but with Rank::kError.
std::optional<Candidate> KruSolver::Best() const {
  if (widest_) return CandidateOf(*widest_);
  const std::vector<KruEntry>& entries = front_.Entries();
  if (entries.empty()) return std::nullopt;
  const bool by_error = !all_met_ || task_.Asked().rank == Rank::kError;
  return CandidateOf(by_error ? entries.front() : entries.back());
}

}  // namespace planner::search
