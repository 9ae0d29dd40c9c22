// The loop of PLL and TSYN. The hand-computed values use 1 / sqrt(4 pi) = 0.28209479 and
// sqrt(pi) = 1.77245385.
#include <gtest/gtest.h>

#include <cmath>
#include <random>

#include "host/bundled/calculator/LoopModel.h"
#include "tests/host/calculator_support.h"

namespace {

using Calculator::Bandwidth;
using Calculator::LoopCoefficients;

// Kappa 30 at 1000 MHz; bandwidths 0.01, 0.02 and 0.04.
LoopCoefficients Coefficients() {
  return LoopCoefficients::Of(calculator_test::BundledGrade("vk40", "2"));
}

TEST(LoopCoefficients, AreThoseOfTheGrade) {
  const LoopCoefficients coefficients = LoopCoefficients::Of(calculator_test::GradeOf(
      "[grade.1.calculator]\nLOOP_KAPPA = 1\nLOOP_KAPPA_VCO = 2\nLOOP_BANDWIDTH_LOW = 0.03\n"
      "LOOP_BANDWIDTH_OPTIMIZED = 0.04\nLOOP_BANDWIDTH_HIGH = 0.05\nLOOP_BUFFER_JITTER = 6\n"
      "LOOP_DETERMINISTIC_JITTER = 7\nLOOP_STATIC_OFFSET = 8\nLOOP_LEAKAGE = 9\n"));
  EXPECT_EQ(coefficients.kappa, 1.0);
  EXPECT_EQ(coefficients.kappa_vco, 2.0);
  EXPECT_EQ(coefficients.bandwidth_low, 0.03);
  EXPECT_EQ(coefficients.bandwidth_optimized, 0.04);
  EXPECT_EQ(coefficients.bandwidth_high, 0.05);
  EXPECT_EQ(coefficients.buffer_jitter, 6.0);
  EXPECT_EQ(coefficients.deterministic_jitter, 7.0);
  EXPECT_EQ(coefficients.static_offset, 8.0);
  EXPECT_EQ(coefficients.leakage, 9.0);
}

TEST(BandwidthFraction, IsThatOfTheSetting) {
  EXPECT_EQ(BandwidthFraction(Coefficients(), Bandwidth::kLow), 0.01);
  EXPECT_EQ(BandwidthFraction(Coefficients(), Bandwidth::kOptimized), 0.02);
  EXPECT_EQ(BandwidthFraction(Coefficients(), Bandwidth::kHigh), 0.04);
}

TEST(KappaAt, GoesWithTheInverseRootOfTheFrequency) {
  EXPECT_EQ(KappaAt(Coefficients(), 1000), 30.0);
  EXPECT_EQ(KappaAt(Coefficients(), 250), 60.0);  // 30 * sqrt(4)
  EXPECT_EQ(KappaAt(Coefficients(), 4000), 15.0);
}

// 30 / sqrt(4 pi) = 8.4628437 in a loop of 1 MHz, and half of it in one of 4 MHz.
TEST(OscillatorJitter, FallsWithTheRootOfTheBandwidth) {
  EXPECT_NEAR(Calculator::OscillatorJitter(30, 1), 8.4628437, 1e-6);
  EXPECT_NEAR(Calculator::OscillatorJitter(30, 4), 4.2314218, 1e-6);
  EXPECT_NEAR(Calculator::OscillatorJitter(60, 4), 8.4628437, 1e-6);
}

// In SI units, from the paper's own formula: kappa is 1e-8 root seconds and the loop 1 MHz, so
// that the jitter is 1e-8 * sqrt(1 / (4 pi * 1e6)) = 2.8209e-12 s. 1e-8 root seconds are
// 1e-8 * 1e12 ps / sqrt(1e6 us) = 10 ps per root of a microsecond.
TEST(OscillatorJitter, AgreesInOtherUnits) {
  EXPECT_NEAR(Calculator::OscillatorJitter(10, 1), 2.8209479, 1e-6);
}

// sqrt(pi * 0.01) = 0.177245385.
TEST(FilteredInputJitter, IsTheShareOfTheBand) {
  EXPECT_NEAR(Calculator::FilteredInputJitter(100, 0.01), 17.7245385, 1e-6);
  EXPECT_NEAR(Calculator::FilteredInputJitter(100, 0.04), 35.449077, 1e-6);
  EXPECT_EQ(Calculator::FilteredInputJitter(0, 0.04), 0.0);
}

// The widest loop that a device file may give lets through sqrt(pi * 0.1) = 0.56, not more than
// there is.
TEST(FilteredInputJitter, NeverGrows) {
  EXPECT_LT(Calculator::FilteredInputJitter(1, Device::kWidestLoop), 1.0);
}

// Two loops simulated period by period against the formulas: the error of the output is pulled
// towards the input by a share of 2 pi * fraction in each PFD period.
class SimulatedLoop {
 public:
  explicit SimulatedLoop(double fraction) : gain_(2 * 3.14159265358979 * fraction) {}

  // The rms error of the output, for an input and an oscillator with an rms error of so much in
  // each period.
  double Run(double input, double oscillator) {
    std::mt19937_64 random(20240607);
    std::normal_distribution<double> normal;
    const int periods = 400000;
    double error = 0;
    double sum = 0;
    for (int i = 0; i < periods; ++i) {
      error += gain_ * (input * normal(random) - error) + oscillator * normal(random);
      sum += error * error;
    }
    return std::sqrt(sum / periods);
  }

 private:
  double gain_;
};

// The simulated loop samples, and the formulas are those of a continuous one. For a first-order
// loop of gain g they differ by a factor of sqrt(1 / (1 - g / 2)), 1.03 for the fraction 0.02.
TEST(LoopModel, AgreesWithASimulation) {
  const double fraction = 0.02;
  const double pfd = 50.0;  // MHz, a period of 0.02 us
  SimulatedLoop loop(fraction);
  EXPECT_NEAR(loop.Run(10, 0) / Calculator::FilteredInputJitter(10, fraction), 1.03, 0.03);
  // An oscillator of kappa 30 errs by 30 * sqrt(0.02) = 4.2426 ps in a period.
  EXPECT_NEAR(
      loop.Run(0, 30 * std::sqrt(1 / pfd)) / Calculator::OscillatorJitter(30, fraction * pfd), 1.03,
      0.03);
}

}  // namespace
