// Tested by verify_test.cpp.
#include "planner/verify/Sequence.h"

#include <algorithm>
#include <cstddef>
#include <optional>
#include <string>

namespace planner::verify {

namespace {

class Sequence {
 public:
  Sequence(const Standing& standing, const std::vector<Claim>& claims)
      : standing_(standing), claims_(claims) {}

  // The first answer that breaks an order; as many as there are when none does.
  std::size_t OfCompare() const {
    std::size_t i = 0;
    while (i < claims_.size() && claims_[i].solved && claims_[i].number == i + 1) ++i;
    if (i < claims_.size() && i < standing_.candidates.size()) return i;
    while (i < claims_.size() && !claims_[i].solved) {
      if (i > 0 && !claims_[i - 1].solved && claims_[i].primitive <= claims_[i - 1].primitive) {
        return i;
      }
      ++i;
    }
    return i;
  }

  std::size_t OfBest() const {
    std::size_t i = 1;
    if (i < claims_.size() && claims_[i].number == 1) ++i;
    for (const std::size_t number : BestOfOthers()) {
      if (i < claims_.size() && claims_[i].number == number) ++i;
    }
    i = BehindTradeoffs(i);
    const std::optional<std::size_t> of_engine = FirstOfEngine();
    if (of_engine && i < claims_.size() && claims_[i].number == of_engine) ++i;
    return i;
  }

 private:
  // The best of each primitive but the one with the best of all.
  std::vector<std::size_t> BestOfOthers() const {
    std::vector<Primitive> seen;
    std::vector<std::size_t> numbers;
    for (std::size_t i = 0; i < standing_.candidates.size(); ++i) {
      const Primitive one = PrimitiveOf(standing_.candidates[i].ranked.settings);
      if (std::find(seen.begin(), seen.end(), one) != seen.end()) continue;
      if (!seen.empty()) numbers.push_back(i + 1);
      seen.push_back(one);
    }
    return numbers;
  }

  std::optional<std::size_t> FirstOfEngine() const {
    for (std::size_t i = 0; i < standing_.candidates.size(); ++i) {
      if (standing_.candidates[i].origin.source.engine) return i + 1;
    }
    return std::nullopt;
  }

  // They go from the smallest error on, or from the least jitter.
  std::size_t BehindTradeoffs(std::size_t i) const {
    std::optional<std::size_t> last;
    std::optional<bool> rises;
    for (; i < claims_.size(); ++i) {
      const auto place = standing_.TradeoffOf(claims_[i].settings, claims_[i].order);
      if (!claims_[i].solved || !place) break;
      if (last) {
        const bool is_later = *place > *last;
        if (*place == *last || (rises && *rises != is_later)) break;
        rises = is_later;
      }
      last = place;
    }
    return i;
  }

  const Standing& standing_;
  const std::vector<Claim>& claims_;
};

}  // namespace

void HoldSequence(const Standing& standing, const std::vector<Claim>& claims,
                  Discrepancies* discrepancies) {
  if (claims.size() < 2) return;
  const Sequence sequence(standing, claims);
  const std::size_t place = std::max(sequence.OfCompare(), sequence.OfBest());
  if (place >= claims.size()) return;
  Discrepancy discrepancy =
      At(*claims[place].node, DiscrepancyKind::kMisplaced, claims[place].path, "");
  const auto right = standing.PlaceOf(claims[place].settings, claims[place].order);
  if (right) discrepancy.expected = std::to_string(*right + 1);
  discrepancies->push_back(std::move(discrepancy));
}

}  // namespace planner::verify
