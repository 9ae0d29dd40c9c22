#include "cli/InputFile.h"

#include <fcntl.h>
#include <fmt/format.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>

#include "cli/Failure.h"
#include "cli/Output.h"
#include "planner/read/Shown.h"

namespace cli {

namespace {

std::string ReadAll(int descriptor, std::size_t most) {
  std::string text;
  char buffer[65536];
  while (text.size() <= most) {
    const std::size_t wanted = std::min(sizeof buffer, most + 1 - text.size());
    const ssize_t count = read(descriptor, buffer, wanted);
    if (count < 0 && errno == EINTR) continue;
    if (count < 0) throw FileError(SystemReason(errno));
    if (count == 0) break;
    text.append(buffer, static_cast<std::size_t>(count));
  }
  return text;
}

}  // namespace

std::string ReadFile(const std::string& name, std::size_t most) {
  if (name == "-") return ReadAll(STDIN_FILENO, most);
  const int descriptor = open(name.c_str(), O_RDONLY | O_CLOEXEC);
  if (descriptor < 0) throw FileError(SystemReason(errno));
  try {
    struct stat status {};
    if (fstat(descriptor, &status) == 0 && S_ISDIR(status.st_mode)) {
      throw FileError("it is a directory");
    }
    std::string text = ReadAll(descriptor, most);
    close(descriptor);
    return text;
  } catch (...) {
    close(descriptor);
    throw;
  }
}

std::string ReadFileOf(std::string_view kind, const std::string& name, std::size_t most,
                       std::string_view option) {
  const std::string before = option.empty() ? "" : fmt::format("{}: ", option);
  if (name.empty()) throw Failure::OfUsage(before + "the name of the file is empty");
  const std::string shown = before + planner::read::Shown(name);
  std::string text;
  try {
    text = ReadFile(name, most);
  } catch (const FileError& error) {
    throw Failure::OfUsage(fmt::format("{} cannot be read: {}", shown, error.what()));
  }
  if (text.size() > most) {
    throw Failure::OfUsage(fmt::format("{} is too large for a {}", shown, kind));
  }
  return text;
}

}  // namespace cli
