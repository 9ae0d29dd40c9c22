// Tested by search_test.cpp.
#include "planner/search/LoopRanking.h"

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <utility>

#include "planner/answer/Margin.h"

namespace planner::search {

namespace {

constexpr std::strong_ordering kEqual = std::strong_ordering::equal;

std::strong_ordering CompareJitters(double a, double b) {
  return a < b ? std::strong_ordering::less : a > b ? std::strong_ordering::greater : kEqual;
}

// Of a frequency that is between these two with the inputs.
Near MarginOf(double lowest, double highest, const Range& range) {
  const double low = range.lowest.ToDouble();
  const double above = low > 0 ? (lowest - low) / low : HUGE_VAL;
  const double below = 1 - highest / range.highest.ToDouble();
  const double margin = std::min(above, below);
  return {margin, kRounding * (2 + std::abs(margin))};
}

Rational ExactMarginOf(const Inputs& inputs, const Rational& ratio, const Range& range) {
  return std::min(answer::MarginOf(inputs.lowest * ratio, range),
                  answer::MarginOf(inputs.highest * ratio, range));
}

bool IsSame(const LoopMargin& a, const LoopMargin& b) {
  return a.of == b.of && a.a * b.b == b.a * a.b;
}

}  // namespace

LoopRanking::LoopRanking(const Request& request, const LoopLimits& limits, Primitive primitive,
                         const Inputs& inputs, const std::vector<LoopDividers>& outputs,
                         const answer::LoopJitter& jitter)
    : request_(request),
      limits_(limits),
      primitive_(primitive),
      inputs_(inputs),
      outputs_(outputs),
      jitter_(jitter),
      by_margin_(request.rank == Rank::kMargin),
      lowest_input_(inputs.lowest.ToDouble()),
      highest_input_(inputs.highest.ToDouble()) {
  for (const LoopDividers& output : outputs) {
    const auto& allowed =
        request.MaxJitterOf(request.outputs[static_cast<std::size_t>(output.Index())]);
    if (allowed) jitter_demand_.Add(*allowed);
  }
}

bool LoopRanking::Choose(Kind kind, int m, int d, bool all_met, LoopPoint* point) const {
  point->m = m;
  point->d = d;
  point->kind = kind;
  point->ratio = static_cast<double>(m) / d;
  point->error = {};
  point->is_met = true;
  if (by_margin_) {
    const double vco = point->ratio / hardware::kEighths;
    point->margin = {MarginOf(lowest_input_ * vco, highest_input_ * vco, limits_.vco),
                     LoopMargin::Of::kVco, m, d};
  }
  for (std::size_t i = 0; i < outputs_.size(); ++i) {
    const LoopDividers::Choice choice = outputs_[i].Choose(kind, m, d);
    if (choice.divider == 0 || (all_met && !choice.is_met)) return false;
    point->dividers[i] = static_cast<short>(choice.divider);
    point->error = LargerOf(point->error, choice.error);
    point->is_met = point->is_met && choice.is_met;
    if (by_margin_) {
      const LoopMargin margin = {
          choice.margin,
          outputs_[i].Index() == 1 ? LoopMargin::Of::kOutput1 : LoopMargin::Of::kOutput, m,
          std::int64_t{d} * choice.divider};
      // No bandwidth counts here.
      if (IsBelow(margin, point->margin, Bandwidth::kOptimized)) point->margin = margin;
    }
  }
  return true;
}

LoopEntry LoopRanking::EntryOf(const LoopPoint& point, Bandwidth bandwidth) const {
  LoopEntry entry;
  entry.point = point;
  entry.bandwidth = bandwidth;
  entry.jitter = jitter_.PeakToPeak(point.m, point.d, bandwidth);
  entry.error = point.error;
  if (jitter_demand_.IsAsked()) {
    entry.error = LargerOf(point.error, {.near = jitter_demand_.Error(entry.jitter),
                                         .demand = LoopError::Demand::kJitter,
                                         .jitter = entry.jitter});
  }
  if (by_margin_) {
    entry.margin = {
        MarginOf(lowest_input_ / point.d, highest_input_ / point.d, limits_.PfdOf(bandwidth)),
        LoopMargin::Of::kPfd, 1, point.d};
    if (IsBelow(point.margin, entry.margin, bandwidth)) entry.margin = point.margin;
  }
  return entry;
}

std::strong_ordering LoopRanking::Compare(const LoopError& a, const LoopError& b) const {
  if (IsSurelyBelow(a.near, b.near)) return std::strong_ordering::less;
  if (IsSurelyBelow(b.near, a.near)) return std::strong_ordering::greater;
  if (a.near.value + a.near.slack + b.near.value + b.near.slack == 0) return kEqual;
  if (a.demand == LoopError::Demand::kFrequency && b.demand == LoopError::Demand::kFrequency) {
    const auto order = FrequencyDemand::Compare(outputs_[a.place].Frequency(), a.a, a.b,
                                                outputs_[b.place].Frequency(), b.a, b.b);
    if (order) return *order;
  }
  const bool is_same = a.demand == b.demand && a.place == b.place && a.a == b.a && a.b == b.b &&
                       a.jitter == b.jitter;
  return is_same ? kEqual : Exact(a) <=> Exact(b);
}

bool LoopRanking::IsBelow(const LoopMargin& a, const LoopMargin& b, Bandwidth bandwidth) const {
  if (IsSurelyBelow(a.near, b.near)) return true;
  if (IsSurelyBelow(b.near, a.near) || IsSame(a, b)) return false;
  return Exact(a, bandwidth) < Exact(b, bandwidth);
}

// The largest first.
std::strong_ordering LoopRanking::CompareMargins(const LoopEntry& a, const LoopEntry& b) const {
  if (IsSurelyBelow(b.margin.near, a.margin.near)) return std::strong_ordering::less;
  if (IsSurelyBelow(a.margin.near, b.margin.near)) return std::strong_ordering::greater;
  const bool is_same_range = limits_.PfdOf(a.bandwidth) == limits_.PfdOf(b.bandwidth);
  if (is_same_range && IsSame(a.margin, b.margin)) return kEqual;
  return Exact(b.margin, b.bandwidth) <=> Exact(a.margin, a.bandwidth);
}

std::strong_ordering LoopRanking::CompareVcos(const LoopEntry& a, const LoopEntry& b) const {
  const std::strong_ordering order = CompareJitters(a.point.ratio, b.point.ratio);
  return request_.prefer_max_vco ? 0 <=> order : order;
}

bool LoopRanking::IsBefore(const LoopEntry& a, const LoopEntry& b, bool are_met) const {
  std::strong_ordering order = kEqual;
  const auto by_error = [&] { return order = Compare(a.error, b.error), order != kEqual; };
  const auto by_jitter = [&] {
    return order = CompareJitters(a.jitter, b.jitter), order != kEqual;
  };
  const auto by_margin = [&] { return order = CompareMargins(a, b), order != kEqual; };
  const auto by_vco = [&] { return order = CompareVcos(a, b), order != kEqual; };
  bool is_decided = false;
  switch (are_met ? request_.rank : Rank::kError) {
    case Rank::kJitter:
      is_decided = by_jitter() || by_error() || by_vco();
      break;
    case Rank::kError:
      is_decided = by_error() || by_jitter() || by_vco();
      break;
    case Rank::kMargin:
      is_decided = by_margin() || by_jitter() || by_error() || by_vco();
      break;
    case Rank::kVco:
      is_decided = by_vco() || by_jitter() || by_error();
      break;
  }
  if (is_decided) return order < 0;
  return answer::CompareSettings(SettingsOf(a), SettingsOf(b)).order < 0;
}

Rational LoopRanking::Exact(const LoopError& error) const {
  if (error.demand == LoopError::Demand::kNone) return 0;
  if (error.demand == LoopError::Demand::kJitter) return jitter_demand_.ExactError(error.jitter);
  return outputs_[error.place].Exact(error);
}

Rational LoopRanking::Exact(const LoopMargin& margin, Bandwidth bandwidth) const {
  const Rational ratio(margin.a, margin.b);
  switch (margin.of) {
    case LoopMargin::Of::kVco:
      return ExactMarginOf(inputs_, ratio / hardware::kEighths, limits_.vco);
    case LoopMargin::Of::kPfd:
      return ExactMarginOf(inputs_, ratio, limits_.PfdOf(bandwidth));
    case LoopMargin::Of::kOutput:
      return ExactMarginOf(inputs_, ratio, limits_.output);
    case LoopMargin::Of::kOutput1:
      break;
  }
  return ExactMarginOf(inputs_, ratio, limits_.output_1);
}

LoopSettings LoopRanking::SettingsOf(const LoopEntry& entry) const {
  LoopSettings settings{.primitive = primitive_,
                        .bandwidth = entry.bandwidth,
                        .m = entry.point.m,
                        .d = entry.point.d,
                        .outputs = {}};
  settings.outputs.resize(request_.outputs.size());
  for (std::size_t i = 0; i < outputs_.size(); ++i) {
    settings.outputs[static_cast<std::size_t>(outputs_[i].Index())] =
        outputs_[i].Set(entry.point.kind, entry.point.dividers[i]);
  }
  return settings;
}

Candidate LoopRanking::CandidateOf(const LoopEntry& entry) const {
  Candidate candidate;
  candidate.settings = SettingsOf(entry);
  candidate.within = IsMet(entry);
  candidate.worst_error = Exact(entry.error);
  if (entry.jitter != answer::kUnknownJitter) candidate.max_jitter = entry.jitter;
  return candidate;
}

}  // namespace planner::search
