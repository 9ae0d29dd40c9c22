// How near one PHASE_SHIFT can bring the outputs of a KRU to all their phases at once.
//
// That depends only on the quarters of a turn that the pins of each output have, so that there are
// few answers, which are kept.
//
// Tested by search_test.cpp.
#ifndef VORKEL_PLANNER_SEARCH_KRUPHASES_H_
#define VORKEL_PLANNER_SEARCH_KRUPHASES_H_

#include <array>
#include <cstddef>
#include <cstdint>
#include <unordered_map>

#include "planner/search/KruTask.h"

namespace planner::search {

// Quarters of a turn, a bit for each.
inline constexpr std::uint32_t kAllQuarters = 0b1111;
inline constexpr std::uint32_t kHalfTurns = 0b0101;
inline constexpr std::uint32_t kNoTurn = 0b0001;
// Those of an output on a source; that of a KRU_CLKGEN with output 0 is always CLKFX.
inline std::uint32_t QuartersOn(PinSource source, bool is_sp, int output) {
  if (source == PinSource::kLine) return kAllQuarters;
  const bool has_half = source == PinSource::kDoubler ||
                        (source == PinSource::kSynthesiser && (is_sp || output != 0));
  return has_half ? kHalfTurns : kNoTurn;
}
// Those of an output, among those of all.
constexpr std::uint32_t QuartersOf(std::size_t place, std::uint32_t quarters) {
  return quarters << (place * kQuarters);
}

class KruPhases {
 public:
  explicit KruPhases(const KruTask& task);

  // The smallest worst error of all phases, with a PHASE_SHIFT of 0 or one above. An output has one
  // quarter at least.
  const KruError& LeastError(std::uint32_t quarters, bool shifted);
  // Whether an output by itself can meet its phase with one of some quarters.
  bool CanMeet(std::size_t place, std::uint32_t quarters) const;
  // Whether it can be below an error, or, with ties, the same; null is above all.
  bool AreNear(std::uint32_t quarters, const KruError* bound, bool with_ties);

 private:
  const KruTask& task_;
  std::uint32_t asked_ = 0;  // all quarters of the outputs that ask for a phase
  std::array<std::unordered_map<std::uint32_t, KruError>, 2> known_;
};

}  // namespace planner::search

#endif  // VORKEL_PLANNER_SEARCH_KRUPHASES_H_
