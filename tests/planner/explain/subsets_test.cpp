#include "planner/explain/Subsets.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <optional>
#include <vector>

#include "tests/compare/Random.h"

namespace planner::explain {
namespace {

TEST(Subsets, BeginWithAll) {
  EXPECT_EQ(Subsets(0b111).Next(), Set{0b111});
  EXPECT_EQ(Subsets(0).Next(), Set{0});
}

TEST(Subsets, GoOnBesideWhatIsSettled) {
  Subsets subsets(0b111);
  subsets.SettleAbove(0b011);
  const std::optional<Set> next = subsets.Next();
  ASSERT_TRUE(next.has_value());
  EXPECT_NE(*next & 0b011, Set{0b011});
  EXPECT_NE(*next & 0b100, Set{0});  // nothing keeps the third out
}

// What is left of three: not below {0, 1}, not above {2} - nothing.
TEST(Subsets, EndWhenAllAreSettled) {
  Subsets subsets(0b111);
  subsets.SettleBelow(0b011);
  EXPECT_TRUE(subsets.Next().has_value());
  subsets.SettleAbove(0b100);
  EXPECT_EQ(subsets.Next(), std::nullopt);
}

TEST(Subsets, TheWholeSetSettlesAll) {
  Subsets subsets(0b11);
  subsets.SettleBelow(0b11);
  EXPECT_EQ(subsets.Next(), std::nullopt);
}

TEST(Subsets, OfNothingOnlyTheEmptySet) {
  Subsets subsets(0);
  subsets.SettleBelow(0);
  EXPECT_EQ(subsets.Next(), std::nullopt);
}

TEST(Subsets, NextIsNotSettledAndAnyMoreWouldBe) {
  compare::Random random(17);
  int settled = 0;
  for (int i = 0; i < 3000; ++i) {
    const Set all = ~Set{0} >> (64 - random.Int(1, 8));
    Subsets subsets(all);
    std::vector<Set> below;
    std::vector<Set> above;
    for (int n = random.Int(0, 12); n > 0; --n) {
      const Set set = static_cast<Set>(random.Int(0, 255)) & all;
      if (random.Int(0, 1) == 0) {
        below.push_back(set);
        subsets.SettleBelow(set);
      } else {
        above.push_back(set);
        subsets.SettleAbove(set);
      }
    }
    const auto is_settled = [&](Set set) {
      return std::any_of(below.begin(), below.end(), [&](Set one) { return (set & ~one) == 0; }) ||
             std::any_of(above.begin(), above.end(), [&](Set one) { return (one & ~set) == 0; });
    };
    const std::optional<Set> next = subsets.Next();
    if (!next) {
      ++settled;
      for (Set set = 0; set <= all; ++set) ASSERT_TRUE(is_settled(set)) << i;
      continue;
    }
    ASSERT_EQ(*next & ~all, Set{0}) << i;
    ASSERT_FALSE(is_settled(*next)) << i;
    for (Set element = 1; element <= all; element <<= 1) {
      ASSERT_TRUE((*next & element) != 0 || is_settled(*next | element)) << i;
    }
  }
  EXPECT_GT(settled, 200);
  EXPECT_LT(settled, 2800);
}

}  // namespace
}  // namespace planner::explain
