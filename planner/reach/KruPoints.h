// The frequencies of an output of a KRU_SP or a KRU_CLKGEN: of all its pins with all that can be
// set. They are some hundred thousand at most, and kept.
//
// Tested by reach_test.cpp.
#ifndef VORKEL_PLANNER_REACH_KRUPOINTS_H_
#define VORKEL_PLANNER_REACH_KRUPOINTS_H_

#include <cstdint>
#include <vector>

#include "hardware/Kru.h"
#include "planner/Device.h"
#include "planner/Request.h"
#include "planner/answer/Jitter.h"
#include "planner/reach/Point.h"

namespace planner::reach {

class KruPoints final : public Points {
 public:
  // Of the last output of the request.
  KruPoints(const Request& request, const Device& device, Primitive primitive);

  bool ForEach(const Range& ratios, const Take& take) const override;
  Settings SettingsOf(const Point& point) const override;
  double JitterOf(const Point& point) const override { return all_[point.source].jitter; }

 private:
  struct Made {
    double ratio;
    double jitter;
    std::int64_t multiply;
    std::int64_t divide;
    bool feedback;
    bool divide_by_2;
    int d;
    int m;
    int divide_halves;
    hardware::Pin pin;
  };

  class Maker;
  Settings SettingsOf(const Made& made) const;

  Primitive primitive_;
  std::size_t outputs_;
  std::vector<Made> all_;  // by rising frequency, each once
};

}  // namespace planner::reach

#endif  // VORKEL_PLANNER_REACH_KRUPOINTS_H_
