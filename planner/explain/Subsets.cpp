// Tested by subsets_test.cpp.
#include "planner/explain/Subsets.h"

#include <bit>

namespace planner::explain {

std::optional<Set> Subsets::Next() const {
  Set found = 0;
  if (!Decide({all_, 0}, &found)) return std::nullopt;
  return found;
}

// Decides what the rules leave no choice about. False when one of them cannot be kept any more.
bool Subsets::Follow(Choice* choice) const {
  const auto is_one = [](Set set) { return (set & (set - 1)) == 0; };
  Set before = 0;
  do {
    before = choice->undecided;
    for (const Set rule : one_in_) {
      if ((rule & choice->in) != 0) continue;
      const Set left = rule & choice->undecided;
      if (left == 0) return false;
      if (is_one(left)) choice->In(left);
    }
    const Set out = all_ & ~choice->in;
    for (const Set rule : one_out_) {
      if ((rule & out & ~choice->undecided) != 0) continue;
      const Set left = rule & choice->undecided;
      if (left == 0) return false;
      if (is_one(left)) choice->Out(left);
    }
  } while (choice->undecided != before);
  return true;
}

// An element to decide about. What makes a decision fail is that a set has none of its elements in:
// those with the fewest left come first. When all have one, no decision can fail any more.
Set Subsets::ElementOf(const Choice& choice) const {
  Set least = choice.undecided;
  for (const Set rule : one_in_) {
    const Set left = rule & choice.undecided;
    if ((rule & choice.in) == 0 && std::popcount(left) < std::popcount(least)) least = left;
  }
  return least & (~least + 1);
}

bool Subsets::Decide(Choice choice, Set* found) const {
  if (!Follow(&choice)) return false;
  if (choice.undecided == 0) {
    *found = choice.in;
    return true;
  }
  const Set element = ElementOf(choice);
  Choice with = choice;
  with.In(element);
  if (Decide(with, found)) return true;
  choice.Out(element);
  return Decide(choice, found);
}

}  // namespace planner::explain
