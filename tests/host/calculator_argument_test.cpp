// Checks of single arguments, and the choice among primitives.
#include <gtest/gtest.h>

#include <cmath>
#include <string>

#include "host/bundled/calculator/Argument.h"
#include "host/bundled/calculator/Candidates.h"
#include "tests/host/calculator_support.h"

namespace {

using Calculator::ArgumentError;
using calculator_test::kInfinity;
using calculator_test::kNan;
using Device::kPll;
using Device::kTsyn;
using Device::Primitive;

template <typename Check>
std::string Refusal(Check check) {
  try {
    check();
  } catch (const ArgumentError& error) {
    return error.what();
  }
  return "accepted";
}

TEST(NumberText, ReadsBackAsTheSameNumber) {
  EXPECT_EQ(Calculator::NumberText(100), "100");
  EXPECT_EQ(Calculator::NumberText(-2.5), "-2.5");
  EXPECT_EQ(Calculator::NumberText(0.1 + 0.2), "0.30000000000000004");
  EXPECT_EQ(Calculator::NumberText(1e300), "1e+300");
  EXPECT_EQ(Calculator::NumberText(5e-324), "5e-324");
  EXPECT_EQ(Calculator::NumberText(-1.7976931348623157e308), "-1.7976931348623157e+308");
}

TEST(NumberText, HasOneNan) {
  EXPECT_EQ(Calculator::NumberText(kNan), "nan");
  EXPECT_EQ(Calculator::NumberText(-kNan), "nan");
  EXPECT_EQ(Calculator::NumberText(kInfinity), "inf");
  EXPECT_EQ(Calculator::NumberText(-kInfinity), "-inf");
}

TEST(FrequencyText, HasSixDigits) {
  EXPECT_EQ(Calculator::FrequencyText(400), "400 MHz");
  EXPECT_EQ(Calculator::FrequencyText(100.0 / 3.0), "33.3333 MHz");
  EXPECT_EQ(Calculator::FrequencyRange(1000 / 3.571, 1e6), "from 280.034 to 1e+06 MHz");
}

TEST(Refuse, SaysOneSentence) {
  EXPECT_EQ(Refusal([] { Calculator::Refuse("M is 0", "a whole number from 1 to 64"); }),
            "M is 0, but must be a whole number from 1 to 64.");
}

TEST(CheckWithin, TakesBothEnds) {
  const auto refusal = [](double value) {
    return Refusal([=] { Calculator::CheckWithin("Angle", value, "degrees", -360, 360); });
  };
  EXPECT_EQ(refusal(-360), "accepted");
  EXPECT_EQ(refusal(360), "accepted");
  EXPECT_EQ(refusal(std::nextafter(360.0, 361.0)),
            "Angle is 360.00000000000006 degrees, but must be from -360 to 360 degrees.");
  EXPECT_EQ(refusal(-361), "Angle is -361 degrees, but must be from -360 to 360 degrees.");
  EXPECT_EQ(refusal(kNan), "Angle is nan degrees, but must be from -360 to 360 degrees.");
  EXPECT_EQ(refusal(kInfinity), "Angle is inf degrees, but must be from -360 to 360 degrees.");
}

TEST(CheckWhole, TakesWholeNumbersAlone) {
  const auto refusal = [](double value) {
    return Refusal([=] { Calculator::CheckWhole("D", value, 1, 80); });
  };
  for (const double value : {1.0, 2.0, 80.0}) EXPECT_EQ(refusal(value), "accepted");
  const std::string range = ", but must be a whole number from 1 to 80.";
  EXPECT_EQ(refusal(0), "D is 0" + range);
  EXPECT_EQ(refusal(81), "D is 81" + range);
  EXPECT_EQ(refusal(1.5), "D is 1.5" + range);
  EXPECT_EQ(refusal(std::nextafter(2.0, 3.0)), "D is 2.0000000000000004" + range);
  EXPECT_EQ(refusal(-1), "D is -1" + range);
  EXPECT_EQ(refusal(kNan), "D is nan" + range);
  EXPECT_EQ(refusal(kInfinity), "D is inf" + range);
}

TEST(CheckInputFrequency, TakesWhatAClockCanBe) {
  const auto refusal = [](double value) {
    return Refusal([=] { Calculator::CheckInputFrequency(value); });
  };
  for (const double value : {1e-6, 0.032768, 100.0, 1e6}) EXPECT_EQ(refusal(value), "accepted");
  const std::string range = ", but must be from 1e-06 to 1e+06 MHz.";
  EXPECT_EQ(refusal(0), "Input frequency is 0 MHz" + range);
  EXPECT_EQ(refusal(-5), "Input frequency is -5 MHz" + range);
  EXPECT_EQ(refusal(9e-7), "Input frequency is 9e-07 MHz" + range);
  EXPECT_EQ(refusal(1e300), "Input frequency is 1e+300 MHz" + range);
  EXPECT_EQ(refusal(kNan), "Input frequency is nan MHz" + range);
  EXPECT_EQ(refusal(-kInfinity), "Input frequency is -inf MHz" + range);
}

// --- Candidates ------------------------------------------------------------------------------

constexpr auto kAny = [](Primitive) { return true; };
constexpr auto kNone = [](Primitive) { return false; };
constexpr auto kRange = [](Primitive primitive) {
  return std::string(primitive == kPll ? "small" : "large");
};

// Statements and ranges are sentences: nobody makes them for an argument that is good.
constexpr auto kSays3 = [] { return std::string("X is 3"); };
std::string Unsaid() {
  ADD_FAILURE() << "made for nothing";
  return {};
}

TEST(Candidates, KeepsThoseThatAccept) {
  Calculator::Candidates candidates({kPll, kTsyn});
  candidates.Keep(Unsaid, kAny, [](Primitive) { return Unsaid(); });
  EXPECT_EQ(candidates.primitives(), (std::vector<Primitive>{kPll, kTsyn}));
  candidates.Keep(
      Unsaid, [](Primitive primitive) { return primitive == kTsyn; }, kRange);
  EXPECT_EQ(candidates.primitives(), (std::vector<Primitive>{kTsyn}));
}

TEST(Candidates, NamesTheRangesOfThoseThatWereLeft) {
  Calculator::Candidates candidates({kPll, kTsyn});
  EXPECT_EQ(Refusal([&] { candidates.Keep(kSays3, kNone, kRange); }),
            "X is 3, but must be small for a PLL, or large for a TSYN.");
  candidates.Keep(
      Unsaid, [](Primitive primitive) { return primitive == kPll; }, kRange);
  EXPECT_EQ(Refusal([&] { candidates.Keep(kSays3, kNone, kRange); }),
            "X is 3, but must be small for a PLL.");
}

}  // namespace
