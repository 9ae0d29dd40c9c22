// Jitter, frequency and duty cycle of KRU outputs: hand-computed values, and what a designer
// expects of them when one setting changes.
#include <gtest/gtest.h>

#include "host/bundled/calculator/KruFigures.h"
#include "tests/host/calculator_support.h"

namespace {

using Calculator::KruCoefficients;
using Calculator::KruSettings;
using Calculator::PinOf;

constexpr int kLinePins[] = {1, 2, 3, 4, 5, 7, 10};
constexpr int kClk0 = 1, kClk2x = 5, kClkfx = 8, kClkfx180 = 9, kClkdv = 10;

// Kappa 60, tap 30 ps, buffers 3 ps, phase error 150 ps.
KruCoefficients Coefficients() {
  return KruCoefficients::Of(calculator_test::BundledGrade("vk40", "2"));
}

double Jitter(int pin, const KruSettings& settings) {
  return KruPkToPkJitter(Coefficients(), PinOf(pin), settings);
}

TEST(KruCoefficients, AreThoseOfTheGrade) {
  EXPECT_EQ(Coefficients().kappa, 60.0);
  EXPECT_EQ(Coefficients().tap_step, 30.0);
  EXPECT_EQ(Coefficients().buffer_jitter, 3.0);
  EXPECT_EQ(Coefficients().phase_error, 150.0);
}

// 100 MHz, feedback: 60^2 * 0.01 us = 36; two buffers 2 * 9 = 18; rms sqrt(54) = 7.34847;
// 14.069 * 7.34847 = 103.3856. CLK0 has one tap more, CLK2X two: 133.3856 and 163.3856.
TEST(KruPkToPkJitter, OfTheDelayLine) {
  const KruSettings settings = {.input = 100, .feedback = true};
  EXPECT_NEAR(Jitter(kClk0, settings), 133.3856, 1e-3);
  EXPECT_NEAR(Jitter(kClkdv, settings), 133.3856, 1e-3);
  EXPECT_NEAR(Jitter(kClk2x, settings), 163.3856, 1e-3);
}

// With everything on: the period is 0.02 us, 72; three buffers, 27; rms sqrt(99) = 9.94987;
// 139.9848 and two taps: 199.9848.
TEST(KruPkToPkJitter, OfAllSettingsTogether) {
  EXPECT_NEAR(
      Jitter(kClk0, {.input = 100, .divide_by_2 = true, .feedback = true, .phase_shift = true}),
      199.9848, 1e-3);
}

// 100 * 3 / 2, no feedback: 36 * 2 = 72 over two input periods; 3 * 30^2 / 12 = 225 from the
// rounding of three output periods; one buffer, 9; rms sqrt(306) = 17.49286;
// 14.069 * 17.49286 = 246.1070 and two taps: 306.1070.
TEST(KruPkToPkJitter, OfTheSynthesiser) {
  const KruSettings settings = {.input = 100, .m = 3, .d = 2};
  EXPECT_NEAR(Jitter(kClkfx, settings), 306.1070, 1e-3);
  EXPECT_EQ(Jitter(kClkfx180, settings), Jitter(kClkfx, settings));
}

// The rms values of the three above: the taps do not count.
TEST(KruRmsJitter, IsTheRandomPart) {
  const auto rms = [](int pin, const KruSettings& settings) {
    return KruRmsJitter(Coefficients(), PinOf(pin), settings);
  };
  EXPECT_NEAR(rms(kClk2x, {.input = 100, .feedback = true}), 7.34847, 1e-5);
  EXPECT_NEAR(
      rms(kClk0, {.input = 100, .divide_by_2 = true, .feedback = true, .phase_shift = true}),
      9.94987, 1e-5);
  EXPECT_NEAR(rms(kClkfx, {.input = 100, .m = 3, .d = 2}), 17.49286, 1e-5);
}

TEST(KruPkToPkJitter, OfTheSynthesiserIsWorseThanThatOfTheLine) {
  for (const double input : {5.0, 33.0, 100.0, 200.0}) {
    for (int flags = 0; flags < 8; ++flags) {
      KruSettings settings = {.input = input,
                              .divide_by_2 = (flags & 1) != 0,
                              .feedback = (flags & 2) != 0,
                              .phase_shift = (flags & 4) != 0,
                              .m = 2,
                              .d = 1};
      for (const int pin : kLinePins) {
        EXPECT_GT(Jitter(kClkfx, settings), Jitter(pin, settings)) << pin;
      }
    }
  }
}

TEST(KruPkToPkJitter, OfTheSynthesiserGrowsWithMAndD) {
  for (int m = 2; m < 256; ++m) {
    EXPECT_GT(Jitter(kClkfx, {.input = 50, .m = m + 1.0, .d = 8}),
              Jitter(kClkfx, {.input = 50, .m = 1.0 * m, .d = 8}));
  }
  for (int d = 1; d < 256; ++d) {
    EXPECT_GT(Jitter(kClkfx, {.input = 50, .m = 8, .d = d + 1.0}),
              Jitter(kClkfx, {.input = 50, .m = 8, .d = 1.0 * d}));
  }
}

TEST(KruPkToPkJitter, OfTheLineDependsNotOnMAndD) {
  for (const int pin : kLinePins) {
    EXPECT_EQ(Jitter(pin, {.input = 50, .m = 32, .d = 31}), Jitter(pin, {.input = 50}));
  }
}

// A longer period takes more taps.
TEST(KruPkToPkJitter, FallsWithAHigherInputFrequency) {
  for (const int pin : {1, 2, 3, 4, 5, 7, 8, 9, 10}) {
    for (double input = 10; input < 200; input += 10) {
      EXPECT_LT(Jitter(pin, {.input = input + 10, .m = 3, .d = 2}),
                Jitter(pin, {.input = input, .m = 3, .d = 2}));
    }
  }
}

TEST(KruPkToPkJitter, EverySettingAddsALittle) {
  for (const int pin : {1, 2, 3, 4, 5, 7, 8, 9, 10}) {
    const KruSettings plain = {.input = 100, .m = 3, .d = 2};
    KruSettings divided = plain;
    divided.divide_by_2 = true;
    KruSettings with_feedback = plain;
    with_feedback.feedback = true;
    KruSettings shifted = plain;
    shifted.phase_shift = true;
    EXPECT_GT(Jitter(pin, divided), Jitter(pin, plain));
    EXPECT_GT(Jitter(pin, with_feedback), Jitter(pin, plain));
    // One buffer's variance.
    EXPECT_LT(Jitter(pin, with_feedback), Jitter(pin, plain) + 14.069 * 3);
    // One tap.
    EXPECT_NEAR(Jitter(pin, shifted), Jitter(pin, plain) + 30, 1e-9);
  }
}

TEST(PinFrequency, OfEveryPin) {
  const KruSettings settings = {.input = 100, .m = 7, .d = 4, .clkdv = 2.5};
  for (const int pin : {1, 2, 3, 4}) EXPECT_EQ(PinFrequency(PinOf(pin), settings), 100.0);
  for (const int pin : {5, 7}) EXPECT_EQ(PinFrequency(PinOf(pin), settings), 200.0);
  for (const int pin : {8, 9}) EXPECT_EQ(PinFrequency(PinOf(pin), settings), 175.0);
  EXPECT_EQ(PinFrequency(PinOf(10), settings), 40.0);
}

TEST(PinFrequency, IsHalvedWithTheInput) {
  const KruSettings settings = {.input = 100, .divide_by_2 = true, .m = 7, .d = 4, .clkdv = 2.5};
  EXPECT_EQ(LineFrequency(settings), 50.0);
  for (const int pin : {1, 2, 3, 4}) EXPECT_EQ(PinFrequency(PinOf(pin), settings), 50.0);
  for (const int pin : {5, 7}) EXPECT_EQ(PinFrequency(PinOf(pin), settings), 100.0);
  for (const int pin : {8, 9}) EXPECT_EQ(PinFrequency(PinOf(pin), settings), 87.5);
  EXPECT_EQ(PinFrequency(PinOf(10), settings), 20.0);
}

TEST(KruDutyCycle, IsOneHalf) {
  for (const int pin : {1, 2, 3, 4, 5, 7, 8, 9}) {
    EXPECT_EQ(KruDutyCycle(PinOf(pin), {.input = 100, .m = 3, .d = 2, .clkdv = 1.5}), 50.0);
  }
  for (const double divide : {2.0, 3.0, 8.0, 9.0, 17.0}) {
    EXPECT_EQ(KruDutyCycle(PinOf(kClkdv), {.input = 100, .clkdv = divide}), 50.0);
  }
}

// 1.5 cycles are 1 half cycle high and 2 low, 2.5 are 2 and 3, 7.5 are 7 and 8.
TEST(KruDutyCycle, OfAnOddNumberOfHalfCycles) {
  EXPECT_NEAR(KruDutyCycle(PinOf(kClkdv), {.input = 100, .clkdv = 1.5}), 100.0 / 3, 1e-12);
  EXPECT_NEAR(KruDutyCycle(PinOf(kClkdv), {.input = 100, .clkdv = 2.5}), 100.0 * 2 / 5, 1e-12);
  EXPECT_NEAR(KruDutyCycle(PinOf(kClkdv), {.input = 100, .clkdv = 7.5}), 100.0 * 7 / 15, 1e-12);
}

}  // namespace
