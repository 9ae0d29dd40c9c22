// Tests of the spans of the VCO that outputs leave.
#include "planner/search/VcoSpans.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cmath>

#include "planner/search/SpanStore.h"
#include "tests/compare/Random.h"

namespace planner::search {

void PrintTo(const Span& span, std::ostream* out) {
  *out << span.lowest << " to " << span.highest;
}

namespace {

bool Any(int) { return true; }

MATCHER_P2(IsSpan, lowest, highest, "") {
  // Ends are rounded outwards.
  const auto is_near = [](double a, double b) { return std::fabs(a - b) <= 1e-11 * b; };
  return is_near(arg.lowest, lowest) && is_near(arg.highest, highest) && arg.lowest <= lowest &&
         arg.highest >= highest;
}

// An output that is 30 to 31 with each of the dividers 1 to 10.
constexpr SpanOutput kOutput = {.lowest = 30, .highest = 31, .first = 1, .last = 10, .step = 1};

TEST(VcoSpans, AreThoseOfTheDividersThatReachIn) {
  Spans left;
  Meet({{100, 200}}, kOutput, Any, &left);
  EXPECT_THAT(left, testing::ElementsAre(IsSpan(120, 124), IsSpan(150, 155), IsSpan(180, 186)));
}

TEST(VcoSpans, AreCutWhereASpanEnds) {
  Spans left;
  Meet({{100, 121}, {122, 151}, {186, 200}}, kOutput, Any, &left);
  EXPECT_THAT(left, testing::ElementsAre(IsSpan(120, 121), IsSpan(122, 124), IsSpan(150, 151),
                                         IsSpan(186, 186)));
}

TEST(VcoSpans, AreNoneOfADividerThatIsNotAllowedOrNotThere) {
  Spans left;
  Meet({{100, 400}}, kOutput, [](int divider) { return divider % 2 == 1; }, &left);
  EXPECT_THAT(left,
              testing::ElementsAre(IsSpan(150, 155), IsSpan(210, 217), IsSpan(270, 279)));
}

TEST(VcoSpans, AreOneWhereTheyMeet) {
  Spans left;
  SpanOutput wide = kOutput;
  wide.highest = 45;
  Meet({{50, 130}}, wide, Any, &left);  // 60 to 90, 90 to 135
  EXPECT_THAT(left, testing::ElementsAre(IsSpan(60, 130)));
}

TEST(VcoSpans, HaveNoUpperEndWithoutALowerLimit) {
  Spans left;
  Meet({{0, HUGE_VAL}}, {.lowest = 0, .highest = 31, .first = 2, .last = 3, .step = 1}, Any, &left);
  EXPECT_THAT(left, testing::ElementsAre(IsSpan(0, 93)));
}

TEST(VcoSpans, InCommonAreThoseThatWouldBeMetOneAfterTheOther) {
  compare::Random random(1);
  for (int i = 0; i < 2000; ++i) {
    Spans spans;
    double place = 0;
    for (int k = random.Int(0, 5); k > 0; --k) {
      const double lowest = place + random.Real(1, 300);
      place = lowest + random.Real(0, 100);
      spans.push_back({lowest, place});
    }
    const double lowest = random.Real(10, 60);
    const SpanOutput output = {.lowest = lowest,
                               .highest = lowest * random.Real(1, 1.2),
                               .first = 2,
                               .last = random.Int(2, 60),
                               .step = 2};
    const auto is_allowed = [](int divider) { return divider % 3 != 0; };
    Spans met;
    Meet(spans, output, is_allowed, &met);
    Spans all;
    Meet({{0, HUGE_VAL}}, output, is_allowed, &all);
    Spans common;
    Common(spans, all, &common);
    ASSERT_EQ(common.size(), met.size());
    for (std::size_t k = 0; k < met.size(); ++k) {
      EXPECT_EQ(common[k].lowest, met[k].lowest);
      EXPECT_EQ(common[k].highest, met[k].highest);
    }
  }
}

TEST(SpanStore, KeepsWhatIsAskedForTwice) {
  SpanStore store;
  int made = 0;
  const auto make = [&] {
    ++made;
    return Spans{{1, 2}};
  };
  const SpanCase one{};
  SpanCase other{};
  other.moves = true;
  EXPECT_EQ(store.Of(one, false, make), nullptr);
  EXPECT_EQ(store.Of(other, false, make), nullptr);
  EXPECT_EQ(made, 0);
  const SpanStore::Kept kept = store.Of(one, false, make);
  ASSERT_NE(kept, nullptr);
  EXPECT_THAT(*kept, testing::ElementsAre(IsSpan(1, 2)));
  EXPECT_EQ(store.Of(one, false, make), kept);
  EXPECT_EQ(made, 1);
  EXPECT_NE(store.Of(other, false, make), kept);
  EXPECT_EQ(made, 2);
}

TEST(SpanStore, HasManyTheFirstTime) {
  SpanStore store;
  const SpanStore::Kept kept = store.Of({}, true, [] { return Spans{{1, 2}}; });
  ASSERT_NE(kept, nullptr);
  EXPECT_THAT(*kept, testing::ElementsAre(IsSpan(1, 2)));
}

TEST(SpanStore, TellsAllCasesApart) {
  SpanStore store;
  for (int round = 0; round < 2; ++round) {
    for (std::size_t i = 0; i < 256; ++i) {
      const auto bit = [i](int n) { return (i >> n & 1) != 0; };
      const SpanCase one = {.frequency = bit(0), .phase = bit(1),
                            .duty = bit(2), .range = bit(3), .dividers = bit(4),
                            .second_input = bit(5), .moves = bit(6), .in_eighths = bit(7)};
      const double number = static_cast<double>(i);
      const SpanStore::Kept kept = store.Of(one, false, [&] { return Spans{{number, number}}; });
      ASSERT_EQ(kept == nullptr, round == 0);
      if (kept) {
        ASSERT_EQ(kept->front().lowest, number);
      }
    }
  }
}

}  // namespace
}  // namespace planner::search
