// Tested by search_test.cpp.
#include "planner/search/KruSearch.h"

#include <algorithm>
#include <array>
#include <bit>
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <numeric>
#include <optional>
#include <span>
#include <utility>
#include <vector>

#include "planner/search/KruSolver.h"
#include "planner/search/KruTask.h"
#include "planner/search/Staircase.h"

namespace planner::search {

namespace {

using Errors = std::array<double, kMostKruOutputs>;

// A set of numbers from 0 to 256: M.
class MBits {
 public:
  void Add(int first, int last) {
    for (int m = first; m <= last; ++m) words_[Word(m)] |= Bit(m);
  }
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
  static std::size_t Word(int m) { return static_cast<std::size_t>(m / kBits); }
  static std::uint64_t Bit(int m) { return std::uint64_t{1} << (m % kBits); }
  std::array<std::uint64_t, 5> words_{};
};

// An M and a D with the same quotient as others that are smaller: 6 / 4, but 2 / 2, as no M is 1.
bool IsMultiple(int m, int d) {
  const int common = std::gcd(m, d);
  return common > 1 && (m != common || m > hardware::kSmallestKruM);
}

class KruSearch {
 public:
  KruSearch(const Request& request, const Device& device, Primitive primitive)
      : task_(request, device, primitive),
        solver_(task_),
        largest_(hardware::LargestKruRatioPart(primitive)),
        leaves_out_multiples_(task_.Model().RisesWithSettings() && IsJitterAllKnown()) {
    if (task_.IsSp()) {
      divides_ = hardware::kClkdvHalves;
    } else {
      divides_ = hardware::kClkfxdvHalves;
    }
  }

  Found Run() {
    Walk(true);
    if (solver_.IsEmpty()) Walk(false);
    Found found;
    found.front = solver_.Front(kMostOfFront);
    found.complete = solver_.FrontSize() == found.front.size();
    if (std::optional<Candidate> best = solver_.Best()) found.best.push_back(*std::move(best));
    found.counts = {.pairs = pairs_, .judged = solver_.Solved()};
    return found;
  }

 private:
  // Where the jitter of a ratio is known, it is so with all M and D that make it. With output 0 of a
  // KRU_CLKGEN unused CLKFX can be out of range.
  bool IsJitterAllKnown() const {
    const bool on_clkfx = task_.IsSp() || task_.Outputs().front().Index() == 0;
    return !task_.Model().IsKnown() || (on_clkfx && task_.IsJitterAllKnown());
  }

  void Walk(bool all_met) {
    all_met_ = all_met;
    pairs_ = 0;
    for (const bool feedback : {false, true}) {
      if (task_.IsSp() ? task_.Asked().feedback && !feedback : feedback) continue;
      for (const bool divide_by_2 : {false, true}) {
        if (divide_by_2 && !task_.IsSp()) continue;
        WalkLine({.feedback = feedback, .divide_by_2 = divide_by_2});
      }
    }
  }

  // All M, D and divides.
  void WalkLine(const KruBase& line) {
    // Keys are 1 / M, and D goes upwards: what comes later has no smaller M and D than what a step
    // with a larger key stands for.
    Staircase staircase(task_.Model().RisesWithSettings() ? 1 : HUGE_VAL);
    NoteLine(line);
    if (line.feedback) {
      ++pairs_;
      Errors none;
      none.fill(HUGE_VAL);
      TakeDivides(line, none, HUGE_VAL);
      Note(hardware::kSmallestKruM, 1, line, &staircase);
    }
    pairs_ += std::int64_t{largest_} * (largest_ + 1 - hardware::kSmallestKruM);
    for (int d = 1; d <= largest_; ++d) {
      MsInReach(line, d, staircase).ForEach([&](int m) { TakePair(line, m, d, &staircase); });
    }
  }

  // The least error of an output with a pin that has a ratio to the input; HUGE_VAL where all is to
  // be met and that is not.
  double LeastError(const KruOutput& output, double ratio) const {
    const FrequencyDemand& frequency = output.Frequency();
    const double quotient = ratio * frequency.InputPerAsked();
    const double error =
        frequency.QuickError(quotient) - frequency.Slack() * (1 + quotient);
    return all_met_ && error > MostAllowed(frequency) ? HUGE_VAL : error;
  }
  static double MostAllowed(const FrequencyDemand& frequency) {
    return frequency.AllowedUnits() * (1 + kRounding);
  }

  static double RatioOf(PinSource source, const KruBase& base) {
    const KruRatio ratio = search::RatioOf(source, base);
    return static_cast<double>(ratio.a) / static_cast<double>(ratio.b);
  }

  // What the outputs can have without the synthesiser.
  void NoteLine(const KruBase& line) {
    const std::vector<KruOutput>& outputs = task_.Outputs();
    for (std::size_t i = 0; i < outputs.size(); ++i) {
      on_line_[i] = HUGE_VAL;
      if (!line.feedback) continue;
      on_line_[i] = std::min(LeastError(outputs[i], RatioOf(PinSource::kLine, line)),
                             LeastError(outputs[i], RatioOf(PinSource::kDoubler, line)));
    }
    on_divide_.assign(divides_.size(), Errors{});
    for (std::size_t k = 0; k < divides_.size(); ++k) {
      for (std::size_t i = 0; i < outputs.size(); ++i) {
        on_divide_[k][i] = HUGE_VAL;
        if (!line.feedback) continue;
        KruBase base = line;
        base.divide_halves = divides_[k];
        on_divide_[k][i] = LeastError(outputs[i], RatioOf(PinSource::kDivider, base));
      }
    }
  }

  // The M with which some output can be as near on the synthesiser, or on its divider, as it has to
  // be for the settings to matter.
  MBits MsInReach(const KruBase& line, int d, const Staircase& staircase) const {
    MBits reach;
    for (const KruOutput& output : task_.Outputs()) {
      const bool is_first = output.Index() == 0;
      // Output 0 of a KRU_CLKGEN must be on CLKFX, and says all.
      if (!task_.IsSp() && !is_first && task_.Outputs().front().Index() == 0) break;
      AddInReach(output, line.divide_by_2 ? 2.0 * d : d, staircase, &reach);
      if (task_.IsSp() || is_first) continue;
      for (const int halves : divides_) {
        AddInReach(output, 0.5 * halves * d, staircase, &reach);
      }
    }
    return reach;
  }

  // The M for which M / divided is near enough to the frequency of an output.
  void AddInReach(const KruOutput& output, double divided, const Staircase& staircase,
                  MBits* reach) const {
    const FrequencyDemand& frequency = output.Frequency();
    const double exact = divided / frequency.InputPerAsked();
    int first = hardware::kSmallestKruM;
    const auto add = [&](int last, double bound) {
      const double most = all_met_ ? std::min(bound, MostAllowed(frequency)) : bound;
      const double wide = most / frequency.PerUnit() + 2 * kRounding;
      const double low = std::clamp(exact * (1 - wide) * (1 - kRounding), 0.0, largest_ + 1.0);
      const double high = std::min(exact * (1 + wide) * (1 + kRounding), largest_ + 1.0);
      reach->Add(std::max(first, static_cast<int>(std::ceil(low))),
                 std::min(last, static_cast<int>(high)));
      first = last + 1;
    };
    double bound = HUGE_VAL;
    if (solver_.IsBestOnFront() || !all_met_) {
      for (const Staircase::Step& step : staircase.Steps()) {
        const int start = static_cast<int>(std::lround(1 / step.key));
        if (start > first) add(start - 1, bound);
        bound = step.error;
      }
    }
    add(largest_, bound);
  }

  void TakePair(const KruBase& line, int m, int d, Staircase* staircase) {
    KruBase base = line;
    base.m = m;
    base.d = d;
    const double bound = BoundOf(m, *staircase);
    const double ratio = RatioOf(PinSource::kSynthesiser, base);
    Errors own;
    double least = HUGE_VAL;
    for (std::size_t i = 0; i < task_.Outputs().size(); ++i) {
      own[i] = LeastError(task_.Outputs()[i], ratio);
      least = std::min(least, own[i]);
    }
    if (task_.IsSp() && least > bound) return;
    if (!task_.IsSp()) NoteDivides(ratio);
    if (leaves_out_multiples_ && IsMultiple(m, d)) return;
    if (TakeDivides(base, own, bound)) Note(m, d, line, staircase);
  }

  double BoundOf(int m, const Staircase& staircase) const {
    if (all_met_ && !solver_.IsBestOnFront()) return HUGE_VAL;
    return staircase.BoundOf(1.0 / m);
  }

  // What the outputs of a KRU_CLKGEN have on CLKFXDV.
  void NoteDivides(double ratio) {
    const std::vector<KruOutput>& outputs = task_.Outputs();
    for (std::size_t k = 0; k < divides_.size(); ++k) {
      for (std::size_t i = 0; i < outputs.size(); ++i) {
        on_divide_[k][i] = outputs[i].Index() == 0
                               ? HUGE_VAL
                               : LeastError(outputs[i], ratio * 2 / divides_[k]);
      }
    }
  }

  // Solves with each divide, and without one, as far as the frequencies can be near enough. `own`
  // are the errors on the synthesiser. False when nothing was solved.
  bool TakeDivides(KruBase base, const Errors& own, double bound) {
    const std::size_t count = task_.Outputs().size();
    Errors most = own;
    double worst = 0;
    for (std::size_t i = 0; i < count; ++i) {
      if (task_.IsSp()) most[i] = std::min(most[i], on_line_[i]);
      worst = std::max(worst, most[i]);
    }
    bool is_solved = false;
    const auto solve = [&](double error, int halves) {
      if (error > bound || error == HUGE_VAL) return;
      base.divide_halves = halves;
      solver_.Solve(base, all_met_);
      is_solved = true;
    };
    solve(worst, 0);
    for (std::size_t k = 0; k < divides_.size(); ++k) {
      double with_divide = 0;
      double least = HUGE_VAL;
      for (std::size_t i = 0; i < count; ++i) {
        with_divide = std::max(with_divide, std::min(most[i], on_divide_[k][i]));
        least = std::min(least, on_divide_[k][i]);
      }
      solve(std::max(with_divide, least), divides_[k]);
    }
    return is_solved;
  }

  // What was found binds all with a larger M and D: their synthesiser has no less jitter.
  void Note(int m, int d, const KruBase& line, Staircase* staircase) const {
    KruBase base = line;
    base.m = m;
    base.d = d;
    const double jitter = task_.JitterOf(base, Pin::kClkfx, false);
    if (jitter == answer::kUnknownJitter && task_.Model().IsKnown()) return;
    const double error = solver_.BoundOf(jitter);
    if (error < HUGE_VAL) staircase->Add(1.0 / m, error);
  }

  KruTask task_;
  KruSolver solver_;
  int largest_;
  bool leaves_out_multiples_;
  std::span<const int> divides_;
  bool all_met_ = true;
  std::int64_t pairs_ = 0;
  Errors on_line_{};
  std::vector<Errors> on_divide_;
};

}  // namespace

Found SearchKru(const Request& request, const Device& device, Primitive primitive) {
  return KruSearch(request, device, primitive).Run();
}

}  // namespace planner::search
