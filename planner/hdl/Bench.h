// What a testbench looks at: which edges, and when they have to come. All of it is worked out from
// the figures of an answer (frequencies, phases, duty cycles), nothing from its settings.
#ifndef VORKEL_PLANNER_HDL_BENCH_H_
#define VORKEL_PLANNER_HDL_BENCH_H_

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "planner/Answer.h"
#include "planner/Request.h"
#include "planner/hdl/Instance.h"

namespace planner::hdl {

// The edges of an output: `ratio` cycles in one of the input, each of `shape` parts; it rises with
// part `phase`, and is high for `high` of them.
struct Expected {
  int output = 0;
  Parts ratio{1, 1};
  std::int64_t shape = 1;
  std::int64_t phase = 0;
  std::int64_t high = 0;
  std::int64_t rises = 0;  // rising edges in `cycles` of the input
};

struct Bench {
  std::vector<Parts> inputs;  // MHz
  std::vector<Expected> outputs;
  // Cycles of the input in which all outputs come back to where they were, if that is not too many.
  std::optional<std::int64_t> hyperperiod;
  std::int64_t cycles = 0;  // that are looked at: a hyperperiod, or a number of its own
  std::int64_t repeat = 1;  // how many times
  // For how many cycles of the input the testbench has to run: until the lock, for `cycles` and
  // until the last edge.
  std::int64_t before = 0;
  std::int64_t after = 0;
  // A period of each input, fs, rounded up.
  std::vector<std::int64_t> spans;
};

Bench BenchOf(const Request& request, const Answer& answer);

// What a reader should know of it, as sentences.
std::string BenchText(const Bench& bench);

}  // namespace planner::hdl

#endif  // VORKEL_PLANNER_HDL_BENCH_H_
