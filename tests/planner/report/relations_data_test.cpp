#include <gtest/gtest.h>

#include <nlohmann/json.hpp>

#include "made.h"
#include "planner/report/Relations.h"
#include "schema.h"

namespace planner::report {
namespace {

using nlohmann::ordered_json;

// 100 MHz times 8; by 8, and by 9 at 90 degrees: 11.25 ns and 2.8125 of them.
Answer MadeAnswer(const Request& request) {
  Answer answer = MadeLoop(request, Primitive::kPll, Bandwidth::kHigh, 64, 1, {64, 72}, 100);
  answer.outputs[1].phase = 90;
  return answer;
}

ordered_json Made(const Request& request, const Answer& answer, const relations::Rule& rule = {}) {
  return ordered_json::parse(RelationsJson(request, MadeDevice(), answer, rule));
}

ordered_json Between(const ordered_json& data, const std::string& from, const std::string& to) {
  for (const ordered_json& one : data["relations"]) {
    if (one["from"] == from && one["to"] == to) return one;
  }
  return nullptr;
}

TEST(RelationsJson, FitsItsSchema) {
  const ordered_json schema = schema::Load("relations.schema.json");
  Request request = MadeRequest({100}, {100, Rational(800, 9)});
  EXPECT_EQ(schema::FaultOf(Made(request, MadeAnswer(request)), schema), "");
  EXPECT_EQ(schema::FaultOf(Made(request, MadeAnswer(request), {Rational(1, 3), {}}), schema), "");
  request.inputs.push_back(80);
  EXPECT_EQ(schema::FaultOf(Made(request, MadeAnswer(request)), schema), "");
  ordered_json wrong = Made(request, MadeAnswer(request));
  wrong["relations"][0]["crossing"] = "none";
  EXPECT_NE(schema::FaultOf(wrong, schema), "");
}

TEST(RelationsJson, AllOfAClockAndARelation) {
  const Request request = MadeRequest({100}, {100, Rational(800, 9)});
  const ordered_json data = Made(request, MadeAnswer(request));
  EXPECT_EQ(data["format"], "vorkel-relations");
  EXPECT_EQ(data["version"], 1);
  EXPECT_EQ(data["answer"]["primitive"], "PLL");
  EXPECT_EQ(data["rule"], ordered_json::parse(R"({"gap": null, "gap_exact": null, "share": 0.25,
                                                  "share_exact": "1/4"})"));
  ASSERT_EQ(data["clocks"].size(), 3);
  EXPECT_EQ(data["clocks"][2], ordered_json::parse(R"({
      "name": "clk_out1", "input": 0, "outputs": [1],
      "frequency": 88.88888888888889, "frequency_exact": "800/9",
      "period": 11.25, "period_exact": "45/4", "rise": 2.8125, "rise_exact": "45/16",
      "fall": 8.4375, "fall_exact": "135/16", "jitter": 100.0})"));
  EXPECT_EQ(data["clocks"][0]["outputs"], ordered_json::array());
  ASSERT_EQ(data["relations"].size(), 6);
  // The common step is 1.25 ns. The rise is 2.5 + 0.3125 ns later; the falls are at 5 ns, four
  // steps, and at 8.4375, six steps and 0.9375.
  EXPECT_EQ(Between(data, "clk_out0", "clk_out1"), ordered_json::parse(R"({
      "from": "clk_out0", "to": "clk_out1", "synchronous": true, "crossing": "fifo", "fifo": true,
      "ratio": 0.8888888888888888, "ratio_exact": "8/9",
      "hyperperiod": 90.0, "hyperperiod_exact": "90", "launches": 9, "captures": 8, "cycles": null,
      "phase": 90.0, "phase_exact": "90", "gap": 0.3125, "gap_exact": "5/16",
      "gap_rise_fall": 0.9375, "gap_rise_fall_exact": "15/16",
      "gap_fall_rise": 0.3125, "gap_fall_rise_exact": "5/16",
      "gap_fall_fall": 0.9375, "gap_fall_fall_exact": "15/16",
      "hold": 0.9375, "hold_exact": "15/16", "limit": 2.5, "limit_exact": "5/2"})"));
  const ordered_json same = Between(data, "clk_in1", "clk_out0");
  EXPECT_EQ(same["crossing"], "single_cycle");
  EXPECT_EQ(same["cycles"], 1);
  EXPECT_EQ(same["fifo"], false);
}

TEST(RelationsJson, WhatIsNotRelatedHasNoFigures) {
  const Request request = MadeRequest({100, 80}, {100, Rational(800, 9)});
  const ordered_json data = Made(request, MadeAnswer(request));
  EXPECT_EQ(data["clocks"][4]["name"], "clk_out0_in2");
  EXPECT_EQ(data["clocks"][4]["jitter"], nullptr);
  const ordered_json one = Between(data, "clk_in2", "clk_out0_in1");
  EXPECT_EQ(one["synchronous"], false);
  EXPECT_EQ(one["crossing"], "unrelated");
  EXPECT_EQ(one["fifo"], true);
  EXPECT_EQ(one["gap"], nullptr);
  EXPECT_EQ(one["launches"], nullptr);
  EXPECT_EQ(Between(data, "clk_out0_in1", "clk_out1_in2"), nullptr);
}

// 1 of 10 ns later is less than a quarter of the period, and 9 of 10 the other way is not; 200 MHz
// are twice 100.
TEST(RelationsJson, CrossingsHaveNames) {
  const Request request = MadeRequest({100}, {100, 200});
  Answer answer = MadeLoop(request, Primitive::kPll, Bandwidth::kHigh, 64, 1, {64, 32}, 100);
  answer.outputs[0].phase = 36;
  const ordered_json data = Made(request, answer);
  EXPECT_EQ(Between(data, "clk_in1", "clk_out0")["crossing"], "relaxed");
  EXPECT_EQ(Between(data, "clk_out0", "clk_in1")["crossing"], "phase");
  EXPECT_EQ(Between(data, "clk_in1", "clk_out1")["crossing"], "multicycle");
  const std::string text = RelationsText(request, MadeDevice(), answer, {}, {});
  EXPECT_NE(text.find("\nmulticycle: one is a whole multiple of the other"), std::string::npos);
}

TEST(RelationsJson, WholeNumbersThatAreTooLongAreTexts) {
  const Request request = MadeRequest({100}, {100, Rational(800, 9)});
  Answer answer = MadeAnswer(request);
  constexpr std::int64_t kMany = 1'000'000'000'000'000'000;
  answer.outputs[0].ratio = Rational(1, kMany);
  answer.outputs[1].ratio = 3 * kMany;
  const ordered_json one = Between(Made(request, answer), "clk_out1", "clk_out0");
  EXPECT_EQ(one["launches"], "3" + std::string(36, '0'));
  EXPECT_EQ(one["captures"], 1);
}

TEST(RelationsTcl, HasTheSame) {
  const Request request = MadeRequest({100}, {100, Rational(800, 9)});
  const std::string text = RelationsTcl(request, MadeDevice(), MadeAnswer(request), {});
  EXPECT_EQ(text.rfind("format vorkel-relations\nversion 1\n", 0), 0U);
  EXPECT_NE(text.find("gap_exact 5/16"), std::string::npos);
}

}  // namespace
}  // namespace planner::report
