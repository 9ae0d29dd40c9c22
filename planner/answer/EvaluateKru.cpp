// What the settings of a KRU make.
//
// Tested by evaluate_kru_test.cpp.
#include <cstddef>
#include <optional>
#include <string>
#include <utility>

#include "hardware/Kru.h"
#include "planner/answer/Jitter.h"
#include "planner/answer/Judge.h"

namespace planner::answer {

namespace {

// The range of a pin, and what to say of it. The feedback is taken from output 0: when that is on
// CLK2X, some pins have another range.
struct PinRange {
  Range range;
  bool feedback_2x = false;  // and it is not the usual one
};

PinRange RangeOf(const PinLimits& limits, const KruSettings& settings, hardware::Pin pin) {
  const bool doubled = !settings.pins.empty() && settings.pins[0] == hardware::Pin::kClk2x;
  const Range& range = limits.Of(pin, doubled);
  return {range, doubled && range != limits.Of(pin, false)};
}

void HoldOutput(const Request& request, const Device& device, const KruSettings& settings,
                std::size_t index, OutputAnswer* output, std::optional<Rational>* margin) {
  const hardware::Pin pin = settings.pins[index];
  const PinRange limit = RangeOf(device.Pins(settings.primitive), settings, pin);
  std::optional<Rational> own;
  for (std::size_t i = 0; i < request.inputs.size(); ++i) {
    const Finding about = {.kind = FindingKind::kOutsideLimit,
                           .primitive = settings.primitive,
                           .quantity = Quantity::kFrequency,
                           .output = static_cast<int>(index),
                           .input = static_cast<int>(i),
                           .pin = std::string(hardware::FactsOf(pin).name),
                           .feedback_2x = limit.feedback_2x};
    Lower(Hold(request.inputs[i] * output->ratio, request.input_tolerance, limit.range, about,
               &output->violations),
          &own);
  }
  output->margin = *own;
  Lower(*own, margin);
}

void AddJitter(const Request& request, const Device& device, const KruSettings& settings,
               const KruJitter& model, std::size_t index, OutputAnswer* output,
               MissingFigures* missing) {
  const hardware::Pin pin = settings.pins[index];
  const double jitter = model.PeakToPeak(settings, pin);
  if (jitter != kUnknownJitter) {
    output->jitter = jitter;
    output->jitter_rms = model.Rms(settings, pin);
    return;
  }
  missing->AddJitter(static_cast<int>(index),
                     KruJitterRefusal(device, request, settings, pin).value_or(std::string()));
}

}  // namespace

void JudgeKru(const Request& request, const Device& device, const KruSettings& settings,
              Answer* answer) {
  const KruJitter model(device, request, settings.primitive);
  std::optional<Rational> margin;
  MissingFigures missing;
  std::size_t used = 0;
  for (std::size_t i = 0; i < answer->outputs.size(); ++i) {
    if (!request.outputs[i].used) continue;
    ++used;
    const hardware::Pin pin = settings.pins[i];
    OutputAnswer& output = answer->outputs[i];
    output.ratio = hardware::PinRatio(pin, settings.Ratios());
    output.frequency = request.inputs[0] * output.ratio;
    if (request.inputs.size() > 1) output.frequency_second = request.inputs[1] * output.ratio;
    output.phase = hardware::PinPhase(pin, settings.phase_shift);
    output.duty = hardware::PinDuty(pin, settings.divide_halves);
    HoldOutput(request, device, settings, i, &output, &margin);
    AddJitter(request, device, settings, model, i, &output, &missing);
    JudgeOutput(request, settings.primitive, static_cast<int>(i), &output);
  }
  if (const Refusal refusal = KruPhaseErrorRefusal(device)) {
    missing.AddPhaseError(*refusal);
  } else {
    answer->phase_error = model.PhaseError();
  }
  if (margin) answer->margin = *margin;
  missing.Note(settings.primitive, used, &answer->notes);
}

}  // namespace planner::answer
