// Why the timing calculator has no figure for settings, in its own words.
//
// It holds frequencies against the device's limits, a little beyond which it still answers, and
// its other arguments against their ranges. It does not know which primitive of the device is
// meant, and answers when one of them could be.
//
// Tested by jitter_test.cpp.
#ifndef VORKEL_PLANNER_ANSWER_CALCULATORREFUSAL_H_
#define VORKEL_PLANNER_ANSWER_CALCULATORREFUSAL_H_

#include <optional>
#include <string>

#include "planner/Device.h"
#include "planner/Request.h"
#include "planner/Settings.h"

namespace planner::answer {

// The calculator's sentence without its full stop; empty when the device has no coefficients.
// Nothing when there is a figure.
using Refusal = std::optional<std::string>;

Refusal LoopJitterRefusal(const Device& device, const Request& request,
                          const LoopSettings& settings, int divider_eighths);
Refusal LoopPhaseErrorRefusal(const Device& device, const Request& request,
                              const LoopSettings& settings);
Refusal KruJitterRefusal(const Device& device, const Request& request, const KruSettings& settings,
                         hardware::Pin pin);
Refusal KruPhaseErrorRefusal(const Device& device);

}  // namespace planner::answer

#endif  // VORKEL_PLANNER_ANSWER_CALCULATORREFUSAL_H_
