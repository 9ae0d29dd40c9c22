// A frequency that an output can have, and settings that make it.
#ifndef VORKEL_PLANNER_REACH_POINT_H_
#define VORKEL_PLANNER_REACH_POINT_H_

#include <cstddef>
#include <cstdint>
#include <functional>

#include "planner/Settings.h"

namespace planner::reach {

struct Point {
  // Frequency / first input, in lowest terms; both are below 2^20.
  std::int64_t multiply = 0;
  std::int64_t divide = 1;
  // Where the settings are to be found, for who has made the point.
  std::size_t source = 0;
  int divider = 0;  // of a loop, in eighths

  bool operator==(const Point&) const = default;
};

// A quotient of two whole numbers above 0 and below 2^20, rounded. Two such quotients that differ
// do so by more than a 2^40th of them, and a division is rounded correctly: so doubles are equal,
// and in order, just where the quotients are.
inline double RatioOf(std::int64_t multiply, std::int64_t divide) {
  return static_cast<double>(multiply) / static_cast<double>(divide);
}

// The points of a primitive.
class Points {
 public:
  virtual ~Points() = default;
  // Those in a range of ratios, both ends included, by rising frequency. Stops when `take` answers
  // false, and then answers that, too.
  using Take = std::function<bool(const Point&)>;
  virtual bool ForEach(const Range& ratios, const Take& take) const = 0;
  // The settings of a primitive of which one output is used.
  virtual Settings SettingsOf(const Point& point) const = 0;
  // ps, peak to peak; infinite when it is not known.
  virtual double JitterOf(const Point& point) const = 0;
};

}  // namespace planner::reach

#endif  // VORKEL_PLANNER_REACH_POINT_H_
