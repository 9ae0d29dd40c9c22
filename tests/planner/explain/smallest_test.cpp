#include "planner/explain/Smallest.h"

#include <gtest/gtest.h>

#include <random>

namespace planner::explain {
namespace {

// Settings whose D is the number of an allowance.
Settings Numbered(int number) {
  LoopSettings settings;
  settings.d = number;
  return settings;
}

int NumberOf(const Settings& settings) { return std::get<LoopSettings>(settings).d; }

// The last of some rising allowances that is allowed: the worst choice that `find` may make.
std::optional<Allowance> Smallest(const std::vector<Rational>& allowances, const Rational& most,
                                  bool choose_last = true) {
  return FindSmallest(
      [&](const Rational& allowed) -> std::optional<Settings> {
        std::optional<Settings> found;
        for (std::size_t i = 0; i < allowances.size() && allowances[i] <= allowed; ++i) {
          if (!found || choose_last) found = Numbered(static_cast<int>(i));
        }
        return found;
      },
      [&](const Settings& settings) {
        return allowances[static_cast<std::size_t>(NumberOf(settings))];
      },
      most);
}

TEST(Smallest, IsNothingWhereNotEvenTheMostDoes) {
  EXPECT_FALSE(Smallest({Rational(5)}, 4).has_value());
}

TEST(Smallest, IsMetExactly) {
  const std::optional<Allowance> found = Smallest({Rational(1, 3), Rational(1), Rational(7)}, 100);
  ASSERT_TRUE(found.has_value());
  EXPECT_EQ(found->value, Rational(1, 3));
  EXPECT_EQ(NumberOf(found->settings), 0);
}

TEST(Smallest, CanBeNone) {
  const std::optional<Allowance> found = Smallest({Rational(0), Rational(50)}, 100);
  ASSERT_TRUE(found.has_value());
  EXPECT_EQ(found->value, Rational(0));
}

TEST(Smallest, OfManyDrawn) {
  std::mt19937 random(1);
  for (int turn = 0; turn < 300; ++turn) {
    std::vector<Rational> allowances;
    Rational last = 0;
    for (auto left = 1 + random() % 40; left > 0; --left) {
      last += Rational(static_cast<int>(1 + random() % 1000000),
                       static_cast<int>(1 + random() % 1000000));
      allowances.push_back(last);
    }
    const std::optional<Allowance> found = Smallest(allowances, 100000000, turn % 2 == 0);
    ASSERT_TRUE(found.has_value());
    ASSERT_EQ(found->value, allowances.front());
  }
}

}  // namespace
}  // namespace planner::explain
