// Tested by tests/python/test_evaluate.py.
#include "python/Evaluation.h"

#include "planner/answer/Evaluate.h"
#include "planner/read/Options.h"
#include "planner/read/Settings.h"
#include "planner/report/Json.h"
#include "planner/report/ReportText.h"
#include "python/Refused.h"

namespace python {

namespace {

using planner::read::SettingsDraft;

// Options that are settings; the reader knows no others.
std::vector<planner::read::Option> OptionsOf(const std::vector<Evaluation::Setting>& settings) {
  std::vector<planner::read::Option> options;
  for (const auto& [name, value] : settings) {
    std::string option = "--" + name;
    for (char& letter : option) letter = letter == '_' ? '-' : letter;
    options.push_back({std::move(option), value});
  }
  return options;
}

}  // namespace

Evaluation::Evaluation(const std::string& request, const std::vector<Setting>& settings,
                       const std::optional<std::string>& plan, const std::optional<int>& number) {
  planner::read::Mistakes mistakes;
  planner::read::PlanFile file;
  if (plan) {
    file = ReadPlan(*plan, "plan", number, &mistakes);
    if (!mistakes.empty()) RefuseMistakes(mistakes);
  }
  const SettingsDraft all =
      Over(planner::read::ReadSettingOptions(OptionsOf(settings), &mistakes), file.settings);
  if (!mistakes.empty()) RefuseArguments(mistakes);
  const planner::read::Draft draft = Over(ReadDraft(request), file.request);
  const auto primitive = PrimitiveOf(draft, all, DeviceOf(draft.device, {}));
  asked_.device = DeviceOf(draft.device, primitive);
  auto evaluation = FinishEvaluation(draft, all, asked_.device, &mistakes);
  if (!evaluation) RefuseArguments(mistakes);
  asked_.reading = std::move(evaluation->reading);
  answer_ = planner::answer::Evaluate(asked_.request(), asked_.device, evaluation->settings,
                                      planner::Source{});
}

std::string Evaluation::Json() const {
  return planner::report::Json(asked_.request(), asked_.device, {{&answer_}});
}

std::string Evaluation::Tcl() const {
  return planner::report::Tcl(asked_.request(), asked_.device, {{&answer_}});
}

std::string Evaluation::Report(int width) const {
  return planner::report::EvaluationText(asked_.request(), asked_.device, answer_, {false, width});
}

}  // namespace python
