// Limits by keyword: their units, and the ranges that they make, MHz.
#ifndef VORKEL_PLANNER_REPORT_LIMITS_H_
#define VORKEL_PLANNER_REPORT_LIMITS_H_

#include <optional>

#include "planner/device/Describe.h"

namespace planner::report {

// Ranges of a primitive whose limits are all there. They can be the wrong way round, as the file
// has them.
struct PrimitiveRanges {
  std::optional<Range> vco;  // of a PLL or a TSYN
  std::optional<Range> pfd;
  std::optional<Range> pfd_low;  // with bandwidth LOW
  Range output;
  std::optional<Range> output_1;  // of a PLL
};

PrimitiveRanges RangesOf(const device::GradeDescription& grade, Primitive primitive);

// "MHz", "ns" or "count".
const char* UnitName(device::Unit unit);

}  // namespace planner::report

#endif  // VORKEL_PLANNER_REPORT_LIMITS_H_
