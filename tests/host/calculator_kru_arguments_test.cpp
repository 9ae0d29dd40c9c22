// What KRU_SP and KRU_CLKGEN accept.
#include <gtest/gtest.h>

#include <map>
#include <set>
#include <string>

#include "host/bundled/calculator/KruArguments.h"
#include "tests/host/calculator_support.h"

namespace {

using Calculator::ArgumentError;
using Calculator::KruArguments;
using calculator_test::BundledGrade;
using calculator_test::GradeOf;
using calculator_test::kInfinity;
using calculator_test::kKruClkgenLines;
using calculator_test::kNan;
using Device::kKruClkgen;
using Device::kKruSp;

constexpr int kClk0 = 1, kClk2x = 5, kClkfx = 8, kClkfx180 = 9, kClkdv = 10;

// Both KRUs: CLK0 5 to 312.5 MHz, CLK90 5 to 250, CLK2X 10 to 400, CLKFX 5 to 400.
const Device::Grade& Both() {
  static const auto* const grade = new Device::Grade(BundledGrade("vk40", "2"));
  return *grade;
}
const Device::Grade& Clkgen() {
  static const auto* const grade = new Device::Grade(GradeOf(kKruClkgenLines));
  return *grade;
}

template <typename Check>
std::string Refusal(Check check) {
  try {
    check();
  } catch (const ArgumentError& error) {
    return error.what();
  }
  return "accepted";
}

// What a check of a fresh query about a pin says, to any KRU of the device or to one of them.
template <typename Check>
std::string AnyRefusal(const Device::Grade& grade, int pin, Check check) {
  return Refusal([&] {
    KruArguments arguments = KruArguments::Any(grade, "dev-1");
    arguments.CheckPin(pin);
    check(arguments);
  });
}
template <typename Check>
std::string CertainRefusal(Device::Primitive primitive, int pin, Check check) {
  return Refusal([&] {
    KruArguments arguments = KruArguments::Certain(Both(), "dev-1", primitive);
    arguments.CheckPin(pin);
    check(arguments);
  });
}

const std::string kPins = "CLK0, CLK90, CLK180, CLK270, CLK2X, CLK2X180, CLKFX, CLKFX180 or CLKDV";

TEST(KruPin, HasTheCodesOfTheInterface) {
  const std::map<int, std::string> expected = {{1, "CLK0"},   {2, "CLK90"},    {3, "CLK180"},
                                               {4, "CLK270"}, {5, "CLK2X"},    {7, "CLK2X180"},
                                               {8, "CLKFX"},  {9, "CLKFX180"}, {10, "CLKDV"}};
  for (int code = -2; code <= 20; ++code) {
    const auto known = expected.find(code);
    if (known != expected.end()) {
      EXPECT_EQ(Calculator::PinOf(code).name, known->second);
    } else {
      EXPECT_EQ(Refusal([=] { Calculator::PinOf(code); }),
                "Pin is unknown (code " + std::to_string(code) + "), but must be " + kPins + ".");
    }
  }
  EXPECT_EQ(Calculator::AllPins(), kPins);
  EXPECT_EQ(Calculator::SynthesiserPins(), "CLKFX or CLKFX180");
}

TEST(KruPin, HasItsPhase) {
  const std::map<int, double> expected = {{1, 0},   {2, 0.25}, {3, 0.5}, {4, 0.75}, {5, 0},
                                          {7, 0.5}, {8, 0},    {9, 0.5}, {10, 0}};
  for (const auto& [code, phase] : expected) {
    EXPECT_EQ(Calculator::PinOf(code).phase, phase) << code;
  }
}

TEST(KruArguments, NeedsAKru) {
  const auto any = [](const Device::Grade& grade) {
    return Refusal([&] { KruArguments::Any(grade, "dev-1"); });
  };
  EXPECT_EQ(any(Both()), "accepted");
  EXPECT_EQ(any(Clkgen()), "accepted");
  EXPECT_EQ(any(BundledGrade("vk20", "2")), "Device dev-1 has neither KRU_SP nor KRU_CLKGEN.");
  const auto certain = [](Device::Primitive primitive) {
    return Refusal([&] { KruArguments::Certain(Clkgen(), "dev-1", primitive); });
  };
  EXPECT_EQ(certain(kKruClkgen), "accepted");
  EXPECT_EQ(certain(kKruSp), "Device dev-1 has no KRU_SP.");
  EXPECT_EQ(
      Refusal([&] { KruArguments::Certain(BundledGrade("vk20", "2"), "vk20-2", kKruClkgen); }),
      "Device vk20-2 has no KRU_CLKGEN.");
}

TEST(KruArguments, PinsOfTheKruClkgen) {
  const auto nothing = [](auto&) {};
  for (const int pin : {kClkfx, kClkfx180}) {
    EXPECT_EQ(CertainRefusal(kKruClkgen, pin, nothing), "accepted");
  }
  EXPECT_EQ(CertainRefusal(kKruClkgen, kClk0, nothing),
            "Pin is CLK0, but must be CLKFX or CLKFX180 for a KRU_CLKGEN.");
  EXPECT_EQ(CertainRefusal(kKruClkgen, kClkdv, nothing),
            "Pin is CLKDV, but must be CLKFX or CLKFX180 for a KRU_CLKGEN.");
  EXPECT_EQ(CertainRefusal(kKruClkgen, 12, nothing),
            "Pin is unknown (code 12), but must be " + kPins + ".");
  EXPECT_EQ(CertainRefusal(kKruSp, kClk0, nothing), "accepted");
  EXPECT_EQ(AnyRefusal(Clkgen(), kClk2x, nothing),
            "Pin is CLK2X, but must be CLKFX or CLKFX180 for a KRU_CLKGEN.");
}

TEST(KruArguments, Flags) {
  for (const bool flag : {false, true}) {
    EXPECT_EQ(CertainRefusal(kKruSp, kClkfx, [=](auto& of) { of.CheckFlag("F", flag); }),
              "accepted");
    EXPECT_EQ(CertainRefusal(kKruClkgen, kClkfx, [=](auto& of) { of.CheckFlag("F", flag); }),
              flag ? "F is true, but must be false for a KRU_CLKGEN." : "accepted");
  }
}

TEST(KruArguments, MAndDOfTheKruSp) {
  const auto m = [](double value) {
    return CertainRefusal(kKruSp, kClkfx, [=](auto& of) { of.CheckM(value); });
  };
  EXPECT_EQ(m(2), "accepted");
  EXPECT_EQ(m(32), "accepted");
  for (const double value : {0.0, 1.0, 33.0, 2.5, -2.0, kNan, kInfinity}) {
    EXPECT_EQ(m(value), "M is " + Calculator::NumberText(value) +
                            ", but must be a whole number from 2 to 32 for a KRU_SP.");
  }
  const auto d = [](double value) {
    return CertainRefusal(kKruSp, kClkfx180, [=](auto& of) { of.CheckD(value); });
  };
  EXPECT_EQ(d(1), "accepted");
  EXPECT_EQ(d(32), "accepted");
  for (const double value : {0.0, 33.0, 1.5, kNan}) {
    EXPECT_EQ(d(value), "D is " + Calculator::NumberText(value) +
                            ", but must be a whole number from 1 to 32 for a KRU_SP.");
  }
}

TEST(KruArguments, MAndDOfTheKruClkgen) {
  const auto both = [](double m, double d) {
    return CertainRefusal(kKruClkgen, kClkfx, [=](auto& of) {
      of.CheckM(m);
      of.CheckD(d);
    });
  };
  EXPECT_EQ(both(256, 256), "accepted");
  EXPECT_EQ(both(2, 1), "accepted");
  EXPECT_EQ(both(257, 1), "M is 257, but must be a whole number from 2 to 256 for a KRU_CLKGEN.");
  EXPECT_EQ(both(2, 257), "D is 257, but must be a whole number from 1 to 256 for a KRU_CLKGEN.");
}

TEST(KruArguments, PinsThatNeedNoMAndD) {
  for (const double value : {0.0, -0.0, 2.0, 32.0}) {
    EXPECT_EQ(CertainRefusal(kKruSp, kClk0,
                             [=](auto& of) {
                               of.CheckM(value);
                               of.CheckD(value);
                             }),
              "accepted");
  }
  EXPECT_EQ(CertainRefusal(kKruSp, kClkdv, [](auto& of) { of.CheckM(1); }),
            "M is 1, but must be 0 (none) or a whole number from 2 to 32 for a KRU_SP.");
  EXPECT_EQ(CertainRefusal(kKruSp, kClk0, [](auto& of) { of.CheckD(kNan); }),
            "D is nan, but must be 0 (none) or a whole number from 1 to 32 for a KRU_SP.");
}

TEST(KruArguments, EarlierArgumentsChooseTheKru) {
  const auto check = [](bool divide_by_2, double m) {
    return AnyRefusal(Both(), kClkfx, [=](auto& of) {
      of.CheckFlag("CLKIN_DIVIDE_BY_2", divide_by_2);
      of.CheckM(m);
    });
  };
  EXPECT_EQ(check(false, 200), "accepted");
  EXPECT_EQ(check(true, 200), "M is 200, but must be a whole number from 2 to 32 for a KRU_SP.");
  EXPECT_EQ(check(false, 300),
            "M is 300, but must be a whole number from 2 to 32 for a KRU_SP, or a whole number "
            "from 2 to 256 for a KRU_CLKGEN.");
}

TEST(KruArguments, DivideOfClkdv) {
  const auto divide = [](double value) {
    return AnyRefusal(Both(), kClkdv, [=](auto& of) { of.CheckDivide(value); });
  };
  for (double value = 2; value <= 8; value += 0.5) EXPECT_EQ(divide(value), "accepted") << value;
  for (double value = 9; value <= 17; ++value) EXPECT_EQ(divide(value), "accepted") << value;
  for (const double value : {0.0, 1.0, 1.25, 1.5, 8.5, 9.5, 18.0, 32.0, -2.0, kNan, kInfinity}) {
    EXPECT_EQ(divide(value), "CLKDV divide is " + Calculator::NumberText(value) +
                                 ", but must be from 2 to 8 in steps of 0.5 or a whole number "
                                 "from 9 to 17 for a KRU_SP.");
  }
}

TEST(KruArguments, DivideThatThePinDoesNotNeed) {
  const auto divide = [](int pin, double value) {
    return AnyRefusal(Both(), pin, [=](auto& of) { of.CheckDivide(value); });
  };
  for (const double value : {0.0, 2.5, 17.0}) EXPECT_EQ(divide(kClk0, value), "accepted") << value;
  EXPECT_EQ(divide(kClk0, 32),
            "CLKDV divide is 32, but must be 0 (none), from 2 to 8 in steps of 0.5 or a whole "
            "number from 9 to 17 for a KRU_SP.");
  EXPECT_EQ(divide(kClkfx, 32), "accepted") << "that of a KRU_CLKGEN";
  EXPECT_EQ(divide(kClkfx, 64),
            "CLKDV divide is 64, but must be 0 (none), from 2 to 8 in steps of 0.5 or a whole "
            "number from 9 to 17 for a KRU_SP, or 0 (none), 2, 4, 8, 16 or 32 for a KRU_CLKGEN.");
}

TEST(KruArguments, FrequencyOfThePin) {
  const auto frequency = [](int pin, double value) {
    return CertainRefusal(kKruSp, pin, [=](auto& of) { of.CheckFrequency(value); });
  };
  for (const double value : {5.0, 312.5}) EXPECT_EQ(frequency(1, value), "accepted") << value;
  EXPECT_EQ(frequency(1, 4), "CLK0 frequency is 4 MHz, but must be from 5 to 312.5 MHz.");
  EXPECT_EQ(frequency(3, 320), "CLK180 frequency is 320 MHz, but must be from 5 to 312.5 MHz.");
  EXPECT_EQ(frequency(2, 260), "CLK90 frequency is 260 MHz, but must be from 5 to 250 MHz.");
  EXPECT_EQ(frequency(4, 260), "CLK270 frequency is 260 MHz, but must be from 5 to 250 MHz.");
  EXPECT_EQ(frequency(5, 9), "CLK2X frequency is 9 MHz, but must be from 10 to 400 MHz.");
  EXPECT_EQ(frequency(7, 401), "CLK2X180 frequency is 401 MHz, but must be from 10 to 400 MHz.");
  EXPECT_EQ(frequency(8, 1300.0 / 3.0),
            "CLKFX frequency is 433.333 MHz, but must be from 5 to 400 MHz.");
  EXPECT_EQ(frequency(9, 4.99), "CLKFX180 frequency is 4.99 MHz, but must be from 5 to 400 MHz.");
  EXPECT_EQ(frequency(10, 4), "Delay-line frequency is 4 MHz, but must be from 5 to 312.5 MHz.");
}

// 0.0005 of 400 MHz is 0.2.
TEST(KruArguments, FrequencyHasTheSlackOfTheSolver) {
  const auto frequency = [](double value) {
    return CertainRefusal(kKruSp, kClkfx, [=](auto& of) { of.CheckFrequency(value); });
  };
  EXPECT_EQ(frequency(400.19), "accepted");
  EXPECT_NE(frequency(400.21), "accepted");
}

}  // namespace
