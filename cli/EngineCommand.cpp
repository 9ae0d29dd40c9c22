#include "cli/EngineCommand.h"

#include "cli/Call.h"
#include "cli/Devices.h"
#include "cli/Failure.h"
#include "cli/Hdl.h"
#include "cli/Options.h"
#include "planner/engine/Ask.h"
#include "planner/report/Json.h"
#include "planner/report/PlanText.h"
#include "planner/report/ReportText.h"
#include "planner/report/Sdc.h"

namespace cli {

namespace {

using planner::Primitive;
using planner::report::Entry;

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

std::string InFormat(const Call& call, const planner::Answer& answer, const Setting& setting) {
  const std::vector<Entry> entries = {{&answer}};
  switch (call.format) {
    case Format::kText:
      return planner::report::ReportText(call.request(), call.device, answer,
                                         StyleOf(call, setting));
    case Format::kJson:
      return planner::report::Json(call.request(), call.device, entries);
    case Format::kTcl:
      return planner::report::Tcl(call.request(), call.device, entries);
    case Format::kVerilog:
    case Format::kVhdl:
    case Format::kTestbench:
      return HdlText(call, answer);
    case Format::kSdc:
      break;
  }
  return planner::report::Sdc(call.request(), call.device, answer, call.sdc);
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
                  planner::report::UnsolvedText(answer, call.device, cause, style, calls) +
                      DoubtLines(call, style));
  }
  Write(call, InFormat(call, answer, setting), setting);
  return answer.within ? kDone : kOff;
}

}  // namespace cli
