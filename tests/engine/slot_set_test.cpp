// Tests of sets of slot numbers, held against std::set.

#include "engine/pll/SlotSet.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <random>
#include <set>
#include <vector>

#include "tests/engine/EngineTest.h"

namespace {

using engine_test::SlotsOf;
using Ip::Pll::SlotSet;
using testing::ElementsAre;
using testing::IsEmpty;

// Table sizes around whole words of 64 bits, and those that the solver uses.
template <typename Set>
class SlotSetTest : public testing::Test {};

template <int kSlots>
struct Sized {
  static constexpr int kSize = kSlots;
  using Set = SlotSet<kSlots>;
};
using Sizes = testing::Types<Sized<65>, Sized<100>, Sized<127>, Sized<128>, Sized<129>,
                             Sized<1010>>;
TYPED_TEST_SUITE(SlotSetTest, Sizes);

TYPED_TEST(SlotSetTest, IsEmptyAtFirst) {
  const typename TypeParam::Set set;
  EXPECT_TRUE(set.IsEmpty());
  EXPECT_EQ(set.Count(), 0);
  EXPECT_EQ(set.NextFrom(0), TypeParam::kSize);
  EXPECT_THAT(SlotsOf(set), IsEmpty());
  for (int slot = 0; slot < TypeParam::kSize; ++slot) EXPECT_FALSE(set.Contains(slot)) << slot;
}

TYPED_TEST(SlotSetTest, HoldsEverySlotAlone) {
  for (int slot = 0; slot < TypeParam::kSize; ++slot) {
    typename TypeParam::Set set;
    set.Insert(slot);
    EXPECT_FALSE(set.IsEmpty());
    EXPECT_EQ(set.Count(), 1);
    EXPECT_TRUE(set.Contains(slot));
    ASSERT_THAT(SlotsOf(set), ElementsAre(slot));
    EXPECT_EQ(set.NextFrom(0), slot);
    EXPECT_EQ(set.NextFrom(slot), slot);
    EXPECT_EQ(set.NextFrom(slot + 1), TypeParam::kSize);
    set.Erase(slot);
    EXPECT_TRUE(set.IsEmpty());
  }
}

TYPED_TEST(SlotSetTest, HoldsAllSlots) {
  typename TypeParam::Set set;
  std::vector<int> all;
  for (int slot = TypeParam::kSize - 1; slot >= 0; --slot) set.Insert(slot);
  for (int slot = 0; slot < TypeParam::kSize; ++slot) all.push_back(slot);
  EXPECT_EQ(SlotsOf(set), all);
  EXPECT_EQ(set.Count(), TypeParam::kSize);
  set.Clear();
  EXPECT_TRUE(set.IsEmpty());
  EXPECT_THAT(SlotsOf(set), IsEmpty());
}

TYPED_TEST(SlotSetTest, InsertingTwiceAndErasingWhatIsNotThereChangeNothing) {
  typename TypeParam::Set set;
  set.Erase(0);
  EXPECT_TRUE(set.IsEmpty());
  set.Insert(0);
  set.Insert(0);
  EXPECT_EQ(set.Count(), 1);
  set.Erase(0);
  EXPECT_FALSE(set.Contains(0));
}

TYPED_TEST(SlotSetTest, ASlotMayBeErasedWhileTheLoopStandsOnIt) {
  typename TypeParam::Set set;
  for (int slot = 0; slot < TypeParam::kSize; ++slot) set.Insert(slot);
  int visited = 0;
  for (const int slot : set) {
    EXPECT_EQ(slot, visited++);
    set.Erase(slot);
  }
  EXPECT_EQ(visited, TypeParam::kSize);
  EXPECT_TRUE(set.IsEmpty());
}

TYPED_TEST(SlotSetTest, ACopyIsASetOfItsOwn) {
  typename TypeParam::Set set;
  set.Insert(TypeParam::kSize - 1);
  typename TypeParam::Set copy = set;
  set.Clear();
  EXPECT_THAT(SlotsOf(copy), ElementsAre(TypeParam::kSize - 1));
}

TYPED_TEST(SlotSetTest, RemovesAnotherSet) {
  typename TypeParam::Set set;
  typename TypeParam::Set others;
  for (const int slot : {0, 1, 63, 64, TypeParam::kSize - 1}) set.Insert(slot);
  for (const int slot : {1, 2, 64, TypeParam::kSize - 1}) others.Insert(slot);
  set.Remove(others);
  EXPECT_THAT(SlotsOf(set), ElementsAre(0, 63));
}

TYPED_TEST(SlotSetTest, ARangeThatEndsBeforeItBeginsIsEmpty) {
  typename TypeParam::Set set;
  set.InsertRange(5, 4);
  set.InsertRange(0, -1);
  set.InsertRange(TypeParam::kSize, TypeParam::kSize - 1);
  EXPECT_TRUE(set.IsEmpty());
  set.Insert(4);
  set.EraseRange(5, 4);
  set.EraseRange(5, 4, [](int) { FAIL(); });
  EXPECT_THAT(SlotsOf(set), ElementsAre(4));
}

TYPED_TEST(SlotSetTest, ErasesARangeAndTellsWhatWasThere) {
  typename TypeParam::Set set;
  for (const int slot : {3, 4, 9, 63, 64}) set.Insert(slot);
  std::vector<int> erased;
  set.EraseRange(4, 63, [&](int slot) { erased.push_back(slot); });
  EXPECT_THAT(erased, ElementsAre(4, 9, 63));
  EXPECT_THAT(SlotsOf(set), ElementsAre(3, 64));
}

TYPED_TEST(SlotSetTest, RangesBehaveAsTheirSlots) {
  std::mt19937 random(54321);
  std::uniform_int_distribution<int> anySlot(0, TypeParam::kSize - 1);
  typename TypeParam::Set set;
  std::set<int> model;
  for (int step = 0; step < 500; ++step) {
    const int first = anySlot(random);
    const int last = anySlot(random);
    if (random() % 2 == 0) {
      set.InsertRange(first, last);
      for (int slot = first; slot <= last; ++slot) model.insert(slot);
    } else {
      set.EraseRange(first, last);
      for (int slot = first; slot <= last; ++slot) model.erase(slot);
    }
    ASSERT_EQ(SlotsOf(set), std::vector<int>(model.begin(), model.end()))
        << first << " to " << last;
  }
}

TYPED_TEST(SlotSetTest, BehavesAsASortedSet) {
  std::mt19937 random(12345);
  std::uniform_int_distribution<int> anySlot(0, TypeParam::kSize - 1);
  typename TypeParam::Set set;
  std::set<int> model;
  for (int step = 0; step < 3000; ++step) {
    const int slot = anySlot(random);
    if (random() % 2 == 0) {
      set.Insert(slot);
      model.insert(slot);
    } else {
      set.Erase(slot);
      model.erase(slot);
    }
    ASSERT_EQ(set.Contains(slot), model.contains(slot));
    const int from = anySlot(random);
    const auto next = model.lower_bound(from);
    ASSERT_EQ(set.NextFrom(from), next == model.end() ? TypeParam::kSize : *next);
    if (step % 50 == 0) {
      ASSERT_EQ(SlotsOf(set), std::vector<int>(model.begin(), model.end()));
      ASSERT_EQ(set.Count(), static_cast<int>(model.size()));
    }
  }
}

}  // namespace
