#include <gtest/gtest.h>

#include "made.h"
#include "planner/report/SdcCrossings.h"

namespace planner::report {
namespace {

// Two outputs of a PLL, 100 MHz times 8, the second one later by a phase.
struct Two {
  Request request;
  Answer answer;
};
Two Made(int first, int second, const Rational& phase = 0) {
  Two two{MadeRequest({100}, {100, 100}), {}};
  two.answer =
      MadeLoop(two.request, Primitive::kPll, Bandwidth::kHigh, 64, 1, {first, second}, 100);
  two.answer.outputs[1].phase = phase;
  return two;
}

std::string Of(const Two& two, const SdcOptions& options = {}) {
  return SdcCrossings(two.request, two.answer, options);
}

bool Has(const std::string& text, const std::string& part) {
  return text.find(part) != std::string::npos;
}

// 800 MHz by 8 and by 10: 10 and 12.5 ns, 2.5 ns of which are a quarter.
TEST(SdcCrossings, NothingIsRelaxedWhereNothingHasToBe) {
  const std::string text = Of(Made(64, 80));
  EXPECT_EQ(text.find("set_"), std::string::npos);
  EXPECT_TRUE(Has(text, "No gap is below 25 % of the shorter"));
}

// By 8 and 9: 10 and 11.25 ns, 1.25 ns apart. The input is as the first output.
TEST(SdcCrossings, WhatAFifoWouldAllowIsACommentUnlessItIsSaid) {
  const Two two = Made(64, 72);
  const std::string commands =
      "# clk_out0 to clk_out1: a gap of 1.25 ns: a FIFO or a handshake.\n"
      "#set_max_delay 10 -from [get_clocks clk_out0] -to [get_clocks clk_out1]\n"
      "#set_false_path -hold -from [get_clocks clk_out0] -to [get_clocks clk_out1]\n";
  const std::string text = Of(two);
  EXPECT_TRUE(Has(text, commands)) << text;
  EXPECT_FALSE(Has(text, "\nset_"));
  SdcOptions options;
  options.fifos = true;
  const std::string said = Of(two, options);
  EXPECT_TRUE(Has(said,
                  "\nset_max_delay 10 -from [get_clocks clk_out0] -to [get_clocks "
                  "clk_out1]\nset_false_path -hold -from"))
      << said;
  EXPECT_TRUE(Has(said, "has been said, and not been checked"));
  EXPECT_FALSE(Has(said, "#set_"));
  // Only between clocks 1.25 ns apart: input and first output are one clock but for their names.
  EXPECT_FALSE(Has(said, "-from [get_clocks clk_in1] -to [get_clocks clk_out0]"));
}

TEST(SdcCrossings, TheRuleDecides) {
  SdcOptions options;
  options.rule.gap = 1;
  EXPECT_TRUE(Has(Of(Made(64, 72), options), "No gap is below 1 ns"));
  options.rule.gap = 3;
  EXPECT_TRUE(Has(Of(Made(64, 80), options), "less than 3 ns"));
}

// 36 degrees of 10 ns: 1 ns later. A multicycle is counted in periods of the faster clock.
TEST(SdcCrossings, AMulticycleIsNeverSaidByItself) {
  SdcOptions options;
  options.fifos = true;
  const std::string text = Of(Made(64, 64, 36), options);
  EXPECT_TRUE(
      Has(text,
          "\n#set_multicycle_path 2 -setup -end -from [get_clocks clk_out0] -to [get_clocks "
          "clk_out1]\n"))
      << text;
  EXPECT_TRUE(Has(text, "clk_out0 to clk_out1: a gap of 1 ns, the same"));
  EXPECT_FALSE(Has(text, "\nset_"));
  // Back there are 9 ns.
  EXPECT_FALSE(Has(text, "-from [get_clocks clk_out1]"));
  // 18 degrees of 20 ns are 1 ns, too, and the launching clock is the faster one.
  EXPECT_TRUE(Has(Of(Made(64, 128, 18)),
                  "#set_multicycle_path 2 -setup -start -from [get_clocks "
                  "clk_out0] -to [get_clocks clk_out1]\n"));
}

TEST(SdcCrossings, TwoInputsAreAsynchronousOnlyWhereTheUserSaysSo) {
  const Request request = MadeRequest({100, 80}, {200});
  const Answer answer = MadeLoop(request, Primitive::kPll, Bandwidth::kHigh, 64, 1, {32}, 100);
  const std::string command =
      "set_clock_groups -asynchronous -group [get_clocks {clk_in1 clk_out0_in1}] -group "
      "[get_clocks "
      "{clk_in2 clk_out0_in2}]\n";
  EXPECT_TRUE(Has(SdcCrossings(request, answer, {}), "\n#" + command));
  SdcOptions options;
  options.fifos = true;
  EXPECT_TRUE(Has(SdcCrossings(request, answer, options), "\n" + command));
}

// Half of 100 ps and 77.037 ps of a loop; the outputs share the VCO.
TEST(SdcInterclockUncertainties, OfALoop) {
  Two two = Made(64, 72);
  const std::string text = SdcInterclockUncertainties(two.request, two.answer);
  EXPECT_TRUE(Has(text,
                  "\nset_clock_uncertainty 0.127037 -from [get_clocks clk_in1] -to "
                  "[get_clocks {clk_out0 clk_out1}]\n"
                  "set_clock_uncertainty 0.127037 -from [get_clocks {clk_out0 clk_out1}] -to "
                  "[get_clocks clk_in1]\n"))
      << text;
  EXPECT_FALSE(Has(text, "-from [get_clocks clk_out0]"));
  // And half of the input's.
  two.request.input_jitter = 20;
  EXPECT_TRUE(Has(SdcInterclockUncertainties(two.request, two.answer), " 0.137037 -from"));
  two.answer.outputs[1].jitter = 60;
  const std::string own = SdcInterclockUncertainties(two.request, two.answer);
  EXPECT_TRUE(Has(own,
                  "set_clock_uncertainty 0.117037 -from [get_clocks clk_in1] -to [get_clocks "
                  "clk_out1]\n"))
      << own;
  two.answer.phase_error = std::nullopt;
  EXPECT_EQ(SdcInterclockUncertainties(two.request, two.answer), "");
}

// Pins of a KRU have jitter of their own: 100 and 300 ps, and a phase error of 150 ps.
TEST(SdcInterclockUncertainties, OfAKru) {
  const Request request = MadeRequest({100}, {100, 150});
  KruSettings settings;
  settings.m = 3;
  settings.d = 2;
  settings.pins = {Pin::kClk0, Pin::kClkfx};
  Answer answer = MadeKru(request, settings, {1, Rational(3, 2)}, 100);
  answer.outputs[1].jitter = 300;
  const std::string text = SdcInterclockUncertainties(request, answer);
  for (const char* const command : {"0.2 -from [get_clocks clk_in1] -to [get_clocks clk_out0]",
                                    "0.3 -from [get_clocks clk_in1] -to [get_clocks clk_out1]",
                                    "0.2 -from [get_clocks clk_out0] -to [get_clocks clk_in1]",
                                    "0.3 -from [get_clocks clk_out1] -to [get_clocks clk_in1]",
                                    "0.2 -from [get_clocks clk_out1] -to [get_clocks clk_out0]",
                                    "0.2 -from [get_clocks clk_out0] -to [get_clocks clk_out1]"}) {
    EXPECT_TRUE(Has(text, std::string("set_clock_uncertainty ") + command + "\n")) << text;
  }
}

TEST(SdcInterclockUncertainties, OnlyWithTheFirstInput) {
  const Request request = MadeRequest({100, 80}, {200});
  const Answer answer = MadeLoop(request, Primitive::kPll, Bandwidth::kHigh, 64, 1, {32}, 100);
  const std::string text = SdcInterclockUncertainties(request, answer);
  EXPECT_TRUE(Has(text, "-from [get_clocks clk_in1] -to [get_clocks clk_out0_in1]"));
  EXPECT_FALSE(Has(text, "in2"));
}

}  // namespace
}  // namespace planner::report
