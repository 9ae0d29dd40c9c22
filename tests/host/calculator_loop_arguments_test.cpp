// What PLL and TSYN accept.
#include <gtest/gtest.h>

#include <cmath>
#include <string>

#include "host/bundled/calculator/LoopArguments.h"
#include "tests/host/calculator_support.h"

namespace {

using Calculator::ArgumentError;
using Calculator::Bandwidth;
using Calculator::LoopArguments;
using calculator_test::BundledGrade;
using calculator_test::GradeOf;
using calculator_test::kInfinity;
using calculator_test::kNan;
using calculator_test::kPllLines;

// What a check of a fresh query to the device says.
template <typename Check>
std::string Refusal(const Device::Grade& grade, Check check) {
  try {
    LoopArguments arguments(grade, "dev-1");
    check(arguments);
  } catch (const ArgumentError& error) {
    return error.what();
  }
  return "accepted";
}

// PLL alone, with VCO 400 to 1080 and PFD 19 to 500.
const Device::Grade& Pll() {
  static const auto* const grade = new Device::Grade(BundledGrade("vk10", "1"));
  return *grade;
}
// TSYN alone, with VCO 600 to 1440, PFD 10 to 500 and to 300 with a narrow loop.
const Device::Grade& Tsyn() {
  static const auto* const grade = new Device::Grade(BundledGrade("vk20", "2"));
  return *grade;
}
// Both, with the same limits.
const Device::Grade& Both() {
  static const auto* const grade = new Device::Grade(BundledGrade("vk40", "2"));
  return *grade;
}

TEST(LoopArguments, NeedsAPllOrATsyn) {
  EXPECT_EQ(Refusal(GradeOf("O_MAX_HT_LT = 64\n"), [](auto&) {}),
            "Device dev-1 has neither PLL nor TSYN.");
  EXPECT_EQ(Refusal(GradeOf(kPllLines), [](auto&) {}), "accepted");
  EXPECT_EQ(Refusal(Tsyn(), [](auto&) {}), "accepted");
}

TEST(BandwidthOf, KnowsThreeTexts) {
  EXPECT_EQ(Calculator::BandwidthOf("LOW"), Bandwidth::kLow);
  EXPECT_EQ(Calculator::BandwidthOf("OPTIMIZED"), Bandwidth::kOptimized);
  EXPECT_EQ(Calculator::BandwidthOf("HIGH"), Bandwidth::kHigh);
  for (const std::string text : {"", "low", "LOW ", " HIGH", "OPTIMISED", "MEDIUM", "0", "%s%n"}) {
    EXPECT_EQ(Refusal(Pll(), [&](auto&) { Calculator::BandwidthOf(text); }),
              "Bandwidth is \"" + text + "\", but must be LOW, HIGH or OPTIMIZED.");
  }
}

TEST(LoopArguments, MOfAPll) {
  const auto m = [](double value) {
    return Refusal(Pll(), [=](auto& arguments) { arguments.CheckM(value); });
  };
  for (const double value : {1.0, 2.0, 3.0, 4.0, 64.0}) EXPECT_EQ(m(value), "accepted") << value;
  const std::string range = ", but must be a whole number from 1 to 64 for a PLL.";
  EXPECT_EQ(m(0), "M is 0" + range);
  EXPECT_EQ(m(65), "M is 65" + range);
  EXPECT_EQ(m(5.125), "M is 5.125" + range);
  EXPECT_EQ(m(-8), "M is -8" + range);
  EXPECT_EQ(m(kNan), "M is nan" + range);
  EXPECT_EQ(m(kInfinity), "M is inf" + range);
}

TEST(LoopArguments, MOfATsyn) {
  const auto m = [](double value) {
    return Refusal(Tsyn(), [=](auto& arguments) { arguments.CheckM(value); });
  };
  for (const double value : {1.0, 5.0, 5.125, 63.875, 64.0})
    EXPECT_EQ(m(value), "accepted") << value;
  const std::string range = ", but must be 1 or from 5 to 64 in steps of 0.125 for a TSYN.";
  EXPECT_EQ(m(0), "M is 0" + range);
  EXPECT_EQ(m(1.125), "M is 1.125" + range);
  EXPECT_EQ(m(2), "M is 2" + range);
  EXPECT_EQ(m(4.875), "M is 4.875" + range);
  EXPECT_EQ(m(5.0625), "M is 5.0625" + range);
  EXPECT_EQ(m(64.125), "M is 64.125" + range);
}

TEST(LoopArguments, MOfEither) {
  const auto m = [](double value) {
    return Refusal(Both(), [=](auto& arguments) { arguments.CheckM(value); });
  };
  EXPECT_EQ(m(3), "accepted") << "of the PLL";
  EXPECT_EQ(m(5.125), "accepted") << "of the TSYN";
  EXPECT_EQ(m(2.5),
            "M is 2.5, but must be a whole number from 1 to 64 for a PLL, or 1 or from 5 to 64 in "
            "steps of 0.125 for a TSYN.");
}

TEST(LoopArguments, D) {
  const auto d = [](double value) {
    return Refusal(Both(), [=](auto& arguments) { arguments.CheckD(value); });
  };
  for (const double value : {1.0, 80.0}) EXPECT_EQ(d(value), "accepted") << value;
  for (const double value : {0.0, 81.0, 1.125}) {
    EXPECT_EQ(d(value), "D is " + Calculator::NumberText(value) +
                            ", but must be a whole number from 1 to 80.");
  }
}

TEST(LoopArguments, OutputDivider) {
  const auto divider = [](const Device::Grade& grade, double value) {
    return Refusal(grade, [=](auto& arguments) { arguments.CheckOutputDivider(value); });
  };
  for (const double value : {1.0, 2.0, 128.0}) {
    EXPECT_EQ(divider(Pll(), value), "accepted") << value;
    EXPECT_EQ(divider(Tsyn(), value), "accepted") << value;
  }
  for (const double value : {2.125, 127.875}) {
    EXPECT_EQ(divider(Pll(), value), "Output divider is " + Calculator::NumberText(value) +
                                         ", but must be a whole number from 1 to 128 for a PLL.");
    EXPECT_EQ(divider(Tsyn(), value), "accepted") << value;
  }
  for (const double value : {0.0, -1.0, 1.5, 2.0625, 128.125, 129.0, kNan, kInfinity}) {
    EXPECT_EQ(divider(Tsyn(), value),
              "Output divider is " + Calculator::NumberText(value) +
                  ", but must be 1 or from 2 to 128 in steps of 0.125 for a TSYN.");
  }
}

TEST(LoopArguments, FeedbackDivider) {
  const auto divider = [](const Device::Grade& grade, double value) {
    return Refusal(grade, [=](auto& arguments) { arguments.CheckFeedbackDivider(value); });
  };
  for (const double value : {0.0, -0.0, 1.0, 2.0, 128.0}) {
    EXPECT_EQ(divider(Pll(), value), "accepted") << value;
  }
  EXPECT_EQ(divider(Tsyn(), 2.125), "accepted");
  for (const double value : {-1.0, 0.5, 2.125, 129.0, kNan}) {
    EXPECT_EQ(divider(Pll(), value),
              "Feedback divider is " + Calculator::NumberText(value) +
                  ", but must be 0 (none) or a whole number from 1 to 128 for a PLL.");
  }
}

TEST(LoopArguments, Requests) {
  const auto phase = [](double value) {
    return Refusal(Pll(), [=](auto& arguments) { arguments.CheckRequestedPhase(value); });
  };
  EXPECT_EQ(phase(-360), "accepted");
  EXPECT_EQ(phase(360), "accepted");
  EXPECT_EQ(phase(361), "Requested phase is 361 degrees, but must be from -360 to 360 degrees.");
  EXPECT_EQ(phase(kNan), "Requested phase is nan degrees, but must be from -360 to 360 degrees.");
  const auto duty = [](double value) {
    return Refusal(Pll(), [=](auto& arguments) { arguments.CheckRequestedDuty(value); });
  };
  EXPECT_EQ(duty(0), "accepted");
  EXPECT_EQ(duty(100), "accepted");
  EXPECT_EQ(duty(-1), "Requested duty cycle is -1 percent, but must be from 0 to 100 percent.");
  EXPECT_EQ(duty(kInfinity),
            "Requested duty cycle is inf percent, but must be from 0 to 100 percent.");
}

TEST(LoopArguments, InputJitter) {
  const auto jitter = [](double value) {
    return Refusal(Pll(), [=](auto& arguments) { arguments.CheckInputJitter(value); });
  };
  EXPECT_EQ(jitter(0), "accepted");
  EXPECT_EQ(jitter(1e6), "accepted");
  for (const double value : {-1.0, 1.5e6, kNan, kInfinity}) {
    EXPECT_EQ(jitter(value), "Input jitter is " + Calculator::NumberText(value) +
                                 " ps, but must be from 0 to 1e+06 ps.");
  }
}

// A divider of 8 needs 8 = 4.25 high and 3.75 low at least, where the count is 3.75 and the high
// time may be half a cycle more.
TEST(LoopArguments, LargestCount) {
  const auto count = [](double value, double divider) {
    return Refusal(Pll(), [=](auto& arguments) { arguments.CheckLargestCount(value, divider); });
  };
  EXPECT_EQ(count(3.75, 8), "accepted");
  EXPECT_EQ(count(4, 8), "accepted");
  EXPECT_EQ(count(1e300, 8), "accepted");
  EXPECT_EQ(count(1, 1), "accepted");
  EXPECT_EQ(count(3, 8),
            "Largest high or low count is 3, but must be 0 (the device's) or a finite number from "
            "3.75 for an output divider of 8.");
  for (const double value : {-1.0, kNan, kInfinity}) {
    EXPECT_EQ(count(value, 8), "Largest high or low count is " + Calculator::NumberText(value) +
                                   ", but must be 0 (the device's) or a finite number from 3.75 "
                                   "for an output divider of 8.");
  }
}

TEST(LoopArguments, LargestCountOfTheDevice) {
  LoopArguments arguments(Pll(), "dev-1");
  EXPECT_EQ(arguments.CheckLargestCount(0, 128), 64.0);
  EXPECT_EQ(arguments.CheckLargestCount(70, 128), 70.0);
  std::string lines = kPllLines;
  lines.replace(lines.find("O_MAX_HT_LT = 64"), 16, "O_MAX_HT_LT = 32");
  EXPECT_EQ(Refusal(GradeOf(lines), [](auto& of) { of.CheckLargestCount(0, 64); }), "accepted");
  EXPECT_EQ(Refusal(GradeOf(lines), [](auto& of) { of.CheckLargestCount(0, 65); }),
            "Output divider is 65, but must be at most 64.5, as high and low counts end at 32.");
}

TEST(LoopArguments, PfdFrequency) {
  const auto pfd = [](const Device::Grade& grade, double value, Bandwidth bandwidth) {
    return Refusal(grade, [=](auto& arguments) { arguments.CheckPfd(value, bandwidth); });
  };
  for (const double value : {19.0, 500.0}) {
    EXPECT_EQ(pfd(Pll(), value, Bandwidth::kLow), "accepted") << value;
  }
  EXPECT_EQ(pfd(Pll(), 18, Bandwidth::kHigh),
            "PFD frequency (input frequency / D) is 18 MHz, but must be from 19 to 500 MHz for a "
            "PLL.");
  EXPECT_EQ(pfd(Tsyn(), 400, Bandwidth::kOptimized), "accepted");
  EXPECT_EQ(pfd(Tsyn(), 400, Bandwidth::kLow),
            "PFD frequency (input frequency / D) is 400 MHz, but must be from 10 to 300 MHz for a "
            "TSYN.");
  EXPECT_EQ(pfd(Both(), 1000.0 / 3.0, Bandwidth::kLow), "accepted") << "of the PLL";
  EXPECT_EQ(pfd(Both(), 1700.0 / 3.0, Bandwidth::kLow),
            "PFD frequency (input frequency / D) is 566.667 MHz, but must be from 19 to 500 MHz "
            "for a PLL, or from 10 to 300 MHz for a TSYN.");
}

TEST(LoopArguments, VcoFrequency) {
  const auto vco = [](const Device::Grade& grade, double value) {
    return Refusal(grade, [=](auto& arguments) { arguments.CheckVco(value); });
  };
  for (const double value : {400.0, 1080.0}) EXPECT_EQ(vco(Pll(), value), "accepted") << value;
  EXPECT_EQ(vco(Pll(), 1200),
            "VCO frequency (input frequency x M / D) is 1200 MHz, but must be "
            "from 400 to 1080 MHz for a PLL.");
  EXPECT_EQ(vco(Both(), 1440), "accepted");
  EXPECT_EQ(vco(Both(), 300),
            "VCO frequency (input frequency x M / D) is 300 MHz, but must be "
            "from 400 to 1080 MHz for a PLL, or from 600 to 1440 MHz for a TSYN.");
}

// The solver's slack is 0.0005 of a limit: 0.2 of 400, 0.54 of 1080.
TEST(LoopArguments, LimitsHaveTheSlackOfTheSolver) {
  const auto vco = [](double value) {
    return Refusal(Pll(), [=](auto& arguments) { arguments.CheckVco(value); });
  };
  EXPECT_EQ(vco(399.81), "accepted");
  EXPECT_NE(vco(399.79), "accepted");
  EXPECT_EQ(vco(1080.53), "accepted");
  EXPECT_NE(vco(1080.55), "accepted");
}

// An M of 3 can only be a PLL's, and a fractional one only a TSYN's.
TEST(LoopArguments, EarlierArgumentsChooseThePrimitive) {
  EXPECT_EQ(Refusal(Both(),
                    [](auto& arguments) {
                      arguments.CheckM(3);
                      arguments.CheckVco(1200);
                    }),
            "VCO frequency (input frequency x M / D) is 1200 MHz, but must be from 400 to 1080 MHz "
            "for a PLL.");
  EXPECT_EQ(Refusal(Both(),
                    [](auto& arguments) {
                      arguments.CheckM(5.5);
                      arguments.CheckVco(500);
                    }),
            "VCO frequency (input frequency x M / D) is 500 MHz, but must be from 600 to 1440 MHz "
            "for a TSYN.");
  EXPECT_EQ(Refusal(Both(),
                    [](auto& arguments) {
                      arguments.CheckM(3);
                      arguments.CheckOutputDivider(2.5);
                    }),
            "Output divider is 2.5, but must be a whole number from 1 to 128 for a PLL.");
}

TEST(IsFractional, IsBetweenWholeNumbers) {
  EXPECT_FALSE(Calculator::IsFractional(5));
  EXPECT_TRUE(Calculator::IsFractional(5.125));
}

}  // namespace
