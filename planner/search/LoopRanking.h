// Settings of a loop while they are searched, and their order.
//
// The order is that of answer/Rank.h. Here it is decided by doubles where these are apart, and in
// rationals only where they are not, which is seldom.
//
// Tested by search_test.cpp.
#ifndef VORKEL_PLANNER_SEARCH_LOOPRANKING_H_
#define VORKEL_PLANNER_SEARCH_LOOPRANKING_H_

#include <array>
#include <compare>
#include <vector>

#include "planner/Device.h"
#include "planner/Request.h"
#include "planner/answer/Jitter.h"
#include "planner/answer/Rank.h"
#include "planner/search/JitterDemand.h"
#include "planner/search/LoopDividers.h"
#include "planner/search/Search.h"

namespace planner::search {

// An M and a D with a divider for each used output.
struct LoopPoint {
  int m = 0;  // in eighths
  int d = 0;
  Kind kind = Kind::kMoving;
  double ratio = 0;  // m / d, rounded: two are equal only when the quotients are
  Near error;        // the worst of all outputs, but for the jitter
  bool is_met = false;  // all demands but for the jitter
  Near margin;          // of VCO and outputs, where the request ranks by it
  std::array<short, 7> dividers{};  // in eighths, of the used outputs in their order
};

// The same with a bandwidth.
struct LoopEntry {
  LoopPoint point;
  Bandwidth bandwidth = Bandwidth::kOptimized;
  double jitter = answer::kUnknownJitter;
  Near error;  // the worst of all demands
  Near margin;
};

class LoopRanking {
 public:
  // All must outlive it.
  LoopRanking(const Request& request, const LoopLimits& limits, Primitive primitive,
              const Inputs& inputs, const std::vector<LoopDividers>& outputs,
              const answer::LoopJitter& jitter);

  // Chooses the dividers. False when an output has none that keeps its range; and, when all demands
  // are to be met, when one cannot be met.
  bool Choose(Kind kind, int m, int d, bool all_met, LoopPoint* point) const;
  LoopEntry EntryOf(const LoopPoint& point, Bandwidth bandwidth) const;
  bool IsMet(const LoopEntry& entry) const {
    return entry.point.is_met && jitter_demand_.IsMet(entry.jitter);
  }

  // By their worst errors.
  std::strong_ordering CompareErrors(const LoopEntry& a, const LoopEntry& b) const;
  // Whether `a` ranks before `b`; `are_met` tells the class of both.
  bool IsBefore(const LoopEntry& a, const LoopEntry& b, bool are_met) const;

  Candidate CandidateOf(const LoopEntry& entry) const;

 private:
  std::strong_ordering CompareMargins(const LoopEntry& a, const LoopEntry& b) const;
  std::strong_ordering CompareVcos(const LoopEntry& a, const LoopEntry& b) const;
  Rational WorstError(const LoopEntry& entry) const;
  Rational ExactMargin(const LoopEntry& entry) const;
  LoopSettings SettingsOf(const LoopEntry& entry) const;

  const Request& request_;
  const LoopLimits& limits_;
  Primitive primitive_;
  const Inputs& inputs_;
  const std::vector<LoopDividers>& outputs_;
  const answer::LoopJitter& jitter_;
  JitterDemand jitter_demand_;
  bool by_margin_;
  double lowest_input_;
  double highest_input_;
};

}  // namespace planner::search

#endif  // VORKEL_PLANNER_SEARCH_LOOPRANKING_H_
