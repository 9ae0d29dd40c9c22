// Tests of the Pareto front of a search, against comparing each entry with each other.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <limits>

#include "planner/search/TradeOffs.h"
#include "tests/compare/Random.h"

namespace planner::search {
namespace {

struct Entry {
  double jitter;
  int error;
  int number;  // of two that are equal in both the smaller one is kept
  bool operator==(const Entry&) const = default;
};

void PrintTo(const Entry& entry, std::ostream* out) {
  *out << "jitter " << entry.jitter << ", error " << entry.error << ", number " << entry.number;
}

std::strong_ordering CompareErrors(const Entry& a, const Entry& b) { return a.error <=> b.error; }
bool IsBefore(const Entry& a, const Entry& b) { return a.number < b.number; }

std::vector<Entry> FrontOf(const std::vector<Entry>& entries) {
  TradeOffs<Entry> front;
  for (const Entry& entry : entries) front.Take(entry, CompareErrors, IsBefore);
  return front.Entries();
}

// Whether `a` leaves `b` out.
bool Excludes(const Entry& a, const Entry& b) {
  if (a.jitter > b.jitter || a.error > b.error) return false;
  return a.jitter < b.jitter || a.error < b.error || a.number < b.number;
}

std::vector<Entry> PlainFront(const std::vector<Entry>& entries) {
  std::vector<Entry> front;
  for (const Entry& entry : entries) {
    const bool is_out = std::any_of(entries.begin(), entries.end(), [&entry](const Entry& other) {
      return Excludes(other, entry);
    });
    if (!is_out) front.push_back(entry);
  }
  std::sort(front.begin(), front.end(),
            [](const Entry& a, const Entry& b) { return a.error < b.error; });
  return front;
}

constexpr Entry kMiddle = {50, 5, 10};

TEST(TradeOffs, ThatAreNoneBecomeOne) {
  EXPECT_TRUE(FrontOf({}).empty());
  EXPECT_THAT(FrontOf({kMiddle}), testing::ElementsAre(kMiddle));
}

TEST(TradeOffs, WhatIsBetterInOneStandsBeside) {
  const Entry less_jitter = {40, 6, 11};
  const Entry less_error = {60, 4, 12};
  EXPECT_THAT(FrontOf({kMiddle, less_jitter, less_error}),
              testing::ElementsAre(less_error, kMiddle, less_jitter));
  EXPECT_THAT(FrontOf({less_error, less_jitter, kMiddle}),
              testing::ElementsAre(less_error, kMiddle, less_jitter));
}

TEST(TradeOffs, WhatIsWorseInOneAndNotBetterInTheOtherIsLeftOut) {
  for (const Entry& other : {Entry{50, 6, 1}, Entry{51, 5, 1}, Entry{51, 6, 1}}) {
    EXPECT_THAT(FrontOf({kMiddle, other}), testing::ElementsAre(kMiddle));
    EXPECT_THAT(FrontOf({other, kMiddle}), testing::ElementsAre(kMiddle));
  }
}

TEST(TradeOffs, OfTwoThatAreEqualInBothThatBeforeIsKept) {
  const Entry before = {50, 5, 9};
  EXPECT_THAT(FrontOf({kMiddle, before}), testing::ElementsAre(before));
  EXPECT_THAT(FrontOf({before, kMiddle}), testing::ElementsAre(before));
}

TEST(TradeOffs, OneCanTakeThePlaceOfMany) {
  const std::vector<Entry> entries = {{90, 1, 0}, {80, 2, 0}, {70, 3, 0}, {60, 4, 0}};
  std::vector<Entry> all = entries;
  all.push_back({70, 2, 5});
  EXPECT_THAT(FrontOf(all), testing::ElementsAre(entries[0], Entry{70, 2, 5}, entries[3]));
  all.push_back({60, 1, 6});
  EXPECT_THAT(FrontOf(all), testing::ElementsAre(Entry{60, 1, 6}));
}

TEST(TradeOffs, AnUnknownJitterIsTheLargest) {
  const Entry unknown = {std::numeric_limits<double>::infinity(), 4, 1};
  EXPECT_THAT(FrontOf({unknown, kMiddle}), testing::ElementsAre(unknown, kMiddle));
  const Entry worse = {std::numeric_limits<double>::infinity(), 5, 1};
  EXPECT_THAT(FrontOf({worse, kMiddle}), testing::ElementsAre(kMiddle));
}

TEST(TradeOffs, CanBeginAgain) {
  TradeOffs<Entry> front;
  front.Take(kMiddle, CompareErrors, IsBefore);
  front.Clear();
  EXPECT_TRUE(front.Entries().empty());
  const Entry worse = {51, 6, 1};
  front.Take(worse, CompareErrors, IsBefore);
  EXPECT_THAT(front.Entries(), testing::ElementsAre(worse));
}

// Few jitters and errors, so that many are the same. After each entry, not only at the end.
TEST(TradeOffs, AreWhatNoOtherLeavesOut) {
  compare::Random random(1);
  std::size_t largest = 0;
  for (int i = 0; i < 400; ++i) {
    const int values = random.Int(2, 20);
    TradeOffs<Entry> front;
    std::vector<Entry> all;
    for (int n = random.Int(1, 30); n > 0; --n) {
      // No two have the same number.
      const int number = static_cast<int>(all.size()) * 2 % 31;
      const int error = random.Int(0, values);
      // In half of the cases most stand beside each other.
      const int jitter = i % 2 == 0 ? random.Int(0, values) : values - error + random.Int(0, 2);
      all.push_back({static_cast<double>(jitter), error, number});
      front.Take(all.back(), CompareErrors, IsBefore);
      ASSERT_EQ(front.Entries(), PlainFront(all)) << i;
    }
    largest = std::max(largest, front.Entries().size());
  }
  EXPECT_GE(largest, 7u);
}

}  // namespace
}  // namespace planner::search
