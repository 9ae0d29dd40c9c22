#include "planner/report/Sdc.h"

#include <gtest/gtest.h>

#include "made.h"

namespace planner::report {
namespace {

// What creates the clock of an output, without its comment.
std::string Clock(const std::string& text, const std::string& name) {
  const std::size_t begin = text.find("create_generated_clock -name " + name + " ");
  if (begin == std::string::npos) return "none";
  return text.substr(begin, text.find("]\n", text.find("get_pins", begin)) + 1 - begin);
}

// How a clock is described.
std::string Waveform(const Rational& ratio, const Rational& phase = 0, const Rational& duty = 50,
                     const Rational& input = 100) {
  const Request request = MadeRequest({input}, {input * ratio});
  Answer answer = MadeLoop(request, Primitive::kPll, Bandwidth::kHigh, 80, 1, {80}, 100);
  answer.outputs[0].ratio = ratio;
  answer.outputs[0].phase = phase;
  answer.outputs[0].duty = duty;
  const std::string text = Clock(Sdc(request, MadeDevice(), answer), "clk_out0");
  const std::size_t begin = text.find("\\\n  ") + 4;
  return text.substr(begin, text.find(" \\\n", begin) - begin);
}

TEST(Sdc, AllOfALoop) {
  const Request request = VideoRequest();
  Answer answer = VideoAnswer(request);
  EXPECT_EQ(Sdc(request, MadeDevice(), answer),
            "# vk40b484-2 TSYN: VCO 1188, PFD 27, M 44, D 1, bandwidth HIGH\n"
            "# Periods and shifts are in ns. The uncertainty of a clock is half of its\n"
            "#   peak-to-peak jitter, at a bit error rate of 1e-12, by which an edge can be\n"
            "#   early or late.\n"
            "# The outputs are up to 77.037 ps beside the phase of the input.\n"
            "\n"
            "# The names of the input ports and of the primitive in the design.\n"
            "set input_port_1 clk_in1\n"
            "set primitive tsyn_inst\n"
            "\n"
            "# Input 1: 27 MHz, jitter 0 ps peak to peak\n"
            "create_clock -name clk_in1 -period 37.037037037037037 [get_ports $input_port_1]\n"
            "\n"
            "# Output 0: 148.5 MHz, 11 / 2 of the input, 148.5 MHz asked for, 0.00 ppm off;\n"
            "#   phase 0 degrees; duty 50 percent; jitter 128.815 ps peak to peak\n"
            "create_generated_clock -name clk_out0 -source [get_ports $input_port_1] "
            "-master_clock clk_in1 \\\n"
            "  -edges {1 1 1} -edge_shift {0 3.367003367003367 6.734006734006734} \\\n"
            "  [get_pins $primitive/CLKOUT0]\n"
            "set_clock_uncertainty 0.0644075 [get_clocks clk_out0]\n"
            "\n"
            "# Output 1: 74.25 MHz, 11 / 4 of the input, 74.25 MHz asked for, 0.00 ppm off;\n"
            "#   phase 0 degrees; duty 50 percent; jitter 128.815 ps peak to peak\n"
            "create_generated_clock -name clk_out1 -source [get_ports $input_port_1] "
            "-master_clock clk_in1 \\\n"
            // A period of 4 / 11 of 37.037 ns, 13.468 ns: half of it less than half of that of the
            // input, and all of it less than the whole.
            "  -edges {1 2 3} -edge_shift {0 -11.784511784511785 -23.569023569023569} \\\n"
            "  [get_pins $primitive/CLKOUT1]\n"
            "set_clock_uncertainty 0.0644075 [get_clocks clk_out1]\n"
            "\n"
            "# Output 2: 27 MHz, 1 / 1 of the input, 27 MHz asked for, 0.00 ppm off; phase 0\n"
            "#   degrees; duty 50 percent; jitter 128.815 ps peak to peak\n"
            "create_generated_clock -name clk_out2 -source [get_ports $input_port_1] "
            "-master_clock clk_in1 \\\n"
            "  -multiply_by 1 \\\n"
            "  [get_pins $primitive/CLKOUT2]\n"
            "set_clock_uncertainty 0.0644075 [get_clocks clk_out2]\n"
            "\n"
            // 128.815 / 2 + 77.037 ps.
            "# Between the input and an output the edges of both can be off, each by half of\n"
            "#   its jitter, and those of an output also by the phase error to the input. All\n"
            "#   outputs follow one VCO: between two of them it is the uncertainty of the\n"
            "#   capturing clock.\n"
            "set_clock_uncertainty 0.1414445 -from [get_clocks clk_in1] -to [get_clocks {clk_out0 "
            "clk_out1 clk_out2}]\n"
            "set_clock_uncertainty 0.1414445 -from [get_clocks {clk_out0 clk_out1 clk_out2}] -to "
            "[get_clocks clk_in1]\n"
            "\n"
            // From 27 MHz to 148.5 MHz it is half of 6.734 ns, and to 74.25 MHz a quarter of 13.468.
            "# Crossings: every path between two clocks is timed with the tightest gap\n"
            "#   between a launching and a capturing edge. No gap is below 25 % of the shorter\n"
            "#   period, and nothing has to be relaxed.\n");
}

TEST(Sdc, WholeMultiplesAndWholePartsArePlain) {
  EXPECT_EQ(Waveform(3), "-multiply_by 3");
  EXPECT_EQ(Waveform(3, 0, Rational(125, 3)), "-multiply_by 3 -duty_cycle 41.666666666666667");
  EXPECT_EQ(Waveform(Rational(1, 4)), "-divide_by 4");
  EXPECT_EQ(Waveform(3, 360), "-multiply_by 3");  // a whole turn is none
}

// Of 100 MHz, with edges at 0, 5, 10, 15, 20 ... ns.
TEST(Sdc, AllElseIsEdgesAndShifts) {
  // 50 MHz, high for a quarter of 20 ns: rises at 0, falls at 5, rises at 20.
  EXPECT_EQ(Waveform(Rational(1, 2), 0, 25), "-edges {1 3 5} -edge_shift {0 -5 0}");
  // 50 MHz at 90 degrees, 5 ns: rises at 5, falls at 15, rises at 25.
  EXPECT_EQ(Waveform(Rational(1, 2), 90), "-edges {1 3 5} -edge_shift {5 5 5}");
  // -90 degrees are 270, 15 ns.
  EXPECT_EQ(Waveform(Rational(1, 2), -90), "-edges {1 3 5} -edge_shift {15 15 15}");
  // 40 MHz, 25 ns, at 0: two whole periods of the input and half of one more.
  EXPECT_EQ(Waveform(Rational(2, 5)), "-edges {1 3 5} -edge_shift {0 2.5 5}");
  // 200 MHz at 180 degrees: rises at 2.5, falls at 5, rises at 7.5.
  EXPECT_EQ(Waveform(2, 180), "-edges {1 2 3} -edge_shift {2.5 0 -2.5}");
}

TEST(Sdc, OnlyClocksOfMoreThanFourTimesTheInputHaveAllEdgesFromOne) {
  // 80 MHz from 20 MHz at 90 degrees: rises at 3.125 of 12.5 ns; the input has edges every 25.
  EXPECT_EQ(Waveform(4, 90, 50, 20), "-edges {1 2 3} -edge_shift {3.125 -15.625 -34.375}");
  // 100 MHz: rises at 2.5, 12.5 and falls at 7.5.
  EXPECT_EQ(Waveform(5, 90, 50, 20), "-edges {1 1 1} -edge_shift {2.5 7.5 12.5}");
}

TEST(Sdc, TwoInputsAndTheJitterOfTheFirst) {
  Request request = MadeRequest({100, 50}, {200});
  request.input_jitter = 50;
  const Answer answer = MadeLoop(request, Primitive::kPll, Bandwidth::kHigh, 80, 1, {40}, 100);
  const std::string text = Sdc(request, MadeDevice(), answer);
  EXPECT_NE(text.find("create_clock -name clk_in2 -period 20 [get_ports $input_port_2]\n"
                      "set_clock_uncertainty 0.025 [get_clocks clk_in2]\n"),
            std::string::npos);
  EXPECT_NE(Clock(text, "clk_out0_in1").find("-master_clock clk_in1 \\\n  -multiply_by 2 \\\n"),
            std::string::npos);
  EXPECT_NE(Clock(text, "clk_out0_in2").find("-master_clock clk_in2 -add \\\n"), std::string::npos);
  EXPECT_NE(text.find("set_clock_uncertainty 0.05 [get_clocks clk_out0_in1]\n"), std::string::npos);
  EXPECT_EQ(text.find("uncertainty 0.05 [get_clocks clk_out0_in2]"), std::string::npos);
  EXPECT_NE(text.find("from input 2 100 MHz"), std::string::npos);
  EXPECT_NE(text.find("# The outputs follow one input or the other.\n"
                      "set_clock_groups -physically_exclusive \\\n"
                      "  -group [get_clocks {clk_out0_in1}] \\\n"
                      "  -group [get_clocks {clk_out0_in2}]\n"),
            std::string::npos);
}

// 80 MHz and a quarter more are 100 MHz.
TEST(Sdc, TheToleranceOfTheInputShortensAllPeriods) {
  Request request = MadeRequest({80}, {160, 80});
  request.input_tolerance = 250000;
  Answer answer = MadeLoop(request, Primitive::kPll, Bandwidth::kHigh, 80, 1, {40, 80}, 100);
  answer.outputs[1].phase = 90;
  const std::string text = Sdc(request, MadeDevice(), answer);
  EXPECT_NE(text.find("# An input can be off by 250000 ppm: all periods and shifts are those of the\n"
                      "#   fastest one, which is the worst case of every path. Frequencies in comments\n"
                      "#   are as they are meant.\n"),
            std::string::npos)
      << text;
  EXPECT_NE(text.find("# Input 1: 80 MHz, jitter"), std::string::npos);
  EXPECT_NE(text.find("create_clock -name clk_in1 -period 10 "), std::string::npos);
  EXPECT_NE(text.find("# Output 0: 160 MHz"), std::string::npos);
  // A quarter of 10 ns.
  EXPECT_NE(Clock(text, "clk_out1").find("-edges {1 2 3} -edge_shift {2.5 2.5 2.5}"),
            std::string::npos)
      << text;
  SdcOptions options;
  options.plain = true;
  const std::string plain = Sdc(request, MadeDevice(), answer, options);
  EXPECT_NE(plain.find("# An input can be off by 250000 ppm"), std::string::npos);
  EXPECT_NE(plain.find("# Output 0: 160 MHz\ncreate_clock -name clk_out0 -period 5 -waveform {0 2.5}"),
            std::string::npos)
      << plain;
}

TEST(Sdc, OutputsOnTheSamePinAreOneClock) {
  const Request request = MadeRequest({100}, {150, 100, 150});
  KruSettings settings;
  settings.feedback = true;
  settings.m = 3;
  settings.d = 2;
  settings.pins = {Pin::kClkfx, Pin::kClk0, Pin::kClkfx};
  const Answer answer =
      MadeKru(request, settings, {Rational(3, 2), 1, Rational(3, 2)}, std::nullopt);
  const std::string text = Sdc(request, MadeDevice(), answer);
  EXPECT_NE(text.find("# vk40b484-2 KRU_SP: CLKIN_DIVIDE_BY_2 false, M 3, D 2, phase offset 0 "
                      "degrees,\n#   PHASE_SHIFT 0\n"),
            std::string::npos)
      << text;
  EXPECT_NE(Clock(text, "clk_out0").find("[get_pins $primitive/CLKFX]"), std::string::npos);
  EXPECT_EQ(Clock(text, "clk_out2"), "none");
  EXPECT_NE(text.find("\n# Output 2 is on the pin CLKFX, too: its clock is clk_out0.\n"),
            std::string::npos);
  EXPECT_NE(text.find("; jitter unknown\n"), std::string::npos);
  EXPECT_EQ(text.find("uncertainty 0"), std::string::npos);
}

TEST(Sdc, WhatIsOffIsTold) {
  Request request = MadeRequest({100}, {333});
  request.outputs[0].phase = 10;
  Answer answer = MadeLoop(request, Primitive::kPll, Bandwidth::kHigh, 80, 1, {24}, 144);
  answer.outputs[0].phase = 15;
  answer.outputs[0].phase_error = 5;
  Miss(&answer, 0, Quantity::kPhase, 5, Rational(1, 2));
  Break(&answer, Outside(Quantity::kVco, -1, 0, 1000, {400, 900}));
  const std::string text = Sdc(request, MadeDevice(), answer);
  EXPECT_NE(
      text.find("# OFF: not everything is as asked for, or in the device's range.\n"
                "# OFF: the VCO is at 1000 MHz, outside the device's range of 400 to 900 MHz\n"),
      std::string::npos)
      << text;
  EXPECT_NE(text.find("phase 15 degrees, 10 asked for, 5 off; duty 50 percent; jitter 144 ps\n"
                      "#   peak to peak; OFF\n"),
            std::string::npos)
      << text;
}

}  // namespace
}  // namespace planner::report
