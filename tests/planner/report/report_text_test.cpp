#include <gtest/gtest.h>

#include "made.h"
#include "planner/report/ReportText.h"
#include "planner/report/SettingsText.h"

namespace planner::report {
namespace {

std::string Text(const Request& request, const Answer& answer, bool colour = false) {
  return ReportText(request, MadeDevice(), answer, {.colour = colour});
}

TEST(ReportText, ALoopWithAllAsAskedFor) {
  const Request request = VideoRequest();
  EXPECT_EQ(Text(request, VideoAnswer(request)),
            "device        vk40b484-2 TSYN\n"
            "input         27 MHz\n"
            "VCO           1188 MHz\n"
            "PFD           27 MHz\n"
            "M             44\n"
            "D             1\n"
            "bandwidth     HIGH\n"
            "input jitter  0 ps\n"
            "phase error   77.037 ps\n"
            "\n"
            "output  divider  requested MHz  actual MHz  error ppm  jitter ps\n"
            "     0        8     148.500000  148.500000       0.00    128.815\n"
            "     1       16      74.250000   74.250000       0.00    128.815\n"
            "     2       44      27.000000   27.000000       0.00    128.815\n");
}

// 100 x 10 / 3 is 333.333333, 1001.00 ppm above 333; the engine has counted with 333.167.
TEST(ReportText, AFrequencyThatIsOffIsMarkedAndToldBelow) {
  const Request request = MadeRequest({100}, {333});
  Answer answer = MadeLoop(request, Primitive::kPll, Bandwidth::kOptimized, 80, 1, {24}, 144);
  Miss(&answer, 0, Quantity::kFrequency, answer.outputs[0].error_ppm, 100);
  answer.searched_vco = 999.501;
  answer.notes.push_back(
      {.kind = FindingKind::kSearchedFrequencies, .numbers = {Rational(333167, 1000)}});
  EXPECT_EQ(Text(request, answer),
            "device        vk40b484-2 PLL\n"
            "input         100 MHz\n"
            "VCO           1000 MHz (the search took it as 999.501)\n"
            "PFD           100 MHz\n"
            "M             10\n"
            "D             1\n"
            "bandwidth     OPTIMIZED\n"
            "input jitter  0 ps\n"
            "phase error   77.037 ps\n"
            "\n"
            "output  divider  requested MHz  actual MHz  error ppm  jitter ps  mark\n"
            "     0        3     333.000000  333.333333    1001.00    144.000  OFF\n"
            "\n"
            "note: output 0: the frequency is off by 1001.00 ppm, with 100 allowed\n"
            "note: the search counted with 333.167 MHz, which M and D do not make\n");
}

TEST(ReportText, ColoursTellWhatIsOff) {
  const Request request = MadeRequest({100}, {333});
  Answer answer = MadeLoop(request, Primitive::kPll, Bandwidth::kOptimized, 80, 1, {24}, 144);
  Miss(&answer, 0, Quantity::kFrequency, answer.outputs[0].error_ppm, 100);
  const std::string text = Text(request, answer, true);
  EXPECT_NE(text.find("\033[1moutput  divider"), std::string::npos);
  EXPECT_NE(text.find("\n\033[31m\033[1m     0        3"), std::string::npos);
  EXPECT_NE(text.find("\n\033[33mnote: output 0: the frequency is off by 1001.00 ppm, with 100 "
                      "allowed\033[0m\n"),
            std::string::npos);
}

// From 25 MHz x 20 / 2 the outputs are 250 and 125 MHz, from 50 MHz twice that.
TEST(ReportText, WhatASecondInputMakes) {
  const Request request = MadeRequest({25, 50}, {250, 125});
  Answer answer = MadeLoop(request, Primitive::kPll, Bandwidth::kHigh, 160, 1, {16, 32}, 90);
  Break(&answer, Outside(Quantity::kFrequency, 0, 1, 500, {3, 400}));
  answer.notes.push_back({.kind = FindingKind::kSearchedVco, .value = Rational(5001, 10)});
  answer.searched_vco = 500.1;
  EXPECT_EQ(Text(request, answer),
            "device        vk40b484-2 PLL\n"
            "input         25 MHz, with the second input 50 MHz\n"
            "VCO           500 MHz, with the second input 1000 MHz\n"
            "PFD           25 MHz, with the second input 50 MHz\n"
            "M             20\n"
            "D             1\n"
            "bandwidth     HIGH\n"
            "input jitter  0 ps\n"
            "phase error   77.037 ps\n"
            "\n"
            "output  divider  requested MHz  actual MHz  error ppm  jitter ps\n"
            "     0        2     250.000000  250.000000       0.00     90.000\n"
            "     1        4     125.000000  125.000000       0.00     90.000\n"
            "\n"
            "output  MHz with the second input  mark\n"
            "     0                 500.000000  OFF\n"
            "     1                 250.000000\n"
            "\n"
            "note: output 0 with the second input is at 500 MHz, outside the device's range\n"
            "  of 3 to 400 MHz\n"
            "note: the search took the VCO as 500.100 MHz\n");
}

TEST(ReportText, PhasesAndDutyCyclesHaveATableOfTheirOwn) {
  Request request = MadeRequest({100}, {200, 100});
  request.outputs[0].phase = -90;
  request.outputs[1].duty = 30;
  Answer answer = MadeLoop(request, Primitive::kPll, Bandwidth::kHigh, 80, 1, {40, 80}, 90);
  answer.outputs[0].phase = -90;
  answer.outputs[0].phase_error = 0;
  answer.outputs[1].duty = 35;
  answer.outputs[1].duty_error = 5;
  Miss(&answer, 1, Quantity::kDuty, 5, Rational(1, 2));
  const std::string text = Text(request, answer);
  EXPECT_NE(text.find("\n\noutput  divider  requested MHz  actual MHz  error ppm  jitter ps\n"
                      "     0        5     200.000000  200.000000       0.00     90.000\n"
                      "     1       10     100.000000  100.000000       0.00     90.000\n"
                      "\n"
                      "output  phase deg  actual deg  error deg  duty %  actual %  error points  "
                      "mark\n"
                      "     0    -90.000     -90.000      0.000       -    50.000             -\n"
                      "     1          -       0.000          -  30.000    35.000         5.000  "
                      "OFF\n"
                      "\nnote: output 1: the duty cycle is off by 5.00 percent points, with 0.5 "
                      "allowed\n"),
            std::string::npos)
      << text;
}

TEST(ReportText, AnUnknownJitterHasNoColumn) {
  const Request request = VideoRequest();
  const Answer answer = MadeLoop(request, Primitive::kTsyn, Bandwidth::kHigh, 44 * 8, 1,
                                 {64, 128, 352}, std::nullopt);
  const std::string text = Text(request, answer);
  EXPECT_NE(text.find("D       1\n\noutput  divider  requested MHz  actual MHz  error ppm\n"),
            std::string::npos)
      << text;
  EXPECT_EQ(text.find("jitter"), std::string::npos);
}

TEST(ReportText, AJitterAboveWhatIsAllowedMarksTheRow) {
  const Request request = MadeRequest({100}, {100});
  Answer answer = MadeLoop(request, Primitive::kPll, Bandwidth::kHigh, 80, 1, {80}, 144);
  Miss(&answer, 0, Quantity::kJitter, 144, 100);
  EXPECT_NE(Text(request, answer)
                .find("0.00    144.000  OFF\n\nnote: output 0: the jitter is "
                      "144.000 ps, with 100 allowed\n"),
            std::string::npos);
}

KruSettings Shifted() {
  KruSettings settings;
  settings.primitive = Primitive::kKruSp;
  settings.feedback = true;
  settings.phase_shift = 32;
  settings.pins = {Pin::kClk0, Pin::kClk90};
  return settings;
}

// 32 of 255 steps are 45.176 degrees.
// Periods of 200, 100 and 50 MHz: 5000, 10000 and 20000 ps.
TEST(ReportText, AJitterAboveThePeriodIsTold) {
  const Request request = MadeRequest({100}, {200, 100, 50});
  const auto text_with = [&](double jitter) {
    return Text(request, MadeLoop(request, Primitive::kPll, Bandwidth::kOptimized, 80, 1,
                                  {40, 80, 160}, jitter));
  };
  EXPECT_EQ(text_with(5000).find("above the period"), std::string::npos);
  EXPECT_NE(text_with(5001).find("\nnote: output 0: the jitter is above the period of the clock\n"),
            std::string::npos);
  EXPECT_NE(
      text_with(10001)
          .find("\nnote: outputs 0 and 1: the jitter is above the period of the clock\n"),
      std::string::npos);
}

TEST(ReportText, AKruWithAPhaseShift) {
  Request request = MadeRequest({100}, {100, 100});
  request.outputs[0].phase = 45;
  request.outputs[1].phase = 135;
  Answer answer = MadeKru(request, Shifted(), {1, 1}, 180);
  const Rational made = Rational(32) * 360 / 255;
  for (std::size_t i = 0; i < 2; ++i) {
    answer.outputs[i].phase = made + Rational(i == 0 ? 0 : 90);
    answer.outputs[i].phase_error = made - 45;
  }
  EXPECT_EQ(Text(request, answer),
            "device             vk40b484-2 KRU_SP\n"
            "input              100 MHz\n"
            "CLKIN_DIVIDE_BY_2  false\n"
            "phase offset       45 degrees\n"
            "PHASE_SHIFT        32 (45.176 degrees)\n"
            "phase error        150.000 ps\n"
            "\n"
            "output  pin    requested MHz  actual MHz  error ppm  jitter ps\n"
            "     0  CLK0      100.000000  100.000000       0.00    180.000\n"
            "     1  CLK90     100.000000  100.000000       0.00    180.000\n"
            "\n"
            "output  phase deg  actual deg  error deg\n"
            "     0     45.000      45.176      0.176\n"
            "     1    135.000     135.176      0.176\n");
}

TEST(ReportText, SettingsThatNoPinUsesAreLeftOut) {
  const Request request = MadeRequest({100}, {160, 40});
  KruSettings settings;
  settings.primitive = Primitive::kKruClkgen;
  settings.m = 8;
  settings.d = 5;
  settings.divide_halves = 8;
  settings.pins = {Pin::kClkfx, Pin::kClkfxdv};
  const Answer answer = MadeKru(request, settings, {Rational(8, 5), Rational(2, 5)}, 180);
  EXPECT_EQ(Text(request, answer).substr(0, 128),
            "device       vk40b484-2 KRU_CLKGEN\n"
            "input        100 MHz\n"
            "M            8\n"
            "D            5\n"
            "CLKFXDV      4\n"
            "phase error  150.000 ps\n"
            "\n"
            "ou");
}

TEST(ReportText, AnOutputThatIsNotUsedHasNoRow) {
  Request request = MadeRequest({100}, {200, 50, 100});
  request.outputs[1].used = false;
  Answer answer = MadeLoop(request, Primitive::kPll, Bandwidth::kHigh, 80, 1, {40, 160, 80}, 90);
  answer.outputs[1] = {};
  answer.outputs[1].used = false;
  EXPECT_NE(Text(request, answer)
                .find("jitter ps\n"
                      "     0        5     200.000000  200.000000       0.00     90.000\n"
                      "     2       10     100.000000  100.000000       0.00     90.000\n"),
            std::string::npos);
}

// The outputs of the answer are at places; which of the request they are, the note tells.
TEST(ReportText, OutputsThatHaveChangedPlaces) {
  const Request request = MadeRequest({100}, {100, 500});
  const Request placed = MadeRequest({100}, {500, 100});
  Answer answer = MadeLoop(placed, Primitive::kPll, Bandwidth::kHigh, 80, 1, {16, 80}, 90);
  answer.notes.push_back({.kind = FindingKind::kMoved, .outputs = {1, 0}});
  const std::string text = Text(request, answer);
  EXPECT_NE(text.find("     0        2     500.000000  500.000000       0.00     90.000\n"
                      "     1       10     100.000000  100.000000       0.00     90.000\n"
                      "\nnote: outputs have changed places: output 0 is what was asked for as "
                      "output 1\n"),
            std::string::npos)
      << text;
}

TEST(SettingsText, ThePhaseOffsetIsTheTurnNextToTheShift) {
  Request request = MadeRequest({100}, {100, 100});
  Answer answer = MadeKru(request, Shifted(), {1, 1}, 180);
  // Nothing is asked for: it is what the shift makes.
  EXPECT_EQ(PhaseOffset(request, answer), Rational(32) * 360 / 255);
  request.outputs[1].phase = -225;  // 135 degrees, 45 of them beyond the pin
  EXPECT_EQ(PhaseOffset(request, answer), Rational(45));
}

TEST(SettingsText, SettingsInOneLine) {
  const Request request = VideoRequest();
  EXPECT_EQ(SettingsWords(VideoAnswer(request).settings), "M 44, D 1 and dividers 8, 16 and 44");
  KruSettings settings = Shifted();
  settings.m = 3;
  settings.d = 2;
  settings.divide_by_2 = true;
  settings.divide_halves = 5;
  settings.pins = {Pin::kClkfx, Pin::kClkdv};
  EXPECT_EQ(SettingsWords(settings),
            "CLKIN_DIVIDE_BY_2, M 3, D 2, CLKDV 2.5, PHASE_SHIFT 32, pins CLKFX and CLKDV");
}

}  // namespace
}  // namespace planner::report
