#include "cli/EvaluateCommand.h"

#include <cstddef>
#include <optional>
#include <utility>

#include "cli/Call.h"
#include "cli/Devices.h"
#include "cli/Failure.h"
#include "cli/Formats.h"
#include "cli/InputFile.h"
#include "planner/answer/Evaluate.h"
#include "planner/read/Settings.h"
#include "planner/report/ReportText.h"

namespace cli {

namespace {

using planner::read::Draft;
using planner::read::Mistakes;
using planner::read::Reading;

constexpr std::size_t kLargest = 50'000'000;  // bytes of a plan
constexpr int kMostPick = 1'000'000;

// The device of a draft; with a primitive that has been named it has that.
planner::Device DeviceOf(const Draft& draft, std::optional<planner::Primitive> primitive,
                         const Setting& setting) {
  Reading reading;
  reading.device = draft.device;
  reading.request.primitive = primitive;
  return FindDevice(reading, setting);
}

// The settings and the request of a call.
std::optional<planner::read::Evaluation> EvaluationOf(const Given& given, const Draft& options,
                                                      const Setting& setting, Mistakes* mistakes) {
  planner::read::PlanFile file;
  const std::optional<int> number = WholeNumber(given, "--pick", 1, kMostPick);
  if (!given.operands.empty()) {
    const std::string& name = given.operands.front();
    if (name == "-" && given.Value("--request") == "-") {
      throw Failure::OfUsage("the plan and --request cannot both be standard input");
    }
    file = ReadPlan(ReadFileOf("plan", name, kLargest), name, number, mistakes);
  } else if (number) {
    throw Failure::OfUsage("--pick goes with the file of a plan");
  }
  const Draft draft = Over(options, file.request);
  const planner::read::SettingsDraft settings =
      Over(planner::read::ReadSettingOptions(given.options, mistakes), file.settings);
  if (!mistakes->empty()) return std::nullopt;
  planner::Device device = DeviceOf(draft, std::nullopt, setting);
  device = DeviceOf(draft, PrimitiveOf(draft, settings, device), setting);
  return FinishEvaluation(draft, settings, device, mistakes);
}

}  // namespace

int RunEvaluate(std::string_view command, const std::vector<std::string>& words,
                const Setting& setting) {
  planner::Settings settings;
  const auto make = [&](const Given& given, const Draft& draft,
                        Mistakes* mistakes) -> std::optional<Reading> {
    auto evaluation = EvaluationOf(given, draft, setting, mistakes);
    if (!evaluation) return std::nullopt;
    settings = std::move(evaluation->settings);
    return std::move(evaluation->reading);
  };
  const Call call = ReadCall(command, words, 1, make, setting);
  const planner::Answer answer =
      planner::answer::Evaluate(call.request(), call.device, settings, planner::Source{});
  Write(call,
        call.format == Format::kText
            ? planner::report::EvaluationText(call.request(), call.device, answer,
                                              StyleOf(call, setting))
            : InFormat(call, {{&answer}}, answer),
        setting);
  return answer.within ? kDone : kOff;
}

}  // namespace cli
