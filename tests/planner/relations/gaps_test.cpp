#include "planner/relations/Gaps.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <optional>
#include <random>
#include <vector>

namespace planner::relations {
namespace {

// A clock on a grid of whole steps.
struct Grid {
  int period;
  int rise;
  int high;
};

Clock OnGrid(const Grid& grid, const Rational& unit) {
  Clock clock;
  clock.period = unit * grid.period;
  clock.rise = unit * grid.rise;
  clock.high = unit * grid.high;
  return clock;
}

// The first time, in steps, that is a multiple of both, found by counting.
int Again(int one, int other) {
  int time = one;
  while (time % other != 0) time += one;
  return time;
}

// The least time from an edge that comes every `first` steps from `launch` on to a later one of
// those that come every `second` from `capture` on, walking through the edges of both for a
// hyperperiod and those around it. With `same` an edge at the same time counts as later.
int Walked(int first, int launch, int second, int capture, bool same = false) {
  const int all = Again(first, second);
  int least = 2 * all;
  for (int from = launch; from < launch + all; from += first) {
    for (int to = capture - 2 * all; to < capture + 4 * all; to += second) {
      const int gap = to - from;
      if (gap > 0 || (same && gap == 0)) least = std::min(least, gap);
    }
  }
  return least;
}

void ExpectAsWalked(const Grid& a, const Grid& b, const Rational& unit) {
  SCOPED_TRACE(testing::Message() << a.period << " " << a.rise << " " << a.high << " to "
                                  << b.period << " " << b.rise << " " << b.high);
  const Clock from = OnGrid(a, unit);
  const Clock to = OnGrid(b, unit);
  const int a_fall = a.rise + a.high;
  const int b_fall = b.rise + b.high;
  const Gaps gaps = GapsBetween(from, to);
  EXPECT_EQ(gaps.rise_rise, unit * Walked(a.period, a.rise, b.period, b.rise));
  EXPECT_EQ(gaps.rise_fall, unit * Walked(a.period, a.rise, b.period, b_fall));
  EXPECT_EQ(gaps.fall_rise, unit * Walked(a.period, a_fall, b.period, b.rise));
  EXPECT_EQ(gaps.fall_fall, unit * Walked(a.period, a_fall, b.period, b_fall));
  // From a capturing edge to a launching one that is not before it.
  EXPECT_EQ(HoldGap(from, to), unit * Walked(b.period, b.rise, a.period, a.rise, true));
  EXPECT_EQ(Hyperperiod(from.period, to.period), unit * Again(a.period, b.period));
}

TEST(Gaps, AsWalkedForAllSmallClocks) {
  for (int a = 2; a <= 7; ++a) {
    for (int b = 2; b <= 7; ++b) {
      for (int rise = 0; rise < b; ++rise) {
        for (int high = 1; high < b; ++high) {
          ExpectAsWalked({a, rise % a, 1 + high % (a - 1)}, {b, rise, high}, Rational(5, 3));
        }
      }
    }
  }
}

TEST(Gaps, AsWalkedForDrawnClocks) {
  std::mt19937 random(20261121);
  const auto draw = [&](int from, int to) {
    return from + static_cast<int>(random() % static_cast<unsigned>(to - from + 1));
  };
  for (int n = 0; n < 400; ++n) {
    Grid clocks[2];
    for (Grid& one : clocks) {
      one.period = draw(2, 60);
      one.rise = draw(0, one.period - 1);
      one.high = draw(1, one.period - 1);
    }
    ExpectAsWalked(clocks[0], clocks[1], Rational(draw(1, 99), draw(1, 99)));
  }
}

// 100 and 75 MHz: 10 and 40/3 ns.
TEST(Gaps, ByHand) {
  EXPECT_EQ(CommonStep(10, Rational(40, 3)), Rational(10, 3));
  EXPECT_EQ(Hyperperiod(10, Rational(40, 3)), Rational(40));
  const Clock fast = OnGrid({6, 0, 3}, Rational(5, 3));  // rises at 0, falls at 5
  const Clock slow = OnGrid({8, 1, 2}, Rational(5, 3));  // rises at 5/3, falls at 5
  // Rises 5/3 + 40/3 k against 10 i: 5/3, or that and 10/3 more. Falls 5: 5/3 behind 10/3.
  EXPECT_EQ(GapsBetween(fast, slow),
            (Gaps{Rational(5, 3), Rational(5, 3), Rational(10, 3), Rational(10, 3)}));
  EXPECT_EQ(HoldGap(fast, slow), Rational(5, 3));
}

// Periods that no two words of a machine have.
TEST(Gaps, OfNumbersOfAnySize) {
  const Rational large = Rational::FromDecimal("1000000000000000000000000000057", 0);
  const Rational other = Rational::FromDecimal("1000000000000000000000000000099", 0);
  // Both are odd and 42 apart, and no divisor of 42 divides the first: it is 1 beyond a multiple of
  // 3 and 2 beyond one of 7.
  EXPECT_EQ(Modulo(large, 3), Rational(1));
  EXPECT_EQ(Modulo(large, 7), Rational(2));
  EXPECT_EQ(CommonStep(large, other), Rational(1));
  EXPECT_EQ(CommonStep(large * 12, large * 18), large * 6);
  EXPECT_EQ(Hyperperiod(large * 12, large * 18), large * 36);
}

TEST(Gaps, ModuloIsNeverNegative) {
  EXPECT_EQ(Modulo(Rational(-1, 3), 2), Rational(5, 3));
  EXPECT_EQ(Modulo(4, 2), Rational(0));
  EXPECT_EQ(Modulo(Rational(9, 2), 2), Rational(1, 2));
}

}  // namespace
}  // namespace planner::relations
