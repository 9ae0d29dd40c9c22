#include "cli/PlanCommand.h"

#include <cstddef>

#include "cli/Call.h"
#include "cli/Failure.h"
#include "cli/Formats.h"
#include "cli/PickedPlan.h"
#include "planner/plan/Plan.h"
#include "planner/report/PlanText.h"

namespace cli {

namespace {

using planner::plan::Plan;
using planner::report::Calls;
using planner::report::Style;

constexpr int kUsualFront = 6;
constexpr int kMostFront = 1000;

// What a command shows of a plan.
enum class Part { kCandidate, kRanking, kTradeoffs };

Part PartOf(const Call& call) {
  if (call.command == "best") return Part::kTradeoffs;
  // With --pick, compare is about one row.
  return call.command == "compare" && !call.given.Has("--pick") ? Part::kRanking : Part::kCandidate;
}

Calls CallsOf(const Call& call, const Setting& setting) {
  Calls calls;
  calls.explain = PastedCall("explain", call, setting);
  calls.best = PastedCall("best", call, setting);
  calls.pick = PastedCall("plan", call, setting) + " --pick N";
  return calls;
}

std::string Text(const Call& call, const Plan& plan, std::size_t number, std::size_t most,
                 const Setting& setting) {
  const Style style = StyleOf(call, setting);
  const Calls calls = CallsOf(call, setting);
  switch (PartOf(call)) {
    case Part::kRanking:
      return CompareText(plan, call.device, style, calls);
    case Part::kTradeoffs:
      return BestText(plan, call.device, number, most, style, calls);
    case Part::kCandidate:
      break;
  }
  return PlanText(plan, call.device, number, style, calls);
}

std::vector<planner::report::Entry> Entries(const Call& call, const Plan& plan, std::size_t number,
                                            std::size_t most) {
  switch (PartOf(call)) {
    case Part::kRanking:
      return planner::report::CompareEntries(plan);
    case Part::kTradeoffs:
      return planner::report::BestEntries(plan, number, most);
    case Part::kCandidate:
      break;
  }
  return planner::report::PlanEntries(plan, number);
}

}  // namespace

int RunPlan(std::string_view command, const std::vector<std::string>& words,
            const Setting& setting) {
  const Call call = ReadCall(command, words, std::nullopt, setting);
  const auto most = static_cast<std::size_t>(
      WholeNumber(call.given, "--front", 0, kMostFront).value_or(kUsualFront));
  const Picked picked = PickedPlan(call, setting);
  Write(call,
        call.format == Format::kText
            ? Text(call, picked.plan, picked.number, most, setting)
            : InFormat(call, Entries(call, picked.plan, picked.number, most), picked.answer(),
                       picked.plan.front_cut),
        setting);
  return picked.answer().within ? kDone : kOff;
}

}  // namespace cli
