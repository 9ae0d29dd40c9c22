// The M and D of a KRU with which all outputs can be near enough.
//
// Each output must have a source that comes near enough to its frequency: those of the delay line
// are what they are, those of the synthesiser leave a span of M / D. Where each output has one,
// with the same divide, is a span of M / D, too. How near is near enough falls while M rises: what
// has been found with a smaller M and D has less jitter.
//
// Tested by search_test.cpp.
#ifndef VORKEL_PLANNER_SEARCH_KRUREACH_H_
#define VORKEL_PLANNER_SEARCH_KRUREACH_H_

#include <array>
#include <bit>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>
#include <vector>

#include "planner/search/KruPhases.h"
#include "planner/search/KruTask.h"
#include "planner/search/VcoSpans.h"

namespace planner::search {

// A set of whole numbers from 0 to 319.
class SmallSet {
 public:
  void Add(int first, int last) {
    for (int one = first; one <= last; ++one) words_[Word(one)] |= Bit(one);
  }
  bool Contains(int one) const { return (words_[Word(one)] & Bit(one)) != 0; }
  template <typename Take>
  void ForEach(const Take& take) const {
    for (std::size_t i = 0; i < words_.size(); ++i) {
      for (std::uint64_t word = words_[i]; word != 0; word &= word - 1) {
        take(static_cast<int>(i) * kBits + std::countr_zero(word));
      }
    }
  }

 private:
  static constexpr int kBits = 64;
  static std::size_t Word(int one) { return static_cast<std::size_t>(one / kBits); }
  static std::uint64_t Bit(int one) { return std::uint64_t{1} << (one % kBits); }
  std::array<std::uint64_t, 5> words_{};
};

class KruReach {
 public:
  static constexpr std::size_t kMostDivides = hardware::kClkdvHalves.size();

  // What is near enough.
  struct Terms {
    bool all_met;                  // what does not meet its demand never is
    bool with_ties;                // what is as near as a bound is
    std::optional<KruError> most;  // the bound to begin with, if any
  };
  KruReach(const KruTask& task, KruPhases* phases, const Terms& terms,
           std::span<const int> divides, int largest);

  // Begins with a delay line, and no bound but the first.
  void Start(const KruBase& line);

  // From an M on, only what is below an error is near enough; the D of what is asked for from now
  // on are not below those of what has the error.
  void Bind(int m, const KruError& error);

  // Counts what Bind has changed.
  std::size_t Changes() const { return changes_; }

  // No D below has an M that is near enough; one above all when none has.
  int FirstD() const;
  // The M that are near enough with a D; and those that would be with the first bound alone.
  SmallSet MsFor(int d) const { return MsOf(steps_, d); }
  SmallSet AllMsFor(int d) const { return MsOf(open_, d); }

  // The outputs that are near enough on a source, a bit for each by its place among the used ones.
  using Outputs = std::uint32_t;
  struct Served {
    Outputs line;
    Outputs doubler;
    Outputs divide;
    Outputs synthesiser;
  };
  // Calls `take` with the settings that are near enough, with an M and a D and each divide, none
  // first, and what serves which output. It may call Bind.
  template <typename Take>
  void ForEachNear(const KruBase& pair, const Take& take) const {
    ForEachOf([&]() -> const Step& { return StepOf(pair.m); }, pair, take);
  }
  // The same with the first bound alone.
  template <typename Take>
  void ForEach(const KruBase& pair, const Take& take) const {
    ForEachOf([&]() -> const Step& { return open_.front(); }, pair, take);
  }

  // The same without an M. With a divide, only what is below an error is near enough: that which
  // `bound_of` tells at the moment; null for the first bound.
  template <typename BoundOf, typename Take>
  void ForEachWithoutM(const BoundOf& bound_of, const Take& take) const {
    KruBase base = line_;
    if (open_.front().on_line == all_) take(base);
    bool has_changed = true;
    std::optional<KruError> bound;
    Outputs on_line = 0;
    for (const int halves : divides_) {
      if (has_changed) {
        const KruError* const error = bound_of();
        bound = error == nullptr ? terms_.most : std::optional(*error);
        on_line = OnLine(bound);
        has_changed = false;
      }
      base.divide_halves = halves;
      const Outputs on_divide = NearOn(PinSource::kDivider, base, bound);
      if (on_divide == 0 || (on_line | on_divide) != all_) continue;
      take(base);
      has_changed = true;
    }
  }

 private:
  // From an M on.
  struct Step {
    int m;
    std::optional<KruError> bound;
    Outputs line = 0;  // those that the delay line serves near enough,
    Outputs doubler = 0;
    Outputs on_line = 0;                            // either of them,
    std::array<Outputs, kMostDivides> on_divide{};  // and a divide of CLKDV
    int first_d = 0;                                // none below has an M
    Spans spans;                                    // of M / D
    Outputs on_jitter = 0;  // those that need the synthesiser and ask for a jitter
  };
  // The spans of a few outputs that two sources have each.
  class FewSpans {
   public:
    void Add(const Span& span) {
      if (span.lowest <= span.highest) all_[count_++] = span;
    }
    void Clear() { count_ = 0; }
    const Span* begin() const { return all_.data(); }
    const Span* end() const { return all_.data() + count_; }

   private:
    std::array<Span, 16> all_;
    std::size_t count_ = 0;
  };

  template <typename StepNow, typename Take>
  void ForEachOf(const StepNow& step_now, KruBase pair, const Take& take) const {
    Outputs on_synthesiser = 0;
    std::size_t changes = changes_ + 1;
    for (std::size_t k = 0; k <= divides_.size(); ++k) {
      const Step& step = step_now();
      if (changes != changes_) {
        changes = changes_;
        on_synthesiser = NearOn(PinSource::kSynthesiser, pair, step.bound);
      }
      pair.divide_halves = k == 0 ? 0 : divides_[k - 1];
      Outputs on_divide = 0;
      if (k > 0) {
        on_divide = task_.IsSp() ? step.on_divide[k - 1]
                                 : NearOn(PinSource::kDividedSynthesiser, pair, step.bound);
        if (on_divide == 0) continue;
      }
      if (on_synthesiser == 0 && (task_.IsSp() || on_divide == 0)) continue;
      if ((step.on_line | on_synthesiser | on_divide) != all_) continue;
      const Served served = {step.line, step.doubler, on_divide, on_synthesiser};
      if (ArePhasesNear(served, step.bound)) take(pair, served);
    }
  }
  SmallSet MsOf(const std::vector<Step>& steps, int d) const;
  bool ArePhasesNear(const Served& served, const std::optional<KruError>& bound) const;
  bool IsJitterNear(const Step& step, int m, int d) const;
  int LastOfJitter(const Step& step, int first, int last, int d) const;
  // What is not near enough at `wider`, a step with a larger error, is not looked at.
  Step StepWith(int m, const std::optional<KruError>& bound, const Step* wider) const;
  const Step& StepOf(int m) const {
    auto step = steps_.end() - 1;
    while (step->m > m) --step;
    return *step;
  }

  // Whether a pin of a source keeps its range.
  bool IsInRange(PinSource source, const KruRatio& ratio) const;
  // Whether an output can be near enough on a source.
  bool IsNearOn(PinSource source, std::size_t place, const KruBase& base, const KruRatio& ratio,
                const std::optional<KruError>& bound) const;
  bool IsJitterNearOn(PinSource source, std::size_t place, const KruBase& base,
                      const std::optional<KruError>& bound) const;
  bool IsBelow(const KruError& error, const std::optional<KruError>& bound) const;
  // The outputs that can, of some.
  Outputs NearOn(PinSource source, const KruBase& base, const std::optional<KruError>& bound,
                 Outputs some) const;
  Outputs NearOn(PinSource source, const KruBase& base,
                 const std::optional<KruError>& bound) const {
    return NearOn(source, base, bound, all_);
  }
  Outputs OnLine(const std::optional<KruError>& bound) const;
  using Mosts = std::array<double, kMostKruOutputs>;
  void AddSpans(Outputs served, int divide_halves, const std::optional<KruError>& bound,
                const Mosts& mosts, Spans* spans) const;
  void AddReachable(const Spans& all, Step* step) const;
  // The ratios of M to D with which an output is near enough on a source.
  Span SpanOn(PinSource source, std::size_t place, int divide_halves, double most) const;
  double MostOf(std::size_t place, const std::optional<KruError>& bound) const;
  bool IsDutyNearOn(PinSource source, std::size_t place, int divide_halves,
                    const std::optional<KruError>& bound) const;

  const KruTask& task_;
  KruPhases& phases_;
  Terms terms_;
  std::span<const int> divides_;
  int largest_;
  Outputs all_ = 0;
  Span whole_;    // of CLKFX and CLKFX180 with any of their ranges, as a ratio to the input
  Span divided_;  // of CLKFXDV
  KruBase line_;
  std::vector<Step> open_;   // one, with the first bound
  std::vector<Step> steps_;  // by their M
  std::size_t changes_ = 0;  // of the steps
};

}  // namespace planner::search

#endif  // VORKEL_PLANNER_SEARCH_KRUREACH_H_
