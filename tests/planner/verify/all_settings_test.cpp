// All settings, tried one by one, against the search: two programs that share nothing but the
// formulas of the hardware have to find the same.
#include "planner/verify/AllSettings.h"

#include <gtest/gtest.h>

#include "../search/drawn.h"
#include "planner/search/Search.h"
#include "tests/planner/primitive_names.h"

namespace planner::verify {

namespace {

using compare::Random;

void ExpectSame(const Request& request, const planner::Device& device, Primitive primitive) {
  const search::Found found = search::Search(request, device, primitive);
  const BestSettings best = BestOf(request, device, primitive);
  std::vector<Settings> own;
  for (const auto& one : best.OfKinds()) {
    if (one) own.push_back(one->settings);
  }
  ASSERT_EQ(own.size(), found.best.size()) << drawn::TextOf(request);
  for (std::size_t i = 0; i < own.size(); ++i) {
    EXPECT_EQ(own[i], found.best[i].settings) << drawn::TextOf(request) << " best " << i;
  }
  ASSERT_EQ(best.AllTradeoffs().size(), found.front.size()) << drawn::TextOf(request);
  for (std::size_t i = 0; i < found.front.size(); ++i) {
    EXPECT_EQ(best.AllTradeoffs()[i].settings, found.front[i].settings)
        << drawn::TextOf(request) << " trade-off " << i;
    EXPECT_EQ(best.AllTradeoffs()[i].figures.worst_error, found.front[i].worst_error);
  }
}

class AllSettings : public testing::TestWithParam<Primitive> {};

TEST_P(AllSettings, OfDrawnDevices) {
  Random random(hardware::IsLoop(GetParam()) ? 71 : 72);
  const int count = hardware::IsLoop(GetParam()) ? 40 : 6;
  for (int i = 0; i < count; ++i) {
    const auto input = drawn::Input(random);
    const planner::Device device = drawn::SmallDevice(random, GetParam(), input);
    ExpectSame(drawn::RequestFor(random, device, GetParam(), input, 4), device, GetParam());
  }
}

INSTANTIATE_TEST_SUITE_P(Of, AllSettings, testing::ValuesIn(hardware::kPrimitives),
                         [](const auto& one) { return std::string(Name(one.param)); });

}  // namespace

}  // namespace planner::verify
