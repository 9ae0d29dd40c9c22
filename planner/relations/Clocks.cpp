// Tested by clocks_test.cpp.
#include "planner/relations/Clocks.h"

#include <cstddef>
#include <variant>

#include "hardware/Exact.h"

namespace planner::relations {

namespace {

constexpr int kNsOfMhz = 1000;  // a period in ns is this, divided by MHz

// The clock before `index` that is on the same pin; null when there is none.
Clock* SharesPin(const Answer& answer, std::size_t index, std::vector<Clock>* clocks, int input) {
  const auto* kru = std::get_if<KruSettings>(&answer.settings);
  if (kru == nullptr) return nullptr;
  for (Clock& clock : *clocks) {
    if (clock.IsInput() || clock.input != input) continue;
    if (kru->pins[static_cast<std::size_t>(clock.output)] == kru->pins[index]) return &clock;
  }
  return nullptr;
}

Clock OutputClock(const OutputAnswer& output, int index, int input, const Rational& source) {
  Clock clock;
  clock.input = input;
  clock.output = index;
  clock.period = source / output.ratio;
  clock.rise = clock.period * hardware::TurnedToFull(output.phase) / 360;
  clock.high = clock.period * output.duty / 100;
  // The jitter is worked out for the first input.
  if (input == 0) clock.jitter = output.jitter;
  return clock;
}

}  // namespace

std::vector<Clock> ClocksOf(const Request& request, const Answer& answer) {
  std::vector<Clock> clocks;
  for (std::size_t n = 0; n < request.inputs.size(); ++n) {
    const auto input = static_cast<int>(n);
    const Rational period = Rational(kNsOfMhz) / request.inputs[n];
    clocks.push_back({input, -1, {}, period, 0, period / 2, request.input_jitter.ToDouble()});
    for (std::size_t i = 0; i < answer.outputs.size(); ++i) {
      if (!answer.outputs[i].used) continue;
      const auto index = static_cast<int>(i);
      if (Clock* const same = SharesPin(answer, i, &clocks, input)) {
        same->also.push_back(index);
      } else {
        clocks.push_back(OutputClock(answer.outputs[i], index, input, period));
      }
    }
  }
  return clocks;
}

Request Fastest(const Request& request) {
  Request fastest = request;
  for (Rational& input : fastest.inputs) input *= 1 + request.input_tolerance / 1000000;
  return fastest;
}

}  // namespace planner::relations
