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

Near SmallerOf(const Near& a, const Near& b) {
  return {std::min(a.value, b.value), std::max(a.slack, b.slack)};
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
    point->margin = MarginOf(lowest_input_ * vco, highest_input_ * vco, limits_.vco);
  }
  for (std::size_t i = 0; i < outputs_.size(); ++i) {
    const LoopDividers::Choice choice = outputs_[i].Choose(kind, m, d);
    if (choice.divider == 0 || (all_met && !choice.is_met)) return false;
    point->dividers[i] = static_cast<short>(choice.divider);
    point->error = LargerOf(point->error, choice.error);
    point->is_met = point->is_met && choice.is_met;
    if (by_margin_) point->margin = SmallerOf(point->margin, choice.margin);
  }
  return true;
}

LoopEntry LoopRanking::EntryOf(const LoopPoint& point, Bandwidth bandwidth) const {
  LoopEntry entry;
  entry.point = point;
  entry.bandwidth = bandwidth;
  entry.jitter = jitter_.PeakToPeak(point.m, point.d, bandwidth);
  entry.error = LargerOf(point.error, jitter_demand_.Error(entry.jitter));
  if (by_margin_) {
    entry.margin = SmallerOf(point.margin,
                             MarginOf(lowest_input_ / point.d, highest_input_ / point.d,
                                      limits_.PfdOf(bandwidth)));
  }
  return entry;
}

std::strong_ordering LoopRanking::CompareErrors(const LoopEntry& a, const LoopEntry& b) const {
  if (IsSurelyBelow(a.error, b.error)) return std::strong_ordering::less;
  if (IsSurelyBelow(b.error, a.error)) return std::strong_ordering::greater;
  // The same ratio has the same dividers, and two errors of 0 are exact.
  const bool is_same = a.point.ratio == b.point.ratio && a.point.kind == b.point.kind;
  if (is_same && (!jitter_demand_.IsAsked() || a.jitter == b.jitter)) return kEqual;
  if (a.error.value + a.error.slack + b.error.value + b.error.slack == 0) return kEqual;
  return WorstError(a) <=> WorstError(b);
}

// The largest first.
std::strong_ordering LoopRanking::CompareMargins(const LoopEntry& a, const LoopEntry& b) const {
  if (IsSurelyBelow(b.margin, a.margin)) return std::strong_ordering::less;
  if (IsSurelyBelow(a.margin, b.margin)) return std::strong_ordering::greater;
  return ExactMargin(b) <=> ExactMargin(a);
}

std::strong_ordering LoopRanking::CompareVcos(const LoopEntry& a, const LoopEntry& b) const {
  const std::strong_ordering order = CompareJitters(a.point.ratio, b.point.ratio);
  return request_.prefer_max_vco ? 0 <=> order : order;
}

bool LoopRanking::IsBefore(const LoopEntry& a, const LoopEntry& b, bool are_met) const {
  std::strong_ordering order = kEqual;
  const auto by_error = [&] { return order = CompareErrors(a, b), order != kEqual; };
  const auto by_jitter = [&] { return order = CompareJitters(a.jitter, b.jitter), order != kEqual; };
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

Rational LoopRanking::WorstError(const LoopEntry& entry) const {
  Rational worst = jitter_demand_.ExactError(entry.jitter);
  for (std::size_t i = 0; i < outputs_.size(); ++i) {
    worst = std::max(worst, outputs_[i].WorstError(entry.point.kind, entry.point.m, entry.point.d,
                                                   entry.point.dividers[i]));
  }
  return worst;
}

Rational LoopRanking::ExactMargin(const LoopEntry& entry) const {
  const LoopPoint& point = entry.point;
  Rational margin =
      std::min(ExactMarginOf(inputs_, hardware::VcoRatio(point.m, point.d), limits_.vco),
               ExactMarginOf(inputs_, Rational(1, point.d), limits_.PfdOf(entry.bandwidth)));
  for (std::size_t i = 0; i < outputs_.size(); ++i) {
    margin = std::min(
        margin, outputs_[i].Limits().ExactMargin(
                    point.m, std::int64_t{point.d} * point.dividers[i]));
  }
  return margin;
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
  Candidate candidate{.settings = SettingsOf(entry),
                      .within = IsMet(entry),
                      .worst_error = WorstError(entry),
                      .max_jitter = std::nullopt};
  if (entry.jitter != answer::kUnknownJitter) candidate.max_jitter = entry.jitter;
  return candidate;
}

}  // namespace planner::search
