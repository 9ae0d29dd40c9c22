// Which dividers are tried with which M, and the walk over the M of a row.
#ifndef VORKEL_PLANNER_SEARCH_LOOPSWEEPS_H_
#define VORKEL_PLANNER_SEARCH_LOOPSWEEPS_H_

#include <algorithm>
#include <cmath>
#include <vector>

#include "hardware/Loop.h"
#include "planner/Request.h"
#include "planner/search/LoopDividers.h"
#include "planner/search/LoopGrid.h"
#include "planner/search/VcoSpans.h"

namespace planner::search {

enum class MKind { kAll, kWhole, kFraction };

// A kind of dividers, and the M that go with it.
struct Sweep {
  Kind kind;
  MKind m;
};

// Together they have each M, D and set of dividers that the hardware has once.
inline std::vector<Sweep> SweepsOf(const Request& request, bool fractions) {
  if (!fractions) return {{Kind::kMoving, MKind::kWhole}};
  // Where nothing is to be moved, whole dividers and others are all alike.
  if (!request.AsksForShape()) return {{Kind::kStill, MKind::kAll}};
  return {{Kind::kMoving, MKind::kWhole},
          {Kind::kStill, MKind::kFraction},
          {Kind::kStillFraction, MKind::kWhole}};
}

// Calls `take` with the M of a row that a sweep has and whose ratios are in a span, the largest
// first, until it answers false. `step` is that of the grid.
template <typename Take>
bool ForEachM(const Row& row, int step, MKind kind, const Span& span, const Take& take) {
  constexpr int kOne = hardware::kEighths;
  const int own_step = kind == MKind::kWhole ? kOne : step;
  const double end = row.last + 1;
  const int low = static_cast<int>(std::ceil(std::min(span.lowest * row.d, end)));
  const int high = static_cast<int>(std::min(span.highest * row.d, end));
  const int first = (std::max(row.first, low) + own_step - 1) / own_step * own_step;
  const int last = std::min(row.last, high) / own_step * own_step;
  for (int m = last; m >= first; m -= own_step) {
    if (kind == MKind::kFraction && m % kOne == 0) continue;
    if (!take(m)) return false;
  }
  if (row.one && kind != MKind::kFraction && low <= kOne && span.highest * row.d >= kOne) {
    return take(kOne);
  }
  return true;
}

}  // namespace planner::search

#endif  // VORKEL_PLANNER_SEARCH_LOOPSWEEPS_H_
