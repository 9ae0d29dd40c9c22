// Tests of candidates and of the table that holds them.

#include "engine/pll/VcoCandidate.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <memory>
#include <thread>

#include "tests/engine/EngineTest.h"

namespace {

using engine_test::SlotsOf;
using Ip::Pll::MAX_VCO_CANDIDATES;
using Ip::Pll::VcoCandidate;
using Ip::Pll::VcoCandidateTable;
using testing::Each;
using testing::ElementsAre;
using testing::IsEmpty;

class VcoCandidateTableTest : public testing::Test {
 protected:
  VcoCandidateTable& table_ = engine_test::NewImp().pll._vcoCandidates;
};

TEST_F(VcoCandidateTableTest, HasASlotForEveryStepOfTheFractionalWalk) {
  // 1, then 2 to 128 in eighths: 1 + 126 * 8 + 1.
  EXPECT_EQ(MAX_VCO_CANDIDATES, 1010);
  EXPECT_EQ(Ip::MAX_OUTPUTS, 7);
}

TEST_F(VcoCandidateTableTest, IsEmptyAtFirst) {
  EXPECT_THAT(SlotsOf(table_.Occupied()), IsEmpty());
}

TEST_F(VcoCandidateTableTest, PutsACandidateWithVcoAndDiv0AndNoMAndD) {
  table_.Put(3, 850.0, 2.125);
  EXPECT_EQ(table_[3].vco, 850.0);
  EXPECT_EQ(table_[3].div0, 2.125);
  EXPECT_EQ(table_[3].m, 0.0);
  EXPECT_EQ(table_[3].d, 0u);
}

TEST_F(VcoCandidateTableTest, APutTakesTheSlotOver) {
  table_.Put(0, 400.0, 4.0);
  table_[0].m = 4.0;
  table_[0].d = 1;
  table_.Put(0, 500.0, 5.0);
  EXPECT_EQ(table_[0].vco, 500.0);
  EXPECT_EQ(table_[0].div0, 5.0);
  EXPECT_EQ(table_[0].m, 0.0);
  EXPECT_EQ(table_[0].d, 0u);
  EXPECT_THAT(SlotsOf(table_.Occupied()), ElementsAre(0));
}

TEST(VcoCandidate, ClearsWhatNoStageHasWritten) {
  VcoCandidate candidate;
  candidate.vco = 850.0;
  candidate.div0 = 2.0;
  candidate.m = 17.0;
  candidate.d = 2;
  candidate.freqDiff.fill(1.0);
  candidate.phase.fill(2.0);
  candidate.phaseDiff.fill(3.0);
  candidate.dutyCycle.fill(4.0);
  candidate.dutyDiff.fill(5.0);
  candidate.divN.fill(6);
  candidate.ClearWhatIsLeft(3);
  EXPECT_EQ(candidate.vco, 850.0);
  EXPECT_EQ(candidate.div0, 2.0);
  EXPECT_EQ(candidate.m, 17.0);
  EXPECT_EQ(candidate.d, 2u);
  EXPECT_THAT(candidate.freqDiff, ElementsAre(0, 1, 1, 0, 0, 0, 0));
  EXPECT_THAT(candidate.divN, ElementsAre(0, 6, 6, 0, 0, 0, 0));
  EXPECT_THAT(candidate.phase, Each(0.0));
  EXPECT_THAT(candidate.phaseDiff, Each(0.0));
  EXPECT_THAT(candidate.dutyCycle, Each(0.0));
  EXPECT_THAT(candidate.dutyDiff, Each(0.0));
  candidate.divN.fill(6);
  candidate.ClearWhatIsLeft(1);
  EXPECT_THAT(candidate.divN, Each(0u));
}

TEST_F(VcoCandidateTableTest, ASlotTakenAgainAfterEmptyingHasNoM) {
  table_.Put(7, 400.0, 4.0);
  table_[7].m = 4.0;
  table_.EmptyAll();
  table_.Put(7, 500.0, 5.0);
  EXPECT_FALSE(table_[7].HasMAndD());
}

TEST_F(VcoCandidateTableTest, EmptiesOneSlotOrAllOrAllBut) {
  for (const int slot : {0, 63, 64, 1009}) table_.Put(slot, 100.0 + slot, 1.0);
  EXPECT_THAT(SlotsOf(table_.Occupied()), ElementsAre(0, 63, 64, 1009));
  table_.Empty(63);
  EXPECT_THAT(SlotsOf(table_.Occupied()), ElementsAre(0, 64, 1009));
  VcoCandidateTable::Slots kept;
  kept.Insert(64);
  kept.Insert(1009);
  table_.KeepOnly(kept);
  EXPECT_THAT(SlotsOf(table_.Occupied()), ElementsAre(64, 1009));
  EXPECT_EQ(table_[1009].vco, 1109.0);
  table_.EmptyAll();
  EXPECT_THAT(SlotsOf(table_.Occupied()), IsEmpty());
}

TEST_F(VcoCandidateTableTest, SharesItsRecordsWithTheOthersOfTheThread) {
  VcoCandidateTable other;
  table_.EmptyAll();
  other.Put(5, 400.0, 4.0);
  EXPECT_EQ(&other[5], &table_[5]);
  EXPECT_THAT(SlotsOf(table_.Occupied()), IsEmpty());
  EXPECT_LE(sizeof(VcoCandidateTable), 256u);
}

TEST_F(VcoCandidateTableTest, TakesTheRecordsOfTheThreadThatEmptiesIt) {
  table_.EmptyAll();
  const VcoCandidate* const here = &table_[0];
  const VcoCandidate* there = nullptr;
  std::thread([&] {
    table_.EmptyAll();
    table_.Put(1009, 400.0, 4.0);
    there = &table_[0];
  }).join();
  EXPECT_NE(there, here);
  table_.EmptyAll();
  EXPECT_EQ(&table_[0], here);
}

TEST(VcoCandidate, HasTheDividersOfItsOutputs) {
  VcoCandidate candidate{};
  candidate.div0 = 2.125;
  candidate.divN = {99, 1, 2, 3, 4, 5, 128};
  EXPECT_EQ(candidate.Divider(0), 2.125);
  for (int n = 1; n <= 5; ++n) EXPECT_EQ(candidate.Divider(n), n);
  EXPECT_EQ(candidate.Divider(6), 128.0);
}

TEST(VcoCandidate, HasMAndDWhenAnMIsSet) {
  VcoCandidate candidate{};
  EXPECT_FALSE(candidate.HasMAndD());
  candidate.m = 1.0;
  EXPECT_TRUE(candidate.HasMAndD());
}

}  // namespace
