// Tested by reach_test.cpp.
#include "planner/reach/Reach.h"

#include <algorithm>
#include <utility>

#include "planner/answer/Corners.h"
#include "planner/answer/Evaluate.h"
#include "planner/reach/KruPoints.h"
#include "planner/reach/LoopPoints.h"

namespace planner::reach {

namespace {

// The ranges of all pins of a primitive together.
Range RangeOf(const PinLimits& limits) {
  Range all = limits.usual.begin()->second;
  for (const auto* ranges : {&limits.usual, &limits.doubled}) {
    for (const auto& [pin, range] : *ranges) {
      all.lowest = std::min(all.lowest, range.lowest);
      all.highest = std::max(all.highest, range.highest);
    }
  }
  return all;
}

// The same request for the one output.
Request AloneAt(Request request, int output) {
  Output asked;
  asked.frequency = request.inputs.front();
  Output unused;
  unused.used = false;
  unused.frequency = asked.frequency;
  request.outputs.assign(static_cast<std::size_t>(output), unused);
  request.outputs.push_back(asked);
  return request;
}

}  // namespace

Askable AskableOf(const Request& request, const Device& device) {
  Askable askable;
  for (const Primitive primitive : device.primitives) {
    if (request.primitive && *request.primitive != primitive) continue;
    Answer answer;
    answer.primitive = primitive;
    answer.refusals = answer::Refusals(request, primitive);
    if (answer.refusals.empty()) {
      askable.primitives.push_back(primitive);
    } else {
      askable.refused.push_back(std::move(answer));
    }
  }
  return askable;
}

Reach::Reach(const Request& request, const Device& device, Primitive primitive, int output)
    : primitive_(primitive), input_(request.inputs.front()) {
  const Request alone = AloneAt(request, output);
  // What keeps these limits with the inputs as they are keeps those of the device with all that the
  // inputs can be.
  const Device narrowed = answer::Narrowed(device, request.input_tolerance);
  if (hardware::IsLoop(primitive)) {
    range_ = device.Loop(primitive).OutputOf(output);
    points_ = std::make_unique<LoopPoints>(alone, narrowed, primitive);
  } else {
    range_ = RangeOf(device.Pins(primitive));
    points_ = std::make_unique<KruPoints>(alone, narrowed, primitive);
  }
}

void Reach::ForEach(const Range& frequencies, const std::function<bool(const Point&)>& take) const {
  points_->ForEach({frequencies.lowest / input_, frequencies.highest / input_}, take);
}

}  // namespace planner::reach
