#include "cli/CheckCommand.h"

#include <fmt/format.h>
#include <sys/stat.h>

#include <cerrno>

#include "cli/Devices.h"
#include "cli/Failure.h"
#include "cli/InputFile.h"
#include "cli/Output.h"
#include "cli/Words.h"
#include "planner/read/Shown.h"
#include "planner/report/CheckText.h"

namespace cli {

namespace {

constexpr std::size_t kLargest = 1'000'000;
constexpr std::string_view kEnding = ".toml";

std::string LastPart(const std::string& path) { return path.substr(path.rfind('/') + 1); }

// What to say when the name of a file is that of a device, or its beginning.
std::string IsDevice(const std::string& name, const Setting& setting) {
  const auto files = DeviceFiles(setting);
  try {
    const auto part = planner::device::Catalogue(*files).Find(name);
    return fmt::format(
        "; check takes the file of a device, that of {0} is {1}, and devices {0} shows its limits",
        part.file.device, planner::read::ShownWhole(part.file.path));
  } catch (const planner::device::PartError&) {
    return "";
  }
}

// Why a name is not that of a device file, or nothing.
std::string WhyNot(const std::string& path, const Setting& setting) {
  if (path.empty()) return "the name of the file is empty";
  struct stat status {};
  if (stat(path.c_str(), &status) != 0) {
    return errno == ENOENT ? "there is no such file" + IsDevice(path, setting)
                           : SystemReason(errno);
  }
  if (S_ISDIR(status.st_mode)) return "it is a directory";
  if (!S_ISREG(status.st_mode)) return "it is no plain file";
  const std::string name = LastPart(path);
  const bool is_named = name.size() > kEnding.size() &&
                        name.compare(name.size() - kEnding.size(), kEnding.size(), kEnding) == 0;
  if (!is_named) return "a device file is named DEVICE.toml";
  if (static_cast<std::size_t>(status.st_size) > kLargest) {
    return "it is too large for a device file";
  }
  return "";
}

std::string Contents(const std::string& path, const Setting& setting) {
  std::string reason = WhyNot(path, setting);
  if (reason.empty()) {
    try {
      return ReadFile(path, kLargest);
    } catch (const FileError& error) {
      reason = error.what();
    }
  }
  const std::string label = path.empty() ? "" : planner::read::Shown(path) + ": ";
  throw Failure::OfUsage(label + reason);
}

}  // namespace

int RunCheck(std::string_view command, const std::vector<std::string>& words,
             const Setting& setting) {
  const Given given = ReadWords(command, words, 1);
  if (given.operands.empty()) {
    throw Failure::OfUsage("the device file is missing: check FILE, such as check my_device.toml");
  }
  const std::string& path = given.operands.front();
  const std::string text = Contents(path, setting);
  const std::string name = LastPart(path);
  const auto checked =
      planner::device::Check(text, path, name.substr(0, name.size() - kEnding.size()));
  const std::string shown = planner::read::ShownWhole(path);
  if (!checked.mistakes.empty()) {
    WriteError(planner::report::MistakesText(checked, shown, {false, setting.err_width}));
    return kWrong;
  }
  WriteOut(planner::report::CheckText(checked, shown, {setting.out_has_colour, setting.out_width}));
  return kDone;
}

}  // namespace cli
