#include "cli/EngineCommand.h"

#include "cli/Call.h"
#include "cli/Devices.h"
#include "cli/Failure.h"
#include "cli/Formats.h"
#include "cli/Options.h"
#include "planner/engine/Ask.h"
#include "planner/report/PlanText.h"
#include "planner/report/ReportText.h"

namespace cli {

namespace {

using planner::Primitive;

Primitive PrimitiveOf(std::string_view command) {
  if (command == "tsyn") return Primitive::kTsyn;
  if (command == "pll") return Primitive::kPll;
  return command == "kru" ? Primitive::kKruSp : Primitive::kKruClkgen;
}

// The call that says what stands in the way of the primitive.
std::string ExplainCall(const Call& call, Primitive primitive, const Setting& setting) {
  std::vector<planner::read::Option> options = KeptFor("explain", call.pasted);
  options.push_back({"--primitive", std::string(Name(primitive))});
  return PastedCall("explain", options, setting);
}

}  // namespace

int RunEngine(std::string_view command, const std::vector<std::string>& words,
              const Setting& setting) {
  const Primitive primitive = PrimitiveOf(command);
  const Call call = ReadCall(command, words, primitive, setting);
  const bool has_trace = call.given.Has("--trace");
  if (has_trace && call.format != Format::kText) {
    throw Failure::OfUsage("--trace goes with --format text only");
  }
  const planner::Answer answer =
      planner::engine::AskOne(call.request(), call.device, primitive,
                              planner::engine::AsRequested(call.request()), has_trace);
  if (!answer.solved) {
    const planner::report::Style style{false, setting.err_width};
    planner::report::Calls calls;
    calls.explain = ExplainCall(call, primitive, setting);
    const std::string cause = LimitsInTheWay(call.device, primitive, setting);
    throw Failure(kUnsolved,
                  DoubtLines(call, style) +
                      planner::report::UnsolvedText(answer, call.device, cause, style, calls));
  }
  Write(call,
        call.format == Format::kText ? planner::report::ReportText(call.request(), call.device,
                                                                   answer, StyleOf(call, setting))
                                     : InFormat(call, {{&answer}}, answer),
        setting);
  return answer.within ? kDone : kOff;
}

}  // namespace cli
