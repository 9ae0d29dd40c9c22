// Tested by inputs_test.cpp.
#include "planner/explain/Inputs.h"

#include "planner/search/Within.h"

namespace planner::explain {

namespace {

// Counted in units of 10^-7 MHz.
constexpr std::int64_t kUnits = 10000000;
constexpr std::int64_t kStock[] = {
    80000000,   100000000,  120000000,  122880000,  130000000,  143181800,  147456000,  160000000,
    184320000,  192000000,  194400000,  200000000,  221184000,  240000000,  245760000,  250000000,
    260000000,  270000000,  300000000,  320000000,  333333000,  371250000,  384000000,  400000000,
    480000000,  500000000,  540000000,  600000000,  625000000,  666667000,  742500000,  800000000,
    1000000000, 1062500000, 1228800000, 1250000000, 1333333000, 1485000000, 1500000000, 1536000000,
    1555200000, 1562500000, 1611328125, 2000000000, 2125000000, 2500000000};

}  // namespace

std::vector<Rational> StockOscillators() {
  std::vector<Rational> stock;
  for (const std::int64_t units : kStock) stock.emplace_back(units, kUnits);
  return stock;
}

std::vector<InputThatServes> InputsThatServe(const Request& request, const Device& device,
                                             const std::vector<Primitive>& primitives,
                                             const std::vector<Rational>& inputs) {
  Request changed = request;
  changed.tolerance = 0;
  for (Output& output : changed.outputs) output.tolerance.reset();
  std::vector<InputThatServes> serving;
  for (const Rational& input : inputs) {
    changed.inputs[0] = input;
    InputThatServes one{input, {}};
    for (const Primitive primitive : primitives) {
      if (search::Within(changed, device, primitive).Exists()) one.primitives.push_back(primitive);
    }
    if (!one.primitives.empty()) serving.push_back(std::move(one));
  }
  return serving;
}

}  // namespace planner::explain
