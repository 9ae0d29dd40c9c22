// Tested by conflicts_test.cpp.
#include "planner/explain/Conflicts.h"

#include <algorithm>
#include <bit>

#include "planner/explain/Subsets.h"

namespace planner::explain {

namespace {

class Explorer {
 public:
  Explorer(Set all, const std::function<bool(Set)>& goes, std::int64_t most)
      : all_(all), goes_(goes), most_(most) {}

  bool Goes(Set set) {
    const auto has = [set](Set conflict) { return (conflict & ~set) == 0; };
    const auto is_in = [set](Set whole) { return (set & ~whole) == 0; };
    if (std::any_of(conflicts_.begin(), conflicts_.end(), has)) return false;
    if (std::any_of(wholes_.begin(), wholes_.end(), is_in)) return true;
    ++questions_;
    return goes_(set);
  }
  bool IsSpent() const { return questions_ >= most_; }

  // What has been found, the smaller sets first.
  Conflicts Found() const {
    Conflicts found;
    found.conflicts = conflicts_;
    for (const Set whole : wholes_) {
      if (whole != all_) found.corrections.push_back(all_ & ~whole);
    }
    std::sort(found.conflicts.begin(), found.conflicts.end(), IsSmaller);
    std::sort(found.corrections.begin(), found.corrections.end(), IsSmaller);
    found.questions = questions_;
    return found;
  }

  // The set with all that can be added to it one by one.
  Set Grown(Set set) {
    for (Set left = all_ & ~set; left != 0; left &= left - 1) {
      const Set element = left & (~left + 1);
      if (Goes(set | element)) set |= element;
    }
    wholes_.push_back(set);
    return set;
  }

  // The set without all that can be left out one by one while it still does not go together.
  Set Shrunk(Set set) {
    for (Set left = set; left != 0; left &= left - 1) {
      const Set element = left & (~left + 1);
      if (!Goes(set & ~element)) set &= ~element;
    }
    conflicts_.push_back(set);
    return set;
  }

 private:
  static bool IsSmaller(Set a, Set b) {
    return std::popcount(a) != std::popcount(b) ? std::popcount(a) < std::popcount(b) : a < b;
  }

  Set all_;
  const std::function<bool(Set)>& goes_;
  std::int64_t most_;
  std::int64_t questions_ = 0;
  // What is known without a question: what has one of these does not go together, and what is in
  // one of those does.
  std::vector<Set> conflicts_;
  std::vector<Set> wholes_;
};

}  // namespace

Conflicts FindConflicts(std::size_t demands, const std::function<bool(Set)>& goes,
                        std::int64_t most_questions) {
  const Set all = demands == 0 ? 0 : ~Set{0} >> (64 - demands);
  Explorer explorer(all, goes, most_questions);
  Subsets subsets(all);
  bool complete = true;
  while (const std::optional<Set> set = subsets.Next()) {
    if (explorer.IsSpent()) {
      complete = false;
      break;
    }
    if (explorer.Goes(*set)) {
      subsets.SettleBelow(explorer.Grown(*set));
    } else {
      subsets.SettleAbove(explorer.Shrunk(*set));
    }
  }
  Conflicts found = explorer.Found();
  found.complete = complete;
  return found;
}

}  // namespace planner::explain
