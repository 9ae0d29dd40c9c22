// The names in an explanation as data. They are part of a document that others read.
#include <gtest/gtest.h>

#include <nlohmann/json.hpp>
#include <string>
#include <utility>
#include <vector>

#include "made.h"
#include "planner/report/ExplainText.h"

namespace planner::report {
namespace {

using explain::Change;
using explain::ChangeKind;
using explain::Demand;
using explain::DemandKind;
using nlohmann::json;

template <typename Kind>
using Names = std::vector<std::pair<Kind, std::string>>;

const Names<DemandKind> kDemands = {
    {DemandKind::kFrequency, "frequency"}, {DemandKind::kPhase, "phase"},
    {DemandKind::kDuty, "duty"},           {DemandKind::kJitter, "jitter"},
    {DemandKind::kOutputRange, "output_range"}, {DemandKind::kVco, "vco"},
    {DemandKind::kPfd, "pfd"},             {DemandKind::kM, "m"},
    {DemandKind::kD, "d"},                 {DemandKind::kDividers, "dividers"},
    {DemandKind::kWhole, "whole"},         {DemandKind::kNothingMoves, "nothing_moves"},
    {DemandKind::kBandwidth, "bandwidth"}, {DemandKind::kFeedback, "feedback"},
    {DemandKind::kInputTolerance, "input_tolerance"}, {DemandKind::kSecondInput, "second_input"}};

const Names<ChangeKind> kChanges = {
    {ChangeKind::kWithout, "without"},     {ChangeKind::kTolerance, "tolerance"},
    {ChangeKind::kFrequency, "frequency"}, {ChangeKind::kPhase, "phase"},
    {ChangeKind::kDuty, "duty"},           {ChangeKind::kJitter, "jitter"},
    {ChangeKind::kLowest, "minimum"},      {ChangeKind::kHighest, "maximum"},
    {ChangeKind::kInputTolerance, "input_tolerance"}, {ChangeKind::kBandwidth, "bandwidth"}};

// Output 0 at 200 MHz, with all that can be asked of it.
explain::Explanation MadeExplanation(Primitive primitive) {
  explain::Explanation explanation;
  explanation.request = MadeRequest({100}, {200});
  Request& request = explanation.request;
  request.bandwidth = Bandwidth::kLow;
  request.input_tolerance = 50;
  request.outputs[0].phase = 90;
  request.outputs[0].duty = 25;
  request.outputs[0].max_jitter = 100;
  explanation.primitives.emplace_back().primitive = primitive;
  return explanation;
}

json Data(const explain::Explanation& explanation) {
  return json::parse(ExplainJson(explanation, MadeDevice()))["primitives"][0];
}

TEST(ExplainData, EachDemandHasItsNameAndItsWords) {
  explain::Explanation explanation = MadeExplanation(Primitive::kTsyn);
  std::vector<Demand>& correction = explanation.primitives[0].corrections.emplace_back();
  for (const auto& [kind, name] : kDemands) correction.push_back({kind, 0});
  const json told = Data(explanation)["corrections"][0];
  ASSERT_EQ(told.size(), kDemands.size());
  for (std::size_t i = 0; i < told.size(); ++i) {
    EXPECT_EQ(told[i]["kind"], kDemands[i].second);
    EXPECT_NE(told[i].value("text", ""), "");
  }
  EXPECT_EQ(told[0]["text"], "output 0 at 200 MHz");
  EXPECT_EQ(told[6]["text"], "the PFD from 10 to 300 MHz");
  EXPECT_EQ(told[9]["text"], "dividers up to 128");
  EXPECT_EQ(told[12]["text"], "bandwidth LOW");
  EXPECT_EQ(told[13]["text"], "the feedback");
  EXPECT_EQ(told[14]["text"], "an input that can be off by 50 ppm");
}

TEST(ExplainData, DividersOfAKru) {
  for (const auto& [primitive, words] :
       {std::pair{Primitive::kKruSp, "the divides of CLKDV"},
        std::pair{Primitive::kKruClkgen, "the divides of CLKFXDV"}}) {
    explain::Explanation explanation = MadeExplanation(primitive);
    explanation.primitives[0].corrections = {{{DemandKind::kDividers, 0}}};
    EXPECT_EQ(Data(explanation)["corrections"][0][0]["text"], words);
  }
}

TEST(ExplainData, EachChangeHasItsName) {
  explain::Explanation explanation = MadeExplanation(Primitive::kTsyn);
  std::vector<Change>& together = explanation.primitives[0].together;
  for (const auto& [kind, name] : kChanges) {
    Change& change = together.emplace_back();
    change.kind = kind;
    change.demand = {DemandKind::kFrequency, 0};
    change.value = 2;
    change.before = 1;
    change.settings = LoopSettings{};
  }
  const json told = Data(explanation)["together"];
  ASSERT_EQ(told.size(), kChanges.size());
  for (std::size_t i = 0; i < told.size(); ++i) EXPECT_EQ(told[i]["kind"], kChanges[i].second);
}

// What goes is told in words, too.
TEST(ExplainData, WithoutADemand) {
  explain::Explanation explanation = MadeExplanation(Primitive::kTsyn);
  for (const DemandKind kind :
       {DemandKind::kPfd, DemandKind::kBandwidth, DemandKind::kInputTolerance}) {
    Change& change = explanation.primitives[0].together.emplace_back();
    change.kind = ChangeKind::kWithout;
    change.demand = {kind, -1};
  }
  const json told = Data(explanation)["together"];
  EXPECT_EQ(told[0]["text"], "a PFD outside its range");
  EXPECT_EQ(told[1]["text"], "any bandwidth");
  EXPECT_EQ(told[2]["text"], "an input without a tolerance");
}

TEST(ExplainData, RefusalsAndSwaps) {
  explain::Explanation explanation = MadeExplanation(Primitive::kTsyn);
  Finding refusal{.kind = FindingKind::kNoSettings};
  refusal.primitive = Primitive::kTsyn;
  explanation.primitives[0].refusals = {refusal};
  explain::Swap& swap = explanation.primitives[0].swaps.emplace_back();
  swap.first = 1;
  swap.second = 3;
  const json told = Data(explanation);
  EXPECT_EQ(told["refusals"][0]["kind"], "no_settings");
  EXPECT_EQ(told["swaps"], json::parse("[[1, 3]]"));
}

}  // namespace
}  // namespace planner::report
