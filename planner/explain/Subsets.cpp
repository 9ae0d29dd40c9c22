// Tested by subsets_test.cpp.
#include "planner/explain/Subsets.h"

namespace planner::explain {

std::optional<Set> Subsets::Next() const {
  Set found = 0;
  if (!Decide(all_, 0, &found)) return std::nullopt;
  return found;
}

bool Subsets::CanBe(Set undecided, Set chosen) const {
  for (const Set rule : one_in_) {
    if ((rule & (chosen | undecided)) == 0) return false;
  }
  for (const Set rule : one_out_) {
    if ((rule & ~chosen) == 0) return false;
  }
  return true;
}

bool Subsets::Decide(Set undecided, Set chosen, Set* found) const {
  if (!CanBe(undecided, chosen)) return false;
  if (undecided == 0) {
    *found = chosen;
    return true;
  }
  const Set element = undecided & (~undecided + 1);
  const Set rest = undecided & ~element;
  return Decide(rest, chosen | element, found) || Decide(rest, chosen, found);
}

}  // namespace planner::explain
