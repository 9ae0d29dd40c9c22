// Coefficients of the calculator in device files.
#include <gtest/gtest.h>

#include <set>
#include <string>
#include <string_view>

#include "host/bundled/device/CoefficientTable.h"
#include "tests/host/calculator_support.h"

namespace {

using calculator_test::GradeOf;
using calculator_test::kCalculatorHead;
using calculator_test::kKruLines;
using calculator_test::kLoopLines;
using Device::CoefficientGroup;
using Device::Coefficients;

// What is wrong with a device file whose grade 1 is made of these lines, without its path. The
// lines begin in line 4.
std::string Error(const std::string& lines) {
  const DeviceFolder folder;
  try {
    calculator_test::ReadDevice(folder, lines);
  } catch (const Device::DeviceError& error) {
    return std::string(error.what()).substr(folder.File("dev.toml").size());
  }
  return "no error";
}

// The loop's lines with one coefficient replaced.
std::string LoopWith(const std::string& name, const std::string& value) {
  std::string lines = kLoopLines;
  const std::size_t begin = lines.find(name + " =");
  lines.replace(begin, lines.find('\n', begin) - begin, name + " = " + value);
  return kCalculatorHead + lines;
}

TEST(CoefficientTable, HasEachCoefficientOnce) {
  std::set<std::string_view> names;
  for (std::size_t i = 0; i < Coefficients().size(); ++i) {
    const Device::Coefficient& coefficient = Coefficients()[i];
    EXPECT_TRUE(names.insert(coefficient.name).second) << coefficient.name;
    EXPECT_EQ(Device::FindCoefficient(coefficient.name), i);
    EXPECT_EQ(coefficient.group == CoefficientGroup::kLoop, coefficient.name.starts_with("LOOP_"));
    EXPECT_EQ(coefficient.group == CoefficientGroup::kKru, coefficient.name.starts_with("KRU_"));
    EXPECT_EQ(Device::FindKeyword(coefficient.name), std::nullopt) << "a keyword, too";
  }
  EXPECT_EQ(names.size(), 13U);
  EXPECT_EQ(Device::FindCoefficient("loop_kappa"), std::nullopt);
  EXPECT_EQ(Device::FindCoefficient(""), std::nullopt);
}

TEST(DeviceFileCoefficients, AreRead) {
  const Device::Grade grade = GradeOf("O_MAX_HT_LT = 64\n" + kCalculatorHead + kLoopLines);
  EXPECT_EQ(grade.CoefficientOf("LOOP_KAPPA"), 30.0);
  EXPECT_EQ(grade.CoefficientOf("LOOP_BANDWIDTH_OPTIMIZED"), 0.02);
  EXPECT_EQ(grade.CoefficientOf("LOOP_LEAKAGE"), 40.0);
  EXPECT_EQ(grade.CoefficientOf("KRU_KAPPA"), std::nullopt);
  EXPECT_EQ(grade.CoefficientOf("KAPPA"), std::nullopt);
  EXPECT_EQ(grade.Figure("O_MAX_HT_LT"), 64.0);
  EXPECT_EQ(grade.Figure("LOOP_KAPPA"), std::nullopt);
  EXPECT_TRUE(grade.Has(CoefficientGroup::kLoop));
  EXPECT_FALSE(grade.Has(CoefficientGroup::kKru));
}

TEST(DeviceFileCoefficients, MayBeLeftOut) {
  for (const std::string lines : {"O_MAX_HT_LT = 64\n", "[grade.1.calculator]\n"}) {
    const Device::Grade grade = GradeOf(lines);
    EXPECT_FALSE(grade.Has(CoefficientGroup::kLoop));
    EXPECT_FALSE(grade.Has(CoefficientGroup::kKru));
  }
}

TEST(DeviceFileCoefficients, AreThoseOfTheirGrade) {
  const DeviceFolder folder;
  const auto file = calculator_test::ReadDevice(
      folder, kCalculatorHead + kKruLines + "[grade.2]\nO_MAX_HT_LT = 64\n");
  EXPECT_TRUE(file.FindGrade("1")->Has(CoefficientGroup::kKru));
  EXPECT_FALSE(file.FindGrade("2")->Has(CoefficientGroup::kKru));
  EXPECT_EQ(file.GradeNames(), (std::vector<std::string>{"1", "2"}));
}

TEST(DeviceFileCoefficients, ReportsUnknownOnes) {
  EXPECT_EQ(Error(kCalculatorHead + "LOOP_GAMMA = 1\n"),
            ":5:1: unknown coefficient \"LOOP_GAMMA\"");
  EXPECT_EQ(Error(kCalculatorHead + "O_MAX_HT_LT = 64\n"),
            ":5:1: unknown coefficient \"O_MAX_HT_LT\"");
  EXPECT_EQ(Error("LOOP_KAPPA = 30\n"), ":4:1: unknown keyword \"LOOP_KAPPA\"");
}

TEST(DeviceFileCoefficients, ReportsNumbersThatAreNone) {
  for (const std::string number : {"0", "-1", "inf", "nan"}) {
    EXPECT_EQ(Error(kCalculatorHead + "KRU_KAPPA = " + number + "\n"),
              ":5:13: \"KRU_KAPPA\" must be a finite positive number")
        << number;
  }
  EXPECT_EQ(Error(kCalculatorHead + "KRU_KAPPA = \"60\"\n"),
            ":5:13: \"KRU_KAPPA\" must be a number");
}

TEST(DeviceFileCoefficients, ReportsOtherThanATable) {
  const std::string reason = "\"calculator\" must be a [grade.<name>.calculator] table";
  EXPECT_EQ(Error("calculator = 1\n"), ":4:14: " + reason);
  EXPECT_EQ(Error("calculator = [1]\n"), ":4:14: " + reason);
}

TEST(DeviceFileCoefficients, ReportsAGroupThatIsNotWhole) {
  for (const Device::Coefficient& left_out : Coefficients()) {
    std::string lines;
    std::string_view first;
    for (const Device::Coefficient& coefficient : Coefficients()) {
      if (coefficient.group != left_out.group || coefficient.name == left_out.name) continue;
      if (first.empty()) first = coefficient.name;
      lines += std::string(coefficient.name) + " = 0.01\n";
    }
    EXPECT_EQ(Error(kCalculatorHead + lines),
              ":4:10: the coefficient \"" + std::string(left_out.name) +
                  "\" is missing, which goes with \"" + std::string(first) + "\"");
  }
}

TEST(DeviceFileCoefficients, ReportsBandwidthsThatDoNotRise) {
  EXPECT_EQ(Error(LoopWith("LOOP_BANDWIDTH_OPTIMIZED", "0.01")),
            ":8:28: \"LOOP_BANDWIDTH_OPTIMIZED\" must be above \"LOOP_BANDWIDTH_LOW\"");
  EXPECT_EQ(Error(LoopWith("LOOP_BANDWIDTH_HIGH", "0.015")),
            ":9:23: \"LOOP_BANDWIDTH_HIGH\" must be above \"LOOP_BANDWIDTH_OPTIMIZED\"");
  EXPECT_EQ(Error(LoopWith("LOOP_BANDWIDTH_HIGH", "0.1")), "no error");
  EXPECT_EQ(Error(LoopWith("LOOP_BANDWIDTH_HIGH", "0.101")),
            ":9:23: \"LOOP_BANDWIDTH_HIGH\" must be at most 0.1, a tenth of the PFD frequency");
}

TEST(BundledCoefficients, AreThoseOfThePrimitives) {
  using calculator_test::BundledGrade;
  for (const auto& [device, grade, loop, kru] :
       {std::tuple("vk10", "1", true, true), std::tuple("vk20", "2", true, false),
        std::tuple("vk40", "1", true, true), std::tuple("vk40", "2", true, true)}) {
    const Device::Grade data = BundledGrade(device, grade);
    EXPECT_EQ(data.Has(CoefficientGroup::kLoop), loop) << device;
    EXPECT_EQ(data.Has(CoefficientGroup::kKru), kru) << device;
  }
}

// The slower grade of vk40 is worse in everything that stands for an error.
TEST(BundledCoefficients, AreNotBetterAtTheSlowerGrade) {
  const Device::Grade slow = calculator_test::BundledGrade("vk40", "1");
  const Device::Grade fast = calculator_test::BundledGrade("vk40", "2");
  for (const char* name :
       {"LOOP_KAPPA", "LOOP_BUFFER_JITTER", "LOOP_DETERMINISTIC_JITTER", "LOOP_STATIC_OFFSET",
        "LOOP_LEAKAGE", "KRU_KAPPA", "KRU_TAP_STEP", "KRU_BUFFER_JITTER", "KRU_PHASE_ERROR"}) {
    EXPECT_GT(*slow.CoefficientOf(name), *fast.CoefficientOf(name)) << name;
  }
}

TEST(Grade, HasAPrimitiveWithAllOfItsKeywords) {
  const Device::Grade vk20 = calculator_test::BundledGrade("vk20", "2");
  EXPECT_TRUE(vk20.Has(Device::kTsyn));
  EXPECT_FALSE(vk20.Has(Device::kPll));
  EXPECT_FALSE(vk20.Has(Device::kKruSp));
  EXPECT_FALSE(vk20.Has(Device::kKruClkgen));
  EXPECT_TRUE(GradeOf(calculator_test::kPllLines).Has(Device::kPll));
  EXPECT_FALSE(GradeOf("VCOCLK_FREQ_MIN = 400\n").Has(Device::kPll));
}

}  // namespace
