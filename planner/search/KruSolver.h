// The best pins and PHASE_SHIFT for all else that is set of a KRU.
//
// Each output can be on any pin that keeps its range, with an error, a jitter and a margin of its
// own; what counts of the settings is the largest error and jitter and the smallest margin of all
// outputs. So for a PHASE_SHIFT and a jitter that no pin may exceed, each output by itself takes
// what is best; and of the pins with which nothing gets worse, the one with the lowest code. The
// trade-offs come from all jitters that a pin can have.
//
// Settings must be given in the order in which those with the same figures rank (answer/Rank.h):
// then something that is only as good as what is there already comes to nothing.
//
// Tested by search_test.cpp.
#ifndef VORKEL_PLANNER_SEARCH_KRUSOLVER_H_
#define VORKEL_PLANNER_SEARCH_KRUSOLVER_H_

#include <array>
#include <cmath>
#include <compare>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <vector>

#include "planner/search/KruPhases.h"
#include "planner/search/KruTask.h"
#include "planner/search/Search.h"
#include "planner/search/TradeOffs.h"

namespace planner::search {

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
  // Looks for settings that meet all demands, or for any.
  KruSolver(const KruTask& task, KruPhases* phases, bool all_met);

  void Solve(const KruBase& base);

  std::int64_t Solved() const { return solved_; }
  const std::vector<KruEntry>& Front() const { return front_.Entries(); }
  // That with the smallest error among those with a jitter up to this; null when there is none.
  const KruEntry* LeastOf(double jitter) const;
  // Whether nothing but the front can have the best settings.
  bool IsBestOnFront() const { return !by_margin_; }

  // Where the front is not all: the largest margin that an output can have on a pin of a source,
  // and of which ratio and range that is.
  struct Width {
    Near margin = {HUGE_VAL, 0};
    KruRatio ratio{0, 1};
    const RatioRange* range = nullptr;
  };
  Width WidthOf(PinSource source, const KruBase& base, std::size_t place) const;
  // Whether settings with no larger margin, and with no less jitter, are behind the best so far.
  bool IsTooNarrow(const Width& width, double jitter) const;

  // What ranks first, and the front up to a number.
  std::optional<Candidate> Best() const;
  std::vector<Candidate> TradeOffs(std::size_t most) const;

 private:
  struct Choice {
    const KruPin* pin;
    KruRatio ratio;
    const RatioRange* range;
    KruError error;  // the worst but for the phase
    double jitter;
    Near margin;
  };
  // Those of an output. The first are of the delay line, and stay while M, D and divide change.
  struct Choices {
    std::array<Choice, hardware::kPins.size()> all;
    std::size_t of_line = 0;
    std::size_t count = 0;
    const Choice* begin() const { return all.data(); }
    const Choice* end() const { return all.data() + count; }
  };
  // Of all outputs, with feedback from CLK2X or not, and with a PHASE_SHIFT above 0 or not.
  struct Table {
    bool doubled = false;
    bool shifted = false;
    std::array<Choices, kMostKruOutputs> outputs;
  };
  using Left = std::vector<const Choice*>;

  void StartLine(const KruBase& base);
  bool Prepare(const KruBase& base, Table* table);
  void AddPins(const KruBase& base, bool of_line, Table* table);
  void AddPin(const KruBase& base, const KruPin& pin, std::size_t place, double jitter,
              Table* table);
  void SolveTable(const KruBase& base);
  void SolveWithin(const KruBase& base, double most_jitter, bool shifted);
  Shifts ShiftsMet(double most_jitter) const;
  void SolveShift(const KruBase& base, double most_jitter, int shift);
  void SolveByMargin(const KruBase& base, int shift);
  Width LargestWidth() const;
  double LeastJitter() const;
  bool IsBehind(const KruError& error, const KruEntry& entry, const KruBase& base,
                double jitter) const;
  bool CanBeBefore(const KruEntry& entry, const KruBase& base, double most_jitter, bool shifted);

  bool IsAllowed(std::size_t place, const Choice& choice, double most_jitter, int shift) const;
  KruError ErrorOf(std::size_t place, const Choice& choice, int shift) const;
  std::optional<KruError> LeastError(double most_jitter, int shift) const;
  Near QuickError(double most_jitter, int shift) const;
  void LeaveNearest(double most_jitter, const KruError& error, int shift);
  void LeaveWidest();
  void LeaveLeast(int shift);
  bool MakeEntry(const KruBase& base, int shift, KruEntry* entry) const;

  std::strong_ordering CompareMargins(const KruEntry& a, const KruEntry& b) const;
  bool IsBefore(const KruEntry& a, const KruEntry& b) const;
  bool IsBeforeByMargin(const KruEntry& a, const KruEntry& b) const;
  Candidate CandidateOf(const KruEntry& entry) const;

  const KruTask& task_;
  KruPhases& phases_;
  bool all_met_;
  bool by_margin_;  // of what meets all demands
  search::TradeOffs<KruEntry> front_;
  std::optional<KruEntry> widest_;  // the best by its margin
  std::int64_t solved_ = 0;
  std::optional<KruBase> line_;  // of which the tables are
  std::vector<Table> tables_;
  const Table* table_ = nullptr;  // the one that is solved
  std::array<Left, kMostKruOutputs> left_;
  std::vector<double> jitters_;
};

}  // namespace planner::search

#endif  // VORKEL_PLANNER_SEARCH_KRUSOLVER_H_
