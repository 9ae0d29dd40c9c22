// A run for a KRU_SP or a KRU_CLKGEN.
//
// Tested by run_test.cpp.
#include <algorithm>
#include <cmath>
#include <stdexcept>

#include "engine/ResultTexts.h"
#include "hardware/Kru.h"
#include "planner/engine/Object.h"
#include "planner/engine/Run.h"

namespace planner::engine {
namespace {

using hardware::Pin;
using hardware::PinSource;

bool IsUsed(const std::vector<Pin>& pins, std::initializer_list<PinSource> sources) {
  return std::any_of(pins.begin(), pins.end(), [&sources](Pin pin) {
    return pin != Pin::kNone && std::find(sources.begin(), sources.end(),
                                          hardware::FactsOf(pin).source) != sources.end();
  });
}

// What is chosen, without what no output uses.
KruSettings Chosen(const Ip::VorkelImp& object, const Request& request, Primitive primitive,
                   const Variant& variant) {
  KruSettings settings;
  settings.primitive = primitive;
  settings.pins.resize(request.outputs.size(), Pin::kNone);
  std::size_t n = 0;
  for (const std::size_t index : UsedOutputs(request)) {
    settings.pins[index] = static_cast<Pin>(object.kru._kruChosenPin[n++]);
  }
  if (IsUsed(settings.pins, {PinSource::kSynthesiser, PinSource::kDividedSynthesiser})) {
    settings.m = object.GetKruChosenM();
    settings.d = object.GetKruChosenD();
  }
  if (IsUsed(settings.pins, {PinSource::kDivider, PinSource::kDividedSynthesiser})) {
    settings.divide_halves = static_cast<int>(std::lround(2 * object.GetKruChosenClkdv()));
  }
  if (primitive == Primitive::kKruSp) {
    settings.feedback = variant.feedback;
    settings.divide_by_2 = object.GetKruChosenDivBy2();
    settings.phase_shift = object.GetKruChosenPhaseShift();
  }
  return settings;
}

}  // namespace

Outcome RunKru(const Request& request, const Device& device, Primitive primitive,
               const Variant& variant, const std::vector<double>& phases, bool trace) {
  const auto object = MakeObject(device);
  const bool is_clkgen = primitive == Primitive::kKruClkgen;
  const std::vector<double> frequencies = Frequencies(request);
  std::vector<double> used_phases;
  for (const std::size_t index : UsedOutputs(request)) used_phases.push_back(phases[index]);
  const int count = static_cast<int>(frequencies.size());
  const double input = request.inputs[0].ToDouble();
  const int code = is_clkgen ? object->KruClkgenCalculateActuals(
                                   ListOf(frequencies), ListOf(used_phases), input, count, trace)
                             : object->KruCalculateActuals(ListOf(frequencies), ListOf(used_phases),
                                                           input, count, variant.feedback, trace);
  if (code == Ip::Kru::kNoSpeedData) {
    throw std::logic_error("The engine cannot read the limits of a primitive that is there.");
  }
  if (code != Ip::Kru::kSolved) return Refused{Ip::KruResultText(is_clkgen, code, count)};
  return Found{Chosen(*object, request, primitive, variant), {}};
}

}  // namespace planner::engine
