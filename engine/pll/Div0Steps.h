// The divider steps of output 0: 1, 2, 3, ... 128, or in fractional mode 1, 2, 2.125, ... 128.
// Nothing lies between 1 and 2 in either mode.
//
// Tested by vco_enumeration_test.cpp.
#ifndef VORKEL_ENGINE_PLL_DIV0STEPS_H_
#define VORKEL_ENGINE_PLL_DIV0STEPS_H_

#include <algorithm>

#include "engine/pll/PllState.h"

namespace Ip::Pll {

class Div0Steps {
 public:
  explicit Div0Steps(bool integer) : width_(integer ? 1.0 : 0.125) {}

  // The number of steps; step i belongs to slot i of the candidate table.
  int Count() const { return width_ == 1.0 ? 128 : MAX_VCO_CANDIDATES; }

  // The distance of two steps, beside that of the first two, which is 1.
  double Width() const { return width_; }

  // The divider of a step; exact, as all of them are multiples of 1/8.
  double operator[](int step) const { return step == 0 ? 1.0 : 2.0 + width_ * (step - 1); }

  // The last step whose divider is not above `divider`, cut to the steps there are; the first
  // when all are above.
  int Below(double divider) const {
    if (!(divider >= 2.0)) return 0;
    return static_cast<int>(std::min((divider - 2.0) / width_ + 1.0, Count() - 1.0));
  }

  // A step before which no divider brings `outFreq0` (MHz) up to `minVco` (MHz). One step more
  // than the quotient says makes up for its rounding, which is not so near the smallest
  // doubles. Count() where no step can.
  int FirstWorthTrying(double outFreq0, double minVco) const {
    if (!(minVco > 1e-290)) return 0;
    if (!(outFreq0 > 0.0)) return Count();
    return std::max(Below(minVco / outFreq0) - 1, 0);
  }

 private:
  double width_;
};

// Goes over the steps whose VCO, for an output 0 of `outFreq0` (MHz), lies in the working range, by
// rising dividers: visit(step, vco) returns whether it wants more. Output 0 itself is not held
// against the output limits; only the VCO range bounds it.
template <typename Visit>
void VisitVcos(const PllState& pll, const Div0Steps& steps, double outFreq0, Visit visit) {
  for (int i = steps.FirstWorthTrying(outFreq0, pll.minAdjVco); i < steps.Count(); ++i) {
    const double vco = outFreq0 * steps[i];
    if (!(pll.minAdjVco <= vco && vco <= pll.maxAdjVco)) {
      if (vco > pll.maxAdjVco && outFreq0 > 0.0) return;  // and so are all that follow
      continue;
    }
    if (!visit(i, vco)) return;
  }
}

}  // namespace Ip::Pll

#endif  // VORKEL_ENGINE_PLL_DIV0STEPS_H_
