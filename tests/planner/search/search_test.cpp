// The search against the plain enumeration.
//
// VORKEL_TEST_LONG in the environment asks for the long comparison, on the bundled devices.
#include "planner/search/Search.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <optional>
#include <string>
#include <tuple>
#include <vector>

#include "drawn.h"
#include "hardware/Primitive.h"
#include "plain_enumeration.h"
#include "planner/answer/Evaluate.h"
#include "planner/search/KruTask.h"
#include "tests/planner/primitive_names.h"

namespace planner::search {
namespace {

using drawn::Random;
using hardware::Rational;

std::string TextOf(const Settings& settings) {
  std::string text;
  if (const auto* const loop = std::get_if<LoopSettings>(&settings)) {
    text = std::string(Name(loop->bandwidth)) + " M " + std::to_string(loop->m) + "/8 D " +
           std::to_string(loop->d);
    for (const LoopOutput& output : loop->outputs) {
      text += " (" + std::to_string(output.divider) + "/8 " + std::to_string(output.phase) + " " +
              std::to_string(output.high_time) + ")";
    }
    return text;
  }
  const auto& kru = std::get<KruSettings>(settings);
  text = std::string(kru.feedback ? "feedback " : "") + (kru.divide_by_2 ? "by 2 " : "") + "M " +
         std::to_string(kru.m) + " D " + std::to_string(kru.d) + " divide " +
         std::to_string(kru.divide_halves) + "/2 shift " + std::to_string(kru.phase_shift);
  for (const hardware::Pin pin : kru.pins) text += " " + std::to_string(static_cast<int>(pin));
  return text;
}

// That a candidate is the one that the plain enumeration has.
void ExpectSame(const Candidate& candidate, const plain::Ranked& expected) {
  EXPECT_EQ(TextOf(candidate.settings), TextOf(expected.settings));
  EXPECT_EQ(candidate.within, expected.key.rank_class == answer::Class::kMet);
  EXPECT_EQ(candidate.worst_error, expected.key.worst_error);
  EXPECT_EQ(candidate.max_jitter.value_or(answer::kUnknownJitter), expected.key.jitter);
}

// That the judge of answers has the same keys.
void ExpectJudged(const Request& request, const Device& device, const plain::Ranked& ranked) {
  const Answer answer = answer::Evaluate(request, device, ranked.settings, {});
  const answer::RankKey key = answer::KeyOf(answer);
  EXPECT_EQ(key.rank_class, ranked.key.rank_class);
  EXPECT_EQ(key.worst_error, ranked.key.worst_error);
  EXPECT_EQ(key.jitter, ranked.key.jitter);
  EXPECT_EQ(key.margin, ranked.key.margin);
  EXPECT_EQ(key.vco, ranked.key.vco);
}

void ExpectAgreement(const Request& request, const Device& device, Primitive primitive,
                     plain::Effort effort) {
  SCOPED_TRACE(std::string(Name(primitive)) + " " + drawn::TextOf(request));
  const plain::Found expected = plain::Enumerate(request, device, primitive, effort);
  const Found found = Search(request, device, primitive);
  EXPECT_TRUE(found.complete);
  ASSERT_EQ(found.best.size(), expected.best.size());
  for (std::size_t i = 0; i < found.best.size(); ++i) {
    ExpectSame(found.best[i], expected.best[i]);
    ExpectJudged(request, device, expected.best[i]);
  }
  ASSERT_EQ(found.front.size(), expected.front.size());
  for (std::size_t i = 0; i < found.front.size(); ++i) {
    SCOPED_TRACE("trade-off " + std::to_string(i));
    ExpectSame(found.front[i], expected.front[i]);
    if (i < 3) ExpectJudged(request, device, expected.front[i]);
  }
}

// What has been drawn, to see that all kinds of results come up.
struct Tally {
  int none = 0;
  int met = 0;
  int missed = 0;
  void Count(const Found& found) {
    if (found.best.empty()) {
      ++none;
    } else {
      ++(found.best.front().within ? met : missed);
    }
  }
};

void CompareOnSmallDevices(Primitive primitive, int requests, int most_outputs) {
  Random random(static_cast<std::uint64_t>(primitive) + 1);
  Tally tally;
  for (int i = 0; i < requests && !testing::Test::HasFailure(); ++i) {
    SCOPED_TRACE("request " + std::to_string(i));
    const Rational input = drawn::Input(random);
    const Device device = drawn::SmallDevice(random, primitive, input);
    const Request request = drawn::RequestFor(random, device, primitive, input, most_outputs);
    ExpectAgreement(request, device, primitive, plain::Effort::kAll);
    tally.Count(Search(request, device, primitive));
  }
  EXPECT_GE(tally.met, requests / 8);
  EXPECT_GT(tally.missed, requests / 8);
}

// With inputs that can be off, of which the plain enumeration tries both ends.
TEST(SearchSmall, InputsThatCanBeOffKeepAllLimits) {
  Random random(77);
  int changed = 0;
  for (int i = 0; i < 60 && !testing::Test::HasFailure(); ++i) {
    SCOPED_TRACE("request " + std::to_string(i));
    const Primitive primitive = hardware::kPrimitives[static_cast<std::size_t>(i) % 4];
    const Rational input = drawn::Input(random);
    const Device device = drawn::SmallDevice(random, primitive, input);
    Request request = drawn::RequestFor(random, device, primitive, input, 2);
    const Found nominal = Search(request, device, primitive);
    request.input_tolerance =
        random.Pick(std::vector<Rational>{50, 1000, 20000, Rational(100000, 3), 100000});
    ExpectAgreement(request, device, primitive, plain::Effort::kAll);
    const Found found = Search(request, device, primitive);
    if (found.best.size() != nominal.best.size() ||
        (!found.best.empty() && found.best[0].settings != nominal.best[0].settings)) {
      ++changed;
    }
  }
  // The tolerance counts.
  EXPECT_GT(changed, 10);
}

bool IsLong() { return std::getenv("VORKEL_TEST_LONG") != nullptr; }

// On the bundled devices, all of whose settings are tried. `requests` of each primitive that they
// have.
void CompareOnBundledDevices(Primitive primitive, int requests) {
  struct Grade {
    const char* name;
    const char* grade;
  };
  constexpr Grade kGrades[] = {{"vk40", "2"}, {"vk40", "1"}, {"vk20", "2"}, {"vk10", "1"}};
  std::vector<Device> devices;
  for (const Grade& one : kGrades) {
    Device device = drawn::Bundled(one.name, one.grade);
    if (device.Has(primitive)) devices.push_back(std::move(device));
  }
  Random random(static_cast<std::uint64_t>(primitive) + 50);
  Tally tally;
  for (int i = 0; i < requests && !testing::Test::HasFailure(); ++i) {
    SCOPED_TRACE("request " + std::to_string(i));
    const Device& device = devices[static_cast<std::size_t>(i) % devices.size()];
    const Request request = drawn::RequestFor(random, device, primitive, drawn::Input(random),
                                              hardware::MostOutputs(primitive));
    ExpectAgreement(request, device, primitive, plain::Effort::kLess);
    tally.Count(Search(request, device, primitive));
  }
  EXPECT_GT(tally.met, requests / 30);
  EXPECT_GT(tally.missed, requests / 30);
}

// To try all settings of a KRU takes seconds.
int RequestsOf(Primitive primitive) { return hardware::IsLoop(primitive) ? 4900 : 100; }

class LongSearch : public testing::TestWithParam<Primitive> {
 protected:
  void SetUp() override {
    if (!IsLong()) GTEST_SKIP() << "only with VORKEL_TEST_LONG in the environment";
  }
};
TEST_P(LongSearch, AgreesOnBundledDevices) {
  CompareOnBundledDevices(GetParam(), RequestsOf(GetParam()));
}
INSTANTIATE_TEST_SUITE_P(Primitives, LongSearch,
                         testing::Values(Primitive::kPll, Primitive::kTsyn, Primitive::kKruSp,
                                         Primitive::kKruClkgen));

// CLKFX at 800 MHz is above what the jitter model knows, and CLKFXDV makes 50 MHz of it. A jitter that
// is not known is no error, and one that is known is above 1 ps, with any M and D.
TEST(Search, AnUnknownJitterIsNoError) {
  const Device device = drawn::Bundled("vk40", "2");
  Request request;
  request.inputs = {100};
  request.outputs.resize(2);
  request.outputs[0].used = false;
  request.outputs[1].frequency = 50;
  request.outputs[1].max_jitter = 1;
  const Found found = Search(request, device, Primitive::kKruClkgen);
  ASSERT_EQ(found.best.size(), 1u);
  EXPECT_FALSE(found.best[0].within);
  EXPECT_EQ(found.best[0].worst_error, Rational(0));
  EXPECT_EQ(found.best[0].max_jitter, std::nullopt);
}

// CLKFX goes from 5 to 400 MHz, so of the frequencies around 77 MHz the slowest has the largest
// margin. Within 5 percent that is the smallest M / D from 3.6575 on: with M and D up to 32 it is 11 / 3,
// with both up to 256 139 / 38. Settings with smaller errors come first in the search.
TEST(Search, TheWidestMarginOfAKruIsNotTheFirst) {
  const Device device = drawn::Bundled("vk40", "2");
  Request request;
  request.inputs = {20};
  request.outputs.resize(1);
  request.outputs[0].frequency = 77;
  request.tolerance = 50'000;
  request.rank = Rank::kMargin;
  for (const auto& [primitive, m, d] : {std::tuple{Primitive::kKruSp, 11, 3},
                                        std::tuple{Primitive::kKruClkgen, 139, 38}}) {
    const Found found = Search(request, device, primitive);
    ASSERT_EQ(found.best.size(), 1u);
    EXPECT_TRUE(found.best[0].within);
    const auto& settings = std::get<KruSettings>(found.best[0].settings);
    EXPECT_EQ(settings.m, m);
    EXPECT_EQ(settings.d, d);
  }
}

// 80 from 100 MHz is a fifth off 100, which are 2,000 of the usual 100 ppm.
TEST(KruTask, IsExactAboutAnErrorFromElsewhere) {
  const Device device = drawn::Bundled("vk40", "2");
  Request request;
  request.inputs = {100};
  request.outputs.resize(1);
  request.outputs[0].frequency = 100;
  KruTask task(request, device, Primitive::kKruSp);
  const KruError off = task.FrequencyError(0, {4, 5});
  EXPECT_EQ(task.Exact(off), Rational(2000));
  constexpr std::int64_t kFine = 1 << 30;
  const KruError above = task.JustAbove(2000);
  EXPECT_EQ(task.Exact(above), Rational(2000) + Rational(2001, kFine));
  EXPECT_TRUE(task.Compare(above, off) > 0);
  EXPECT_TRUE(task.Compare(above, above) == 0);
}

TEST(Search, AgreesOnSmallPlls) { CompareOnSmallDevices(Primitive::kPll, 150, 4); }
TEST(Search, AgreesOnSmallTsyns) { CompareOnSmallDevices(Primitive::kTsyn, 120, 4); }
TEST(Search, AgreesOnSmallKruSps) { CompareOnSmallDevices(Primitive::kKruSp, 40, 2); }
TEST(Search, AgreesOnSmallKruClkgens) { CompareOnSmallDevices(Primitive::kKruClkgen, 60, 3); }

}  // namespace
}  // namespace planner::search
