// Tested by evaluate.test.
#include <optional>
#include <vector>

#include "planner/answer/Evaluate.h"
#include "planner/read/Settings.h"
#include "planner/report/Json.h"
#include "tcl/Commands.h"
#include "tcl/Failure.h"
#include "tcl/Objects.h"
#include "tcl/RequestTree.h"

namespace tcl {

namespace {

using planner::read::Mistakes;
using planner::read::SettingsDraft;

// Names in a list, with commas between.
std::string Names(Tcl_Obj* object) {
  const auto items = List(object);
  if (!items) return Text(object);
  std::string text;
  for (Tcl_Obj* const item : *items) text += (text.empty() ? "" : ",") + Text(item);
  return text;
}

// The options of settings, as the reader of options takes them.
SettingsDraft OptionsOf(const Given& given, Mistakes* mistakes) {
  std::vector<planner::read::Option> options;
  for (const planner::read::OptionFacts& facts : planner::read::SettingOptions()) {
    const auto own = given.own.find(facts.name.substr(2));
    if (own == given.own.end()) continue;
    std::string value = facts.is_list ? WithCommas(own->second) : Text(own->second);
    if (facts.name == "--pins") value = Names(own->second);
    if (facts.placeholder.empty()) {
      const auto truth = Boolean(own->second);
      if (!truth) {
        throw Failure::OfUsage("not_a_switch", value,
                               "-" + own->first + ": \"" + value + "\" must be 1 or 0");
      }
      value = *truth ? "1" : "0";
    }
    options.push_back({std::string(facts.name), std::move(value)});
  }
  return ReadSettingOptions(options, mistakes);
}

planner::Device DeviceOf(const planner::read::Draft& draft,
                         std::optional<planner::Primitive> primitive) {
  planner::read::Reading reading;
  reading.device = draft.device;
  reading.request.primitive = primitive;
  return tcl::DeviceOf(reading);
}

}  // namespace

std::string Evaluate(Words words) {
  const Given given =
      ReadDraft(words, {"m", "d", "divide", "phase-steps", "set-phase", "high-times", "set-duty",
                        "pins", "divide-by-2", "phase-shift", "json", "pick"});
  Mistakes mistakes;
  planner::read::PlanFile plan;
  const auto json = given.own.find("json");
  if (json != given.own.end()) {
    std::optional<int> number;
    if (given.own.contains("pick")) number = static_cast<int>(given.Count("pick", 1, 1));
    plan = ReadPlan(Text(json->second), "-json", number, &mistakes);
  }
  const SettingsDraft settings = Over(OptionsOf(given, &mistakes), plan.settings);
  if (!mistakes.empty()) throw Failure::OfMistakes(mistakes);
  const planner::read::Draft draft = Over(given.draft, plan.request);
  const planner::Primitive primitive = PrimitiveOf(draft, settings, DeviceOf(draft, std::nullopt));
  const planner::Device device = DeviceOf(draft, primitive);
  const auto evaluation = FinishEvaluation(draft, settings, device, &mistakes);
  if (!evaluation) throw Failure::OfMistakes(mistakes);
  const planner::Request& request = evaluation->reading.request;
  const planner::Answer answer =
      planner::answer::Evaluate(request, device, evaluation->settings, planner::Source{});
  return planner::report::Tcl(request, device, {{&answer}});
}

}  // namespace tcl
