#include "cli/ExplainCommand.h"

#include <optional>

#include "cli/Call.h"
#include "cli/Failure.h"
#include "planner/explain/Explain.h"
#include "planner/read/Units.h"
#include "planner/report/ExplainText.h"

namespace cli {

namespace {

using planner::Rational;

// The input frequencies to try that the user names.
std::optional<std::vector<Rational>> OwnInputs(const Given& given) {
  const std::optional<std::string> list = given.Value("--oscillators");
  if (!list) return std::nullopt;
  planner::read::Place place;
  place.entry = "--oscillators";
  planner::read::Mistakes mistakes;
  const auto values = planner::read::ReadValues(*list, planner::read::ValueKind::kFrequency, place,
                                                false, &mistakes);
  if (!values) Refuse(mistakes);
  std::vector<Rational> inputs;
  for (const auto& value : *values) inputs.push_back(*value);
  return inputs;
}

std::string InFormat(const Call& call, const planner::explain::Explanation& explanation,
                     bool own_inputs, const Setting& setting) {
  if (call.format == Format::kJson) return planner::report::ExplainJson(explanation, call.device);
  if (call.format == Format::kTcl) return planner::report::ExplainTcl(explanation, call.device);
  planner::report::Calls calls;
  calls.best = PastedCall("best", call, setting);
  return planner::report::ExplainText(explanation, call.device, StyleOf(call, setting), calls,
                                      own_inputs);
}

}  // namespace

// An explanation is what was asked for, also when a request is not possible.
int RunExplain(std::string_view command, const std::vector<std::string>& words,
               const Setting& setting) {
  const Call call = ReadCall(command, words, std::nullopt, setting);
  const std::optional<std::vector<Rational>> own_inputs = OwnInputs(call.given);
  const auto explanation = planner::explain::Explain(
      call.request(), call.device, own_inputs.value_or(planner::explain::StockOscillators()));
  Write(call, InFormat(call, explanation, own_inputs.has_value(), setting), setting);
  return kDone;
}

}  // namespace cli
