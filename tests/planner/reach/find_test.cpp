#include "planner/reach/Find.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <vector>

#include "plain_reach.h"
#include "tests/planner/search/drawn.h"

namespace planner::reach {
namespace {

const Range kAll = {0, 1'000'000};

struct Case {
  Device device;
  Request request;
  Primitive primitive;
};

// Some small devices of each primitive.
std::vector<Case> Cases() {
  drawn::Random random(31);
  std::vector<Case> cases;
  for (const Primitive primitive : hardware::kPrimitives) {
    for (int i = 0; i < 3; ++i) {
      Request request;
      request.inputs = {drawn::Input(random)};
      cases.push_back({drawn::SmallDevice(random, primitive, request.inputs[0]), request, primitive});
    }
  }
  return cases;
}

TEST(Find, CountsAreThoseOfPlainEnumeration) {
  for (const Case& one : Cases()) {
    const Reach reach(one.request, one.device, one.primitive, 0);
    const auto plain = plain::Frequencies(one.request, one.device, one.primitive, 0);
    const Counted counted = Count(reach, kAll);
    ASSERT_EQ(counted.count, static_cast<std::int64_t>(plain.size()));
    ASSERT_EQ(counted.lowest.has_value(), !plain.empty());
    if (plain.empty()) continue;
    EXPECT_EQ(reach.FrequencyOf(*counted.lowest), plain.front());
    EXPECT_EQ(reach.FrequencyOf(*counted.highest), plain.back());
    EXPECT_EQ(Count(reach, {plain.back() + 1, plain.back() + 2}).count, 0);
  }
}

// All gaps, sorted.
TEST(Find, LargestGaps) {
  for (const Case& one : Cases()) {
    const Reach reach(one.request, one.device, one.primitive, 0);
    const auto plain = plain::Frequencies(one.request, one.device, one.primitive, 0);
    std::vector<std::pair<Rational, Rational>> gaps;
    for (std::size_t i = 1; i < plain.size(); ++i) gaps.emplace_back(plain[i - 1], plain[i]);
    std::stable_sort(gaps.begin(), gaps.end(), [](const auto& a, const auto& b) {
      return b.second - b.first < a.second - a.first;
    });
    for (const std::size_t most : {0, 1, 5, 100}) {
      const std::vector<Gap> found = LargestGaps(reach, kAll, most);
      ASSERT_EQ(found.size(), std::min(most, gaps.size()));
      for (std::size_t i = 0; i < found.size(); ++i) {
        ASSERT_EQ(reach.FrequencyOf(found[i].below), gaps[i].first);
        ASSERT_EQ(reach.FrequencyOf(found[i].above), gaps[i].second);
      }
    }
  }
}

// A frequency that there is, one halfway between two, others, and some far outside.
TEST(Find, Nearest) {
  for (const Case& one : Cases()) {
    const Reach reach(one.request, one.device, one.primitive, 0);
    auto plain = plain::Frequencies(one.request, one.device, one.primitive, 0);
    if (plain.size() < 3) continue;
    const Range range = {plain[1], 1'000'000};
    const std::vector<Rational> asked = {plain[plain.size() / 2],
                                         (plain[1] + plain[2]) / 2,
                                         (plain.front() + 2 * plain.back()) / 3,
                                         Rational(1, 1000),
                                         100'000};
    for (const Rational& frequency : asked) {
      for (const Range& within : {kAll, range}) {
        std::vector<Rational> sorted = plain::Within(plain, within);
        std::stable_sort(sorted.begin(), sorted.end(), [&](const Rational& a, const Rational& b) {
          return (a - frequency).Absolute() < (b - frequency).Absolute();
        });
        for (const std::size_t most : {0, 1, 2, 7, 100'000}) {
          const std::vector<Point> found = Nearest(reach, frequency, within, most);
          ASSERT_EQ(found.size(), std::min(most, sorted.size()));
          for (std::size_t i = 0; i < found.size(); ++i) {
            ASSERT_EQ(reach.FrequencyOf(found[i]), sorted[i]);
          }
        }
      }
    }
  }
}

}  // namespace
}  // namespace planner::reach
