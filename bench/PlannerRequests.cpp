#include "bench/PlannerRequests.h"

#include <optional>
#include <utility>

namespace bench {

namespace {

using hardware::Rational;
using planner::Output;
using planner::Request;

Output Clock(const Rational& frequency, std::optional<Rational> phase = {},
             std::optional<Rational> duty = {}) {
  Output output;
  output.frequency = frequency;
  output.phase = std::move(phase);
  output.duty = std::move(duty);
  return output;
}

Request Of(std::vector<Rational> inputs, std::vector<Output> outputs) {
  Request request;
  request.inputs = std::move(inputs);
  request.outputs = std::move(outputs);
  return request;
}

const Rational kHd(297, 2);
const Rational kHalfHd(297, 4);

}  // namespace

std::vector<Named> ReadmeRequests() {
  std::vector<Named> all = {
      {"video_exact", Of({27}, {Clock(kHd), Clock(kHalfHd), Clock(27)})},
      {"ethernet", Of({25}, {Clock(125), Clock(Rational(125, 2)), Clock(25)})},
      {"phase_333", Of({100}, {Clock(333, 90)})},
      {"video_from_100", Of({100}, {Clock(kHd), Clock(kHalfHd), Clock(27)})},
      {"video_shape", Of({27}, {Clock(kHd), Clock(kHalfHd, 90, 50), Clock(27)})},
      {"delay_lines", Of({100}, {Clock(100, 0), Clock(50, 180), Clock(150, 0)})},
      {"memory", Of({100}, {Clock(400), Clock(200), Clock(200, 90), Clock(100, 0, 50)})},
  };
  all[5].request.feedback = true;
  all[4].request.bandwidth = hardware::Bandwidth::kLow;
  all[4].request.input_jitter = 50;
  all[4].request.tolerance = 20;
  return all;
}

std::vector<Named> SlowRequests() {
  const auto tenths = [](int number) { return Rational(number, 10); };
  return {
      {"odd_from_800", Of({800}, {Clock(Rational(333333, 1000)), Clock(tenths(1481)), Clock(27)})},
      {"seven", Of({100, 101}, {Clock(tenths(1481), 90, 40), Clock(tenths(747), 33, 60),
                                Clock(27, 10), Clock(tenths(333), 200), Clock(tenths(611), 45, 25),
                                Clock(13, 120), Clock(91, 70)})},
      {"six_delay_lines", Of({50}, {Clock(100, 10), Clock(50, 33), Clock(150, 70), Clock(75, 99),
                                    Clock(25, 111), Clock(60, 123)})},
  };
}

Request OrdinaryRequest(drawn::Random& random) {
  const std::vector<Rational> inputs = {24,  25,  26,  27, Rational(100, 3), 48, 50, 54, kHalfHd,
                                        100, 125, 156, 200};
  const std::vector<Rational> usual = {10,
                                       12,
                                       Rational(12288, 1000),
                                       25,
                                       27,
                                       Rational(100, 3),
                                       40,
                                       48,
                                       50,
                                       Rational(125, 2),
                                       65,
                                       kHalfHd,
                                       80,
                                       100,
                                       125,
                                       133,
                                       kHd,
                                       150,
                                       156,
                                       166,
                                       200,
                                       250,
                                       300,
                                       333,
                                       400};
  const std::vector<Rational> phases = {0, 90, 180, 270, 45, Rational(45, 2), -90};
  const std::vector<Rational> duties = {50, 50, 25, 40};
  constexpr int kMostOutputs = 5;
  Request request = Of({random.Pick(inputs)}, {});
  const int outputs = random.Int(1, kMostOutputs);
  const bool fits = random.OneIn(2);
  const bool shaped = random.OneIn(4);
  const Rational made = request.inputs.front() * random.Int(2, 30) / random.Int(1, 3);
  for (int i = 0; i < outputs; ++i) {
    Output output = Clock(fits ? made / random.Int(1, 12) : random.Pick(usual));
    if (shaped && random.OneIn(2)) output.phase = random.Pick(phases);
    if (shaped && random.OneIn(4)) output.duty = random.Pick(duties);
    request.outputs.push_back(std::move(output));
  }
  return request;
}

Request AnyRequest(drawn::Random& random, const planner::Device& device) {
  const planner::Primitive primitive = random.Pick(device.primitives);
  constexpr int kMostOutputs = 4;
  return drawn::RequestFor(random, device, primitive, drawn::Input(random), kMostOutputs);
}

}  // namespace bench
