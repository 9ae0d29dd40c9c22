// Tested by within_test.cpp.
#include "planner/search/KruWithin.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <cstddef>
#include <cstdint>
#include <numeric>
#include <utility>
#include <vector>

#include "host/bundled/calculator/Slack.h"
#include "planner/search/Denominators.h"
#include "planner/search/VcoSpans.h"

namespace planner::search {

namespace {

// Outputs, by their places among the used ones.
using Outputs = std::uint32_t;
constexpr Outputs Of(std::size_t place) { return Outputs{1} << place; }

// Something that is set, and the outputs that it can then serve.
struct Served {
  KruBase base;
  Outputs outputs = 0;
};

// Adds what serves outputs that no other one serves all of.
void AddServed(const Served& one, std::vector<Served>* all) {
  for (const Served& other : *all) {
    if ((one.outputs & ~other.outputs) == 0) return;
  }
  all->push_back(one);
}

}  // namespace

KruWithin::KruWithin(const Request& request, const Device& device, Primitive primitive)
    : request_(request), task_(request_, device, primitive) {}

// A question, and how far its answer is.
class KruWithin::Question {
 public:
  Question(const KruTask& task, const Relaxed& relaxed) : task_(task), relaxed_(relaxed) {
    const int largest = hardware::LargestKruRatioPart(task.Which());
    first_m_ = relaxed.m ? 1 : hardware::kSmallestKruM;
    last_m_ = relaxed.m ? kRelaxedM : largest;
    last_d_ = relaxed.d ? kRelaxedD : largest;
    for (std::size_t i = 0; i < task.Outputs().size(); ++i) {
      all_ |= Of(i);
      asks_for_jitter_ = asks_for_jitter_ || AsksForJitter(i);
      asks_for_phase_ = asks_for_phase_ || PhasesOf(i) != nullptr;
    }
    if (relaxed.dividers) {
      // Any half of CLKDV, any whole number of CLKFXDV.
      const int step = task.IsSp() ? 1 : 2;
      for (int halves = 2; halves <= 2 * kRelaxedDivider; halves += step) {
        divides_.push_back(halves);
      }
    } else if (task.IsSp()) {
      divides_.assign(hardware::kClkdvHalves.begin(), hardware::kClkdvHalves.end());
    } else {
      divides_.assign(hardware::kClkfxdvHalves.begin(), hardware::kClkfxdvHalves.end());
    }
  }

  std::optional<Settings> Answer() {
    if (!task_.IsSp()) return AnswerClkgen();
    const bool must_feed_back = task_.Asked().feedback && !relaxed_.feedback;
    // With feedback there are more pins. Without it there is less jitter.
    for (const bool feedback : {true, false}) {
      if (!feedback && (must_feed_back || !asks_for_jitter_)) continue;
      for (const bool divide_by_2 : {false, true}) {
        for (const bool doubled : {false, true}) {
          if (doubled && (!feedback || task_.Outputs().front().Index() != 0)) continue;
          doubled_ = doubled;
          const KruBase line = {.feedback = feedback, .divide_by_2 = divide_by_2};
          if (auto found = AnswerSp(line)) return found;
        }
      }
    }
    return std::nullopt;
  }

 private:
  const Relaxed::OfOutput& OwnOf(std::size_t place) const {
    return relaxed_.outputs[static_cast<std::size_t>(task_.Outputs()[place].Index())];
  }
  bool AsksForJitter(std::size_t place) const {
    return !OwnOf(place).jitter && task_.Outputs()[place].Jitter().IsAsked();
  }
  // Null where the phase does not count.
  const PhaseTable* PhasesOf(std::size_t place) const {
    return OwnOf(place).phase ? nullptr : task_.Outputs()[place].Phases();
  }

  // --- What a pin does for an output ----------------------------------------------------------

  // Whether an output can be on a pin, but for its phase.
  bool Serves(const KruPin& pin, std::size_t place, const KruBase& base) const {
    const KruOutput& output = task_.Outputs()[place];
    const Relaxed::OfOutput& own = OwnOf(place);
    if (!IsConnected(pin, output, base)) return false;
    const PinSource source = pin.facts->source;
    const KruRatio ratio = RatioOf(source, base);
    if (!own.frequency && !output.Frequency().IsMet(ratio.a, ratio.b)) return false;
    if (!own.range && !(doubled_ ? pin.doubled : pin.usual)->Contains(ratio.a, ratio.b)) {
      return false;
    }
    if (!own.duty && output.AsksForDuty() && !output.IsDutyMet(source, base.divide_halves)) {
      return false;
    }
    return !AsksForJitter(place) ||
           output.Jitter().IsMet(task_.JitterOf(base, pin.facts->pin, shifted_));
  }

  bool IsConnected(const KruPin& pin, const KruOutput& output, const KruBase& base) const {
    return search::IsConnected(pin, task_.IsSp(), output.Index(), base.feedback, doubled_);
  }

  // The PHASE_SHIFTs with which it then meets its phase.
  Shifts ShiftsOf(const KruPin& pin, std::size_t place) const {
    const PhaseTable* const phases = PhasesOf(place);
    if (phases != nullptr) return phases->Met(static_cast<std::size_t>(pin.quarter));
    Shifts all;
    return all.set();
  }

  template <typename Take>
  void ForEachPin(bool synthesised, bool divided, const Take& take) const {
    for (const KruPin& pin : task_.Pins()) {
      if (UsesM(pin) == synthesised && UsesDivide(pin) == divided) take(pin);
    }
  }

  // The outputs that pins of a kind serve.
  Outputs ServedBy(bool synthesised, bool divided, const KruBase& base) const {
    Outputs outputs = 0;
    ForEachPin(synthesised, divided, [&](const KruPin& pin) {
      for (std::size_t i = 0; i < task_.Outputs().size(); ++i) {
        if ((outputs & Of(i)) == 0 && Serves(pin, i, base)) outputs |= Of(i);
      }
    });
    return outputs;
  }

  // --- Spans of M / D ---------------------------------------------------------------------------

  // The ratios of M to D with which a pin serves an output, but for the jitter; they are rounded
  // outwards. Empty when it cannot.
  std::optional<Span> SpanOf(const KruPin& pin, std::size_t place, const KruBase& base) const {
    std::optional<Span> span = SpanWithoutJitter(pin, place, base);
    if (!span) return std::nullopt;
    if (AsksForJitter(place)) LeaveKnown(base.divide_by_2 ? 2 : 1, &*span);
    return Outwards(*span);
  }

  // Those with any jitter, not yet rounded.
  std::optional<Span> SpanWithoutJitter(const KruPin& pin, std::size_t place,
                                        const KruBase& base) const {
    const KruOutput& output = task_.Outputs()[place];
    const Relaxed::OfOutput& own = OwnOf(place);
    if (!IsConnected(pin, output, base)) return std::nullopt;
    if (!own.duty && output.AsksForDuty() &&
        !output.IsDutyMet(pin.facts->source, base.divide_halves)) {
      return std::nullopt;
    }
    KruBase unit = base;
    unit.m = 1;
    unit.d = 1;
    const KruRatio ratio = RatioOf(pin.facts->source, unit);
    const double scale = static_cast<double>(ratio.b) / static_cast<double>(ratio.a);
    Span span = {0, HUGE_VAL};
    if (!own.frequency) {
      const FrequencyDemand& frequency = output.Frequency();
      const double exact = scale / frequency.InputPerAsked();
      span.lowest = exact * (1 - frequency.Allowed());
      span.highest = exact * (1 + frequency.Allowed());
    }
    if (!own.range) {
      const RatioRange& range = *(doubled_ ? pin.doubled : pin.usual);
      span.lowest = std::max(span.lowest, scale * range.Lowest());
      span.highest = std::min(span.highest, scale * range.Highest());
    }
    return span;
  }

  // Empty where the ends have passed each other.
  static std::optional<Span> Outwards(const Span& span) {
    const Span wider = {span.lowest * (1 - kWider), span.highest * (1 + kWider)};
    return wider.lowest > wider.highest ? std::nullopt : std::optional(wider);
  }

  // Leaves of a span where the jitter of the synthesiser is known: about where CLKFX is in range.
  void LeaveKnown(double scale, Span* span) const {
    for (const KruPin& pin : task_.Pins()) {
      if (pin.facts->pin != Pin::kClkfx) continue;
      const double lowest = pin.usual->Lowest() * (1 - Calculator::kSolverSlack);
      const double highest = pin.usual->Highest() * (1 + Calculator::kSolverSlack);
      span->lowest = std::max(span->lowest, scale * lowest);
      span->highest = std::min(span->highest, scale * highest);
    }
  }

  // Calls `take` with the M and D whose ratio is in a span, the smallest D and then the smallest M
  // first, until it answers false. Of those with the same ratio the first stands for all: only the
  // jitter tells them apart, and it is no smaller with the others.
  template <typename Take>
  void ForEachRatio(const Span& span, const Take& take) const {
    const Denominators ds(span, last_d_);
    for (int d = ds.First(); d <= last_d_ && span.lowest * d <= last_m_; d = ds.Next(d)) {
      const int first = std::max(first_m_, static_cast<int>(std::ceil(span.lowest * d)));
      const int last = static_cast<int>(std::min<double>(span.highest * d, last_m_));
      for (int m = first; m <= last; ++m) {
        if (!IsFirstOfRatio(m, d)) continue;
        if (!take(m, d)) return;
      }
    }
  }

  bool IsFirstOfRatio(int m, int d) const {
    const int common = std::gcd(m, d);
    if (common == 1 || !task_.Model().RisesWithSettings()) return true;
    const int lowest = m / common;
    return common <= (first_m_ + lowest - 1) / lowest;
  }

  // --- KRU_SP ------------------------------------------------------------------------------------

  // Only the jitter tells a PHASE_SHIFT of 0 from others.
  std::optional<Settings> AnswerSp(const KruBase& line) {
    shifts_.reset();
    shifts_[0] = true;
    shifted_ = false;
    if (!asks_for_phase_) return AnswerSpWithShifts(line);
    if (!asks_for_jitter_) {
      shifts_.set();
      return AnswerSpWithShifts(line);
    }
    if (auto settings = AnswerSpWithShifts(line)) return settings;
    shifts_.flip();
    shifted_ = true;
    return AnswerSpWithShifts(line);
  }

  std::optional<Settings> AnswerSpWithShifts(const KruBase& line) {
    const Outputs on_line = line.feedback ? ServedBy(false, false, line) : 0;
    std::vector<Served> divides = {{line, 0}};
    if (line.feedback) AddDivides(line, &divides);
    for (const Served& ratio : RatiosOf(line)) {
      for (const Served& divide : divides) {
        if ((on_line | ratio.outputs | divide.outputs) != all_) continue;
        KruBase base = line;
        base.m = ratio.base.m;
        base.d = ratio.base.d;
        base.divide_halves = divide.base.divide_halves;
        if (auto settings = WithPins(base)) return settings;
      }
    }
    return std::nullopt;
  }

  // The divides of CLKDV that serve different outputs.
  void AddDivides(const KruBase& line, std::vector<Served>* divides) const {
    // About those with which the frequency of an output is right.
    std::vector<Span> spans;
    for (std::size_t i = 0; i < task_.Outputs().size(); ++i) {
      const FrequencyDemand& frequency = task_.Outputs()[i].Frequency();
      const double exact = (line.divide_by_2 ? 1 : 2) * frequency.InputPerAsked();
      const double least = 1 - frequency.Allowed();
      spans.push_back(OwnOf(i).frequency || least <= 0
                          ? Span{0, HUGE_VAL}
                          : Span{exact / (1 + frequency.Allowed()) * (1 - kWider),
                                 exact / least * (1 + kWider)});
    }
    KruBase base = line;
    for (const int halves : divides_) {
      const bool is_right = std::any_of(spans.begin(), spans.end(), [&](const Span& span) {
        return span.lowest <= halves && halves <= span.highest;
      });
      if (!is_right) continue;
      base.divide_halves = halves;
      AddServed({base, ServedBy(false, true, base)}, divides);
    }
  }

  // The M and D that serve different outputs, and none, which serve none.
  std::vector<Served> RatiosOf(const KruBase& line) const {
    std::vector<Served> ratios = {{line, 0}};
    // Between two neighbours of these ends all ratios serve the same outputs, but for jitter, of
    // which the first has the least.
    std::vector<Span> spans;
    std::vector<double> ends;
    ForEachPin(true, false, [&](const KruPin& pin) {
      if (pin.facts->pin != Pin::kClkfx) return;  // CLKFX180 has the same
      for (std::size_t i = 0; i < task_.Outputs().size(); ++i) {
        const std::optional<Span> span = SpanOf(pin, i, line);
        if (!span) continue;
        spans.push_back(*span);
        ends.push_back(span->lowest);
        ends.push_back(span->highest);
      }
    });
    std::sort(ends.begin(), ends.end());
    ends.erase(std::unique(ends.begin(), ends.end()), ends.end());
    for (std::size_t i = 0; i < ends.size(); ++i) {
      AddRatios(line, {ends[i], ends[i]}, spans, &ratios);
      if (i + 1 < ends.size()) AddRatios(line, {ends[i], ends[i + 1]}, spans, &ratios);
    }
    return ratios;
  }

  void AddRatios(const KruBase& line, const Span& part, const std::vector<Span>& spans,
                 std::vector<Served>* ratios) const {
    const bool is_asked = std::any_of(spans.begin(), spans.end(), [&](const Span& span) {
      return span.lowest <= part.lowest && part.highest <= span.highest;
    });
    if (!is_asked) return;
    // Close to an end some ratios do not serve all of the outputs, so that more than one is tried.
    constexpr int kTries = 4;
    int tries = 0;
    ForEachRatio(part, [&](int m, int d) {
      KruBase base = line;
      base.m = m;
      base.d = d;
      AddServed({base, ServedBy(true, false, base)}, ratios);
      return task_.Model().RisesWithSettings() ? ++tries < kTries : true;
    });
  }

  // --- KRU_CLKGEN --------------------------------------------------------------------------------

  // The ratios of M to D with which an output is on a pin, but for the jitter: on CLKFX or
  // CLKFX180, and on CLKFXDV, of a divide by 1; with another they are as many times as large.
  struct OnPins {
    std::optional<Span> undivided;
    std::optional<Span> divided;
    bool asks_for_jitter = false;
  };

  std::optional<Settings> AnswerClkgen() {
    shifts_[0] = true;
    std::vector<OnPins> outputs(task_.Outputs().size());
    for (std::size_t i = 0; i < outputs.size(); ++i) {
      outputs[i].asks_for_jitter = AsksForJitter(i);
      for (const bool divided : {false, true}) {
        ForEachPin(true, divided, [&](const KruPin& pin) {
          if (!ShiftsOf(pin, i)[0]) return;
          const KruBase line = {.divide_halves = divided ? 2 : 0};
          const std::optional<Span> span = SpanWithoutJitter(pin, i, line);
          if (span) (divided ? outputs[i].divided : outputs[i].undivided) = span;
        });
      }
    }
    // First without CLKFXDV.
    if (auto settings = AnswerClkgenWith({}, outputs)) return settings;
    for (const int halves : divides_) {
      if (auto settings = AnswerClkgenWith({.divide_halves = halves}, outputs)) return settings;
    }
    return std::nullopt;
  }

  // The spans of an output with a divide, at most two.
  void SpansOf(const OnPins& output, int divide_halves, Spans* spans) const {
    const auto add = [&](Span span) {
      if (output.asks_for_jitter) LeaveKnown(1, &span);
      const std::optional<Span> wider = Outwards(span);
      if (wider) spans->push_back(*wider);
    };
    if (output.undivided) add(*output.undivided);
    if (output.divided && divide_halves != 0) {
      const double divide = divide_halves / 2.0;
      add({output.divided->lowest * divide, output.divided->highest * divide});
    }
    if (spans->size() < 2) return;
    Span lower = spans->front();
    Span upper = spans->back();
    if (upper.lowest < lower.lowest) std::swap(lower, upper);
    spans->clear();
    AddSpan(lower.lowest, lower.highest, spans);
    AddSpan(upper.lowest, upper.highest, spans);
  }

  std::optional<Settings> AnswerClkgenWith(const KruBase& line,
                                           const std::vector<OnPins>& outputs) {
    Spans& spans = spans_;
    spans.assign({{0, HUGE_VAL}});
    for (const OnPins& output : outputs) {
      own_.clear();
      left_.clear();
      SpansOf(output, line.divide_halves, &own_);
      Common(spans, own_, &left_);
      if (left_.empty()) return std::nullopt;
      std::swap(spans, left_);
    }
    for (const Span& span : spans) {
      std::optional<Settings> settings;
      ForEachRatio(span, [&](int m, int d) {
        KruBase base = line;
        base.m = m;
        base.d = d;
        settings = WithPins(base);
        return !settings && !IsHopeless(base);
      });
      if (settings) return settings;
    }
    return std::nullopt;
  }

  // Whether a jitter that is asked for is too large already with this M and D: with others that
  // follow it is no smaller.
  bool IsHopeless(const KruBase& base) const {
    if (!asks_for_jitter_ || !task_.Model().RisesWithSettings()) return false;
    for (std::size_t i = 0; i < task_.Outputs().size(); ++i) {
      if (!AsksForJitter(i)) continue;
      const double jitter = task_.JitterOf(base, Pin::kClkfx, false);
      if (jitter != answer::kUnknownJitter && !task_.Outputs()[i].Jitter().IsMet(jitter)) {
        return true;
      }
    }
    return false;
  }

  // --- Pins --------------------------------------------------------------------------------------

  // The first PHASE_SHIFT with which each output has a pin, and the first such pins.
  std::optional<Settings> WithPins(const KruBase& base) const {
    Shifts shifts = shifts_;
    const std::size_t count = task_.Outputs().size();
    std::array<std::vector<const KruPin*>, kMostOutputs> pins;
    for (std::size_t i = 0; i < count && shifts.any(); ++i) {
      Shifts own;
      for (const KruPin& pin : task_.Pins()) {
        if (!IsSet(pin, base) || !Serves(pin, i, base)) continue;
        pins[i].push_back(&pin);
        own |= ShiftsOf(pin, i);
      }
      shifts &= own;
    }
    if (shifts.none()) return std::nullopt;
    int shift = 0;
    while (!shifts[static_cast<std::size_t>(shift)]) ++shift;
    KruSettings settings{.primitive = task_.Which(),
                         .feedback = base.feedback,
                         .divide_by_2 = base.divide_by_2,
                         .phase_shift = shift,
                         .pins = {}};
    settings.pins.resize(task_.Asked().outputs.size(), Pin::kNone);
    for (std::size_t i = 0; i < count; ++i) {
      for (const KruPin* const pin : pins[i]) {
        if (!ShiftsOf(*pin, i)[static_cast<std::size_t>(shift)]) continue;
        settings.pins[static_cast<std::size_t>(task_.Outputs()[i].Index())] = pin->facts->pin;
        if (UsesM(*pin)) {
          settings.m = base.m;
          settings.d = base.d;
        }
        if (UsesDivide(*pin)) settings.divide_halves = base.divide_halves;
        break;
      }
    }
    return settings;
  }

  const KruTask& task_;
  const Relaxed& relaxed_;
  int first_m_;
  int last_m_;
  int last_d_;
  Outputs all_ = 0;
  bool asks_for_jitter_ = false;
  bool asks_for_phase_ = false;
  std::vector<int> divides_;
  bool doubled_ = false;
  Shifts shifts_;         // those that are tried
  bool shifted_ = false;  // they are above 0
  // Kept for their memory.
  Spans spans_;
  Spans own_;
  Spans left_;
};

std::optional<Settings> KruWithin::Find(const Relaxed& relaxed) const {
  return Question(task_, relaxed).Answer();
}

}  // namespace planner::search
