// Tested by search_test.cpp.
#include "planner/search/KruPhases.h"

#include <compare>
#include <optional>

namespace planner::search {

KruPhases::KruPhases(const KruTask& task) : task_(task) {
  for (std::size_t i = 0; i < task.Outputs().size(); ++i) {
    if (task.Outputs()[i].Phases() != nullptr) asked_ |= QuartersOf(i, kAllQuarters);
  }
}

const KruError& KruPhases::LeastError(std::uint32_t quarters, bool shifted) {
  const auto [place, is_new] = known_[shifted ? 1 : 0].try_emplace(quarters & asked_);
  if (!is_new) return place->second;
  std::optional<KruError> least;
  const int last = shifted ? hardware::kShiftSteps : 0;
  for (int shift = shifted ? 1 : 0; shift <= last; ++shift) {
    KruError worst;
    for (std::size_t i = 0; i < task_.Outputs().size(); ++i) {
      if (task_.Outputs()[i].Phases() == nullptr) continue;
      std::optional<KruError> own;
      for (int quarter = 0; quarter < static_cast<int>(kQuarters); ++quarter) {
        if ((quarters & QuartersOf(i, std::uint32_t{1} << quarter)) == 0) continue;
        const KruError error = task_.PhaseError(i, quarter, shift);
        if (!own || task_.Compare(error, *own) < 0) own = error;
      }
      worst = task_.LargerOf(worst, *own);
      if (least && IsSurelyBelow(least->near, worst.near)) break;
    }
    if (!least || task_.Compare(worst, *least) < 0) least = worst;
  }
  place->second = *least;
  return place->second;
}

bool KruPhases::CanMeet(std::size_t place, std::uint32_t quarters) const {
  const PhaseTable* const phases = task_.Outputs()[place].Phases();
  if (phases == nullptr) return true;
  for (std::size_t quarter = 0; quarter < kQuarters; ++quarter) {
    if ((quarters >> quarter & 1) != 0 && phases->Met(quarter).any()) return true;
  }
  return false;
}

bool KruPhases::AreNear(std::uint32_t quarters, const KruError* bound, bool with_ties) {
  if (asked_ == 0 || bound == nullptr) return true;
  for (const bool shifted : {false, true}) {
    if (shifted && !task_.IsSp()) continue;
    const std::strong_ordering order = task_.Compare(LeastError(quarters, shifted), *bound);
    if (with_ties ? order <= 0 : order < 0) return true;
  }
  return false;
}

}  // namespace planner::search
