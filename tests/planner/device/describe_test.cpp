#include "planner/device/Describe.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "hardware/Exact.h"
#include "tests/planner/device/memory_files.h"

namespace {

using hardware::Primitive;
using hardware::Rational;
using planner::device::Description;
using planner::device::Keyword;
using planner::device::Unit;
using testing::ElementsAre;
using testing::IsEmpty;

TEST(Keywords, SayWhatNeedsThem) {
  int found = 0;
  for (const Keyword& keyword : planner::device::Keywords()) {
    if (keyword.name == "O_MAX_HT_LT") {
      ++found;
      EXPECT_EQ(keyword.unit, Unit::kCount);
      EXPECT_THAT(keyword.primitives, ElementsAre(Primitive::kPll, Primitive::kTsyn));
    }
    if (keyword.name == "D_KRU_CLKFXDV_CLKIN_DIVIDE_BY_2_FALSE_MINPERIOD") {
      ++found;
      EXPECT_EQ(keyword.unit, Unit::kNanoseconds);
      EXPECT_THAT(keyword.primitives, ElementsAre(Primitive::kKruClkgen));
    }
  }
  EXPECT_EQ(found, 2);
  EXPECT_EQ(planner::device::KeywordsOf(Primitive::kPll).size(), 8u);
  EXPECT_EQ(planner::device::KeywordsOf(Primitive::kTsyn).size(), 9u);
  EXPECT_EQ(planner::device::KeywordsOf(Primitive::kKruSp).size(), 13u);
  EXPECT_EQ(planner::device::KeywordsOf(Primitive::kKruClkgen).size(), 4u);
  EXPECT_EQ(planner::device::KeywordsOf(Primitive::kPll).front().unit, Unit::kMegahertz);
}

TEST(Describe, HasAllThatTheFileSays) {
  const Description description = planner::device::Describe(::Device::DeviceFile::Parse(
      "device = \"dev\"\ndescription = \"for tests\"\npackages = [\"p1\", \"p2\"]\n"
      "default_grade = \"b\"\n"
      "[grade.b]\nCLKPFD_FREQ_MAX = 4e2\nVCOCLK_FREQ_MAX = 187.617\n"
      "[grade.a]\nD_KRU_CLKFX_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MINPERIOD = 3\n"
      "D_KRU_CLKFX_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MAXPERIOD = 3\n"
      "D_KRU_CLKFXDV_CLKIN_DIVIDE_BY_2_FALSE_MINPERIOD = 3\n"
      "D_KRU_CLKFXDV_CLKIN_DIVIDE_BY_2_FALSE_MAXPERIOD = 3\n"
      "[grade.a.calculator]\nKRU_KAPPA = 1\nKRU_TAP_STEP = 1\nKRU_BUFFER_JITTER = 1\n"
      "KRU_PHASE_ERROR = 1\n",
      "some/dev.toml", "dev"));
  EXPECT_EQ(description.name, "dev");
  EXPECT_EQ(description.about, "for tests");
  EXPECT_EQ(description.file, "some/dev.toml");
  EXPECT_THAT(description.packages, ElementsAre("p1", "p2"));
  EXPECT_EQ(description.default_package, std::nullopt);
  EXPECT_EQ(description.default_grade, "b");
  ASSERT_EQ(description.grades.size(), 2u);

  const auto& b = description.grades[0];
  EXPECT_EQ(b.name, "b");
  ASSERT_EQ(b.limits.size(), 2u);  // in the order of the keywords
  EXPECT_EQ(b.limits[0].keyword, "VCOCLK_FREQ_MAX");
  EXPECT_EQ(b.limits[0].value, Rational(187617, 1000));
  EXPECT_EQ(b.limits[0].text, "187.617");
  EXPECT_EQ(b.limits[0].line, 7u);
  EXPECT_EQ(b.Find("CLKPFD_FREQ_MAX")->value, Rational(400));
  EXPECT_EQ(b.Find("CLKPFD_FREQ_MAX")->text, "4e2");
  EXPECT_EQ(b.Find("CLKPFD_FREQ_MIN"), nullptr);
  EXPECT_THAT(b.primitives, IsEmpty());
  EXPECT_FALSE(b.has_loop_jitter || b.has_kru_jitter);

  const auto& a = description.grades[1];
  EXPECT_THAT(a.primitives, ElementsAre(Primitive::kKruClkgen));
  EXPECT_TRUE(a.has_kru_jitter && !a.has_loop_jitter);
  EXPECT_EQ(description.Find("a"), &a);
  EXPECT_EQ(description.Find("c"), nullptr);
}

TEST(List, HasEveryDeviceAndWhatIsWrongWithIt) {
  MemoryFiles files;
  files.Add("a");
  files.texts["b"] = "device = \"b\"\n";
  files.Add("c");
  files.unreadable = "c";
  const auto list = planner::device::List(files);
  ASSERT_EQ(list.size(), 3u);
  EXPECT_EQ(list[0].name, "a");
  EXPECT_EQ(list[0].description->grades.size(), 2u);
  EXPECT_FALSE(list[0].complaint.has_value());
  EXPECT_FALSE(list[1].description.has_value());
  EXPECT_EQ(list[1].complaint->device, "b");
  EXPECT_EQ(list[1].complaint->line, 1u);
  EXPECT_EQ(list[1].complaint->reason, "the key \"packages\" is missing");
  EXPECT_EQ(list[2].complaint->reason, "is gone");
}

}  // namespace
