#include "planner/plan/Lead.h"

#include <utility>

#include "planner/answer/Evaluate.h"
#include "planner/answer/Rank.h"

namespace planner::plan {

namespace {

// A candidate by what is known of it already.
answer::RankKey KeyOf(const search::Candidate& candidate) {
  return {.rank_class = candidate.within ? answer::Class::kMet : answer::Class::kMissed,
          .worst_error = candidate.worst_error,
          .jitter = candidate.max_jitter.value_or(answer::kUnknownJitter)};
}

// The candidates of some primitives, of which those are kept that nothing ranks before by its key.
class Leading {
 public:
  explicit Leading(const Request& request) : request_(request), order_(request) {}

  void Take(Lead lead) {
    const std::size_t place = leads_.size();
    leads_.push_back(std::move(lead));
    for (const search::Candidate& candidate : leads_.back().found.best) {
      answer::RankKey key = KeyOf(candidate);
      const auto order = firsts_.empty() ? std::strong_ordering::less
                                         : answer::Compare(order_, key, key_).order;
      if (order > 0) continue;
      if (order < 0) {
        firsts_.clear();
        key_ = std::move(key);
      }
      firsts_.push_back({place, candidate.settings});
    }
  }

  // The worst error of what ranks first so far; nothing where there is none.
  std::optional<Rational> WorstError() const {
    return firsts_.empty() ? std::nullopt : std::optional(key_.worst_error);
  }

  // The lead of the one that ranks first.
  std::optional<Lead> First(const Device& device) {
    std::optional<Answer> best;
    std::size_t place = 0;
    for (const auto& [lead, settings] : firsts_) {
      Answer answer = answer::Evaluate(request_, device, settings, {.search = true});
      if (best && !answer::Before(request_, answer, *best)) continue;
      best = std::move(answer);
      place = lead;
    }
    if (!best) return std::nullopt;
    return std::move(leads_[place]);
  }

 private:
  struct Place {
    std::size_t lead;
    Settings settings;
  };

  const Request& request_;
  answer::Order order_;
  std::vector<Lead> leads_;
  answer::RankKey key_;
  std::vector<Place> firsts_;
};

std::optional<Lead> FirstOf(const Request& request, const Device& device,
                            const std::vector<Primitive>& primitives, search::Aim::Part part) {
  Leading leading(request);
  for (const Primitive primitive : primitives) {
    const search::Aim aim{.part = part, .worst_error = leading.WorstError()};
    leading.Take({primitive, search::Search(request, device, primitive, aim)});
  }
  return leading.First(device);
}

}  // namespace

std::optional<Lead> LeadOf(const Request& request, const Device& device,
                           const std::vector<Primitive>& primitives) {
  if (request.any_order || request.engine_only) return std::nullopt;
  if (request.rank != Rank::kJitter && request.rank != Rank::kError) return std::nullopt;
  std::optional<Lead> met = FirstOf(request, device, primitives, search::Aim::Part::kMet);
  if (met) return met;
  return FirstOf(request, device, primitives, search::Aim::Part::kNearest);
}

}  // namespace planner::plan
