// Tested by plan_test.cpp.
#include <algorithm>
#include <stdexcept>
#include <utility>

#include "planner/answer/Evaluate.h"
#include "planner/answer/Front.h"
#include "planner/plan/Lead.h"
#include "planner/plan/OfPrimitive.h"
#include "planner/plan/Plan.h"

namespace planner::plan {

namespace {

std::vector<Primitive> PrimitivesOf(const Request& request, const Device& device) {
  if (!request.primitive) return device.primitives;
  if (!device.Has(*request.primitive)) {
    throw std::invalid_argument("The device does not have the primitive of the request.");
  }
  return {*request.primitive};
}

// Adds a primitive that has no answers.
void AddRefused(const OfPrimitive& of, Plan* plan) {
  Answer answer = answer::Unsolved(of.primitive, {}, of.refusals);
  plan->refused.push_back(std::move(answer));
}

// The trade-offs of all primitives. Their candidates are many; answers are made of the few that
// are on the front, and where two are equal in error and jitter.
class FrontMaker {
 public:
  FrontMaker(const std::vector<OfPrimitive>& all, const Device& device) : device_(device) {
    for (const OfPrimitive& of : all) {
      for (const Attempt& attempt : of.attempts) Add(attempt);
    }
  }

  Front Make() {
    Front front;
    const auto before = [this](std::size_t a, std::size_t b) { return Before(a, b); };
    for (const std::size_t place : answer::FrontOf(keys_, before)) {
      front.push_back(AnswerAt(place));
    }
    return front;
  }

 private:
  struct Member {
    const Attempt* attempt;
    const search::Candidate* candidate;
    std::optional<Answer> answer = {};
  };

  void Add(const Attempt& attempt) {
    for (const search::Candidate& candidate : attempt.found.front) {
      keys_.push_back(
          {.rank_class = candidate.within ? answer::Class::kMet : answer::Class::kMissed,
           .worst_error = candidate.worst_error,
           .jitter = candidate.max_jitter.value_or(answer::kUnknownJitter)});
      members_.push_back({&attempt, &candidate});
    }
  }

  const Answer& AnswerAt(std::size_t place) {
    Member& member = members_[place];
    if (!member.answer) {
      member.answer = AnswerOf(*member.attempt, member.candidate->settings, device_);
    }
    return *member.answer;
  }

  // Outputs at their own places come before those that are moved.
  bool Before(std::size_t a, std::size_t b) {
    const auto is_moved = [this](std::size_t place) {
      const answer::PlaceOrder& order = members_[place].attempt->order;
      return !std::is_sorted(order.begin(), order.end());
    };
    if (is_moved(a) != is_moved(b)) return is_moved(b);
    const answer::Comparison comparison =
        answer::Compare(members_[a].attempt->placed, AnswerAt(a), AnswerAt(b));
    return comparison.order != 0 ? comparison.order < 0 : a < b;
  }

  const Device& device_;
  std::vector<answer::RankKey> keys_;
  std::vector<Member> members_;
};

// Answers of the front that are among those ranked, too, are the same in all: where they come from,
// and what the engine counted with.
void TakeRanked(const std::vector<Answer>& ranked, const Request& request, Front* front) {
  for (Answer& answer : *front) {
    for (const Answer& other : ranked) {
      if (answer::SameSettings(answer, other) &&
          answer::OrderOf(request, answer) == answer::OrderOf(request, other)) {
        answer = other;
      }
    }
  }
}

// Why the first is where it is.
void Explain(Plan* plan) {
  if (plan->ranked.empty()) return;
  const Answer& first = plan->ranked.front();
  std::vector<Primitive> seen = {first.primitive};
  for (std::size_t i = 1; i < plan->ranked.size(); ++i) {
    const Answer& other = plan->ranked[i];
    const Reason reason = {0, i, answer::Decided(plan->request, first, other)};
    if (other.primitive == first.primitive) {
      if (!plan->among_own) plan->among_own = reason;
    } else if (std::find(seen.begin(), seen.end(), other.primitive) == seen.end()) {
      seen.push_back(other.primitive);
      plan->among_primitives.push_back(reason);
    }
  }
}

}  // namespace

Plan Make(const Request& request, const Device& device, const Options& options) {
  Options used = options;
  used.search = options.search && !request.engine_only;
  Plan plan;
  plan.request = request;
  std::vector<Primitive> primitives = PrimitivesOf(request, device);
  std::optional<Lead> lead;
  if (used.first_only && used.search) lead = LeadOf(request, device, primitives);
  if (lead) primitives = {lead->primitive};
  std::vector<OfPrimitive> all;
  for (const Primitive primitive : primitives) {
    all.push_back(MakeOf(primitive, request, device, used, lead ? &lead->found : nullptr));
    const OfPrimitive& of = all.back();
    std::vector<Answer> shown = of.Shown();
    if (shown.empty()) {
      AddRefused(of, &plan);
    } else if (used.engine && !of.IsEngineSolved()) {
      plan.engine_refused.push_back(answer::Unsolved(primitive, {.engine = true}, of.refusals));
    }
    for (Answer& answer : shown) plan.ranked.push_back(std::move(answer));
    const bool is_cut = std::any_of(of.attempts.begin(), of.attempts.end(),
                                    [](const Attempt& one) { return !one.found.complete; });
    if (is_cut) plan.front_cut.push_back(primitive);
  }
  answer::Rank(request, &plan.ranked);
  plan.front = used.search ? FrontMaker(all, device).Make() : answer::FrontOf(request, plan.ranked);
  TakeRanked(plan.ranked, request, &plan.front);
  Explain(&plan);
  return plan;
}

}  // namespace planner::plan
