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
    return answer::Unsolved(
        primitive, source,
        {{.kind = FindingKind::kUnsolved, .primitive = primitive, .text = refused->sentence}});
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

// The runs for the variants of a KRU. Many end in the same settings, which are judged once.
class KruRuns {
 public:
  KruRuns(const Request& request, const Device& device, Primitive primitive, bool trace)
      : request_(request), device_(device), primitive_(primitive), trace_(trace) {}

  // The first answer that is as asked for, of all phases that stand for those of the request, or
  // else the best.
  Answer Of(const Variant& variant, const Source& source) {
    std::optional<Answer> best;
    for (const auto& phases : KruPhases(request_, primitive_, variant.feedback)) {
      Answer answer =
          Judged(source, RunKru(request_, device_, primitive_, variant, phases, trace_));
      if (answer.within) return answer;
      if (!best || answer::Before(request_, answer, *best)) best = std::move(answer);
    }
    return *best;
  }

 private:
  Answer Judged(const Source& source, const Outcome& outcome) {
    const auto* const found = std::get_if<Found>(&outcome);
    if (found == nullptr) return AnswerOf(request_, device_, primitive_, source, outcome);
    const auto same = std::find_if(judged_.begin(), judged_.end(), [found](const Answer& other) {
      return other.settings == found->settings;
    });
    if (same == judged_.end()) {
      judged_.push_back(AnswerOf(request_, device_, primitive_, source, outcome));
      return judged_.back();
    }
    Answer answer = *same;
    answer.source = source;
    return answer;
  }

  const Request& request_;
  const Device& device_;
  const Primitive primitive_;
  const bool trace_;
  std::vector<Answer> judged_;
};

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

// The answers of all variants, solved or not, in their order. Of variants of a loop that end in the
// same settings there is the first: with the same settings none ranks before another.
std::vector<Answer> AllAnswers(const Request& request, const Device& device, Primitive primitive) {
  std::vector<Answer> answers;
  LoopRuns loop_runs(request, device, primitive);
  KruRuns kru_runs(request, device, primitive, false);
  for (const Variant& variant : Variants(request, primitive)) {
    const Source source = {.engine = true, .variant = variant.name};
    if (!hardware::IsLoop(primitive)) {
      answers.push_back(kru_runs.Of(variant, source));
      continue;
    }
    const Outcome outcome = loop_runs.Of(variant);
    const auto* const found = std::get_if<Found>(&outcome);
    const bool is_known =
        found != nullptr && std::any_of(answers.begin(), answers.end(), [&](const Answer& other) {
          return other.solved && other.settings == found->settings;
        });
    if (!is_known) answers.push_back(AnswerOf(request, device, primitive, source, outcome));
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
    return KruRuns(request, device, primitive, trace).Of(variant, source);
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
