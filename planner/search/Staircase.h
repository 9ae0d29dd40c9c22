// The smallest error that has been found up to each jitter, to leave out what cannot be better.
//
// Jitter stands in for by a key that rises where it falls. A step of the staircase is a key and an
// error; what has a smaller key and a larger error than a step is beneath it.
//
// Tested by staircase_test.cpp.
#ifndef VORKEL_PLANNER_SEARCH_STAIRCASE_H_
#define VORKEL_PLANNER_SEARCH_STAIRCASE_H_

#include <utility>
#include <vector>

namespace planner::search {

template <typename Error>
class Staircase {
 public:
  // A key counts as larger than another when it is so by this factor: 0 when keys do not matter and
  // the smallest error of all is the bound, HUGE_VAL when nothing is to be left out.
  explicit Staircase(double factor) : factor_(factor) {}

  // Below which error something with a key, which is above 0, can matter; null when any can.
  const Error* BoundOf(double key) const {
    const Error* bound = nullptr;
    for (const Step& step : steps_) {
      if (step.key < key * factor_) break;
      bound = &step.error;
    }
    return bound;
  }

  // `compare(a, b)` is the order of two errors.
  template <typename Compare>
  void Add(double key, const Error& error, const Compare& compare) {
    // The steps are by their keys, the largest first, and each has a smaller error than those
    // before it.
    auto place = steps_.begin();
    while (place != steps_.end() && place->key >= key) ++place;
    if (place != steps_.begin() && compare((place - 1)->error, error) <= 0) return;
    auto last = place;
    while (last != steps_.end() && compare(last->error, error) >= 0) ++last;
    if (last == place) {
      steps_.insert(place, {key, error});
    } else {
      *place = {key, error};
      steps_.erase(place + 1, last);
    }
  }

 private:
  struct Step {
    double key;
    Error error;
  };
  double factor_;
  std::vector<Step> steps_;
};

}  // namespace planner::search

#endif  // VORKEL_PLANNER_SEARCH_STAIRCASE_H_
