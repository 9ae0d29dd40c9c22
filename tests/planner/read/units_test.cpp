// Values as people write them.
#include "planner/read/Units.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <ostream>

#include "tests/planner/read/read_support.h"

namespace planner::read {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

struct Good {
  const char* text;
  ValueKind kind;
  std::int64_t numerator;
  std::int64_t denominator = 1;
};
void PrintTo(const Good& good, std::ostream* stream) { *stream << good.text; }

class GoodValue : public testing::TestWithParam<Good> {};

TEST_P(GoodValue, IsExact) {
  const Good& good = GetParam();
  Mistakes mistakes;
  const auto value = ReadValue(good.text, good.kind, Called("it"), &mistakes);
  EXPECT_THAT(TextsOf(mistakes), IsEmpty());
  EXPECT_EQ(Shape(value), Shape(Rational(good.numerator, good.denominator)));
}

constexpr ValueKind kF = ValueKind::kFrequency;
INSTANTIATE_TEST_SUITE_P(
    Frequencies, GoodValue,
    testing::Values(
        Good{"100", kF, 100}, Good{"148.5MHz", kF, 297, 2}, Good{"33.333 MHz", kF, 33333, 1000},
        Good{"148500kHz", kF, 297, 2}, Good{"0.1485GHz", kF, 297, 2},
        Good{"148500000Hz", kF, 297, 2}, Good{"8ns", kF, 125}, Good{"8 ns", kF, 125},
        Good{"8000ps", kF, 125}, Good{"0.5us", kF, 2}, Good{"1ms", kF, 1, 1000},
        // The period of 7 ns is no decimal: 1000/7 MHz.
        Good{"7ns", kF, 1000, 7}, Good{"125mhz", kF, 125}, Good{"300/4", kF, 75},
        Good{"100/3", kF, 100, 3}, Good{"148.5 / 1.1MHz", kF, 135}, Good{"0100", kF, 100},
        Good{"1e2", kF, 100}, Good{"+.5E+2", kF, 50}, Good{"5.", kF, 5}, Good{" 5 ", kF, 5},
        Good{"125MHZ", kF, 125}, Good{"125000KHZ", kF, 125}, Good{"8NS", kF, 125},
        Good{"8000PS", kF, 125}, Good{"1MS", kF, 1, 1000}, Good{"0.125gHz", kF, 125},
        // A double between has 100.00000000000001 and 100.00000000000001421.
        Good{"100.00000000000001", kF, 10000000000000001, 100000000000000},
        Good{"1Hz", kF, 1, 1000000}, Good{"1000GHz", kF, 1000000},
        Good{"1e308/1e303", kF, 100000}, Good{"0.0000000001e10", kF, 1}));
INSTANTIATE_TEST_SUITE_P(
    Others, GoodValue,
    testing::Values(
        Good{"90", ValueKind::kPhase, 90}, Good{"90deg", ValueKind::kPhase, 90},
        Good{"-45 degrees", ValueKind::kPhase, -45}, Good{"-360", ValueKind::kPhase, -360},
        Good{"90\xc2\xb0", ValueKind::kPhase, 90}, Good{"90\xb0", ValueKind::kPhase, 90},
        Good{"-100/3", ValueKind::kPhase, -100, 3}, Good{"50", ValueKind::kDuty, 50},
        Good{"33.3%", ValueKind::kDuty, 333, 10}, Good{"25 percent", ValueKind::kDuty, 25},
        Good{"0e99999", ValueKind::kDuty, 0}, Good{"50", ValueKind::kJitter, 50},
        Good{"50ps", ValueKind::kJitter, 50}, Good{"0.05ns", ValueKind::kJitter, 50},
        Good{"50000fs", ValueKind::kJitter, 50}, Good{"50PS", ValueKind::kJitter, 50},
        Good{"1ms", ValueKind::kJitter, 1000000000}, Good{"0", ValueKind::kJitter, 0},
        Good{"0.2ns", ValueKind::kMaxJitter, 200}, Good{"200ps", ValueKind::kGap, 1, 5},
        Good{"0.2", ValueKind::kGap, 1, 5}, Good{"25%", ValueKind::kShare, 25},
        Good{"100", ValueKind::kTolerance, 100},
        Good{"100ppm", ValueKind::kTolerance, 100}, Good{"0.01%", ValueKind::kTolerance, 100},
        Good{"500ppb", ValueKind::kTolerance, 1, 2}, Good{"0", ValueKind::kTolerance, 0},
        Good{"1000000000", ValueKind::kTolerance, 1000000000},
        Good{"0.5deg", ValueKind::kPhaseTolerance, 1, 2},
        Good{"2%", ValueKind::kDutyTolerance, 2}));

struct Bad {
  std::string text;
  ValueKind kind;
  std::string sentence;
};
void PrintTo(const Bad& bad, std::ostream* stream) { *stream << bad.text; }

class BadValue : public testing::TestWithParam<Bad> {};

TEST_P(BadValue, IsTold) {
  const Bad& bad = GetParam();
  Mistakes mistakes;
  EXPECT_EQ(Shape(ReadValue(bad.text, bad.kind, Called("it"), &mistakes)), "nothing");
  EXPECT_THAT(TextsOf(mistakes), ElementsAre("it: " + bad.sentence));
}

const char* const kNoFrequency = "is not a frequency, such as 100, 148.5MHz, 100/3 or 8ns";
const char* const kOut = "is out of range: a frequency is from 1 Hz to 1000 GHz";
std::string Not(const std::string& text) { return "\"" + text + "\" " + kNoFrequency; }

INSTANTIATE_TEST_SUITE_P(
    Frequencies, BadValue,
    testing::Values(
        Bad{"", kF, Not("")}, Bad{"MHz", kF, Not("MHz")}, Bad{"50 25", kF, Not("50 25")},
        Bad{"1/2/3", kF, Not("1/2/3")}, Bad{"0x64", kF, Not("0x64")}, Bad{"inf", kF, Not("inf")},
        Bad{"-", kF, Not("-")}, Bad{".", kF, Not(".")}, Bad{"1;2", kF, Not("1;2")},
        Bad{"1\n2", kF, Not("1\\x0a2")}, Bad{"1.2.3", kF, Not("1.2.3")},
        Bad{"0ns", kF, "0ns must be greater than 0"},
        Bad{"-5MHz", kF, "-5MHz must be greater than 0"},
        Bad{"-0.0", kF, "-0.0 must be greater than 0"}, Bad{"1/0", kF, "\"1/0\" divides by 0"},
        Bad{"1e999MHz", kF, "1e999 is too large"}, Bad{"1/1e-9999", kF, "1e-9999 is too small"},
        Bad{"1e308GHz", kF, std::string("1e308GHz ") + kOut},
        Bad{"1e308/1e-308", kF, std::string("1e308/1e-308 ") + kOut},
        Bad{"1e-320Hz", kF, std::string("1e-320Hz ") + kOut},
        Bad{"0.999Hz", kF, std::string("0.999Hz ") + kOut},
        Bad{"1000.001GHz", kF, std::string("1000.001GHz ") + kOut},
        // The next below 1 Hz and above 1000 GHz that a double does not tell from them.
        Bad{"0.99999999999999999Hz", kF, std::string("0.99999999999999999Hz ") + kOut},
        Bad{"1000000000000.00001Hz", kF, std::string("1000000000000.00001Hz ") + kOut},
        Bad{"10mHz", kF, "mHz in \"10mHz\" is millihertz; write MHz"},
        Bad{"10 mHZ", kF, "mHZ in \"10 mHZ\" is millihertz; write MHz"},
        Bad{"1Ms", kF, "Ms in \"1Ms\" is megaseconds; write ms"},
        Bad{"8000Ps", kF, "Ps in \"8000Ps\" is petaseconds; write ps"},
        Bad{"100MHZZ", kF,
            "unknown unit \"MHZZ\" in \"100MHZZ\"; the units of a frequency are Hz, kHz, MHz and "
            "GHz, or ps, ns, us and ms for a period"}));
INSTANTIATE_TEST_SUITE_P(
    DecimalComma, BadValue,
    testing::Values(Bad{"148,5", kF, Not("148,5") + "; with a decimal point it is 148.5"},
                    Bad{"148,5 MHz", kF, Not("148,5 MHz") + "; with a decimal point it is 148.5 MHz"},
                    Bad{"0,5", ValueKind::kJitter,
                        "\"0,5\" is not a jitter, such as 50, 50ps or 0.05ns; with a decimal "
                        "point it is 0.5"},
                    // A list, which has no decimal point to be.
                    Bad{"1,2,3", kF, Not("1,2,3")}, Bad{"1,", kF, Not("1,")},
                    Bad{",5", kF, Not(",5")}, Bad{"1,5x", kF, Not("1,5x")}));
INSTANTIATE_TEST_SUITE_P(
    Others, BadValue,
    testing::Values(
        Bad{"50Ps", ValueKind::kJitter, "Ps in \"50Ps\" is petaseconds; write ps"},
        Bad{"50mHz", ValueKind::kJitter,
            "unknown unit \"mHz\" in \"50mHz\"; the units of a jitter are fs, ps, ns, us and ms"},
        Bad{"90deg", ValueKind::kDuty,
            "unknown unit \"deg\" in \"90deg\"; the units of a duty cycle are %"},
        Bad{"50%", ValueKind::kPhase,
            "unknown unit \"%\" in \"50%\"; the units of a phase are deg"},
        Bad{"720", ValueKind::kPhase, "720 must be between -360 and 360"},
        Bad{"360.00000000000000001", ValueKind::kPhase,
            "360.00000000000000001 must be between -360 and 360"},
        Bad{"1e308/1e-308", ValueKind::kPhase, "1e308/1e-308 must be between -360 and 360"},
        Bad{"101%", ValueKind::kDuty, "101% must be above 0 and below 100"},
        Bad{"100", ValueKind::kDuty, "100 must be above 0 and below 100"},
        Bad{"-1", ValueKind::kTolerance, "-1 must be 0 or greater"},
        Bad{"1000000001", ValueKind::kTolerance,
            "1000000001 is out of range: a tolerance is from 0 to 1000000000 ppm"},
        Bad{"2000us", ValueKind::kJitter, "2000us must be at most 1 ms"},
        Bad{"1e300", ValueKind::kJitter, "1e300 must be at most 1 ms"},
        Bad{"0", ValueKind::kMaxJitter, "0 must be greater than 0"},
        Bad{"361", ValueKind::kPhaseTolerance,
            "361 is out of range: a tolerance of a phase is from 0 to 360 degrees"},
        Bad{"101", ValueKind::kDutyTolerance,
            "101 is out of range: a tolerance of a duty cycle is from 0 to 100 percent points"},
        Bad{std::string(101, '7'), ValueKind::kPhase,
            std::string(60, '7') + "... has more than 100 digits"}));

// A list as text: entries with commas between them, or the sentences about it.
std::string List(const std::string& text, ValueKind kind, bool optional = false) {
  Mistakes mistakes;
  const auto values = ReadValues(text, kind, Called("it"), optional, &mistakes);
  std::string result;
  if (!values) {
    for (const std::string& sentence : TextsOf(mistakes)) result += sentence + "\n";
    return result;
  }
  EXPECT_THAT(mistakes, IsEmpty());
  for (const auto& value : *values) result += (result.empty() ? "" : ",") +
                                              (value ? Written(*value) : std::string("-"));
  return result;
}

TEST(Lists, WithBlanksForCommasAreShownWithThem) {
  EXPECT_EQ(List("148.5 74.25", kF),
            "it: \"148.5 74.25\" is a list without commas; write 148.5,74.25\n");
  EXPECT_EQ(List("27,148.5 MHz  8ns", kF),
            "it: \"148.5 MHz  8ns\" is a list without commas; write 148.5MHz,8ns\n");
  EXPECT_EQ(List("- -45 90deg", ValueKind::kPhase, true),
            "it: \"- -45 90deg\" is a list without commas; write -,-45,90deg\n");
  // Not where something else is wrong, too.
  EXPECT_EQ(List("148.5 x", kF), "it: unknown unit \"x\" in \"148.5 x\"; the units of a frequency "
                                 "are Hz, kHz, MHz and GHz, or ps, ns, us and ms for a period\n");
  EXPECT_EQ(List("148.5 -7", kF), "it: " + Not("148.5 -7") + "\n");
  EXPECT_EQ(List("- 90", kF), "it: " + Not("- 90") + "\n");
}

TEST(Lists, HaveAUnitWithEachOrWithSomeWhenItChangesNothing) {
  EXPECT_EQ(List("148.5MHz,74.25,27MHz", kF), "148.5,74.25,27");
  EXPECT_EQ(List("8ns, 16 ns", kF), "125,62.5");
  EXPECT_EQ(List("1GHz,500MHz", kF), "1000,500");
  EXPECT_EQ(List("24,27,33.3MHz", kF), "24,27,33.3");
  EXPECT_EQ(List(" 24MHz , 27 ,33.3 ", kF), "24,27,33.3");
  EXPECT_EQ(List("24MHz,8ns,500kHz", kF), "24,125,0.5");
}

TEST(Lists, RefuseAUnitThatMayBeMeantForAll) {
  EXPECT_EQ(List("8,16ns", kF),
            "it: \"8\" has no unit, and beside \"16ns\" it could be in MHz or in ns; write 8MHz or "
            "8ns\n");
  EXPECT_EQ(List("125kHz,62.5", kF),
            "it: \"62.5\" has no unit, and beside \"125kHz\" it could be in MHz or in kHz; write "
            "62.5MHz or 62.5kHz\n");
  // The case of a unit is no other unit.
  EXPECT_EQ(List("100,50ps", ValueKind::kJitter), "100,50");
}

TEST(Lists, HaveEntriesThatAskForNothing) {
  EXPECT_EQ(List("90,-,0", ValueKind::kPhase, true), "90,-,0");
  EXPECT_EQ(List("-,-", ValueKind::kDuty, true), "-,-");
  EXPECT_EQ(List("-", ValueKind::kPhase), "it: \"-\" is not a phase, such as 90, 90deg or -45\n");
}

TEST(Lists, LackEntries) {
  EXPECT_EQ(List("1,,2", kF), "it: a number is missing in \"1,,2\"\n");
  EXPECT_EQ(List("1, ,2", kF), "it: a number is missing in \"1, ,2\"\n");
  EXPECT_EQ(List("50,", kF), "it: a number is missing in \"50,\"\n");
  EXPECT_EQ(List(",", kF), "it: a number is missing in \",\"\n");
  EXPECT_EQ(List("", kF), "it: the list is empty\n");
}

TEST(Lists, TellAllThatIsWrong) {
  EXPECT_EQ(List("0,5,1Ms", kF),
            "it: 0 must be greater than 0\nit: Ms in \"1Ms\" is megaseconds; write ms\n");
}

TEST(IsUnit, KnowsTheUnitsOfAKind) {
  EXPECT_TRUE(IsUnit("MHz", kF));
  EXPECT_TRUE(IsUnit("mhz", kF));
  EXPECT_TRUE(IsUnit("mHz", kF));  // which is refused as a value, with what to write
  EXPECT_FALSE(IsUnit("deg", kF));
  EXPECT_FALSE(IsUnit("", kF));
  EXPECT_TRUE(IsUnit("%", ValueKind::kDuty));
}

TEST(Written, IsADecimalWhereThereIsOne) {
  EXPECT_EQ(Written(Rational(297, 2)), "148.5");
  EXPECT_EQ(Written(Rational(-1, 8)), "-0.125");
  EXPECT_EQ(Written(Rational(100, 3)), "100/3");
  EXPECT_EQ(Written(Rational(27)), "27");
  EXPECT_EQ(Written(Rational(0)), "0");
  EXPECT_EQ(Written(Rational(1, 1'000'000)), "0.000001");
}

}  // namespace
}  // namespace planner::read
