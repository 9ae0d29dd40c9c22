#include <gtest/gtest.h>

#include <nlohmann/json.hpp>

#include "descriptions.h"
#include "planner/report/DevicesText.h"
#include "schema.h"

namespace planner::report {
namespace {

using device::Description;
using device::Listed;
using nlohmann::ordered_json;

TEST(DevicesText, ARowForEachPrimitive) {
  EXPECT_EQ(DevicesText({{"round", Round(), std::nullopt}}, {}),
            "device  grade  primitive  VCO MHz     PFD MHz   outputs MHz  output 1\n"
            "round   b      PLL        400 - 1000  19 - 500  3.125 - 400  to 1000\n"
            "\n"
            "The grade is the device's default; devices NAME shows all limits.\n"
            "The last column is the highest frequency of output 1 of a PLL, which can drive\n"
            "an I/O clock.\n"
            "With bandwidth LOW the PFD of a PLL goes up to 300 MHz.\n");
}

TEST(DevicesText, DevicesThatCannotBeUsed) {
  Description bare = Round();
  bare.name = "bare";
  bare.default_grade.reset();
  const Listed broken = {"broken", std::nullopt,
                         device::FileComplaint{"broken", "/d/broken.toml", 3, 7, "no number"}};
  EXPECT_EQ(DevicesText({{"bare", bare, std::nullopt}, broken}, {}),
            "device  grade  primitive  VCO MHz  PFD MHz  outputs MHz  output 1\n"
            "\n"
            "bare cannot be used: bare has no default grade; it has a, b\n"
            "broken cannot be used: /d/broken.toml:3:7: no number\n"
            "\n"
            "The grade is the device's default; devices NAME shows all limits.\n");
}

TEST(DevicesText, ARangeThatIsTheWrongWayRoundIsMarked) {
  Description description = Round();
  SetLimit(&description, "b", "VCOCLK_FREQ_MIN", "6000");
  const std::string text = DevicesText({{"round", description, std::nullopt}}, {});
  EXPECT_NE(text.find("PLL        6000 - 1000 !  19 - 500"), std::string::npos) << text;
  EXPECT_NE(text.find("\nwarning: round, grade b: VCOCLK_FREQ_MIN, 6000, is above "
                      "VCOCLK_FREQ_MAX,\n  1000: there is no VCO frequency\n"),
            std::string::npos)
      << text;
}

TEST(DeviceText, AllLimitsOfADevice) {
  EXPECT_EQ(DeviceText(Round(), {"a", "b"}, {}),
            "device    round\n"
            "about     A device of tests\n"
            "file      /d/round.toml\n"
            "packages  p1, p2 (default p2)\n"
            "grades    a, b (default b, the fastest)\n"
            "\n"
            "PLL                     unit   grade a  grade b\n"
            "VCOCLK_FREQ_MIN         MHz        400      400\n"
            "VCOCLK_FREQ_MAX         MHz        900     1000\n"
            "CLKOUT_FREQ_MIN_GCLK    MHz      3.125    3.125\n"
            "CLKOUT_FREQ_MAX_GCLK    MHz        400      400\n"
            "CLKPFD_FREQ_MIN         MHz         19       19\n"
            "CLKPFD_FREQ_MAX         MHz        250      500\n"
            "CLKOUT_FREQ_MAX_IOCLK   MHz       1000     1000\n"
            "O_MAX_HT_LT             count       64       64\n"
            "PFD with bandwidth LOW  MHz     to 250   to 300\n"
            "note: M is 1 to 64, D 1 to 80 and each output divider 1 to 128, at most twice\n"
            "  O_MAX_HT_LT; all are whole. Output 1 can drive an I/O clock and goes up to\n"
            "  CLKOUT_FREQ_MAX_IOCLK, the others to CLKOUT_FREQ_MAX_GCLK.\n"
            "note: with bandwidth LOW the maximum of the PFD is 300 MHz for a PLL of any\n"
            "  device, or CLKPFD_FREQ_MAX where that is less.\n"
            "note: O_MAX_HT_LT is the largest number of VCO cycles for which an output\n"
            "  divider can hold its output high or low. The further a divider is above it,\n"
            "  the nearer to 50 % are the duty cycles that it has.\n");
}

TEST(DeviceText, WhatAKruClkgenCanBeSetTo) {
  Description description = Round();
  description.grades[1].primitives = {Primitive::kKruClkgen};
  const std::string text = DeviceText(description, {"b"}, Style{false, 200});
  EXPECT_NE(text.find("\nnote: M of CLKFX is 2 to 256, D 1 to 256. CLKFXDV divides CLKFX by 2, 4, "
                      "8, 16 or 32.\n"),
            std::string::npos)
      << text;
}

TEST(DeviceText, OneGrade) {
  const std::string text = DeviceText(Round(), {"a"}, {});
  EXPECT_NE(text.find("\nPLL                     unit   grade a\n"), std::string::npos) << text;
  EXPECT_NE(text.find("\nVCOCLK_FREQ_MAX         MHz        900\n"), std::string::npos) << text;
}

TEST(DeviceText, DoubtsAreToldOfTheGradesThatAreShown) {
  Description description = Round();
  SetLimit(&description, "a", "VCOCLK_FREQ_MIN", "6000");
  EXPECT_NE(DeviceText(description, {"a"}, {}).find("\nwarning: grade a: VCOCLK_FREQ_MIN, 6000"),
            std::string::npos);
  EXPECT_EQ(DeviceText(description, {"b"}, {}).find("warning"), std::string::npos);
}

TEST(FastestGrade, IsFasterThanEachOtherInSomethingAndSlowerInNothing) {
  Description description = Round();
  EXPECT_EQ(FastestGrade(description), "b");
  SetLimit(&description, "a", "CLKOUT_FREQ_MAX_GCLK", "401");
  EXPECT_EQ(FastestGrade(description), std::nullopt);  // each is faster in something
  description.grades.pop_back();
  EXPECT_EQ(FastestGrade(description), std::nullopt);  // there is nothing to be faster than
}

TEST(FastestGrade, ShorterPeriodsAreFaster) {
  Description description = Round();
  const char* const keyword = "D_KRU_CLK0_CLKIN_DIVIDE_BY_2_FALSE_CLK_FEEDBACK_1X_MINPERIOD";
  SetLimit(&description, "a", "VCOCLK_FREQ_MAX", "1000");
  SetLimit(&description, "a", "CLKPFD_FREQ_MAX", "500");
  EXPECT_EQ(FastestGrade(description), std::nullopt);
  SetLimit(&description, "a", keyword, "4");
  EXPECT_EQ(FastestGrade(description), std::nullopt);  // the other does not have it
  SetLimit(&description, "b", keyword, "5");
  EXPECT_EQ(FastestGrade(description), "a");
}

TEST(DevicesJson, WhatItSays) {
  const ordered_json data = ordered_json::parse(DeviceJson(Round(), {"b"}));
  EXPECT_EQ(data["format"], "vorkel-devices");
  const ordered_json& device = data["devices"][0];
  EXPECT_EQ(device["fastest_grade"], "b");
  ASSERT_EQ(device["grades"].size(), 1U);
  const ordered_json& grade = device["grades"][0];
  EXPECT_EQ(grade["primitives"][0], ordered_json::parse(R"({
    "primitive": "PLL",
    "vco": {"lowest": 400.0, "lowest_exact": "400", "highest": 1000.0, "highest_exact": "1000"},
    "pfd": {"lowest": 19.0, "lowest_exact": "19", "highest": 500.0, "highest_exact": "500"},
    "pfd_low": {"lowest": 19.0, "lowest_exact": "19", "highest": 300.0, "highest_exact": "300"},
    "output": {"lowest": 3.125, "lowest_exact": "25/8", "highest": 400.0, "highest_exact": "400"},
    "output_1": {"lowest": 3.125, "lowest_exact": "25/8", "highest": 1000.0,
                 "highest_exact": "1000"},
    "has_jitter": true})"));
  EXPECT_EQ(grade["limits"][0], ordered_json::parse(R"({"keyword": "VCOCLK_FREQ_MIN",
    "unit": "MHz", "value": 400.0, "value_exact": "400"})"));
}

TEST(DevicesJson, FitsItsSchema) {
  const Listed broken = {"broken", std::nullopt,
                         device::FileComplaint{"broken", "b.toml", 3, std::nullopt, "no number"}};
  Description doubtful = Round();
  doubtful.default_package.reset();
  SetLimit(&doubtful, "b", "VCOCLK_FREQ_MIN", "6000");
  const ordered_json data = ordered_json::parse(
      DevicesJson({{"round", Round(), std::nullopt}, broken, {"d", doubtful, std::nullopt}}));
  EXPECT_EQ(schema::FaultOf(data, schema::Load("devices.schema.json")), "");
  EXPECT_EQ(data["devices"][2]["grades"][1]["warnings"].size(), 1U);
}

}  // namespace
}  // namespace planner::report
