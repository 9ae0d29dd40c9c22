// Jitter and phase error of PLL and TSYN: hand-computed values, and what a designer expects of
// them when one setting changes.
#include <gtest/gtest.h>

#include "host/bundled/calculator/LoopFigures.h"
#include "tests/host/calculator_support.h"

namespace {

using Calculator::Bandwidth;
using Calculator::Loop;
using Calculator::LoopCoefficients;

constexpr Bandwidth kSettings[] = {Bandwidth::kLow, Bandwidth::kOptimized, Bandwidth::kHigh};

// Kappa 30 at 1000 MHz, bandwidths 0.01, 0.02 and 0.04, buffers 2 ps, deterministic part 20 ps,
// static offset 40 ps, leakage 40.
LoopCoefficients Coefficients() {
  return LoopCoefficients::Of(calculator_test::BundledGrade("vk40", "2"));
}

double Jitter(double pfd, double vco, Bandwidth bandwidth, double input_jitter) {
  return LoopPkToPkJitter(Coefficients(), {.pfd = pfd, .vco = vco, .bandwidth = bandwidth},
                          input_jitter);
}

// PFD 100 MHz and VCO 1000 MHz, so that kappa is 30.
// LOW: loop 1 MHz; 30 * sqrt(1 / (4 pi)) = 8.46284 ps; variance 71.6197 + 2 * 2 = 75.6197,
//   rms 8.69596; 14.069 * 8.69596 + 20 = 142.3435.
// HIGH: loop 4 MHz; 4.23142 ps; variance 17.9049 + 4 = 21.9049, rms 4.68027; 85.8467.
TEST(LoopPkToPkJitter, OfACleanInput) {
  EXPECT_NEAR(Jitter(100, 1000, Bandwidth::kLow, 0), 142.3435, 1e-3);
  EXPECT_NEAR(Jitter(100, 1000, Bandwidth::kHigh, 0), 85.8467, 1e-3);
}

// OPTIMIZED: loop 2 MHz; 30 * sqrt(1 / (8 pi)) = 5.98413 ps, variance 35.8099.
// 100 ps peak to peak are 100 / 14.069 = 7.10783 ps rms; sqrt(pi * 0.02) = 0.250663 of them are
//   1.78167, variance 3.17434.
// 35.8099 + 3.1743 + 4 = 42.9842, rms 6.55623; 14.069 * 6.55623 + 20 = 112.2397.
TEST(LoopPkToPkJitter, OfAnInputWithJitter) {
  EXPECT_NEAR(Jitter(100, 1000, Bandwidth::kOptimized, 100), 112.2397, 1e-3);
}

// VCO 400: kappa 30 * sqrt(2.5) = 47.4342; 9.46175 ps; variance 89.5247 + 4, rms 9.67081;
//   14.069 * 9.67081 + 20 = 156.0587.
TEST(LoopPkToPkJitter, OfASlowVco) {
  EXPECT_NEAR(Jitter(100, 400, Bandwidth::kOptimized, 0), 156.0587, 1e-3);
}

// The figures of OfACleanInput and OfAnInputWithJitter without the deterministic part.
TEST(LoopRmsJitter, IsTheRandomPart) {
  const auto rms = [](Bandwidth bandwidth, double input_jitter) {
    return LoopRmsJitter(Coefficients(), {.pfd = 100, .vco = 1000, .bandwidth = bandwidth},
                         input_jitter);
  };
  EXPECT_NEAR(rms(Bandwidth::kLow, 0), 8.69596, 1e-5);
  EXPECT_NEAR(rms(Bandwidth::kHigh, 0), 4.68027, 1e-5);
  EXPECT_NEAR(rms(Bandwidth::kOptimized, 100), 6.55623, 1e-5);
}

TEST(LoopPkToPkJitter, FallsWithAHigherVco) {
  for (const Bandwidth setting : kSettings) {
    for (const double input : {0.0, 100.0, 1000.0}) {
      for (double vco = 400; vco < 1400; vco += 100) {
        EXPECT_GT(Jitter(50, vco, setting, input), Jitter(50, vco + 100, setting, input));
      }
    }
  }
}

TEST(LoopPkToPkJitter, FallsWithAWiderLoopWhereTheOscillatorDominates) {
  for (const double vco : {400.0, 1000.0, 1440.0}) {
    for (const double pfd : {20.0, 100.0, 400.0}) {
      const double low = Jitter(pfd, vco, Bandwidth::kLow, 0);
      const double optimized = Jitter(pfd, vco, Bandwidth::kOptimized, 0);
      const double high = Jitter(pfd, vco, Bandwidth::kHigh, 0);
      EXPECT_GT(low, optimized);
      EXPECT_GT(optimized, high);
    }
  }
}

TEST(LoopPkToPkJitter, RisesWithAWiderLoopWhereTheInputDominates) {
  for (const double vco : {400.0, 1000.0, 1440.0}) {
    for (const double pfd : {100.0, 400.0}) {
      const double low = Jitter(pfd, vco, Bandwidth::kLow, 2000);
      const double optimized = Jitter(pfd, vco, Bandwidth::kOptimized, 2000);
      const double high = Jitter(pfd, vco, Bandwidth::kHigh, 2000);
      EXPECT_LT(low, optimized);
      EXPECT_LT(optimized, high);
    }
  }
}

// Of 2000 ps at the input, sqrt(pi * 0.01) = 0.177 come through the narrow loop.
TEST(LoopPkToPkJitter, ANarrowLoopFiltersTheInput) {
  const double added = Jitter(100, 1000, Bandwidth::kLow, 2000) - 20;
  EXPECT_LT(added, 0.25 * 2000);
  EXPECT_GT(added, 0.17 * 2000);
}

TEST(LoopPkToPkJitter, RisesWithTheInput) {
  for (const Bandwidth setting : kSettings) {
    double before = Jitter(100, 800, setting, 0);
    for (const double input : {1.0, 10.0, 100.0, 1000.0, 1e6}) {
      const double jitter = Jitter(100, 800, setting, input);
      EXPECT_GT(jitter, before);
      before = jitter;
    }
  }
}

// A slower detector leaves the oscillator alone for longer.
TEST(LoopPkToPkJitter, FallsWithAHigherPfdFrequency) {
  for (const Bandwidth setting : kSettings) {
    EXPECT_GT(Jitter(20, 800, setting, 50), Jitter(40, 800, setting, 50));
    EXPECT_GT(Jitter(200, 800, setting, 50), Jitter(400, 800, setting, 50));
  }
}

TEST(LoopPkToPkJitter, IsNeverBelowBuffersAndTheDeterministicPart) {
  EXPECT_GT(Jitter(500, 1e9, Bandwidth::kHigh, 0), 14.069 * 2 + 20);
  EXPECT_NEAR(Jitter(500, 1e15, Bandwidth::kHigh, 0), 14.069 * 2 + 20, 1e-3);
}

// Loops of 1, 2 and 4 MHz: 40 + 40 / 1, 40 / 2 and 40 / 4 ps.
TEST(LoopPhaseError, IsTheOffsetAndTheLeakage) {
  EXPECT_DOUBLE_EQ(LoopPhaseError(Coefficients(), 100, Bandwidth::kLow), 80.0);
  EXPECT_DOUBLE_EQ(LoopPhaseError(Coefficients(), 100, Bandwidth::kOptimized), 60.0);
  EXPECT_DOUBLE_EQ(LoopPhaseError(Coefficients(), 100, Bandwidth::kHigh), 50.0);
  // A quarter of the PFD frequency, 0.5 MHz: 40 + 80.
  EXPECT_DOUBLE_EQ(LoopPhaseError(Coefficients(), 25, Bandwidth::kOptimized), 120.0);
}

TEST(LoopPhaseError, FallsWithAWiderLoopAndAHigherPfdFrequency) {
  for (double pfd = 20; pfd < 500; pfd += 40) {
    double before = 1e9;
    for (const Bandwidth setting : kSettings) {
      const double error = LoopPhaseError(Coefficients(), pfd, setting);
      EXPECT_LT(error, before);
      EXPECT_LT(LoopPhaseError(Coefficients(), pfd + 40, setting), error);
      before = error;
    }
  }
}

}  // namespace
