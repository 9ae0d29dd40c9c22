#include "cli/PickedPlan.h"

#include <fmt/format.h>

#include <string>

#include "cli/Devices.h"
#include "cli/Failure.h"
#include "planner/report/PlanText.h"
#include "planner/report/Table.h"

namespace cli {

namespace {

using planner::plan::Plan;
using planner::report::Style;

constexpr int kMostPick = 1'000'000;

// Why there is nothing at all, with what of the device's limits is to blame.
std::string UnsolvedText(const Call& call, const Plan& plan, const Setting& setting) {
  const Style style{false, setting.err_width};
  std::string text =
      DoubtLines(call, style) + planner::report::UnsolvedText(plan, call.device, style, {});
  for (const planner::Answer& answer : plan.refused) {
    const std::string cause = LimitsInTheWay(call.device, answer.primitive, setting);
    if (cause.empty()) continue;
    text += planner::report::Prose(style, std::string(Name(answer.primitive)) + ": ", cause);
  }
  return text + "hint: what stands in the way: " + PastedCall("explain", call, setting) + "\n";
}

}  // namespace

Picked PickedPlan(const Call& call, const Setting& setting) {
  Picked picked;
  picked.number =
      static_cast<std::size_t>(WholeNumber(call.given, "--pick", 1, kMostPick).value_or(1));
  picked.plan = planner::plan::Make(call.request(), call.device);
  if (!picked.plan.IsSolved()) throw Failure(kUnsolved, UnsolvedText(call, picked.plan, setting));
  if (picked.number > picked.plan.ranked.size()) {
    throw Failure::OfUsage(fmt::format("--pick: there are {} candidates, and no number {}",
                                       picked.plan.ranked.size(), picked.number));
  }
  return picked;
}

}  // namespace cli
