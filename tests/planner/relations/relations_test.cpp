#include "planner/relations/Relations.h"

#include <gtest/gtest.h>

#include "planner/report/made.h"

namespace planner::relations {
namespace {

using report::MadeLoop;
using report::MadeRequest;

Clock Made(const Rational& period, const Rational& rise = 0) {
  Clock clock;
  clock.output = 0;
  clock.period = period;
  clock.rise = rise;
  clock.high = period / 2;
  return clock;
}

Crossing Of(const Clock& from, const Clock& to, const Rule& rule = {}) {
  return Relate(from, to, rule).crossing;
}

// 100 to 75 MHz, which rises 2 ns later: 10 and 40/3 ns, common step 10/3.
TEST(Relate, AllFigures) {
  const Relation relation = Relate(Made(10), Made(Rational(40, 3), 2), {});
  EXPECT_EQ(relation.ratio, Rational(3, 4));
  EXPECT_EQ(relation.hyperperiod, Rational(40));
  EXPECT_EQ(relation.launches, Rational(4));
  EXPECT_EQ(relation.captures, Rational(3));
  EXPECT_EQ(relation.phase, Rational(54));  // 2 / (40/3) of a turn
  EXPECT_EQ(relation.gaps.rise_rise, Rational(2));
  EXPECT_EQ(relation.hold, Rational(4, 3));
  EXPECT_EQ(relation.limit, Rational(5, 2));
  EXPECT_EQ(relation.cycles, Rational(0));
  EXPECT_EQ(relation.crossing, Crossing::kFifo);  // 2 is below a quarter of 10
  EXPECT_TRUE(relation.NeedsFifo());
  EXPECT_TRUE(relation.IsSynchronous());
  const Relation back = Relate(Made(Rational(40, 3), 2), Made(10), {});
  EXPECT_EQ(back.ratio, Rational(4, 3));
  EXPECT_EQ(back.phase, Rational(288));  // 8 of 10 ns
  EXPECT_EQ(back.gaps.rise_rise, Rational(4, 3));
}

TEST(Relate, WholeRatiosThatRiseTogetherHaveAPeriodOfTheFaster) {
  EXPECT_EQ(Of(Made(10), Made(10)), Crossing::kSingleCycle);
  EXPECT_EQ(Of(Made(10), Made(30)), Crossing::kMulticycle);
  EXPECT_EQ(Of(Made(30), Made(10)), Crossing::kMulticycle);
  EXPECT_EQ(Of(Made(30), Made(10, 0)), Crossing::kMulticycle);
  // One period of the faster later is together, too.
  EXPECT_EQ(Of(Made(10), Made(30, 20)), Crossing::kMulticycle);
  EXPECT_EQ(Relate(Made(10), Made(30), {}).cycles, Rational(3));
  EXPECT_EQ(Relate(Made(30), Made(10), {}).cycles, Rational(3));
  EXPECT_EQ(Relate(Made(10), Made(10), {}).cycles, Rational(1));
}

// A quarter of 10 ns is 2.5.
TEST(Relate, TheRuleIncludesItsLimit) {
  EXPECT_EQ(Of(Made(10), Made(10, Rational(5, 2))), Crossing::kPhase);
  EXPECT_EQ(Of(Made(10), Made(10, Rational(249, 100))), Crossing::kRelaxed);
  // The other way 7.51 of 10 ns are left.
  EXPECT_EQ(Of(Made(10, Rational(249, 100)), Made(10)), Crossing::kPhase);
  // 10 and 12.5 ns: 2.5 is just enough; 10 and 12 ns: 2 is not.
  EXPECT_EQ(Of(Made(10), Made(Rational(25, 2))), Crossing::kShort);
  EXPECT_EQ(Of(Made(10), Made(12)), Crossing::kFifo);
}

TEST(Relate, AWholeRatioAtAPhase) {
  EXPECT_EQ(Of(Made(10), Made(20, 4)), Crossing::kShort);
  EXPECT_EQ(Of(Made(10), Made(20, 2)), Crossing::kRelaxed);
  EXPECT_EQ(Of(Made(20), Made(10, 2)), Crossing::kRelaxed);
}

TEST(Relate, ARuleOfOnesOwn) {
  const Rule three{Rational(3), {}};
  EXPECT_EQ(Of(Made(10), Made(15), three), Crossing::kShort);
  EXPECT_EQ(Of(Made(10), Made(Rational(25, 2)), three), Crossing::kFifo);
  const Rule half{{}, Rational(1, 2)};
  EXPECT_EQ(Of(Made(10), Made(15), half), Crossing::kShort);
  EXPECT_EQ(Of(Made(10), Made(Rational(40, 3)), half), Crossing::kFifo);
  // What has a whole period of the faster clock is as hard as that clock itself.
  EXPECT_EQ(Of(Made(2), Made(2), three), Crossing::kSingleCycle);
  EXPECT_EQ(Of(Made(2), Made(8), three), Crossing::kMulticycle);
  EXPECT_EQ(Of(Made(2), Made(2, 1), three), Crossing::kRelaxed);
}

TEST(RelationsOf, AllOrderedPairs) {
  const Request request = MadeRequest({100}, {200, 50});
  const Relations relations = RelationsOf(
      request, MadeLoop(request, Primitive::kPll, Bandwidth::kHigh, 64, 1, {32, 128}, 120));
  ASSERT_EQ(relations.clocks.size(), 3);
  ASSERT_EQ(relations.all.size(), 6);
  const std::size_t pairs[][2] = {{0, 1}, {0, 2}, {1, 0}, {1, 2}, {2, 0}, {2, 1}};
  for (std::size_t i = 0; i < 6; ++i) {
    EXPECT_EQ(relations.all[i].from, pairs[i][0]);
    EXPECT_EQ(relations.all[i].to, pairs[i][1]);
    EXPECT_EQ(relations.all[i].crossing, Crossing::kMulticycle);
  }
  EXPECT_EQ(relations.all[3].ratio, Rational(1, 4));
  EXPECT_EQ(relations.all[3].gaps.rise_rise, Rational(5));
}

// The clocks are input 1, its output, input 2 and its output: of 12 pairs the two of both outputs
// are no crossing.
TEST(RelationsOf, TwoInputsAreNotRelated) {
  const Request request = MadeRequest({100, 80}, {200});
  const Relations relations =
      RelationsOf(request, MadeLoop(request, Primitive::kPll, Bandwidth::kHigh, 64, 1, {32}, 120));
  ASSERT_EQ(relations.clocks.size(), 4);
  ASSERT_EQ(relations.all.size(), 10);
  int related = 0;
  for (const Relation& one : relations.all) {
    EXPECT_FALSE((one.from == 1 && one.to == 3) || (one.from == 3 && one.to == 1));
    const bool is_same = relations.clocks[one.from].input == relations.clocks[one.to].input;
    EXPECT_EQ(one.IsSynchronous(), is_same);
    EXPECT_EQ(one.NeedsFifo(), !is_same);
    related += is_same ? 1 : 0;
  }
  EXPECT_EQ(related, 4);
  // The same ratio through either input, at another gap: of 5 and of 25/4 ns.
  EXPECT_EQ(relations.all[0].gaps.rise_rise, Rational(5));
  const Relation& last = relations.all.back();
  EXPECT_EQ(last.from, 3U);
  EXPECT_EQ(last.to, 2U);
  EXPECT_EQ(last.ratio, Rational(1, 2));
  EXPECT_EQ(last.gaps.rise_rise, Rational(25, 4));
}

}  // namespace
}  // namespace planner::relations
