// Tested by search_test.cpp.
#include "planner/search/KruReach.h"

#include <algorithm>
#include <cmath>
#include <utility>

namespace planner::search {

namespace {

// Whether an output can be on a source at all.
bool HasSource(const KruTask& task, PinSource source, std::size_t place, bool feedback) {
  if (source == PinSource::kSynthesiser) return true;
  if (task.IsSp()) return feedback && source != PinSource::kDividedSynthesiser;
  return source == PinSource::kDividedSynthesiser && task.Outputs()[place].Index() != 0;
}

// Both in rising order, and apart.
Spans CommonOf(const Spans& some, const Spans& others) {
  Spans common;
  for (const Span& one : some) {
    for (const Span& other : others) {
      AddSpan(std::max(one.lowest, other.lowest), std::min(one.highest, other.highest), &common);
    }
  }
  return common;
}

}  // namespace

KruReach::KruReach(const KruTask& task, KruPhases* phases, bool all_met, bool with_ties,
                   std::span<const int> divides, int largest)
    : task_(task),
      phases_(*phases),
      all_met_(all_met),
      with_ties_(with_ties),
      divides_(divides),
      largest_(largest) {
  for (std::size_t i = 0; i < task.Outputs().size(); ++i) all_ |= Outputs{1} << i;
}

void KruReach::Start(const KruBase& line) {
  line_ = line;
  ++changes_;
  open_.assign(1, StepWith(hardware::kSmallestKruM, std::nullopt));
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
  if (before.m == m) {
    before = StepWith(m, error);
    steps_.erase(place, last);
  } else {
    steps_.insert(steps_.erase(place, last), StepWith(m, error));
  }
}

SmallSet KruReach::MsOf(const std::vector<Step>& steps, int d) const {
  SmallSet ms;
  for (std::size_t i = 0; i < steps.size(); ++i) {
    const int end = i + 1 < steps.size() ? steps[i + 1].m - 1 : largest_;
    if (!IsJitterNear(steps[i], d)) continue;
    for (const Span& span : steps[i].spans) {
      const double low = std::ceil(std::min(span.lowest * d, largest_ + 1.0));
      const double high = std::min<double>(span.highest * d, largest_);
      ms.Add(std::max(steps[i].m, static_cast<int>(low)), std::min(end, static_cast<int>(high)));
    }
  }
  return ms;
}

// --- What outputs can have -----------------------------------------------------------------------

bool KruReach::IsBelow(const KruError& error, const std::optional<KruError>& bound) const {
  if (!bound) return true;
  const std::strong_ordering order = task_.Compare(error, *bound);
  return with_ties_ ? order <= 0 : order < 0;
}

bool KruReach::IsNearOn(PinSource source, std::size_t place, const KruBase& base,
                        const KruRatio& ratio, const std::optional<KruError>& bound) const {
  const KruOutput& output = task_.Outputs()[place];
  if (!HasSource(task_, source, place, base.feedback)) return false;
  if (all_met_ && !output.Frequency().IsMet(ratio.a, ratio.b)) return false;
  if (!IsBelow(task_.FrequencyError(place, ratio), bound)) return false;
  if (!IsDutyNearOn(source, place, base.divide_halves, bound)) return false;
  if (all_met_ &&
      !phases_.CanMeet(place, QuartersOn(source, task_.IsSp(), output.Index()))) {
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
  if (all_met_ && !output.IsDutyMet(source, divide_halves)) return false;
  return IsBelow(task_.DutyError(place, source, divide_halves), bound);
}

// On one of the pins; a PHASE_SHIFT can make it worse.
bool KruReach::IsJitterNearOn(PinSource source, std::size_t place, const KruBase& base,
                              const std::optional<KruError>& bound) const {
  for (const KruPin& pin : task_.Pins()) {
    if (pin.facts->source != source) continue;
    const double jitter = task_.JitterOf(base, pin.facts->pin, false);
    if (all_met_ && !task_.Outputs()[place].Jitter().IsMet(jitter)) continue;
    if (IsBelow(task_.JitterError(place, jitter), bound)) return true;
  }
  return false;
}

KruReach::Outputs KruReach::NearOn(PinSource source, const KruBase& base,
                                   const std::optional<KruError>& bound) const {
  const KruRatio ratio = RatioOf(source, base);
  Outputs near = 0;
  if (!IsInRange(source, ratio)) return near;
  for (std::size_t i = 0; i < task_.Outputs().size(); ++i) {
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
  return phases_.AreNear(quarters, &*bound, with_ties_);
}

// Whether the jitter of the synthesiser is near enough with a D: with the smallest M of a step, it is
// the least.
bool KruReach::IsJitterNear(const Step& step, int d) const {
  if (step.on_jitter == 0 || !task_.Model().RisesWithSettings()) return true;
  KruBase base = line_;
  base.m = step.m;
  base.d = d;
  const double jitter = task_.JitterOf(base, Pin::kClkfx, false);
  if (jitter == answer::kUnknownJitter) return true;
  for (std::size_t i = 0; i < task_.Outputs().size(); ++i) {
    if ((step.on_jitter >> i & 1) == 0) continue;
    if (all_met_ && !task_.Outputs()[i].Jitter().IsMet(jitter)) return false;
    if (!IsBelow(task_.JitterError(i, jitter), step.bound)) return false;
  }
  return true;
}

KruReach::Outputs KruReach::OnLine(const std::optional<KruError>& bound) const {
  return NearOn(PinSource::kLine, line_, bound) | NearOn(PinSource::kDoubler, line_, bound);
}

KruReach::Step KruReach::StepWith(int m, const std::optional<KruError>& bound) const {
  Step step{m, bound, NearOn(PinSource::kLine, line_, bound),
            NearOn(PinSource::kDoubler, line_, bound), 0, {}, {}, 0};
  step.on_line = step.line | step.doubler;
  Spans all;
  AddSpans(step.on_line, 0, bound, &all);
  // Of a KRU_SP the span depends only on the outputs that the divide serves.
  std::vector<Outputs> known = {step.on_line};
  Outputs on_any = 0;
  KruBase base = line_;
  for (const int halves : divides_) {
    base.divide_halves = halves;
    if (!task_.IsSp()) {
      AddSpans(0, halves, bound, &all);
      continue;
    }
    step.on_divide.push_back(line_.feedback ? NearOn(PinSource::kDivider, base, bound) : 0);
    on_any |= step.on_divide.back();
    const Outputs served = step.on_line | step.on_divide.back();
    if (std::find(known.begin(), known.end(), served) != known.end()) continue;
    known.push_back(served);
    AddSpans(served, halves, bound, &all);
  }
  // All that there can be.
  if (!ArePhasesNear({step.line, step.doubler, on_any, all_}, bound)) return step;
  for (std::size_t i = 0; i < task_.Outputs().size(); ++i) {
    if (!task_.Outputs()[i].Jitter().IsAsked()) continue;
    step.on_jitter |= ~(step.on_line | on_any) & Outputs{1} << i;
  }
  std::sort(all.begin(), all.end(),
            [](const Span& a, const Span& b) { return a.lowest < b.lowest; });
  for (const Span& span : all) AddSpan(span.lowest, span.highest, &step.spans);
  return step;
}

// --- Spans -------------------------------------------------------------------------------------

// The largest error that is near enough for an output, in units.
double KruReach::MostOf(std::size_t place, const std::optional<KruError>& bound) const {
  const double most = bound ? bound->near.value + bound->near.slack : HUGE_VAL;
  const double allowed = task_.Outputs()[place].Frequency().AllowedUnits() * (1 + kRounding);
  return all_met_ ? std::min(most, allowed) : most;
}

Span KruReach::SpanOn(PinSource source, std::size_t place, int divide_halves,
                      const std::optional<KruError>& bound) const {
  const FrequencyDemand& frequency = task_.Outputs()[place].Frequency();
  KruBase base = line_;
  base.m = 1;
  base.d = 1;
  base.divide_halves = divide_halves;
  const KruRatio unit = RatioOf(source, base);
  const double scale = static_cast<double>(unit.b) / static_cast<double>(unit.a);
  Span span = {HUGE_VAL, 0};
  for (const KruPin& pin : task_.Pins()) {
    if (pin.facts->source != source) continue;
    for (const RatioRange* const range : {pin.usual, pin.doubled}) {
      span.lowest = std::min(span.lowest, scale * range->Lowest());
      span.highest = std::max(span.highest, scale * range->Highest());
    }
  }
  const double most = MostOf(place, bound);
  if (most < HUGE_VAL) {
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
                        Spans* spans) const {
  Spans all = {{0, HUGE_VAL}};
  for (std::size_t i = 0; i < task_.Outputs().size(); ++i) {
    const bool is_served = (served >> i & 1) != 0;
    if (is_served && served != all_) continue;
    Spans own;
    // The synthesiser and what divides it have the same duty cycle.
    if (IsDutyNearOn(PinSource::kSynthesiser, i, 0, bound)) {
      const Span whole = SpanOn(PinSource::kSynthesiser, i, divide_halves, bound);
      AddSpan(whole.lowest, whole.highest, &own);
      if (divide_halves != 0 && HasSource(task_, PinSource::kDividedSynthesiser, i, false)) {
        const Span divided = SpanOn(PinSource::kDividedSynthesiser, i, divide_halves, bound);
        if (divided.lowest <= divided.highest) own.push_back(divided);
      }
    }
    std::sort(own.begin(), own.end(),
              [](const Span& a, const Span& b) { return a.lowest < b.lowest; });
    if (is_served) {
      spans->insert(spans->end(), own.begin(), own.end());
    } else {
      all = CommonOf(all, own);
    }
  }
  if (served != all_) spans->insert(spans->end(), all.begin(), all.end());
}

}  // namespace planner::search
