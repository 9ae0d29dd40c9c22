// What a request and the hardware demand of settings, one by one. All of them together are what
// an answer has to meet; an explanation leaves some of them out and asks again.
//
// Tested by demand_test.cpp.
#ifndef VORKEL_PLANNER_EXPLAIN_DEMAND_H_
#define VORKEL_PLANNER_EXPLAIN_DEMAND_H_

#include <cstdint>
#include <vector>

#include "planner/Request.h"
#include "planner/search/Within.h"

namespace planner::explain {

enum class DemandKind {
  // Of an output, as the request has them:
  kFrequency,
  kPhase,
  kDuty,
  kJitter,
  kOutputRange,  // and the device's range for it
  // Of the device and the primitive:
  kVco,
  kPfd,
  kM,
  kD,
  kDividers,
  kWhole,         // M and dividers are whole
  kNothingMoves,  // beside a fraction, phases are 0 and duty cycles 50 percent
  // Of the request:
  kBandwidth,
  kFeedback,
  kSecondInput,     // all of it with the second input, too
  kInputTolerance,  // all limits with what the inputs can be beside their frequencies, too
};

struct Demand {
  DemandKind kind = DemandKind::kFrequency;
  int output = -1;  // of the first five kinds
  bool operator==(const Demand&) const = default;
};

// The demands to a primitive that there are, what the request asks for first. At most 64.
std::vector<Demand> DemandsOf(const Request& request, Primitive primitive);

// A set of demands: bit i stands for the demand at place i.
using Set = std::uint64_t;
inline Set All(const std::vector<Demand>& demands) {
  return demands.empty() ? 0 : ~Set{0} >> (64 - demands.size());
}
inline bool Has(Set set, std::size_t place) { return (set >> place & 1) != 0; }

// Leaves one demand out.
void Relax(const Demand& demand, search::Relaxed* relaxed);
// Leaves out all that are not in the set.
search::Relaxed OnlyWith(const std::vector<Demand>& demands, Set kept);
// Those in a set, in their order.
std::vector<Demand> In(const std::vector<Demand>& demands, Set set);

}  // namespace planner::explain

#endif  // VORKEL_PLANNER_EXPLAIN_DEMAND_H_
