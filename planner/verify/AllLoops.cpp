// Every setting of a PLL or a TSYN.
//
// Tested by all_settings_test.cpp.
#include <algorithm>
#include <cmath>
#include <cstddef>
#include <map>
#include <optional>
#include <utility>

#include "hardware/Loop.h"
#include "planner/answer/Jitter.h"
#include "planner/verify/AllSettings.h"
#include "planner/verify/Formulas.h"

namespace planner::verify {

namespace {

// What stands behind one M and D.
enum class Kind {
  kWhole,     // whole dividers, with phases and high times
  kStill,     // any dividers, with nothing moved
  kFraction,  // likewise, and that of output 0 is none of the whole ones
};

// A divider for one output.
struct Choice {
  LoopOutput set;
  bool is_met = true;
  Rational margin = 0;
  Rational error = 0;  // the largest, in units
  Rational ppm = 0;    // their sizes
  Rational degrees = 0;
  Rational points = 0;
};

class Loops {
 public:
  Loops(const Request& request, const Device& device, Primitive primitive, BestSettings* best)
      : request_(request),
        limits_(device.Loop(primitive)),
        primitive_(primitive),
        best_(*best),
        model_(device, request),
        corners_(CornersOf(request.inputs, request.input_tolerance)),
        fractions_(hardware::HasFractions(primitive, static_cast<int>(request.outputs.size()),
                                          request.whole_divider_0)),
        largest_(hardware::LargestDivider(limits_.max_count)) {}

  void TryAll() {
    for (int d = 1; d <= hardware::kLargestD; ++d) {
      for (int m = 1; m <= 8 * hardware::kLargestM; ++m) {
        if (!hardware::IsM(primitive_, m, fractions_)) continue;
        if (IsVcoInside(m, d)) TryDividers(m, d);
      }
    }
  }

 private:
  bool IsVcoInside(int m, int d) const {
    for (const Rational& input : corners_) {
      const Rational vco = VcoOf(input, m, d);
      if (vco < limits_.vco.lowest || limits_.vco.highest < vco) return false;
    }
    return true;
  }

  const Range& Pfds(Bandwidth bandwidth) const {
    return bandwidth == Bandwidth::kLow ? limits_.pfd_low : limits_.pfd;
  }

  bool IsPfdInside(int d, Bandwidth bandwidth) const {
    if (request_.bandwidth && *request_.bandwidth != bandwidth) return false;
    const Range& pfds = Pfds(bandwidth);
    for (const Rational& input : corners_) {
      if (input / d < pfds.lowest || pfds.highest < input / d) return false;
    }
    return true;
  }

  void TryDividers(int m, int d) {
    const bool is_any = IsPfdInside(d, Bandwidth::kOptimized) || IsPfdInside(d, Bandwidth::kLow) ||
                        IsPfdInside(d, Bandwidth::kHigh);
    if (!is_any) return;
    if (!fractions_) return Try(m, d, Kind::kWhole);
    if (m % 8 != 0 || !request_.AsksForShape()) return Try(m, d, Kind::kStill);
    Try(m, d, Kind::kWhole);
    Try(m, d, Kind::kFraction);
  }

  // With the best divider of each output, which does not depend on those of the others.
  void Try(int m, int d, Kind kind) {
    LoopSettings set{primitive_, Bandwidth::kOptimized, m, d, {}};
    Figures figures;
    figures.vco = VcoOf(request_.inputs[0], m, d);
    figures.margin = MarginOfVco(m, d);
    for (std::size_t i = 0; i < request_.outputs.size(); ++i) {
      set.outputs.emplace_back();
      if (!request_.outputs[i].used) continue;
      const std::optional<Choice>& choice = BestFor(i, m, d, kind);
      if (!choice) return;
      set.outputs.back() = choice->set;
      if (!choice->is_met) figures.rank_class = 1;
      figures.worst_error = std::max(figures.worst_error, choice->error);
      figures.margin = std::min(figures.margin, choice->margin);
    }
    for (const Bandwidth bandwidth : hardware::kBandwidths) {
      if (!IsPfdInside(d, bandwidth)) continue;
      set.bandwidth = bandwidth;
      best_.Add(static_cast<std::size_t>(bandwidth), {set, WithJitter(set, figures)});
    }
  }

  Rational MarginOfVco(int m, int d) const {
    Rational margin = MarginIn(limits_.vco, VcoOf(corners_[0], m, d));
    for (const Rational& input : corners_) {
      margin = std::min(margin, MarginIn(limits_.vco, VcoOf(input, m, d)));
    }
    return margin;
  }

  // What depends on the bandwidth.
  Figures WithJitter(const LoopSettings& set, Figures figures) const {
    figures.jitter = model_.PeakToPeak(set.m, set.d, set.bandwidth);
    for (const Rational& input : corners_) {
      figures.margin = std::min(figures.margin, MarginIn(Pfds(set.bandwidth), input / set.d));
    }
    for (const Output& asked : request_.outputs) {
      const auto& allowed = asked.max_jitter ? asked.max_jitter : request_.max_jitter;
      if (!asked.used || !allowed) continue;
      if (figures.jitter == kNoJitter) {
        figures.rank_class = 1;
        continue;
      }
      const Rational jitter = Rational::FromDouble(figures.jitter);
      if (*allowed < jitter) figures.rank_class = 1;
      figures.worst_error = std::max(figures.worst_error, PsInUnits(jitter, *allowed));
    }
    return figures;
  }

  // Dividers depend on M and D by their quotient alone.
  const std::optional<Choice>& BestFor(std::size_t output, int m, int d, Kind kind) {
    const Rational vco = VcoOf(request_.inputs[0], m, d);
    auto& known = known_[{output, kind}];
    const auto place = known.find(vco);
    if (place != known.end()) return place->second;
    return known.emplace(vco, Choose(output, vco, kind)).first->second;
  }

  std::optional<Choice> Choose(std::size_t output, const Rational& vco, Kind kind) const {
    std::optional<Choice> best;
    for (int divider = 8; divider <= 8 * largest_; ++divider) {
      if (!hardware::IsDivider(divider, static_cast<int>(output), fractions_, largest_)) continue;
      if (kind == Kind::kWhole && divider % 8 != 0) continue;
      if (kind == Kind::kFraction && output == 0 && divider % 8 == 0) continue;
      if (best && IsHopeless(output, vco, divider, *best)) continue;
      if (!IsInside(output, vco, divider)) continue;
      const Choice choice = Make(output, vco, divider, kind == Kind::kWhole);
      if (!best || IsBetter(choice, *best)) best = choice;
    }
    return best;
  }

  // Whether already the error of the frequency makes a divider worse than another one, as doubles
  // tell beyond doubt.
  bool IsHopeless(std::size_t output, const Rational& vco, int divider, const Choice& best) const {
    const Output& asked = request_.outputs[output];
    const double made = vco.ToDouble() * 8 / divider;
    const double ppm = std::abs(made / asked.frequency.ToDouble() - 1) * 1e6;
    constexpr double kRounding = 1e-6;
    const double least = ppm * (1 - kRounding) - kRounding;
    const double allowed = asked.tolerance.value_or(request_.tolerance).ToDouble();
    // It may meet the demands.
    if (least <= allowed) return false;
    const double unit = allowed > 0 ? allowed : 100;
    return best.is_met || least / unit > best.error.ToDouble() * (1 + kRounding);
  }

  const Range& Outputs(std::size_t output) const {
    return output == 1 ? limits_.output_1 : limits_.output;
  }

  // What the second input makes is to the first as these are to each other.
  bool IsInside(std::size_t output, const Rational& vco, int divider) const {
    for (const Rational& input : corners_) {
      const Rational made = FrequencyOf(vco * input / request_.inputs[0], divider);
      if (made < Outputs(output).lowest || Outputs(output).highest < made) return false;
    }
    return true;
  }

  Choice Make(std::size_t output, const Rational& vco, int divider, bool moves) const {
    const Output& asked = request_.outputs[output];
    Choice choice;
    choice.set.divider = divider;
    const Rational frequency = FrequencyOf(vco, divider);
    const Rational tolerance = asked.tolerance.value_or(request_.tolerance);
    choice.ppm = Ppm(frequency, asked.frequency).Absolute();
    choice.is_met = choice.ppm <= tolerance;
    choice.error = PpmInUnits(choice.ppm, tolerance);
    if (asked.phase) AddPhase(asked, moves, &choice);
    if (asked.duty) AddDuty(asked, moves, &choice);
    choice.margin = MarginIn(Outputs(output), frequency);
    for (const Rational& input : corners_) {
      const Rational made = frequency * input / request_.inputs[0];
      choice.margin = std::min(choice.margin, MarginIn(Outputs(output), made));
    }
    return choice;
  }

  // The step that is nearest; of two the later one.
  void AddPhase(const Output& asked, bool moves, Choice* choice) const {
    const int divider = choice->set.divider;
    if (moves) {
      const Rational steps = *asked.phase * divider / 360;
      choice->set.phase = static_cast<int>(*(steps + Rational(1, 2)).Floor().Whole());
    }
    const Rational allowed = asked.phase_tolerance.value_or(request_.phase_tolerance);
    choice->degrees = Turned(verify::PhaseOf(choice->set.phase, divider) - *asked.phase).Absolute();
    choice->is_met = choice->is_met && choice->degrees <= allowed;
    choice->error = std::max(choice->error, DegreesInUnits(choice->degrees, allowed));
  }

  // The high time that is nearest to the duty cycle, one of the two around it; of two the longer
  // one.
  void AddDuty(const Output& asked, bool moves, Choice* choice) const {
    Rational made = 50;
    if (moves) {
      const int divider = choice->set.divider / 8;
      const hardware::HighTimes times = hardware::HighTimesOf(divider, limits_.max_count);
      const Rational below = (*asked.duty * 2 * divider / 100).Floor();
      const int first = static_cast<int>(*below.Whole());
      std::optional<Rational> least;
      for (const int one : {first, first + 1}) {
        const int high = std::clamp(one, times.shortest, times.longest);
        const Rational error = (verify::DutyOf(high, choice->set.divider) - *asked.duty).Absolute();
        if (least && *least < error) continue;
        least = error;
        choice->set.high_time = high;
      }
      made = verify::DutyOf(choice->set.high_time, choice->set.divider);
    }
    const Rational allowed = asked.duty_tolerance.value_or(request_.duty_tolerance);
    choice->points = (made - *asked.duty).Absolute();
    choice->is_met = choice->is_met && choice->points <= allowed;
    choice->error = std::max(choice->error, PointsInUnits(choice->points, allowed));
  }

  bool IsBetter(const Choice& a, const Choice& b) const {
    if (a.is_met != b.is_met) return a.is_met;
    if (a.is_met && request_.rank == Rank::kMargin && !(a.margin == b.margin)) {
      return b.margin < a.margin;
    }
    if (!(a.error == b.error)) return a.error < b.error;
    if (!(a.ppm == b.ppm)) return a.ppm < b.ppm;
    if (!(a.degrees == b.degrees)) return a.degrees < b.degrees;
    if (!(a.points == b.points)) return a.points < b.points;
    return a.set.divider < b.set.divider;
  }

  const Request& request_;
  const LoopLimits& limits_;
  const Primitive primitive_;
  BestSettings& best_;
  const answer::LoopJitter model_;
  const std::vector<Rational> corners_;  // what the inputs can be
  const bool fractions_;
  const int largest_;
  std::map<std::pair<std::size_t, Kind>, std::map<Rational, std::optional<Choice>>> known_;
};

}  // namespace

void TryLoops(const Request& request, const Device& device, Primitive primitive,
              BestSettings* best) {
  Loops(request, device, primitive, best).TryAll();
}

}  // namespace planner::verify
