#include "cli/Setting.h"

#include <sys/auxv.h>
#include <sys/ioctl.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstdlib>
#include <filesystem>
#include <string_view>
#include <system_error>

#include "host/bundled/device/Shipped.h"

namespace cli {

namespace {

std::string Variable(const char* name) {
  const char* value = std::getenv(name);
  return value ? value : "";
}

// Prose and tables are made for 80 columns; a narrower terminal gets shorter lines.
int WidthOf(int stream) {
  constexpr int kUsual = 80;
  constexpr int kNarrowest = 40;
  winsize size{};
  if (!isatty(stream) || ioctl(stream, TIOCGWINSZ, &size) != 0 || size.ws_col == 0) return kUsual;
  return std::clamp(static_cast<int>(size.ws_col), kNarrowest, kUsual);
}

bool HasColour() {
  const std::string terminal = Variable("TERM");
  return Variable("NO_COLOR").empty() && !terminal.empty() && terminal != "dumb" &&
         isatty(STDOUT_FILENO);
}

// The folder of the executable file. Where /proc is not there, as in a plain chroot, the system
// still tells by which path it was started.
std::string OwnFolder() {
  namespace fs = std::filesystem;
  std::error_code error;
  fs::path own = fs::read_symlink("/proc/self/exe", error);
  if (error) {
    // The system tells the address as a number. NOLINTNEXTLINE(performance-no-int-to-ptr)
    const auto* const started = reinterpret_cast<const char*>(getauxval(AT_EXECFN));
    own = started != nullptr ? fs::canonical(started, error) : fs::path();
  }
  return own.parent_path().native();
}

// Whether the program does not stand in a build tree, where a script of the checkout starts it.
bool IsInstalled(const std::string& folder) {
  return !::Device::Shipped(folder, "devices").starts_with(folder + "/");
}

// The word by which the program was called, where it can be pasted into a shell as it is.
std::string CalledAs() {
  constexpr std::string_view kPlain =
      "abcdefghijklmnopqrstuvwxyzABCDEFGHIJKLMNOPQRSTUVWXYZ0123456789_-+./";
  const std::string_view word = program_invocation_name;
  const bool is_plain = !word.empty() && word.find_first_not_of(kPlain) == std::string_view::npos;
  return is_plain ? std::string(word) : "vorkel";
}

}  // namespace

Setting SettingOfProcess() {
  Setting setting;
  setting.folder = OwnFolder();
  const std::string program = Variable("VORKEL_PROGRAM");
  if (!program.empty()) {
    setting.program = program;
  } else if (IsInstalled(setting.folder)) {
    setting.program = CalledAs();
  }
  std::string_view folders;
  const std::string devices = Variable("VORKEL_DEVICES");
  for (folders = devices; !folders.empty();) {
    const std::size_t colon = std::min(folders.find(':'), folders.size());
    if (colon > 0) setting.device_folders.emplace_back(folders.substr(0, colon));
    folders.remove_prefix(std::min(colon + 1, folders.size()));
  }
  setting.out_has_colour = HasColour();
  setting.out_width = WidthOf(STDOUT_FILENO);
  setting.err_width = WidthOf(STDERR_FILENO);
  return setting;
}

}  // namespace cli
