// How far the pins of a KRU are off a phase, for each PHASE_SHIFT.
//
// Pins have 0, 90, 180 or 270 degrees, quarters of a turn here, and a PHASE_SHIFT moves all of them
// by steps of 360 / 255 degrees.
//
// Tested by phase_table_test.cpp.
#ifndef VORKEL_PLANNER_SEARCH_PHASETABLE_H_
#define VORKEL_PLANNER_SEARCH_PHASETABLE_H_

#include <array>
#include <bitset>
#include <cstddef>

#include "hardware/Kru.h"
#include "planner/Request.h"
#include "planner/search/Near.h"

namespace planner::search {

inline constexpr std::size_t kQuarters = 4;
inline constexpr std::size_t kShifts = hardware::kShiftSteps + 1;
using Shifts = std::bitset<kShifts>;

class PhaseTable {
 public:
  // Of an output that asks for a phase; with shifts from 0 to below `shifts`.
  PhaseTable(const Request& request, const Output& asked, std::size_t shifts);

  // |error| / unit.
  Near Error(std::size_t quarter, std::size_t shift) const {
    return Rounded(errors_[quarter][shift]);
  }
  // The shifts with which a pin meets the demand.
  const Shifts& Met(std::size_t quarter) const { return met_[quarter]; }

 private:
  void Fill(const Request& request, const Output& asked, std::size_t shifts);
  void FillSlowly(const Request& request, const Output& asked, std::size_t shifts);

  std::array<std::array<double, kShifts>, kQuarters> errors_;
  std::array<Shifts, kQuarters> met_;
};

}  // namespace planner::search

#endif  // VORKEL_PLANNER_SEARCH_PHASETABLE_H_
