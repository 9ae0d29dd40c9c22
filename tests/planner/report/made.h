// Requests, devices and answers that are made by hand, with round figures.
#ifndef VORKEL_TESTS_PLANNER_REPORT_MADE_H_
#define VORKEL_TESTS_PLANNER_REPORT_MADE_H_

#include <algorithm>
#include <cstddef>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "planner/Answer.h"
#include "planner/Device.h"
#include "planner/Request.h"
#include "planner/plan/Plan.h"

namespace planner::report {

using hardware::Pin;

// vk40b484-2: VCO 600 to 1440, PFD 10 to 500 and with LOW 300, outputs 5 to 800 MHz. Pins of the
// KRUs go from 5 to 400, with feedback from CLK2X to 200 MHz.
inline Device MadeDevice() {
  Device device;
  device.name = "vk40";
  device.package = "b484";
  device.grade = "2";
  device.part = "vk40b484-2";
  device.primitives = {Primitive::kPll, Primitive::kTsyn, Primitive::kKruSp, Primitive::kKruClkgen};
  device.pll = LoopLimits{{400, 1080}, {19, 500}, {19, 300}, {3, 400}, {3, 1080}, 64, 0};
  device.tsyn = LoopLimits{{600, 1440}, {10, 500}, {10, 300}, {5, 800}, {5, 800}, 64, 1000};
  PinLimits pins;
  for (const hardware::PinFacts& facts : hardware::kPins) {
    pins.usual[std::string(facts.limits)] = {5, 400};
    pins.doubled[std::string(facts.limits)] = {5, 200};
  }
  device.kru_sp = pins;
  device.kru_clkgen = pins;
  device.has_loop_jitter = true;
  device.has_kru_jitter = true;
  return device;
}

inline Request MadeRequest(std::vector<Rational> inputs, const std::vector<Rational>& outputs) {
  Request request;
  request.inputs = std::move(inputs);
  for (const Rational& frequency : outputs) {
    Output output;
    output.frequency = frequency;
    request.outputs.push_back(output);
  }
  return request;
}

// An output as it comes from the first input by a ratio, with the error of a request's frequency.
inline OutputAnswer MadeOutput(const Request& request, std::size_t index, const Rational& ratio,
                               std::optional<double> jitter) {
  OutputAnswer output;
  output.ratio = ratio;
  output.frequency = request.inputs[0] * ratio;
  if (request.inputs.size() > 1) output.frequency_second = request.inputs[1] * ratio;
  const Rational& requested = request.outputs[index].frequency;
  output.error_ppm = (output.frequency - requested) / requested * 1000000;
  output.phase = 0;
  output.duty = 50;
  output.jitter = jitter;
  if (jitter) output.jitter_rms = (*jitter - 20) / 14;
  return output;
}

// Takes the errors together as if nothing was missed.
inline void SumUp(Answer* answer) {
  answer->within = true;
  answer->max_jitter = 0;
  for (const OutputAnswer& output : answer->outputs) {
    if (!output.used) continue;
    answer->worst_ppm = std::max(answer->worst_ppm, output.error_ppm.Absolute());
    if (!output.jitter) answer->max_jitter = std::nullopt;
    if (answer->max_jitter) answer->max_jitter = std::max(*answer->max_jitter, *output.jitter);
  }
  answer->worst_error = answer->worst_ppm / 100;
}

// A PLL or a TSYN with M and dividers in eighths.
inline Answer MadeLoop(const Request& request, Primitive primitive, Bandwidth bandwidth, int m,
                       int d, const std::vector<int>& dividers, std::optional<double> jitter) {
  Answer answer;
  answer.primitive = primitive;
  answer.source = {.engine = false, .search = true};
  answer.solved = true;
  LoopSettings settings;
  settings.primitive = primitive;
  settings.bandwidth = bandwidth;
  settings.m = m;
  settings.d = d;
  answer.vco = request.inputs[0] * Rational(m, 8) / d;
  answer.pfd = request.inputs[0] / d;
  for (std::size_t i = 0; i < dividers.size(); ++i) {
    settings.outputs.push_back({dividers[i], 0, dividers[i] / 8});
    answer.outputs.push_back(
        MadeOutput(request, i, Rational(m, 8) / d / Rational(dividers[i], 8), jitter));
  }
  answer.settings = settings;
  answer.phase_error = jitter ? std::optional<double>(77.037) : std::nullopt;
  SumUp(&answer);
  return answer;
}

// A KRU with the ratio of each pin.
inline Answer MadeKru(const Request& request, KruSettings settings,
                      const std::vector<Rational>& ratios, std::optional<double> jitter) {
  Answer answer;
  answer.primitive = settings.primitive;
  answer.source = {.engine = false, .search = true};
  answer.solved = true;
  for (std::size_t i = 0; i < ratios.size(); ++i) {
    answer.outputs.push_back(MadeOutput(request, i, ratios[i], jitter));
  }
  answer.settings = std::move(settings);
  answer.phase_error = 150;
  SumUp(&answer);
  return answer;
}

// What an output misses.
inline void Miss(Answer* answer, int output, Quantity quantity, const Rational& error,
                 const Rational& allowed) {
  answer->outputs[static_cast<std::size_t>(output)].misses.push_back(
      {.kind = FindingKind::kOffTarget,
       .primitive = answer->primitive,
       .quantity = quantity,
       .output = output,
       .value = error,
       .range = {0, allowed}});
  answer->within = false;
}

// A frequency that is out of its range: that of an output, or of VCO or PFD with output -1.
inline Finding Outside(Quantity quantity, int output, int input, const Rational& value,
                       const Range& range) {
  return {.kind = FindingKind::kOutsideLimit,
          .quantity = quantity,
          .output = output,
          .input = input,
          .value = value,
          .range = range};
}

inline void Break(Answer* answer, const Finding& violation) {
  if (violation.output >= 0) {
    answer->outputs[static_cast<std::size_t>(violation.output)].violations.push_back(violation);
  }
  answer->violations.push_back(violation);
  answer->within = false;
}

// 27 MHz to 148.5, 74.25 and 27 MHz: 27 x 44 is 1188, and that divided by 8, 16 and 44.
inline Request VideoRequest() {
  return MadeRequest({27}, {Rational(297, 2), Rational(297, 4), 27});
}
inline Answer VideoAnswer(const Request& request) {
  return MadeLoop(request, Primitive::kTsyn, Bandwidth::kHigh, 44 * 8, 1, {64, 128, 352}, 128.815);
}

inline Answer Refused(Primitive primitive, const std::string& sentence) {
  Answer answer;
  answer.primitive = primitive;
  answer.refusals = {{.kind = FindingKind::kUnsolved, .primitive = primitive, .text = sentence}};
  return answer;
}

}  // namespace planner::report

#endif  // VORKEL_TESTS_PLANNER_REPORT_MADE_H_
