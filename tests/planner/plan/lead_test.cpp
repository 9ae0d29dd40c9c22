// What ranks first, found by itself, against that of whole plans, on drawn requests.
#include "planner/plan/Lead.h"

#include <gtest/gtest.h>

#include <array>
#include <map>
#include <string>

#include "planner/plan/Plan.h"
#include "planner/report/Json.h"
#include "tests/planner/search/drawn.h"

namespace planner::plan {
namespace {

// Of an unsolved plan the primitives with their reasons.
std::string FirstOf(const Plan& plan, const Device& device) {
  if (plan.IsSolved()) {
    return report::JsonLine(plan.request, device, report::PlanEntries(plan, 1));
  }
  return std::to_string(plan.refused.size()) + " refused";
}

TEST(Lead, IsTheFirstOfTheWholePlan) {
  constexpr std::array<Rank, 4> kRanks = {Rank::kJitter, Rank::kError, Rank::kMargin, Rank::kVco};
  const std::array<Device, 3> devices = {drawn::Bundled("vk10", "1"), drawn::Bundled("vk20", "2"),
                                         drawn::Bundled("vk40", "2")};
  std::map<Primitive, int> leads;
  int met = 0;
  int missed = 0;
  for (unsigned seed = 0; seed < 240; ++seed) {
    drawn::Random random(seed);
    const Device& device = devices[seed % devices.size()];
    const Primitive primitive = device.primitives[seed / 3 % device.primitives.size()];
    Request request = drawn::RequestFor(random, device, primitive, drawn::Input(random), 4);
    request.primitive.reset();
    request.rank = random.OneIn(2) ? Rank::kJitter : kRanks[seed % kRanks.size()];
    request.any_order = random.OneIn(12);
    const Plan whole = Make(request, device);
    const Plan first = Make(request, device, {.first_only = true});
    ASSERT_EQ(FirstOf(first, device), FirstOf(whole, device))
        << "request " << seed << ": " << drawn::TextOf(request);
    if (!whole.IsSolved()) continue;
    ++leads[whole.ranked.front().primitive];
    ++(whole.ranked.front().within ? met : missed);
  }
  // All there is to tell apart has been met.
  EXPECT_EQ(leads.size(), hardware::kPrimitives.size());
  EXPECT_GT(met, 40);
  EXPECT_GT(missed, 40);
}

// 27 MHz to 148.5: 44 x 27 = 1188 MHz is in the range of a TSYN alone, whose jitter is the least.
// Only what meets the demands is looked for.
TEST(Lead, HasWhatMeetsTheDemandsAlone) {
  const Device device = drawn::Bundled("vk40", "2");
  Request request;
  request.inputs = {27};
  request.outputs.resize(1);
  request.outputs[0].frequency = {297, 2};
  const auto lead = LeadOf(request, device, device.primitives);
  ASSERT_TRUE(lead);
  EXPECT_EQ(lead->primitive, Primitive::kTsyn);
  ASSERT_FALSE(lead->found.best.empty());
  for (const search::Candidate& candidate : lead->found.best) EXPECT_TRUE(candidate.within);
}

TEST(Lead, IsLeftToWholePlansWhereItCannotTell) {
  const Device device = drawn::Bundled("vk40", "2");
  Request request;
  request.inputs = {27};
  request.outputs.resize(1);
  request.outputs[0].frequency = 27;
  EXPECT_TRUE(LeadOf(request, device, device.primitives));
  for (const Rank rank : {Rank::kMargin, Rank::kVco}) {
    request.rank = rank;
    EXPECT_FALSE(LeadOf(request, device, device.primitives));
  }
  request.rank = Rank::kError;
  EXPECT_TRUE(LeadOf(request, device, device.primitives));
  request.any_order = true;
  EXPECT_FALSE(LeadOf(request, device, device.primitives));
  request.any_order = false;
  request.engine_only = true;
  EXPECT_FALSE(LeadOf(request, device, device.primitives));
}

}  // namespace
}  // namespace planner::plan
