// Every setting of a primitive, tried one after the other.
//
// Loops are nested and exact. What is left out early breaks a limit of the device, or is so far
// behind what is there already that doubles are enough to see it: behind in its class, or in both
// error and jitter of all trade-offs and in what is ranked by.
//
// Tested by all_settings_test.cpp.
#ifndef VORKEL_PLANNER_VERIFY_ALLSETTINGS_H_
#define VORKEL_PLANNER_VERIFY_ALLSETTINGS_H_

#include <array>
#include <cstddef>
#include <optional>
#include <vector>

#include "planner/Device.h"
#include "planner/Request.h"
#include "planner/verify/Ranking.h"

namespace planner::verify {

// The best of what has been tried.
class BestSettings {
 public:
  explicit BestSettings(const Request& request) : request_(request), tradeoffs_(request) {}

  // `kind` is that of settings of which each has a best of its own: the bandwidth, 0 of a KRU.
  void Add(std::size_t kind, const Ranked& one);

  const std::array<std::optional<Ranked>, 3>& OfKinds() const { return best_; }
  const std::vector<Ranked>& AllTradeoffs() const { return tradeoffs_.All(); }
  bool IsEmpty() const { return tradeoffs_.All().empty(); }

  // Whether nothing with at least such an error and jitter and at most such a margin could be any
  // of these. Never true for what could be.
  bool IsBehind(std::size_t kind, int rank_class, double error, double jitter, double margin) const;
  // The same exactly, for settings of a KRU whose pins and PHASE_SHIFT are not chosen: `bound` has
  // the best figures that these could have.
  bool IsBehind(std::size_t kind, const Ranked& bound) const;

 private:
  const Request& request_;
  std::array<std::optional<Ranked>, 3> best_;
  Tradeoffs tradeoffs_;
};

// Of the request with its outputs in this order, of which the primitive has that many, and that
// many inputs. Empty when no settings keep the device's limits.
BestSettings BestOf(const Request& request, const Device& device, Primitive primitive);

void TryLoops(const Request& request, const Device& device, Primitive primitive,
              BestSettings* best);
void TryKrus(const Request& request, const Device& device, Primitive primitive, BestSettings* best);

}  // namespace planner::verify

#endif  // VORKEL_PLANNER_VERIFY_ALLSETTINGS_H_
