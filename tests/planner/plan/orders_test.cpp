#include "planner/plan/Orders.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <numeric>
#include <set>

#include "tests/planner/answer/answer_support.h"

namespace planner::plan {

namespace {

using namespace answer_test;  // NOLINT: requests and a device
using Orders = std::vector<answer::PlaceOrder>;

Orders Of(const Request& request, Primitive primitive) {
  return OrdersOf(request, HandMade(), primitive);
}

TEST(OrdersOf, WhoIsOnOutput1OfAPll) {
  EXPECT_EQ(Of(Ask({100}, {10, 20, 30, 40}), Primitive::kPll),
            (Orders{{0, 1, 2, 3}, {1, 0, 2, 3}, {0, 2, 1, 3}, {0, 3, 2, 1}}));
  EXPECT_EQ(Of(Ask({100}, {10}), Primitive::kPll), (Orders{{0}}));
  Device device = HandMade();
  device.pll->output_1 = device.pll->output;
  EXPECT_EQ(OrdersOf(Ask({100}, {10, 20}), device, Primitive::kPll), (Orders{{0, 1}}));
}

TEST(OrdersOf, WhoHasTheFractionOfATsyn) {
  Request request = Ask({100}, {10, 20, 30});
  EXPECT_EQ(Of(request, Primitive::kTsyn), (Orders{{0, 1, 2}, {1, 0, 2}, {2, 1, 0}}));
  request.whole_divider_0 = true;
  EXPECT_EQ(Of(request, Primitive::kTsyn), (Orders{{0, 1, 2}}));
  EXPECT_EQ(Of(Ask({100}, {1, 2, 3, 4, 5, 6}), Primitive::kTsyn), (Orders{{0, 1, 2, 3, 4, 5}}));
}

TEST(OrdersOf, WhoIsOnClkfxOfAClkgen) {
  EXPECT_EQ(Of(Ask({100}, {10, 20}), Primitive::kKruClkgen), (Orders{{0, 1}, {1, 0}}));
}

TEST(OrdersOf, FromWhomTheFeedbackOfAKruIs) {
  EXPECT_EQ(Of(Ask({100}, {10, 20}), Primitive::kKruSp), (Orders{{0, 1}, {1, 0}}));
  Device device = HandMade();
  device.kru_sp->doubled = device.kru_sp->usual;
  EXPECT_EQ(OrdersOf(Ask({100}, {10, 20}), device, Primitive::kKruSp), (Orders{{0, 1}}));
}

TEST(OrdersOf, OutputsWithTheSameDemandsAreNotToldApart) {
  Request request = Ask({100}, {10, 10, 20});
  EXPECT_EQ(Of(request, Primitive::kPll), (Orders{{0, 1, 2}, {0, 2, 1}}));
  request.outputs[0].phase = 0;
  EXPECT_EQ(Of(request, Primitive::kPll), (Orders{{0, 1, 2}, {1, 0, 2}, {0, 2, 1}}));
}

TEST(OrdersOf, AnEmptyPlaceCanBeTaken) {
  Request request = Ask({100}, {10, 20, 30});
  request.outputs[1] = Unused();
  request.outputs[2] = Unused();
  request.outputs[2].frequency = 7;  // does not count
  EXPECT_EQ(Of(request, Primitive::kPll), (Orders{{0, 1, 2}, {1, 0, 2}}));
}

// Every order of the outputs is one of these, but for places that are alike: here, all from 2.
TEST(OrdersOf, AreAllThatDiffer) {
  Device device = HandMade();
  device.tsyn->output_1 = {4, 900};
  const Request request = Ask({100}, {10, 20, 30, 40, 50});
  const Orders orders = OrdersOf(request, device, Primitive::kTsyn);
  std::set<std::pair<int, int>> found;
  for (const answer::PlaceOrder& order : orders) {
    EXPECT_TRUE(std::is_permutation(order.begin(), order.end(), orders[0].begin()));
    EXPECT_TRUE(found.insert({order[0], order[1]}).second);
    // Whoever did not have to go is at the own place.
    for (int place = 2; place < 5; ++place) {
      if (order[0] != place && order[1] != place) {
        EXPECT_EQ(order[static_cast<std::size_t>(place)], place);
      }
    }
  }
  answer::PlaceOrder all(5);
  std::iota(all.begin(), all.end(), 0);
  EXPECT_EQ(orders[0], all);
  do {
    EXPECT_EQ(found.count({all[0], all[1]}), 1u);
  } while (std::next_permutation(all.begin(), all.end()));
  EXPECT_EQ(orders.size(), 20u);
}

}  // namespace

}  // namespace planner::plan
