#include <gtest/gtest.h>

#include "made.h"
#include "planner/report/Sdc.h"
#include "planner/report/SdcPlain.h"

namespace planner::report {
namespace {

// 100 MHz times 8; by 8, a quarter of 10 ns later, and by 16, high for a quarter of 20 ns.
TEST(SdcPlain, AllOfALoop) {
  const Request request = MadeRequest({100}, {100, 50});
  Answer answer = MadeLoop(request, Primitive::kPll, Bandwidth::kHigh, 64, 1, {64, 128}, 100);
  answer.outputs[0].phase = 90;
  answer.outputs[1].duty = 25;
  const std::string text =
      "# vk40b484-2 PLL: VCO 800, PFD 100, M 8, D 1, bandwidth HIGH\n"
      "# Periods and edges are in ns. Nothing here tells that the clocks are related,\n"
      "#   nor their jitter.\n"
      "\n"
      "# Input 1: 100 MHz\n"
      "create_clock -name clk_in1 -period 10 -waveform {0 5} [get_ports clk_in1]\n"
      "\n"
      "# Output 0: 100 MHz\n"
      "create_clock -name clk_out0 -period 10 -waveform {2.5 7.5} [get_pins pll_inst/CLKOUT0]\n"
      "\n"
      "# Output 1: 50 MHz\n"
      "create_clock -name clk_out1 -period 20 -waveform {0 5} [get_pins pll_inst/CLKOUT1]\n";
  EXPECT_EQ(SdcPlain(request, MadeDevice(), answer), text);
  SdcOptions options;
  options.plain = true;
  EXPECT_EQ(Sdc(request, MadeDevice(), answer, options), text);
}

TEST(SdcPlain, OfTwoInputsTheFasterOneCounts) {
  Request request = MadeRequest({50, 80}, {200});
  const auto text = [&] {
    return SdcPlain(request, MadeDevice(),
                    MadeLoop(request, Primitive::kPll, Bandwidth::kHigh, 128, 1, {32}, 100));
  };
  // Four times the input.
  EXPECT_NE(text().find("# The outputs are as with input 2, the faster one.\n"), std::string::npos);
  EXPECT_NE(text().find("create_clock -name clk_in1 -period 20 -waveform {0 10}"),
            std::string::npos);
  EXPECT_NE(text().find("create_clock -name clk_in2 -period 12.5 -waveform {0 6.25}"),
            std::string::npos);
  EXPECT_NE(text().find("create_clock -name clk_out0 -period 3.125 -waveform {0 1.5625}"),
            std::string::npos)
      << text();
  request.inputs = {50, 40};
  EXPECT_NE(text().find("with input 1, the faster one"), std::string::npos);
  EXPECT_NE(text().find("create_clock -name clk_out0 -period 5 "), std::string::npos);
}

TEST(SdcPlain, OutputsOnTheSamePinAreOneClock) {
  const Request request = MadeRequest({100}, {150, 100, 150});
  KruSettings settings;
  settings.m = 3;
  settings.d = 2;
  settings.pins = {Pin::kClkfx, Pin::kClk0, Pin::kClkfx};
  const std::string text = SdcPlain(
      request, MadeDevice(), MadeKru(request, settings, {Rational(3, 2), 1, Rational(3, 2)}, 1));
  EXPECT_NE(text.find("# Output 0: 150 MHz; output 2 is on the same pin\n"
                      "create_clock -name clk_out0 -period 6.666666666666667 -waveform {0 "
                      "3.333333333333333} [get_pins kru_sp_inst/CLKFX]\n"),
            std::string::npos)
      << text;
  EXPECT_EQ(text.find("clk_out2"), std::string::npos);
}

}  // namespace
}  // namespace planner::report
