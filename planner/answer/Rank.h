// The order of answers: the same everywhere, for what the engine answers, what the search over
// all settings finds, and what a certificate claims.
//
// Classes come first: what meets all demands and keeps all limits; what keeps the limits; what
// breaks one; and what is not solved. Within the first class the request says what counts
// (Rank): the jitter, the worst error, the margin to the device's limits or the VCO. The next two
// are ordered by their worst error, so that what comes nearest is first. What is still equal is
// ordered by the settings themselves, so that there is one order for all.
//
// The keys are apart from the answers: the search ranks settings by tens of thousands, and makes
// answers only of the few that it keeps.
//
// Tested by rank_test.cpp.
#ifndef VORKEL_PLANNER_ANSWER_RANK_H_
#define VORKEL_PLANNER_ANSWER_RANK_H_

#include <compare>
#include <vector>

#include "planner/Answer.h"
#include "planner/Request.h"
#include "planner/Settings.h"
#include "planner/answer/Jitter.h"

namespace planner::answer {

enum class Class {
  kMet,     // all demands met, all limits kept
  kMissed,  // all limits kept, some demand missed
  kBroken,  // a limit of the device broken
  kUnsolved,
};

// What settings are compared by.
struct RankKey {
  Class rank_class = Class::kMet;
  Rational worst_error = 0;        // of all demands, in their units (Demands.h)
  double jitter = kUnknownJitter;  // the largest of an output, ps; unknown when one is
  Rational margin = 0;             // to the device's limits (Margin.h)
  Rational vco = 0;                // MHz; 0 of a KRU
};

// What of a request says how to compare.
struct Order {
  Order() = default;
  Order(const Request& request)  // NOLINT: a request says how to order
      : rank(request.rank), prefer_max_vco(request.prefer_max_vco) {}
  Rank rank = Rank::kJitter;
  bool prefer_max_vco = false;
};

// By what one of two ranks before the other.
enum class Criterion {
  kNone,  // they are the same
  kClass,
  kWorstError,
  kKnownJitter,  // the jitter of the other is not known
  kJitter,
  kMargin,
  kVco,
  kPrimitive,  // from here on nothing is better, but one must be first
  kBandwidth,  // of a KRU_SP: CLKIN_DIVIDE_BY_2 and feedback
  kSettings,
};

// `order` is less when the first ranks before the second.
struct Comparison {
  std::strong_ordering order = std::strong_ordering::equal;
  Criterion decided = Criterion::kNone;
};

// By the keys alone. Those that are equal in all that counts are equal.
Comparison Compare(const Order& order, const RankKey& a, const RankKey& b);

// What is left when the keys are equal: primitive, bandwidth (in the order of kBandwidths),
// smaller D, smaller M, dividers of the outputs in their order, and then phases and high times
// likewise. Of a KRU: primitive, without feedback first, without CLKIN_DIVIDE_BY_2 first, smaller
// D, smaller M, smaller divide, pins of the outputs in the order of hardware::Pin, and smaller
// PHASE_SHIFT.
Comparison CompareSettings(const LoopSettings& a, const LoopSettings& b);
Comparison CompareSettings(const KruSettings& a, const KruSettings& b);
Comparison CompareSettings(const Settings& a, const Settings& b);

// The key of an answer.
RankKey KeyOf(const Answer& answer);

// Which of two answers to a request ranks first and why. Answers with the same settings are equal,
// wherever these come from; those that are not solved go by their primitive.
Comparison Compare(const Request& request, const Answer& a, const Answer& b);
bool Before(const Request& request, const Answer& a, const Answer& b);
Criterion Decided(const Request& request, const Answer& a, const Answer& b);

// Sorts answers, the best first. Equal ones keep their order.
void Rank(const Request& request, std::vector<Answer>* answers);

// Whether two solved answers have the same settings.
bool SameSettings(const Answer& a, const Answer& b);

}  // namespace planner::answer

#endif  // VORKEL_PLANNER_ANSWER_RANK_H_
