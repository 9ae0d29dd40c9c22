#include "planner/read/Settings.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "hardware/Primitive.h"

namespace planner::read {
namespace {

// A device with a PLL and a TSYN whose counters go to 64, and both KRUs; no other limit counts here.
Device MadeDevice() {
  Device device;
  device.name = "made";
  device.primitives.assign(hardware::kPrimitives.begin(), hardware::kPrimitives.end());
  device.pll.emplace();
  device.pll->max_count = 64;
  device.tsyn = device.pll;
  device.kru_sp.emplace();
  device.kru_clkgen.emplace();
  return device;
}

std::optional<Evaluation> Finished(const std::vector<Option>& options, Mistakes* mistakes,
                                   const PlanFile& file = {}) {
  std::vector<Option> of_request;
  for (const Option& option : options) {
    if (FindOption(option.name) != nullptr) of_request.push_back(option);
  }
  const Draft draft = Over(ReadOptions(of_request, mistakes), file.request);
  const SettingsDraft settings = Over(ReadSettingOptions(options, mistakes), file.settings);
  if (!mistakes->empty()) return std::nullopt;
  return FinishEvaluation(draft, settings, MadeDevice(), mistakes);
}

LoopSettings LoopOf(const std::vector<Option>& options) {
  Mistakes mistakes;
  const auto evaluation = Finished(options, &mistakes);
  EXPECT_TRUE(mistakes.empty());
  return evaluation ? std::get<LoopSettings>(evaluation->settings) : LoopSettings{};
}

TEST(Settings, NumbersAsTheyAreWrittenBecomeWholeOnes) {
  const LoopSettings set = LoopOf({{"--in", "27"},
                                   {"--m", "333/8"},
                                   {"--d", "3"},
                                   {"--divide", "8.125,-,16"},
                                   {"--low-bandwidth", ""}});
  EXPECT_EQ(set.primitive, Primitive::kTsyn);
  EXPECT_EQ(set.bandwidth, Bandwidth::kLow);
  EXPECT_EQ(set.m, 333);
  EXPECT_EQ(set.d, 3);
  EXPECT_EQ(set.outputs, (std::vector<LoopOutput>{{65, 0, 0}, {}, {128, 0, 0}}));
}

// A step behind a divider of 9 is 5 degrees, half a VCO period 100 / 18 percent.
TEST(Settings, DegreesAndPercentBecomeSteps) {
  const LoopSettings set = LoopOf({{"--in", "100"},
                                   {"--m", "9"},
                                   {"--d", "1"},
                                   {"--divide", "9,9"},
                                   {"--set-phase", "-15,360"},
                                   {"--set-duty", "100/3,50"}});
  EXPECT_EQ(set.outputs, (std::vector<LoopOutput>{{72, -3, 6}, {72, 72, 9}}));
}

TEST(Settings, FrequenciesThatNobodyAskedForAreThoseThatComeOut) {
  Mistakes mistakes;
  const auto made = Finished({{"--in", "100,50"},
                              {"--m", "9"},
                              {"--d", "2"},
                              {"--divide", "3,-,5"},
                              {"--out", "150,-,-"},
                              {"--rank", "error"}},
                             &mistakes);
  ASSERT_TRUE(made);
  const Request& request = made->reading.request;
  ASSERT_EQ(request.outputs.size(), 3U);
  EXPECT_TRUE(request.outputs[0].asked);
  EXPECT_EQ(request.outputs[0].frequency, 150);
  EXPECT_FALSE(request.outputs[1].used);
  EXPECT_TRUE(request.outputs[2].used);
  EXPECT_FALSE(request.outputs[2].asked);
  EXPECT_EQ(request.outputs[2].frequency, 90);  // 100 x 9 / 2 / 5
  EXPECT_EQ(request.primitive, Primitive::kTsyn);
  EXPECT_EQ(request.rank, Rank::kJitter);
}

TEST(Settings, ThePrimitiveFollowsFromThePins) {
  Mistakes mistakes;
  const auto of = [&](const std::string& pins) {
    const SettingsDraft draft =
        ReadSettingOptions(std::vector<Option>{{"--pins", pins}}, &mistakes);
    return PrimitiveOf({}, draft, MadeDevice());
  };
  EXPECT_EQ(of("clk0, CLKFX"), Primitive::kKruSp);
  EXPECT_EQ(of("CLKFX,-,clkfxdv"), Primitive::kKruClkgen);
  Device device = MadeDevice();
  EXPECT_EQ(PrimitiveOf({}, {}, device), Primitive::kTsyn);
  device.primitives = {Primitive::kPll};
  EXPECT_EQ(PrimitiveOf({}, {}, device), Primitive::kPll);
}

TEST(Settings, WhatNoPinUsesIsNotSet) {
  Mistakes mistakes;
  const auto made = Finished({{"--in", "100"},
                              {"--pins", "CLK0,-,CLK2X"},
                              {"--m", "3"},
                              {"--d", "2"},
                              {"--divide", "7"},
                              {"--feedback", ""},
                              {"--phase-shift", "255"}},
                             &mistakes);
  ASSERT_TRUE(made);
  const auto& set = std::get<KruSettings>(made->settings);
  EXPECT_EQ(set.m, 0);
  EXPECT_EQ(set.divide_halves, 0);
  EXPECT_EQ(set.phase_shift, 255);
  EXPECT_EQ(set.pins, (std::vector<hardware::Pin>{hardware::Pin::kClk0, hardware::Pin::kNone,
                                                  hardware::Pin::kClk2x}));
}

// Behind a divider of 80, whose low time is at most 64 periods, it is high for 16 periods at least.
TEST(Settings, HighTimesAreThoseOfTheCounters) {
  const std::vector<Option> options = {
      {"--in", "100"}, {"--m", "9"}, {"--d", "1"}, {"--divide", "80"}, {"--high-times", "31"}};
  Mistakes mistakes;
  EXPECT_FALSE(Finished(options, &mistakes));
  ASSERT_EQ(mistakes.size(), 1U);
  EXPECT_EQ(mistakes[0].kind, MistakeKind::kNoSetting);
  EXPECT_EQ(mistakes[0].hint, "behind a divider of 80 it is 32 to 129 halves of a VCO period");
}

constexpr const char* kPlan = R"({
  "request": {"device": "made", "inputs": [100], "outputs": [450, {"frequency": 90, "phase": 45}],
              "tolerance": 7, "rank": "margin", "any_order": true, "primitive": "TSYN"},
  "answers": [
    {"number": 1, "primitive": "TSYN", "bandwidth": "HIGH", "solved": true,
     "settings": {"vco": 1, "m": 9, "m_eighths": 72, "d": 2},
     "outputs": [{"used": true, "request": 1, "divider": 5, "phase_step": 5, "high_time": 4},
                 {"used": true, "request": 0, "divider_eighths": 8, "phase_step": 0}]},
    {"number": 2, "primitive": "KRU_SP", "bandwidth": null, "solved": true,
     "settings": {"feedback": true, "clkin_divide_by_2": true, "clkdv": 2.5, "phase_shift": 17},
     "outputs": [{"used": true, "request": 0, "pin": "CLKDV"},
                 {"used": true, "request": 1, "pin": "CLK0"}]}]
})";

TEST(PlanFile, SettingsAndRequestCountAndFiguresDoNot) {
  Mistakes mistakes;
  const auto made = Finished({}, &mistakes, ReadPlan(kPlan, "plan.json", std::nullopt, &mistakes));
  ASSERT_TRUE(made);
  const auto& set = std::get<LoopSettings>(made->settings);
  EXPECT_EQ(set.m, 72);
  EXPECT_EQ(set.d, 2);
  EXPECT_EQ(set.bandwidth, Bandwidth::kHigh);
  EXPECT_EQ(set.outputs, (std::vector<LoopOutput>{{40, 5, 4}, {8, 0, 0}}));
  // The outputs stand where the answer has them.
  const Request& request = made->reading.request;
  EXPECT_EQ(request.outputs[0].frequency, 90);
  EXPECT_EQ(request.outputs[0].phase, Rational(45));
  EXPECT_EQ(request.outputs[1].frequency, 450);
  EXPECT_EQ(request.tolerance, 7);
  EXPECT_EQ(request.rank, Rank::kJitter);
  EXPECT_FALSE(request.any_order);
}

TEST(PlanFile, AnAnswerByItsNumber) {
  Mistakes mistakes;
  const auto made = Finished({}, &mistakes, ReadPlan(kPlan, "plan.json", 2, &mistakes));
  ASSERT_TRUE(made);
  const auto& set = std::get<KruSettings>(made->settings);
  EXPECT_TRUE(set.feedback);
  EXPECT_TRUE(set.divide_by_2);
  EXPECT_EQ(set.divide_halves, 5);
  EXPECT_EQ(set.phase_shift, 17);
  EXPECT_EQ(set.pins, (std::vector<hardware::Pin>{hardware::Pin::kClkdv, hardware::Pin::kClk0}));
  ReadPlan(kPlan, "plan.json", 3, &mistakes);
  ASSERT_EQ(mistakes.size(), 1U);
  EXPECT_EQ(mistakes[0].kind, MistakeKind::kNoAnswer);
}

TEST(PlanFile, OptionsReplaceWhatItSays) {
  Mistakes mistakes;
  const auto made = Finished({{"--m", "10"}, {"--set-phase", "-,90"}, {"--bandwidth", "LOW"}},
                             &mistakes, ReadPlan(kPlan, "plan.json", 1, &mistakes));
  ASSERT_TRUE(made);
  const auto& set = std::get<LoopSettings>(made->settings);
  EXPECT_EQ(set.m, 80);
  EXPECT_EQ(set.bandwidth, Bandwidth::kLow);
  // The phases of the plan are gone with those of the options: 90 degrees of a divider of 1 are 2.
  EXPECT_EQ(set.outputs, (std::vector<LoopOutput>{{40, 0, 4}, {8, 2, 0}}));
}

}  // namespace
}  // namespace planner::read
