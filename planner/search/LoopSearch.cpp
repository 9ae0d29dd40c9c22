// Tested by search_test.cpp.
#include "planner/search/LoopSearch.h"

#include <algorithm>
#include <cmath>
#include <compare>
#include <cstddef>
#include <optional>
#include <tuple>
#include <utility>
#include <vector>

#include "planner/answer/Jitter.h"
#include "planner/search/LoopDividers.h"
#include "planner/search/LoopGrid.h"
#include "planner/search/LoopRanking.h"
#include "planner/search/LoopSweeps.h"
#include "planner/search/Staircase.h"
#include "planner/search/TradeOffs.h"
#include "planner/search/VcoSpans.h"

namespace planner::search {

namespace {

constexpr Span kEverywhere = {0, HUGE_VAL};

// The best of a bandwidth so far.
struct Best {
  Bandwidth bandwidth;
  std::optional<LoopEntry> entry;
  bool is_met = false;
};

// Bandwidths with the same M and D.
struct Group {
  LoopGrid grid;
  Range pfd;
  std::vector<Best*> bests;
};

using Bounds = Staircase<LoopError>;

class LoopSearch {
 public:
  LoopSearch(const Request& request, const Device& device, Primitive primitive)
      : limits_(device.Loop(primitive)),
        inputs_(InputsOf(request.inputs)),
        fractions_(hardware::HasFractions(primitive, static_cast<int>(request.outputs.size()),
                                          request.whole_divider_0)),
        sweeps_(SweepsOf(request, fractions_)),
        outputs_(OutputsOf(request, limits_, inputs_)),
        jitter_(device, request),
        ranking_(request, limits_, primitive, inputs_, outputs_, jitter_) {
    for (const Bandwidth bandwidth : hardware::kBandwidths) {
      if (!request.bandwidth || *request.bandwidth == bandwidth) bests_.push_back({bandwidth, {}});
    }
    MakeGroups(primitive);
  }

  Found Run(const Aim& aim) {
    if (aim.part != Aim::Part::kNearest) {
      for (Group& group : groups_) TakeAllMet(&group);
    }
    if (aim.part == Aim::Part::kMet) return Result();
    if (aim.worst_error) most_ = Rounded(aim.worst_error->ToDouble());
    bool some_met = false;
    for (const Best& best : bests_) some_met = some_met || best.is_met;
    for (Group& group : groups_) TakeNearest(&group, !some_met);
    return Result();
  }

 private:
  // Those of the used outputs, the one with the fewest dividers in reach first.
  static std::vector<LoopDividers> OutputsOf(const Request& request, const LoopLimits& limits,
                                             const Inputs& inputs) {
    std::vector<LoopDividers> outputs;
    outputs.reserve(request.outputs.size());
    for (std::size_t i = 0; i < request.outputs.size(); ++i) {
      if (request.outputs[i].used) {
        outputs.emplace_back(request, static_cast<int>(i), outputs.size(), inputs, limits);
      }
    }
    return outputs;
  }

  void MakeGroups(Primitive primitive) {
    const MSet m = MSetOf(primitive, fractions_);
    for (Best& best : bests_) {
      const Range& pfd = limits_.PfdOf(best.bandwidth);
      const auto same = std::find_if(groups_.begin(), groups_.end(),
                                     [&](const Group& group) { return group.pfd == pfd; });
      if (same != groups_.end()) {
        same->bests.push_back(&best);
        continue;
      }
      groups_.push_back(
          {LoopGridOf(inputs_, m, hardware::kLargestD, limits_.vco, pfd), pfd, {&best}});
    }
    for (const Group& group : groups_) {
      counts_.pairs += group.grid.Count() * static_cast<std::int64_t>(group.bests.size());
    }
  }

  // --- What meets all demands ---------------------------------------------------------------

  void TakeAllMet(Group* group) {
    for (const Sweep& sweep : sweeps_) {
      const Spans spans = SpansOf(sweep.kind, group->grid);
      for (const Span& span : spans) {
        for (const Row& row : group->grid.rows) {
          ForEachM(row, group->grid.step, sweep.m, span, [&](int m) {
            TakeMet(sweep.kind, m, row.d, group);
            return true;
          });
        }
      }
    }
  }

  // Where all outputs meet their demands.
  Spans SpansOf(Kind kind, const LoopGrid& grid) const {
    Spans spans;
    if (grid.lowest <= grid.highest) spans.push_back({grid.lowest, grid.highest});
    Spans left;
    for (const LoopDividers& output : outputs_) {
      left.clear();
      const FrequencyDemand& frequency = output.Frequency();
      const double exact = 1 / frequency.InputPerAsked();
      const SpanOutput span = {
          .lowest = std::max(exact * (1 - frequency.Allowed()), output.Limits().Lowest()),
          .highest = std::min(exact * (1 + frequency.Allowed()), output.Limits().Highest()),
          .first = output.UpTo(kind, 1),
          .last = output.DownTo(kind, output.Largest()),
          .step = output.StepOf(kind)};
      Meet(
          spans, span,
          [&](int divider) {
            return divider > 0 && output.DownTo(kind, divider) == divider &&
                   output.ShapeOf(kind, divider).is_met;
          },
          &left);
      std::swap(spans, left);
    }
    return spans;
  }

  void TakeMet(Kind kind, int m, int d, Group* group) {
    LoopPoint point;
    ++counts_.judged;
    if (!ranking_.Choose(kind, m, d, true, &point)) return;
    for (Best* best : group->bests) {
      const LoopEntry entry = ranking_.EntryOf(point, best->bandwidth);
      if (ranking_.IsMet(entry)) Take(entry, true, true, best);
    }
  }

  void Take(const LoopEntry& entry, bool is_met, bool with_front, Best* best) {
    if (!best->entry || ranking_.IsBefore(entry, *best->entry, is_met)) best->entry = entry;
    best->is_met = is_met;
    if (!with_front) return;
    front_.Take(
        entry, [&](const auto& a, const auto& b) { return ranking_.Compare(a.error, b.error); },
        [&](const auto& a, const auto& b) { return ranking_.IsBefore(a, b, is_met); });
  }

  // --- What comes nearest -------------------------------------------------------------------

  void TakeNearest(Group* group, bool with_front) {
    std::vector<Best*> open;
    for (Best* best : group->bests) {
      if (!best->is_met) open.push_back(best);
    }
    if (open.empty() || group->grid.rows.empty()) return;
    Bounds bounds(FactorOf(*group));
    for (const Row& row : group->grid.rows) {
      for (const Sweep& sweep : sweeps_) {
        ForEachM(row, group->grid.step, sweep.m, kEverywhere, [&](int m) {
          TakeNear(sweep.kind, m, row.d, open, with_front, &bounds);
          return true;
        });
      }
    }
  }

  void TakeNear(Kind kind, int m, int d, const std::vector<Best*>& bests, bool with_front,
                Bounds* bounds) {
    const double ratio = static_cast<double>(m) / d;
    const double key = ratio / d;
    const LoopError* const bound = bounds->BoundOf(key);
    double most = most_.value + most_.slack;
    if (bound != nullptr) most = std::min(most, bound->near.value + bound->near.slack);
    for (const LoopDividers& output : outputs_) {
      if (output.LeastError(kind, ratio) > most) return;
    }
    LoopPoint point;
    ++counts_.judged;
    if (!ranking_.Choose(kind, m, d, false, &point)) return;
    const auto compare = [&](const auto& a, const auto& b) { return ranking_.Compare(a, b); };
    // With the same error, more jitter is behind.
    if (bound != nullptr) {
      const std::strong_ordering order = compare(point.error, *bound);
      if (jitter_.IsKnown() ? order >= 0 : order > 0) return;
    }
    bounds->Add(key, point.error, compare);
    for (Best* best : bests)
      Take(ranking_.EntryOf(point, best->bandwidth), false, with_front, best);
  }

  // By which factor the M / D^2 of one must be larger than that of another so that its jitter is
  // less for certain, also after rounding (see Staircase).
  //
  // The jitter is A sqrt(c / key + w) + B. How steeply its logarithm falls with that of the key is
  // least where the key is largest, and the average between two keys is at most largest / smallest
  // times that. So what is measured between the ends of the grid tells what a small step does at
  // least.
  double FactorOf(const Group& group) const {
    constexpr double kStep = 1e-3;
    constexpr double kEnough = 100 * answer::LoopJitter::kRounding;
    if (!jitter_.IsKnown()) return 0;
    if (!jitter_.FallsWithRatio()) return HUGE_VAL;
    std::pair<int, int> largest;
    std::pair<int, int> smallest;
    double high = 0;
    double low = HUGE_VAL;
    const auto look = [&](int m, int d) {
      const double key = static_cast<double>(m) / d / d;
      if (key > high) std::tie(high, largest) = std::tuple(key, std::pair(m, d));
      if (key < low) std::tie(low, smallest) = std::tuple(key, std::pair(m, d));
    };
    for (const Row& row : group.grid.rows) {
      if (row.one) look(hardware::kEighths, row.d);
      if (row.first > row.last) continue;
      look(row.first, row.d);
      look(row.last, row.d);
    }
    if (high <= low * (1 + kStep)) return HUGE_VAL;
    for (const Best* best : group.bests) {
      const double most = jitter_.PeakToPeak(smallest.first, smallest.second, best->bandwidth);
      const double least = jitter_.PeakToPeak(largest.first, largest.second, best->bandwidth);
      const double steepness = std::log(most / least) / std::log(high / low) * (low / high);
      if (!(steepness * kStep > kEnough)) return HUGE_VAL;
    }
    return 1 + kStep;
  }

  Found Result() {
    Found found;
    for (const Best& best : bests_) {
      if (best.entry) found.best.push_back(ranking_.CandidateOf(*best.entry));
    }
    const std::vector<LoopEntry>& entries = front_.Entries();
    const std::size_t shown = std::min(entries.size(), kMostOfFront);
    for (std::size_t i = 0; i < shown; ++i) {
      found.front.push_back(ranking_.CandidateOf(entries[i]));
    }
    found.complete = shown == entries.size();
    found.counts = counts_;
    return found;
  }

  const LoopLimits& limits_;
  Inputs inputs_;
  bool fractions_;
  std::vector<Sweep> sweeps_;
  std::vector<LoopDividers> outputs_;
  answer::LoopJitter jitter_;
  LoopRanking ranking_;
  Near most_ = {HUGE_VAL, 0};  // the largest worst error that is of use
  std::vector<Best> bests_;
  std::vector<Group> groups_;
  TradeOffs<LoopEntry> front_;
  Counts counts_;
};

}  // namespace

Found SearchLoop(const Request& request, const Device& device, Primitive primitive,
                 const Aim& aim) {
  return LoopSearch(request, device, primitive).Run(aim);
}

}  // namespace planner::search
