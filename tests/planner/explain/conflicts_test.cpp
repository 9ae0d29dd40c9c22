#include "planner/explain/Conflicts.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <random>

namespace planner::explain {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testing::UnorderedElementsAreArray;

bool GoesWithout(const std::vector<Set>& conflicts, Set set) {
  for (const Set conflict : conflicts) {
    if ((conflict & ~set) == 0) return false;
  }
  return true;
}

// All smallest sets that do not go, and all smallest sets without which the rest goes: from all
// subsets, one after the other.
void FromAllSubsets(std::size_t count, const std::vector<Set>& given, std::vector<Set>* conflicts,
                    std::vector<Set>* corrections) {
  const Set end = Set{1} << count;
  const Set all = end - 1;
  for (Set set = 0; set < end; ++set) {
    bool is_conflict = !GoesWithout(given, set);
    bool is_correction = GoesWithout(given, all & ~set);
    for (std::size_t i = 0; i < count; ++i) {
      if (!Has(set, i)) continue;
      const Set without = set & ~(Set{1} << i);
      is_conflict = is_conflict && GoesWithout(given, without);
      is_correction = is_correction && !GoesWithout(given, all & ~without);
    }
    if (is_conflict) conflicts->push_back(set);
    if (is_correction && set != 0) corrections->push_back(set);
  }
}

TEST(Conflicts, NothingIsInTheWayOfWhatGoes) {
  const Conflicts found = FindConflicts(5, [](Set) { return true; });
  EXPECT_THAT(found.conflicts, IsEmpty());
  EXPECT_THAT(found.corrections, IsEmpty());
  EXPECT_TRUE(found.complete);
}

// The first two do not go together, nor do the last three.
TEST(Conflicts, OfTwoApart) {
  const std::vector<Set> given = {0b00011, 0b11100};
  const Conflicts found = FindConflicts(5, [&](Set set) { return GoesWithout(given, set); });
  EXPECT_THAT(found.conflicts, ElementsAre(0b00011, 0b11100));
  EXPECT_THAT(found.corrections,
              ElementsAre(0b00101, 0b00110, 0b01001, 0b01010, 0b10001, 0b10010));
}

TEST(Conflicts, ADemandThatNothingMeets) {
  const std::vector<Set> given = {0b010};
  const Conflicts found = FindConflicts(3, [&](Set set) { return GoesWithout(given, set); });
  EXPECT_THAT(found.conflicts, ElementsAre(0b010));
  EXPECT_THAT(found.corrections, ElementsAre(0b010));
}

TEST(Conflicts, AreThoseOfAllSubsets) {
  std::mt19937 random(1);
  for (int turn = 0; turn < 400; ++turn) {
    const std::size_t count = 1 + random() % 10;
    const Set all = (Set{1} << count) - 1;
    std::vector<Set> given;
    for (auto left = random() % 7; left > 0; --left) {
      // The empty set can be one: then nothing goes at all.
      given.push_back(random() & random() & all);
    }
    std::vector<Set> conflicts;
    std::vector<Set> corrections;
    FromAllSubsets(count, given, &conflicts, &corrections);
    const Conflicts found = FindConflicts(count, [&](Set set) { return GoesWithout(given, set); });
    ASSERT_TRUE(found.complete);
    ASSERT_THAT(found.conflicts, UnorderedElementsAreArray(conflicts)) << turn;
    ASSERT_THAT(found.corrections, UnorderedElementsAreArray(corrections)) << turn;
  }
}

TEST(Conflicts, SayThatTheQuestionsCameToTheirEnd) {
  const std::vector<Set> given = {0b00011, 0b11100};
  const Conflicts found = FindConflicts(5, [&](Set set) { return GoesWithout(given, set); }, 6);
  EXPECT_FALSE(found.complete);
  EXPECT_LE(found.conflicts.size(), 1u);
}

}  // namespace
}  // namespace planner::explain
