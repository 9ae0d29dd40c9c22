#include "planner/engine/Ask.h"

#include <algorithm>
#include <stdexcept>
#include <utility>

#include "planner/answer/Evaluate.h"
#include "planner/answer/Rank.h"
#include "planner/engine/KruPhases.h"
#include "planner/engine/Run.h"

namespace planner::engine {
namespace {

Answer AnswerOf(const Request& request, const Device& device, Primitive primitive,
                const Source& source, const Outcome& outcome) {
  if (const auto* const refused = std::get_if<Refused>(&outcome)) {
    return answer::Unsolved(primitive, source,
                            {{.kind = FindingKind::kUnsolved,
                              .primitive = primitive,
                              .text = refused->sentence}});
  }
  const Found& found = std::get<Found>(outcome);
  return answer::Evaluate(request, device, found.settings, source, found.searched);
}

// The runs for the variants of a PLL or a TSYN, of which several can be the same.
class LoopRuns {
 public:
  LoopRuns(const Request& request, const Device& device, Primitive primitive)
      : request_(request), device_(device), primitive_(primitive) {}

  Outcome Of(const Variant& variant) {
    const Variant key = Effective(request_, device_, primitive_, variant);
    auto run = std::find_if(runs_.begin(), runs_.end(),
                            [&key](const auto& one) { return one.first == key; });
    if (run == runs_.end()) {
      runs_.emplace_back(key, RunLoop(request_, device_, primitive_, variant, false));
      run = runs_.end() - 1;
    }
    Outcome outcome = run->second;
    if (auto* const found = std::get_if<Found>(&outcome)) {
      std::get<LoopSettings>(found->settings).bandwidth = variant.bandwidth;
    }
    return outcome;
  }

 private:
  const Request& request_;
  const Device& device_;
  const Primitive primitive_;
  std::vector<std::pair<Variant, Outcome>> runs_;
};

// The first answer that is as asked for, of all phases that stand for those of the request, or
// else the best.
Answer AskKru(const Request& request, const Device& device, Primitive primitive,
              const Variant& variant, const Source& source, bool trace) {
  std::optional<Answer> best;
  for (const auto& phases : KruPhases(request, primitive, variant.feedback)) {
    Answer answer = AnswerOf(request, device, primitive, source,
                             RunKru(request, device, primitive, variant, phases, trace));
    if (answer.within) return answer;
    if (!best || answer::Before(request, answer, *best)) best = std::move(answer);
  }
  return *best;
}

// Whether two answers have the same settings, but for a feedback that makes no difference.
bool IsSame(const Answer& a, const Answer& b) {
  if (answer::SameSettings(a, b)) return true;
  const auto* const one = std::get_if<KruSettings>(&a.settings);
  const auto* const other = std::get_if<KruSettings>(&b.settings);
  if (one == nullptr || other == nullptr) return false;
  KruSettings connected = *one;
  connected.feedback = other->feedback;
  return connected == *other && a.max_jitter == b.max_jitter && a.phase_error == b.phase_error;
}

void RequirePrimitive(const Device& device, Primitive primitive) {
  if (device.Has(primitive)) return;
  throw std::invalid_argument("The device does not have the primitive.");
}

// The answers of all variants, solved or not, in their order.
std::vector<Answer> AllAnswers(const Request& request, const Device& device,
                               Primitive primitive) {
  std::vector<Answer> answers;
  LoopRuns runs(request, device, primitive);
  for (const Variant& variant : Variants(request, primitive)) {
    const Source source = {.engine = true, .variant = variant.name};
    answers.push_back(
        hardware::IsLoop(primitive)
            ? AnswerOf(request, device, primitive, source, runs.Of(variant))
            : AskKru(request, device, primitive, variant, source, false));
  }
  return answers;
}

}  // namespace

Answer AskOne(const Request& request, const Device& device, Primitive primitive,
              const Variant& variant, bool trace) {
  RequirePrimitive(device, primitive);
  const Source source = {.engine = true, .variant = variant.name};
  std::vector<Finding> refusals = answer::Refusals(request, primitive);
  if (!refusals.empty()) return answer::Unsolved(primitive, source, std::move(refusals));
  if (!hardware::IsLoop(primitive)) {
    return AskKru(request, device, primitive, variant, source, trace);
  }
  return AnswerOf(request, device, primitive, source,
                  RunLoop(request, device, primitive, variant, trace));
}

std::vector<Answer> Ask(const Request& request, const Device& device, Primitive primitive) {
  RequirePrimitive(device, primitive);
  std::vector<Finding> refusals = answer::Refusals(request, primitive);
  if (!refusals.empty()) {
    return {answer::Unsolved(primitive, {.engine = true}, std::move(refusals))};
  }
  std::vector<Answer> answers = AllAnswers(request, device, primitive);
  std::vector<Answer> solved;
  for (Answer& answer : answers) {
    if (!answer.solved) continue;
    const auto same = std::find_if(solved.begin(), solved.end(), [&answer](const Answer& other) {
      return IsSame(answer, other);
    });
    if (same == solved.end()) {
      solved.push_back(std::move(answer));
    } else if (answer::Before(request, answer, *same)) {
      *same = std::move(answer);
    }
  }
  if (!solved.empty()) return solved;
  // The reason is that of all variants; the name of one would only distract from it.
  answers.front().source.variant.clear();
  return {std::move(answers.front())};
}

}  // namespace planner::engine
