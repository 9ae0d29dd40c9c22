#include "cli/VerifyCommand.h"

#include <fmt/format.h>

#include "cli/Devices.h"
#include "cli/Failure.h"
#include "cli/InputFile.h"
#include "cli/Output.h"
#include "cli/Words.h"
#include "planner/read/Shown.h"
#include "planner/report/PartText.h"
#include "planner/report/VerifyText.h"
#include "planner/verify/Verify.h"

namespace cli {

namespace {

// A plan has some KiB for each of its answers, which are some dozens, or a thousand trade-offs.
constexpr std::size_t kLargest = 50'000'000;

// The device that a plan is for; one without anything when the plan does not say.
planner::Device DeviceOf(const std::string& text, const std::string& name, const Setting& setting) {
  const std::optional<std::string> part = planner::verify::PartOf(text);
  if (!part) return {};
  const auto files = DeviceFiles(setting);
  try {
    return planner::device::Catalogue(*files).FindDevice(*part);
  } catch (const planner::device::PartError& error) {
    throw Failure::OfUsage(fmt::format("{}: request.device: {}", planner::read::Shown(name),
                                       planner::report::PartText(error)),
                           false);
  }
}

}  // namespace

int RunVerify(std::string_view command, const std::vector<std::string>& words,
              const Setting& setting) {
  const Given given = ReadWords(command, words, 1);
  if (given.operands.empty()) {
    throw Failure::OfUsage("the plan is missing: verify FILE, such as verify plan.json");
  }
  const std::string& name = given.operands.front();
  const std::string text = ReadFileOf("plan", name, kLargest);
  const planner::Device device = DeviceOf(text, name, setting);
  const auto wrong = planner::verify::Verify(text, device, &planner::report::JsonSentences());
  if (!wrong.empty()) {
    WriteError(planner::report::VerifyText(wrong, name, {false, setting.err_width}));
    return kWrong;
  }
  WriteOut(planner::report::VerifyText(wrong, name, {setting.out_has_colour, setting.out_width}));
  return kDone;
}

}  // namespace cli
