// Tested by explain_test.cpp.
#include "planner/explain/Explain.h"

#include <utility>

#include "planner/answer/Evaluate.h"
#include "planner/explain/Conflicts.h"
#include "planner/explain/Question.h"
#include "planner/search/Within.h"

namespace planner::explain {

namespace {

// Only the first conflicts are told with their changes; there can be thousands.
constexpr std::size_t kMostWithChanges = 6;

// The changes of demands with which all demands of a question go. A demand can be in many
// conflicts; its changes are looked for once.
class ChangesToAll {
 public:
  explicit ChangesToAll(const Question& question) : question_(question) {}

  std::vector<Change> In(const std::vector<Demand>& conflict) {
    std::vector<Change> changes;
    for (const Demand& demand : conflict) {
      const std::vector<Change>& own = Of(demand);
      changes.insert(changes.end(), own.begin(), own.end());
    }
    return changes;
  }

 private:
  const std::vector<Change>& Of(const Demand& demand) {
    for (const auto& [known, changes] : known_) {
      if (known == demand) return changes;
    }
    return known_.emplace_back(demand, ChangesOf(question_, demand)).second;
  }

  const Question& question_;
  std::vector<std::pair<Demand, std::vector<Change>>> known_;
};

Conflict Described(const Question& question, const std::vector<Demand>& demands, Set conflict,
                   ChangesToAll* changes) {
  Conflict described;
  described.demands = In(demands, conflict);
  described.changes = changes->In(described.demands);
  if (described.changes.empty()) {
    described.lifts_all = false;
    Question alone = question;
    alone.relaxed = OnlyWith(demands, conflict);
    described.changes = ChangesToAll(alone).In(described.demands);
  }
  return described;
}

std::vector<Swap> Swaps(const Question& question) {
  std::vector<Swap> swaps;
  const int count = static_cast<int>(question.request.outputs.size());
  for (int first = 0; first < count; ++first) {
    for (int second = first + 1; second < count; ++second) {
      Question changed = question;
      std::swap(changed.request.outputs[static_cast<std::size_t>(first)],
                changed.request.outputs[static_cast<std::size_t>(second)]);
      if (std::optional<Settings> settings = changed.Ask()) {
        swaps.push_back({first, second, std::move(*settings)});
      }
    }
  }
  return swaps;
}

OfPrimitive ExplainOne(const Request& request, const Device& device, Primitive primitive) {
  OfPrimitive one;
  one.primitive = primitive;
  one.refusals = answer::Refusals(request, primitive);
  if (!one.refusals.empty()) return one;
  const search::Within within(request, device, primitive);
  one.is_met = within.Exists();
  if (one.is_met) return one;
  const std::vector<Demand> demands = DemandsOf(request, primitive);
  const Conflicts found =
      FindConflicts(demands.size(), [&](Set set) { return within.Exists(OnlyWith(demands, set)); });
  one.questions = found.questions;
  one.is_complete = found.complete;
  const Question question{request, device, primitive, {}, &within};
  ChangesToAll changes(question);
  for (const Set conflict : found.conflicts) {
    if (one.conflicts.size() < kMostWithChanges) {
      one.conflicts.push_back(Described(question, demands, conflict, &changes));
    } else {
      one.conflicts.push_back({In(demands, conflict), {}, false});
    }
  }
  for (const Set correction : found.corrections) {
    one.corrections.push_back(In(demands, correction));
  }
  one.together = CommonTolerance(question);
  for (Change& change : CommonJitter(question)) one.together.push_back(std::move(change));
  one.swaps = Swaps(question);
  return one;
}

}  // namespace

Explanation Explain(const Request& request, const Device& device,
                    const std::vector<Rational>& oscillators) {
  Explanation explanation;
  explanation.request = request;
  std::vector<Primitive> primitives = device.primitives;
  if (request.primitive) primitives = {*request.primitive};
  std::vector<Primitive> able;
  for (const Primitive primitive : primitives) {
    explanation.primitives.push_back(ExplainOne(request, device, primitive));
    if (explanation.primitives.back().refusals.empty()) able.push_back(primitive);
  }
  explanation.inputs = InputsThatServe(request, device, able, oscillators);
  return explanation;
}

}  // namespace planner::explain
