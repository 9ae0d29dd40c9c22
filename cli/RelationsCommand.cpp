#include "cli/RelationsCommand.h"

#include "cli/Call.h"
#include "cli/Failure.h"
#include "cli/Formats.h"
#include "cli/PickedPlan.h"
#include "planner/report/Relations.h"

namespace cli {

namespace {

std::string Written(const Call& call, const planner::Answer& answer, const Setting& setting) {
  const planner::Request& request = call.request();
  const planner::relations::Rule& rule = call.sdc.rule;
  switch (call.format) {
    case Format::kText:
      return planner::report::RelationsText(request, call.device, answer, rule,
                                            StyleOf(call, setting));
    case Format::kJson:
      return planner::report::RelationsJson(request, call.device, answer, rule);
    case Format::kTcl:
      return planner::report::RelationsTcl(request, call.device, answer, rule);
    default:
      return DesignText(call, answer);
  }
}

}  // namespace

int RunRelations(std::string_view command, const std::vector<std::string>& words,
                 const Setting& setting) {
  const Call call = ReadCall(command, words, std::nullopt, setting);
  const Picked picked = PickedPlan(call, setting);
  Write(call, Written(call, picked.answer(), setting), setting);
  return picked.answer().within ? kDone : kOff;
}

}  // namespace cli
