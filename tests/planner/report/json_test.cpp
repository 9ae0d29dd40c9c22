#include "planner/report/Json.h"

#include <gmock/gmock.h>

#include <nlohmann/json.hpp>

#include "made.h"
#include "planner/report/Data.h"
#include "schema.h"

namespace planner::report {
namespace {

using nlohmann::ordered_json;
using ::testing::ElementsAre;

ordered_json Document(const Request& request, const std::vector<Entry>& entries) {
  return ordered_json::parse(Json(request, MadeDevice(), entries));
}

ordered_json AnswerOf(const Request& request, const Answer& answer) {
  return Document(request, {{&answer, 1, true}})["answers"][0];
}

TEST(FindingData, EachKindHasItsName) {
  const std::pair<FindingKind, const char*> names[] = {
      {FindingKind::kOutsideLimit, "outside_limit"},
      {FindingKind::kDividerTooLarge, "divider_too_large"},
      {FindingKind::kOffTarget, "off_target"},
      {FindingKind::kSearchedVco, "searched_vco"},
      {FindingKind::kSearchedFrequencies, "searched_frequencies"},
      {FindingKind::kNothingMoves, "nothing_moves"},
      {FindingKind::kPreferMaxVcoUnused, "prefer_max_vco_unused"},
      {FindingKind::kWholeDividerUnused, "whole_divider_unused"},
      {FindingKind::kOutput0Phase, "output_0_phase"},
      {FindingKind::kBandwidthUnused, "bandwidth_unused"},
      {FindingKind::kInputJitterPasses, "input_jitter_passes"},
      {FindingKind::kNoJitter, "no_jitter"},
      {FindingKind::kNoPhaseError, "no_phase_error"},
      {FindingKind::kTooManyInputs, "too_many_inputs"},
      {FindingKind::kTooManyOutputs, "too_many_outputs"},
      {FindingKind::kUnsolved, "unsolved"},
      {FindingKind::kNoSettings, "no_settings"},
  };
  for (const auto& [kind, name] : names) {
    const Finding finding = {.kind = kind, .primitive = Primitive::kPll, .value = 1, .range = {0, 1}};
    EXPECT_EQ(FindingData(finding, MadeDevice())["kind"], name);
  }
}

TEST(FindingData, EachQuantityHasItsName) {
  const std::pair<Quantity, ordered_json> names[] = {
      {Quantity::kNone, nullptr},           {Quantity::kVco, "vco"},
      {Quantity::kPfd, "pfd"},              {Quantity::kFrequency, "frequency"},
      {Quantity::kPhase, "phase"},          {Quantity::kDuty, "duty"},
      {Quantity::kJitter, "jitter"},        {Quantity::kDivider, "divider"},
  };
  for (const auto& [quantity, name] : names) {
    const Finding finding = {.kind = FindingKind::kOffTarget, .quantity = quantity, .output = 0};
    EXPECT_EQ(FindingData(finding, MadeDevice())["quantity"], name);
  }
}

// 100 x 10 / 3 is 1000 / 3 MHz. That is 1 / 3 of 333 more than it, 1000000 / 999 ppm.
TEST(Json, AllOfAnAnswer) {
  const Request request = MadeRequest({100}, {333});
  Answer answer = MadeLoop(request, Primitive::kPll, Bandwidth::kLow, 80, 1, {24}, 90);
  answer.source = {.engine = true, .search = false, .variant = "largest VCO"};
  answer.searched_vco = 999.5;
  answer.outputs[0].searched = 333.25;
  answer.outputs[0].jitter_rms = 5;
  answer.vco_margin = Rational(2, 27);
  answer.pfd_margin = Rational(2, 3);
  answer.outputs[0].margin = Rational(1, 6);
  answer.margin = Rational(2, 27);
  Miss(&answer, 0, Quantity::kFrequency, answer.outputs[0].error_ppm, 100);
  const char* const expected = R"({
    "format": "vorkel-plan",
    "version": 4,
    "units": {
      "frequency": "MHz", "frequency_error": "ppm", "phase": "degrees", "duty": "percent",
      "jitter": "ps, peak to peak at a bit error rate of 1e-12",
      "jitter_rms": "ps, rms of the random part", "phase_error_of_primitive": "ps"
    },
    "request": {
      "device": "vk40b484-2", "inputs": [100], "outputs": [{"frequency": 333}],
      "input_jitter": 0, "input_tolerance": 0, "tolerance": 100, "phase_tolerance": 0.5, "duty_tolerance": 0.5,
      "feedback": false, "prefer_max_vco": false, "int_div0": false, "any_order": false,
      "engine": false, "rank": "jitter"
    },
    "answers": [{
      "number": 2, "tradeoff": false, "primitive": "PLL", "source": "engine",
      "variant": "largest VCO", "solved": true, "within": false, "reason": "", "refusals": [],
      "settings": {
        "vco": 1000.0, "vco_exact": "1000", "pfd": 100.0, "pfd_exact": "100",
        "m": 10, "m_eighths": 80, "d": 1
      },
      "bandwidth": "LOW",
      "limits": {
        "vco": {"lowest": 400.0, "lowest_exact": "400", "highest": 1080.0, "highest_exact": "1080"},
        "vco_margin": 0.07407407407407407, "vco_margin_exact": "2/27",
        "pfd": {"lowest": 19.0, "lowest_exact": "19", "highest": 300.0, "highest_exact": "300"},
        "pfd_margin": 0.6666666666666666, "pfd_margin_exact": "2/3",
        "largest_count": 64
      },
      "search_vco": 999.5,
      "input_jitter": 0.0, "input_jitter_exact": "0",
      "input_tolerance": 0.0, "input_tolerance_exact": "0",
      "phase_error": 77.037,
      "worst_ppm": 1001.001001001001, "worst_ppm_exact": "1000000/999",
      "max_jitter": 90.0,
      "ranking": {
        "class": "missed", "worst_error": 10.01001001001001, "worst_error_exact": "10000/999",
        "max_jitter": 90.0, "margin": 0.07407407407407407, "margin_exact": "2/27",
        "vco": 1000.0, "vco_exact": "1000"
      },
      "outputs": [{
        "index": 0, "used": true, "request": 0, "pin": null, "divider": 3, "divider_eighths": 24,
        "phase_step": 0, "high_time": 3, "multiply": 10, "divide": 3,
        "requested": 333.0, "requested_exact": "333",
        "actual": 333.3333333333333, "actual_exact": "1000/3",
        "actual_second": null, "actual_second_exact": null, "search": 333.25,
        "error_ppm": 1001.001001001001, "error_ppm_exact": "1000000/999",
        "requested_phase": null, "requested_phase_exact": null, "phase": 0.0, "phase_exact": "0",
        "phase_error": null, "phase_error_exact": null,
        "requested_duty": null, "requested_duty_exact": null, "duty": 50.0, "duty_exact": "50",
        "duty_error": null, "duty_error_exact": null, "jitter": 90.0, "jitter_rms": 5.0,
        "range": {"lowest": 3.0, "lowest_exact": "3", "highest": 400.0, "highest_exact": "400"},
        "margin": 0.16666666666666666, "margin_exact": "1/6",
        "within": false
      }],
      "misses": ["output 0: the frequency is off by 1001.00 ppm, with 100 allowed"],
      "violations": [],
      "notes": [],
      "findings": [{
        "kind": "off_target", "primitive": "PLL", "quantity": "frequency", "output": 0, "input": 0,
        "corner": 0.0, "corner_exact": "0",
        "value": 1001.001001001001, "value_exact": "1000000/999",
        "range": {"lowest": 0.0, "lowest_exact": "0", "highest": 100.0, "highest_exact": "100"},
        "pin": null, "feedback_2x": false, "outputs": [], "numbers": [], "words": "",
        "text": "output 0: the frequency is off by 1001.00 ppm, with 100 allowed"
      }]
    }],
    "tradeoffs_cut": []
  })";
  const ordered_json made = Document(request, {{&answer, 2, false}});
  // Entries in another order would differ as ordered objects.
  EXPECT_EQ(made, ordered_json::parse(expected)) << made.dump(2);
}

TEST(Json, RequestsAreWrittenAsTheyCanBeReadBack) {
  Request request = MadeRequest({Rational(100, 3), 27}, {Rational(297, 2), Rational(1, 3), 5});
  request.outputs[1].phase = -90;
  request.outputs[1].duty = Rational(100, 3);
  request.outputs[1].tolerance = 0;
  request.outputs[1].phase_tolerance = Rational(1, 4);
  request.outputs[1].duty_tolerance = 2;
  request.outputs[1].max_jitter = 150;
  request.outputs[2].used = false;
  request.input_jitter = Rational(505, 10);
  request.input_tolerance = Rational(45, 2);
  request.max_jitter = 200;
  request.primitive = Primitive::kTsyn;
  request.bandwidth = Bandwidth::kHigh;
  request.any_order = request.whole_divider_0 = true;
  request.rank = Rank::kMargin;
  EXPECT_EQ(RequestData(request, MadeDevice()), ordered_json::parse(R"({
    "device": "vk40b484-2", "primitive": "TSYN", "inputs": ["100/3", 27],
    "outputs": [{"frequency": 148.5},
                {"frequency": "1/3", "phase": -90, "duty": "100/3", "tolerance": 0,
                 "phase_tolerance": 0.25, "duty_tolerance": 2, "max_jitter": 150},
                "-"],
    "input_jitter": 50.5, "input_tolerance": 22.5, "tolerance": 100, "phase_tolerance": 0.5, "duty_tolerance": 0.5,
    "max_jitter": 200, "bandwidth": "HIGH", "feedback": false, "prefer_max_vco": false,
    "int_div0": true, "any_order": true, "engine": false, "rank": "margin"})"));
}

TEST(Json, NumbersThatNoDoubleIsAreTexts) {
  EXPECT_EQ(WrittenNumber(Rational::FromDecimal("33333333333333333333", -18)),
            ordered_json("33.333333333333333333"));
  EXPECT_EQ(WrittenNumber(Rational::FromDecimal("1", 20)), ordered_json("100000000000000000000"));
  EXPECT_EQ(WrittenNumber(Rational::FromDecimal("1", -7)), ordered_json("0.0000001"));
  EXPECT_EQ(WrittenNumber(Rational(148500001, 1000000)), ordered_json(148.500001));
  EXPECT_EQ(WrittenNumber(0), ordered_json(0));
}

TEST(Json, SettingsOfAKru) {
  const Request request = MadeRequest({100}, {260, 130, 40});
  KruSettings settings;
  settings.feedback = true;
  settings.divide_by_2 = true;
  settings.m = 3;
  settings.d = 2;
  settings.divide_halves = 5;
  settings.phase_shift = 51;
  settings.pins = {Pin::kClk2x, Pin::kClkfx, Pin::kClkdv};
  const Answer answer = MadeKru(request, settings, {1, Rational(3, 4), Rational(1, 5)}, 180);
  const ordered_json data = AnswerOf(request, answer);
  EXPECT_EQ(data["settings"], ordered_json::parse(R"({"feedback": true, "clkin_divide_by_2": true,
    "m": 3, "d": 2, "clkdv": 2.5, "divide_halves": 5, "phase_offset": 72.0, "phase_shift": 51})"));
  EXPECT_TRUE(data["bandwidth"].is_null());
  EXPECT_TRUE(data["limits"].is_null());
  const ordered_json& output = data["outputs"][1];
  EXPECT_EQ(output["pin"], "CLKFX");
  EXPECT_TRUE(output["divider"].is_null());
  EXPECT_EQ(output["multiply"], 3);
  EXPECT_EQ(output["divide"], 4);
  // Output 0 is on CLK2X.
  EXPECT_EQ(output["range"]["highest"], 200.0);
}

TEST(Json, SettingsThatNoPinUsesAreLeftOut) {
  const Request request = MadeRequest({100}, {100});
  const Answer answer = MadeKru(request, {.feedback = true, .pins = {Pin::kClk0}}, {1}, 180);
  EXPECT_EQ(AnswerOf(request, answer)["settings"],
            ordered_json::parse(R"({"feedback": true, "clkin_divide_by_2": false,
                                    "phase_offset": 0.0, "phase_shift": 0})"));
}

TEST(Json, TwoInputs) {
  const Request request = MadeRequest({25, Rational(100, 3)}, {250});
  const Answer answer = MadeLoop(request, Primitive::kTsyn, Bandwidth::kHigh, 251, 1, {25}, 90);
  const ordered_json data = AnswerOf(request, answer);
  EXPECT_EQ(data["settings"]["m"], 31.375);
  EXPECT_EQ(data["settings"]["m_eighths"], 251);
  // 100 / 3 x 251 / 8.
  EXPECT_EQ(data["settings"]["vco_second_exact"], "6275/6");
  EXPECT_EQ(data["settings"]["pfd_second_exact"], "100/3");
  EXPECT_EQ(data["outputs"][0]["divider"], 3.125);
  EXPECT_EQ(data["outputs"][0]["actual_second_exact"], "1004/3");
}

TEST(Json, OutputsThatAreNotUsedAndOutputsThatHaveMoved) {
  Request request = MadeRequest({100}, {100, 50, 500});
  request.outputs[1].used = false;
  Request placed = request;
  std::swap(placed.outputs[0], placed.outputs[2]);
  Answer answer = MadeLoop(placed, Primitive::kPll, Bandwidth::kHigh, 80, 1, {16, 16, 80}, 90);
  answer.outputs[1] = {};
  answer.outputs[1].used = false;
  answer.notes.push_back({.kind = FindingKind::kMoved, .outputs = {2, 1, 0}});
  const ordered_json data = AnswerOf(request, answer);
  EXPECT_EQ(data["outputs"][0]["request"], 2);
  EXPECT_EQ(data["outputs"][0]["requested"], 500.0);
  EXPECT_EQ(data["outputs"][1], ordered_json::parse(R"({"index": 1, "used": false})"));
  EXPECT_EQ(data["findings"][0]["kind"], "moved");
  EXPECT_EQ(data["findings"][0]["outputs"], ordered_json::parse("[2, 1, 0]"));
}

TEST(Json, AnUnsolvedAnswerHasItsReason) {
  const Answer answer = Refused(Primitive::kKruSp, "Cannot.");
  const ordered_json data = Document(VideoRequest(), {{&answer}})["answers"][0];
  EXPECT_TRUE(data["number"].is_null());
  EXPECT_EQ(data["solved"], false);
  EXPECT_EQ(data["reason"], "Cannot.");
  EXPECT_EQ(data["refusals"][0]["kind"], "unsolved");
  EXPECT_FALSE(data.contains("outputs"));
}

TEST(Json, WhatIsNoUtf8IsReplaced) {
  const Answer answer = Refused(Primitive::kPll, "a \" \\ \n \xff");
  const ordered_json data = Document(VideoRequest(), {{&answer}})["answers"][0];
  EXPECT_EQ(data["reason"], "a \" \\ \n \xEF\xBF\xBD");
}

// All kinds of documents.
TEST(Json, FitsItsSchema) {
  const ordered_json schema = schema::Load("planner.schema.json");
  const Answer refused = Refused(Primitive::kKruSp, "Cannot.");
  Request shaped = MadeRequest({100, 50}, {200, 100});
  shaped.outputs[0].phase = 10;
  shaped.outputs[1].duty = 30;
  shaped.bandwidth = Bandwidth::kLow;
  shaped.primitive = Primitive::kPll;
  Answer loop = MadeLoop(shaped, Primitive::kPll, Bandwidth::kLow, 80, 1, {40, 80}, 90);
  loop.outputs[0].phase_error = -10;
  loop.outputs[1].duty_error = 20;
  Miss(&loop, 0, Quantity::kPhase, -10, 1);
  Break(&loop, Outside(Quantity::kVco, -1, 1, 1400, {400, 1080}));
  loop.notes.push_back({.kind = FindingKind::kSearchedFrequencies, .numbers = {1, 2}});
  EXPECT_EQ(schema::FaultOf(Document(shaped, {{&loop, 1, true}, {&refused}}), schema), "");

  Request spare = MadeRequest({100}, {160, 40});
  spare.outputs[1].used = false;
  spare.outputs[0].max_jitter = 90;
  const Answer unknown =
      MadeLoop(spare, Primitive::kTsyn, Bandwidth::kHigh, 80, 1, {50}, std::nullopt);
  EXPECT_EQ(schema::FaultOf(Document(spare, {{&unknown, 3}}), schema), "");

  const Request request = MadeRequest({Rational(100, 3)}, {100});
  const Answer sp = MadeKru(request, {.m = 3, .d = 1, .pins = {Pin::kClkfx}}, {3}, 180);
  KruSettings settings;
  settings.primitive = Primitive::kKruClkgen;
  settings.m = 3;
  settings.d = 1;
  settings.pins = {Pin::kClkfx};
  const Answer clkgen = MadeKru(request, settings, {3}, 180);
  EXPECT_EQ(schema::FaultOf(Document(request, {{&sp, 1}, {&clkgen, 2}}), schema), "");
}

TEST(Json, TheSchemaSeesWhatDoesNotFit) {
  const ordered_json schema = schema::Load("planner.schema.json");
  const Request request = VideoRequest();
  const Answer answer = VideoAnswer(request);
  const ordered_json good = Document(request, {{&answer, 1, true}});
  const auto fault = [&](const char* path, const ordered_json& value) {
    ordered_json changed = good;
    changed[ordered_json::json_pointer(path)] = value;
    return schema::FaultOf(changed, schema);
  };
  EXPECT_EQ(schema::FaultOf(good, schema), "");
  EXPECT_EQ(fault("/version", 2), ".version is 2");
  EXPECT_NE(fault("/answers/0/outputs/0/jitter", "1"), "");
  EXPECT_NE(fault("/answers/0/outputs/0/multiply", 5.5), "");
  EXPECT_NE(fault("/answers/0/primitive", "XYZ"), "");
  EXPECT_NE(fault("/answers/0/extra", 1), "");
  EXPECT_NE(fault("/answers/0/settings/clkdv", 1), "");
  EXPECT_NE(fault("/request/outputs/0", "none"), "");
}

TEST(Tcl, HasTheSame) {
  const Request request = VideoRequest();
  const Answer answer = VideoAnswer(request);
  const std::string text = Tcl(request, MadeDevice(), {{&answer, 1, true}});
  EXPECT_EQ(text.substr(0, 32), "format vorkel-plan\nversion 4\nuni");
  EXPECT_NE(text.find("\nanswers {\n  {\n    number 1\n    tradeoff true\n    primitive TSYN\n"),
            std::string::npos);
  EXPECT_NE(text.find("\n      {\n        index 0\n        used true\n"), std::string::npos);
  EXPECT_NE(text.find("\n        requested_phase {}\n"), std::string::npos);
  EXPECT_NE(text.find("\n        requested_exact 297/2\n"), std::string::npos);
}

plan::Plan MadePlan() {
  plan::Plan plan;
  plan.request = VideoRequest();
  Answer tsyn = VideoAnswer(plan.request);
  Answer pll =
      MadeLoop(plan.request, Primitive::kPll, Bandwidth::kHigh, 264, 1, {48, 96, 264}, 144.594);
  Answer low = pll;
  low.source = {.engine = true, .search = false};
  std::get<LoopSettings>(low.settings).bandwidth = Bandwidth::kLow;
  Answer other = pll;
  std::get<LoopSettings>(other.settings).d = 2;
  plan.ranked = {tsyn, low, pll};
  plan.front = {other, tsyn};
  plan.front[0].worst_ppm = 7;
  plan.refused = {Refused(Primitive::kKruSp, "Cannot.")};
  plan.among_primitives = {{0, 1, answer::Criterion::kJitter}};
  return plan;
}

// The number of each entry, and whether it is a trade-off.
std::vector<std::string> Shown(const std::vector<Entry>& entries) {
  std::vector<std::string> shown;
  for (const Entry& entry : entries) {
    shown.push_back(std::string(Name(entry.answer->primitive)) + " " +
                    std::to_string(entry.number) + (entry.is_tradeoff ? " trade-off" : ""));
  }
  return shown;
}

TEST(Entries, OfEachCommand) {
  const plan::Plan plan = MadePlan();
  EXPECT_THAT(Shown(PlanEntries(plan, 1)), ElementsAre("TSYN 1 trade-off"));
  EXPECT_THAT(Shown(PlanEntries(plan, 3)), ElementsAre("PLL 3"));
  EXPECT_THAT(Shown(CompareEntries(plan)),
              ElementsAre("TSYN 1 trade-off", "PLL 2", "PLL 3", "KRU_SP 0"));
  // The PLL at place 2 is the best of its primitive, and the engine's best.
  EXPECT_THAT(Shown(BestEntries(plan, 1, 6)),
              ElementsAre("TSYN 1 trade-off", "PLL 2", "PLL 0 trade-off"));
  EXPECT_THAT(Shown(BestEntries(plan, 3, 0)), ElementsAre("PLL 3", "TSYN 1 trade-off", "PLL 2"));
}

}  // namespace
}  // namespace planner::report
