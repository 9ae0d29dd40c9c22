// Tests of the M and D of a loop, against trying all of them.
#include <gtest/gtest.h>

#include <algorithm>
#include <utility>

#include "exactly.h"
#include "hardware/Loop.h"
#include "planner/search/LoopGrid.h"
#include "tests/compare/Random.h"

namespace planner::search {
namespace {

using hardware::kEighths;
using Pairs = std::vector<std::pair<int, int>>;  // D and M

struct Asked {
  std::vector<Rational> inputs;
  Primitive primitive = Primitive::kPll;
  bool fractions = false;
  int largest_d = hardware::kLargestD;
  std::optional<Range> vco = {};
  std::optional<Range> pfd = {};
};

LoopGrid GridOf(const Asked& asked) {
  return LoopGridOf(InputsOf(asked.inputs), MSetOf(asked.primitive, asked.fractions),
                    asked.largest_d, asked.vco, asked.pfd);
}

Pairs PairsOf(const LoopGrid& grid) {
  Pairs pairs;
  for (const Row& row : grid.rows) {
    if (row.one) pairs.emplace_back(row.d, kEighths);
    for (int m = row.first; m <= row.last; m += grid.step) pairs.emplace_back(row.d, m);
  }
  return pairs;
}

// Each M and D by itself.
Pairs PlainPairs(const Asked& asked) {
  Pairs pairs;
  for (int d = 1; d <= asked.largest_d; ++d) {
    for (int m = 1; m <= hardware::kLargestM * kEighths; ++m) {
      if (!hardware::IsM(asked.primitive, m, asked.fractions)) continue;
      const bool fits =
          std::all_of(asked.inputs.begin(), asked.inputs.end(), [&](const Rational& input) {
            return (!asked.pfd || asked.pfd->Contains(input / d)) &&
                   (!asked.vco || asked.vco->Contains(input * Rational(m, kEighths * d)));
          });
      if (fits) pairs.emplace_back(d, m);
    }
  }
  return pairs;
}

TEST(InputsOf, AreTheLowestAndTheHighest) {
  EXPECT_EQ(InputsOf({25}).lowest, Rational(25));
  EXPECT_EQ(InputsOf({25}).highest, Rational(25));
  EXPECT_EQ(InputsOf({25, 20, 33}).lowest, Rational(20));
  EXPECT_EQ(InputsOf({25, 20, 33}).highest, Rational(33));
}

TEST(MSetOf, IsWhatCanBeSet) {
  for (const Primitive primitive : {Primitive::kPll, Primitive::kTsyn}) {
    for (const bool fractions : {false, true}) {
      if (fractions && primitive == Primitive::kPll) continue;
      const MSet set = MSetOf(primitive, fractions);
      for (int m = 0; m <= 600; ++m) {
        const bool is_there = (set.one && m == kEighths) ||
                              (set.first <= m && m <= set.last && (m - set.first) % set.step == 0);
        EXPECT_EQ(is_there, hardware::IsM(primitive, m, fractions)) << m;
      }
    }
  }
}

// 100 MHz: D 5 has a PFD of 20, and a VCO of 400 to 600 with an M from 20 to 30. D 1 has a PFD of
// 100, and an M from 4 to 6.
TEST(LoopGrid, EndsOfRangesBelongToThem) {
  const LoopGrid grid = GridOf({.inputs = {100}, .vco = Range{400, 600}, .pfd = Range{20, 100}});
  ASSERT_EQ(grid.rows.size(), 5u);
  EXPECT_EQ(grid.rows.front().d, 1);
  EXPECT_EQ(grid.rows.front().first, 4 * kEighths);
  EXPECT_EQ(grid.rows.front().last, 6 * kEighths);
  EXPECT_EQ(grid.rows.back().d, 5);
  EXPECT_EQ(grid.rows.back().first, 20 * kEighths);
  EXPECT_EQ(grid.rows.back().last, 30 * kEighths);
  // 4..6, 8..12, 12..18, 16..24 and 20..30.
  EXPECT_EQ(grid.Count(), 3 + 5 + 7 + 9 + 11);
  // Of a TSYN there is no 4.
  const LoopGrid tsyn = GridOf({.inputs = {100},
                                .primitive = Primitive::kTsyn,
                                .vco = Range{100, 600},
                                .pfd = Range{100, 100}});
  ASSERT_EQ(tsyn.rows.size(), 1u);
  EXPECT_TRUE(tsyn.rows[0].one);
  EXPECT_EQ(tsyn.Count(), 1 + 2);
}

TEST(LoopGrid, RangesThatDoNotFitIntoWords) {
  const Asked exact = {.inputs = {100}, .vco = Range{400, 600}, .pfd = Range{20, 100}};
  Asked narrow = exact;
  narrow.vco = Range{exactly::JustAbove(400), exactly::JustBelow(600)};
  EXPECT_EQ(GridOf(narrow).Count(), GridOf(exact).Count() - 5 * 2);
  narrow = exact;
  narrow.pfd = Range{exactly::JustAbove(20), exactly::JustBelow(100)};
  EXPECT_EQ(GridOf(narrow).Count(), GridOf(exact).Count() - 3 - 11);
}

TEST(LoopGrid, RangesThatAreNotThereOrHoldNothing) {
  const LoopGrid all = GridOf({.inputs = {100}});
  EXPECT_EQ(all.Count(), hardware::kLargestM * hardware::kLargestD);
  EXPECT_EQ(GridOf({.inputs = {100}, .vco = Range{0, 0}}).Count(), 0);
  EXPECT_EQ(GridOf({.inputs = {100}, .pfd = Range{0, 0}}).Count(), 0);
  EXPECT_EQ(GridOf({.inputs = {100}, .vco = Range{600, 400}}).Count(), 0);
  EXPECT_EQ(GridOf({.inputs = {100}, .pfd = Range{300, 200}}).Count(), 0);
  // Two inputs that are further apart than the range is wide.
  EXPECT_EQ(GridOf({.inputs = {100, 160}, .vco = Range{400, 600}}).Count(), 0);
}

TEST(LoopGrid, IsWhatKeepsTheRanges) {
  compare::Random random(1);
  const std::vector<Rational> inputs = {10, 25, Rational(100, 3), 50, 100, Rational(74250, 1001)};
  std::int64_t count = 0;
  for (int i = 0; i < 120; ++i) {
    Asked asked;
    asked.inputs = {random.Pick(inputs)};
    if (random.OneIn(3)) asked.inputs.push_back(asked.inputs[0] * random.Int(90, 110) / 100);
    if (random.OneIn(2)) asked.primitive = Primitive::kTsyn;
    asked.fractions = asked.primitive == Primitive::kTsyn && random.OneIn(2);
    asked.largest_d = random.Int(1, 12);
    const auto ratio = [&random](int high, int low) {
      return Rational(random.Int(1, high), random.Int(1, low));
    };
    if (!random.OneIn(5)) {
      const Rational lowest = random.OneIn(5) ? Rational(0) : asked.inputs[0] * ratio(40, 8);
      asked.vco = Range{exactly::Nudged(random, lowest),
                        exactly::Nudged(random, lowest + asked.inputs[0] * ratio(20, 8))};
    }
    if (!random.OneIn(5)) {
      const Rational lowest = random.OneIn(5) ? Rational(0) : asked.inputs[0] / ratio(12, 1);
      asked.pfd = Range{exactly::Nudged(random, lowest),
                        exactly::Nudged(random, lowest + asked.inputs[0] * ratio(3, 3))};
    }
    const LoopGrid grid = GridOf(asked);
    const Pairs plain = PlainPairs(asked);
    ASSERT_EQ(PairsOf(grid), plain) << i;
    ASSERT_EQ(grid.Count(), static_cast<std::int64_t>(plain.size())) << i;
    for (const auto& [d, m] : plain) {
      const Rational ratio_of_vco(m, d);
      ASSERT_LE(Rational::FromDouble(grid.lowest), ratio_of_vco) << i;
      ASSERT_GE(Rational::FromDouble(grid.highest), ratio_of_vco) << i;
    }
    count += grid.Count();
  }
  EXPECT_GT(count, 1000);
}

}  // namespace
}  // namespace planner::search
