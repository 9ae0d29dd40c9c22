// Tested by all_settings_test.cpp.
#include "planner/verify/AllSettings.h"

#include <algorithm>

namespace planner::verify {

namespace {

// How many of the numbers of a KRU's settings are those before its pins.
constexpr std::ptrdiff_t kBeforePins = 6;

// Whether one comes first whatever pins and PHASE_SHIFT the other has.
bool IsAhead(const Request& request, const Ranked& one, const Ranked& other) {
  const int by_figures = CompareFigures(request, one.figures, other.figures);
  if (by_figures != 0) return by_figures < 0;
  const std::vector<int> a = Numbers(one.settings);
  const std::vector<int> b = Numbers(other.settings);
  return std::lexicographical_compare(a.begin(), a.begin() + kBeforePins, b.begin(),
                                      b.begin() + kBeforePins);
}

// Of an error or a margin as a double, many times its rounding.
constexpr double kRounding = 1e-9;

}  // namespace

void BestSettings::Add(std::size_t kind, const Ranked& one) {
  std::optional<Ranked>& best = best_[kind];
  if (!best || IsBefore(request_, one, *best)) best = one;
  tradeoffs_.Add(one);
}

bool BestSettings::IsBehind(std::size_t kind, int rank_class, double error, double jitter,
                            double margin) const {
  if (!best_[kind] || !tradeoffs_.IsBehind(rank_class, error, jitter, kRounding)) return false;
  const Figures& best = best_[kind]->figures;
  if (best.rank_class != rank_class) return best.rank_class < rank_class;
  const bool has_larger_error = best.worst_error.ToDouble() < error - kRounding * (1 + error);
  if (rank_class > 0 || request_.rank == Rank::kError) return has_larger_error;
  if (request_.rank == Rank::kMargin) {
    return best.margin.ToDouble() > margin + kRounding * (1 + margin);
  }
  // With --rank vco a KRU has no VCO, and the jitter comes next; loops do not ask.
  return best.jitter < jitter || (best.jitter == jitter && has_larger_error);
}

bool BestSettings::IsBehind(std::size_t kind, const Ranked& bound) const {
  if (!best_[kind] || !IsAhead(request_, *best_[kind], bound)) return false;
  const Figures& figures = bound.figures;
  const std::vector<Ranked>& front = tradeoffs_.All();
  if (figures.rank_class != front.front().figures.rank_class) {
    return figures.rank_class > front.front().figures.rank_class;
  }
  return std::any_of(front.begin(), front.end(), [&](const Ranked& one) {
    const Figures& own = one.figures;
    if (own.jitter > figures.jitter || figures.worst_error < own.worst_error) return false;
    const bool is_same = own.jitter == figures.jitter && own.worst_error == figures.worst_error;
    return !is_same || IsAhead(request_, one, bound);
  });
}

BestSettings BestOf(const Request& request, const Device& device, Primitive primitive) {
  BestSettings best(request);
  if (hardware::IsLoop(primitive)) {
    TryLoops(request, device, primitive, &best);
  } else {
    TryKrus(request, device, primitive, &best);
  }
  return best;
}

}  // namespace planner::verify
