// Tested by search_test.cpp.
#include "planner/search/KruSolver.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <tuple>
#include <utility>

namespace planner::search {

namespace {

constexpr std::strong_ordering kEqual = std::strong_ordering::equal;
constexpr double kAnyJitter = std::numeric_limits<double>::infinity();

std::size_t Index(int whole) { return static_cast<std::size_t>(whole); }

bool IsSameRatio(const KruRatio& a, const KruRatio& b) { return a.a * b.b == b.a * a.b; }

std::strong_ordering CompareBases(const KruBase& a, const KruBase& b) {
  const auto key = [](const KruBase& base) {
    return std::tie(base.feedback, base.divide_by_2, base.d, base.m, base.divide_halves);
  };
  return key(a) <=> key(b);
}

std::strong_ordering CompareSettings(const KruEntry& a, const KruEntry& b) {
  const std::strong_ordering order = CompareBases(a.base, b.base);
  if (order != kEqual) return order;
  // libc++ 14 has only a weak order of arrays.
  if (a.pins != b.pins)
    return a.pins < b.pins ? std::strong_ordering::less : std::strong_ordering::greater;
  return a.shift <=> b.shift;
}

}  // namespace

KruSolver::KruSolver(const KruTask& task, KruPhases* phases, bool all_met)
    : task_(task),
      phases_(*phases),
      all_met_(all_met),
      by_margin_(all_met && task.Asked().rank == Rank::kMargin) {}

const KruEntry* KruSolver::LeastOf(double jitter) const {
  for (const KruEntry& entry : front_.Entries()) {
    if (entry.jitter <= jitter) return &entry;
  }
  return nullptr;
}

void KruSolver::Solve(const KruBase& base) {
  ++solved_;
  if (!line_ || line_->feedback != base.feedback || line_->divide_by_2 != base.divide_by_2) {
    StartLine(base);
  }
  for (Table& table : tables_) {
    if (!Prepare(base, &table)) continue;
    table_ = &table;
    SolveTable(base);
  }
}

void KruSolver::StartLine(const KruBase& base) {
  line_ = {.feedback = base.feedback, .divide_by_2 = base.divide_by_2};
  tables_.clear();
  // Output 0 on CLK2X takes the feedback from there.
  const bool can_double = task_.IsSp() && base.feedback && task_.Outputs().front().Index() == 0;
  const bool can_shift = task_.IsSp() && task_.AsksForPhase();
  for (const bool doubled : {false, true}) {
    for (const bool shifted : {false, true}) {
      if ((doubled && !can_double) || (shifted && !can_shift)) continue;
      Table& table = tables_.emplace_back();
      table.doubled = doubled;
      table.shifted = shifted;
      AddPins(*line_, true, &table);
      for (Choices& choices : table.outputs) choices.of_line = choices.count;
    }
  }
}

// The pins that each output can be on, and their jitters. False when an output has none, or what is
// set is of no use: the same settings without it are looked at anyway.
bool KruSolver::Prepare(const KruBase& base, Table* table) {
  for (Choices& choices : table->outputs) choices.count = choices.of_line;
  AddPins(base, false, table);
  bool uses_m = base.m == 0;
  bool uses_divide = base.divide_halves == 0;
  jitters_.clear();
  for (std::size_t i = 0; i < task_.Outputs().size(); ++i) {
    if (table->outputs[i].count == 0) return false;
    for (const Choice& choice : table->outputs[i]) {
      uses_m = uses_m || UsesM(*choice.pin);
      uses_divide = uses_divide || UsesDivide(*choice.pin);
      if (std::find(jitters_.begin(), jitters_.end(), choice.jitter) == jitters_.end()) {
        jitters_.push_back(choice.jitter);
      }
    }
  }
  std::sort(jitters_.begin(), jitters_.end());
  return uses_m && uses_divide;
}

// The pins that need neither M nor a divide, or the others.
void KruSolver::AddPins(const KruBase& base, bool of_line, Table* table) {
  for (const KruPin& pin : task_.Pins()) {
    if (of_line == (UsesM(pin) || UsesDivide(pin)) || !IsSet(pin, base)) continue;
    if (pin.facts->needs_feedback && !base.feedback) continue;
    const double jitter = task_.JitterOf(base, pin.facts->pin, table->shifted);
    for (std::size_t i = 0; i < task_.Outputs().size(); ++i) AddPin(base, pin, i, jitter, table);
  }
}

void KruSolver::AddPin(const KruBase& base, const KruPin& pin, std::size_t place, double jitter,
                       Table* table) {
  const KruOutput& output = task_.Outputs()[place];
  const PinSource source = pin.facts->source;
  if (!IsConnected(pin, task_.IsSp(), output.Index(), base.feedback, table->doubled)) return;
  const KruRatio ratio = RatioOf(source, base);
  const RatioRange& range = *(table->doubled ? pin.doubled : pin.usual);
  if (!range.Contains(ratio.a, ratio.b)) return;
  if (all_met_ && !(output.Frequency().IsMet(ratio.a, ratio.b) && output.Jitter().IsMet(jitter) &&
                    output.IsDutyMet(source, base.divide_halves))) {
    return;
  }
  Choices& choices = table->outputs[place];
  Choice& choice = choices.all[choices.count++];
  choice.pin = &pin;
  choice.ratio = ratio;
  choice.range = &range;
  choice.jitter = jitter;
  choice.error = task_.FrequencyError(place, ratio);
  if (output.AsksForDuty()) {
    choice.error = task_.LargerOf(choice.error, task_.DutyError(place, source, base.divide_halves));
  }
  if (output.Jitter().IsAsked()) {
    choice.error = task_.LargerOf(choice.error, task_.JitterError(place, jitter));
  }
  if (by_margin_) {
    choice.margin = range.Margin(static_cast<double>(ratio.a) / static_cast<double>(ratio.b));
  }
}

void KruSolver::SolveTable(const KruBase& base) {
  for (const double jitter : jitters_) SolveWithin(base, jitter, table_->shifted);
  if (!by_margin_ || IsTooNarrow(LargestWidth(), LeastJitter())) return;
  const Shifts shifts = ShiftsMet(kAnyJitter);
  const int last = table_->shifted ? hardware::kShiftSteps : 0;
  for (int shift = table_->shifted ? 1 : 0; shift <= last; ++shift) {
    if (shifts[Index(shift)]) SolveByMargin(base, shift);
  }
}

// --- Errors and jitters ------------------------------------------------------------------------

bool KruSolver::IsAllowed(std::size_t place, const Choice& choice, double most_jitter,
                          int shift) const {
  if (choice.jitter > most_jitter) return false;
  const PhaseTable* const phases = task_.Outputs()[place].Phases();
  return !all_met_ || phases == nullptr || phases->Met(Index(choice.pin->quarter))[Index(shift)];
}

KruError KruSolver::ErrorOf(std::size_t place, const Choice& choice, int shift) const {
  if (task_.Outputs()[place].Phases() == nullptr) return choice.error;
  return task_.LargerOf(choice.error, task_.PhaseError(place, choice.pin->quarter, shift));
}

// The same as LeastError, to within its slack.
Near KruSolver::QuickError(double most_jitter, int shift) const {
  Near worst;
  for (std::size_t i = 0; i < task_.Outputs().size(); ++i) {
    const PhaseTable* const phases = task_.Outputs()[i].Phases();
    Near least = {HUGE_VAL, 0};
    for (const Choice& choice : table_->outputs[i]) {
      if (!IsAllowed(i, choice, most_jitter, shift)) continue;
      Near error = choice.error.near;
      if (phases != nullptr) {
        error = LargerOf(error, phases->Error(Index(choice.pin->quarter), Index(shift)));
      }
      least.value = std::min(least.value, error.value);
      least.slack = std::max(least.slack, error.slack);
    }
    worst = LargerOf(worst, least);
  }
  return worst;
}

// The smallest worst error with a PHASE_SHIFT; nothing when an output has no pin.
std::optional<KruError> KruSolver::LeastError(double most_jitter, int shift) const {
  KruError worst;
  for (std::size_t i = 0; i < task_.Outputs().size(); ++i) {
    std::optional<KruError> least;
    for (const Choice& choice : table_->outputs[i]) {
      if (!IsAllowed(i, choice, most_jitter, shift)) continue;
      const KruError error = ErrorOf(i, choice, shift);
      if (!least || task_.Compare(error, *least) < 0) least = error;
    }
    if (!least) return std::nullopt;
    worst = task_.LargerOf(worst, *least);
  }
  return worst;
}

// Whether settings with a jitter up to some value can rank before an entry that has no more jitter:
// whether each output has a pin whose error is smaller, and for one PHASE_SHIFT its phase, too.
bool KruSolver::CanBeBefore(const KruEntry& entry, const KruBase& base, double most_jitter,
                            bool shifted) {
  std::uint32_t quarters = 0;
  for (std::size_t i = 0; i < task_.Outputs().size(); ++i) {
    std::uint32_t own = 0;
    for (const Choice& choice : table_->outputs[i]) {
      if (choice.jitter > most_jitter || IsBehind(choice.error, entry, base, most_jitter)) continue;
      own |= std::uint32_t{1} << choice.pin->quarter;
    }
    if (own == 0) return false;
    quarters |= QuartersOf(i, own);
  }
  return !task_.AsksForPhase() ||
         !IsBehind(phases_.LeastError(quarters, shifted), entry, base, most_jitter);
}

// With all demands to be met, the shifts with which the phases of all outputs are.
Shifts KruSolver::ShiftsMet(double most_jitter) const {
  Shifts all;
  all.set();
  if (!all_met_) return all;
  for (std::size_t i = 0; i < task_.Outputs().size(); ++i) {
    const PhaseTable* const phases = task_.Outputs()[i].Phases();
    if (phases == nullptr) continue;
    Shifts own;
    for (const Choice& choice : table_->outputs[i]) {
      if (choice.jitter <= most_jitter) own |= phases->Met(Index(choice.pin->quarter));
    }
    all &= own;
  }
  return all;
}

// Whether settings with an error, and a jitter that comes to nothing less than this, are behind an
// entry with no more jitter. Where both figures are the same those decide that were there first,
// but for settings that differ in no more than pins and PHASE_SHIFT.
bool KruSolver::IsBehind(const KruError& error, const KruEntry& entry, const KruBase& base,
                         double jitter) const {
  const std::strong_ordering order = task_.Compare(error, entry.error);
  if (order != kEqual) return order > 0;
  if (entry.jitter < jitter) return true;
  return !by_margin_ && CompareBases(entry.base, base) < 0;
}

// Settings with less jitter than `most_jitter` have been looked for already.
void KruSolver::SolveWithin(const KruBase& base, double most_jitter, bool shifted) {
  const Shifts shifts = ShiftsMet(most_jitter);
  if (shifts.none()) return;
  const KruEntry* best = LeastOf(most_jitter);
  if (best != nullptr && !CanBeBefore(*best, base, most_jitter, shifted)) return;
  const int last = shifted ? hardware::kShiftSteps : 0;
  for (int shift = shifted ? 1 : 0; shift <= last; ++shift) {
    if (!shifts[Index(shift)]) continue;
    const Near error = QuickError(most_jitter, shift);
    if (error.value == HUGE_VAL) continue;
    best = LeastOf(most_jitter);
    if (best != nullptr && IsSurelyBelow(best->error.near, error)) continue;
    SolveShift(base, most_jitter, shift);
  }
}

void KruSolver::SolveShift(const KruBase& base, double most_jitter, int shift) {
  const std::optional<KruError> error = LeastError(most_jitter, shift);
  if (!error) return;
  const KruEntry* const best = LeastOf(most_jitter);
  if (best != nullptr && IsBehind(*error, *best, base, most_jitter)) return;
  LeaveNearest(most_jitter, *error, shift);
  if (by_margin_) LeaveWidest();
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
    for (const Choice& choice : table_->outputs[i]) {
      if (IsAllowed(i, choice, most_jitter, shift) &&
          task_.Compare(ErrorOf(i, choice, shift), error) <= 0) {
        left_[i].push_back(&choice);
      }
    }
  }
}

// --- Margins -----------------------------------------------------------------------------------

KruSolver::Width KruSolver::WidthOf(PinSource source, const KruBase& base,
                                    std::size_t place) const {
  Width widest{{-HUGE_VAL, 0}, RatioOf(source, base), nullptr};
  const double quotient = static_cast<double>(widest.ratio.a) / static_cast<double>(widest.ratio.b);
  const auto look = [&](const RatioRange& range) {
    const Near margin = range.Margin(quotient);
    if (margin.value <= widest.margin.value) return;
    widest.margin = margin;
    widest.range = &range;
  };
  for (const KruPin& pin : task_.Pins()) {
    if (pin.facts->source != source) continue;
    if (!phases_.CanMeet(place, std::uint32_t{1} << pin.quarter)) continue;
    look(*pin.usual);
    if (base.feedback) look(*pin.doubled);
  }
  return widest;
}

bool KruSolver::IsTooNarrow(const Width& width, double jitter) const {
  if (!widest_) return false;
  if (IsSurelyBelow(width.margin, widest_->margin)) return true;
  // Where the margin is the same as that of the best the jitter decides.
  return jitter > widest_->jitter && width.range == widest_->margin_range &&
         IsSameRatio(width.ratio, widest_->margin_ratio);
}

// With the pins that each output can be on.
double KruSolver::LeastJitter() const {
  double most = 0;
  for (std::size_t i = 0; i < task_.Outputs().size(); ++i) {
    double least = kAnyJitter;
    for (const Choice& choice : table_->outputs[i]) least = std::min(least, choice.jitter);
    most = std::max(most, least);
  }
  return most;
}

KruSolver::Width KruSolver::LargestWidth() const {
  Width least;
  for (std::size_t i = 0; i < task_.Outputs().size(); ++i) {
    Width most{{-HUGE_VAL, 0}, {0, 1}, nullptr};
    for (const Choice& choice : table_->outputs[i]) {
      if (choice.margin.value <= most.margin.value) continue;
      if (!phases_.CanMeet(i, std::uint32_t{1} << choice.pin->quarter)) continue;
      most = {choice.margin, choice.ratio, choice.range};
    }
    if (most.margin.value < least.margin.value) least = most;
  }
  return least;
}

// The settings with the largest margin; of those the ones with the least jitter, and of those the
// ones with the smallest error.
void KruSolver::SolveByMargin(const KruBase& base, int shift) {
  for (std::size_t i = 0; i < task_.Outputs().size(); ++i) {
    left_[i].clear();
    for (const Choice& choice : table_->outputs[i]) {
      if (IsAllowed(i, choice, kAnyJitter, shift)) left_[i].push_back(&choice);
    }
    if (left_[i].empty()) return;
  }
  LeaveWidest();
  LeaveLeast(shift);
  KruEntry entry;
  if (!MakeEntry(base, shift, &entry)) return;
  if (!widest_ || IsBeforeByMargin(entry, *widest_)) widest_ = entry;
}

// Leaves the pins with which the smallest margin of all outputs is the largest.
void KruSolver::LeaveWidest() {
  const auto is_below = [](const Choice& a, const Choice& b) {
    if (IsSurelyBelow(a.margin, b.margin)) return true;
    if (IsSurelyBelow(b.margin, a.margin)) return false;
    if (a.range == b.range && IsSameRatio(a.ratio, b.ratio)) return false;
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
    std::erase_if(left_[i], [&](const Choice* choice) { return is_below(*choice, *narrowest); });
  }
}

// Leaves the pins with which the jitter, and then the error, is the least.
void KruSolver::LeaveLeast(int shift) {
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
}

// --- Entries -----------------------------------------------------------------------------------

// From the pins with the lowest codes that are left. False when M and D or the divide are not used.
bool KruSolver::MakeEntry(const KruBase& base, int shift, KruEntry* entry) const {
  entry->base = base;
  entry->shift = shift;
  bool uses_m = false;
  bool uses_divide = false;
  for (std::size_t i = 0; i < task_.Outputs().size(); ++i) {
    const Choice& choice = **std::min_element(
        left_[i].begin(), left_[i].end(),
        [](const Choice* a, const Choice* b) { return a->pin->facts->pin < b->pin->facts->pin; });
    uses_m = uses_m || UsesM(*choice.pin);
    uses_divide = uses_divide || UsesDivide(*choice.pin);
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
  return (base.m == 0 || uses_m) && (base.divide_halves == 0 || uses_divide);
}

// The largest first.
std::strong_ordering KruSolver::CompareMargins(const KruEntry& a, const KruEntry& b) const {
  if (IsSurelyBelow(b.margin, a.margin)) return std::strong_ordering::less;
  if (IsSurelyBelow(a.margin, b.margin)) return std::strong_ordering::greater;
  if (a.margin_range == b.margin_range && IsSameRatio(a.margin_ratio, b.margin_ratio)) {
    return kEqual;
  }
  return b.margin_range->ExactMargin(b.margin_ratio.a, b.margin_ratio.b) <=>
         a.margin_range->ExactMargin(a.margin_ratio.a, a.margin_ratio.b);
}

// Of two with the same error and jitter.
bool KruSolver::IsBefore(const KruEntry& a, const KruEntry& b) const {
  if (by_margin_) {
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
    settings.pins[Index(task_.Outputs()[i].Index())] = entry.pins[i];
  }
  Candidate candidate{.settings = std::move(settings),
                      .within = all_met_,
                      .worst_error = task_.Exact(entry.error),
                      .max_jitter = std::nullopt};
  if (entry.jitter != answer::kUnknownJitter) candidate.max_jitter = entry.jitter;
  return candidate;
}

std::vector<Candidate> KruSolver::TradeOffs(std::size_t most) const {
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
