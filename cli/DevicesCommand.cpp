#include "cli/DevicesCommand.h"

#include <fmt/format.h>
#include <sys/stat.h>

#include <algorithm>

#include "cli/Devices.h"
#include "cli/Failure.h"
#include "cli/Output.h"
#include "cli/Words.h"
#include "planner/read/Letters.h"
#include "planner/read/Shown.h"
#include "planner/report/DevicesText.h"
#include "planner/report/PartText.h"

namespace cli {

namespace {

// Says which folders of VORKEL_DEVICES there are not: they are passed over.
void TellFolders(const Setting& setting) {
  std::vector<std::string> folders = setting.device_folders;
  std::sort(folders.begin(), folders.end());
  folders.erase(std::unique(folders.begin(), folders.end()), folders.end());
  for (const std::string& folder : folders) {
    struct stat status {};
    if (stat(folder.c_str(), &status) == 0 && S_ISDIR(status.st_mode)) continue;
    WriteError(fmt::format("vorkel: warning: VORKEL_DEVICES names {}, which is no folder\n",
                           planner::read::Shown(folder)));
  }
}

bool IsJson(const Given& given) {
  const std::string format = given.Value("--format").value_or("text");
  const bool is_json = planner::read::IsSameWord(format, "json");
  if (!is_json && !planner::read::IsSameWord(format, "text")) {
    throw Failure::OfUsage(
        fmt::format("--format: \"{}\" must be text or json", planner::read::Shown(format)));
  }
  return is_json;
}

planner::device::Catalogue::Selection Selected(const planner::device::Files& files,
                                               const std::string& name) {
  try {
    return planner::device::Catalogue(files).Select(name);
  } catch (const planner::device::PartError& error) {
    throw Failure::OfUsage(planner::report::PartText(error),
                           error.kind != planner::device::PartError::Kind::kBadFile);
  }
}

}  // namespace

int RunDevices(std::string_view command, const std::vector<std::string>& words,
               const Setting& setting) {
  const Given given = ReadWords(command, words, 1);
  const bool is_json = IsJson(given);
  const planner::report::Style style{setting.out_has_colour, setting.out_width};
  const auto files = DeviceFiles(setting);
  TellFolders(setting);
  if (given.operands.empty()) {
    const std::vector<planner::device::Listed> devices = planner::device::List(*files);
    WriteOut(is_json ? planner::report::DevicesJson(devices)
                     : planner::report::DevicesText(devices, style));
    return kDone;
  }
  const auto selection = Selected(*files, given.operands.front());
  const planner::device::Description device = planner::device::Describe(selection.file);
  WriteOut(is_json ? planner::report::DeviceJson(device, selection.grades)
                   : planner::report::DeviceText(device, selection.grades, style));
  return kDone;
}

}  // namespace cli
