// What settings of a KRU make, worked out by hand.
#include <gtest/gtest.h>

#include <ostream>

#include "planner/answer/Evaluate.h"
#include "tests/planner/answer/answer_support.h"
#include "tests/planner/answer/bundled_device.h"

namespace planner::answer {

namespace {

using namespace answer_test;  // NOLINT: what all tests of this folder begin with

KruSettings Sp(std::vector<Pin> pins) {
  KruSettings settings;
  settings.feedback = true;
  settings.pins = std::move(pins);
  return settings;
}
KruSettings Clkgen(int m, int d, std::vector<Pin> pins, int divide_halves = 0) {
  KruSettings settings;
  settings.primitive = Primitive::kKruClkgen;
  settings.m = m;
  settings.d = d;
  settings.divide_halves = divide_halves;
  settings.pins = std::move(pins);
  return settings;
}

// The line runs at 100 / 2 = 50 MHz, a period of 0.02 us; three buffers: output, divider in front,
// feedback. CLK180: variance 60^2 x 0.02 + 3 x 3^2 = 99, rms 9.949874; 14.069 x 9.949874 + 30 =
// 169.9848 ps. CLK2X has a second tap: 199.9848. CLKFX: 60^2 x 1 x 0.02 + 3 x 30^2 / 12 + 27 = 324,
// rms 18; 14.069 x 18 + 2 x 30 = 313.242.
// Margin: output 0 on CLK2X: of 10 to 400 MHz, (400 - 100) / 400 = 3/4; output 1 on CLK180, whose
// range is then that with feedback from CLK2X, 5 to 200: (200 - 50) / 200 = 3/4; output 2 on CLKFX,
// 5 to 400: (400 - 150) / 400 = 5/8.
TEST(EvaluateKru, ThreePins) {
  Request request = Ask({100}, {100, 50, 150});
  request.outputs[0].phase = 0;
  request.outputs[1].phase = 180;
  request.outputs[2].phase = 0;
  KruSettings settings = Sp({Pin::kClk2x, Pin::kClk180, Pin::kClkfx});
  settings.divide_by_2 = true;
  settings.m = 3;
  settings.d = 1;
  const Answer answer = Evaluate(request, Bundled("vk40", "2"), settings, {});
  EXPECT_TRUE(answer.within);
  EXPECT_EQ(answer.primitive, Primitive::kKruSp);
  EXPECT_EQ(answer.vco, Rational(0));
  EXPECT_EQ(answer.margin, Rational(5, 8));
  const Rational ratios[] = {1, Rational(1, 2), Rational(3, 2)};
  const int phases[] = {0, 180, 0};
  const double jitters[] = {199.9848, 169.9848, 313.242};
  const double rms[] = {9.949874, 9.949874, 18};
  for (std::size_t i = 0; i < 3; ++i) {
    const OutputAnswer& output = answer.outputs[i];
    EXPECT_EQ(output.ratio, ratios[i]);
    EXPECT_EQ(output.error_ppm, Rational(0));
    EXPECT_EQ(output.phase, Rational(phases[i]));
    EXPECT_EQ(output.phase_error, Rational(0));
    EXPECT_EQ(output.duty, Rational(50));
    EXPECT_NEAR(output.jitter.value(), jitters[i], 1e-4);
    EXPECT_NEAR(output.jitter_rms.value(), rms[i], 1e-6);
  }
  EXPECT_NEAR(answer.max_jitter.value(), 313.242, 1e-4);
  EXPECT_EQ(answer.phase_error, 150.0);
  EXPECT_TRUE(answer.notes.empty());
}

// The input's jitter passes: 20 ps more, 20 / 14.069 = 1.421565 ps rms.
TEST(EvaluateKru, WithTheJitterOfTheInput) {
  Request request = Ask({100}, {50});
  request.input_jitter = 20;
  KruSettings settings = Sp({Pin::kClk180});
  settings.divide_by_2 = true;
  const Answer answer = Evaluate(request, Bundled("vk40", "2"), settings, {});
  EXPECT_NEAR(answer.outputs[0].jitter.value(), 189.9848, 1e-4);
  EXPECT_NEAR(answer.outputs[0].jitter_rms.value(), 9.949874 + 1.421565, 1e-6);
  ASSERT_EQ(answer.notes.size(), 1u);
  EXPECT_EQ(answer.notes[0].kind, FindingKind::kInputJitterPasses);
  EXPECT_EQ(answer.notes[0].value, Rational(20));
}

// A shift of 17 steps is 17 x 360 / 255 = 24 degrees.
TEST(EvaluateKru, PhasesAreShiftedAlike) {
  Request request = Ask({100}, {100, 100, 40});
  request.outputs[0].phase = 24;
  request.outputs[1].phase = -65;
  request.outputs[2].duty = 40;
  KruSettings settings = Sp({Pin::kClk0, Pin::kClk270, Pin::kClkdv});
  settings.phase_shift = 17;
  settings.divide_halves = 5;
  const Answer answer = Evaluate(request, HandMade(), settings, {});
  EXPECT_EQ(answer.outputs[0].phase, Rational(24));
  EXPECT_EQ(answer.outputs[0].phase_error, Rational(0));
  EXPECT_EQ(answer.outputs[1].phase, Rational(294));
  EXPECT_EQ(answer.outputs[1].phase_error, Rational(-1));  // 294 is -66
  EXPECT_EQ(answer.outputs[2].frequency, Rational(40));
  EXPECT_EQ(answer.outputs[2].duty, Rational(40));
  EXPECT_EQ(answer.outputs[2].duty_error, Rational(0));
  EXPECT_EQ(answer.worst_error, Rational(2));
  ASSERT_EQ(answer.outputs[1].misses.size(), 1u);
  EXPECT_EQ(answer.outputs[1].misses[0].primitive, Primitive::kKruSp);
}

// --- Ranges -------------------------------------------------------------------------------

struct Edge {
  const char* what;
  std::vector<Pin> pins;
  Rational input;
  int m;
  int d;
  int divide_halves;
  int direction;
  std::size_t output;
  std::string pin;
  Range range;
  bool feedback_2x;
};

void PrintTo(const Edge& edge, std::ostream* stream) { *stream << edge.what; }

class KruEdges : public testing::TestWithParam<Edge> {};

// As for loops: the end is inside, one part in 10^30 beyond is not.
TEST_P(KruEdges, TheEndIsInsideAndNothingBeyond) {
  const Edge& edge = GetParam();
  KruSettings settings = Sp(edge.pins);
  settings.m = edge.m;
  settings.d = edge.d;
  settings.divide_halves = edge.divide_halves;
  const Device device = HandMade();
  const auto evaluate = [&](const Rational& input) {
    Request request = Ask({input}, {});
    for (const Pin pin : edge.pins) {
      request.outputs.push_back(
          Frequency(edge.input * hardware::PinRatio(pin, settings.Ratios())));
    }
    return Evaluate(request, device, settings, {});
  };
  const Answer inside = evaluate(edge.input);
  EXPECT_TRUE(inside.within);
  EXPECT_EQ(inside.margin, Rational(0));
  const Answer outside = evaluate(edge.input + edge.direction * Sliver(edge.input));
  EXPECT_FALSE(outside.within);
  EXPECT_EQ(outside.margin, -Sliver(1));
  ASSERT_EQ(outside.violations.size(), 1u);
  const Finding& finding = outside.violations[0];
  EXPECT_EQ(finding.kind, FindingKind::kOutsideLimit);
  EXPECT_EQ(finding.quantity, Quantity::kFrequency);
  EXPECT_EQ(finding.output, static_cast<int>(edge.output));
  EXPECT_EQ(finding.pin, edge.pin);
  EXPECT_EQ(finding.range, edge.range);
  EXPECT_EQ(finding.feedback_2x, edge.feedback_2x);
  EXPECT_EQ(outside.outputs[edge.output].violations.size(), 1u);
}

INSTANTIATE_TEST_SUITE_P(
    EvaluateKru, KruEdges,
    testing::Values(
        Edge{"the highest of CLK0", {Pin::kClk0}, 300, 0, 0, 0, 1, 0, "CLK0", {5, 300}, false},
        Edge{"the lowest", {Pin::kClk0}, 5, 0, 0, 0, -1, 0, "CLK0", {5, 300}, false},
        Edge{"CLK180 is as CLK0", {Pin::kClk180}, 300, 0, 0, 0, 1, 0, "CLK180", {5, 300}, false},
        Edge{"CLK90", {Pin::kClk90}, 250, 0, 0, 0, 1, 0, "CLK90", {5, 250}, false},
        Edge{"with feedback from CLK2X", {Pin::kClk2x, Pin::kClk0}, 150, 0, 0, 0, 1, 1, "CLK0",
             {5, 150}, true},
        Edge{"not from another output", {Pin::kClk0, Pin::kClk2x}, 200, 0, 0, 0, 1, 1,
             "CLK2X", {10, 400}, false},
        Edge{"CLKDV, 400 / 2", {Pin::kClkdv}, 400, 0, 0, 4, 1, 0, "CLKDV", {Rational(1, 4), 200},
             false},
        Edge{"CLK90 with feedback from CLK2X", {Pin::kClk2x, Pin::kClk90}, 120, 0, 0, 0, 1, 1,
             "CLK90", {5, 120}, true},
        Edge{"the lowest of CLKFX", {Pin::kClkfx180}, 60, 2, 24, 0, -1, 0, "CLKFX180", {5, 400},
             false}),
    [](const auto& test) { return std::to_string(test.index); });

// A pin whose range is the same with feedback from CLK2X is said to be out of its usual one.
TEST(EvaluateKru, FeedbackFromClk2xIsToldWhereItMatters) {
  KruSettings settings = Sp({Pin::kClk2x, Pin::kClkfx, Pin::kClk0});
  settings.m = 9;
  settings.d = 2;
  const Answer answer = Evaluate(Ask({100}, {200, 450, 100}), HandMade(), settings, {});
  ASSERT_EQ(answer.violations.size(), 1u);
  EXPECT_EQ(answer.violations[0].pin, "CLKFX");
  EXPECT_FALSE(answer.violations[0].feedback_2x);
  EXPECT_EQ(answer.margin, Rational(-1, 8));  // (400 - 450) / 400
}

// --- KRU_CLKGEN ----------------------------------------------------------------------------

// 100 x 3 / 2 = 150 on CLKFX, 150 / 4 = 37.5 on CLKFXDV, whose jitter is that of CLKFX: variance
// 60^2 x 2 x 0.01 + 3 x 30^2 / 12 + 3^2 = 72 + 225 + 9 = 306, rms 17.49286; 14.069 x that + 60 =
// 306.1070.
TEST(EvaluateKru, ADividedSynthesiser) {
  Request request = Ask({100}, {150, Rational(75, 2), 150});
  request.outputs[0].phase = 90;
  request.outputs[0].phase_tolerance = 90;
  request.outputs[2].phase = 180;
  const Answer answer =
      Evaluate(request, Bundled("vk40", "2"),
               Clkgen(3, 2, {Pin::kClkfx, Pin::kClkfxdv, Pin::kClkfx180}, 8), {});
  EXPECT_TRUE(answer.within);
  EXPECT_EQ(answer.outputs[1].ratio, Rational(3, 8));
  EXPECT_EQ(answer.outputs[1].frequency, Rational(75, 2));
  EXPECT_EQ(answer.outputs[2].phase, Rational(180));
  EXPECT_NEAR(answer.outputs[0].jitter.value(), 306.1070, 1e-4);
  EXPECT_EQ(answer.outputs[0].jitter, answer.outputs[1].jitter);
  ASSERT_EQ(answer.notes.size(), 1u);
  EXPECT_EQ(answer.notes[0].kind, FindingKind::kOutput0Phase);
  EXPECT_EQ(answer.notes[0].value, Rational(90));
  // 37.5 of 5/32 to 200, 150 of 5 to 400.
  EXPECT_EQ(answer.margin, Rational(5, 8));
}

// The line of CLKDV is out of its range, 5 to 312.5 MHz, though CLKDV is not: 320 / 2 = 160.
TEST(EvaluateKru, NoJitterOfADivideOfALineThatIsTooFast) {
  KruSettings settings = Sp({Pin::kClkfx, Pin::kClkdv});
  settings.m = 2;
  settings.d = 4;
  settings.divide_halves = 4;
  const Answer answer = Evaluate(Ask({320}, {160, 160}), Bundled("vk40", "2"), settings, {});
  EXPECT_TRUE(answer.violations.empty());
  EXPECT_TRUE(answer.outputs[0].jitter);
  EXPECT_FALSE(answer.outputs[1].jitter);
  EXPECT_FALSE(answer.max_jitter);
  ASSERT_EQ(answer.notes.size(), 1u);
  EXPECT_EQ(answer.notes[0].kind, FindingKind::kNoJitter);
  EXPECT_EQ(answer.notes[0].outputs, std::vector<int>{1});
  EXPECT_EQ(answer.notes[0].text.rfind("Delay-line frequency is 320 MHz, but must be", 0), 0u)
      << answer.notes[0].text;
}

TEST(EvaluateKru, WithoutCoefficients) {
  const Answer answer =
      Evaluate(Ask({100}, {150}), HandMade(), Clkgen(3, 2, {Pin::kClkfx}), {});
  EXPECT_FALSE(answer.max_jitter);
  EXPECT_FALSE(answer.phase_error);
  ASSERT_EQ(answer.notes.size(), 2u);
  EXPECT_EQ(answer.notes[0].kind, FindingKind::kNoJitter);
  EXPECT_EQ(answer.notes[0].text, "");
  EXPECT_EQ(answer.notes[1].kind, FindingKind::kNoPhaseError);
}

TEST(EvaluateKru, OutputsThatAreNotUsedHaveNoPin) {
  Request request = Ask({100}, {1, 100});
  request.outputs[0] = Unused();
  const Answer answer = Evaluate(request, HandMade(), Sp({Pin::kNone, Pin::kClk0}), {});
  EXPECT_TRUE(answer.within);
  EXPECT_FALSE(answer.outputs[0].used);
  EXPECT_EQ(answer.outputs[1].frequency, Rational(100));
}

}  // namespace

}  // namespace planner::answer
