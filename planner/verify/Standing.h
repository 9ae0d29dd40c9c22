// What a plan of a request would have to have: its candidates in their order, and its trade-offs.
//
// Tested by verify_test.cpp.
#ifndef VORKEL_PLANNER_VERIFY_STANDING_H_
#define VORKEL_PLANNER_VERIFY_STANDING_H_

#include <cstddef>
#include <map>
#include <optional>
#include <vector>

#include "planner/Answer.h"
#include "planner/Device.h"
#include "planner/Request.h"
#include "planner/verify/Ranking.h"
#include "planner/verify/Recompute.h"

namespace planner::verify {

struct Candidate {
  Ranked ranked;
  PlaceOrder order;
  Origin origin;
};

struct Standing {
  // The engine's answers; of all settings of each primitive the best of each bandwidth, and the
  // one with the smallest error; the best first. plan/Plan.h tells more.
  std::vector<Candidate> candidates;
  std::vector<Candidate> tradeoffs;
  // What the engine answers to a request as it stands, for commands that ask it for no more.
  std::vector<Candidate> as_requested;
  // Why there is nothing of a primitive; and why the engine has nothing.
  std::map<Primitive, std::vector<Finding>> refusals;
  std::map<Primitive, std::vector<Finding>> engine_refusals;
  // Of which more trade-offs are there than a plan keeps.
  std::vector<Primitive> cut;

  // The place among the candidates, and among the trade-offs; nothing when it is not there.
  std::optional<std::size_t> PlaceOf(const Settings& settings, const PlaceOrder& order) const;
  std::optional<std::size_t> TradeoffOf(const Settings& settings, const PlaceOrder& order) const;
};

Standing StandingOf(const Request& request, const Device& device);

}  // namespace planner::verify

#endif  // VORKEL_PLANNER_VERIFY_STANDING_H_
