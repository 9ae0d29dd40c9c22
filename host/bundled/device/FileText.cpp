#include "host/bundled/device/FileText.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <optional>
#include <system_error>

#include "host/bundled/device/DeviceError.h"

namespace Device {
namespace {

DeviceError CannotRead(const std::string& path, const std::string& reason) {
  return DeviceError(path, std::nullopt, "cannot be read: " + reason);
}

std::string SystemReason() { return std::generic_category().message(errno); }

// A file descriptor, closed at the end of its scope.
class OpenFile {
 public:
  // Opening a named pipe waits for a writer unless O_NONBLOCK is given; for regular files
  // the flag means nothing.
  explicit OpenFile(const std::string& path)
      : path_(path), descriptor_(open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK)) {
    if (descriptor_ < 0) throw CannotRead(path_, SystemReason());
  }
  ~OpenFile() { close(descriptor_); }
  OpenFile(const OpenFile&) = delete;
  OpenFile& operator=(const OpenFile&) = delete;

  // The size of the file, which must be a regular one.
  std::size_t RegularSize() const {
    struct stat status {};
    if (fstat(descriptor_, &status) != 0) throw CannotRead(path_, SystemReason());
    if (S_ISDIR(status.st_mode)) throw CannotRead(path_, "it is a directory");
    if (!S_ISREG(status.st_mode)) throw CannotRead(path_, "it is not a regular file");
    return static_cast<std::size_t>(status.st_size);
  }

  // The next bytes into `buffer`; how many, 0 at the end.
  std::size_t Read(char* buffer, std::size_t size) const {
    for (;;) {
      const ssize_t count = read(descriptor_, buffer, size);
      if (count >= 0) return static_cast<std::size_t>(count);
      if (errno != EINTR) throw CannotRead(path_, SystemReason());
    }
  }

 private:
  const std::string& path_;
  int descriptor_;
};

void RequireShort(const std::string& path, std::size_t length) {
  if (length <= kLargestFile) return;
  throw DeviceError(path, std::nullopt,
                    "is longer than " + std::to_string(kLargestFile) +
                        " bytes, which no device file is");
}

void RequireFewDots(const std::string& path, std::string_view text) {
  SourcePosition position;
  std::size_t dots = 0;
  for (const char c : text) {
    if (c == '.' && ++dots > kMostDots) {
      throw ErrorAt(path, position,
                    "no device file has more than " + std::to_string(kMostDots) + " dots");
    }
    if (c == '\n') {
      ++position.line;
      position.column = 1;
    } else {
      ++position.column;
    }
  }
}

}  // namespace

std::string ReadFileText(const std::string& path) {
  const OpenFile file(path);
  // A byte more than the file has now, so that the end is met; it may grow all the same.
  std::string text(std::min(file.RegularSize(), kLargestFile) + 1, '\0');
  std::size_t length = 0;
  while (const std::size_t count = file.Read(text.data() + length, text.size() - length)) {
    length += count;
    RequireShort(path, length);
    if (length == text.size()) text.resize(kLargestFile + 1);
  }
  text.resize(length);
  return text;
}

void RequireParsable(const std::string& path, std::string_view text) {
  RequireShort(path, text.size());
  RequireFewDots(path, text);
}

}  // namespace Device
