// Tested by search_test.cpp.
#include "planner/search/KruReach.h"

#include <algorithm>
#include <cmath>
#include <utility>

#include "planner/search/Fractions.h"

namespace planner::search {

namespace {

// Whether an output can be on a source at all.
bool HasSource(const KruTask& task, PinSource source, std::size_t place, bool feedback) {
  if (source == PinSource::kSynthesiser) return true;
  if (task.IsSp()) return feedback && source != PinSource::kDividedSynthesiser;
  return source == PinSource::kDividedSynthesiser && task.Outputs()[place].Index() != 0;
}

// That of all pins of a source, with all of their ranges.
Span RangeOf(const KruTask& task, PinSource source) {
  Span span = {HUGE_VAL, 0};
  for (const KruPin& pin : task.Pins()) {
    if (pin.facts->source != source) continue;
    for (const RatioRange* const range : {pin.usual, pin.doubled}) {
      span.lowest = std::min(span.lowest, range->Lowest());
      span.highest = std::max(span.highest, range->Highest());
    }
  }
  return span;
}

}  // namespace

KruReach::KruReach(const KruTask& task, KruPhases* phases, const Terms& terms,
                   std::span<const int> divides, int largest)
    : task_(task),
      phases_(*phases),
      terms_(terms),
      divides_(divides),
      largest_(largest),
      whole_(RangeOf(task, PinSource::kSynthesiser)),
      divided_(RangeOf(task, PinSource::kDividedSynthesiser)) {
  for (std::size_t i = 0; i < task.Outputs().size(); ++i) all_ |= Outputs{1} << i;
}

void KruReach::Start(const KruBase& line) {
  line_ = line;
  ++changes_;
  open_.clear();
  open_.push_back(StepWith(hardware::kSmallestKruM, terms_.most, nullptr));
  steps_ = open_;
}

void KruReach::Bind(int m, const KruError& error) {
  // The steps are by their M, and each has a smaller error than those before it.
  auto place = steps_.begin();
  while (place != steps_.end() && place->m <= m) ++place;
  Step& before = *(place - 1);  // there is one from the smallest M on
  if (before.bound && task_.Compare(*before.bound, error) <= 0) return;
  ++changes_;
  auto last = place;
  while (last != steps_.end() && task_.Compare(error, *last->bound) <= 0) ++last;
  Step step = StepWith(m, error, &before);
  if (before.m == m) {
    before = std::move(step);
    steps_.erase(place, last);
  } else if (place != last) {
    *place = std::move(step);
    steps_.erase(place + 1, last);
  } else {
    steps_.insert(place, std::move(step));
  }
}

int KruReach::FirstD() const {
  int first = largest_ + 1;
  for (const Step& step : steps_) {
    if (!step.spans.empty()) first = std::min(first, step.first_d);
  }
  return first;
}

SmallSet KruReach::MsOf(const std::vector<Step>& steps, int d) const {
  SmallSet ms;
  for (std::size_t i = 0; i < steps.size(); ++i) {
    const Step& step = steps[i];
    if (step.spans.empty() || d < step.first_d) continue;
    const int end = i + 1 < steps.size() ? steps[i + 1].m - 1 : largest_;
    const bool asks_for_jitter = step.on_jitter != 0 && task_.Model().RisesWithSettings();
    for (const Span& span : step.spans) {
      const double low = std::ceil(std::min(span.lowest * d, largest_ + 1.0));
      const double high = std::min<double>(span.highest * d, largest_);
      const int first = std::max(step.m, static_cast<int>(low));
      int last = std::min(end, static_cast<int>(high));
      if (asks_for_jitter && first <= last) last = LastOfJitter(step, first, last, d);
      ms.Add(first, last);
    }
  }
  return ms;
}

// The largest M of some whose jitter, which rises with M, is near enough; one below the first where
// none is. Those whose jitter is known are next to each other, so that where the last is known and
// too large there is none behind the first that is.
int KruReach::LastOfJitter(const Step& step, int first, int last, int d) const {
  if (IsJitterNear(step, last, d)) return last;
  int near = first - 1;
  while (last - near > 1) {
    const int middle = near + (last - near) / 2;
    (IsJitterNear(step, middle, d) ? near : last) = middle;
  }
  return near;
}

// --- What outputs can have -----------------------------------------------------------------------

bool KruReach::IsBelow(const KruError& error, const std::optional<KruError>& bound) const {
  if (!bound) return true;
  const std::strong_ordering order = task_.Compare(error, *bound);
  return terms_.with_ties ? order <= 0 : order < 0;
}

bool KruReach::IsNearOn(PinSource source, std::size_t place, const KruBase& base,
                        const KruRatio& ratio, const std::optional<KruError>& bound) const {
  const KruOutput& output = task_.Outputs()[place];
  if (!HasSource(task_, source, place, base.feedback)) return false;
  if (terms_.all_met && !output.Frequency().IsMet(ratio.a, ratio.b)) return false;
  if (!IsBelow(task_.FrequencyError(place, ratio), bound)) return false;
  if (!IsDutyNearOn(source, place, base.divide_halves, bound)) return false;
  if (terms_.all_met && !phases_.CanMeet(place, QuartersOn(source, task_.IsSp(), output.Index()))) {
    return false;
  }
  return !output.Jitter().IsAsked() || IsJitterNearOn(source, place, base, bound);
}

bool KruReach::IsInRange(PinSource source, const KruRatio& ratio) const {
  for (const KruPin& pin : task_.Pins()) {
    if (pin.facts->source != source) continue;
    if (pin.usual->Contains(ratio.a, ratio.b)) return true;
    if (pin.doubled != pin.usual && pin.doubled->Contains(ratio.a, ratio.b)) return true;
  }
  return false;
}

bool KruReach::IsDutyNearOn(PinSource source, std::size_t place, int divide_halves,
                            const std::optional<KruError>& bound) const {
  const KruOutput& output = task_.Outputs()[place];
  if (!output.AsksForDuty()) return true;
  if (terms_.all_met && !output.IsDutyMet(source, divide_halves)) return false;
  return IsBelow(task_.DutyError(place, source, divide_halves), bound);
}

// On one of the pins; a PHASE_SHIFT can make it worse.
bool KruReach::IsJitterNearOn(PinSource source, std::size_t place, const KruBase& base,
                              const std::optional<KruError>& bound) const {
  for (const KruPin& pin : task_.Pins()) {
    if (pin.facts->source != source) continue;
    const double jitter = task_.JitterOf(base, pin.facts->pin, false);
    if (terms_.all_met && !task_.Outputs()[place].Jitter().IsMet(jitter)) continue;
    if (IsBelow(task_.JitterError(place, jitter), bound)) return true;
  }
  return false;
}

KruReach::Outputs KruReach::NearOn(PinSource source, const KruBase& base,
                                   const std::optional<KruError>& bound, Outputs some) const {
  const KruRatio ratio = RatioOf(source, base);
  Outputs near = 0;
  if (some == 0 || !IsInRange(source, ratio)) return near;
  for (std::size_t i = 0; i < task_.Outputs().size(); ++i) {
    if ((some >> i & 1) == 0) continue;
    if (IsNearOn(source, i, base, ratio, bound)) near |= Outputs{1} << i;
  }
  return near;
}

// Whether some PHASE_SHIFT is near enough to all phases.
bool KruReach::ArePhasesNear(const Served& served, const std::optional<KruError>& bound) const {
  if (!task_.AsksForPhase() || !bound) return true;
  std::uint32_t quarters = 0;
  for (std::size_t i = 0; i < task_.Outputs().size(); ++i) {
    std::uint32_t own = 0;
    const auto add = [&](Outputs outputs, PinSource source) {
      if ((outputs >> i & 1) == 0) return;
      own |= QuartersOn(source, task_.IsSp(), task_.Outputs()[i].Index());
    };
    add(served.line, PinSource::kLine);
    add(served.doubler, PinSource::kDoubler);
    add(served.divide, PinSource::kDivider);
    add(served.synthesiser, PinSource::kSynthesiser);
    quarters |= QuartersOf(i, own);
  }
  return phases_.AreNear(quarters, &*bound, terms_.with_ties);
}

// Whether the jitter of the synthesiser is near enough with an M and a D, or not known.
bool KruReach::IsJitterNear(const Step& step, int m, int d) const {
  KruBase base = line_;
  base.m = m;
  base.d = d;
  const double jitter = task_.JitterOf(base, Pin::kClkfx, false);
  if (jitter == answer::kUnknownJitter) return true;
  for (std::size_t i = 0; i < task_.Outputs().size(); ++i) {
    if ((step.on_jitter >> i & 1) == 0) continue;
    if (terms_.all_met && !task_.Outputs()[i].Jitter().IsMet(jitter)) return false;
    if (!IsBelow(task_.JitterError(i, jitter), step.bound)) return false;
  }
  return true;
}

KruReach::Outputs KruReach::OnLine(const std::optional<KruError>& bound) const {
  return NearOn(PinSource::kLine, line_, bound) | NearOn(PinSource::kDoubler, line_, bound);
}

KruReach::Step KruReach::StepWith(int m, const std::optional<KruError>& bound,
                                  const Step* wider) const {
  Step step{.m = m, .bound = bound, .spans = {}};
  const bool has_line = task_.IsSp() && line_.feedback;
  if (has_line) {
    step.line = NearOn(PinSource::kLine, line_, bound, wider != nullptr ? wider->line : all_);
    step.doubler =
        NearOn(PinSource::kDoubler, line_, bound, wider != nullptr ? wider->doubler : all_);
  }
  step.on_line = step.line | step.doubler;
  Mosts mosts;
  for (std::size_t i = 0; i < task_.Outputs().size(); ++i) mosts[i] = MostOf(i, bound);
  Spans all;
  AddSpans(step.on_line, 0, bound, mosts, &all);
  // Of a KRU_SP the span depends only on the outputs that the divide serves.
  std::array<Outputs, kMostDivides + 1> known = {step.on_line};
  std::size_t count = 1;
  Outputs on_any = 0;
  KruBase base = line_;
  for (std::size_t k = 0; k < divides_.size(); ++k) {
    base.divide_halves = divides_[k];
    if (!task_.IsSp()) {
      AddSpans(0, divides_[k], bound, mosts, &all);
      continue;
    }
    if (!has_line) break;
    step.on_divide[k] =
        NearOn(PinSource::kDivider, base, bound, wider != nullptr ? wider->on_divide[k] : all_);
    on_any |= step.on_divide[k];
    const Outputs served = step.on_line | step.on_divide[k];
    const auto end = known.begin() + static_cast<std::ptrdiff_t>(count);
    if (std::find(known.begin(), end, served) != end) continue;
    known[count++] = served;
    AddSpans(served, divides_[k], bound, mosts, &all);
  }
  // All that there can be.
  if (!ArePhasesNear({step.line, step.doubler, on_any, all_}, bound)) return step;
  for (std::size_t i = 0; i < task_.Outputs().size(); ++i) {
    if (!task_.Outputs()[i].Jitter().IsAsked()) continue;
    step.on_jitter |= ~(step.on_line | on_any) & Outputs{1} << i;
  }
  std::sort(all.begin(), all.end(),
            [](const Span& a, const Span& b) { return a.lowest < b.lowest; });
  AddReachable(all, &step);
  return step;
}

// Adds of some spans, in rising order, what has an M and a D that can be set.
void KruReach::AddReachable(const Spans& all, Step* step) const {
  step->first_d = largest_ + 1;
  Spans merged;
  for (const Span& span : all) AddSpan(span.lowest, span.highest, &merged);
  for (const Span& span : merged) {
    int first_d = 1;
    if (span.lowest > 0) {
      // Spans are wider than what rounding does to their ends.
      const Fraction simplest = SimplestIn(span.lowest, span.highest, largest_);
      if (simplest.denominator > largest_ || simplest.numerator > largest_) continue;
      first_d = static_cast<int>(simplest.denominator);
    }
    step->first_d = std::min(step->first_d, first_d);
    step->spans.push_back(span);
  }
}

// --- Spans -------------------------------------------------------------------------------------

// The largest error that is near enough for an output, in units.
double KruReach::MostOf(std::size_t place, const std::optional<KruError>& bound) const {
  const double most = bound ? bound->near.value + bound->near.slack : HUGE_VAL;
  const double allowed = task_.Outputs()[place].Frequency().AllowedUnits() * (1 + kRounding);
  return terms_.all_met ? std::min(most, allowed) : most;
}

Span KruReach::SpanOn(PinSource source, std::size_t place, int divide_halves, double most) const {
  const bool is_divided = source == PinSource::kDividedSynthesiser;
  const double line = line_.divide_by_2 ? 2 : 1;
  const double scale = is_divided ? line * divide_halves / 2 : line;
  const Span& range = is_divided ? divided_ : whole_;
  Span span = {scale * range.lowest, scale * range.highest};
  if (most < HUGE_VAL) {
    const FrequencyDemand& frequency = task_.Outputs()[place].Frequency();
    const double exact = scale / frequency.InputPerAsked();
    const double wide = most / frequency.PerUnit();
    span.lowest = std::max(span.lowest, exact * (1 - wide));
    span.highest = std::min(span.highest, exact * (1 + wide));
  }
  return {span.lowest * (1 - kWider), span.highest * (1 + kWider)};
}

// Adds where all outputs are near enough with a divide, of which some are served anyway. Where all
// are, one must be near enough on the synthesiser, as M and D are of no use else.
void KruReach::AddSpans(Outputs served, int divide_halves, const std::optional<KruError>& bound,
                        const Mosts& mosts, Spans* spans) const {
  FewSpans all;
  all.Add({0, HUGE_VAL});
  for (std::size_t i = 0; i < task_.Outputs().size(); ++i) {
    const bool is_served = (served >> i & 1) != 0;
    if (is_served && served != all_) continue;
    FewSpans own;
    // The synthesiser and what divides it have the same duty cycle.
    if (IsDutyNearOn(PinSource::kSynthesiser, i, 0, bound)) {
      Span whole = SpanOn(PinSource::kSynthesiser, i, divide_halves, mosts[i]);
      if (divide_halves != 0 && HasSource(task_, PinSource::kDividedSynthesiser, i, false)) {
        Span divided = SpanOn(PinSource::kDividedSynthesiser, i, divide_halves, mosts[i]);
        // In rising order, and apart.
        if (divided.lowest < whole.lowest) std::swap(whole, divided);
        if (whole.lowest <= whole.highest && divided.lowest <= whole.highest) {
          whole.highest = std::max(whole.highest, divided.highest);
        } else {
          own.Add(whole);
          whole = divided;
        }
      }
      own.Add(whole);
    }
    if (is_served) {
      spans->insert(spans->end(), own.begin(), own.end());
      continue;
    }
    FewSpans common;
    for (const Span& one : all) {
      for (const Span& other : own) {
        common.Add({std::max(one.lowest, other.lowest), std::min(one.highest, other.highest)});
      }
    }
    all = common;
    if (all.begin() == all.end()) return;
  }
  if (served != all_) spans->insert(spans->end(), all.begin(), all.end());
}

}  // namespace planner::search
