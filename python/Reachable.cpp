// Tested by tests/python/test_reach.py.
#include "python/Reachable.h"

#include <utility>

#include "hardware/Primitive.h"
#include "planner/read/Units.h"
#include "python/Refused.h"

namespace python {

namespace {

using planner::Rational;
using planner::report::ReachQuestion;

constexpr int kMostOutput = hardware::MostOutputs(planner::Primitive::kPll) - 1;

Rational Frequency(const std::string& text, const char* entry) {
  planner::read::Mistakes mistakes;
  planner::read::Place place;
  place.entry = entry;
  const auto value =
      planner::read::ReadValue(text, planner::read::ValueKind::kFrequency, place, &mistakes);
  if (!value) RefuseMistakes(mistakes);
  return *value;
}

}  // namespace

Reachable::Reachable(const std::string& request, int output,
                     const std::optional<std::string>& lowest,
                     const std::optional<std::string>& highest) {
  if (output < 0 || output > kMostOutput) {
    const std::string text = std::to_string(output);
    RefuseEntry(
        "must_be", "output", text,
        "output: " + text + " must be a whole number from 0 to " + std::to_string(kMostOutput));
  }
  question_.output = output;
  if (lowest) question_.from = Frequency(*lowest, "lowest");
  if (highest) question_.to = Frequency(*highest, "highest");
  if (lowest && highest && *question_.to < *question_.from) {
    RefuseEntry("contradiction", "highest", *highest, "highest is below lowest");
  }
  // An output at its place, whose frequency does not count.
  planner::read::Draft draft = ReadDraft(request);
  planner::read::Values outputs(static_cast<std::size_t>(output));
  outputs.emplace_back(100);
  draft.outputs = {std::move(outputs), {}, ""};
  planner::read::Mistakes mistakes;
  auto reading = planner::read::Finish(draft, {}, &mistakes);
  if (!reading) RefuseMistakes(mistakes);
  asked_.reading = std::move(*reading);
  asked_.device = DeviceOf(asked_.reading.device, asked_.request().primitive);
  auto askable = planner::reach::AskableOf(asked_.request(), asked_.device);
  if (askable.primitives.empty()) RefuseUnsolved(askable.refused, asked_.device);
  primitives_ = std::move(askable.primitives);
}

std::string Reachable::Json(const ReachQuestion& question) const {
  std::string text;
  WriteReach(asked_.request(), asked_.device, question, primitives_,
             planner::report::ReachForm::kJson, [&](const std::string& piece) {
               text += piece;
               return true;
             });
  return text;
}

std::string Reachable::All(std::int64_t most) const {
  ReachQuestion question = question_;
  question.most = most;
  return Json(question);
}

std::string Reachable::Near(const std::string& frequency, std::int64_t most) const {
  ReachQuestion question = question_;
  question.kind = ReachQuestion::Kind::kNear;
  question.near = Frequency(frequency, "near");
  question.most = most;
  return Json(question);
}

std::string Reachable::Gaps(std::int64_t most) const {
  ReachQuestion question = question_;
  question.kind = ReachQuestion::Kind::kGaps;
  question.most = most;
  return Json(question);
}

std::string Reachable::Count() const {
  ReachQuestion question = question_;
  question.kind = ReachQuestion::Kind::kCount;
  return Json(question);
}

}  // namespace python
