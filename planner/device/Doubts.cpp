// Limits that cannot be meant, or over which the engine searches long.
//
// Tested by check_test.cpp.
#include <algorithm>
#include <string>

#include "hardware/Kru.h"
#include "hardware/Loop.h"
#include "planner/device/Check.h"

namespace planner::device {
namespace {

using hardware::Rational;

// Two limits of which the first is to be the lower one.
struct Pair {
  std::string_view low;
  std::string_view high;
  DoubtKind kind;
  RangeOf range;
  std::optional<Primitive> lost;  // what can do nothing when they are the wrong way round
};

constexpr Pair kPairs[] = {
    {"VCOCLK_FREQ_MIN", "VCOCLK_FREQ_MAX", DoubtKind::kNothingBetween, RangeOf::kVco,
     Primitive::kPll},
    {"CLKPFD_FREQ_MIN", "CLKPFD_FREQ_MAX", DoubtKind::kNothingBetween, RangeOf::kPfd,
     Primitive::kPll},
    {"CLKOUT_FREQ_MIN_GCLK", "CLKOUT_FREQ_MAX_GCLK", DoubtKind::kNothingBetween, RangeOf::kOutput,
     Primitive::kPll},
    {"CLKOUT_FREQ_MIN_GCLK", "CLKOUT_FREQ_MAX_IOCLK", DoubtKind::kNothingBetween, RangeOf::kOutput1,
     std::nullopt},
    {"TSYN_VCOCLK_FREQ_MIN", "TSYN_VCOCLK_FREQ_MAX", DoubtKind::kNothingBetween, RangeOf::kVco,
     Primitive::kTsyn},
    {"TSYN_VCOCLK_FREQ_MIN", "TSYN_VCOCLK_FREQ_TARGET", DoubtKind::kTargetOutside, RangeOf::kNone,
     std::nullopt},
    {"TSYN_VCOCLK_FREQ_TARGET", "TSYN_VCOCLK_FREQ_MAX", DoubtKind::kTargetOutside, RangeOf::kNone,
     std::nullopt},
    {"TSYN_CLKOUT_FREQ_MIN", "TSYN_CLKOUT_FREQ_MAX", DoubtKind::kNothingBetween, RangeOf::kOutput,
     Primitive::kTsyn},
    {"TSYN_CLKPFD_FREQ_MIN", "TSYN_CLKPFD_FREQ_MAX", DoubtKind::kNothingBetween, RangeOf::kPfd,
     Primitive::kTsyn},
    {"TSYN_CLKPFD_FREQ_MIN", "TSYN_CLKPFD_FREQ_MAX_LBW", DoubtKind::kNothingBetween,
     RangeOf::kPfdLow, std::nullopt},
    {"TSYN_CLKPFD_FREQ_MAX_LBW", "TSYN_CLKPFD_FREQ_MAX", DoubtKind::kLowUnused, RangeOf::kNone,
     std::nullopt},
};

// The limits of a loop that say what its settings can reach.
struct LoopKeywords {
  Primitive primitive;
  std::string_view vco_min;
  std::string_view vco_max;
  std::string_view pfd_min;
  std::string_view pfd_max;
  std::string_view output_min;
  std::string_view output_max;
  std::string_view output_1_max;  // empty: output 1 is as the others
};

constexpr LoopKeywords kLoops[] = {
    {Primitive::kPll, "VCOCLK_FREQ_MIN", "VCOCLK_FREQ_MAX", "CLKPFD_FREQ_MIN", "CLKPFD_FREQ_MAX",
     "CLKOUT_FREQ_MIN_GCLK", "CLKOUT_FREQ_MAX_GCLK", "CLKOUT_FREQ_MAX_IOCLK"},
    {Primitive::kTsyn, "TSYN_VCOCLK_FREQ_MIN", "TSYN_VCOCLK_FREQ_MAX", "TSYN_CLKPFD_FREQ_MIN",
     "TSYN_CLKPFD_FREQ_MAX", "TSYN_CLKOUT_FREQ_MIN", "TSYN_CLKOUT_FREQ_MAX", ""},
};

constexpr std::string_view kCount = "O_MAX_HT_LT";

// A PFD or an output can well have a highest frequency above that of the VCO: what limits it is
// something else. From so many times that on it cannot be meant.
constexpr int kFarAbove = 10;

// Between these, in MHz, no call of the engine takes longer than 10 ms (tests/cost/cost_test.cpp).
//
// A slow VCO has a slow output 0. Shifts of that, which are up to 11 MHz, then bring it to many of
// its dividers, of which a TSYN has a thousand; a PLL has too few for it to matter. And on a fast
// VCO the shifts are so small that all of them leave the same M and D: where what they make is
// refused for its phases, it is refused for each of 22000.
constexpr int kSlowTsynVco = 10;
constexpr int kFastVco = 10'000;

// Works out what is doubtful about one grade.
class Finder {
 public:
  explicit Finder(const GradeDescription& grade) : grade_(grade) {}

  std::vector<Doubt> Find() {
    for (const Pair& pair : kPairs) ComparePair(pair);
    ComparePeriods();
    for (const LoopKeywords& loop : kLoops) CompareReach(loop);
    CheckCount();
    return std::move(doubts_);
  }

 private:
  // The primitives of the grade that need a keyword.
  std::vector<Primitive> UsersOf(std::string_view keyword) const {
    std::vector<Primitive> users;
    for (const Keyword& one : Keywords()) {
      if (one.name != keyword) continue;
      for (const Primitive primitive : grade_.primitives) {
        if (one.IsOf(primitive)) users.push_back(primitive);
      }
    }
    return users;
  }

  Doubt& Add(DoubtKind kind, RangeOf range, const Limit& limit, const Limit* other) {
    Doubt doubt;
    doubt.kind = kind;
    doubt.range = range;
    doubt.grades = {grade_.name};
    doubt.keyword = limit.keyword;
    doubt.value = limit.value;
    doubt.text = limit.text;
    if (other != nullptr) {
      doubt.other = other->keyword;
      doubt.other_value = other->value;
      doubt.other_text = other->text;
    }
    doubt.lines = {limit.line};
    doubt.touched = UsersOf(limit.keyword);
    doubts_.push_back(std::move(doubt));
    return doubts_.back();
  }

  void ComparePair(const Pair& pair) {
    const Limit* const low = grade_.Find(pair.low);
    const Limit* const high = grade_.Find(pair.high);
    if (low == nullptr || high == nullptr || low->value <= high->value) return;
    // Of the two ends of the VCO, the recommended one is what is looked at.
    const bool target_is_high =
        pair.kind == DoubtKind::kTargetOutside && pair.high == "TSYN_VCOCLK_FREQ_TARGET";
    Doubt& doubt = target_is_high ? Add(pair.kind, pair.range, *high, low)
                                  : Add(pair.kind, pair.range, *low, high);
    if (pair.lost && Has(*pair.lost)) doubt.lost = {*pair.lost};
  }

  // The shortest and the longest period of each pin of a KRU.
  void ComparePeriods() {
    for (const hardware::PinFacts& pin : hardware::kPins) {
      if (pin.name != pin.limits) continue;
      const std::string stem = "D_KRU_" + std::string(pin.name) + "_CLKIN_DIVIDE_BY_2_FALSE_";
      const bool has_feedback = pin.pin != hardware::Pin::kClkfxdv;
      const std::string usual = stem + (has_feedback ? "CLK_FEEDBACK_1X_" : "");
      const Limit* const longest = grade_.Find(usual + "MAXPERIOD");
      const Limit* const shortest = grade_.Find(usual + "MINPERIOD");
      const Limit* const doubled = grade_.Find(stem + "CLK_FEEDBACK_2X_MINPERIOD");
      ComparePeriod(pin, shortest, longest);
      ComparePeriod(pin, doubled, longest);
      if (doubled != nullptr && shortest != nullptr && doubled->value < shortest->value) {
        Add(DoubtKind::kDoubledAbove, RangeOf::kNone, *doubled, shortest).pin = pin.name;
      }
    }
  }

  void ComparePeriod(const hardware::PinFacts& pin, const Limit* shortest, const Limit* longest) {
    if (shortest == nullptr || longest == nullptr || shortest->value <= longest->value) return;
    Doubt& doubt = Add(DoubtKind::kNothingBetween, RangeOf::kPeriod, *shortest, longest);
    doubt.pin = pin.name;
    // A KRU_CLKGEN has its output 0 on CLKFX; a KRU_SP has other pins.
    const bool is_needed = pin.pin == hardware::Pin::kClkfx;
    if (is_needed && Has(Primitive::kKruClkgen)) doubt.lost = {Primitive::kKruClkgen};
  }

  // Limits that no settings come up or down to: the VCO is a multiple of the PFD, and an output is
  // the VCO or a quotient of it. Where a range is empty that is enough said of it.
  void CompareReach(const LoopKeywords& loop) {
    if (!Has(loop.primitive)) return;
    const Limit& vco_min = *grade_.Find(loop.vco_min);
    const Limit& vco_max = *grade_.Find(loop.vco_max);
    if (vco_min.value > vco_max.value) return;
    CheckSearch(loop, vco_min, vco_max);
    CompareVcoAndPfd(loop, vco_min, vco_max);
    CompareVcoAndOutputs(loop, vco_min, vco_max);
  }

  void CheckSearch(const LoopKeywords& loop, const Limit& vco_min, const Limit& vco_max) {
    const Rational slow = loop.primitive == Primitive::kTsyn ? kSlowTsynVco : 0;
    if (vco_min.value < slow) AddLongSearch(vco_min, slow);
    if (vco_max.value > Rational(kFastVco)) AddLongSearch(vco_max, kFastVco);
  }

  void AddLongSearch(const Limit& limit, const Rational& bound) {
    Add(DoubtKind::kLongSearch, RangeOf::kVco, limit, nullptr).bound = bound;
  }

  void CompareVcoAndPfd(const LoopKeywords& loop, const Limit& vco_min, const Limit& vco_max) {
    const Limit& pfd_min = *grade_.Find(loop.pfd_min);
    const Limit& pfd_max = *grade_.Find(loop.pfd_max);
    if (pfd_min.value > pfd_max.value) return;
    const Rational highest = pfd_max.value * hardware::kLargestM;
    if (vco_min.value > highest) {
      AddReach(loop, RangeOf::kVco, vco_min, pfd_max, highest, true);
    } else if (vco_max.value > highest) {
      AddReach(loop, RangeOf::kVco, vco_max, pfd_max, highest, false);
    }
    if (vco_max.value < pfd_min.value) {
      AddReach(loop, RangeOf::kVco, vco_max, pfd_min, pfd_min.value, true);
    } else if (IsFarAbove(pfd_max, vco_max)) {
      AddReach(loop, RangeOf::kPfd, pfd_max, vco_max, vco_max.value, false);
    }
  }

  void CompareVcoAndOutputs(const LoopKeywords& loop, const Limit& vco_min, const Limit& vco_max) {
    const Limit& output_min = *grade_.Find(loop.output_min);
    const Limit& output_max = *grade_.Find(loop.output_max);
    if (output_min.value > output_max.value) return;
    const Rational lowest = vco_min.value / LargestDivider();
    if (output_max.value < lowest) {
      AddReach(loop, RangeOf::kOutput, output_max, vco_min, lowest, true);
    }
    if (output_min.value > vco_max.value) {
      AddReach(loop, RangeOf::kOutput, output_min, vco_max, vco_max.value, true);
    } else if (IsFarAbove(output_max, vco_max)) {
      AddReach(loop, RangeOf::kOutput, output_max, vco_max, vco_max.value, false);
    }
    const Limit* const output_1_max = grade_.Find(loop.output_1_max);
    if (output_1_max != nullptr && IsFarAbove(*output_1_max, vco_max)) {
      AddReach(loop, RangeOf::kOutput1, *output_1_max, vco_max, vco_max.value, false);
    }
  }

  static bool IsFarAbove(const Limit& limit, const Limit& vco_max) {
    return limit.value > vco_max.value * kFarAbove;
  }

  void AddReach(const LoopKeywords& loop, RangeOf range, const Limit& limit, const Limit& other,
                const Rational& bound, bool is_lost) {
    Doubt& doubt = Add(DoubtKind::kNeverReached, range, limit, &other);
    doubt.bound = bound;
    if (is_lost) doubt.lost = {loop.primitive};
  }

  int LargestDivider() const {
    const Limit* const count = grade_.Find(kCount);
    const Rational whole = count->value.Floor();
    if (whole >= Rational(hardware::kLargestDivider)) return hardware::kLargestDivider;
    return hardware::LargestDivider(static_cast<int>(*whole.Whole()));
  }

  void CheckCount() {
    const Limit* const count = grade_.Find(kCount);
    if (count == nullptr) return;
    const int largest = LargestDivider();
    if (largest < hardware::kLargestDivider) {
      Add(DoubtKind::kFewDividers, RangeOf::kNone, *count, nullptr).bound = largest;
    }
    if (!count->value.IsWhole()) Add(DoubtKind::kNotWhole, RangeOf::kNone, *count, nullptr);
  }

  bool Has(Primitive primitive) const {
    return std::find(grade_.primitives.begin(), grade_.primitives.end(), primitive) !=
           grade_.primitives.end();
  }

  const GradeDescription& grade_;
  std::vector<Doubt> doubts_;
};

// Whether two doubts say the same of their grades.
bool IsSame(const Doubt& a, const Doubt& b) {
  return a.kind == b.kind && a.range == b.range && a.keyword == b.keyword && a.value == b.value &&
         a.other == b.other && a.other_value == b.other_value && a.bound == b.bound &&
         a.touched == b.touched && a.lost == b.lost;
}

}  // namespace

std::vector<Doubt> Doubts(const GradeDescription& grade) { return Finder(grade).Find(); }

std::vector<Doubt> Doubts(const Description& description) {
  std::vector<Doubt> all;
  for (const GradeDescription& grade : description.grades) {
    for (Doubt& doubt : Doubts(grade)) {
      const auto same = std::find_if(all.begin(), all.end(),
                                     [&doubt](const Doubt& one) { return IsSame(one, doubt); });
      if (same == all.end()) {
        all.push_back(std::move(doubt));
      } else {
        same->grades.push_back(grade.name);
        same->lines.push_back(doubt.lines.front());
      }
    }
  }
  return all;
}

}  // namespace planner::device
