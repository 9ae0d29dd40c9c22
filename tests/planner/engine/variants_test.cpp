#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "planner/engine/Ask.h"
#include "tests/planner/engine/devices.h"

namespace {

using engine_test::Ask;
using engine_test::Out;
using hardware::Bandwidth;
using hardware::Primitive;
using planner::Request;
using planner::engine::Variant;
using planner::engine::Variants;
using testing::ElementsAre;

std::vector<std::string> Names(const Request& request, Primitive primitive) {
  std::vector<std::string> names;
  for (const Variant& variant : Variants(request, primitive)) {
    names.push_back(variant.name + "/" + std::string(hardware::Name(variant.bandwidth)));
  }
  return names;
}

TEST(Variants, OfALoopAreAllSearchesWithAllBandwidths) {
  EXPECT_THAT(Names(Ask({100}, {Out(100)}), Primitive::kPll),
              ElementsAre("smallest VCO/OPTIMIZED", "smallest VCO/LOW", "smallest VCO/HIGH",
                          "largest VCO/OPTIMIZED", "largest VCO/LOW", "largest VCO/HIGH"));
}

TEST(Variants, KeepToTheBandwidthThatIsNamed) {
  Request request = Ask({100}, {Out(100)});
  request.bandwidth = Bandwidth::kLow;
  EXPECT_THAT(Names(request, Primitive::kTsyn),
              ElementsAre("smallest VCO/LOW", "target VCO/LOW", "largest VCO/LOW",
                          "integer divider 0/LOW"));
}

TEST(Variants, AreWhatTheirNamesSay) {
  Request request = Ask({100}, {Out(100)});
  request.bandwidth = Bandwidth::kHigh;
  const auto tsyn = Variants(request, Primitive::kTsyn);
  ASSERT_EQ(tsyn.size(), 4u);
  EXPECT_EQ(tsyn[0], (Variant{.name = "smallest VCO", .bandwidth = Bandwidth::kHigh}));
  EXPECT_EQ(tsyn[1], (Variant{.name = "target VCO", .bandwidth = Bandwidth::kHigh,
                              .closest = true}));
  EXPECT_EQ(tsyn[2], (Variant{.name = "largest VCO", .bandwidth = Bandwidth::kHigh,
                              .closest = true, .prefer_max_vco = true}));
  EXPECT_EQ(tsyn[3], (Variant{.name = "integer divider 0", .bandwidth = Bandwidth::kHigh,
                              .whole_divider_0 = true}));
}

// With a phase or a duty cycle the VCO of a TSYN is the one next to the target.
TEST(Variants, OfATsynWithPhasesHaveNoSmallestVco) {
  Request request = Ask({100}, {Out(100), Out(50, 90)});
  request.bandwidth = Bandwidth::kHigh;
  EXPECT_THAT(Names(request, Primitive::kTsyn),
              ElementsAre("target VCO/HIGH", "largest VCO/HIGH", "integer divider 0/HIGH"));
  EXPECT_THAT(Names(request, Primitive::kPll),
              ElementsAre("smallest VCO/HIGH", "largest VCO/HIGH"));
  // What an output that is not used says does not count.
  request.outputs[1].used = false;
  EXPECT_EQ(Names(request, Primitive::kTsyn).size(), 4u);
}

TEST(Variants, DoNotContradictSwitches) {
  Request request = Ask({100}, {Out(100)});
  request.bandwidth = Bandwidth::kHigh;
  request.prefer_max_vco = true;
  EXPECT_THAT(Names(request, Primitive::kPll), ElementsAre("largest VCO/HIGH"));
  EXPECT_THAT(Names(request, Primitive::kTsyn), ElementsAre("largest VCO/HIGH"));
  request.whole_divider_0 = true;
  for (const Variant& variant : Variants(request, Primitive::kTsyn)) {
    EXPECT_TRUE(variant.whole_divider_0);
  }
}

TEST(Variants, OfAKruAreItsFeedbacks) {
  Request request = Ask({100}, {Out(100)});
  EXPECT_THAT(Variants(request, Primitive::kKruSp),
              ElementsAre(Variant{.name = "feedback", .feedback = true},
                          Variant{.name = "no feedback", .feedback = false}));
  EXPECT_THAT(Variants(request, Primitive::kKruClkgen), ElementsAre(Variant{}));
  request.feedback = true;
  EXPECT_THAT(Variants(request, Primitive::kKruSp),
              ElementsAre(Variant{.name = "feedback", .feedback = true}));
}

TEST(AsRequested, IsTheRequestAsItStands) {
  Request request = Ask({100}, {Out(100)});
  EXPECT_EQ(planner::engine::AsRequested(request), Variant{});
  request.bandwidth = Bandwidth::kLow;
  request.prefer_max_vco = true;
  request.whole_divider_0 = true;
  request.feedback = true;
  EXPECT_EQ(planner::engine::AsRequested(request),
            (Variant{.bandwidth = Bandwidth::kLow, .prefer_max_vco = true,
                     .whole_divider_0 = true, .feedback = true}));
}

}  // namespace
