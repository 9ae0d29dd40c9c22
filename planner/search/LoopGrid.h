// The M and D of a loop that keep VCO and PFD in their ranges with each input.
//
// VCO = input x M / D and PFD = input / D, so that a D is in range or not, and each D has one span
// of M. Their ends are worked out exactly.
//
// Tested by loop_grid_test.cpp.
#ifndef VORKEL_PLANNER_SEARCH_LOOPGRID_H_
#define VORKEL_PLANNER_SEARCH_LOOPGRID_H_

#include <cstdint>
#include <optional>
#include <vector>

#include "hardware/Exact.h"
#include "hardware/Primitive.h"

namespace planner::search {

using hardware::Primitive;
using hardware::Range;
using hardware::Rational;

// The lowest and the highest of the inputs, MHz; the same where there is one.
struct Inputs {
  Rational lowest;
  Rational highest;
};
Inputs InputsOf(const std::vector<Rational>& inputs);

// The M, in eighths, from `first` to `last` in steps of `step`, and beside them an M of 1.
struct MSet {
  int first;
  int last;
  int step;
  bool one;
};
// Those that can be set.
MSet MSetOf(Primitive primitive, bool fractions);

// A D, and the M that go with it.
struct Row {
  int d;
  int first;  // above `last` where there is none
  int last;
  bool one;
};

struct LoopGrid {
  int step = 1;           // of M, in eighths
  std::vector<Row> rows;  // by D, the smallest first; those without an M are not there
  double lowest = 0;      // VCO / first input, in eighths of M / D: all M / D are between these,
  double highest = 0;     // which are rounded outwards

  // How many pairs of M and D there are.
  std::int64_t Count() const;
};

// A range that is not there does not count.
LoopGrid LoopGridOf(const Inputs& inputs, const MSet& m, int largest_d,
                    const std::optional<Range>& vco, const std::optional<Range>& pfd);

}  // namespace planner::search

#endif  // VORKEL_PLANNER_SEARCH_LOOPGRID_H_
