// Tested by find_test.cpp.
#include "planner/reach/Find.h"

#include <algorithm>

namespace planner::reach {

namespace {

Rational RatioOfPoint(const Point& point) { return {point.multiply, point.divide}; }

double Approximate(const Point& point) { return RatioOf(point.multiply, point.divide); }

// Keeps the first ones in some order.
template <typename T, typename Before>
class Best {
 public:
  Best(std::size_t most, const Before& before) : most_(most), before_(before) {}

  bool IsFull() const { return kept_.size() >= most_; }
  const T& Last() const { return kept_.front(); }
  void Add(const T& one) {
    if (most_ == 0 || (IsFull() && !before_(one, Last()))) return;
    if (IsFull()) {
      std::pop_heap(kept_.begin(), kept_.end(), before_);
      kept_.pop_back();
    }
    kept_.push_back(one);
    std::push_heap(kept_.begin(), kept_.end(), before_);
  }
  std::vector<T> Sorted() {
    std::sort_heap(kept_.begin(), kept_.end(), before_);
    return kept_;
  }

 private:
  std::size_t most_;
  Before before_;
  std::vector<T> kept_;  // a heap: the last in order is in front
};

}  // namespace

Counted Count(const Reach& reach, const Range& frequencies) {
  Counted counted;
  reach.ForEach(frequencies, [&](const Point& point) {
    if (counted.count == 0) counted.lowest = point;
    counted.highest = point;
    ++counted.count;
    return true;
  });
  return counted;
}

std::vector<Gap> LargestGaps(const Reach& reach, const Range& frequencies, std::size_t most) {
  const auto width = [](const Gap& gap) {
    return RatioOfPoint(gap.above) - RatioOfPoint(gap.below);
  };
  const auto before = [&](const Gap& a, const Gap& b) {
    const Rational one = width(a);
    const Rational other = width(b);
    return one != other ? other < one : RatioOfPoint(a.below) < RatioOfPoint(b.below);
  };
  Best<Gap, decltype(before)> best(most, before);
  std::optional<Point> last;
  reach.ForEach(frequencies, [&](const Point& point) {
    if (last) {
      const Gap gap = {*last, point};
      // What is narrower for certain: doubles are off by less than this.
      const double above = Approximate(point);
      const bool is_narrower = best.IsFull() && most > 0 &&
                               above - Approximate(*last) + 1e-15 * above <
                                   Approximate(best.Last().above) - Approximate(best.Last().below) -
                                       1e-15 * Approximate(best.Last().above);
      if (!is_narrower) best.Add(gap);
    }
    last = point;
    return true;
  });
  return best.Sorted();
}

std::vector<Point> Nearest(const Reach& reach, const Rational& frequency, const Range& frequencies,
                           std::size_t most) {
  const auto distance = [&](const Point& point) {
    return (reach.FrequencyOf(point) - frequency).Absolute();
  };
  const auto before = [&](const Point& a, const Point& b) {
    const Rational one = distance(a);
    const Rational other = distance(b);
    return one != other ? one < other : RatioOfPoint(a) < RatioOfPoint(b);
  };
  // In a neighbourhood that grows until there are enough.
  constexpr int kTimes = 8;
  Rational radius = frequency / 1'000'000;
  for (;;) {
    const Range near = {std::max(frequencies.lowest, frequency - radius),
                        std::min(frequencies.highest, frequency + radius)};
    Best<Point, decltype(before)> best(most, before);
    reach.ForEach(near, [&](const Point& point) {
      best.Add(point);
      return true;
    });
    const bool is_all = frequency - radius <= std::max(frequencies.lowest, reach.range().lowest) &&
                        std::min(frequencies.highest, reach.range().highest) <= frequency + radius;
    if (best.IsFull() || is_all) return best.Sorted();
    radius *= kTimes;
  }
}

}  // namespace planner::reach
