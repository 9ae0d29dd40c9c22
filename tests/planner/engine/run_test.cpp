#include "planner/engine/Run.h"

#include <gtest/gtest.h>

#include <stdexcept>
#include <string>
#include <thread>
#include <utility>
#include <vector>

#include "engine/Ip_VorkelImp.h"
#include "engine/pll/Stages.h"
#include "tests/compare/Random.h"
#include "tests/host/device_folder.h"
#include "tests/planner/engine/devices.h"
#include "tests/support/CommaLocale.h"

namespace {

using engine_test::Ask;
using engine_test::Out;
using hardware::Bandwidth;
using hardware::Pin;
using hardware::Primitive;
using hardware::Rational;
using planner::KruSettings;
using planner::LoopSettings;
using planner::Request;
using planner::engine::Found;
using planner::engine::Outcome;
using planner::engine::Refused;
using planner::engine::Variant;

class RunTest : public testing::Test {
 protected:
  Outcome RunLoop(Primitive primitive, const Request& request, const Variant& variant = {}) {
    return planner::engine::RunLoop(request, device_, primitive, variant, false);
  }
  LoopSettings LoopFound(Primitive primitive, const Request& request,
                         const Variant& variant = {}) {
    const Outcome outcome = RunLoop(primitive, request, variant);
    const auto* const found = std::get_if<Found>(&outcome);
    EXPECT_NE(found, nullptr);
    return found == nullptr ? LoopSettings{} : std::get<LoopSettings>(found->settings);
  }
  Outcome KruRun(Primitive primitive, const Request& request, std::vector<double> phases,
                 bool feedback) {
    return planner::engine::RunKru(request, device_, primitive, {.feedback = feedback}, phases,
                                   false);
  }
  KruSettings KruFound(Primitive primitive, const Request& request, std::vector<double> phases,
                       bool feedback = true) {
    const Outcome outcome = KruRun(primitive, request, std::move(phases), feedback);
    const auto* const found = std::get_if<Found>(&outcome);
    EXPECT_NE(found, nullptr);
    return found == nullptr ? KruSettings{} : std::get<KruSettings>(found->settings);
  }
  static std::string Sentence(const Outcome& outcome) {
    const auto* const refused = std::get_if<Refused>(&outcome);
    return refused == nullptr ? "solved" : refused->sentence;
  }

  const planner::Device device_ = engine_test::Round();
};

LoopSettings Loop(Primitive primitive, int m, int d, std::vector<planner::LoopOutput> outputs) {
  return {.primitive = primitive, .m = m, .d = d, .outputs = std::move(outputs)};
}

// VCOs of 400, 600, 800 and 1000 MHz, all with a whole divider for 50 MHz.
TEST_F(RunTest, APllTakesTheSmallestVco) {
  EXPECT_EQ(LoopFound(Primitive::kPll, Ask({100}, {Out(200), Out(50)})),
            Loop(Primitive::kPll, 4 * 8, 1, {{2 * 8, 0, 0}, {8 * 8, 0, 0}}));
}

// The VCOs are 190 x a / 8 = 100 x 19 a / 80 for a from 26 to 50. D is at most 10, as the PFD is
// at least 10, and M at most 64: of these only a = 30, 32, 40 and 48 have a whole M.
TEST_F(RunTest, ATsynTakesFractions) {
  EXPECT_EQ(LoopFound(Primitive::kTsyn, Ask({100}, {Out(190)})),
            Loop(Primitive::kTsyn, 57 * 8, 8, {{30, 0, 0}}));
  EXPECT_EQ(LoopFound(Primitive::kTsyn, Ask({100}, {Out(190)}), {.whole_divider_0 = true}),
            Loop(Primitive::kTsyn, 38 * 8, 5, {{4 * 8, 0, 0}}));
}

TEST_F(RunTest, TakesTheLargestVcoWhereItIsPreferred) {
  EXPECT_EQ(LoopFound(Primitive::kPll, Ask({100}, {Out(200), Out(50)}),
                      {.closest = true, .prefer_max_vco = true}),
            Loop(Primitive::kPll, 10 * 8, 1, {{5 * 8, 0, 0}, {20 * 8, 0, 0}}));
}

// 666.6 = 100 x 20 / 3.0003: a remainder below 0.0005 is taken for a whole D. So the engine counts
// with a VCO that M and D do not make.
TEST_F(RunTest, TellsWhatTheEngineCountedWith) {
  const Outcome outcome = RunLoop(Primitive::kPll, Ask({100}, {Out(Rational(3333, 10))}));
  const Found& found = std::get<Found>(outcome);
  EXPECT_EQ(std::get<LoopSettings>(found.settings),
            Loop(Primitive::kPll, 20 * 8, 3, {{2 * 8, 0, 0}}));
  EXPECT_EQ(found.searched.vco, 333.3 * 2);
  ASSERT_EQ(found.searched.outputs.size(), 1u);
  EXPECT_EQ(found.searched.outputs[0], 333.3);
}

TEST_F(RunTest, LeavesUnusedOutputsOut) {
  const Outcome outcome =
      RunLoop(Primitive::kPll, Ask({100}, {Out({}), Out(200), Out({}), Out(50)}));
  const Found& found = std::get<Found>(outcome);
  EXPECT_EQ(std::get<LoopSettings>(found.settings),
            Loop(Primitive::kPll, 4 * 8, 1, {{}, {2 * 8, 0, 0}, {}, {8 * 8, 0, 0}}));
  EXPECT_EQ(found.searched.outputs,
            (std::vector<std::optional<double>>{{}, 200.0, {}, 50.0}));
}

// The fraction is of output 0, and none beside a sixth output.
TEST_F(RunTest, GivesFractionsToNoOtherOutput) {
  const LoopSettings moved = LoopFound(Primitive::kTsyn, Ask({100}, {Out({}), Out(190)}));
  EXPECT_EQ(moved, Loop(Primitive::kTsyn, 38 * 8, 5, {{}, {4 * 8, 0, 0}}));
  Request many = Ask({100}, {Out(190)});
  many.outputs.resize(5, Out({}));
  EXPECT_EQ(LoopFound(Primitive::kTsyn, many).outputs[0].divider, 30);
  many.outputs.resize(6, Out({}));
  EXPECT_EQ(LoopFound(Primitive::kTsyn, many).outputs[0].divider, 4 * 8);
}

// Behind a divider of 4 a step is 11.25 degrees, and a quarter of the period one VCO period.
TEST_F(RunTest, TurnsPhasesAndDutyCyclesIntoSteps) {
  EXPECT_EQ(LoopFound(Primitive::kPll, Ask({100}, {Out(100, 90, 25), Out(200), Out(50, -90)})),
            Loop(Primitive::kPll, 4 * 8, 1, {{4 * 8, 8, 2}, {2 * 8, 0, 0}, {8 * 8, -16, 0}}));
}

// The whole dividers 4, 5 and 6 have steps of 11.25, 9 and 7.5 degrees, none at 10. A fraction has
// only 0, and for the engine that is no difference.
TEST_F(RunTest, MovesNothingBesideAFraction) {
  EXPECT_EQ(LoopFound(Primitive::kTsyn, Ask({100}, {Out(190, 10, 30)})),
            Loop(Primitive::kTsyn, 57 * 8, 8, {{30, 0, 0}}));
}

// The PFD of the TSYN goes up to 60 MHz in LOW; that of the PLL up to 300, whatever ran before.
TEST_F(RunTest, EachRunHasItsOwnLimits) {
  const Variant low = {.bandwidth = Bandwidth::kLow};
  for (int i = 0; i < 2; ++i) {
    LoopSettings expected = Loop(Primitive::kTsyn, 12 * 8, 2, {{3 * 8, 0, 0}});
    expected.bandwidth = Bandwidth::kLow;
    EXPECT_EQ(LoopFound(Primitive::kTsyn, Ask({100}, {Out(200)}), low), expected);
    expected = Loop(Primitive::kPll, 2 * 8, 2, {{8, 0, 0}});
    expected.bandwidth = Bandwidth::kLow;
    EXPECT_EQ(LoopFound(Primitive::kPll, Ask({400}, {Out(400)}), low), expected);
    EXPECT_EQ(LoopFound(Primitive::kPll, Ask({400}, {Out(400)})),
              Loop(Primitive::kPll, 8, 1, {{8, 0, 0}}));
  }
}

// A PFD of 20 MHz cannot be made of 10.
TEST_F(RunTest, SaysWhatTheEngineSays) {
  EXPECT_EQ(Sentence(RunLoop(Primitive::kPll, Ask({10}, {Out(100)}))),
            "Could not obtain valid VCO, M and D values with the given input freqs and the "
            "requested frequency.");
  EXPECT_EQ(Sentence(RunLoop(Primitive::kPll, Ask({10}, {Out(100), Out({}), Out(50)}))),
            "Could not obtain valid VCO, M and D values with the given input freqs and the "
            "requested frequencies.");
  EXPECT_EQ(Sentence(RunLoop(Primitive::kTsyn, Ask({5}, {Out(100)}))),
            "Could not obtain valid VCO, M and D values with the requested frequency.");
  EXPECT_EQ(Sentence(RunLoop(Primitive::kTsyn, Ask({5}, {Out(100, 90)}))),
            "Could not obtain valid VCO, M and D values with the given input freqs and the "
            "requested frequencies.");
  // What makes 400 MHz of 1 MHz makes 40000 of 100.
  EXPECT_EQ(Sentence(RunLoop(Primitive::kPll, Ask({1, 100}, {Out(100)}))),
            "Could not obtain a valid VCO because the 2 input clock freqs are too far apart in "
            "range.");
}

TEST_F(RunTest, TakesThePinsOfAKru) {
  EXPECT_EQ(KruFound(Primitive::kKruSp, Ask({100}, {Out(100), Out(50), Out(150)}), {0, 0, 0}),
            (KruSettings{.feedback = true, .m = 3, .d = 2, .divide_halves = 4,
                         .pins = {Pin::kClk0, Pin::kClkdv, Pin::kClkfx}}));
  EXPECT_EQ(KruFound(Primitive::kKruSp, Ask({100}, {Out(100), Out(200)}), {90, 180}),
            (KruSettings{.feedback = true, .pins = {Pin::kClk90, Pin::kClk2x180}}));
}

// 45 degrees are 31.875 steps of PHASE_SHIFT.
TEST_F(RunTest, TakesThePhaseShift) {
  EXPECT_EQ(KruFound(Primitive::kKruSp, Ask({100}, {Out(100)}), {45}),
            (KruSettings{.feedback = true, .phase_shift = 32, .pins = {Pin::kClk0}}));
}

// CLKDV has no pin at 90 degrees, but half of the input has.
TEST_F(RunTest, TakesTheInputOfAKruHalved) {
  const KruSettings settings =
      KruFound(Primitive::kKruSp, Ask({100}, {Out(50), Out(50)}), {90, 0});
  EXPECT_EQ(settings, (KruSettings{.feedback = true, .divide_by_2 = true,
                                   .pins = {Pin::kClk90, Pin::kClk0}}));
}

TEST_F(RunTest, PutsThePinsOfUsedOutputsInTheirPlaces) {
  EXPECT_EQ(KruFound(Primitive::kKruSp, Ask({100}, {Out({}), Out(100), Out({}), Out(200)}),
                     {1, 90, 2, 180}),
            (KruSettings{.feedback = true,
                         .pins = {Pin::kNone, Pin::kClk90, Pin::kNone, Pin::kClk2x180}}));
}

// Output 0 is on CLKFX: M and D are the first pair that makes its frequency, and 25 is a quarter.
TEST_F(RunTest, TakesThePinsOfAKruClkgen) {
  const KruSettings settings =
      KruFound(Primitive::kKruClkgen, Ask({100}, {Out(150), Out(Rational(75, 2)), Out(150)}),
               {0, 0, 180});
  EXPECT_EQ(settings.primitive, Primitive::kKruClkgen);
  EXPECT_EQ(settings.pins, (std::vector<Pin>{Pin::kClkfx, Pin::kClkfxdv, Pin::kClkfx180}));
  EXPECT_EQ(Rational(settings.m, settings.d), Rational(3, 2));
  EXPECT_EQ(settings.divide_halves, 8);
  EXPECT_FALSE(settings.feedback || settings.divide_by_2);
  EXPECT_EQ(settings.phase_shift, 0);
}

TEST_F(RunTest, SaysWhatTheEngineSaysOfAKru) {
  // Without feedback there is CLKFX alone, from 20 MHz on.
  EXPECT_EQ(Sentence(KruRun(Primitive::kKruSp, Ask({100}, {Out(10)}), {0}, false)),
            "The KRU_SP cannot support the requested output frequency and phase.");
  EXPECT_EQ(Sentence(KruRun(Primitive::kKruSp, Ask({100}, {Out(100), Out(100)}), {90, 0}, false)),
            "The KRU_SP cannot support the requested output frequencies and phases.");
  EXPECT_EQ(Sentence(KruRun(Primitive::kKruClkgen, Ask({100}, {Out(1000)}), {0}, false)),
            "The KRU_CLKGEN cannot support the requested output frequency and phase.");
}

// What one run stands for: all variants of it, run by themselves.
TEST_F(RunTest, VariantsWithTheSameEffectHaveTheSameOutcome) {
  compare::Random random(1);
  int same = 0;
  int different = 0;
  const auto text_of = [](Outcome outcome) {
    if (const auto* const refused = std::get_if<Refused>(&outcome)) return refused->sentence;
    const Found& found = std::get<Found>(outcome);
    const auto& loop = std::get<LoopSettings>(found.settings);
    std::string text = compare::Number("%.17g", *found.searched.vco) + " " +
                       std::to_string(loop.m) + "/" + std::to_string(loop.d);
    for (const planner::LoopOutput& output : loop.outputs) {
      text += " " + std::to_string(output.divider) + "," + std::to_string(output.phase) + "," +
              std::to_string(output.high_time);
    }
    return text;
  };
  for (int i = 0; i < 60; ++i) {
    // The PFD of the TSYN ends at 60 MHz in LOW, that of the PLL at 300.
    Request request = Ask({random.OneIn(3) ? random.Pick(std::vector<Rational>{300, 400, 60, 61})
                                           : Rational(random.Int(20, 70))},
                          {});
    const int outputs = random.Int(1, 6);
    const bool shaped = random.OneIn(2);
    for (int n = 0; n < outputs; ++n) {
      request.outputs.push_back(Out(Rational(random.Int(20, 2000), 5)));
      if (shaped && random.OneIn(2)) request.outputs.back().phase = random.Int(0, 359);
    }
    if (random.OneIn(4)) request.outputs.insert(request.outputs.begin(), Out({}));
    for (const Primitive primitive : {Primitive::kPll, Primitive::kTsyn}) {
      std::vector<std::pair<Variant, std::string>> seen;
      for (const Variant& variant : planner::engine::Variants(request, primitive)) {
        const Variant effective =
            planner::engine::Effective(request, device_, primitive, variant);
        const std::string outcome = text_of(RunLoop(primitive, request, variant));
        for (const auto& [other, known] : seen) {
          if (other != effective) {
            if (known != outcome) ++different;
            continue;
          }
          EXPECT_EQ(outcome, known) << i << " " << variant.name;
          ++same;
        }
        seen.emplace_back(effective, outcome);
      }
    }
  }
  EXPECT_GT(same, 300);
  EXPECT_GT(different, 100);
}

// The limit of LOW counts for an input above it, and for one that a D just below 1 takes above it.
TEST_F(RunTest, LowIsTheSameOnlyBelowItsLimit) {
  const auto is_same = [&](Primitive primitive, const Rational& input) {
    const Request request = Ask({input}, {Out(200)});
    return planner::engine::Effective(request, device_, primitive,
                                      {.bandwidth = Bandwidth::kLow}) ==
           planner::engine::Effective(request, device_, primitive,
                                      {.bandwidth = Bandwidth::kHigh});
  };
  EXPECT_TRUE(is_same(Primitive::kTsyn, 59));
  EXPECT_FALSE(is_same(Primitive::kTsyn, Rational(5999, 100)));
  EXPECT_FALSE(is_same(Primitive::kTsyn, 61));
  EXPECT_TRUE(is_same(Primitive::kPll, 299));
  EXPECT_FALSE(is_same(Primitive::kPll, 300));
}

// What an object answers that looks its device up by the name, and is asked as a script asks.
TEST_F(RunTest, AnswersAsAnyObjectOfTheEngine) {
  DeviceFolder folder;
  folder.Write("round.toml", engine_test::RoundText());
  const SearchPath path(folder.path());
  const Request request =
      Ask({Rational(33333, 1000), Rational(10001, 300)},
          {Out(Rational(148351, 1000), Rational(451, 10), Rational(301, 10)),
           Out(Rational(74176, 1000))});
  Ip::VorkelImp other(nullptr);
  other.SetDevice("round");
  const int code =
      other.GetClosestSolution("148.351 74.176", "45.1 0", "30.1 0", 33.333, 10001.0 / 300.0, 2,
                               false, false, Ip::Pll::kTsyn, false);
  ASSERT_EQ(code, Ip::Pll::kSolved);
  const Outcome outcome = RunLoop(Primitive::kTsyn, request);
  const Found& found = std::get<Found>(outcome);
  const auto& settings = std::get<LoopSettings>(found.settings);
  EXPECT_EQ(found.searched.vco, other.GetChosenVCO());
  EXPECT_EQ(found.searched.outputs[0], other.GetChosenOutFreqN(0));
  EXPECT_EQ(found.searched.outputs[1], other.GetChosenOutFreqN(1));
  EXPECT_EQ(settings.m / 8.0, other.GetChosenM());
  EXPECT_EQ(settings.d, other.GetChosenD());
  EXPECT_EQ(settings.outputs[0].divider / 8.0, other.GetChosenDiv0());
  EXPECT_EQ(settings.outputs[1].divider / 8, other.GetChosenDivN(1));
}

// Who asks for a primitive that the device has not, has not looked: nothing is made of it.
TEST_F(RunTest, APrimitiveWithoutLimitsIsAMistakeOfTheCaller) {
  const std::string text =
      "device = \"bare\"\npackages = [\"p\"]\n[grade.1]\nO_MAX_HT_LT = 64\n" + engine_test::kTsyn;
  const planner::Device bare = planner::device::FromFile(
      ::Device::DeviceFile::Parse(text, "bare.toml", "bare"), "p", "1");
  const Request request = Ask({100}, {Out(200)});
  EXPECT_THROW(planner::engine::RunLoop(request, bare, Primitive::kPll, {}, false),
               std::logic_error);
  EXPECT_THROW(planner::engine::RunKru(request, bare, Primitive::kKruSp, {}, {0.0}, false),
               std::logic_error);
}

// The engine takes lists of numbers as text. Here no fraction gets lost on the way: from 33.125 MHz,
// 298.125 is that times 9 and 99.375 times 3, and the first VCO from 600 MHz on is 894.375.
TEST_F(RunTest, AHostWithADecimalCommaHasTheSameAnswers) {
  const Request request = Ask({Rational(265, 8)}, {Out(Rational(2385, 8)), Out(Rational(795, 8))});
  const CommaLocale locale;
  if (!CommaLocale::IsSet()) GTEST_SKIP() << "localedef can make no locale with a comma";
  const Variant whole = {.whole_divider_0 = true};
  EXPECT_EQ(LoopFound(Primitive::kTsyn, request, whole),
            Loop(Primitive::kTsyn, 27 * 8, 1, {{3 * 8, 0, 0}, {9 * 8, 0, 0}}));
}

// Were the primitive of the run that of the process, a PLL and a TSYN at a time would take it from
// each other: a PLL could get an M of 2 and a TSYN lose its fractions.
TEST_F(RunTest, RunsOfSeveralThreadsDoNotDisturbEachOther) {
  const Request pll = Ask({300}, {Out(600), Out(600)});
  const Request tsyn = Ask({300}, {Out(600), Out(600)});
  const LoopSettings of_pll = Loop(Primitive::kPll, 2 * 8, 1, {{8, 0, 0}, {8, 0, 0}});
  const LoopSettings of_tsyn = Loop(Primitive::kTsyn, 6 * 8, 3, {{8, 0, 0}, {8, 0, 0}});
  std::vector<int> wrong(4, 0);
  std::vector<std::thread> threads;
  for (std::size_t t = 0; t < wrong.size(); ++t) {
    threads.emplace_back([&, t] {
      for (int i = 0; i < 500; ++i) {
        const bool is_pll = t % 2 == 0;
        const Outcome outcome = RunLoop(is_pll ? Primitive::kPll : Primitive::kTsyn,
                                     is_pll ? pll : tsyn);
        const auto* const found = std::get_if<Found>(&outcome);
        const bool right = found != nullptr && std::get<LoopSettings>(found->settings) ==
                                                   (is_pll ? of_pll : of_tsyn);
        if (!right) ++wrong[t];
      }
    });
  }
  for (std::thread& thread : threads) thread.join();
  EXPECT_EQ(wrong, (std::vector<int>{0, 0, 0, 0}));
}

}  // namespace
