// Tested by ranking_test.cpp.
#include "planner/verify/Ranking.h"

#include <algorithm>

namespace planner::verify {

namespace {

template <typename T>
int Less(const T& a, const T& b) {
  return a < b ? -1 : b < a ? 1 : 0;
}

}  // namespace

Figures FiguresOf(const Answer& answer) {
  Figures figures;
  figures.rank_class = !answer.violations.empty() ? 2 : answer.within ? 0 : 1;
  figures.worst_error = answer.worst_error;
  if (answer.max_jitter) figures.jitter = *answer.max_jitter;
  figures.margin = answer.margin;
  figures.vco = answer.vco;
  return figures;
}

int CompareFigures(const Request& request, const Figures& a, const Figures& b) {
  const int by_class = Less(a.rank_class, b.rank_class);
  if (by_class != 0) return by_class;
  const int error = Less(a.worst_error, b.worst_error);
  const int jitter = Less(a.jitter, b.jitter);
  const int margin = Less(b.margin, a.margin);
  const int vco = request.prefer_max_vco ? Less(b.vco, a.vco) : Less(a.vco, b.vco);
  std::vector<int> order = {error, jitter, vco};
  if (a.rank_class == 0) {
    if (request.rank == Rank::kJitter) order = {jitter, error, vco};
    if (request.rank == Rank::kMargin) order = {margin, jitter, error, vco};
    if (request.rank == Rank::kVco) order = {vco, jitter, error};
  }
  for (const int one : order) {
    if (one != 0) return one;
  }
  return 0;
}

std::vector<int> Numbers(const Settings& settings) {
  std::vector<int> numbers = {static_cast<int>(PrimitiveOf(settings))};
  if (const auto* const loop = std::get_if<LoopSettings>(&settings)) {
    numbers.push_back(static_cast<int>(loop->bandwidth));
    numbers.push_back(loop->d);
    numbers.push_back(loop->m);
    for (const LoopOutput& output : loop->outputs) numbers.push_back(output.divider);
    for (const LoopOutput& output : loop->outputs) numbers.push_back(output.phase);
    for (const LoopOutput& output : loop->outputs) numbers.push_back(output.high_time);
    return numbers;
  }
  const auto& kru = std::get<KruSettings>(settings);
  numbers.push_back(kru.feedback ? 1 : 0);
  numbers.push_back(kru.divide_by_2 ? 1 : 0);
  numbers.push_back(kru.d);
  numbers.push_back(kru.m);
  numbers.push_back(kru.divide_halves);
  for (const hardware::Pin pin : kru.pins) numbers.push_back(static_cast<int>(pin));
  numbers.push_back(kru.phase_shift);
  return numbers;
}

bool IsBefore(const Request& request, const Ranked& a, const Ranked& b) {
  const int by_figures = CompareFigures(request, a.figures, b.figures);
  if (by_figures != 0) return by_figures < 0;
  return Numbers(a.settings) < Numbers(b.settings);
}

void Tradeoffs::Add(const Ranked& one) {
  const Figures& own = one.figures;
  if (!all_.empty()) {
    const int best = all_.front().figures.rank_class;
    if (own.rank_class > best) return;
    if (own.rank_class < best) all_.clear();
  }
  // Behind all with smaller errors; those with the same are looked at one by one.
  auto place = std::find_if(all_.begin(), all_.end(), [&](const Ranked& other) {
    return !(other.figures.worst_error < own.worst_error);
  });
  if (place != all_.begin() && (place - 1)->figures.jitter <= own.jitter) return;
  if (place != all_.end() && place->figures.worst_error == own.worst_error) {
    if (place->figures.jitter < own.jitter) return;
    if (place->figures.jitter == own.jitter && !IsBefore(request_, one, *place)) return;
  }
  const auto end = std::find_if(
      place, all_.end(), [&](const Ranked& other) { return other.figures.jitter < own.jitter; });
  place = all_.erase(place, end);
  all_.insert(place, one);
}

bool Tradeoffs::IsBehind(int rank_class, double error, double jitter, double margin) const {
  if (all_.empty()) return false;
  if (rank_class != all_.front().figures.rank_class) {
    return rank_class > all_.front().figures.rank_class;
  }
  for (const Ranked& one : all_) {
    if (one.figures.jitter <= jitter &&
        one.figures.worst_error.ToDouble() < error - margin * (1 + error)) {
      return true;
    }
  }
  return false;
}

}  // namespace planner::verify
