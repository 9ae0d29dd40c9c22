// The primitives that a query can be about.
//
// An operation serves several primitives, and its arguments do not say which one is meant. A
// query is legal when one primitive of the device can take all of its arguments together. So
// the arguments are shown to the candidates one after the other, and each leaves those that
// can take it; the argument that leaves none is refused, with the ranges of the candidates
// that were left before it. On a device with PLL and TSYN, for example, an M of 3 can only be
// a PLL's, and its VCO frequency is then held against the PLL's range alone.
//
// Tested by calculator_argument_test.cpp.
#ifndef VORKEL_HOST_BUNDLED_CALCULATOR_CANDIDATES_H_
#define VORKEL_HOST_BUNDLED_CALCULATOR_CANDIDATES_H_

#include <algorithm>
#include <string>
#include <utility>
#include <vector>

#include "host/bundled/calculator/Argument.h"
#include "host/bundled/device/KeywordTable.h"

namespace Calculator {

class Candidates {
 public:
  // `primitives` is not empty.
  explicit Candidates(std::vector<Device::Primitive> primitives)
      : primitives_(std::move(primitives)) {}

  const std::vector<Device::Primitive>& primitives() const { return primitives_; }

  // Keeps the primitives for which `accepts(primitive)` is true. When there is none, throws
  // ArgumentError: "<statement()>, but must be <range_of(primitive)> for a <name>[, or ...]."
  template <typename StatementOf, typename Accepts, typename RangeOf>
  void Keep(StatementOf statement, Accepts accepts, RangeOf range_of) {
    const auto is_refused = [&accepts](Device::Primitive primitive) { return !accepts(primitive); };
    if (std::all_of(primitives_.begin(), primitives_.end(), is_refused)) {
      Refuse(statement(), Ranges(range_of));
    }
    std::erase_if(primitives_, is_refused);
  }

 private:
  template <typename RangeOf>
  std::string Ranges(RangeOf range_of) const {
    std::string ranges;
    for (const Device::Primitive primitive : primitives_) {
      if (!ranges.empty()) ranges += ", or ";
      ranges += range_of(primitive);
      ranges += " for a ";
      ranges += Device::PrimitiveName(primitive);
    }
    return ranges;
  }

  std::vector<Device::Primitive> primitives_;
};

}  // namespace Calculator

#endif  // VORKEL_HOST_BUNDLED_CALCULATOR_CANDIDATES_H_
