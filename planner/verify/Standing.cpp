// Tested by verify_test.cpp.
#include "planner/verify/Standing.h"

#include <algorithm>
#include <utility>

#include "planner/engine/Ask.h"
#include "planner/plan/Orders.h"
#include "planner/search/Search.h"
#include "planner/verify/AllSettings.h"

namespace planner::verify {

namespace {

using Candidates = std::vector<Candidate>;

bool IsSame(const Candidate& one, const Settings& settings, const PlaceOrder& order) {
  return one.ranked.settings == settings && one.order == order;
}

std::optional<std::size_t> PlaceIn(const Candidates& all, const Settings& settings,
                                   const PlaceOrder& order) {
  for (std::size_t i = 0; i < all.size(); ++i) {
    if (IsSame(all[i], settings, order)) return i;
  }
  return std::nullopt;
}

// The same settings come once, from both.
void Add(const Candidate& candidate, Candidates* all) {
  const auto place = PlaceIn(*all, candidate.ranked.settings, candidate.order);
  if (!place) return all->push_back(candidate);
  Origin& origin = (*all)[*place].origin;
  origin.source.search = origin.source.search || candidate.origin.source.search;
}

// A primitive, with the outputs in all orders that there are.
class OfPrimitive {
 public:
  OfPrimitive(const Request& request, const Device& device, Primitive primitive, Standing* standing)
      : request_(request), device_(device), primitive_(primitive), standing_(*standing) {}

  void Do() {
    std::vector<Finding> refusals = TooMany();
    if (refusals.empty()) {
      Ask(&refusals);
      TryAll(&refusals);
    }
    const Candidates shown = Shown();
    for (const Candidate& one : shown) standing_.candidates.push_back(one);
    if (shown.empty()) standing_.refusals[primitive_] = std::move(refusals);
  }

 private:
  struct OfOrder {
    PlaceOrder order;
    Candidates engine;
    Candidates search;
  };

  std::vector<Finding> TooMany() const {
    std::vector<Finding> refusals;
    const auto hold = [&](FindingKind kind, std::size_t count, int most) {
      if (count <= static_cast<std::size_t>(most)) return;
      Finding finding{.kind = kind};
      finding.primitive = primitive_;
      finding.value = static_cast<std::int64_t>(count);
      finding.range = {1, most};
      refusals.push_back(std::move(finding));
    };
    hold(FindingKind::kTooManyInputs, request_.inputs.size(), hardware::MostInputs(primitive_));
    std::size_t outputs = 0;
    for (const Output& output : request_.outputs) {
      if (hardware::IsLoop(primitive_) || output.used) ++outputs;
    }
    hold(FindingKind::kTooManyOutputs, outputs, hardware::MostOutputs(primitive_));
    return refusals;
  }

  // The settings of an answer of the engine, judged here.
  Candidate Judged(const Answer& answer, const PlaceOrder& order) const {
    Candidate candidate;
    candidate.order = order;
    candidate.origin.source = {.engine = true, .variant = answer.source.variant};
    candidate.origin.vco = answer.searched_vco;
    for (const OutputAnswer& output : answer.outputs) {
      candidate.origin.outputs.push_back(output.searched);
    }
    candidate.ranked.settings = answer.settings;
    candidate.ranked.figures =
        FiguresOf(Recompute(request_, device_, answer.settings, order, candidate.origin));
    return candidate;
  }

  void Ask(std::vector<Finding>* refusals) {
    const std::vector<PlaceOrder> orders = request_.any_order
                                               ? plan::OrdersOf(request_, device_, primitive_)
                                               : std::vector<PlaceOrder>{OwnPlaces(request_)};
    for (const PlaceOrder& order : orders) {
      orders_.push_back({order, {}, {}});
      const Request placed = InOrder(request_, order);
      for (const Answer& answer : engine::Ask(placed, device_, primitive_)) {
        if (answer.solved) {
          orders_.back().engine.push_back(Judged(answer, order));
        } else if (orders_.size() == 1) {
          *refusals = answer.refusals;
        }
      }
    }
    standing_.engine_refusals[primitive_] = *refusals;
    const Answer answer =
        engine::AskOne(request_, device_, primitive_, engine::AsRequested(request_));
    if (answer.solved) {
      standing_.as_requested.push_back(Judged(answer, OwnPlaces(request_)));
    } else if (refusals->empty()) {
      standing_.engine_refusals[primitive_] = answer.refusals;
    }
  }

  void TryAll(std::vector<Finding>* refusals) {
    if (request_.engine_only) return;
    bool is_any = false;
    for (OfOrder& one : orders_) {
      const Request placed = InOrder(request_, one.order);
      const BestSettings best = BestOf(placed, device_, primitive_);
      const auto candidate = [&](const Ranked& ranked) {
        return Candidate{ranked, one.order, {.source = {.search = true}}};
      };
      for (const std::optional<Ranked>& of_kind : best.OfKinds()) {
        if (of_kind) Add(candidate(*of_kind), &one.search);
      }
      if (best.IsEmpty()) continue;
      is_any = true;
      Add(candidate(best.AllTradeoffs().front()), &one.search);
      for (const Ranked& ranked : best.AllTradeoffs()) {
        standing_.tradeoffs.push_back(candidate(ranked));
      }
      if (best.AllTradeoffs().size() > search::kMostOfFront) standing_.cut.push_back(primitive_);
    }
    if (is_any) return;
    Finding finding{.kind = FindingKind::kNoSettings};
    finding.primitive = primitive_;
    refusals->push_back(std::move(finding));
  }

  // The first order whose best is not behind that of another.
  std::size_t BestOrder(Candidates OfOrder::*source) const {
    std::size_t best = 0;
    const Figures* leader = nullptr;
    for (std::size_t i = 0; i < orders_.size(); ++i) {
      for (const Candidate& one : orders_[i].*source) {
        if (leader != nullptr && CompareFigures(request_, one.ranked.figures, *leader) >= 0) {
          continue;
        }
        leader = &one.ranked.figures;
        best = i;
      }
    }
    return best;
  }

  // Those in the order of the request, and in the best order of the engine and of all settings.
  Candidates Shown() const {
    Candidates shown;
    if (orders_.empty()) return shown;
    const std::size_t engine = BestOrder(&OfOrder::engine);
    const std::size_t search = BestOrder(&OfOrder::search);
    for (std::size_t i = 0; i < orders_.size(); ++i) {
      if (i == 0 || i == engine) {
        for (const Candidate& one : orders_[i].engine) Add(one, &shown);
      }
      if (i == 0 || i == search) {
        for (const Candidate& one : orders_[i].search) Add(one, &shown);
      }
    }
    return shown;
  }

  const Request& request_;
  const Device& device_;
  const Primitive primitive_;
  Standing& standing_;
  std::vector<OfOrder> orders_;
};

// Of the trade-offs of all primitives and orders those that are so among all.
class Front {
 public:
  explicit Front(const Request& request) : request_(request) {}

  Candidates Of(Candidates all) const {
    if (all.empty()) return all;
    std::stable_sort(all.begin(), all.end(),
                     [&](const Candidate& a, const Candidate& b) { return Before(a, b); });
    Candidates front = {all.front()};
    for (const Candidate& one : all) {
      const Figures& last = front.back().ranked.figures;
      if (one.ranked.figures.rank_class != last.rank_class) break;
      if (one.ranked.figures.jitter < last.jitter) front.push_back(one);
    }
    return front;
  }

 private:
  // By class, error and jitter; outputs at their own places come before those that are moved.
  bool Before(const Candidate& a, const Candidate& b) const {
    const Figures& x = a.ranked.figures;
    const Figures& y = b.ranked.figures;
    if (x.rank_class != y.rank_class) return x.rank_class < y.rank_class;
    if (!(x.worst_error == y.worst_error)) return x.worst_error < y.worst_error;
    if (x.jitter != y.jitter) return x.jitter < y.jitter;
    const bool own = a.order == OwnPlaces(request_);
    // Among the engine's answers alone only the ranking counts.
    if (!request_.engine_only && own != (b.order == OwnPlaces(request_))) return own;
    return IsBefore(request_, a.ranked, b.ranked);
  }

  const Request& request_;
};

}  // namespace

std::optional<std::size_t> Standing::PlaceOf(const Settings& settings,
                                             const PlaceOrder& order) const {
  return PlaceIn(candidates, settings, order);
}

std::optional<std::size_t> Standing::TradeoffOf(const Settings& settings,
                                                const PlaceOrder& order) const {
  return PlaceIn(tradeoffs, settings, order);
}

Standing StandingOf(const Request& request, const Device& device) {
  Standing standing;
  for (const Primitive primitive : device.primitives) {
    if (request.primitive && *request.primitive != primitive) continue;
    OfPrimitive(request, device, primitive, &standing).Do();
  }
  std::stable_sort(standing.candidates.begin(), standing.candidates.end(),
                   [&](const Candidate& a, const Candidate& b) {
                     return IsBefore(request, a.ranked, b.ranked);
                   });
  const bool has_all = !request.engine_only;
  standing.tradeoffs = Front(request).Of(has_all ? standing.tradeoffs : standing.candidates);
  for (Candidate& one : standing.tradeoffs) {
    const auto place = standing.PlaceOf(one.ranked.settings, one.order);
    if (place) one.origin = standing.candidates[*place].origin;
  }
  return standing;
}

}  // namespace planner::verify
