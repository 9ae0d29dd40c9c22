// Tests of the divider of an output, against trying all of them.
#include <gtest/gtest.h>

#include <algorithm>
#include <tuple>

#include "exactly.h"
#include "hardware/Loop.h"
#include "planner/search/LoopDividers.h"
#include "tests/compare/Random.h"

namespace planner::search {
namespace {

using exactly::Holds;
using hardware::kEighths;

struct Case {
  Request request;
  int index = 0;
  LoopLimits limits;
  Kind kind = Kind::kMoving;
  int m = 0;  // in eighths
  int d = 0;
  const Output& Asked() const { return request.outputs[static_cast<std::size_t>(index)]; }
  bool HasMargin() const { return request.rank == Rank::kMargin; }
};

LoopDividers DividersOf(const Case& one) {
  return LoopDividers(one.request, one.index, 0, InputsOf(one.request.inputs), one.limits);
}

// All of a kind, in eighths, the smallest first.
std::vector<int> AllOf(const Case& one) {
  std::vector<int> all;
  const bool has_eighths = one.index == 0 && one.kind != Kind::kMoving;
  for (int divider = 1; divider <= hardware::LargestDivider(one.limits.max_count) * kEighths;
       ++divider) {
    const bool is_whole = divider % kEighths == 0;
    if (!is_whole && (!has_eighths || divider < 2 * kEighths)) continue;
    if (is_whole && has_eighths && one.kind == Kind::kStillFraction) continue;
    all.push_back(divider);
  }
  return all;
}

// What a divider makes, exactly. What is better is less in the first that differs.
struct Made {
  bool is_missed = false;
  Rational narrowness;  // the margin, below 0; 0 where it does not count
  Rational worst;
  Rational ppm;
  Rational phase;
  Rational duty;
  LoopOutput set;
  bool IsBefore(const Made& other) const {
    return std::tie(is_missed, narrowness, worst, ppm, phase, duty, set.divider) <
           std::tie(other.is_missed, other.narrowness, other.worst, other.ppm, other.phase,
                    other.duty, other.set.divider);
  }
};

Rational InUnits(const Rational& error, const Rational& tolerance, const Rational& usual) {
  return error / (tolerance == Rational(0) ? usual : tolerance);
}

Made MadeBy(const Case& one, int divider) {
  const Output& asked = one.Asked();
  const Rational half(1, 2);
  Made made;
  made.set.divider = divider;
  const Rational ratio(one.m, std::int64_t{one.d} * divider);
  made.ppm = (one.request.inputs[0] * ratio / asked.frequency - 1).Absolute() * 1'000'000;
  made.worst = InUnits(made.ppm, one.request.tolerance, 100);
  made.is_missed = made.ppm > one.request.tolerance;
  if (asked.phase) {
    if (one.kind == Kind::kMoving) {
      made.set.phase = hardware::NearestPhaseStep(*asked.phase, divider);
    }
    made.phase =
        hardware::TurnedToHalf(hardware::PhaseOfStep(made.set.phase, divider) - *asked.phase)
            .Absolute();
    made.worst = std::max(made.worst, InUnits(made.phase, one.request.phase_tolerance, half));
    made.is_missed = made.is_missed || made.phase > one.request.phase_tolerance;
  }
  if (asked.duty) {
    Rational duty = 50;
    if (one.kind == Kind::kMoving) {
      const int whole = divider / kEighths;
      made.set.high_time = hardware::NearestHighTime(*asked.duty, whole, one.limits.max_count);
      duty = hardware::DutyOfHighTime(made.set.high_time, whole);
    }
    made.duty = (duty - *asked.duty).Absolute();
    made.worst = std::max(made.worst, InUnits(made.duty, one.request.duty_tolerance, half));
    made.is_missed = made.is_missed || made.duty > one.request.duty_tolerance;
  }
  if (one.HasMargin() && !made.is_missed) {
    const Range& range = one.limits.OutputOf(one.index);
    for (const Rational& input : one.request.inputs) {
      const Rational output = input * ratio;
      const Rational above = range.lowest - output;
      const Rational margin = (range.highest - output) / range.highest;
      made.narrowness =
          &input == &one.request.inputs[0] ? -margin : std::max(made.narrowness, -margin);
      if (range.lowest > 0) made.narrowness = std::max(made.narrowness, above / range.lowest);
    }
  }
  return made;
}

std::vector<Made> AllThatKeepTheRange(const Case& one) {
  std::vector<Made> all;
  const Range& range = one.limits.OutputOf(one.index);
  for (const int divider : AllOf(one)) {
    const Rational ratio(one.m, std::int64_t{one.d} * divider);
    const bool is_kept =
        std::all_of(one.request.inputs.begin(), one.request.inputs.end(),
                    [&](const Rational& input) { return range.Contains(input * ratio); });
    if (is_kept) all.push_back(MadeBy(one, divider));
  }
  return all;
}

Case Drawn(compare::Random& random) {
  Case one;
  Request& request = one.request;
  one.index = random.Int(0, 1);
  one.kind = std::vector<Kind>{Kind::kMoving, Kind::kStill,
                               Kind::kStillFraction}[static_cast<std::size_t>(random.Int(0, 2))];
  one.limits.max_count = random.Int(2, random.OneIn(4) ? 64 : 20);
  one.m = one.kind == Kind::kMoving ? random.Int(1, 64) * kEighths : random.Int(40, 512);
  one.d = random.Int(1, 20);
  request.inputs = {Rational(random.Int(10'000, 200'000), 1000)};
  if (random.OneIn(3)) request.inputs.push_back(request.inputs[0] * random.Int(90, 110) / 100);
  if (random.OneIn(2)) request.rank = Rank::kMargin;
  const std::vector<int> dividers = AllOf(one);
  const Rational made =
      dividers.empty() ? Rational(100) : request.inputs[0] * one.m / one.d / random.Pick(dividers);
  Output output;
  // What a divider makes, what is between two of them, and anything near.
  output.frequency = made;
  if (random.OneIn(3)) output.frequency = made * random.Int(80'000, 120'000) / 100'000;
  output.frequency = exactly::Nudged(random, output.frequency);
  if (random.OneIn(3)) output.phase = Rational(random.Int(-48, 48) * 15, 2);
  if (random.OneIn(3)) output.duty = Rational(random.Int(1, 80) * 5, 4);
  request.outputs = {output, output};
  const std::vector<Rational> tolerances = {0, Rational(1, 100), 1, 5, 20};
  request.tolerance = random.Pick(tolerances) * (random.OneIn(2) ? 5000 : 1);
  request.phase_tolerance = random.Pick(tolerances);
  request.duty_tolerance = random.Pick(tolerances);
  // Ends that are just met, none, or anything.
  Range range = {made * random.Int(30, 110) / 100, made * random.Int(100, 250) / 100};
  if (random.OneIn(6)) range.lowest = 0;
  one.limits.output = one.limits.output_1 = {0, 0};
  (one.index == 0 ? one.limits.output : one.limits.output_1) = range;
  return one;
}

void ExpectBest(const Case& one, const std::vector<Made>& all) {
  const LoopDividers dividers = DividersOf(one);
  const LoopDividers::Choice choice = dividers.Choose(one.kind, one.m, one.d);
  if (all.empty()) {
    EXPECT_EQ(choice.divider, 0);
    return;
  }
  const Made best = *std::min_element(all.begin(), all.end(),
                                      [](const Made& a, const Made& b) { return a.IsBefore(b); });
  ASSERT_EQ(choice.divider, best.set.divider);
  EXPECT_EQ(choice.is_met, !best.is_missed);
  EXPECT_TRUE(Holds(choice.error.near, best.worst));
  EXPECT_EQ(dividers.Exact(choice.error), best.worst);
  EXPECT_EQ(dividers.Set(one.kind, choice.divider), best.set);
  if (one.HasMargin() && choice.is_met) {
    EXPECT_TRUE(Holds(choice.margin, -best.narrowness));
  }
  // The bound is of the frequency, and of what stands still.
  const double least = dividers.LeastError(one.kind, static_cast<double>(one.m) / one.d);
  for (const Made& made : all) {
    ASSERT_LE(Rational::FromDouble(least * (1 - kRounding)), made.worst) << made.set.divider;
  }
}

TEST(LoopDividers, HaveTheNextOneOfAKindOnEitherSide) {
  for (const Kind kind : {Kind::kMoving, Kind::kStill, Kind::kStillFraction}) {
    for (const int index : {0, 1}) {
      Case one;
      one.kind = kind;
      one.index = index;
      one.limits.max_count = 5;
      one.limits.output = one.limits.output_1 = {1, 1000};
      one.request.inputs = {100};
      one.request.outputs.resize(2);
      for (Output& output : one.request.outputs) output.frequency = 100;
      const LoopDividers dividers = DividersOf(one);
      const std::vector<int> all = AllOf(one);
      for (int divider = 0; divider <= dividers.Largest() + 20; ++divider) {
        const auto above = std::lower_bound(all.begin(), all.end(), divider);
        EXPECT_EQ(dividers.UpTo(kind, divider), above == all.end() ? 0 : *above) << divider;
        const auto beyond = std::upper_bound(all.begin(), all.end(), divider);
        EXPECT_EQ(dividers.DownTo(kind, divider), beyond == all.begin() ? 0 : *(beyond - 1))
            << divider;
      }
      for (const int divider : all) EXPECT_EQ(divider % dividers.StepOf(kind), 0);
    }
  }
}

// A VCO of 48 MHz, and an output of 14 that may be from 10 to 20: 12 MHz is a fifth above the one end
// and 16 a fifth below the other. Both are as far from 14, and the smaller divider is taken.
TEST(LoopDividers, CompareMarginsExactly) {
  const Rational little(1, 1'000'000'000'000'000);
  for (const auto& [lowest, divider] :
       {std::pair{Rational(10), 3}, {10 + little, 3}, {10 - little, 4}}) {
    Case one;
    one.m = kEighths;
    one.d = 1;
    one.limits.max_count = 64;
    one.limits.output = {lowest, 20};
    one.request.inputs = {48};
    one.request.rank = Rank::kMargin;
    one.request.tolerance = 200'000;
    one.request.outputs.resize(1);
    one.request.outputs[0].frequency = 14;
    ExpectBest(one, AllThatKeepTheRange(one));
    EXPECT_EQ(DividersOf(one).Choose(one.kind, one.m, one.d).divider, divider * kEighths);
  }
}

TEST(LoopDividers, AreTheBestOfAll) {
  compare::Random random(1);
  int met = 0;
  int none = 0;
  int wide = 0;
  for (int i = 0; i < 800; ++i) {
    const Case one = Drawn(random);
    const std::vector<Made> all = AllThatKeepTheRange(one);
    ASSERT_NO_FATAL_FAILURE(ExpectBest(one, all)) << i;
    ASSERT_FALSE(testing::Test::HasFailure()) << i;
    none += all.empty() ? 1 : 0;
    const auto count =
        std::count_if(all.begin(), all.end(), [](const Made& made) { return !made.is_missed; });
    met += count > 0 ? 1 : 0;
    wide += count > 1 && one.HasMargin() ? 1 : 0;
  }
  EXPECT_GT(met, 150);
  EXPECT_LT(met, 650);
  EXPECT_GT(none, 10);
  EXPECT_GT(wide, 20);
}

}  // namespace
}  // namespace planner::search
