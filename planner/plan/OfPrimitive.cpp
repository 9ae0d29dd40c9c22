// Tested by plan_test.cpp.
#include "planner/plan/OfPrimitive.h"

#include <utility>

#include "planner/answer/Evaluate.h"
#include "planner/answer/Rank.h"
#include "planner/engine/Ask.h"
#include "planner/plan/Orders.h"

namespace planner::plan {

namespace {

using Answers = std::vector<Answer>;

// Adds an answer, those of the engine first; to one with the same settings only where it is from.
void Add(const Answer& answer, Answers* answers) {
  for (Answer& other : *answers) {
    if (!answer::SameSettings(answer, other)) continue;
    other.source.search = other.source.search || answer.source.search;
    return;
  }
  answers->push_back(answer);
}

void AskEngine(Primitive primitive, const Device& device, Attempt* attempt,
               std::vector<Finding>* refusals) {
  for (Answer& answer : engine::Ask(attempt->placed, device, primitive)) {
    if (answer.solved) {
      answer::NoteMoved(attempt->order, &answer);
      attempt->engine.push_back(std::move(answer));
    } else {
      *refusals = std::move(answer.refusals);
    }
  }
}

void TakeFound(search::Found found, const Device& device, Attempt* attempt) {
  attempt->found = std::move(found);
  for (const search::Candidate& candidate : attempt->found.best) {
    Add(AnswerOf(*attempt, candidate.settings, device), &attempt->search);
  }
  if (!attempt->found.front.empty()) {
    Add(AnswerOf(*attempt, attempt->found.front.front().settings, device), &attempt->search);
  }
}

// The attempt whose best answer ranks before that of all earlier ones; the first where there is
// none. What ranks before is better in something: an output is not moved for nothing.
std::size_t BestOf(const std::vector<Attempt>& attempts, Answers Attempt::*source) {
  std::size_t best = 0;
  const Answer* leader = nullptr;
  for (std::size_t i = 0; i < attempts.size(); ++i) {
    const answer::Order order(attempts[i].placed);
    for (const Answer& answer : attempts[i].*source) {
      if (leader != nullptr &&
          answer::Compare(order, answer::KeyOf(answer), answer::KeyOf(*leader)).order >= 0) {
        continue;
      }
      leader = &answer;
      best = i;
    }
  }
  return best;
}

}  // namespace

Answer AnswerOf(const Attempt& attempt, const Settings& settings, const Device& device) {
  for (const Answer& answer : attempt.search) {
    if (answer.settings == settings) return answer;
  }
  Answer answer = answer::Evaluate(attempt.placed, device, settings, {.search = true});
  answer::NoteMoved(attempt.order, &answer);
  return answer;
}

Answers OfPrimitive::Shown() const {
  Answers shown;
  if (attempts.empty()) return shown;
  const std::size_t engine = BestOf(attempts, &Attempt::engine);
  const std::size_t search = BestOf(attempts, &Attempt::search);
  for (std::size_t i = 0; i < attempts.size(); ++i) {
    // Settings are the same only with the outputs in the same order.
    Answers own;
    if (i == 0 || i == engine) {
      for (const Answer& answer : attempts[i].engine) Add(answer, &own);
    }
    if (i == 0 || i == search) {
      for (const Answer& answer : attempts[i].search) Add(answer, &own);
    }
    shown.insert(shown.end(), own.begin(), own.end());
  }
  return shown;
}

bool OfPrimitive::IsEngineSolved() const {
  for (const Attempt& attempt : attempts) {
    if (!attempt.engine.empty()) return true;
  }
  return false;
}

OfPrimitive MakeOf(Primitive primitive, const Request& request, const Device& device,
                   const Options& options, const search::Found* found) {
  OfPrimitive made;
  made.primitive = primitive;
  made.refusals = answer::Refusals(request, primitive);
  if (!made.refusals.empty()) return made;
  const std::vector<answer::PlaceOrder> orders =
      request.any_order ? OrdersOf(request, device, primitive)
                        : std::vector<answer::PlaceOrder>{answer::AsRequested(request)};
  bool is_found = false;
  for (const answer::PlaceOrder& order : orders) {
    Attempt& attempt = made.attempts.emplace_back();
    attempt.order = order;
    attempt.placed = answer::Placed(request, order);
    std::vector<Finding> refusals;
    if (options.engine) AskEngine(primitive, device, &attempt, &refusals);
    if (made.attempts.size() == 1) made.refusals = std::move(refusals);
    if (options.search) {
      TakeFound(found != nullptr ? *found : search::Search(attempt.placed, device, primitive),
                device, &attempt);
    }
    is_found = is_found || !attempt.search.empty();
  }
  if (options.search && !is_found) {
    made.refusals.push_back({.kind = FindingKind::kNoSettings, .primitive = primitive});
  }
  return made;
}

}  // namespace planner::plan
