// What settings of a PLL or a TSYN make, worked out by hand.
#include <gtest/gtest.h>

#include <ostream>

#include "planner/answer/Evaluate.h"
#include "tests/planner/answer/answer_support.h"
#include "tests/planner/answer/bundled_device.h"

namespace planner::answer {

namespace {

using namespace answer_test;  // NOLINT: what all tests of this folder begin with

const Finding* Find(const std::vector<Finding>& findings, FindingKind kind) {
  for (const Finding& finding : findings) {
    if (finding.kind == kind) return &finding;
  }
  return nullptr;
}

// 27 MHz to 148.5, 74.25 and 27 MHz: VCO 27 x 44 = 1188 = 148.5 x 8 = 74.25 x 16 = 27 x 44.
// Jitter: kappa^2 = 30^2 x 1000 / 1188 = 757.5758; the loop is 0.04 x 27 = 1.08 MHz wide;
//   757.5758 / (4 pi x 1.08) = 55.8203; with 2^2 of the buffers 59.8203, the root 7.73436 ps rms;
//   14.069 x 7.73436 + 20 = 128.8147 ps.
// Phase error: 40 + 40 / 1.08 = 77.0370 ps.
// Margin: of the VCO, (1440 - 1188) / 1440 = 7/40; PFD, (500 - 27) / 500 = 473/500; the outputs
//   are further away: the first (800 - 148.5) / 800 = 0.81, the last (27 - 4.6875) / 4.6875 = 4.8
//   and (800 - 27) / 800 = 0.97.
TEST(EvaluateLoop, ThreeVideoClocks) {
  Request request = Ask({27}, {Rational(297, 2), Rational(297, 4), 27});
  const Answer answer =
      Evaluate(request, Bundled("vk40", "2"),
               Loop(Primitive::kTsyn, 44, 1, {8, 16, 44}, Bandwidth::kHigh), {.search = true});
  EXPECT_TRUE(answer.solved);
  EXPECT_TRUE(answer.within);
  EXPECT_TRUE(answer.source.search);
  EXPECT_EQ(answer.primitive, Primitive::kTsyn);
  EXPECT_EQ(answer.vco, Rational(1188));
  EXPECT_EQ(answer.pfd, Rational(27));
  EXPECT_EQ(answer.margin, Rational(7, 40));
  EXPECT_EQ(answer.worst_ppm, Rational(0));
  EXPECT_EQ(answer.worst_error, Rational(0));
  EXPECT_NEAR(answer.max_jitter.value(), 128.8147, 5e-5);
  EXPECT_NEAR(answer.phase_error.value(), 77.0370, 5e-5);
  EXPECT_TRUE(answer.violations.empty());
  EXPECT_TRUE(answer.notes.empty());
  const Rational ratios[] = {Rational(11, 2), Rational(11, 4), 1};
  for (std::size_t i = 0; i < 3; ++i) {
    const OutputAnswer& output = answer.outputs[i];
    EXPECT_TRUE(output.used);
    EXPECT_EQ(output.ratio, ratios[i]);
    EXPECT_EQ(output.frequency, request.outputs[i].frequency);
    EXPECT_FALSE(output.frequency_second);
    EXPECT_EQ(output.error_ppm, Rational(0));
    EXPECT_EQ(output.phase, Rational(0));
    EXPECT_EQ(output.duty, Rational(50));
    EXPECT_FALSE(output.phase_error);
    EXPECT_FALSE(output.duty_error);
    EXPECT_NEAR(output.jitter.value(), 128.8147, 5e-5);
    EXPECT_NEAR(output.jitter_rms.value(), 7.73436, 5e-6);
    EXPECT_TRUE(output.IsWithin());
  }
}

// 100 MHz x 49 / 6 = 816.67 MHz; / 5.5 = 148.4848 = 100 x 49 / 33, for 148.5: 4900/33 less 297/2 is
// (9800 - 9801) / 66 = -1/66, of 297/2 it is -1/9801, -1000000/9801 ppm = -102.03. The second has
// the same error. The third: 4900/180 = 27.2222, 2/9 more than 27, 2/243, 2000000/243 ppm.
TEST(EvaluateLoop, AFractionAndMissedFrequencies) {
  Request request = Ask({100}, {Rational(297, 2), Rational(297, 4), 27});
  LoopSettings settings = Loop(Primitive::kTsyn, 49, 6, {0, 11, 30});
  settings.outputs[0].divider = 44;  // 5.5
  const Answer answer = Evaluate(request, HandMade(), settings, {});
  EXPECT_EQ(answer.vco, Rational(2450, 3));
  EXPECT_EQ(answer.pfd, Rational(50, 3));
  EXPECT_EQ(answer.outputs[0].frequency, Rational(4900, 33));
  EXPECT_EQ(answer.outputs[0].error_ppm, Rational(-1'000'000, 9801));
  EXPECT_EQ(answer.outputs[1].error_ppm, Rational(-1'000'000, 9801));
  EXPECT_EQ(answer.outputs[2].error_ppm, Rational(2'000'000, 243));
  EXPECT_EQ(answer.worst_ppm, Rational(2'000'000, 243));
  EXPECT_EQ(answer.worst_error, Rational(20'000, 243));
  EXPECT_FALSE(answer.within);
  EXPECT_TRUE(answer.violations.empty());
  ASSERT_EQ(answer.outputs[2].misses.size(), 1u);
  const Finding& miss = answer.outputs[2].misses[0];
  EXPECT_EQ(miss.kind, FindingKind::kOffTarget);
  EXPECT_EQ(miss.primitive, Primitive::kTsyn);
  EXPECT_EQ(miss.quantity, Quantity::kFrequency);
  EXPECT_EQ(miss.output, 2);
  EXPECT_EQ(miss.value, Rational(2'000'000, 243));
  EXPECT_EQ(miss.range.highest, Rational(100));
  // 102.0304 ppm are allowed exactly when they are.
  request.tolerance = Rational(1'000'000, 9801);
  EXPECT_TRUE(Evaluate(request, HandMade(), settings, {}).outputs[0].IsWithin());
  request.tolerance -= Sliver(1);
  EXPECT_FALSE(Evaluate(request, HandMade(), settings, {}).outputs[0].IsWithin());
}

// --- Ranges -------------------------------------------------------------------------------

struct Edge {
  const char* what;
  Primitive primitive;
  Rational input;  // just at the end of a range
  int m;
  int d;
  int divider;
  Bandwidth bandwidth;
  int direction;  // of what is outside of it
  Quantity quantity;
  Range range;
};

void PrintTo(const Edge& edge, std::ostream* stream) { *stream << edge.what; }

class Edges : public testing::TestWithParam<Edge> {};

// Exactly at the end of a range is inside of it, with a margin of 0. One part in 10^30 beyond is
// outside.
TEST_P(Edges, TheEndIsInsideAndNothingBeyond) {
  const Edge& edge = GetParam();
  const LoopSettings settings =
      Loop(edge.primitive, edge.m, edge.d, {edge.divider}, edge.bandwidth);
  const Device device = HandMade();
  const Rational frequency = edge.input * edge.m / (edge.d * edge.divider);
  const auto evaluate = [&](const Rational& input) {
    return Evaluate(Ask({input}, {frequency}), device, settings, {});
  };
  const Answer inside = evaluate(edge.input);
  EXPECT_TRUE(inside.violations.empty());
  EXPECT_TRUE(inside.within);
  EXPECT_EQ(inside.margin, Rational(0));
  const Rational step = edge.direction * Sliver(edge.input);
  EXPECT_TRUE(evaluate(edge.input - step).violations.empty());
  const Answer outside = evaluate(edge.input + step);
  EXPECT_FALSE(outside.within);
  EXPECT_EQ(outside.margin, -Sliver(1));
  ASSERT_EQ(outside.violations.size(), 1u);
  const Finding& finding = outside.violations[0];
  EXPECT_EQ(finding.kind, FindingKind::kOutsideLimit);
  EXPECT_EQ(finding.primitive, edge.primitive);
  EXPECT_EQ(finding.quantity, edge.quantity);
  EXPECT_EQ(finding.range, edge.range);
  EXPECT_FALSE(edge.range.Contains(finding.value));
  EXPECT_EQ(finding.input, 0);
  const bool of_output = edge.quantity == Quantity::kFrequency;
  EXPECT_EQ(finding.output, of_output ? 0 : -1);
  EXPECT_EQ(outside.outputs[0].violations.size(), of_output ? 1u : 0u);
}

constexpr Bandwidth kOptimized = Bandwidth::kOptimized;
constexpr Bandwidth kLow = Bandwidth::kLow;
INSTANTIATE_TEST_SUITE_P(
    EvaluateLoop, Edges,
    testing::Values(
        Edge{"the lowest VCO", Primitive::kPll, 100, 4, 1, 4, kOptimized, -1, Quantity::kVco,
             {400, 1080}},
        Edge{"the highest VCO", Primitive::kPll, 108, 10, 1, 4, kOptimized, 1, Quantity::kVco,
             {400, 1080}},
        Edge{"the lowest VCO of a TSYN", Primitive::kTsyn, 100, 6, 1, 4, kOptimized, -1,
             Quantity::kVco, {600, 1440}},
        Edge{"the highest VCO of a TSYN", Primitive::kTsyn, 144, 10, 1, 4, kOptimized, 1,
             Quantity::kVco, {600, 1440}},
        Edge{"the lowest PFD", Primitive::kPll, 38, 44, 2, 4, kOptimized, -1, Quantity::kPfd,
             {19, 500}},
        Edge{"the highest PFD", Primitive::kPll, 500, 1, 1, 4, kOptimized, 1, Quantity::kPfd,
             {19, 500}},
        Edge{"that of LOW", Primitive::kPll, 300, 2, 1, 4, kLow, 1, Quantity::kPfd, {19, 300}},
        Edge{"that of LOW of a TSYN", Primitive::kTsyn, 500, 5, 2, 5, kLow, 1, Quantity::kPfd,
             {10, 250}},
        Edge{"the highest output", Primitive::kPll, 100, 8, 1, 2, kOptimized, 1,
             Quantity::kFrequency, {3, 400}},
        Edge{"the highest output of a TSYN", Primitive::kTsyn, 80, 10, 1, 1, kOptimized, 1,
             Quantity::kFrequency, {4, 800}}),
    [](const auto& test) { return std::to_string(test.index); });

// 480 / 120 = 4 MHz, the lowest.
TEST(EvaluateLoop, TheLowestOutput) {
  Device device = HandMade();
  device.pll->output.lowest = 4;
  const LoopSettings settings = Loop(Primitive::kPll, 24, 1, {120});
  EXPECT_TRUE(Evaluate(Ask({20}, {4}), device, settings, {}).within);
  const Answer outside = Evaluate(Ask({20 - Sliver(20)}, {4}), device, settings, {});
  ASSERT_EQ(outside.violations.size(), 1u);
  EXPECT_EQ(outside.violations[0].output, 0);
  EXPECT_EQ(outside.violations[0].value, 4 - Sliver(4));
}

// 1080 MHz / 2 = 540: only output 1 may be there.
TEST(EvaluateLoop, Output1OfAPllHasItsOwnRange) {
  const Answer answer = Evaluate(Ask({108}, {540, 540, 540}), HandMade(),
                                 Loop(Primitive::kPll, 10, 1, {2, 2, 2}), {});
  ASSERT_EQ(answer.violations.size(), 2u);
  EXPECT_EQ(answer.violations[0].output, 0);
  EXPECT_EQ(answer.violations[0].range, (Range{3, 400}));
  EXPECT_EQ(answer.violations[1].output, 2);
  EXPECT_TRUE(answer.outputs[1].IsWithin());
  EXPECT_FALSE(answer.outputs[2].IsWithin());
}

// With 110 MHz and M = 8 output 0 is at 440, above 400; with M = 10 the VCO at 1100, above 1080.
// 36 MHz / 2 = 18 are below the lowest PFD, 19.
TEST(EvaluateLoop, TheSecondInputMustStayInRangeToo) {
  const Answer outside =
      Evaluate(Ask({96, 110}, {384}), HandMade(), Loop(Primitive::kPll, 8, 1, {2}), {});
  EXPECT_EQ(outside.outputs[0].frequency, Rational(384));
  EXPECT_EQ(outside.outputs[0].frequency_second, Rational(440));
  EXPECT_EQ(outside.outputs[0].error_ppm, Rational(0));
  ASSERT_EQ(outside.violations.size(), 1u);
  EXPECT_EQ(outside.violations[0].input, 1);
  EXPECT_EQ(outside.violations[0].output, 0);
  EXPECT_EQ(outside.violations[0].value, Rational(440));
  EXPECT_EQ(outside.margin, Rational(-1, 10));  // (400 - 440) / 400
  EXPECT_EQ(outside.vco, Rational(768));
  const Answer vco =
      Evaluate(Ask({100, 110}, {100}), HandMade(), Loop(Primitive::kPll, 10, 1, {10}), {});
  ASSERT_EQ(vco.violations.size(), 1u);
  EXPECT_EQ(vco.violations[0].quantity, Quantity::kVco);
  EXPECT_EQ(vco.violations[0].input, 1);
  EXPECT_EQ(vco.violations[0].value, Rational(1100));
  const Answer pfd =
      Evaluate(Ask({40, 36}, {100}), HandMade(), Loop(Primitive::kPll, 25, 2, {5}), {});
  ASSERT_EQ(pfd.violations.size(), 1u);
  EXPECT_EQ(pfd.violations[0].quantity, Quantity::kPfd);
  EXPECT_EQ(pfd.violations[0].value, Rational(18));
}

// High and low times of 60 VCO periods make dividers up to 120.
TEST(EvaluateLoop, ADividerThatTheCountersDoNotMake) {
  const Request request = Ask({121}, {4});
  const auto evaluate = [&](int divider) {
    return Evaluate(request, HandMade(), Loop(Primitive::kPll, 4, 1, {divider}), {});
  };
  EXPECT_TRUE(evaluate(120).violations.empty());
  const Answer answer = evaluate(121);
  ASSERT_EQ(answer.violations.size(), 1u);
  EXPECT_EQ(answer.violations[0].kind, FindingKind::kDividerTooLarge);
  EXPECT_EQ(answer.violations[0].output, 0);
  EXPECT_EQ(answer.violations[0].value, Rational(121));
  EXPECT_EQ(answer.violations[0].range.highest, Rational(60));
  EXPECT_FALSE(answer.within);
  EXPECT_EQ(answer.outputs[0].violations.size(), 1u);
}

// --- Phases and duty cycles -----------------------------------------------------------------

// VCO 1000, dividers of 10: a phase step is 360 / 80 = 4.5 degrees, a step of the duty cycle 5
// points. -22 steps are -99 degrees, 9 less than -90; 7 half periods are 35 percent.
TEST(EvaluateLoop, PhasesAndDutyCycles) {
  Request request = Ask({100}, {100, 100, 100, 100});
  LoopSettings settings = Loop(Primitive::kPll, 10, 1, {10, 10, 10, 10});
  request.outputs[0].phase = 90;
  settings.outputs[0].phase = 20;
  request.outputs[1].phase = -90;
  request.outputs[1].phase_tolerance = 3;
  settings.outputs[1].phase = -22;
  request.outputs[2].duty = 33;
  settings.outputs[2].high_time = 7;
  settings.outputs[3].phase = 3;  // not asked for
  settings.outputs[3].high_time = 4;
  const Answer answer = Evaluate(request, HandMade(), settings, {});
  EXPECT_EQ(answer.outputs[0].phase, Rational(90));
  EXPECT_EQ(answer.outputs[0].phase_error, Rational(0));
  EXPECT_TRUE(answer.outputs[0].IsWithin());
  EXPECT_EQ(answer.outputs[1].phase, Rational(-99));
  EXPECT_EQ(answer.outputs[1].phase_error, Rational(-9));
  ASSERT_EQ(answer.outputs[1].misses.size(), 1u);
  EXPECT_EQ(answer.outputs[1].misses[0].quantity, Quantity::kPhase);
  EXPECT_EQ(answer.outputs[1].misses[0].value, Rational(-9));
  EXPECT_EQ(answer.outputs[1].misses[0].range.highest, Rational(3));
  EXPECT_EQ(answer.outputs[2].duty, Rational(35));
  EXPECT_EQ(answer.outputs[2].duty_error, Rational(2));
  ASSERT_EQ(answer.outputs[2].misses.size(), 1u);
  EXPECT_EQ(answer.outputs[2].misses[0].quantity, Quantity::kDuty);
  EXPECT_EQ(answer.outputs[2].misses[0].range.highest, Rational(1, 2));
  EXPECT_EQ(answer.outputs[3].phase, Rational(27, 2));
  EXPECT_EQ(answer.outputs[3].duty, Rational(20));
  EXPECT_FALSE(answer.outputs[3].phase_error);
  EXPECT_TRUE(answer.outputs[3].IsWithin());
  // 9 degrees of 3 are 3, 2 points of 0.5 are 4.
  EXPECT_EQ(answer.worst_error, Rational(4));
  EXPECT_TRUE(answer.violations.empty());
  EXPECT_FALSE(answer.within);
}

TEST(EvaluateLoop, NothingMovesBesideAFraction) {
  Request request = Ask({100}, {Rational(800, 9), 100});
  request.outputs[1].phase = 90;
  LoopSettings settings = Loop(Primitive::kTsyn, 10, 1, {0, 10});
  settings.outputs[0].divider = 90;  // 11.25
  settings.outputs[1].phase = 20;
  settings.outputs[1].high_time = 3;
  const Answer answer = Evaluate(request, HandMade(), settings, {});
  EXPECT_EQ(answer.outputs[0].error_ppm, Rational(0));
  EXPECT_EQ(answer.outputs[1].phase, Rational(0));
  EXPECT_EQ(answer.outputs[1].duty, Rational(50));
  EXPECT_EQ(answer.outputs[1].phase_error, Rational(-90));
  EXPECT_EQ(answer.worst_error, Rational(180));
  EXPECT_NE(Find(answer.notes, FindingKind::kNothingMoves), nullptr);
}

// --- Jitter and outputs that are not used ---------------------------------------------------

TEST(EvaluateLoop, AnUnknownJitterMeetsNoDemand) {
  Request request = Ask({100}, {100, 50});
  const LoopSettings settings = Loop(Primitive::kPll, 10, 1, {10, 20});
  const Answer free = Evaluate(request, HandMade(), settings, {});
  EXPECT_TRUE(free.within);
  EXPECT_FALSE(free.max_jitter);
  EXPECT_FALSE(free.phase_error);
  const Finding* note = Find(free.notes, FindingKind::kNoJitter);
  ASSERT_NE(note, nullptr);
  EXPECT_TRUE(note->outputs.empty());  // all
  EXPECT_TRUE(note->text.empty());     // there are no coefficients
  EXPECT_NE(Find(free.notes, FindingKind::kNoPhaseError), nullptr);

  request.outputs[1].max_jitter = 500;
  const Answer demanded = Evaluate(request, HandMade(), settings, {});
  EXPECT_FALSE(demanded.within);
  EXPECT_EQ(demanded.worst_error, Rational(0));
  EXPECT_TRUE(demanded.outputs[0].IsWithin());
  ASSERT_EQ(demanded.outputs[1].misses.size(), 1u);
  EXPECT_EQ(demanded.outputs[1].misses[0].quantity, Quantity::kJitter);
  EXPECT_EQ(demanded.outputs[1].misses[0].range.highest, Rational(500));
}

// PFD 100, VCO 1000, OPTIMIZED: 30 x sqrt(1 / (8 pi)) = 5.98413 ps, variance 35.8099 + 4 of the
// buffers, rms 6.30950; 14.069 x 6.30950 + 20 = 108.768 ps.
TEST(EvaluateLoop, JitterThatIsDemanded) {
  Request request = Ask({100}, {100});
  request.max_jitter = 109;
  const Device device = Bundled("vk40", "2");
  const LoopSettings settings = Loop(Primitive::kPll, 10, 1, {10});
  Answer answer = Evaluate(request, device, settings, {});
  EXPECT_TRUE(answer.within);
  EXPECT_NEAR(answer.worst_error.ToDouble(), 108.768 / 109, 1e-5);
  request.max_jitter = Rational(1085, 10);
  answer = Evaluate(request, device, settings, {});
  EXPECT_FALSE(answer.within);
  ASSERT_EQ(answer.outputs[0].misses.size(), 1u);
  EXPECT_EQ(answer.outputs[0].misses[0].quantity, Quantity::kJitter);
  EXPECT_EQ(answer.outputs[0].misses[0].value, Rational::FromDouble(*answer.max_jitter));
  EXPECT_EQ(answer.worst_error, Rational::FromDouble(*answer.max_jitter) / Rational(1085, 10));
}

// 1500 MHz are above the VCOs of PLL and TSYN alike, so that the calculator says nothing of the
// jitter; the phase error goes by the PFD alone: 40 + 40 / (0.02 x 100) = 60 ps.
TEST(EvaluateLoop, NoJitterFarOutsideOfTheRange) {
  const Answer answer = Evaluate(Ask({100}, {100}), Bundled("vk40", "2"),
                                 Loop(Primitive::kPll, 15, 1, {15}), {});
  EXPECT_FALSE(answer.max_jitter);
  EXPECT_FALSE(answer.outputs[0].jitter_rms);
  EXPECT_NEAR(answer.phase_error.value(), 60, 1e-9);
  const Finding* note = Find(answer.notes, FindingKind::kNoJitter);
  ASSERT_NE(note, nullptr);
  EXPECT_EQ(note->text.rfind("VCO frequency (input frequency x M / D) is 1500 MHz, but must be", 0),
            0u)
      << note->text;
  EXPECT_NE(note->text.back(), '.');
  EXPECT_EQ(Find(answer.notes, FindingKind::kNoPhaseError), nullptr);
}

TEST(EvaluateLoop, OutputsThatAreNotUsedCountForNothing) {
  Request request = Ask({100}, {100, 777, 50});
  request.outputs[1] = Unused();
  request.outputs[1].phase = 5;  // does not count either
  LoopSettings settings = Loop(Primitive::kPll, 10, 1, {10, 0, 20});
  const Answer answer = Evaluate(request, Bundled("vk40", "2"), settings, {});
  EXPECT_TRUE(answer.within);
  EXPECT_EQ(answer.worst_ppm, Rational(0));
  ASSERT_EQ(answer.outputs.size(), 3u);
  EXPECT_TRUE(answer.outputs[0].used);
  EXPECT_FALSE(answer.outputs[1].used);
  EXPECT_FALSE(answer.outputs[1].jitter);
  EXPECT_TRUE(answer.outputs[2].used);
  EXPECT_TRUE(answer.max_jitter.has_value());
}

TEST(Unsolved, SaysWhy) {
  const Answer answer = Unsolved(
      Primitive::kKruSp, {.engine = true},
      {{.kind = FindingKind::kUnsolved, .text = "No."}});
  EXPECT_FALSE(answer.solved);
  EXPECT_FALSE(answer.within);
  EXPECT_EQ(answer.primitive, Primitive::kKruSp);
  EXPECT_TRUE(answer.source.engine);
  EXPECT_EQ(answer.refusals.at(0).text, "No.");
}

TEST(Refusals, OfTooManyClocks) {
  Request request = Ask({100, 50}, {1, 2, 3, 4, 5, 6, 7});
  EXPECT_TRUE(Refusals(request, Primitive::kPll).empty());
  EXPECT_TRUE(Refusals(request, Primitive::kTsyn).empty());
  const std::vector<Finding> refusals = Refusals(request, Primitive::kKruSp);
  ASSERT_EQ(refusals.size(), 2u);
  EXPECT_EQ(refusals[0].kind, FindingKind::kTooManyInputs);
  EXPECT_EQ(refusals[0].value, Rational(2));
  EXPECT_EQ(refusals[0].range.highest, Rational(1));
  EXPECT_EQ(refusals[1].kind, FindingKind::kTooManyOutputs);
  EXPECT_EQ(refusals[1].value, Rational(7));
  EXPECT_EQ(refusals[1].range.highest, Rational(6));
  EXPECT_EQ(Refusals(request, Primitive::kKruClkgen).size(), 2u);
  // A place that stays empty needs no pin.
  request.inputs.pop_back();
  request.outputs[3].used = false;
  EXPECT_TRUE(Refusals(request, Primitive::kKruSp).empty());
  EXPECT_TRUE(Refusals(request, Primitive::kKruClkgen).empty());
}

}  // namespace

}  // namespace planner::answer
