// The best pins and PHASE_SHIFT for all else that is set of a KRU.
//
// Each output can be on any pin that keeps its range, with an error, a jitter and a margin of its
// own; what counts of the settings is the largest error and jitter and the smallest margin of all
// outputs. So for a PHASE_SHIFT and a jitter that no pin may exceed, each output by itself takes
// what is best; and of the pins with which nothing gets worse, the one with the lowest code. The
// trade-offs come from all jitters that a pin can have.
//
// Tested by search_test.cpp.
#ifndef VORKEL_PLANNER_SEARCH_KRUSOLVER_H_
#define VORKEL_PLANNER_SEARCH_KRUSOLVER_H_

#include <array>
#include <compare>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <vector>

#include "planner/search/KruTask.h"
#include "planner/search/Search.h"
#include "planner/search/TradeOffs.h"

namespace planner::search {

inline constexpr std::size_t kMostKruOutputs = 6;

// Settings while they are searched.
struct KruEntry {
  KruBase base;
  int shift = 0;
  std::array<Pin, kMostKruOutputs> pins{};  // of the used outputs, in their order
  double jitter = 0;
  KruError error;
  // The smallest, where the request ranks by it, and the pin of which it is.
  Near margin;
  KruRatio margin_ratio{0, 1};
  const RatioRange* margin_range = nullptr;
};

class KruSolver {
 public:
  explicit KruSolver(const KruTask& task);

  // Looks for the trade-offs that these settings can make, and with `all_met` only for such as meet
  // all demands.
  void Solve(const KruBase& base, bool all_met);

  std::int64_t Solved() const { return solved_; }
  bool IsEmpty() const { return front_.Entries().empty(); }
  // The smallest error with a jitter up to this; HUGE_VAL when there is none.
  double BoundOf(double jitter) const;
  // Whether less jitter or a smaller error is all that can make settings the best.
  bool IsBestOnFront() const { return !by_margin_; }

  std::vector<Candidate> Front(std::size_t most) const;
  std::size_t FrontSize() const { return front_.Entries().size(); }
  std::optional<Candidate> Best() const;

 private:
  struct Choice {
    const KruPin* pin;
    KruRatio ratio;
    const RatioRange* range;
    KruError base;  // the worst but for the phase
    double jitter;
    Near margin;
  };
  using Choices = std::array<std::vector<Choice>, kMostKruOutputs>;

  bool Prepare(const KruBase& base, bool doubled, bool shifted);
  void AddChoice(std::size_t place, const KruBase& base, const KruPin& pin, bool doubled,
                 double jitter);
  void SolveWithin(const KruBase& base, double most_jitter, bool shifted);
  Shifts ShiftsMet(double most_jitter) const;
  void SolveShift(const KruBase& base, double most_jitter, int shift);
  void TakeByMargin(const KruBase& base, int shift);

  bool IsAllowed(std::size_t place, const Choice& choice, double most_jitter, int shift) const;
  KruError ErrorOf(std::size_t place, const Choice& choice, int shift) const;
  // The smallest worst error; nothing when an output has no pin.
  std::optional<KruError> LeastError(double most_jitter, int shift) const;
  Near QuickError(double most_jitter, int shift) const;
  void LeaveNearest(double most_jitter, const KruError& error, int shift);
  void LeaveWidest();
  bool MakeEntry(const KruBase& base, int shift, KruEntry* entry) const;

  std::strong_ordering CompareMargins(const KruEntry& a, const KruEntry& b) const;
  bool IsBefore(const KruEntry& a, const KruEntry& b) const;
  bool IsBeforeByMargin(const KruEntry& a, const KruEntry& b) const;
  Candidate CandidateOf(const KruEntry& entry) const;

  const KruTask& task_;
  bool by_margin_;
  bool all_met_ = false;
  TradeOffs<KruEntry> front_;
  std::optional<KruEntry> widest_;  // the best by its margin
  std::int64_t solved_ = 0;
  Choices choices_;
  std::array<std::vector<const Choice*>, kMostKruOutputs> left_;
};

}  // namespace planner::search

#endif  // VORKEL_PLANNER_SEARCH_KRUSOLVER_H_
