#include "planner/explain/Subsets.h"

#include <gtest/gtest.h>

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

}  // namespace
}  // namespace planner::explain
