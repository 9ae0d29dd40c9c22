// The search against the plain enumeration.
//
// VORKEL_TEST_LONG in the environment asks for the long comparison, on the bundled devices.
#include "planner/search/Search.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <string>
#include <vector>

#include "drawn.h"
#include "hardware/Primitive.h"
#include "plain_enumeration.h"
#include "planner/answer/Evaluate.h"

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
  EXPECT_GE(tally.met, requests / 30);
  EXPECT_GT(tally.missed, requests / 30);
}

TEST(Search, AgreesOnSmallPlls) { CompareOnSmallDevices(Primitive::kPll, 150, 4); }
TEST(Search, AgreesOnSmallTsyns) { CompareOnSmallDevices(Primitive::kTsyn, 150, 4); }
TEST(Search, AgreesOnSmallKruSps) { CompareOnSmallDevices(Primitive::kKruSp, 40, 2); }
TEST(Search, AgreesOnSmallKruClkgens) { CompareOnSmallDevices(Primitive::kKruClkgen, 40, 3); }

}  // namespace
}  // namespace planner::search
