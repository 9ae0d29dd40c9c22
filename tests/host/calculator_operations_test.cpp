// The operations of a calculator, as the engine calls them: answers of the bundled devices, and
// the sentence for each argument that is refused.
#include <gtest/gtest.h>

#include <string>

#include "tests/host/calculator_support.h"

namespace {

using calculator_test::Answer;
using calculator_test::Asked;
using calculator_test::BundledGrade;
using calculator_test::GradeOf;
using calculator_test::kInfinity;
using calculator_test::kNan;

constexpr int kClk0 = 1, kClk90 = 2, kClk180 = 3, kClk270 = 4, kClk2x = 5, kClk2x180 = 7,
              kClkfx = 8, kClkfx180 = 9, kClkdv = 10, kUnknownPin = 12;

class Operations : public testing::Test {
 protected:
  Asked pll_{BundledGrade("vk10", "1"), "vk10"};   // PLL and both KRUs
  Asked tsyn_{BundledGrade("vk20", "2"), "vk20"};  // TSYN alone
  Asked vk40_{BundledGrade("vk40", "2"), "vk40"};  // all
};

// A refusal whose sentence begins and ends so.
void ExpectRefused(const Answer& answer, const std::string& begin, const std::string& end = ".") {
  EXPECT_TRUE(answer.error.starts_with(begin)) << answer.error << "\n  is not: " << begin;
  EXPECT_TRUE(answer.error.ends_with(end)) << answer.error;
}

// --- 1: VCO frequency ------------------------------------------------------------------------

TEST_F(Operations, VcoFrequency) {
  EXPECT_EQ(vk40_.Vco(100, 10, 1).figure, 1000.0);
  EXPECT_EQ(vk40_.Vco(33, 20, 3).figure, 220.0);
  EXPECT_EQ(tsyn_.Vco(100, 7.125, 1).figure, 712.5);
  EXPECT_EQ(vk40_.Vco(100, 10, 1, 1).figure, 1000.0);
  EXPECT_EQ(vk40_.Vco(25, 4, 2, 16).figure, 800.0) << "a divider in the feedback";
}

// Arithmetic, also where no VCO runs.
TEST_F(Operations, VcoFrequencyBeyondTheRange) {
  EXPECT_EQ(vk40_.Vco(1e6, 64, 1, 128).figure, 8.192e9);
  EXPECT_EQ(vk40_.Vco(1e-6, 1, 80).figure, 1e-6 / 80);
}

TEST_F(Operations, VcoFrequencyChecksEveryArgument) {
  for (const double wrong : {0.0, -1.0, 1e7, kNan, kInfinity, -kInfinity}) {
    ExpectRefused(vk40_.Vco(wrong, 10, 1), "Input frequency is ",
                  " MHz, but must be from 1e-06 to 1e+06 MHz.");
  }
  for (const double wrong : {0.0, -1.0, 65.0, 2.5, kNan, kInfinity}) {
    ExpectRefused(vk40_.Vco(100, wrong, 1), "M is ", " for a TSYN.");
  }
  for (const double wrong : {0.0, -1.0, 81.0, 1.5, kNan, kInfinity}) {
    ExpectRefused(vk40_.Vco(100, 10, wrong), "D is ", "a whole number from 1 to 80.");
  }
  for (const double wrong : {-1.0, 0.5, 129.0, kNan, kInfinity}) {
    ExpectRefused(vk40_.Vco(100, 10, 1, wrong), "Feedback divider is ", " for a TSYN.");
  }
}

TEST_F(Operations, TheFirstWrongArgumentIsNamed) {
  ExpectRefused(vk40_.Vco(0, 0, 0, -1), "Input frequency is 0 MHz");
  ExpectRefused(vk40_.Vco(100, 0, 0, -1), "M is 0");
  ExpectRefused(vk40_.Vco(100, 1, 0, -1), "D is 0");
}

// --- 2: PLL and TSYN jitter ------------------------------------------------------------------

// The values of the loop's own tests; those of vk10 and vk20 are worked out here.
TEST_F(Operations, PllJitter) {
  EXPECT_NEAR(vk40_.Jitter(100, 10, 1, "OPTIMIZED", 4, 100).figure, 112.2397, 1e-3);
  EXPECT_NEAR(vk40_.Jitter(100, 10, 1, "LOW").figure, 142.3435, 1e-3);
  // vk20: PFD 25, VCO 600, loop 0.375 MHz; kappa 25 * sqrt(1 / 0.6) = 32.2749;
  // 32.2749 * sqrt(1 / (4 pi * 0.375)) = 14.8677; variance 221.0485 + 4; rms 15.0016;
  // 14.069 * 15.0016 + 15 = 226.0578.
  EXPECT_NEAR(tsyn_.Jitter(50, 24, 2, "OPTIMIZED").figure, 226.0578, 1e-3);
  // vk10: PFD 100, VCO 800 where kappa is 40, loop 4 MHz: 40 * 0.28209479 / 2 = 5.64190;
  // variance 31.8310 + 9; rms 6.38992; 14.069 * 6.38992 + 30 = 119.8998.
  EXPECT_NEAR(pll_.Jitter(100, 8, 1, "HIGH").figure, 119.8998, 1e-3);
}

TEST_F(Operations, DividersLeaveJitterAsItIs) {
  const double jitter = vk40_.Jitter(100, 8, 1, "HIGH", 1, 200).figure;
  for (const double divider : {2.0, 2.125, 7.0, 127.875, 128.0}) {
    EXPECT_EQ(vk40_.Jitter(100, 8, 1, "HIGH", divider, 200).figure, jitter) << divider;
  }
}

TEST_F(Operations, TheSlowerGradeHasMoreJitter) {
  Asked slow(BundledGrade("vk40", "1"), "vk40");
  for (const char* setting : {"LOW", "OPTIMIZED", "HIGH"}) {
    EXPECT_GT(slow.Jitter(100, 10, 1, setting, 4, 100).figure,
              vk40_.Jitter(100, 10, 1, setting, 4, 100).figure);
  }
}

TEST_F(Operations, PllJitterChecksEveryArgument) {
  ExpectRefused(vk40_.Jitter(kNan, 10, 1, "LOW"), "Input frequency is nan MHz");
  ExpectRefused(vk40_.Jitter(100, 2.5, 1, "LOW"), "M is 2.5");
  ExpectRefused(vk40_.Jitter(100, 10, 0, "LOW"), "D is 0");
  for (const char* wrong : {"", "low", "Optimized", "MAX", "LOW HIGH"}) {
    ExpectRefused(vk40_.Jitter(100, 10, 1, wrong), "Bandwidth is \"" + std::string(wrong) + "\"",
                  ", but must be LOW, HIGH or OPTIMIZED.");
  }
  for (const double wrong : {0.0, -4.0, 1.5, 129.0, kNan, kInfinity}) {
    ExpectRefused(vk40_.Jitter(100, 10, 1, "LOW", wrong), "Output divider is ");
  }
  for (const double wrong : {-1.0, 2e6, kNan, kInfinity}) {
    ExpectRefused(vk40_.Jitter(100, 10, 1, "LOW", 4, wrong), "Input jitter is ",
                  " ps, but must be from 0 to 1e+06 ps.");
  }
}

// A loop that cannot lock has no jitter.
TEST_F(Operations, PllJitterNeedsALoopThatLocks) {
  EXPECT_EQ(pll_.Jitter(100, 11, 1, "LOW").error,
            "VCO frequency (input frequency x M / D) is 1100 MHz, but must be from 400 to 1080 MHz "
            "for a PLL.");
  EXPECT_EQ(pll_.Jitter(100, 40, 8, "LOW").error,
            "PFD frequency (input frequency / D) is 12.5 MHz, but must be from 19 to 500 MHz for a "
            "PLL.");
  EXPECT_EQ(tsyn_.Jitter(400, 6, 2, "LOW").error, "") << "PFD 200";
  EXPECT_EQ(tsyn_.Jitter(400, 1, 1, "LOW").error,
            "PFD frequency (input frequency / D) is 400 MHz, but must be from 10 to 300 MHz for a "
            "TSYN.");
}

// --- 4: KRU jitter ---------------------------------------------------------------------------

TEST_F(Operations, KruJitter) {
  EXPECT_NEAR(vk40_.KruJitter(100, kClk0, false, false, true, false, 0, 0).figure, 133.3856, 1e-3);
  EXPECT_NEAR(vk40_.KruJitter(100, kClkfx, false, false, false, false, 3, 2).figure, 306.1070,
              1e-3);
  EXPECT_NEAR(vk40_.KruJitter(100, kClk0, false, true, true, true, 0, 0).figure, 199.9848, 1e-3);
  // Both KRUs have the same synthesiser.
  EXPECT_EQ(vk40_.KruJitter(100, kClkfx180, true, false, false, false, 3, 2).figure,
            vk40_.KruJitter(100, kClkfx, false, false, false, false, 3, 2).figure);
  EXPECT_EQ(vk40_.KruJitter(100, kClkfx, true, false, false, false, 200, 150).error, "");
}

TEST_F(Operations, KruJitterChecksEveryArgument) {
  ExpectRefused(vk40_.KruJitter(0, kClk0, false, false, true, false, 0, 0),
                "Input frequency is 0 MHz");
  for (const int wrong : {kUnknownPin, 0, 6, 11, -1}) {
    EXPECT_EQ(vk40_.KruJitter(100, wrong, false, false, true, false, 0, 0).error,
              "Pin is unknown (code " + std::to_string(wrong) +
                  "), but must be CLK0, CLK90, CLK180, CLK270, CLK2X, CLK2X180, CLKFX, CLKFX180 or "
                  "CLKDV.");
  }
  EXPECT_EQ(vk40_.KruJitter(100, kClk0, true, false, false, false, 3, 2).error,
            "Pin is CLK0, but must be CLKFX or CLKFX180 for a KRU_CLKGEN.");
  EXPECT_EQ(vk40_.KruJitter(100, kClkfx, true, true, false, false, 3, 2).error,
            "CLKIN_DIVIDE_BY_2 is true, but must be false for a KRU_CLKGEN.");
  EXPECT_EQ(vk40_.KruJitter(100, kClkfx, true, false, true, false, 3, 2).error,
            "Feedback used is true, but must be false for a KRU_CLKGEN.");
  EXPECT_EQ(vk40_.KruJitter(100, kClkfx, true, false, false, true, 3, 2).error,
            "Fixed phase shift is true, but must be false for a KRU_CLKGEN.");
  for (const double wrong : {0.0, 1.0, 33.0, kNan}) {
    ExpectRefused(vk40_.KruJitter(100, kClkfx, false, false, false, false, wrong, 2), "M is ",
                  "a whole number from 2 to 32 for a KRU_SP.");
  }
  for (const double wrong : {0.0, 257.0, -kInfinity}) {
    ExpectRefused(vk40_.KruJitter(100, kClkfx, true, false, false, false, 3, wrong), "D is ",
                  "a whole number from 1 to 256 for a KRU_CLKGEN.");
  }
}

TEST_F(Operations, KruJitterNeedsAPinThatRuns) {
  EXPECT_EQ(vk40_.KruJitter(400, kClk0, false, false, true, false, 0, 0).error,
            "CLK0 frequency is 400 MHz, but must be from 5 to 312.5 MHz.");
  EXPECT_EQ(vk40_.KruJitter(400, kClk0, false, true, true, false, 0, 0).error, "") << "200 MHz";
  EXPECT_EQ(vk40_.KruJitter(250, kClk2x, false, false, true, false, 0, 0).error,
            "CLK2X frequency is 500 MHz, but must be from 10 to 400 MHz.");
  EXPECT_EQ(vk40_.KruJitter(100, kClkfx, false, false, false, false, 32, 1).error,
            "CLKFX frequency is 3200 MHz, but must be from 5 to 400 MHz.");
  EXPECT_EQ(vk40_.KruJitter(4, kClkdv, false, false, true, false, 0, 0).error,
            "Delay-line frequency is 4 MHz, but must be from 5 to 312.5 MHz.");
}

// --- 5 and 6: phase error --------------------------------------------------------------------

TEST_F(Operations, PllPhaseError) {
  EXPECT_DOUBLE_EQ(vk40_.PhaseError(100, 1, "OPTIMIZED").figure, 60.0);  // 40 + 40 / 2
  EXPECT_DOUBLE_EQ(tsyn_.PhaseError(200, 2, "LOW").figure, 90.0);        // 30 + 30 / 0.5
  ExpectRefused(vk40_.PhaseError(0, 1, "LOW"), "Input frequency is 0 MHz");
  ExpectRefused(vk40_.PhaseError(100, 0, "LOW"), "D is 0");
  ExpectRefused(vk40_.PhaseError(100, 1, "MEDIUM"), "Bandwidth is \"MEDIUM\"");
  ExpectRefused(vk40_.PhaseError(100, 80, "LOW"),
                "PFD frequency (input frequency / D) is 1.25 MHz");
}

TEST_F(Operations, KruPhaseError) {
  EXPECT_EQ(vk40_.KruPhaseError().figure, 150.0);
  EXPECT_EQ(pll_.KruPhaseError().figure, 200.0);
}

// --- 7: KRU period, phase and duty cycle -----------------------------------------------------

TEST_F(Operations, KruPeriodPhaseAndDutyCycle) {
  const struct {
    int pin;
    double period, phase;
  } expected[] = {{kClk0, 10, 0},      {kClk90, 10, 0.25},  {kClk180, 10, 0.5},
                  {kClk270, 10, 0.75}, {kClk2x, 5, 0},      {kClk2x180, 5, 0.5},
                  {kClkfx, 8, 0},      {kClkfx180, 8, 0.5}, {kClkdv, 25, 0}};
  for (const auto& [pin, period, phase] : expected) {
    EXPECT_EQ(vk40_.KruPeriod(100, pin, false, 5, 4, 2.5).figure, period) << pin;
    EXPECT_EQ(vk40_.phase, phase) << pin;
    EXPECT_EQ(vk40_.duty, pin == kClkdv ? 40.0 : 50.0) << pin;
    EXPECT_EQ(vk40_.KruPeriod(100, pin, true, 5, 4, 2.5).figure, 2 * period) << pin;
    EXPECT_EQ(vk40_.phase, phase) << pin;
  }
}

// Arithmetic, also where no KRU runs.
TEST_F(Operations, KruPeriodBeyondTheLimits) {
  EXPECT_EQ(vk40_.KruPeriod(1e6, kClk2x, false).figure, 0.0005);
  EXPECT_EQ(vk40_.KruPeriod(1e-6, kClk0, false).figure, 1e9);
}

TEST_F(Operations, KruPeriodChecksEveryArgument) {
  ExpectRefused(vk40_.KruPeriod(-1, kClk0, false), "Input frequency is -1 MHz");
  ExpectRefused(vk40_.KruPeriod(100, kUnknownPin, false), "Pin is unknown (code 12)");
  ExpectRefused(vk40_.KruPeriod(100, kClkfx, false, 0, 2), "M is 0");
  ExpectRefused(vk40_.KruPeriod(100, kClkfx, false, 3, 0), "D is 0");
  ExpectRefused(vk40_.KruPeriod(100, kClkdv, false, 0, 0, 0), "CLKDV divide is 0");
  ExpectRefused(vk40_.KruPeriod(100, kClk0, false, kNan, 0, 0), "M is nan");
  ExpectRefused(vk40_.KruPeriod(100, kClk0, false, 0, kInfinity, 0), "D is inf");
  ExpectRefused(vk40_.KruPeriod(100, kClk0, false, 0, 0, 1), "CLKDV divide is 1");
  Asked clkgen(GradeOf(calculator_test::kKruClkgenLines + calculator_test::kCalculatorHead +
                       calculator_test::kKruLines));
  EXPECT_EQ(clkgen.KruPeriod(100, kClkfx, false, 5, 4).figure, 8.0);
  EXPECT_EQ(clkgen.KruPeriod(100, kClkfx, true, 5, 4).error,
            "CLKIN_DIVIDE_BY_2 is true, but must be false for a KRU_CLKGEN.");
}

// --- 8: PLL and TSYN period, phase and duty cycle --------------------------------------------

TEST_F(Operations, PllPeriodPhaseAndDutyCycle) {
  EXPECT_EQ(vk40_.Period(100, 10, 1, 4, 100, 40).figure, 4.0);  // 250 MHz
  EXPECT_EQ(vk40_.phase, 101.25);
  EXPECT_EQ(vk40_.duty, 37.5);
  EXPECT_EQ(vk40_.Period(100, 10, 1, 1, -100, 30).figure, 1.0);
  EXPECT_EQ(vk40_.phase, -90.0);
  EXPECT_EQ(vk40_.duty, 50.0);
  EXPECT_EQ(vk40_.Period(50, 16, 1, 100, 0, 20).figure, 125.0);
  EXPECT_EQ(vk40_.phase, 0.0);
  EXPECT_EQ(vk40_.duty, 36.0);
}

TEST_F(Operations, PllPeriodTakesTheLargestCount) {
  vk40_.Period(100, 10, 1, 8, 0, 1, 5);
  EXPECT_EQ(vk40_.duty, 37.5);
  vk40_.Period(100, 10, 1, 8, 0, 1, 0);
  EXPECT_EQ(vk40_.duty, 12.5) << "the device's 64";
}

TEST_F(Operations, AFractionalTsynHasPhase0AndOneHalf) {
  EXPECT_EQ(tsyn_.Period(100, 7.125, 1, 4, 90, 25).figure, 1000 / (712.5 / 4));
  EXPECT_EQ(tsyn_.phase, 0.0);
  EXPECT_EQ(tsyn_.duty, 50.0);
  EXPECT_EQ(tsyn_.Period(100, 8, 1, 2.5, 90, 25).figure, 3.125);
  EXPECT_EQ(tsyn_.phase, 0.0);
  EXPECT_EQ(tsyn_.duty, 50.0);
}

TEST_F(Operations, PllPeriodBeyondTheRange) {
  EXPECT_EQ(vk40_.Period(1, 1, 80, 1).figure, 80000.0);
  EXPECT_EQ(vk40_.Period(1e6, 64, 1, 1).figure, 1000 / 6.4e7);
}

TEST_F(Operations, PllPeriodChecksEveryArgument) {
  ExpectRefused(vk40_.Period(0, 10, 1, 4), "Input frequency is 0 MHz");
  ExpectRefused(vk40_.Period(100, 0, 1, 4), "M is 0");
  ExpectRefused(vk40_.Period(100, 10, 0, 4), "D is 0");
  ExpectRefused(vk40_.Period(100, 10, 1, 0), "Output divider is 0");
  for (const double wrong : {-361.0, 361.0, kNan, kInfinity, -kInfinity}) {
    ExpectRefused(vk40_.Period(100, 10, 1, 4, wrong), "Requested phase is ");
  }
  for (const double wrong : {-1.0, 101.0, kNan, kInfinity}) {
    ExpectRefused(vk40_.Period(100, 10, 1, 4, 0, wrong), "Requested duty cycle is ");
  }
  for (const double wrong : {-1.0, 1.0, kNan, kInfinity}) {
    ExpectRefused(vk40_.Period(100, 10, 1, 8, 0, 50, wrong), "Largest high or low count is ");
  }
  EXPECT_NE(vk40_.phase, vk40_.phase) << "a refusal writes nothing";
  EXPECT_NE(vk40_.duty, vk40_.duty);
}

// --- What a device lacks ---------------------------------------------------------------------

TEST_F(Operations, PrimitivesThatTheDeviceLacks) {
  EXPECT_EQ(tsyn_.KruJitter(100, kClk0, false, false, true, false, 0, 0).error,
            "Device vk20-2 has no KRU_SP.");
  EXPECT_EQ(tsyn_.KruJitter(100, kClkfx, true, false, false, false, 3, 2).error,
            "Device vk20-2 has no KRU_CLKGEN.");
  EXPECT_EQ(tsyn_.KruPhaseError().error, "Device vk20-2 has neither KRU_SP nor KRU_CLKGEN.");
  EXPECT_EQ(tsyn_.KruPeriod(100, kClk0, false).error,
            "Device vk20-2 has neither KRU_SP nor KRU_CLKGEN.");
  Asked kru(GradeOf(calculator_test::kKruClkgenLines + calculator_test::kCalculatorHead +
                    calculator_test::kKruLines));
  const std::string no_loop = "Device dev-1 has neither PLL nor TSYN.";
  EXPECT_EQ(kru.Vco(100, 10, 1).error, no_loop);
  EXPECT_EQ(kru.Jitter(100, 10, 1, "LOW").error, no_loop);
  EXPECT_EQ(kru.PhaseError(100, 1, "LOW").error, no_loop);
  EXPECT_EQ(kru.Period(100, 10, 1, 4).error, no_loop);
}

// Figures that follow from the settings alone need no coefficients.
TEST_F(Operations, CoefficientsThatTheDeviceLacks) {
  Asked asked(GradeOf(calculator_test::kPllLines + calculator_test::kKruClkgenLines +
                      calculator_test::kCalculatorHead + calculator_test::kKruLines));
  const std::string no_loop = "Device dev-1 has no calculator coefficients for PLL and TSYN.";
  EXPECT_EQ(asked.Jitter(100, 10, 1, "LOW").error, no_loop);
  EXPECT_EQ(asked.PhaseError(100, 1, "LOW").error, no_loop);
  EXPECT_EQ(asked.Vco(100, 10, 1).figure, 1000.0);
  EXPECT_EQ(asked.Period(100, 10, 1, 4).figure, 4.0);
  Asked other(GradeOf(calculator_test::kPllLines + calculator_test::kKruClkgenLines +
                      calculator_test::kCalculatorHead + calculator_test::kLoopLines));
  const std::string no_kru =
      "Device dev-1 has no calculator coefficients for KRU_SP and KRU_CLKGEN.";
  EXPECT_EQ(other.KruJitter(100, kClkfx, true, false, false, false, 3, 2).error, no_kru);
  EXPECT_EQ(other.KruPhaseError().error, no_kru);
  EXPECT_EQ(other.KruPeriod(100, kClkfx, false, 5, 4).figure, 8.0);
}

TEST_F(Operations, AnUnusedOneAnswersNothing) {
  Port::StringBase error;
  EXPECT_FALSE(vk40_.calculator().Unused(&error));
  EXPECT_FALSE(error.IsEmpty());
}

}  // namespace
