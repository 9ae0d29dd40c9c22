// Whole plans: one written by hand, those that the planner makes, and texts that are no plan.
#include "planner/verify/Verify.h"

#include <gtest/gtest.h>

#include <string>
#include <utility>
#include <vector>

#include "planner/answer/Evaluate.h"
#include "planner/engine/Ask.h"
#include "verify_support.h"

namespace planner::verify_test {

namespace {

using std::string;
using verify::Discrepancy;
using verify::DiscrepancyKind;

// 100 MHz through kOnePll: a PFD of 100 and a VCO of 800 MHz leave D = 1 and M = 8, and 200 MHz
// take a divider of 4. Three bandwidths are alike, and the default comes first. VCO and PFD are at
// their limits: a margin of 0. The device has no coefficients, so there are two notes.
string ByHand() {
  return R"({
  "format": "vorkel-plan",
  "version": 4,
  "units": {
    "frequency": "MHz", "frequency_error": "ppm", "phase": "degrees", "duty": "percent",
    "jitter": "ps, peak to peak at a bit error rate of 1e-12",
    "jitter_rms": "ps, rms of the random part", "phase_error_of_primitive": "ps"
  },
  "request": {"device": "small-1", "inputs": [100], "outputs": [{"frequency": 200, "phase": 90}]},
  "answers": [{
    "number": 1, "tradeoff": true, "primitive": "PLL", "source": "both", "variant": "smallest VCO",
    "solved": true, "within": true, "reason": "", "refusals": [],
    "settings": {"vco": 800, "vco_exact": "800", "pfd": 100, "pfd_exact": "100",
                 "m": 8, "m_eighths": 64, "d": 1},
    "bandwidth": "OPTIMIZED",
    "limits": {
      "vco": {"lowest": 800, "lowest_exact": "800", "highest": 800, "highest_exact": "800"},
      "pfd": {"lowest": 100, "lowest_exact": "100", "highest": 100, "highest_exact": "100"},
      "vco_margin": 0, "vco_margin_exact": "0", "pfd_margin": 0, "pfd_margin_exact": "0",
      "largest_count": 64},
    "search_vco": 800, "input_jitter": 0, "input_jitter_exact": "0", "input_tolerance": 0,
    "input_tolerance_exact": "0", "phase_error": null,
    "worst_ppm": 0, "worst_ppm_exact": "0", "max_jitter": null,
    "ranking": {"class": "met", "worst_error": 0, "worst_error_exact": "0", "max_jitter": null,
                "margin": 0, "margin_exact": "0", "vco": 800, "vco_exact": "800"},
    "outputs": [{
      "index": 0, "used": true, "request": 0, "pin": null,
      "divider": 4, "divider_eighths": 32, "phase_step": 8, "high_time": 0,
      "multiply": 2, "divide": 1, "requested": 200, "requested_exact": "200",
      "actual": 200, "actual_exact": "200", "actual_second": null, "actual_second_exact": null,
      "search": 200, "error_ppm": 0, "error_ppm_exact": "0",
      "requested_phase": 90, "requested_phase_exact": "90", "phase": 90, "phase_exact": "90",
      "phase_error": 0, "phase_error_exact": "0",
      "requested_duty": null, "requested_duty_exact": null, "duty": 50, "duty_exact": "50",
      "duty_error": null, "duty_error_exact": null, "jitter": null, "jitter_rms": null,
      "range": {"lowest": 10, "lowest_exact": "10", "highest": 400, "highest_exact": "400"},
      "margin": 0.5, "margin_exact": "1/2", "within": true}],
    "misses": [], "violations": [], "notes": ["jitter", "phase error"],
    "findings": [
      {"kind": "no_jitter", "primitive": "PLL", "quantity": "jitter", "output": null, "input": 0,
       "corner": 0, "corner_exact": "0", "value": 0, "value_exact": "0",
       "range": {"lowest": 0, "lowest_exact": "0", "highest": 0, "highest_exact": "0"},
       "pin": null, "feedback_2x": false, "outputs": [], "numbers": [], "words": "",
       "text": "jitter"},
      {"kind": "no_phase_error", "primitive": "PLL", "quantity": "phase", "output": null,
       "input": 0, "corner": 0, "corner_exact": "0", "value": 0, "value_exact": "0",
       "range": {"lowest": 0, "lowest_exact": "0", "highest": 0, "highest_exact": "0"},
       "pin": null, "feedback_2x": false, "outputs": [], "numbers": [], "words": "",
       "text": "phase error"}]
  }],
  "tradeoffs_cut": []
})";
}

string With(string text, const string& old, const string& other) {
  const std::size_t place = text.find(old);
  EXPECT_NE(place, string::npos) << old;
  return text.replace(place, old.size(), other);
}

std::vector<Discrepancy> Wrong(const string& json) {
  return verify::Verify(json, DeviceOf(kOnePll));
}

TEST(Verify, APlanByHandIsRight) {
  EXPECT_EQ(Text(Wrong(ByHand())), Text({}));
  EXPECT_EQ(verify::PartOf(ByHand()), "small-1");
}

TEST(Verify, AWrongNumberHasItsPathAndPlace) {
  const auto wrong = Wrong(With(ByHand(), R"("worst_ppm": 0)", R"("worst_ppm": 1e-9)"));
  ASSERT_EQ(wrong.size(), 1u);
  EXPECT_EQ(wrong[0].kind, DiscrepancyKind::kDiffers);
  EXPECT_EQ(wrong[0].path, "answers[0].worst_ppm");
  EXPECT_EQ(wrong[0].found, "1e-9");
  EXPECT_EQ(wrong[0].expected, "0.0");
  EXPECT_EQ(wrong[0].line, 23);
  EXPECT_EQ(wrong[0].column, 18);
}

TEST(Verify, ASettingThatAllElseContradictsIsNamedAlone) {
  const auto wrong = Wrong(With(ByHand(), R"("phase_step": 8)", R"("phase_step": 7)"));
  ASSERT_EQ(wrong.size(), 1u);
  EXPECT_EQ(wrong[0].kind, DiscrepancyKind::kContradicts);
  EXPECT_EQ(wrong[0].path, "answers[0].outputs[0].phase_step");
  EXPECT_EQ(wrong[0].expected, "8");
}

TEST(Verify, SettingsThatThereAreNot) {
  const auto wrong = Wrong(With(ByHand(), R"("d": 1})", R"("d": 81})"));
  ASSERT_EQ(wrong.size(), 1u);
  EXPECT_EQ(wrong[0].kind, DiscrepancyKind::kNoSetting);
  EXPECT_EQ(wrong[0].path, "answers[0].settings.d");
  EXPECT_EQ(wrong[0].expected, "1 to 80");
}

// One message for one cause, and it says what is there.
TEST(Verify, DividersAndOutputsThatThereCannotBe) {
  for (const char* const eighths : {"0", "12", "2000"}) {
    const auto wrong = Wrong(With(With(ByHand(), R"("divider": 4,)", R"("divider": 0,)"),
                                  R"("divider_eighths": 32)",
                                  string(R"("divider_eighths": )") + eighths));
    ASSERT_EQ(wrong.size(), 1u) << eighths;
    EXPECT_EQ(wrong[0].kind, DiscrepancyKind::kNoSetting);
    EXPECT_EQ(wrong[0].path, "answers[0].outputs[0].divider_eighths");
    EXPECT_EQ(wrong[0].found, eighths);
    EXPECT_EQ(wrong[0].expected, "8 times a whole divider from 1 to 128");
  }
  const auto m = Wrong(With(ByHand(), R"("m_eighths": 64)", R"("m_eighths": 0)"));
  ASSERT_EQ(m.size(), 1u);
  const auto fraction = Wrong(With(ByHand(), R"("m": 8, "m_eighths": 64)",
                                   R"("m": 7.5, "m_eighths": 60)"));
  ASSERT_EQ(fraction.size(), 1u);
  EXPECT_EQ(fraction[0].expected, "8 times a whole M from 1 to 64");
  const string text = ByHand();
  const std::size_t begin = text.find("\"outputs\": [{\n      \"index\"") + 12;
  const std::size_t end = text.find("}],\n    \"misses\"") + 1;
  const auto gone = Wrong(string(text).erase(begin, end - begin));
  ASSERT_EQ(gone.size(), 1u);
  EXPECT_EQ(gone[0].kind, DiscrepancyKind::kNoSetting);
  EXPECT_EQ(gone[0].path, "answers[0].outputs");
  EXPECT_EQ(gone[0].found, "0 entries");
  EXPECT_EQ(gone[0].expected, "1 entry");
  const auto word = Wrong(string(text).replace(begin, end - begin, "7"));
  ASSERT_EQ(word.size(), 1u);
  EXPECT_EQ(word[0].kind, DiscrepancyKind::kWrongType);
  EXPECT_EQ(word[0].path, "answers[0].outputs[0]");
}

// The second bandwidth, right in all numbers, is not the first.
TEST(Verify, ACandidateHasItsOwnNumber) {
  const string second = With(With(ByHand(), "OPTIMIZED", "LOW"), R"("tradeoff": true)",
                             R"("tradeoff": false)");
  const auto wrong = Wrong(second);
  ASSERT_EQ(wrong.size(), 1u) << Text(wrong);
  EXPECT_EQ(wrong[0].path, "answers[0].number");
  EXPECT_EQ(wrong[0].expected, "2");
}

// Four halves of the divider of 4 are the 50 percent that it has anyway, and all numbers are right.
// But the default comes before them, and before another bandwidth.
TEST(Verify, WhatRanksBeforeTheFirstIsTold) {
  const auto wrong = Wrong(With(With(ByHand(), "OPTIMIZED", "HIGH"), R"("high_time": 0)",
                                R"("high_time": 4)"));
  int told = 0;
  for (const Discrepancy& one : wrong) {
    if (one.kind != DiscrepancyKind::kRanksBefore) continue;
    ++told;
    EXPECT_EQ(one.path, "answers[0]");
    ASSERT_TRUE(one.settings);
    const auto& first = std::get<LoopSettings>(*one.settings);
    EXPECT_EQ(first.bandwidth, Bandwidth::kOptimized);
    EXPECT_EQ(first.outputs[0].high_time, 0);
  }
  EXPECT_EQ(told, 1) << Text(wrong);
}

TEST(Verify, AnotherDeviceIsNamed) {
  const auto wrong = Wrong(With(ByHand(), "small-1", "small-2"));
  ASSERT_EQ(wrong.size(), 1u);
  EXPECT_EQ(wrong[0].path, "request.device");
  EXPECT_EQ(wrong[0].expected, "\"small-1\"");
}

TEST(Verify, ANumberOfTheRequestThatNoAnswerIsFor) {
  const auto wrong = Wrong(With(ByHand(), R"("inputs": [100])", R"("inputs": [101])"));
  ASSERT_FALSE(wrong.empty());
  EXPECT_EQ(wrong[0].path, "request.inputs[0]");
  EXPECT_EQ(wrong[0].kind, DiscrepancyKind::kContradicts);
  EXPECT_EQ(wrong[0].expected, "100");
}

TEST(Verify, TextsThatAreNoPlan) {
  for (const char* const text : {"", "{", "[]", "null", "7", "{}", "{\"request\": 5}",
                                 "{\"request\": {}, \"answers\": {}}", "\xff\xfe"}) {
    EXPECT_FALSE(Wrong(text).empty()) << text;
  }
  const auto wrong = Wrong("{\"request\":\n  {]}");
  ASSERT_EQ(wrong.size(), 1u);
  EXPECT_EQ(wrong[0].kind, DiscrepancyKind::kNotJson);
  EXPECT_TRUE(wrong[0].mistake);
  EXPECT_EQ(wrong[0].line, 2);
  EXPECT_EQ(wrong[0].column, 4);
  EXPECT_FALSE(verify::PartOf("{\"request\": []}"));
}

TEST(Verify, ARequestThatCannotBeReadIsNamed) {
  const auto wrong = Wrong(With(ByHand(), R"("frequency": 200)", R"("frequency": "2oo")"));
  ASSERT_EQ(wrong.size(), 1u);
  EXPECT_EQ(wrong[0].kind, DiscrepancyKind::kNoRequest);
  EXPECT_EQ(wrong[0].path, "request.outputs[0].frequency");
  EXPECT_EQ(wrong[0].line, 9);
}

TEST(Verify, AnswersMustBeThere) {
  const string none = ByHand().substr(0, ByHand().find("\"answers\"")) +
                      "\"answers\": [], \"tradeoffs_cut\": []}";
  const auto wrong = Wrong(none);
  ASSERT_EQ(wrong.size(), 1u);
  EXPECT_EQ(wrong[0].path, "answers[0]");
}

TEST(Verify, HugeNumbersAreNamed) {
  for (const char* const number : {"1e99999", "-1e400", "123456789012345678901234567890e380"}) {
    const auto wrong = Wrong(With(ByHand(), R"("m": 8)", string("\"m\": ") + number));
    ASSERT_EQ(wrong.size(), 1u) << number;
    EXPECT_EQ(wrong[0].path, "answers[0].settings.m");
  }
  const auto wrong =
      Wrong(With(ByHand(), R"("m_eighths": 64)", "\"m_eighths\": " + string(5000, '9')));
  ASSERT_EQ(wrong.size(), 1u);
  EXPECT_EQ(wrong[0].kind, DiscrepancyKind::kAbsurd);
  EXPECT_EQ(wrong[0].path, "answers[0].settings.m_eighths");
}

TEST(Verify, AnswersMustBeObjects) {
  const string text = ByHand();
  const std::size_t begin = text.find("\"answers\": [") + 12;
  const auto wrong = Wrong(text.substr(0, begin) + "7], \"tradeoffs_cut\": []}");
  ASSERT_EQ(wrong.size(), 1u) << Text(wrong);
  EXPECT_EQ(wrong[0].kind, DiscrepancyKind::kWrongType);
  EXPECT_EQ(wrong[0].path, "answers[0]");
  EXPECT_EQ(wrong[0].found, "7");
  EXPECT_EQ(wrong[0].expected, "object");
}

TEST(Verify, APrimitiveThatTheDeviceDoesNotHave) {
  const string pll = With(ByHand(), R"("small-1",)", R"("small-1", "primitive": "PLL",)");
  EXPECT_EQ(Text(Wrong(pll)), Text({}));
  const auto wrong = Wrong(With(pll, R"("primitive": "PLL",)", R"("primitive": "TSYN",)"));
  ASSERT_EQ(wrong.size(), 1u) << Text(wrong);
  EXPECT_EQ(wrong[0].kind, DiscrepancyKind::kNoSetting);
  EXPECT_EQ(wrong[0].path, "request.primitive");
  EXPECT_EQ(wrong[0].found, "\"TSYN\"");
  EXPECT_EQ(wrong[0].line, 9);
}

// The only one wrong, as nothing of settings that there are not is compared. CLKFX goes without.
TEST(Verify, FeedbackThatIsAskedFor) {
  const auto device = DeviceOf(NarrowKrus());
  const string json = Compared(RequestOf({{"--in", "50"}, {"--out", "83.3"}, {"--feedback", "1"},
                                          {"--primitive", "kru_sp"}}),
                               device);
  EXPECT_EQ(Text(verify::Verify(json, device)), Text({}));
  // Behind the answers' begin, as the request has it as well.
  string without = json;
  const std::size_t place = json.find(R"("feedback": true)", json.find("\"answers\""));
  ASSERT_NE(place, string::npos);
  const auto wrong =
      verify::Verify(without.replace(place, 16, R"("feedback": false)"), device);
  ASSERT_EQ(wrong.size(), 1u) << Text(wrong);
  EXPECT_EQ(wrong[0].kind, DiscrepancyKind::kNoSetting);
  EXPECT_EQ(wrong[0].path, "answers[0].settings.feedback");
  EXPECT_EQ(wrong[0].found, "false");
  EXPECT_EQ(wrong[0].expected, "true");
}

// --- Findings ---------------------------------------------------------------------------------

// A right plan that is wrong in that place when `word`, which it has once, is another one.
void ExpectHeld(const string& json, const planner::Device& device, const string& name,
                const string& word, const string& other) {
  verify::Verifier verifier(device, &report::JsonSentences());
  EXPECT_EQ(Text(verifier.Verify(json)), Text({}));
  const string right = "\"" + name + "\": " + word;
  EXPECT_EQ(json.find(right), json.rfind(right)) << right;
  const auto wrong = verifier.Verify(With(json, right, "\"" + name + "\": " + other));
  ASSERT_EQ(wrong.size(), 1u) << right << ": " << Text(wrong);
  EXPECT_TRUE(wrong[0].path.ends_with("." + name)) << wrong[0].path;
  EXPECT_EQ(wrong[0].found, other);
  EXPECT_EQ(wrong[0].expected, word);
}

// High and low times up to 16 make dividers up to 32.
TEST(Verify, ADividerTooLarge) {
  const auto device = DeviceOf(With(kOnePll, "O_MAX_HT_LT = 64", "O_MAX_HT_LT = 16"));
  const Request request = RequestOf({{"--in", "100"}, {"--out", "20"}, {"--device", "small"}});
  LoopSettings set{.primitive = Primitive::kPll, .m = 64, .d = 1, .outputs = {{.divider = 320}}};
  const Answer answer = answer::Evaluate(request, device, set, Source{});
  const string json = report::Json(request, device, {{&answer}});
  ExpectHeld(json, device, "kind", R"("divider_too_large")", R"("outside_limit")");
  ExpectHeld(json, device, "quantity", R"("divider")", R"("frequency")");
  ExpectHeld(json, device, "value_exact", R"("40")", R"("39")");
  ExpectHeld(json, device, "highest_exact", R"("16")", R"("32")");
}

// Without a shape to choose by, the engine does not look at the VCO.
TEST(Verify, PreferMaxVcoUnused) {
  const auto device = DeviceOf(kOnePll);
  const Request request = RequestOf({{"--in", "100"}, {"--out", "200"}, {"--prefer-max-vco", "1"},
                                     {"--device", "small"}});
  const Answer answer =
      engine::AskOne(request, device, Primitive::kPll, engine::AsRequested(request));
  const string json = report::Json(request, device, {{&answer}});
  ExpectHeld(json, device, "kind", R"("prefer_max_vco_unused")", R"("whole_divider_unused")");
}

// 800 MHz are divided by 4 to make 200. By 5 they make 160, which the engine does not answer.
TEST(Verify, WhatTheEngineDoesNotAnswer) {
  const auto device = DeviceOf(kOnePll);
  const Request request = RequestOf({{"--in", "100"}, {"--out", "200"}, {"--device", "small"}});
  LoopSettings set{.primitive = Primitive::kPll, .m = 64, .d = 1, .outputs = {{.divider = 40}}};
  const Answer answer = answer::Evaluate(request, device, set, Source{.engine = true});
  const string json = report::Json(request, device, {{&answer}});
  const auto wrong = verify::Verify(json, device);
  ASSERT_EQ(wrong.size(), 1u) << Text(wrong);
  EXPECT_EQ(wrong[0].path, "answers[0].source");
  EXPECT_NE(Text(wrong).find(R"(is "engine", should be "search")"), string::npos) << Text(wrong);
}

// CLKFX of 50 MHz: 5/3 make 83.3.
TEST(Verify, WhatAKruDoesNotUse) {
  const auto device = DeviceOf(NarrowKrus());
  const plan::Plan plan =
      plan::Make(RequestOf({{"--in", "50"}, {"--out", "83.3"}, {"--phase", "30"},
                            {"--bandwidth", "low"}, {"--primitive", "kru_clkgen"}}),
                 device);
  const string json =
      report::Json(plan.request, device, report::PlanEntries(plan, 1), plan.front_cut);
  ExpectHeld(json, device, "kind", R"("output_0_phase")", R"("off_target")");
  ExpectHeld(json, device, "kind", R"("bandwidth_unused")", R"("output_0_phase")");
}

// The pins of a KRU are six, and go to the outputs that are used.
TEST(Verify, OutputsTooManyForAKru) {
  const auto device = DeviceOf(NarrowKrus());
  const auto json = [&](const char* out) {
    return Compared(RequestOf({{"--in", "50"}, {"--out", out}}), device);
  };
  const string six = json("83.3,83.3,83.3,-,83.3,83.3,83.3");
  EXPECT_NE(six.find("\"solved\": true"), string::npos);
  EXPECT_EQ(Text(verify::Verify(six, device)), Text({}));
  // Without a range of CLKFXDV there is no KRU_CLKGEN.
  string kru_sp = NarrowKrus();
  for (const char* const line : {"D_KRU_CLKFXDV_CLKIN_DIVIDE_BY_2_FALSE_MINPERIOD = 23\n",
                                 "D_KRU_CLKFXDV_CLKIN_DIVIDE_BY_2_FALSE_MAXPERIOD = 25\n"}) {
    kru_sp = With(kru_sp, line, "");
  }
  const auto with_pll = DeviceOf(kOnePll + kru_sp);
  const plan::Plan plan = plan::Make(
      RequestOf({{"--in", "100"}, {"--out", "200,200,200,200,200,200,200"}}), with_pll);
  ASSERT_TRUE(plan.IsSolved());
  ASSERT_EQ(plan.refused.size(), 1u);
  const string seven = report::Json(plan.request, with_pll, report::CompareEntries(plan));
  ExpectHeld(seven, with_pll, "kind", R"("too_many_outputs")", R"("too_many_inputs")");
  ExpectHeld(seven, with_pll, "value_exact", R"("7")", R"("8")");
  ExpectHeld(seven, with_pll, "highest_exact", R"("6")", R"("7")");
}

// None is solved, and they stand in the order of the primitives.
TEST(Verify, UnsolvedPrimitivesInTheirOrder) {
  for (const string& limits : {NarrowKrus(), string(kOnePll) + NarrowKrus()}) {
    const auto device = DeviceOf(limits);
    const plan::Plan plan = plan::Make(RequestOf({{"--in", "100,200"}, {"--out", "200"}}), device);
    auto entries = report::CompareEntries(plan);
    ASSERT_GE(entries.size(), 2u);
    const auto verified = [&] {
      return verify::Verify(report::Json(plan.request, device, entries, plan.front_cut), device);
    };
    EXPECT_EQ(Text(verified()), Text({}));
    std::swap(entries[entries.size() - 1], entries[entries.size() - 2]);
    const auto wrong = verified();
    ASSERT_EQ(wrong.size(), 1u) << Text(wrong);
    EXPECT_EQ(wrong[0].kind, DiscrepancyKind::kMisplaced);
    EXPECT_EQ(wrong[0].path, "answers[" + std::to_string(entries.size() - 1) + "]");
  }
}

// What the planner makes of some requests, for all that its three documents have.
TEST(Verify, PlansOfTheBundledDevicesAreRight) {
  struct Case {
    const char* device;
    std::vector<read::Option> options;
  };
  const std::vector<Case> cases = {
      {"vk40", {{"--in", "27"}, {"--out", "148.5,74.25,27"}, {"--primitive", "tsyn"}}},
      {"vk40", {{"--in", "33.333,50"}, {"--out", "100,50"}, {"--duty", "40,-"}}},
      {"vk40", {{"--in", "100"}, {"--out", "200,-,50"}, {"--max-jitter", "120"}, {"--rank", "vco"},
                {"--prefer-max-vco", "1"}, {"--primitive", "pll"}}},
      {"vk40", {{"--in", "25"}, {"--out", "133.33,66.7"}, {"--phase", "-30,400/3"},
                {"--rank", "margin"}, {"--primitive", "pll"}}},
      {"vk10", {{"--in", "50"}, {"--out", "100,20,37.5"}, {"--primitive", "kru_sp"},
                {"--input-jitter", "30"}}},
      {"vk40", {{"--in", "27"}, {"--out", "148.5,74.25,27"}, {"--engine", "1"}}},
      {"vk40", {{"--in", "25"}, {"--out", "66.7,133.33"}, {"--any-order", "1"},
                {"--primitive", "tsyn"}, {"--rank", "error"}}},
  };
  for (const Case& one : cases) {
    const auto device = device::FromFile(
        ::Device::DeviceFile::Read(string(BUNDLED_DEVICES) + '/' + one.device + ".toml",
                                   one.device),
        "", "1");
    const plan::Plan plan = plan::Make(RequestOf(one.options), device);
    ASSERT_TRUE(plan.IsSolved());
    verify::Verifier verifier(device, &report::JsonSentences());
    std::vector<std::vector<report::Entry>> documents = {
        report::CompareEntries(plan), report::BestEntries(plan, 1, 5),
        report::BestEntries(plan, plan.ranked.size(), 100)};
    for (std::size_t number = 1; number <= plan.ranked.size(); ++number) {
      documents.push_back(report::PlanEntries(plan, number));
    }
    for (const auto& entries : documents) {
      const string json = report::Json(plan.request, device, entries, plan.front_cut);
      EXPECT_EQ(Text(verifier.Verify(json)), Text({})) << one.device << one.options[1].value;
    }
  }
}

}  // namespace

}  // namespace planner::verify_test
