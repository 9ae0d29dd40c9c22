// PLL and TSYN, tried one by one.
#include <algorithm>
#include <cmath>
#include <cstddef>
#include <map>
#include <numeric>
#include <optional>
#include <tuple>
#include <utility>

#include "hardware/Loop.h"
#include "plain_enumeration.h"
#include "planner/answer/Demands.h"
#include "planner/answer/Jitter.h"
#include "planner/answer/Margin.h"

namespace plain {

namespace {

using hardware::Rational;
using planner::Bandwidth;
using planner::LoopOutput;
using planner::LoopSettings;
using planner::Primitive;
using planner::Request;

// Which dividers are tried.
enum class Dividers {
  kWholeMoving,      // whole ones, with phases and high times
  kStill,            // all that there are, with nothing moved
  kFractionOfFirst,  // the same, but of output 0 no whole ones
};

// What a divider makes of an output.
struct Judged {
  LoopOutput set;
  bool is_met = false;
  Rational worst = 0;
  Rational ppm = 0;
  Rational phase = 0;
  Rational duty = 0;
  Rational margin = 0;
};

class Loop {
 public:
  Loop(const Request& request, const planner::Device& device, Primitive primitive, Effort effort)
      : request_(request),
        limits_(device.Loop(primitive)),
        primitive_(primitive),
        effort_(effort),
        fractions_(hardware::HasFractions(primitive, static_cast<int>(request.outputs.size()),
                                          request.whole_divider_0)),
        jitter_(device, request) {}

  Found Run() {
    std::vector<Ranked> all;
    Found found;
    for (const Bandwidth bandwidth : hardware::kBandwidths) {
      if (request_.bandwidth && *request_.bandwidth != bandwidth) continue;
      const std::size_t start = all.size();
      for (int d = 1; d <= hardware::kLargestD; ++d) {
        for (int m = 1; m <= hardware::kLargestM * 8; ++m) {
          if (!hardware::IsM(primitive_, m, fractions_) || !IsInRange(m, d, bandwidth)) continue;
          for (const Dividers dividers : DividersOf(m)) {
            ++found.tried;
            if (auto one = Make(m, d, bandwidth, dividers)) all.push_back(*std::move(one));
          }
        }
      }
      if (all.size() == start) continue;
      found.best.push_back(*std::min_element(
          all.begin() + static_cast<std::ptrdiff_t>(start), all.end(),
          [&](const Ranked& a, const Ranked& b) { return IsBefore(request_, a, b); }));
    }
    found.front = FrontOf(request_, all);
    return found;
  }

 private:
  bool IsInRange(int m, int d, Bandwidth bandwidth) const {
    for (const Rational& input : corners_) {
      if (!limits_.vco.Contains(input * hardware::VcoRatio(m, d))) return false;
      if (!limits_.PfdOf(bandwidth).Contains(input / d)) return false;
    }
    return true;
  }

  std::vector<Dividers> DividersOf(int m) const {
    if (!fractions_) return {Dividers::kWholeMoving};
    if (m % 8 != 0 || !request_.AsksForShape()) return {Dividers::kStill};
    return {Dividers::kWholeMoving, Dividers::kFractionOfFirst};
  }

  std::optional<Ranked> Make(int m, int d, Bandwidth bandwidth, Dividers dividers) {
    LoopSettings settings{primitive_, bandwidth, m, d, {}};
    settings.outputs.resize(request_.outputs.size());
    planner::answer::RankKey key;
    key.vco = request_.inputs[0] * hardware::VcoRatio(m, d);
    key.jitter = jitter_.PeakToPeak(m, d, bandwidth);
    key.margin = MarginOfLoop(m, d, bandwidth);
    for (std::size_t i = 0; i < request_.outputs.size(); ++i) {
      if (!request_.outputs[i].used) continue;
      const std::optional<Judged>& best = BestOf(i, m, d, dividers);
      if (!best) return std::nullopt;
      settings.outputs[i] = best->set;
      const planner::Output& asked = request_.outputs[i];
      const bool is_met =
          best->is_met && planner::answer::IsJitterMet(request_, asked, key.jitter);
      if (!is_met) key.rank_class = planner::answer::Class::kMissed;
      key.worst_error = std::max({key.worst_error, best->worst,
                                  planner::answer::JitterError(request_, asked, key.jitter)});
      key.margin = std::min(key.margin, best->margin);
    }
    return Ranked{std::move(settings), std::move(key)};
  }

  Rational MarginOfLoop(int m, int d, Bandwidth bandwidth) const {
    std::optional<Rational> margin;
    for (const Rational& input : corners_) {
      for (const Rational& own :
           {planner::answer::MarginOf(input * hardware::VcoRatio(m, d), limits_.vco),
            planner::answer::MarginOf(input / d, limits_.PfdOf(bandwidth))}) {
        if (!margin || own < *margin) margin = own;
      }
    }
    return *margin;
  }

  // The dividers do not depend on the bandwidth, and on M and D only by their quotient.
  const std::optional<Judged>& BestOf(std::size_t output, int m, int d, Dividers dividers) {
    const int common = std::gcd(m, d);
    const auto key = std::tuple(output, m / common, d / common, dividers);
    const auto known = chosen_.find(key);
    if (known != chosen_.end()) return known->second;
    return chosen_.emplace(key, Choose(output, m, d, dividers)).first->second;
  }

  std::optional<Judged> Choose(std::size_t output, int m, int d, Dividers dividers) const {
    std::vector<int> tried;
    for (int divider = 1; divider <= hardware::LargestDivider(limits_.max_count) * 8; ++divider) {
      if (!hardware::IsDivider(divider, static_cast<int>(output), fractions_,
                               hardware::LargestDivider(limits_.max_count))) {
        continue;
      }
      const bool is_whole = divider % 8 == 0;
      if (dividers == Dividers::kWholeMoving && !is_whole) continue;
      if (dividers == Dividers::kFractionOfFirst && output == 0 && is_whole) continue;
      if (KeepsRange(output, m, d, divider)) tried.push_back(divider);
    }
    if (effort_ == Effort::kLess) Thin(output, m, d, dividers, &tried);
    std::optional<Judged> best;
    for (const int divider : tried) {
      Judged one = Judge(output, m, d, divider, dividers);
      if (!best || IsBetter(one, *best)) best = std::move(one);
    }
    return best;
  }

  bool KeepsRange(std::size_t output, int m, int d, int divider) const {
    const hardware::Range& range = limits_.OutputOf(static_cast<int>(output));
    for (const Rational& input : corners_) {
      if (effort_ == Effort::kLess) {
        constexpr double kNear = 1e-9;
        const double frequency = input.ToDouble() * m / d / divider;
        const double lowest = range.lowest.ToDouble();
        const double highest = range.highest.ToDouble();
        if (frequency < lowest * (1 - kNear) || frequency > highest * (1 + kNear)) return false;
        if (frequency > lowest * (1 + kNear) && frequency < highest * (1 - kNear)) continue;
      }
      if (!range.Contains(input * hardware::OutputRatio(m, d, divider))) return false;
    }
    return true;
  }

  bool IsBetter(const Judged& a, const Judged& b) const {
    if (a.is_met != b.is_met) return a.is_met;
    if (request_.rank == planner::Rank::kMargin && a.is_met && a.margin != b.margin) {
      return b.margin < a.margin;
    }
    return std::tie(a.worst, a.ppm, a.phase, a.duty, a.set.divider) <
           std::tie(b.worst, b.ppm, b.phase, b.duty, b.set.divider);
  }

  Judged Judge(std::size_t output, int m, int d, int divider, Dividers dividers) const {
    const planner::Output& asked = request_.outputs[output];
    Judged one;
    one.set.divider = divider;
    Rational duty = 50;
    if (dividers == Dividers::kWholeMoving) {
      if (asked.phase) one.set.phase = hardware::NearestPhaseStep(*asked.phase, divider);
      if (asked.duty) {
        one.set.high_time =
            hardware::NearestHighTime(*asked.duty, divider / 8, limits_.max_count);
        duty = hardware::DutyOfHighTime(one.set.high_time, divider / 8);
      }
    }
    const Rational ratio = hardware::OutputRatio(m, d, divider);
    const planner::answer::Errors errors = planner::answer::ErrorsOf(
        asked, request_.inputs[0] * ratio, hardware::PhaseOfStep(one.set.phase, divider), duty);
    one.is_met = planner::answer::AreMet(request_, asked, errors);
    one.worst = planner::answer::WorstError(request_, asked, errors);
    one.ppm = errors.ppm.Absolute();
    if (errors.phase) one.phase = errors.phase->Absolute();
    if (errors.duty) one.duty = errors.duty->Absolute();
    for (std::size_t i = 0; i < corners_.size(); ++i) {
      const Rational own = planner::answer::MarginOf(
          corners_[i] * ratio, limits_.OutputOf(static_cast<int>(output)));
      one.margin = i == 0 ? own : std::min(one.margin, own);
    }
    return one;
  }

  // Leaves out what is not near the best, and does not meet the demands, as doubles see it.
  void Thin(std::size_t output, int m, int d, Dividers dividers, std::vector<int>* tried) const {
    constexpr double kNear = 1e-6;
    std::vector<double> errors;
    double least = HUGE_VAL;
    for (const int divider : *tried) {
      errors.push_back(RoughError(output, m, d, divider, dividers));
      least = std::min(least, errors.back());
    }
    std::vector<int> left;
    for (std::size_t i = 0; i < tried->size(); ++i) {
      if (errors[i] <= std::max(least * (1 + kNear) + kNear, 1 + kNear)) {
        left.push_back((*tried)[i]);
      }
    }
    *tried = std::move(left);
  }

  double RoughError(std::size_t output, int m, int d, int divider, Dividers dividers) const {
    const planner::Output& asked = request_.outputs[output];
    const double frequency = request_.inputs[0].ToDouble() * m / d / divider;
    const auto unit = [](const Rational& tolerance, double usual) {
      return tolerance == Rational(0) ? usual : tolerance.ToDouble();
    };
    double worst = std::abs(frequency / asked.frequency.ToDouble() - 1) * 1e6 /
                   unit(request_.ToleranceOf(asked), 100);
    const bool moves = dividers == Dividers::kWholeMoving;
    if (asked.phase) {
      const double degrees = asked.phase->ToDouble();
      const double step = 360.0 / divider;
      const double made = moves ? std::round(degrees / step) * step : 0;
      const double error = std::abs(std::remainder(made - degrees, 360.0));
      worst = std::max(worst, error / unit(request_.PhaseToleranceOf(asked), 0.5));
    }
    if (asked.duty) {
      double made = 50;
      if (moves) {
        const int halves =
            hardware::NearestHighTime(*asked.duty, divider / 8, limits_.max_count);
        made = 400.0 * halves / divider;
      }
      worst = std::max(worst, std::abs(made - asked.duty->ToDouble()) /
                                  unit(request_.DutyToleranceOf(asked), 0.5));
    }
    return worst;
  }

  const Request& request_;
  const planner::LoopLimits& limits_;
  const std::vector<Rational> corners_ = CornersOf(request_);
  Primitive primitive_;
  Effort effort_;
  bool fractions_;
  planner::answer::LoopJitter jitter_;
  std::map<std::tuple<std::size_t, int, int, Dividers>, std::optional<Judged>> chosen_;
};

}  // namespace

Found EnumerateLoop(const Request& request, const planner::Device& device, Primitive primitive,
                    Effort effort) {
  return Loop(request, device, primitive, effort).Run();
}

}  // namespace plain
