// Requests, settings and a device with round limits, made by hand.
#ifndef VORKEL_TESTS_PLANNER_ANSWER_ANSWER_SUPPORT_H_
#define VORKEL_TESTS_PLANNER_ANSWER_ANSWER_SUPPORT_H_

#include <initializer_list>
#include <optional>
#include <utility>
#include <vector>

#include "planner/Answer.h"
#include "planner/Device.h"
#include "planner/Request.h"
#include "planner/Settings.h"

namespace planner::answer_test {

using hardware::Pin;

// A device with all four primitives and no coefficients, MHz:
//   PLL   VCO 400 to 1080, PFD 19 to 500 (LOW: 300), outputs 3 to 400, output 1 to 1080
//   TSYN  VCO 600 to 1440, PFD 10 to 500 (LOW: 250), outputs 4 to 800
//   both  high and low times up to 60
//   KRU   CLK0 5 to 300 (150), CLK90 5 to 250 (120), CLKDV 1/4 to 200 (160), CLK2X 10 to 400,
//         CLKFX 5 to 400, CLKFXDV 1/8 to 200; in brackets with feedback from CLK2X
inline Device HandMade() {
  Device device;
  device.name = "hand";
  device.part = "hand-1";
  device.primitives.assign(hardware::kPrimitives.begin(), hardware::kPrimitives.end());
  device.pll = LoopLimits{.vco = {400, 1080},
                          .pfd = {19, 500},
                          .pfd_low = {19, 300},
                          .output = {3, 400},
                          .output_1 = {3, 1080},
                          .max_count = 60,
                          .vco_target = 0};
  device.tsyn = LoopLimits{.vco = {600, 1440},
                           .pfd = {10, 500},
                           .pfd_low = {10, 250},
                           .output = {4, 800},
                           .output_1 = {4, 800},
                           .max_count = 60,
                           .vco_target = 1000};
  device.kru_sp = PinLimits{.usual = {{"CLK0", {5, 300}},
                                      {"CLK90", {5, 250}},
                                      {"CLKDV", {Rational(1, 4), 200}},
                                      {"CLK2X", {10, 400}},
                                      {"CLKFX", {5, 400}}},
                            .doubled = {{"CLK0", {5, 150}},
                                        {"CLK90", {5, 120}},
                                        {"CLKDV", {Rational(1, 4), 160}},
                                        {"CLK2X", {10, 400}},
                                        {"CLKFX", {5, 400}}}};
  device.kru_clkgen = PinLimits{
      .usual = {{"CLKFX", {5, 400}}, {"CLKFXDV", {Rational(1, 8), 200}}},
      .doubled = {{"CLKFX", {5, 400}}, {"CLKFXDV", {Rational(1, 8), 200}}}};
  return device;
}

inline Output Frequency(Rational frequency) {
  Output output;
  output.frequency = std::move(frequency);
  return output;
}
inline Output Unused() {
  Output output;
  output.used = false;
  return output;
}

inline Request Ask(std::vector<Rational> inputs, std::vector<Rational> outputs) {
  Request request;
  request.inputs = std::move(inputs);
  for (Rational& output : outputs) request.outputs.push_back(Frequency(std::move(output)));
  return request;
}

// M and D, and whole dividers.
inline LoopSettings Loop(Primitive primitive, int m, int d, std::initializer_list<int> dividers,
                         Bandwidth bandwidth = Bandwidth::kOptimized) {
  LoopSettings settings;
  settings.primitive = primitive;
  settings.bandwidth = bandwidth;
  settings.m = m * hardware::kEighths;
  settings.d = d;
  for (const int divider : dividers) {
    settings.outputs.push_back({.divider = divider * hardware::kEighths});
  }
  return settings;
}

// One part in 10^30 of a value.
inline Rational Sliver(const Rational& value) {
  return value * Rational::FromDecimal("1", -30);
}

}  // namespace planner::answer_test

#endif  // VORKEL_TESTS_PLANNER_ANSWER_ANSWER_SUPPORT_H_
