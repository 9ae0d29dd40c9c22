#include "cli/TclRequest.h"

#include <fcntl.h>
#include <fmt/format.h>
#include <spawn.h>
#include <sys/mman.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cerrno>
#include <csignal>
#include <utility>

#include "cli/Failure.h"
#include "cli/Output.h"
#include "host/bundled/device/Shipped.h"

extern char** environ;  // NOLINT: POSIX declares it nowhere

namespace cli {

namespace {

constexpr const char* kInterpreter = "tclsh8.6";
constexpr const char* kScript = "tcl_request.tcl";

[[noreturn]] void Fail(const std::string& what) {
  throw Failure(kFailed, fmt::format("vorkel: a request in Tcl cannot be read: {}\n", what));
}

void Check(int error, const char* what) {
  if (error != 0) Fail(fmt::format("{}: {}", what, SystemReason(error)));
}

// A file without a name that holds a text, at its beginning.
int FileOf(const std::string& text) {
  const int file = memfd_create("request", MFD_CLOEXEC);
  if (file < 0) Check(errno, "memory for it");
  for (std::size_t written = 0; written < text.size();) {
    const ssize_t count = write(file, text.data() + written, text.size() - written);
    if (count < 0 && errno != EINTR) Check(errno, "memory for it");
    if (count > 0) written += static_cast<std::size_t>(count);
  }
  lseek(file, 0, SEEK_SET);
  return file;
}

// Starts the interpreter, with two files as its standard input and output.
pid_t Start(const std::string& script, int input, int output) {
  posix_spawn_file_actions_t actions;
  Check(posix_spawn_file_actions_init(&actions), kInterpreter);
  posix_spawn_file_actions_adddup2(&actions, input, STDIN_FILENO);
  posix_spawn_file_actions_adddup2(&actions, output, STDOUT_FILENO);
  // What this program does about signals is its own affair.
  posix_spawnattr_t attributes;
  Check(posix_spawnattr_init(&attributes), kInterpreter);
  sigset_t usual;
  sigemptyset(&usual);
  sigaddset(&usual, SIGPIPE);
  sigaddset(&usual, SIGXFSZ);
  posix_spawnattr_setsigdefault(&attributes, &usual);
  posix_spawnattr_setflags(&attributes, POSIX_SPAWN_SETSIGDEF);
  std::string name = kInterpreter;
  std::string path = script;
  char* const words[] = {name.data(), path.data(), nullptr};
  pid_t process = 0;
  const int error = posix_spawnp(&process, kInterpreter, &actions, &attributes, words, environ);
  posix_spawn_file_actions_destroy(&actions);
  posix_spawnattr_destroy(&attributes);
  Check(error, kInterpreter);
  return process;
}

std::string ReadAll(int descriptor) {
  std::string text;
  char buffer[4096];
  for (;;) {
    const ssize_t count = read(descriptor, buffer, sizeof buffer);
    if (count < 0 && errno == EINTR) continue;
    if (count <= 0) return text;
    text.append(buffer, static_cast<std::size_t>(count));
  }
}

}  // namespace

std::string AskTcl(const std::string& text, const Setting& setting) {
  const std::string script = ::Device::Shipped(setting.folder, kScript);
  if (script.empty()) Fail(fmt::format("{} is not where it belongs", kScript));
  const int input = FileOf(text);
  int ends[2];
  if (pipe2(ends, O_CLOEXEC) != 0) Check(errno, "a pipe");
  const pid_t process = Start(script, input, ends[1]);
  close(input);
  close(ends[1]);
  std::string answer = ReadAll(ends[0]);
  close(ends[0]);
  int status = 0;
  while (waitpid(process, &status, 0) < 0 && errno == EINTR) {
  }
  if (!WIFEXITED(status) || WEXITSTATUS(status) != 0) {
    Fail(fmt::format("{} has failed", kScript));
  }
  return answer;
}

}  // namespace cli
