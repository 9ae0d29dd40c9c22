#include "planner/explain/Demand.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <utility>
#include <vector>

namespace planner::explain {
namespace {

using Kind = DemandKind;

Request TwoOutputs() {
  Request request;
  request.inputs = {27};
  request.outputs.resize(2);
  request.outputs[0].frequency = 100;
  request.outputs[1].frequency = 50;
  request.outputs[1].phase = 90;
  return request;
}

TEST(Demands, AreThoseOfTheRequestAndTheHardware) {
  const std::vector<Demand> demands = DemandsOf(TwoOutputs(), Primitive::kTsyn);
  EXPECT_EQ(demands, (std::vector<Demand>{{Kind::kFrequency, 0},
                                          {Kind::kOutputRange, 0},
                                          {Kind::kFrequency, 1},
                                          {Kind::kPhase, 1},
                                          {Kind::kOutputRange, 1},
                                          {Kind::kVco},
                                          {Kind::kPfd},
                                          {Kind::kM},
                                          {Kind::kD},
                                          {Kind::kDividers},
                                          {Kind::kWhole},
                                          {Kind::kNothingMoves}}));
}

TEST(Demands, OfAnUnusedOutputThereAreNone) {
  Request request = TwoOutputs();
  request.outputs[1].used = false;
  for (const Demand& demand : DemandsOf(request, Primitive::kPll)) EXPECT_NE(demand.output, 1);
}

TEST(Demands, OfAKruHaveNoVco) {
  Request request = TwoOutputs();
  request.feedback = true;
  request.outputs[0].max_jitter = 100;
  EXPECT_EQ(DemandsOf(request, Primitive::kKruSp),
            (std::vector<Demand>{{Kind::kFrequency, 0},
                                 {Kind::kJitter, 0},
                                 {Kind::kOutputRange, 0},
                                 {Kind::kFrequency, 1},
                                 {Kind::kPhase, 1},
                                 {Kind::kOutputRange, 1},
                                 {Kind::kM},
                                 {Kind::kD},
                                 {Kind::kDividers},
                                 {Kind::kFeedback}}));
}

// Of the largest request there are fewer than a set has room for.
TEST(Demands, FitIntoASet) {
  Request request;
  request.inputs = {27, 25};
  request.bandwidth = Bandwidth::kLow;
  request.max_jitter = 100;
  request.outputs.resize(7);
  for (Output& output : request.outputs) {
    output.frequency = 100;
    output.phase = 90;
    output.duty = 40;
  }
  EXPECT_LE(DemandsOf(request, Primitive::kPll).size(), 64u);
  EXPECT_EQ(All(std::vector<Demand>(64)), ~Set{0});
  EXPECT_EQ(All({}), Set{0});
}

TEST(Demands, WhatIsNotKeptIsLeftOut) {
  const std::vector<Demand> demands = {{Kind::kFrequency, 0}, {Kind::kPhase, 1}, {Kind::kVco}};
  search::Relaxed expected;
  expected.outputs[0].frequency = true;
  expected.vco = true;
  EXPECT_EQ(OnlyWith(demands, 0b010), expected);
  EXPECT_EQ(OnlyWith(demands, 0b111), search::Relaxed{});
}

// Each kind has one member of its own, and those of an output are of that one.
TEST(Demands, EachIsLeftOutByItself) {
  using search::Relaxed;
  const std::vector<std::pair<Kind, bool Relaxed::OfOutput::*>> of_outputs = {
      {Kind::kFrequency, &Relaxed::OfOutput::frequency},
      {Kind::kPhase, &Relaxed::OfOutput::phase},
      {Kind::kDuty, &Relaxed::OfOutput::duty},
      {Kind::kJitter, &Relaxed::OfOutput::jitter},
      {Kind::kOutputRange, &Relaxed::OfOutput::range}};
  for (const auto& [kind, member] : of_outputs) {
    Relaxed expected;
    expected.outputs[2].*member = true;
    Relaxed relaxed;
    Relax({kind, 2}, &relaxed);
    EXPECT_EQ(relaxed, expected) << static_cast<int>(kind);
  }
  const std::vector<std::pair<Kind, bool Relaxed::*>> of_all = {
      {Kind::kVco, &Relaxed::vco},
      {Kind::kPfd, &Relaxed::pfd},
      {Kind::kM, &Relaxed::m},
      {Kind::kD, &Relaxed::d},
      {Kind::kDividers, &Relaxed::dividers},
      {Kind::kWhole, &Relaxed::whole},
      {Kind::kNothingMoves, &Relaxed::nothing_moves},
      {Kind::kBandwidth, &Relaxed::bandwidth},
      {Kind::kFeedback, &Relaxed::feedback},
      {Kind::kSecondInput, &Relaxed::second_input},
      {Kind::kInputTolerance, &Relaxed::input_tolerance}};
  for (const auto& [kind, member] : of_all) {
    Relaxed expected;
    expected.*member = true;
    Relaxed relaxed;
    Relax({kind}, &relaxed);
    EXPECT_EQ(relaxed, expected) << static_cast<int>(kind);
  }
}

}  // namespace
}  // namespace planner::explain
