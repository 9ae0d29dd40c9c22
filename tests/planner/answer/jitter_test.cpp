// Jitter by hand, and that it is the calculator's in every bit, refusals included.
#include "planner/answer/Jitter.h"

#include <gtest/gtest.h>

#include <ostream>
#include <random>
#include <string>

#include "planner/answer/CalculatorRefusal.h"
#include "planner/answer/Evaluate.h"
#include "tests/host/calculator_support.h"
#include "tests/planner/answer/answer_support.h"
#include "tests/planner/answer/bundled_device.h"

namespace planner::answer {

namespace {

using namespace answer_test;  // NOLINT: what all tests of this folder begin with
using calculator_test::Asked;

constexpr Calculator::LoopCoefficients kCoefficients = {.kappa = 30,
                                                        .kappa_vco = 1000,
                                                        .bandwidth_low = 0.01,
                                                        .bandwidth_optimized = 0.02,
                                                        .bandwidth_high = 0.04,
                                                        .buffer_jitter = 2,
                                                        .deterministic_jitter = 20,
                                                        .static_offset = 40,
                                                        .leakage = 40};

// PFD 100 MHz, VCO 1000 MHz: 30 x sqrt(1 / (4 pi x 2)) = 5.98413 ps of the oscillator;
// 100 / 14.069 x sqrt(pi x 0.02) = 1.78167 ps of the input; variance 35.8099 + 3.1743 + 4 =
// 42.9842, rms 6.55623; 14.069 x 6.55623 + 20 = 112.240.
TEST(LoopJitter, ByHand) {
  const LoopJitter jitter(kCoefficients, 100, 100);
  EXPECT_TRUE(jitter.IsKnown());
  EXPECT_NEAR(jitter.PeakToPeak(80, 1, Bandwidth::kOptimized), 112.240, 5e-4);
  EXPECT_NEAR(jitter.Rms(80, 1, Bandwidth::kOptimized), 6.55623, 5e-6);
  EXPECT_NEAR(jitter.PhaseError(1, Bandwidth::kOptimized), 60, 1e-9);  // 40 + 40 / 2
}

TEST(LoopJitter, UnknownWithoutCoefficientsAndBeyondWhatTheModelTakes) {
  EXPECT_EQ(LoopJitter(std::nullopt, 100, 0).PeakToPeak(80, 1, Bandwidth::kLow), kUnknownJitter);
  EXPECT_FALSE(LoopJitter(kCoefficients, 2e6, 0).IsKnown());
  EXPECT_FALSE(LoopJitter(kCoefficients, 100, 2e6).IsKnown());
  EXPECT_EQ(LoopJitter(kCoefficients, 100, 2e6).Rms(80, 1, Bandwidth::kLow), kUnknownJitter);
  EXPECT_FALSE(LoopJitter(HandMade(), Ask({100}, {100})).IsKnown());
  EXPECT_TRUE(LoopJitter(Bundled("vk10", "1"), Ask({100}, {100})).IsKnown());
}

// What a search may rely on when it leaves out a smaller M / D^2.
TEST(LoopJitter, FallsWithMOverDSquared) {
  std::mt19937 random(1);
  const LoopJitter jitter(kCoefficients, 33.333, 70);
  ASSERT_TRUE(jitter.FallsWithRatio());
  const auto draw = [&](int most) { return 1 + static_cast<int>(random() % unsigned(most)); };
  for (int i = 0; i < 200'000; ++i) {
    int m = draw(512), d = draw(80), other_m = draw(512), other_d = draw(80);
    if (i % 4 == 0) {  // the same ratio: 4 M of 2 D
      other_m = 4 * draw(128);
      other_d = 2 * draw(40);
      m = other_m / 4;
      d = other_d / 2;
    }
    if (m * other_d * other_d < other_m * d * d) {
      std::swap(m, other_m);
      std::swap(d, other_d);
    }
    for (const Bandwidth bandwidth : hardware::kBandwidths) {
      ASSERT_LE(jitter.PeakToPeak(m, d, bandwidth),
                jitter.PeakToPeak(other_m, other_d, bandwidth) * (1 + LoopJitter::kRounding));
    }
  }
}

// What a search may rely on when it leaves out a larger M or D.
TEST(KruJitter, RisesWithMAndD) {
  for (const char* const input : {"100", "999", "61"}) {
    const Request request = Ask({Rational::FromDecimal(input, 0) / 3}, {100});
    const KruJitter jitter(Bundled("vk40", "2"), request, Primitive::kKruSp);
    ASSERT_TRUE(jitter.RisesWithSettings());
    const auto of = [&](int m, int d) {
      KruSettings settings;
      settings.m = m;
      settings.d = d;
      return jitter.PeakToPeak(settings, Pin::kClkfx);
    };
    int compared = 0;
    for (int m = 2; m <= 32; ++m) {
      for (int d = 1; d <= 32; ++d) {
        if (of(m, d) == kUnknownJitter) continue;
        // That of a frequency out of range is not known, which is above all others.
        ASSERT_LE(of(m, d), of(m + 1, d));
        ASSERT_LE(of(m, d), of(m, d + 1));
        ++compared;
      }
    }
    EXPECT_GT(compared, 100);
  }
}

TEST(KruJitter, RisesWithAPhaseShift) {
  const KruJitter jitter(Bundled("vk40", "2"), Ask({100}, {100}), Primitive::kKruSp);
  KruSettings settings;
  settings.m = 3;
  settings.d = 2;
  for (const hardware::PinFacts& facts : hardware::kPins) {
    if (!facts.is_sp) continue;
    settings.phase_shift = 0;
    const double still = jitter.PeakToPeak(settings, facts.pin);
    settings.phase_shift = 1;
    // One length more that is set in taps of 30 ps.
    EXPECT_NEAR(jitter.PeakToPeak(settings, facts.pin), still + 30, 1e-9) << facts.name;
  }
}

// --- The calculator's figures ------------------------------------------------------------------

struct GradeName {
  const char* device;
  const char* grade;
};
void PrintTo(const GradeName& grade, std::ostream* stream) {
  *stream << grade.device << " " << grade.grade;
}
constexpr GradeName kGrades[] = {{"vk10", "1"}, {"vk20", "2"}, {"vk40", "1"}, {"vk40", "2"}};

class Against : public testing::TestWithParam<GradeName> {
 protected:
  Against()
      : device_(Bundled(GetParam().device, GetParam().grade)),
        asked_(calculator_test::BundledGrade(GetParam().device, GetParam().grade)) {}

  int Draw(int count) { return static_cast<int>(random_() % static_cast<unsigned>(count)); }

  // Over all limits, and often near one.
  Rational DrawInput() {
    const int of[] = {1, 19, 27, 100, 250, 312, 500, 900};
    return of[Draw(8)] + Rational(Draw(1000), 1000);
  }

  // That a figure is the calculator's, or missing with its reason.
  template <typename Figure>
  void Expect(const calculator_test::Answer& expected, const Figure& figure,
              const std::string& reason) {
    if (expected.error.empty()) {
      ++answered_;
      ASSERT_TRUE(figure.has_value()) << reason;
      ASSERT_EQ(*figure, expected.figure);
    } else {
      ++refused_;
      ASSERT_FALSE(figure.has_value()) << expected.error;
      ASSERT_EQ(reason + ".", expected.error);
    }
  }

  static std::string ReasonOf(const Answer& answer, FindingKind kind) {
    for (const Finding& note : answer.notes) {
      if (note.kind == kind) return note.text;
    }
    return "none";
  }

  Device device_;
  Asked asked_;
  std::mt19937 random_{20261121};
  int answered_ = 0;
  int refused_ = 0;
};

TEST_P(Against, TheCalculatorOfLoops) {
  for (const Primitive primitive : {Primitive::kPll, Primitive::kTsyn}) {
    if (!device_.Has(primitive)) continue;
    for (int i = 0; i < 4000; ++i) {
      Request request = Ask({DrawInput()}, {100});
      request.input_jitter = Draw(3) == 0 ? Rational(0) : Rational(Draw(5000), 7);
      if (Draw(50) == 0) request.input_jitter = 1'000'001;
      LoopSettings settings = Loop(primitive, 5 + Draw(30), 1 + Draw(20), {1 + Draw(128)},
                                   hardware::kBandwidths[static_cast<std::size_t>(Draw(3))]);
      if (primitive == Primitive::kTsyn) settings.m += Draw(8);
      const Answer answer = Evaluate(request, device_, settings, {});
      const double input = request.inputs[0].ToDouble();
      const std::string bandwidth(hardware::Name(settings.bandwidth));
      Expect(asked_.Jitter(input, settings.m / 8.0, settings.d, bandwidth.c_str(),
                           settings.outputs[0].divider / 8.0, request.input_jitter.ToDouble()),
             answer.outputs[0].jitter, ReasonOf(answer, FindingKind::kNoJitter));
      Expect(asked_.PhaseError(input, settings.d, bandwidth.c_str()), answer.phase_error,
             ReasonOf(answer, FindingKind::kNoPhaseError));
      if (HasFatalFailure()) return;
      // Peak to peak is 14.069 x rms + the deterministic part, a coefficient.
      if (answer.max_jitter && i % 100 == 0) {
        const double deterministic = *calculator_test::BundledGrade(GetParam().device,
                                                                    GetParam().grade)
                                          .CoefficientOf("LOOP_DETERMINISTIC_JITTER");
        EXPECT_DOUBLE_EQ(*answer.outputs[0].jitter,
                         14.069 * *answer.outputs[0].jitter_rms + deterministic);
      }
    }
    EXPECT_GT(answered_, 200);
    EXPECT_GT(refused_, 200);
  }
}

// The calculator's codes of the pins.
int CodeOf(Pin pin) {
  const std::pair<Pin, int> codes[] = {
      {Pin::kClk0, 1},    {Pin::kClk90, 2},    {Pin::kClk180, 3},   {Pin::kClk270, 4},
      {Pin::kClk2x, 5},   {Pin::kClk2x180, 7}, {Pin::kClkfx, 8},    {Pin::kClkfx180, 9},
      {Pin::kClkdv, 10},  {Pin::kClkfxdv, 8}};
  for (const auto& [one, code] : codes) {
    if (one == pin) return code;
  }
  return 0;
}

TEST_P(Against, TheCalculatorOfKrus) {
  for (const Primitive primitive : {Primitive::kKruSp, Primitive::kKruClkgen}) {
    if (!device_.Has(primitive)) continue;
    const bool is_sp = primitive == Primitive::kKruSp;
    for (int i = 0; i < 4000; ++i) {
      const hardware::PinFacts& facts = hardware::kPins[static_cast<std::size_t>(Draw(10))];
      if (!(is_sp ? facts.is_sp : facts.is_clkgen)) continue;
      Request request = Ask({DrawInput()}, {100});
      KruSettings settings;
      settings.primitive = primitive;
      settings.pins = {facts.pin};
      settings.divide_halves = 4 << Draw(2);
      if (is_sp) {
        settings.feedback = Draw(2) == 0;
        settings.divide_by_2 = Draw(2) == 0;
        settings.phase_shift = Draw(2) * 100;
      }
      if (facts.source == hardware::PinSource::kSynthesiser || !is_sp) {
        settings.m = 2 + Draw(20);
        settings.d = 1 + Draw(20);
      }
      const Answer answer = Evaluate(request, device_, settings, {});
      Expect(asked_.KruJitter(request.inputs[0].ToDouble(), CodeOf(facts.pin), !is_sp,
                              settings.divide_by_2, settings.feedback, settings.phase_shift != 0,
                              settings.m, settings.d),
             answer.outputs[0].jitter, ReasonOf(answer, FindingKind::kNoJitter));
      Expect(asked_.KruPhaseError(), answer.phase_error,
             ReasonOf(answer, FindingKind::kNoPhaseError));
      if (HasFatalFailure()) return;
      request.input_jitter = 50;
      const Answer noisy = Evaluate(request, device_, settings, {});
      if (answer.outputs[0].jitter) {
        ASSERT_EQ(*noisy.outputs[0].jitter, *answer.outputs[0].jitter + 50);
      }
    }
    EXPECT_GT(answered_, 200);
    EXPECT_GT(refused_, 200);
  }
}

INSTANTIATE_TEST_SUITE_P(Jitter, Against, testing::ValuesIn(kGrades), [](const auto& test) {
  return std::string(test.param.device) + "_" + test.param.grade;
});

}  // namespace

}  // namespace planner::answer
