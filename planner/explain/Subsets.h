// The subsets of some demands that have not been looked at.
//
// Whether demands go together is monotone: a subset of what goes together does, and a superset of
// what does not go together does not. So a set that goes together settles all below it, and one
// that does not all above it. Next() finds a set that neither settles. Its elements are decided
// one by one, in or out, each as far as it can be in; what a rule then leaves no choice about is
// decided with it, and a decision that leaves a rule without a way to be kept is taken back.
//
// The map of M. Liffiton, A. Previti, A. Malik and J. Marques-Silva, "Fast, flexible MUS
// enumeration", Constraints 21, 2016, with a search of its own, as there are few elements.
//
// Tested by subsets_test.cpp.
#ifndef VORKEL_PLANNER_EXPLAIN_SUBSETS_H_
#define VORKEL_PLANNER_EXPLAIN_SUBSETS_H_

#include <optional>
#include <vector>

#include "planner/explain/Demand.h"

namespace planner::explain {

class Subsets {
 public:
  explicit Subsets(Set all) : all_(all) {}

  // A set that is not settled, of which nothing can be added without it being so; none when all
  // are.
  std::optional<Set> Next() const;

  void SettleBelow(Set set) { one_in_.push_back(all_ & ~set); }
  void SettleAbove(Set set) { one_out_.push_back(set); }

 private:
  struct Choice {
    Set undecided;
    Set in;
    void In(Set elements) {
      undecided &= ~elements;
      in |= elements;
    }
    void Out(Set elements) { undecided &= ~elements; }
  };
  bool Follow(Choice* choice) const;
  Set ElementOf(const Choice& choice) const;
  bool Decide(Choice choice, Set* found) const;

  Set all_;
  std::vector<Set> one_in_;   // at least one element of each must be in
  std::vector<Set> one_out_;  // and at least one of each of these out
};

}  // namespace planner::explain

#endif  // VORKEL_PLANNER_EXPLAIN_SUBSETS_H_
