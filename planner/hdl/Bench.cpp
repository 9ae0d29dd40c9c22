// Tested by hdl.test.
#include "planner/hdl/Bench.h"

#include <algorithm>
#include <numeric>

namespace planner::hdl {

namespace {

// More cycles and edges than these are not simulated without being asked for.
constexpr std::int64_t kMostCycles = 4000;
constexpr std::int64_t kMostEdges = 20'000;
// Short hyperperiods are looked at so often that they have so many cycles.
constexpr std::int64_t kFewestCycles = 100;
// The models lock after 16 cycles.
constexpr std::int64_t kCyclesToLock = 40;
constexpr std::int64_t kFsInUs = 1'000'000'000;

std::int64_t Whole(const Rational& value) { return PartsOf(value.Floor()).numerator; }
std::int64_t Ceiling(const Rational& value) { return -Whole(-value); }

Expected ExpectedOf(int index, const OutputAnswer& output) {
  Expected expected;
  expected.output = index;
  expected.ratio = PartsOf(output.ratio);
  const Parts phase = PartsOf(hardware::TurnedToFull(output.phase) / 360);
  const Parts high = PartsOf(output.duty / 100);
  expected.shape = std::lcm(phase.denominator, high.denominator);
  expected.phase = expected.shape / phase.denominator * phase.numerator;
  expected.high = expected.shape / high.denominator * high.numerator;
  return expected;
}

// The least common multiple of the periods of input and outputs, in cycles of the input. Nothing
// when it is too long, or has too many edges.
std::optional<std::int64_t> HyperperiodOf(const std::vector<Expected>& outputs,
                                          const Rational& edges) {
  std::int64_t cycles = 1;
  for (const Expected& output : outputs) {
    cycles = std::lcm(cycles, output.ratio.denominator);
    if (cycles > kMostCycles || edges * cycles > Rational(kMostEdges)) return std::nullopt;
  }
  return cycles;
}

}  // namespace

Bench BenchOf(const Request& request, const Answer& answer) {
  Bench bench;
  for (const Rational& input : request.inputs) {
    bench.inputs.push_back(PartsOf(input));
    bench.spans.push_back(Ceiling(Rational(kFsInUs) / input));
  }
  Rational edges = 0;    // in a cycle of the input
  Rational longest = 0;  // period of an output, cycles
  for (std::size_t i = 0; i < answer.outputs.size(); ++i) {
    const OutputAnswer& output = answer.outputs[i];
    if (!output.used) continue;
    bench.outputs.push_back(ExpectedOf(static_cast<int>(i), output));
    edges += output.ratio;
    longest = std::max(longest, Rational(1) / output.ratio);
  }
  bench.hyperperiod = HyperperiodOf(bench.outputs, edges);
  if (bench.hyperperiod) {
    bench.cycles = *bench.hyperperiod;
    bench.repeat =
        std::max<std::int64_t>(1, std::min((kFewestCycles + bench.cycles - 1) / bench.cycles,
                                           Whole(Rational(kMostEdges) / (edges * bench.cycles))));
  } else {
    bench.cycles = std::max({std::int64_t{1}, Ceiling(2 * longest),
                             std::min(kMostCycles, Whole(Rational(kMostEdges) / edges))});
  }
  for (Expected& output : bench.outputs) {
    // Those at n + phase periods, below the number of cycles.
    const Rational periods =
        Rational(output.ratio.numerator, output.ratio.denominator) * bench.cycles;
    output.rises = Ceiling(periods - Rational(output.phase, output.shape));
  }
  bench.before = kCyclesToLock;
  bench.after = Ceiling(2 * longest) + 1;
  return bench;
}

std::string BenchText(const Bench& bench) {
  const std::string cycles = std::to_string(bench.cycles);
  std::string text =
      "Each edge must be where the figures of the plan have it, give or take 1 fs: the rounding of "
      "that edge and of the one of the input before it. ";
  if (bench.hyperperiod) {
    text += "The outputs come back to where they were after " + cycles +
            (bench.cycles == 1 ? " cycle" : " cycles") +
            " of the input, the hyperperiod; REPEAT of them are looked at.";
  } else {
    text +=
        "The hyperperiod, after which the outputs come back to where they were, is too long to "
        "be simulated: the first " +
        cycles + " cycles of the input are looked at.";
  }
  return text;
}

}  // namespace planner::hdl
