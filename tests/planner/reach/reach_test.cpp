#include "planner/reach/Reach.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <string>
#include <vector>

#include "plain_reach.h"
#include "planner/answer/Evaluate.h"
#include "planner/answer/Rank.h"
#include "planner/reach/LoopPoints.h"
#include "planner/search/Search.h"
#include "tests/planner/search/drawn.h"
#include "tests/planner/primitive_names.h"

namespace planner::reach {
namespace {

const Range kAll = {0, 1'000'000};

bool IsLong() { return std::getenv("VORKEL_TEST_LONG") != nullptr; }

std::vector<Point> PointsOf(const Reach& reach, const Range& range = kAll) {
  std::vector<Point> points;
  reach.ForEach(range, [&](const Point& point) {
    points.push_back(point);
    return true;
  });
  return points;
}

std::vector<Rational> FrequenciesOf(const Reach& reach, const Range& range = kAll) {
  std::vector<Rational> frequencies;
  for (const Point& point : PointsOf(reach, range)) {
    frequencies.push_back(reach.FrequencyOf(point));
  }
  return frequencies;
}

// Decimals tell them apart well enough in a message.
std::vector<std::string> Texts(const std::vector<Rational>& frequencies) {
  std::vector<std::string> texts;
  for (const Rational& one : frequencies) {
    texts.push_back(one.NumeratorText() + "/" + one.DenominatorText());
  }
  return texts;
}

Request RequestOf(const Rational& input) {
  Request request;
  request.inputs = {input};
  return request;
}

// Requests that differ in all that counts.
Request Drawn(drawn::Random& random, Primitive primitive, const Rational& input) {
  Request request = RequestOf(input);
  if (hardware::IsLoop(primitive) && random.OneIn(3)) {
    request.inputs.push_back(input * random.Int(98, 102) / 100);
  }
  if (random.OneIn(3)) request.bandwidth = random.Pick(std::vector<Bandwidth>{
      Bandwidth::kOptimized, Bandwidth::kLow, Bandwidth::kHigh});
  request.whole_divider_0 = random.OneIn(4);
  request.feedback = random.OneIn(4);
  if (random.OneIn(3)) request.input_tolerance = random.Int(1, 20'000);
  request.input_jitter = random.OneIn(2) ? 0 : 50;
  return request;
}

class OfPrimitive : public testing::TestWithParam<Primitive> {};
INSTANTIATE_TEST_SUITE_P(All, OfPrimitive, testing::ValuesIn(hardware::kPrimitives),
                         [](const auto& tested) { return std::string(Name(tested.param)); });

// On small devices, with both ends at frequencies, between them, and the wrong way round.
TEST_P(OfPrimitive, IsWhatPlainEnumerationFinds) {
  drawn::Random random(21);
  const int count = IsLong() ? 200 : GetParam() == Primitive::kKruClkgen ? 6 : 12;
  int with_some = 0;
  for (int i = 0; i < count; ++i) {
    const Rational input = drawn::Input(random);
    const Device device = drawn::SmallDevice(random, GetParam(), input);
    const Request request = Drawn(random, GetParam(), input);
    const int most = hardware::MostOutputs(GetParam());
    const int output = random.OneIn(2) ? random.Int(0, 1) : random.Int(0, most - 1);
    const Reach reach(request, device, GetParam(), output);
    const std::vector<Rational> plain = plain::Frequencies(request, device, GetParam(), output);
    ASSERT_EQ(Texts(FrequenciesOf(reach)), Texts(plain)) << drawn::TextOf(request) << output;
    if (plain.empty()) continue;
    ++with_some;
    const auto pick = [&] {
      return plain[static_cast<std::size_t>(random.Int(0, static_cast<int>(plain.size()) - 1))];
    };
    const Rational a = pick();
    const Rational b = random.OneIn(2) ? pick() : pick() + Rational(1, 1'000'000'000);
    for (const Range& range : {Range{a, b}, Range{b, a}, Range{a, a}, Range{a, 1'000'000}}) {
      ASSERT_EQ(Texts(FrequenciesOf(reach, range)), Texts(plain::Within(plain, range)));
    }
    for (const Rational& one : plain) ASSERT_TRUE(reach.range().Contains(one));
  }
  EXPECT_GT(with_some, count / 2);
}

// The settings make the frequency and keep all limits, and they are those that the search over all
// settings ranks first for it.
TEST_P(OfPrimitive, SettingsAreThoseOfThePlan) {
  drawn::Random random(22);
  const int count = IsLong() ? 60 : 6;
  for (int i = 0; i < count; ++i) {
    const Rational input = drawn::Input(random);
    const Device device = drawn::SmallDevice(random, GetParam(), input);
    Request request = Drawn(random, GetParam(), input);
    const int output = random.Int(0, 1);
    const Reach reach(request, device, GetParam(), output);
    const std::vector<Point> points = PointsOf(reach);
    for (std::size_t k = 0; k < points.size(); k += 1 + points.size() / 8) {
      Output unused;
      unused.used = false;
      Output asked;
      asked.frequency = reach.FrequencyOf(points[k]);
      request.outputs.assign(static_cast<std::size_t>(output), unused);
      request.outputs.push_back(asked);
      request.tolerance = 0;
      const Settings settings = reach.SettingsOf(points[k]);
      const Answer answer = answer::Evaluate(request, device, settings, {.search = true});
      ASSERT_TRUE(answer.within) << drawn::TextOf(request);
      ASSERT_EQ(answer.outputs.back().frequency, asked.frequency);
      ASSERT_EQ(answer.max_jitter.value_or(answer::kUnknownJitter), reach.JitterOf(points[k]));
      const search::Found found = search::Search(request, device, GetParam());
      ASSERT_FALSE(found.best.empty());
      for (const search::Candidate& candidate : found.best) {
        const Answer other = answer::Evaluate(request, device, candidate.settings, {});
        ASSERT_FALSE(answer::Before(request, other, answer)) << drawn::TextOf(request);
      }
    }
  }
}

TEST_P(OfPrimitive, StopsWhereItIsTold) {
  const Device device = drawn::Bundled("vk40", "2");
  const Reach reach(RequestOf(100), device, GetParam(), 0);
  int seen = 0;
  reach.ForEach(kAll, [&](const Point&) { return ++seen < 3; });
  EXPECT_EQ(seen, 3);
}

// However small the windows are, they join without a seam.
TEST(LoopPoints, WindowsJoin) {
  const Device device = drawn::Bundled("vk40", "2");
  Request request = RequestOf(25);
  request.outputs.resize(1);
  const auto points_of = [&](std::size_t window) {
    std::vector<Point> points;
    LoopPoints(request, device, Primitive::kTsyn, window).ForEach({1, 2}, [&](const Point& point) {
      points.push_back(point);
      return true;
    });
    return points;
  };
  const std::vector<Point> whole = points_of(1'000'000);
  ASSERT_GT(whole.size(), 1000u);
  for (const std::size_t window : {1, 2, 17, 1000}) EXPECT_TRUE(points_of(window) == whole);
}

// The bundled device: a VCO of 600 to 1440 MHz from 10 MHz, below which the PFD may not be, takes a D
// of 1 and an M from 60 up to the largest, 64.
TEST(Reach, AsksThePrimitivesWithAsManyInputs) {
  const Device device = drawn::Bundled("vk40", "2");
  Request request = RequestOf(27);
  EXPECT_EQ(AskableOf(request, device).primitives, device.primitives);
  EXPECT_TRUE(AskableOf(request, device).refused.empty());
  request.inputs.push_back(54);
  const Askable loops = AskableOf(request, device);
  EXPECT_EQ(loops.primitives, (std::vector{Primitive::kPll, Primitive::kTsyn}));
  ASSERT_EQ(loops.refused.size(), 2u);
  EXPECT_EQ(loops.refused[1].primitive, Primitive::kKruClkgen);
  EXPECT_EQ(loops.refused[1].refusals.at(0).kind, FindingKind::kTooManyInputs);
  request.primitive = Primitive::kKruSp;
  EXPECT_TRUE(AskableOf(request, device).primitives.empty());
  EXPECT_EQ(AskableOf(request, device).refused.size(), 1u);
}

TEST(Reach, BundledDeviceByHand) {
  const Device device = drawn::Bundled("vk40", "2");
  Request request = RequestOf(10);
  request.whole_divider_0 = true;
  const Reach reach(request, device, Primitive::kTsyn, 1);
  ASSERT_EQ(device.tsyn->vco, (Range{600, 1440}));
  ASSERT_EQ(device.tsyn->pfd, (Range{10, 500}));
  // 600 / 128 is 4.6875, so that all dividers will do.
  ASSERT_EQ(device.tsyn->output, (Range{Rational(75, 16), 800}));
  std::vector<Rational> expected;
  for (int m = 60; m <= 64; ++m) {
    for (int divider = 1; divider <= 128; ++divider) {
      expected.emplace_back(10 * m, divider);
    }
  }
  std::sort(expected.begin(), expected.end());
  expected.erase(std::unique(expected.begin(), expected.end()), expected.end());
  EXPECT_EQ(Texts(FrequenciesOf(reach)), Texts(expected));
}

TEST_P(OfPrimitive, BundledDevicesLikePlainEnumeration) {
  for (const char* const name : {"vk10", "vk20", "vk40"}) {
    const Device device = drawn::Bundled(name, name == std::string("vk10") ? "1" : "2");
    if (!device.Has(GetParam())) continue;
    for (const int output : {0, 1}) {
      // All of it with many D takes its time.
      const bool is_slow = GetParam() == Primitive::kTsyn || GetParam() == Primitive::kKruClkgen;
      if (is_slow && name != std::string("vk40") && !IsLong()) continue;
      const Request request = RequestOf(is_slow && !IsLong() ? Rational(20) : Rational(100));
      const Reach reach(request, device, GetParam(), output);
      const std::vector<Rational> plain =
          plain::Frequencies(request, device, GetParam(), output);
      const std::vector<Rational> found = FrequenciesOf(reach);
      ASSERT_GT(plain.size(), 20u);
      ASSERT_EQ(found.size(), plain.size());
      ASSERT_TRUE(found == plain);
    }
  }
}

}  // namespace
}  // namespace planner::reach
