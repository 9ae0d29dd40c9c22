#include "planner/search/Within.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <cstddef>
#include <numeric>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "drawn.h"
#include "hardware/Kru.h"
#include "hardware/Loop.h"
#include "planner/answer/Demands.h"
#include "planner/answer/Evaluate.h"
#include "planner/answer/Jitter.h"
#include "planner/search/Search.h"

namespace planner::search {
namespace {

using drawn::Random;
using hardware::Pin;
using hardware::PinSource;

// Judges settings in exact arithmetic by what counts of a request and a device.
class Judge {
 public:
  Judge(const Request& request, const Device& device, Primitive primitive, const Relaxed& relaxed)
      : request_(request), device_(device), primitive_(primitive), relaxed_(relaxed) {
    if (hardware::IsLoop(primitive)) {
      loop_jitter_.emplace(device, request);
    } else {
      kru_jitter_.emplace(device, request, primitive);
    }
  }

  bool IsLoopWithin(const LoopSettings& settings) const {
    const LoopLimits& limits = device_.Loop(primitive_);
    const bool fractions =
        relaxed_.whole ||
        hardware::HasFractions(primitive_, static_cast<int>(request_.outputs.size()),
                               request_.whole_divider_0);
    if (!IsM(settings.m, fractions)) return false;
    if (settings.d < 1 || settings.d > (relaxed_.d ? kRelaxedD : hardware::kLargestD)) return false;
    if (request_.bandwidth && !relaxed_.bandwidth && settings.bandwidth != *request_.bandwidth) {
      return false;
    }
    for (const Rational& input : Inputs()) {
      if (!relaxed_.vco &&
          !limits.vco.Contains(input * hardware::VcoRatio(settings.m, settings.d))) {
        return false;
      }
      if (!relaxed_.pfd && !limits.PfdOf(settings.bandwidth).Contains(input / settings.d)) {
        return false;
      }
    }
    bool has_fraction = settings.m % 8 != 0;
    for (const LoopOutput& output : settings.outputs) {
      has_fraction = has_fraction || output.divider % 8 != 0;
    }
    const double jitter = loop_jitter_->PeakToPeak(settings.m, settings.d, settings.bandwidth);
    for (std::size_t i = 0; i < request_.outputs.size(); ++i) {
      if (!request_.outputs[i].used) continue;
      const LoopOutput& set = settings.outputs[i];
      if (!IsDivider(set.divider, static_cast<int>(i), fractions, limits.max_count)) return false;
      if (has_fraction && !relaxed_.nothing_moves && (set.phase != 0 || set.high_time != 0)) {
        return false;
      }
      const Rational duty =
          set.high_time == 0 ? Rational(50) : Rational(400 * set.high_time, set.divider);
      if (!IsOutputWithin(i, hardware::OutputRatio(settings.m, settings.d, set.divider),
                          Rational(360 * set.phase, set.divider), duty, jitter,
                          limits.OutputOf(static_cast<int>(i)))) {
        return false;
      }
    }
    return true;
  }

  bool IsKruWithin(const KruSettings& settings) const {
    const bool is_sp = primitive_ == Primitive::kKruSp;
    const int largest = hardware::LargestKruRatioPart(primitive_);
    if (request_.feedback && is_sp && !relaxed_.feedback && !settings.feedback) return false;
    for (std::size_t i = 0; i < request_.outputs.size(); ++i) {
      if (!request_.outputs[i].used) continue;
      const Pin pin = settings.pins[i];
      const hardware::PinFacts& facts = hardware::FactsOf(pin);
      if (!(is_sp ? facts.is_sp : facts.is_clkgen)) return false;
      if (facts.needs_feedback && !settings.feedback) return false;
      if (!is_sp && i == 0 && pin != Pin::kClkfx) return false;
      if (facts.source == PinSource::kSynthesiser ||
          facts.source == PinSource::kDividedSynthesiser) {
        if (settings.m < (relaxed_.m ? 1 : 2) || settings.m > (relaxed_.m ? kRelaxedM : largest) ||
            settings.d < 1 || settings.d > (relaxed_.d ? kRelaxedD : largest)) {
          return false;
        }
      }
      if (facts.source == PinSource::kDivider ||
          facts.source == PinSource::kDividedSynthesiser) {
        if (!IsDivide(settings.divide_halves)) return false;
      }
      const bool doubled = is_sp && settings.pins[0] == Pin::kClk2x;
      if (!IsOutputWithin(i, PinRatio(pin, settings.Ratios()),
                          hardware::PinPhase(pin, settings.phase_shift),
                          hardware::PinDuty(pin, settings.divide_halves),
                          kru_jitter_->PeakToPeak(settings, pin),
                          device_.Pins(primitive_).Of(pin, doubled))) {
        return false;
      }
    }
    return true;
  }

 private:
  std::vector<Rational> Inputs() const {
    if (relaxed_.second_input) return {request_.inputs[0]};
    return request_.inputs;
  }

  bool IsM(int m, bool fractions) const {
    if (m % 8 != 0 && !fractions) return false;
    if (relaxed_.m) return m >= 8 && m <= kRelaxedM * 8;
    const int smallest = primitive_ == Primitive::kTsyn ? 40 : 8;
    return m == 8 || (m >= smallest && m <= 512);
  }

  bool IsDivider(int divider, int output, bool fractions, int count) const {
    const int largest = relaxed_.dividers ? kRelaxedDivider : hardware::LargestDivider(count);
    if (divider < 8 || divider > 8 * largest) return false;
    if (divider % 8 != 0 && !(fractions && (output == 0 || relaxed_.whole))) return false;
    return relaxed_.dividers || divider == 8 || divider >= 16;
  }

  bool IsDivide(int halves) const {
    if (relaxed_.dividers) {
      return halves >= 2 && halves <= 2 * kRelaxedDivider &&
             (primitive_ == Primitive::kKruSp || halves % 2 == 0);
    }
    const auto has = [&](const auto& list) {
      return std::find(list.begin(), list.end(), halves) != list.end();
    };
    return primitive_ == Primitive::kKruSp ? has(hardware::kClkdvHalves)
                                           : has(hardware::kClkfxdvHalves);
  }

  bool IsOutputWithin(std::size_t index, const Rational& ratio, const Rational& phase,
                      const Rational& duty, double jitter, const Range& range) const {
    const Output& asked = request_.outputs[index];
    const Relaxed::OfOutput& own = relaxed_.outputs[index];
    for (const Rational& input : Inputs()) {
      if (!own.range && !range.Contains(input * ratio)) return false;
    }
    const answer::Errors errors =
        answer::ErrorsOf(asked, request_.inputs[0] * ratio, phase, duty);
    if (!own.frequency && errors.ppm.Absolute() > request_.ToleranceOf(asked)) return false;
    if (!own.phase && errors.phase &&
        errors.phase->Absolute() > request_.PhaseToleranceOf(asked)) {
      return false;
    }
    if (!own.duty && errors.duty && errors.duty->Absolute() > request_.DutyToleranceOf(asked)) {
      return false;
    }
    return own.jitter || answer::IsJitterMet(request_, asked, jitter);
  }

  const Request& request_;
  const Device& device_;
  Primitive primitive_;
  const Relaxed& relaxed_;
  std::optional<answer::LoopJitter> loop_jitter_;
  std::optional<answer::KruJitter> kru_jitter_;
};

// A switch of Relaxed, to go through them.
using Switch = bool& (*)(Relaxed&);
constexpr std::array<Switch, 10> kSwitches = {
    [](Relaxed& r) -> bool& { return r.vco; },
    [](Relaxed& r) -> bool& { return r.pfd; },
    [](Relaxed& r) -> bool& { return r.bandwidth; },
    [](Relaxed& r) -> bool& { return r.second_input; },
    [](Relaxed& r) -> bool& { return r.whole; },
    [](Relaxed& r) -> bool& { return r.nothing_moves; },
    [](Relaxed& r) -> bool& { return r.m; },
    [](Relaxed& r) -> bool& { return r.d; },
    [](Relaxed& r) -> bool& { return r.dividers; },
    [](Relaxed& r) -> bool& { return r.feedback; },
};

Relaxed DrawRelaxed(Random& random, std::size_t outputs, bool hardware) {
  Relaxed relaxed;
  if (hardware) {
    for (const Switch& one : kSwitches) one(relaxed) = random.OneIn(4);
  }
  for (std::size_t i = 0; i < outputs; ++i) {
    Relaxed::OfOutput& own = relaxed.outputs[i];
    own.frequency = random.OneIn(4);
    own.phase = random.OneIn(3);
    own.duty = random.OneIn(3);
    own.jitter = random.OneIn(3);
    own.range = hardware && random.OneIn(4);
  }
  return relaxed;
}

std::string TextOf(const Relaxed& relaxed) {
  Relaxed copy = relaxed;
  std::string text = "relaxed ";
  for (const Switch& one : kSwitches) text += one(copy) ? '1' : '0';
  for (const Relaxed::OfOutput& own : relaxed.outputs) {
    text += " ";
    for (const bool one : {own.frequency, own.phase, own.duty, own.jitter, own.range}) {
      text += one ? '1' : '0';
    }
  }
  return text;
}

// A request to a small device, with something that does not count.
struct Drawn {
  Device device;
  Request request;
  Relaxed relaxed;
};

Drawn Draw(Random& random, Primitive primitive, int most_outputs, bool beyond_hardware) {
  const Rational input = drawn::Input(random);
  Drawn one;
  one.device = drawn::SmallDevice(random, primitive, input);
  one.request = drawn::RequestFor(random, one.device, primitive, input, most_outputs);
  one.relaxed = DrawRelaxed(random, one.request.outputs.size(), beyond_hardware);
  return one;
}

std::string TextOf(int number, Primitive primitive, const Request& request,
                   const Relaxed& relaxed) {
  return std::to_string(number) + " " + std::string(Name(primitive)) + " " +
         drawn::TextOf(request) + "\n" + TextOf(relaxed);
}

// What is found is as asked for.
bool IsWithin(const Request& request, const Device& device, Primitive primitive,
              const Relaxed& relaxed, const Settings& settings) {
  const Judge judge(request, device, primitive, relaxed);
  if (const auto* const loop = std::get_if<LoopSettings>(&settings)) {
    return judge.IsLoopWithin(*loop);
  }
  return judge.IsKruWithin(std::get<KruSettings>(settings));
}

constexpr std::array<int, 4> kRequests = {400, 400, 200, 200};

// With the hardware as it is and demands switched off, the search says the same of the request
// without these demands.
void CompareWithSearch(Primitive primitive) {
  Random random(static_cast<std::uint64_t>(primitive) + 100);
  int yes = 0;
  int no = 0;
  const int requests = kRequests[static_cast<std::size_t>(primitive)];
  for (int i = 0; i < requests && !testing::Test::HasFailure(); ++i) {
    const auto [device, request, relaxed] = Draw(random, primitive, 4, false);
    SCOPED_TRACE(TextOf(i, primitive, request, relaxed));
    Request without = request;
    for (std::size_t k = 0; k < request.outputs.size(); ++k) {
      Output& output = without.outputs[k];
      const Relaxed::OfOutput& own = relaxed.outputs[k];
      if (own.frequency) output.tolerance = Rational(1000000) * 1000000;
      if (own.phase) output.phase.reset();
      if (own.duty) output.duty.reset();
      if (own.jitter) output.max_jitter.reset();
      // That of the request goes for outputs without one of their own.
      if (own.jitter && request.max_jitter) output.max_jitter = Rational(1000000) * 1000000;
    }
    const Found found = Search(without, device, primitive);
    bool expected = false;
    for (const Candidate& candidate : found.best) expected = expected || candidate.within;
    // Without coefficients even the highest jitter is not known to be met.
    const bool is_unknown = std::any_of(found.best.begin(), found.best.end(), [](const auto& one) {
      return !one.max_jitter;
    });
    if (is_unknown && request.max_jitter) continue;
    const Within within(request, device, primitive);
    const std::optional<Settings> settings = within.Find(relaxed);
    EXPECT_EQ(settings.has_value(), expected);
    EXPECT_EQ(within.Exists(relaxed), expected);
    if (settings) {
      EXPECT_TRUE(IsWithin(request, device, primitive, relaxed, *settings));
    }
    ++(expected ? yes : no);
  }
  EXPECT_GT(yes, requests / 20);
  EXPECT_GT(no, requests / 20);
}

TEST(Within, AgreesWithTheSearchOnPlls) { CompareWithSearch(Primitive::kPll); }
TEST(Within, AgreesWithTheSearchOnTsyns) { CompareWithSearch(Primitive::kTsyn); }
TEST(Within, AgreesWithTheSearchOnKruSps) { CompareWithSearch(Primitive::kKruSp); }
TEST(Within, AgreesWithTheSearchOnKruClkgens) { CompareWithSearch(Primitive::kKruClkgen); }

// --- Without limits of the hardware ------------------------------------------------------------

// Whether some divider serves an output, tried one by one.
bool SomeDivider(const Judge& judge, LoopSettings* settings, std::size_t output, bool moves,
                 const Request& request, int count) {
  // Only this output is used, so that only it is judged.
  const Output& asked = request.outputs[output];
  for (int divider = 8; divider <= kRelaxedDivider * 8; ++divider) {
    LoopOutput& set = settings->outputs[output];
    set = {.divider = divider};
    if (moves) {
      if (asked.phase) set.phase = hardware::NearestPhaseStep(*asked.phase, divider);
      if (asked.duty) {
        const hardware::HighTimes times = hardware::HighTimesOf(divider / 8, count);
        const Rational nearest = (*asked.duty * divider / 400).Round();
        set.high_time = static_cast<int>(
            *std::min(std::max(nearest, Rational(times.shortest)), Rational(times.longest))
                 .Whole());
      }
    }
    if (judge.IsLoopWithin(*settings)) return true;
  }
  return false;
}

// All M, D and dividers of a PLL or TSYN, tried one by one.
bool SomeLoop(const Request& request, const Device& device, Primitive primitive,
              const Relaxed& relaxed, int largest_m, int largest_d) {
  const int count = relaxed.dividers ? kRelaxedDivider : device.Loop(primitive).max_count;
  for (const hardware::Bandwidth bandwidth : hardware::kBandwidths) {
    for (int d = 1; d <= largest_d; ++d) {
      for (int m = 8; m <= largest_m * 8; ++m) {
        // A cheap look first: without any output.
        Request none = request;
        for (Output& output : none.outputs) output.used = false;
        LoopSettings settings{primitive, bandwidth, m, d, {}};
        settings.outputs.resize(request.outputs.size());
        if (!Judge(none, device, primitive, relaxed).IsLoopWithin(settings)) continue;
        for (const bool moves : {false, true}) {
          bool all = true;
          bool has_fraction = m % 8 != 0;
          for (std::size_t i = 0; i < request.outputs.size() && all; ++i) {
            if (!request.outputs[i].used) continue;
            Request one = none;
            one.outputs[i].used = true;
            const Judge judge(one, device, primitive, relaxed);
            all = SomeDivider(judge, &settings, i, moves, request, count);
            has_fraction = has_fraction || settings.outputs[i].divider % 8 != 0;
          }
          // Phases beside a fraction of another output.
          if (all && moves && has_fraction && !relaxed.nothing_moves) {
            all = Judge(request, device, primitive, relaxed).IsLoopWithin(settings);
          }
          if (all) return true;
        }
      }
    }
  }
  return false;
}

// On one output, with limits of the hardware switched off: what is found is as asked for, and where
// nothing is found, trying all M and D up to some number finds nothing, either.
void CompareRelaxedLoops(Primitive primitive) {
  Random random(static_cast<std::uint64_t>(primitive) + 200);
  int yes = 0;
  int no = 0;
  for (int i = 0; i < 300 && !testing::Test::HasFailure(); ++i) {
    const auto [device, request, relaxed] = Draw(random, primitive, 3, true);
    SCOPED_TRACE(TextOf(i, primitive, request, relaxed));
    const std::optional<Settings> settings = Within(request, device, primitive).Find(relaxed);
    if (settings) {
      EXPECT_TRUE(IsWithin(request, device, primitive, relaxed, *settings));
      ++yes;
    } else if (no < 12 && request.outputs.size() == 1) {
      EXPECT_FALSE(SomeLoop(request, device, primitive, relaxed, 12, 3));
      ++no;
    }
  }
  EXPECT_GT(yes, 30);
  EXPECT_GT(no, 5);
}

// One thing of a request or a device is another: a demand, a tolerance for all, an input, a limit.
void ChangeOne(Random& random, Request* request, Device* device, Primitive primitive) {
  LoopLimits& limits = primitive == Primitive::kPll ? *device->pll : *device->tsyn;
  Output& output = request->outputs[static_cast<std::size_t>(
      random.Int(0, static_cast<int>(request->outputs.size()) - 1))];
  const Rational some(random.Int(1, 400), 10);
  switch (random.Int(0, 11)) {
    case 0: output.frequency = some; break;
    case 1: output.phase = some; break;
    case 2: output.duty = some; break;
    case 3: output.tolerance = some * 100; break;
    case 4: output.phase_tolerance = some; break;
    case 5: output.duty_tolerance = some; break;
    case 6: output.max_jitter = some * 20; break;
    case 7: request->tolerance = some * 100; break;
    case 8: request->phase_tolerance = request->duty_tolerance = some; break;
    case 9: request->inputs[0] = some; break;
    case 10: limits.output.highest = limits.output.lowest + some; break;
    default: limits.max_count = random.Int(2, 64); break;
  }
}

// Where a question is prepared with the help of another one, its answers are what they are without.
void CompareWithHelp(Primitive primitive) {
  Random random(static_cast<std::uint64_t>(primitive) + 300);
  int yes = 0;
  int no = 0;
  for (int i = 0; i < 300 && !testing::Test::HasFailure(); ++i) {
    const auto [device, request, relaxed] = Draw(random, primitive, 4, i % 2 == 0);
    SCOPED_TRACE(TextOf(i, primitive, request, relaxed));
    const Within first(request, device, primitive);
    for (int turn = 0; turn < 2; ++turn) (void)first.Find(relaxed);
    for (int change = 0; change < 4; ++change) {
      Request changed = request;
      Device other = device;
      ChangeOne(random, &changed, &other, primitive);
      const std::optional<Settings> alone = Within(changed, other, primitive).Find(relaxed);
      const Within helped(changed, other, primitive, &first);
      for (int turn = 0; turn < 3; ++turn) EXPECT_EQ(helped.Find(relaxed), alone);
      ++(alone ? yes : no);
    }
  }
  EXPECT_GT(yes, 100);
  EXPECT_GT(no, 100);
}

TEST(Within, AnswersTheSameWithTheHelpOfAnotherPll) { CompareWithHelp(Primitive::kPll); }
TEST(Within, AnswersTheSameWithTheHelpOfAnotherTsyn) { CompareWithHelp(Primitive::kTsyn); }

TEST(Within, FindsWhatIsBeyondTheHardwareOfAPll) { CompareRelaxedLoops(Primitive::kPll); }
TEST(Within, FindsWhatIsBeyondTheHardwareOfATsyn) { CompareRelaxedLoops(Primitive::kTsyn); }

// All settings of a KRU for its one output, with M, D and divides up to some numbers. What a pin does
// not use is not gone through.
bool SomeKru(const Request& request, const Device& device, Primitive primitive,
             const Relaxed& relaxed, int largest_ratio, int largest_halves) {
  const Judge judge(request, device, primitive, relaxed);
  const bool is_sp = primitive == Primitive::kKruSp;
  for (const hardware::PinFacts& facts : hardware::kPins) {
    const bool is_made = facts.source == PinSource::kSynthesiser ||
                         facts.source == PinSource::kDividedSynthesiser;
    const bool is_divided = facts.source == PinSource::kDivider ||
                            facts.source == PinSource::kDividedSynthesiser;
    KruSettings settings{.primitive = primitive, .pins = {facts.pin}};
    for (const bool feedback : {false, true}) {
      for (const bool divide_by_2 : {false, true}) {
        if (!is_sp && (feedback || divide_by_2)) continue;
        settings.feedback = feedback;
        settings.divide_by_2 = divide_by_2;
        for (settings.d = 1; settings.d <= (is_made ? largest_ratio : 1); ++settings.d) {
          for (settings.m = 1; settings.m <= (is_made ? largest_ratio : 1); ++settings.m) {
            for (settings.divide_halves = 2;
                 settings.divide_halves <= (is_divided ? largest_halves : 2);
                 ++settings.divide_halves) {
              for (settings.phase_shift = 0; settings.phase_shift <= (is_sp ? 255 : 0);
                   ++settings.phase_shift) {
                if (judge.IsKruWithin(settings)) return true;
              }
            }
          }
        }
      }
    }
  }
  return false;
}

void CompareRelaxedKrus(Primitive primitive) {
  Random random(static_cast<std::uint64_t>(primitive) + 300);
  int yes = 0;
  int no = 0;
  for (int i = 0; i < 300 && !testing::Test::HasFailure(); ++i) {
    const auto [device, request, relaxed] = Draw(random, primitive, 3, true);
    SCOPED_TRACE(TextOf(i, primitive, request, relaxed));
    const std::optional<Settings> settings = Within(request, device, primitive).Find(relaxed);
    if (settings) {
      EXPECT_TRUE(IsWithin(request, device, primitive, relaxed, *settings));
      ++yes;
    } else if (no < 6 && request.outputs.size() == 1) {
      EXPECT_FALSE(SomeKru(request, device, primitive, relaxed, 5, 9));
      ++no;
    }
  }
  EXPECT_GT(yes, 30);
  EXPECT_GT(no, 3);
}

// A KRU has one input.
TEST(Within, FindsNothingOfAPrimitiveThatCannotBeAsked) {
  const Device device = drawn::Bundled("vk40", "2");
  Request request;
  request.inputs = {100, 101};
  request.outputs.resize(1);
  request.outputs[0].frequency = 200;
  request.tolerance = 20'000;
  EXPECT_TRUE(Within(request, device, Primitive::kPll).Find());
  EXPECT_FALSE(Within(request, device, Primitive::kKruSp).Find());
  EXPECT_FALSE(Within(request, drawn::Bundled("vk20", "2"), Primitive::kPll).Find());
}

TEST(Within, FindsWhatIsBeyondTheHardwareOfAKruSp) { CompareRelaxedKrus(Primitive::kKruSp); }
TEST(Within, FindsWhatIsBeyondTheHardwareOfAKruClkgen) {
  CompareRelaxedKrus(Primitive::kKruClkgen);
}

}  // namespace
}  // namespace planner::search
