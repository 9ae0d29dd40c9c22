// Which frequencies an output of a primitive can have from an input.
//
// All that settings make which keep the device's limits with each input, when no other output is
// used: every frequency once, exactly, and with the settings that plan ranks first for it - the
// least jitter, then the lowest VCO. Frequencies are those of the first input.
//
// An output has a place: with output 1 of a PLL it can run faster, output 0 of a TSYN has dividers
// in eighths, and from place 5 on a TSYN has no fractions at all; output 0 of a KRU_CLKGEN is on
// CLKFX.
//
// Tested by reach_test.cpp.
#ifndef VORKEL_PLANNER_REACH_REACH_H_
#define VORKEL_PLANNER_REACH_REACH_H_

#include <functional>
#include <memory>
#include <vector>

#include "planner/Answer.h"
#include "planner/Device.h"
#include "planner/Request.h"
#include "planner/Settings.h"
#include "planner/reach/Point.h"

namespace planner::reach {

// The primitives of a device that can be asked, that of the request alone if it names one: those
// that have as many inputs. For the others there are answers that say so.
struct Askable {
  std::vector<Primitive> primitives;
  std::vector<Answer> refused;
};
Askable AskableOf(const Request& request, const Device& device);

class Reach {
 public:
  // Of an output, from 0, of a primitive that the device has. Of the request count the inputs, as
  // many as the primitive has, input_jitter, input_tolerance, bandwidth, whole_divider_0 and
  // feedback.
  Reach(const Request& request, const Device& device, Primitive primitive, int output);

  Primitive primitive() const { return primitive_; }
  // MHz: the range of the output, over all that it can be on.
  const Range& range() const { return range_; }

  // The frequencies in a range, MHz, both ends included, rising. Stops when `take` answers false.
  void ForEach(const Range& frequencies, const std::function<bool(const Point&)>& take) const;

  Rational FrequencyOf(const Point& point) const {
    return input_ * Rational(point.multiply, point.divide);
  }
  // As many outputs as it takes to have one at its place, and all others not used.
  Settings SettingsOf(const Point& point) const { return points_->SettingsOf(point); }
  // ps, peak to peak; infinite when it is not known.
  double JitterOf(const Point& point) const { return points_->JitterOf(point); }

 private:
  Primitive primitive_;
  Rational input_;
  Range range_;
  std::unique_ptr<const Points> points_;
};

}  // namespace planner::reach

#endif  // VORKEL_PLANNER_REACH_REACH_H_
