// Tested by commands.test.
#include "planner/plan/Plan.h"
#include "planner/relations/Rule.h"
#include "planner/report/Json.h"
#include "planner/report/Relations.h"
#include "tcl/Commands.h"
#include "tcl/Failure.h"
#include "tcl/Objects.h"

namespace tcl {

namespace {

constexpr std::size_t kUsualFront = 6;

planner::plan::Plan PlanOf(const Given& given) {
  planner::plan::Plan plan = planner::plan::Make(given.request(), given.device);
  if (!plan.IsSolved()) throw Failure::OfUnsolved(plan, given.device);
  return plan;
}

std::size_t Pick(const Given& given, const planner::plan::Plan& plan) {
  const std::size_t number = given.Count("pick", 1, 1);
  if (number <= plan.ranked.size()) return number;
  const std::string text = std::to_string(number);
  throw Failure::OfUsage("no_candidate", text,
                         "-pick: there are " + std::to_string(plan.ranked.size()) +
                             " candidates, and no number " + text);
}

planner::relations::Rule RuleOf(const Given& given) {
  const auto gap = given.own.find("gap");
  if (gap == given.own.end()) return {};
  planner::read::Place place;
  place.entry = "-gap";
  planner::read::Mistakes mistakes;
  const auto rule = planner::relations::ReadRule(Text(gap->second), place, &mistakes);
  if (!rule) throw Failure::OfMistakes(mistakes);
  return *rule;
}

std::string DictOf(const Given& given, const planner::plan::Plan& plan,
                   const std::vector<planner::report::Entry>& entries) {
  return planner::report::Tcl(given.request(), given.device, entries, plan.front_cut);
}

}  // namespace

std::string Plan(Words words) {
  const Given given = ReadGiven(words, {"pick"});
  const planner::plan::Plan plan = PlanOf(given);
  return DictOf(given, plan, planner::report::PlanEntries(plan, Pick(given, plan)));
}

std::string Compare(Words words) {
  const Given given = ReadGiven(words, {});
  const planner::plan::Plan plan = PlanOf(given);
  return DictOf(given, plan, planner::report::CompareEntries(plan));
}

std::string Best(Words words) {
  const Given given = ReadGiven(words, {"pick", "front"});
  const std::size_t most = given.Count("front", 0, kUsualFront);
  const planner::plan::Plan plan = PlanOf(given);
  return DictOf(given, plan, planner::report::BestEntries(plan, Pick(given, plan), most));
}

std::string Relations(Words words) {
  const Given given = ReadGiven(words, {"pick", "gap"});
  const planner::relations::Rule rule = RuleOf(given);
  const planner::plan::Plan plan = PlanOf(given);
  return planner::report::RelationsTcl(given.request(), given.device, *plan.Pick(Pick(given, plan)),
                                       rule);
}

}  // namespace tcl
