#include "cli/InputFile.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>

#include "cli/Output.h"

namespace cli {

namespace {

std::string ReadAll(int descriptor, std::size_t most) {
  std::string text(most + 1, '\0');
  std::size_t length = 0;
  while (length < text.size()) {
    const ssize_t count = read(descriptor, text.data() + length, text.size() - length);
    if (count < 0 && errno == EINTR) continue;
    if (count < 0) throw FileError(SystemReason(errno));
    if (count == 0) break;
    length += static_cast<std::size_t>(count);
  }
  text.resize(length);
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

}  // namespace cli
