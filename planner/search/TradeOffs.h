// The Pareto front of what a search comes upon, while it goes on.
//
// Entries have a jitter, a double that is compared as such, and an error, which is compared by a
// function that decides exactly. The front has them by their errors, the smallest first, and so by
// their jitters, the largest first: each has less jitter than all before it.
//
// Tested by trade_offs_test.cpp.
#ifndef VORKEL_PLANNER_SEARCH_TRADEOFFS_H_
#define VORKEL_PLANNER_SEARCH_TRADEOFFS_H_

#include <algorithm>
#include <compare>
#include <cstddef>
#include <vector>

namespace planner::search {

template <typename Entry>
class TradeOffs {
 public:
  // `compare_errors(a, b)` is the order of two errors; `is_before(a, b)` tells which of two that
  // are equal in both is kept.
  template <typename CompareErrors, typename IsBefore>
  void Take(const Entry& entry, const CompareErrors& compare_errors, const IsBefore& is_before) {
    // The first that has no more jitter has, of those, the smallest error.
    auto place =
        std::lower_bound(entries_.begin(), entries_.end(), entry.jitter,
                         [](const Entry& one, double jitter) { return one.jitter > jitter; });
    if (place != entries_.end()) {
      const std::strong_ordering order = compare_errors(*place, entry);
      if (order < 0) return;
      if (order == 0) {
        if (place->jitter < entry.jitter) return;
        if (is_before(entry, *place)) *place = entry;
        return;
      }
      // The one with the same jitter has a larger error.
      if (place->jitter == entry.jitter) {
        *place = entry;
        Drop(place, compare_errors);
        return;
      }
    }
    place = entries_.insert(place, entry);
    Drop(place, compare_errors);
  }

  const std::vector<Entry>& Entries() const { return entries_; }
  void Clear() { entries_.clear(); }

 private:
  using Place = typename std::vector<Entry>::iterator;

  // Those before a place, which have more jitter, as far as they have no smaller error.
  template <typename CompareErrors>
  void Drop(Place place, const CompareErrors& compare_errors) {
    Place first = place;
    while (first != entries_.begin() && compare_errors(*(first - 1), *place) >= 0) --first;
    entries_.erase(first, place);
  }

  std::vector<Entry> entries_;
};

}  // namespace planner::search

#endif  // VORKEL_PLANNER_SEARCH_TRADEOFFS_H_
