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

}  // namespace

Answer AskOne(const Request& request, const Device& device, Primitive primitive,
              const Variant& variant, bool trace) {
  if (!device.Has(primitive)) {
    throw std::invalid_argument("The device does not have the primitive.");
  }
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
  std::vector<Answer> solved;
  std::optional<Answer> unsolved;
  for (const Variant& variant : Variants(request, primitive)) {
    Answer answer = AskOne(request, device, primitive, variant);
    if (!answer.solved) {
      if (!unsolved) unsolved = std::move(answer);
      continue;
    }
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
  unsolved->source.variant.clear();
  return {std::move(*unsolved)};
}

}  // namespace planner::engine
