// A device of the test's own, and all that its PLL can make, by trying everything.
#ifndef VORKEL_TESTS_PLANNER_EXPLAIN_EXPLAINTEST_H_
#define VORKEL_TESTS_PLANNER_EXPLAIN_EXPLAINTEST_H_

#include <functional>
#include <vector>

#include "planner/Device.h"
#include "planner/Request.h"
#include "planner/Settings.h"
#include "planner/explain/Question.h"

namespace planner::explain {

inline Device SmallDevice() {
  Device device;
  device.name = "small";
  device.part = "small-1";
  device.primitives = {Primitive::kPll};
  LoopLimits limits;
  limits.vco = {400, 600};
  limits.pfd = {20, 300};
  limits.pfd_low = {20, 300};
  limits.output = {5, 300};
  limits.output_1 = {5, 450};
  limits.max_count = 64;
  device.pll = limits;
  return device;
}

inline Question QuestionOf(const std::vector<Rational>& inputs,
                           const std::vector<Rational>& outputs) {
  Question question;
  question.device = SmallDevice();
  question.primitive = Primitive::kPll;
  question.request.inputs = inputs;
  for (const Rational& frequency : outputs) {
    Output output;
    output.frequency = frequency;
    question.request.outputs.push_back(output);
  }
  return question;
}

// Calls back with each VCO frequency that M and D make and that is in range, with its PFD.
inline void ForEachVco(const Question& question,
                       const std::function<void(const Rational& vco)>& visit,
                       const Range& vco_range) {
  const Rational& input = question.request.inputs[0];
  for (int d = 1; d <= 80; ++d) {
    if (!question.device.pll->pfd.Contains(input / d)) continue;
    for (int m = 1; m <= 64; ++m) {
      const Rational vco = input * m / d;
      if (vco_range.Contains(vco)) visit(vco);
    }
  }
}

}  // namespace planner::explain

#endif  // VORKEL_TESTS_PLANNER_EXPLAIN_EXPLAINTEST_H_
