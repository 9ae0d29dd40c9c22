// Plans on the bundled devices. What is first is derived by hand.
#include "planner/plan/Plan.h"

#include <gtest/gtest.h>

#include <random>
#include <set>
#include <stdexcept>
#include <utility>

#include "planner/answer/Evaluate.h"
#include "planner/answer/Moved.h"
#include "tests/planner/answer/answer_support.h"
#include "tests/planner/answer/bundled_device.h"

namespace planner::plan {

namespace {

using namespace answer_test;  // NOLINT: requests and devices
using answer::Criterion;

const LoopSettings& LoopOf(const Answer& answer) {
  return std::get<LoopSettings>(answer.settings);
}
const KruSettings& KruOf(const Answer& answer) { return std::get<KruSettings>(answer.settings); }

std::vector<int> DividersOf(const Answer& answer) {
  std::vector<int> dividers;
  for (const LoopOutput& output : LoopOf(answer).outputs) dividers.push_back(output.divider);
  return dividers;
}

Request VideoRequest() { return Ask({27}, {Rational(297, 2), Rational(297, 4), 27}); }

// Jitter falls with M / D^2, so that D = 1 and the largest M are best. 27 MHz asks for a whole M
// (no other divides by a whole divider within 100 ppm), 74.25 = 2.75 x 27 MHz for a multiple of 11:
// the VCO, at most 1440 MHz, is 44 x 27 = 1188 of a TSYN. Of a PLL, at most 1080, 33 x 27 = 891.
// A clean input has the least jitter with the widest loop, HIGH. Jitters: evaluate_loop_test.cpp
// has 128.8147 of the first; of the second the variance is 900 x 1000 / 891 / (4 pi x 1.08) + 4 =
// 78.4271, 14.069 x 8.85591 + 20 = 144.594.
TEST(Plan, ThreeVideoClocks) {
  const Plan plan = Make(VideoRequest(), Bundled("vk40", "2"));
  ASSERT_TRUE(plan.IsSolved());
  const Answer& first = plan.ranked[0];
  EXPECT_TRUE(first.within);
  EXPECT_EQ(first.primitive, Primitive::kTsyn);
  EXPECT_EQ(LoopOf(first), Loop(Primitive::kTsyn, 44, 1, {8, 16, 44}, Bandwidth::kHigh));
  EXPECT_TRUE(first.source.search);
  EXPECT_TRUE(first.source.engine);
  EXPECT_EQ(first.source.variant, "largest VCO");
  EXPECT_EQ(plan.Pick(1), &first);
  EXPECT_EQ(plan.Pick(0), nullptr);
  EXPECT_EQ(plan.Pick(plan.ranked.size()), &plan.ranked.back());
  EXPECT_EQ(plan.Pick(plan.ranked.size() + 1), nullptr);
  EXPECT_EQ(plan.FirstOfEngine(), &first);

  // The PLL is the best of the others.
  ASSERT_FALSE(plan.among_primitives.empty());
  const Reason& reason = plan.among_primitives[0];
  const Answer& pll = plan.ranked[reason.second];
  EXPECT_EQ(reason.first, 0u);
  EXPECT_EQ(reason.decided, Criterion::kJitter);
  EXPECT_EQ(LoopOf(pll), Loop(Primitive::kPll, 33, 1, {6, 12, 33}, Bandwidth::kHigh));
  EXPECT_NEAR(pll.max_jitter.value(), 144.594, 5e-4);
  ASSERT_TRUE(plan.among_own);
  EXPECT_EQ(plan.ranked[plan.among_own->second].primitive, Primitive::kTsyn);

  // Nothing else has less jitter, and nothing else is exact with as little.
  ASSERT_FALSE(plan.front.empty());
  EXPECT_EQ(LoopOf(plan.front[0]), LoopOf(first));
  EXPECT_EQ(plan.front[0].source.variant, "largest VCO");
  // It is the engine's answer in all, with what that counted with.
  ASSERT_TRUE(first.searched_vco);
  EXPECT_EQ(plan.front[0].searched_vco, first.searched_vco);
  EXPECT_EQ(plan.front[0].outputs[0].searched, first.outputs[0].searched);
  EXPECT_EQ(plan.front.size(), 1u);
  EXPECT_TRUE(plan.front_cut.empty());

  // The engine has nothing for the KRUs; the search has settings that miss.
  EXPECT_TRUE(plan.refused.empty());
  ASSERT_EQ(plan.engine_refused.size(), 2u);
  EXPECT_EQ(plan.engine_refused[0].primitive, Primitive::kKruSp);
  EXPECT_EQ(plan.engine_refused[0].refusals.at(0).kind, FindingKind::kUnsolved);
  EXPECT_EQ(plan.engine_refused[1].primitive, Primitive::kKruClkgen);
}

TEST(Plan, IsRankedAndHasTheSameSettingsOnce) {
  std::vector<Request> requests = {VideoRequest(), Ask({25}, {125, Rational(125, 2), 25}),
                                   Ask({100}, {333}), Ask({100, 99}, {150, 75})};
  requests[1].outputs[1].phase = 90;
  requests[2].rank = planner::Rank::kError;
  requests[3].rank = planner::Rank::kVco;
  for (const Request& request : requests) {
    const Plan plan = Make(request, Bundled("vk40", "2"));
    for (std::size_t i = 0; i < plan.ranked.size(); ++i) {
      const Answer& answer = plan.ranked[i];
      EXPECT_TRUE(answer.solved);
      EXPECT_TRUE(answer.source.engine || answer.source.search);
      for (std::size_t j = i + 1; j < plan.ranked.size(); ++j) {
        EXPECT_TRUE(answer::Before(request, answer, plan.ranked[j])) << i << ' ' << j;
      }
      // What is judged by itself is the same.
      const Answer again =
          answer::Evaluate(request, Bundled("vk40", "2"), answer.settings, answer.source);
      EXPECT_EQ(again.worst_error, answer.worst_error);
      EXPECT_EQ(again.max_jitter, answer.max_jitter);
      EXPECT_EQ(again.within, answer.within);
    }
    // The first is of the search: it has all that the engine could find in the limits.
    EXPECT_TRUE(plan.ranked.at(0).source.search);
  }
}

// What no member of the front is at least as good as in both would have to be on it.
TEST(Plan, NothingRankedIsBetterThanTheFront) {
  for (const Request& request :
       {VideoRequest(), Ask({100}, {333}), Ask({24}, {Rational(651, 8)})}) {
    const Plan plan = Make(request, Bundled("vk40", "2"));
    ASSERT_FALSE(plan.front.empty());
    for (std::size_t i = 0; i < plan.front.size(); ++i) {
      EXPECT_EQ(plan.front[i].within, plan.ranked[0].within);
      if (i == 0) continue;
      EXPECT_LT(plan.front[i - 1].worst_error, plan.front[i].worst_error);
      EXPECT_GT(plan.front[i - 1].max_jitter, plan.front[i].max_jitter);
    }
    for (const Answer& answer : plan.ranked) {
      if (answer::KeyOf(answer).rank_class != answer::KeyOf(plan.ranked[0]).rank_class) continue;
      bool is_covered = false;
      for (const Answer& member : plan.front) {
        is_covered = is_covered || (member.worst_error <= answer.worst_error &&
                                    member.max_jitter <= answer.max_jitter);
      }
      EXPECT_TRUE(is_covered);
    }
  }
}

TEST(Plan, OfOnePrimitive) {
  Request request = VideoRequest();
  request.primitive = Primitive::kPll;
  const Plan plan = Make(request, Bundled("vk40", "2"));
  for (const Answer& answer : plan.ranked) EXPECT_EQ(answer.primitive, Primitive::kPll);
  EXPECT_EQ(LoopOf(plan.ranked.at(0)).m, 33 * 8);
  EXPECT_TRUE(plan.among_primitives.empty());
  EXPECT_THROW(Make(request, Bundled("vk20", "2")), std::invalid_argument);
}

// 100 MHz to 148.5 and 27 MHz: the engine takes the first that is near enough for it.
TEST(Plan, OfTheEngineAlone) {
  Request request = Ask({100}, {Rational(297, 2), Rational(297, 4), 27});
  request.engine_only = true;
  const Device device = Bundled("vk40", "2");
  const Plan plan = Make(request, device);
  ASSERT_TRUE(plan.IsSolved());
  for (const Answer& answer : plan.ranked) {
    EXPECT_TRUE(answer.source.engine);
    EXPECT_FALSE(answer.source.search);
  }
  for (const Answer& answer : plan.front) EXPECT_TRUE(answer.source.engine);
  EXPECT_FALSE(plan.front.empty());
  ASSERT_EQ(plan.refused.size(), 2u);
  EXPECT_EQ(plan.refused[0].primitive, Primitive::kKruSp);
  ASSERT_EQ(plan.refused[0].refusals.size(), 1u);
  EXPECT_EQ(plan.refused[0].refusals[0].kind, FindingKind::kUnsolved);
  EXPECT_TRUE(plan.engine_refused.empty());

  request.engine_only = false;
  const Plan by_option = Make(request, device, {.search = false});
  ASSERT_EQ(by_option.ranked.size(), plan.ranked.size());
  for (std::size_t i = 0; i < plan.ranked.size(); ++i) {
    EXPECT_TRUE(answer::SameSettings(by_option.ranked[i], plan.ranked[i]));
  }
  // Without the engine, only the search.
  for (const Answer& answer : Make(request, device, {.engine = false}).ranked) {
    EXPECT_FALSE(answer.source.engine);
  }
}

TEST(Plan, APrimitiveWithTooFewClocksSaysSo) {
  const Plan plan = Make(Ask({100, 50}, {100}), Bundled("vk40", "2"));
  ASSERT_EQ(plan.refused.size(), 2u);
  EXPECT_EQ(plan.refused[0].primitive, Primitive::kKruSp);
  EXPECT_FALSE(plan.refused[0].solved);
  ASSERT_EQ(plan.refused[0].refusals.size(), 1u);
  EXPECT_EQ(plan.refused[0].refusals[0].kind, FindingKind::kTooManyInputs);
}

// An input of 1 MHz is too slow for any PFD.
TEST(Plan, NoSettingsKeepTheLimits) {
  Request request = Ask({1}, {100});
  request.primitive = Primitive::kPll;
  const Plan plan = Make(request, Bundled("vk40", "2"));
  EXPECT_FALSE(plan.IsSolved());
  EXPECT_TRUE(plan.front.empty());
  EXPECT_TRUE(plan.engine_refused.empty());
  EXPECT_EQ(plan.FirstOfEngine(), nullptr);
  EXPECT_FALSE(plan.among_own);
  ASSERT_EQ(plan.refused.size(), 1u);
  ASSERT_EQ(plan.refused[0].refusals.size(), 2u);
  EXPECT_EQ(plan.refused[0].refusals[0].kind, FindingKind::kUnsolved);
  EXPECT_EQ(plan.refused[0].refusals[1].kind, FindingKind::kNoSettings);
}

// A request with some of everything.
Request Drawn(std::mt19937* random) {
  const auto draw = [random](int count) {
    return static_cast<int>((*random)() % static_cast<unsigned>(count));
  };
  Request request;
  request.inputs = {20 + Rational(draw(180 * 4), 4)};
  if (draw(4) == 0) request.inputs.push_back(request.inputs[0] * Rational(95 + draw(11), 100));
  const int outputs = 1 + draw(4);
  for (int i = 0; i < outputs; ++i) {
    Output output = Frequency(request.inputs[0] * (1 + draw(12)) / (1 + draw(8)));
    if (draw(4) == 0) output.phase = 45 * draw(8);
    if (draw(6) == 0) output.duty = 25 * (1 + draw(3));
    if (draw(8) == 0) output.used = false;
    request.outputs.push_back(output);
  }
  request.outputs[0].used = true;
  if (draw(3) == 0) request.input_jitter = 50 * draw(10);
  if (draw(3) == 0) request.tolerance = draw(2) * 1000;
  if (draw(4) == 0) request.bandwidth = hardware::kBandwidths[static_cast<std::size_t>(draw(3))];
  if (draw(4) == 0) request.max_jitter = 100 + draw(200);
  request.rank = static_cast<planner::Rank>(draw(4));
  request.prefer_max_vco = draw(6) == 0;
  request.whole_divider_0 = draw(6) == 0;
  return request;
}

// All that the engine answers in the device's limits is among the settings that are searched: what
// is first of a primitive, and of each of its bandwidths, is the search's.
TEST(Plan, TheEngineNeverFindsWhatTheSearchDoesNot) {
  std::mt19937 random(20261121);
  const Device device = Bundled("vk40", "2");
  int of_engine = 0;
  for (int i = 0; i < 80; ++i) {
    Request request = Drawn(&random);
    // Mostly loops; the search of a KRU takes longer.
    request.primitive = i % 2 == 0   ? Primitive::kTsyn
                        : i % 8 == 7 ? Primitive::kKruSp
                        : i % 8 == 3 ? Primitive::kKruClkgen
                                     : Primitive::kPll;
    const Plan plan = Make(request, device);
    std::set<std::pair<Primitive, int>> seen;
    for (const Answer& answer : plan.ranked) {
      const bool is_loop = hardware::IsLoop(answer.primitive);
      const int bandwidth = is_loop ? static_cast<int>(LoopOf(answer).bandwidth) : 0;
      if (answer.source.engine) ++of_engine;
      EXPECT_TRUE(!answer.source.search || answer.violations.empty());
      if (!seen.insert({answer.primitive, bandwidth}).second) continue;
      EXPECT_TRUE(answer.source.search || !answer.violations.empty())
          << "request " << i << ", " << hardware::Name(answer.primitive);
    }
  }
  EXPECT_GT(of_engine, 100);
}

// --- Any order ---------------------------------------------------------------------------------

const Finding* Moved(const Answer& answer) {
  for (const Finding& note : answer.notes) {
    if (note.kind == FindingKind::kMoved) return &note;
  }
  return nullptr;
}

// Only output 1 of a PLL goes to 900 MHz, which asks for a VCO of 900 MHz, M = 9 and D = 1 or
// multiples: D = 1 has the least jitter, and the widest loop.
TEST(Plan, AnOutputMovesToTheFastPlaceOfAPll) {
  Request request = Ask({100}, {900, 100});
  const Device device = Bundled("vk10", "1");
  request.primitive = Primitive::kPll;
  EXPECT_FALSE(Make(request, device).ranked.at(0).within);
  request.any_order = true;
  const Plan plan = Make(request, device);
  const Answer& first = plan.ranked.at(0);
  EXPECT_TRUE(first.within);
  EXPECT_EQ(LoopOf(first), Loop(Primitive::kPll, 9, 1, {9, 1}, Bandwidth::kHigh));
  ASSERT_NE(Moved(first), nullptr);
  EXPECT_EQ(Moved(first)->outputs, (std::vector<int>{1, 0}));
  EXPECT_EQ(first.outputs[0].frequency, Rational(100));
  EXPECT_EQ(first.outputs[1].frequency, Rational(900));
  EXPECT_EQ(answer::Placed(request, first).outputs[1].frequency, Rational(900));
  ASSERT_FALSE(plan.front.empty());
  EXPECT_NE(Moved(plan.front[0]), nullptr);
}

TEST(Plan, AnOutputMovesToAnEmptyPlace) {
  Request request = Ask({100}, {900, 1});
  request.outputs[1] = Unused();
  request.any_order = true;
  request.primitive = Primitive::kPll;
  const Answer first = Make(request, Bundled("vk10", "1")).ranked.at(0);
  EXPECT_TRUE(first.within);
  EXPECT_FALSE(first.outputs[0].used);
  EXPECT_EQ(first.outputs[1].frequency, Rational(900));
}

// CLKFX at 100 x 3 / 2 = 150, a quarter of it on CLKFXDV. 3 / 2 has less jitter than 6 / 4.
TEST(Plan, TheFastOutputOfAClkgenIsOnClkfx) {
  Request request = Ask({100}, {Rational(75, 2), 150});
  request.primitive = Primitive::kKruClkgen;
  const Device device = Bundled("vk40", "2");
  EXPECT_FALSE(Make(request, device).ranked.at(0).within);
  request.any_order = true;
  const Answer first = Make(request, device).ranked.at(0);
  EXPECT_TRUE(first.within);
  EXPECT_EQ(KruOf(first).m, 3);
  EXPECT_EQ(KruOf(first).d, 2);
  EXPECT_EQ(KruOf(first).divide_halves, 8);
  EXPECT_EQ(KruOf(first).pins, (std::vector<Pin>{Pin::kClkfx, Pin::kClkfxdv}));
  ASSERT_NE(Moved(first), nullptr);
}

// 800/9 MHz beside 100 MHz. With 800/9 on a whole divider n the VCO is at 800 n / 9; D = 1 asks
// for an M of 8 n / 9 in eighths, a VCO of 800 MHz with n = 9. On output 0 it can be VCO / 15.75,
// with a VCO of 1400 MHz, 14 x 100, the highest up to 1440 on which 100 MHz has a whole divider,
// and so with less jitter.
TEST(Plan, TheOutputThatNeedsItHasTheFraction) {
  Request request = Ask({100}, {100, Rational(800, 9)});
  request.tolerance = 0;
  const Device device = Bundled("vk20", "2");
  const Answer as_asked = Make(request, device).ranked.at(0);
  EXPECT_TRUE(as_asked.within);
  EXPECT_EQ(as_asked.vco, Rational(800));
  request.any_order = true;
  const Plan plan = Make(request, device);
  const Answer& first = plan.ranked.at(0);
  EXPECT_TRUE(first.within);
  EXPECT_EQ(first.vco, Rational(1400));
  EXPECT_EQ(DividersOf(first), (std::vector<int>{126, 112}));
  ASSERT_NE(Moved(first), nullptr);
}

// Nothing is moved where that makes nothing better: with either output on the place with fractions
// the other one asks for a VCO of 1400 MHz, 14 x 100 or 28 x 50.
TEST(Plan, OutputsStayWhereTheyCan) {
  Request request = Ask({100}, {100, 50});
  request.any_order = true;
  const Plan plan = Make(request, Bundled("vk20", "2"));
  EXPECT_EQ(LoopOf(plan.ranked.at(0)), Loop(Primitive::kTsyn, 14, 1, {14, 28}, Bandwidth::kHigh));
  EXPECT_EQ(Moved(plan.ranked[0]), nullptr);
  EXPECT_EQ(Moved(plan.front.at(0)), nullptr);
}

}  // namespace

}  // namespace planner::plan
