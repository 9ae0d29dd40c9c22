// The frequencies of an output of a PLL or a TSYN.
//
// Of all M and D that make the same VCO frequency one is kept, that which the ranking prefers. With
// each VCO frequency an output has some dividers, and different ones make the same frequency again.
// There can be tens of millions: so the range is cut into windows with about a million each, which
// are worked out, sorted and told one after the other.
//
// Tested by reach_test.cpp.
#ifndef VORKEL_PLANNER_REACH_LOOPPOINTS_H_
#define VORKEL_PLANNER_REACH_LOOPPOINTS_H_

#include <cstdint>
#include <vector>

#include "planner/Device.h"
#include "planner/Request.h"
#include "planner/reach/Point.h"

namespace planner::reach {

class LoopPoints final : public Points {
 public:
  // Of the last output of the request. `window`: how many settings are in hand at most.
  LoopPoints(const Request& request, const Device& device, Primitive primitive,
             std::size_t window = 1'000'000);

  bool ForEach(const Range& ratios, const Take& take) const override;
  Settings SettingsOf(const Point& point) const override;
  double JitterOf(const Point& point) const override { return vcos_[point.source].jitter; }

 private:
  // A VCO frequency, and the dividers that keep the range of the output.
  struct Vco {
    int m = 0;  // in eighths
    int d = 0;
    Bandwidth bandwidth = Bandwidth::kOptimized;
    double jitter = 0;
    int first = 0;  // in steps; above `last` where there is none
    int last = 0;
    double Ratio() const { return reach::RatioOf(m, d); }
  };
  // Dividers of a VCO, in steps.
  struct Stretch {
    std::size_t vco;
    int first;
    int last;
  };
  // A point, before it is told.
  struct Made {
    double ratio;
    std::uint32_t vco;
  };

  void AddVcos(Bandwidth bandwidth, const std::vector<Rational>& inputs, const LoopLimits& limits,
               bool fractions, const Request& request, const Device& device);
  void KeepPreferred();
  double RatioWith(const Vco& vco, int step) const {
    return reach::RatioOf(vco.m, std::int64_t{vco.d} * step * step_);
  }
  bool IsDivider(int step) const;
  std::vector<Stretch> Within(const std::vector<Stretch>& all, double lowest, double highest) const;
  bool Tell(const std::vector<Stretch>& stretches, double lowest, double highest,
            const Take& take) const;
  bool TellWindow(const std::vector<Stretch>& stretches, const Take& take) const;

  Primitive primitive_;
  std::size_t outputs_;
  std::size_t window_;
  int step_ = 8;           // of dividers, in eighths
  std::vector<Vco> vcos_;  // those that are preferred come first
};

}  // namespace planner::reach

#endif  // VORKEL_PLANNER_REACH_LOOPPOINTS_H_
