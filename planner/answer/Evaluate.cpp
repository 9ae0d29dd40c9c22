// Tested by evaluate_loop_test.cpp and evaluate_kru_test.cpp.
#include "planner/answer/Evaluate.h"

#include <algorithm>
#include <utility>

#include "planner/answer/Corners.h"
#include "planner/answer/Demands.h"
#include "planner/answer/Jitter.h"
#include "planner/answer/Judge.h"
#include "planner/answer/Margin.h"

namespace planner::answer {

namespace {

Finding Miss(Primitive primitive, int index, Quantity quantity, Rational error, Rational allowed) {
  return {.kind = FindingKind::kOffTarget,
          .primitive = primitive,
          .quantity = quantity,
          .output = index,
          .value = std::move(error),
          .range = {0, std::move(allowed)}};
}

// What is told of all outputs together.
void Sum(const Request& request, Answer* answer) {
  answer->within = answer->violations.empty();
  double jitter = 0;
  bool is_known = true;
  for (std::size_t i = 0; i < answer->outputs.size(); ++i) {
    const OutputAnswer& output = answer->outputs[i];
    if (!output.used) continue;
    answer->violations.insert(answer->violations.end(), output.violations.begin(),
                              output.violations.end());
    answer->within = answer->within && output.IsWithin();
    answer->worst_ppm = std::max(answer->worst_ppm, output.error_ppm.Absolute());
    const Errors errors = {output.error_ppm, output.phase_error, output.duty_error};
    answer->worst_error = std::max(
        {answer->worst_error, WorstError(request, request.outputs[i], errors),
         JitterError(request, request.outputs[i], output.jitter.value_or(kUnknownJitter))});
    is_known = is_known && output.jitter.has_value();
    jitter = std::max(jitter, output.jitter.value_or(0));
  }
  if (is_known) answer->max_jitter = jitter;
}

void AddSearched(const Searched& searched, Answer* answer) {
  answer->searched_vco = searched.vco;
  const std::size_t count = std::min(searched.outputs.size(), answer->outputs.size());
  for (std::size_t i = 0; i < count; ++i) answer->outputs[i].searched = searched.outputs[i];
}

}  // namespace

Rational Hold(const Rational& value, const Rational& tolerance, const Range& range,
              const Finding& finding, std::vector<Finding>* violations) {
  const Range narrowed = Narrowed(range, tolerance);
  const auto add = [&](const Rational& corner) {
    Finding broken = finding;
    broken.kind = FindingKind::kOutsideLimit;
    broken.corner = corner;
    broken.value = value * CornerFactor(corner);
    broken.range = range;
    violations->push_back(std::move(broken));
  };
  if (tolerance == Rational(0)) {
    if (!range.Contains(value)) add(0);
  } else {
    if (value < narrowed.lowest) add(-tolerance);
    if (value > narrowed.highest) add(tolerance);
  }
  return MarginOf(value, narrowed);
}

void Lower(const Rational& margin, std::optional<Rational>* smallest) {
  if (!*smallest || margin < **smallest) *smallest = margin;
}

void JudgeOutput(const Request& request, Primitive primitive, int index, OutputAnswer* output) {
  const Output& asked = request.outputs[static_cast<std::size_t>(index)];
  Errors errors = ErrorsOf(asked, output->frequency, output->phase, output->duty);
  const auto judge = [&](Quantity quantity, const Rational& error, const Rational& allowed) {
    if (error.Absolute() <= allowed) return;
    output->misses.push_back(Miss(primitive, index, quantity, error, allowed));
  };
  judge(Quantity::kFrequency, errors.ppm, request.ToleranceOf(asked));
  if (errors.phase) judge(Quantity::kPhase, *errors.phase, request.PhaseToleranceOf(asked));
  if (errors.duty) judge(Quantity::kDuty, *errors.duty, request.DutyToleranceOf(asked));
  if (!IsJitterMet(request, asked, output->jitter.value_or(kUnknownJitter))) {
    output->misses.push_back(Miss(primitive, index, Quantity::kJitter,
                                  Rational::FromDouble(output->jitter.value_or(0)),
                                  *request.MaxJitterOf(asked)));
  }
  output->error_ppm = std::move(errors.ppm);
  output->phase_error = std::move(errors.phase);
  output->duty_error = std::move(errors.duty);
}

Answer Evaluate(const Request& request, const Device& device, const Settings& settings,
                const Source& source, const Searched& searched) {
  Answer answer;
  answer.primitive = PrimitiveOf(settings);
  answer.source = source;
  answer.solved = true;
  answer.settings = settings;
  answer.outputs.resize(request.outputs.size());
  for (std::size_t i = 0; i < request.outputs.size(); ++i) {
    answer.outputs[i].used = request.outputs[i].used;
  }
  if (const auto* const loop = std::get_if<LoopSettings>(&settings)) {
    JudgeLoop(request, device, *loop, &answer);
  } else {
    JudgeKru(request, device, std::get<KruSettings>(settings), &answer);
  }
  Sum(request, &answer);
  AddSearched(searched, &answer);
  std::vector<Finding> notes = NotesOn(request, answer);
  answer.notes.insert(answer.notes.begin(), notes.begin(), notes.end());
  return answer;
}

Answer Unsolved(Primitive primitive, const Source& source, std::vector<Finding> refusals) {
  Answer answer;
  answer.primitive = primitive;
  answer.source = source;
  answer.refusals = std::move(refusals);
  return answer;
}

std::vector<Finding> Refusals(const Request& request, Primitive primitive) {
  std::vector<Finding> refusals;
  const auto judge = [&](FindingKind kind, std::size_t count, int most) {
    const auto number = static_cast<std::int64_t>(count);
    if (number <= most) return;
    refusals.push_back({.kind = kind, .primitive = primitive, .value = number, .range = {1, most}});
  };
  judge(FindingKind::kTooManyInputs, request.inputs.size(), hardware::MostInputs(primitive));
  // A loop has an output for each place; the pins of a KRU go to those that are used.
  const std::size_t outputs =
      hardware::IsLoop(primitive) ? request.outputs.size() : request.CountOfUsed();
  judge(FindingKind::kTooManyOutputs, outputs, hardware::MostOutputs(primitive));
  return refusals;
}

}  // namespace planner::answer
