// Tested by search_test.cpp.
#include "planner/search/KruSearch.h"

#include <array>
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <numeric>
#include <optional>
#include <span>
#include <utility>

#include "planner/search/KruPhases.h"
#include "planner/search/KruReach.h"
#include "planner/search/KruSolver.h"
#include "planner/search/KruTask.h"

namespace planner::search {

namespace {

// An M and a D with the same quotient as others that are smaller: 6 / 4, but not 2 / 2, as no M
// is 1.
bool IsMultiple(int m, int d) {
  const int common = std::gcd(m, d);
  return common > 1 && (m != common || m > hardware::kSmallestKruM);
}

std::span<const int> DividesOf(const KruTask& task) {
  if (task.IsSp()) return hardware::kClkdvHalves;
  return hardware::kClkfxdvHalves;
}

// All settings, for what meets all demands or for anything with an error up to `most`.
class Walk {
 public:
  Walk(const KruTask& task, KruPhases* phases, bool all_met, const std::optional<KruError>& most)
      : task_(task),
        largest_(hardware::LargestKruRatioPart(task.Which())),
        leaves_out_multiples_(task.Model().RisesWithSettings() && IsJitterAllKnown()),
        solver_(task, phases, all_met),
        reach_(task, phases,
               {.all_met = all_met, .with_ties = !solver_.IsBestOnFront(), .most = most},
               DividesOf(task), largest_) {
    for (const bool feedback : {false, true}) {
      if (task.IsSp() ? task.Asked().feedback && !feedback : feedback) continue;
      for (const bool divide_by_2 : {false, true}) {
        if (divide_by_2 && !task.IsSp()) continue;
        TakeLine({.feedback = feedback, .divide_by_2 = divide_by_2});
      }
    }
  }

  const KruSolver& Solver() const { return solver_; }
  std::int64_t Pairs() const { return pairs_; }

 private:
  // Where the jitter of a ratio is known, it is so with all M and D that make it. With output 0 of
  // a KRU_CLKGEN unused CLKFX can be out of range.
  bool IsJitterAllKnown() const {
    const bool on_clkfx = task_.IsSp() || task_.Outputs().front().Index() == 0;
    return !task_.Model().IsKnown() || (on_clkfx && task_.IsJitterAllKnown());
  }

  void TakeLine(const KruBase& line) {
    reach_.Start(line);
    if (line.feedback) {
      ++pairs_;
      TakeWithoutM(line);
    }
    KruBase base = line;
    base.d = 1;
    base.m = hardware::kSmallestKruM;
    Bind(base);
    pairs_ += std::int64_t{largest_} * (largest_ + 1 - hardware::kSmallestKruM);
    for (base.d = solver_.IsBestOnFront() ? reach_.FirstD() : 1; base.d <= largest_; ++base.d) {
      SmallSet near = reach_.MsFor(base.d);
      std::size_t changes = reach_.Changes();
      const SmallSet ms = solver_.IsBestOnFront() ? near : reach_.AllMsFor(base.d);
      ms.ForEach([&](int m) {
        if (changes != reach_.Changes()) {
          changes = reach_.Changes();
          near = reach_.MsFor(base.d);
        }
        base.m = m;
        TakePair(base, near.Contains(m));
      });
    }
  }

  // What uses CLKDV has its jitter at least.
  void TakeWithoutM(const KruBase& line) {
    const double jitter = task_.JitterOf(line, Pin::kClkdv, false);
    const auto bound = [&]() -> const KruError* {
      const KruEntry* const best = solver_.IsBestOnFront() ? solver_.LeastOf(jitter) : nullptr;
      return best != nullptr ? &best->error : nullptr;
    };
    reach_.ForEachWithoutM(bound, [&](const KruBase& base) { solver_.Solve(base); });
  }

  void TakePair(const KruBase& pair, bool is_near) {
    const bool can_be_widest = !solver_.IsBestOnFront() && CanBeWidest(pair);
    if (!is_near && !can_be_widest) return;
    if (leaves_out_multiples_ && IsMultiple(pair.m, pair.d)) return;
    if (is_near) {
      reach_.ForEachNear(pair, [&](const KruBase& base, const KruReach::Served&) { Solve(base); });
    }
    if (!can_be_widest) return;
    reach_.ForEach(pair, [&](const KruBase& base, const KruReach::Served& served) {
      if (CanBeWidest(base, served)) Solve(base);
    });
  }

  // Whether CLKFX leaves settings a chance to have the largest margin, where an output must be on
  // it.
  bool CanBeWidest(const KruBase& pair) const {
    return task_.IsSp() || task_.Outputs().front().Index() != 0 ||
           !solver_.IsTooNarrow(solver_.WidthOf(PinSource::kSynthesiser, pair, 0), 0);
  }

  void Solve(const KruBase& base) {
    solver_.Solve(base);
    Bind(base);
  }

  // Whether settings can have a larger margin than the best so far, or the same with no more
  // jitter.
  bool CanBeWidest(const KruBase& base, const KruReach::Served& served) const {
    constexpr std::size_t kSources = 4;
    const double jitter = task_.JitterOf(base, Pin::kClkfx, false);
    const std::array<PinSource, kSources> sources = {PinSource::kLine, PinSource::kDoubler,
                                                     DividedSource(), PinSource::kSynthesiser};
    const std::array<KruReach::Outputs, kSources> outputs = {served.line, served.doubler,
                                                             served.divide, served.synthesiser};
    KruSolver::Width least;
    for (std::size_t i = 0; i < task_.Outputs().size(); ++i) {
      KruSolver::Width most{{-HUGE_VAL, 0}, {0, 1}, nullptr};
      for (std::size_t k = 0; k < kSources; ++k) {
        if ((outputs[k] >> i & 1) == 0) continue;
        const KruSolver::Width width = solver_.WidthOf(sources[k], base, i);
        if (width.margin.value > most.margin.value) most = width;
      }
      if (most.margin.value < least.margin.value) least = most;
      if (solver_.IsTooNarrow(least, jitter)) return false;
    }
    return true;
  }

  PinSource DividedSource() const {
    return task_.IsSp() ? PinSource::kDivider : PinSource::kDividedSynthesiser;
  }

  // What has been found with no more jitter than that of CLKFX with an M and a D: nothing with an M
  // and a D that are not below these has less, and so it has to have a smaller error.
  void Bind(const KruBase& base) {
    if (!task_.Model().RisesWithSettings()) return;
    const double jitter = task_.JitterOf(base, Pin::kClkfx, false);
    if (jitter == answer::kUnknownJitter && task_.Model().IsKnown()) return;
    const KruEntry* const best = solver_.LeastOf(jitter);
    if (best != nullptr) reach_.Bind(base.m, best->error);
  }

  const KruTask& task_;
  int largest_;
  bool leaves_out_multiples_;
  KruSolver solver_;
  KruReach reach_;
  std::int64_t pairs_ = 0;
};

Found ResultOf(const Walk& walk) {
  Found found;
  found.front = walk.Solver().TradeOffs(kMostOfFront);
  found.complete = walk.Solver().Front().size() == found.front.size();
  if (std::optional<Candidate> best = walk.Solver().Best()) found.best.push_back(*std::move(best));
  found.counts = {.pairs = walk.Pairs(), .judged = walk.Solver().Solved()};
  return found;
}

}  // namespace

Found SearchKru(const Request& request, const Device& device, Primitive primitive,
                const Aim& aim) {
  KruTask task(request, device, primitive);
  KruPhases phases(task);
  if (aim.part != Aim::Part::kNearest) {
    Found found = ResultOf(Walk(task, &phases, true, std::nullopt));
    if (!found.best.empty() || aim.part == Aim::Part::kMet) return found;
  }
  std::optional<KruError> most;
  if (aim.worst_error) most = task.JustAbove(*aim.worst_error);
  return ResultOf(Walk(task, &phases, false, most));
}

}  // namespace planner::search
