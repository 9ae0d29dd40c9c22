// Input clocks with which all frequencies are exact.
//
// Tested by inputs_test.cpp.
#ifndef VORKEL_PLANNER_EXPLAIN_INPUTS_H_
#define VORKEL_PLANNER_EXPLAIN_INPUTS_H_

#include <vector>

#include "planner/Device.h"
#include "planner/Request.h"

namespace planner::explain {

// Oscillators that are on the shelf, MHz.
std::vector<Rational> StockOscillators();

struct InputThatServes {
  Rational frequency;                 // MHz
  std::vector<Primitive> primitives;  // those that make every frequency exactly from it
};

// Of some input frequencies those with which one of the primitives meets the request with all
// frequencies exact, in their order. Of two inputs the first one is replaced.
std::vector<InputThatServes> InputsThatServe(const Request& request, const Device& device,
                                             const std::vector<Primitive>& primitives,
                                             const std::vector<Rational>& inputs);

}  // namespace planner::explain

#endif  // VORKEL_PLANNER_EXPLAIN_INPUTS_H_
