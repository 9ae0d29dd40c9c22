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
#include <cstdint>
#include <vector>

#include "planner/Device.h"
#include "planner/Request.h"
#include "planner/answer/Jitter.h"
#include "planner/answer/Rank.h"
#include "planner/search/JitterDemand.h"
#include "planner/search/LoopDividers.h"
#include "planner/search/Search.h"

namespace planner::search {

// The smallest margin, and of what it is: with the same range and ratio it is the same.
struct LoopMargin {
  enum class Of { kVco, kPfd, kOutput, kOutput1 };
  Near near;
  Of of = Of::kVco;
  std::int64_t a = 0;  // the ratio to the input; of the VCO in eighths
  std::int64_t b = 1;
};

// An M and a D with a divider for each used output.
struct LoopPoint {
  int m = 0;  // in eighths
  int d = 0;
  Kind kind = Kind::kMoving;
  double ratio = 0;                 // m / d, rounded: two are equal only when the quotients are
  LoopError error;                  // the worst of all outputs, but for the jitter
  bool is_met = false;              // all demands but for the jitter
  LoopMargin margin;                // of VCO and outputs, where the request ranks by it
  std::array<short, 7> dividers{};  // in eighths, of the used outputs in their order
};

// The same with a bandwidth.
struct LoopEntry {
  LoopPoint point;
  Bandwidth bandwidth = Bandwidth::kOptimized;
  double jitter = answer::kUnknownJitter;
  LoopError error;  // the worst of all demands
  LoopMargin margin;
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

  std::strong_ordering Compare(const LoopError& a, const LoopError& b) const;
  // Whether `a` ranks before `b`; `are_met` tells the class of both.
  bool IsBefore(const LoopEntry& a, const LoopEntry& b, bool are_met) const;

  Candidate CandidateOf(const LoopEntry& entry) const;

 private:
  std::strong_ordering CompareMargins(const LoopEntry& a, const LoopEntry& b) const;
  std::strong_ordering CompareVcos(const LoopEntry& a, const LoopEntry& b) const;
  Rational Exact(const LoopError& error) const;
  const LoopError& LargerOf(const LoopError& a, const LoopError& b) const {
    return Compare(a, b) < 0 ? b : a;
  }
  Rational Exact(const LoopMargin& margin, Bandwidth bandwidth) const;
  bool IsBelow(const LoopMargin& a, const LoopMargin& b, Bandwidth bandwidth) const;
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
