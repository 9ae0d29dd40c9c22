#include "engine/StandardOutput.h"

#include <cerrno>
#include <cstddef>
#include <cstdio>

#ifndef _WIN32
#include <fcntl.h>
#include <poll.h>
#include <sys/stat.h>
#include <unistd.h>
#endif

namespace Ip {

namespace {

// By the buffer of C.
int WriteAsC(std::string_view text) {
  const bool written = std::fwrite(text.data(), 1, text.size(), stdout) == text.size();
  return written && std::fflush(stdout) == 0 ? kWritten : errno;
}

}  // namespace

#ifdef _WIN32

// There a file has nothing by which one for oneself could be told.
int WriteToStandardOutput(std::string_view text) { return WriteAsC(text); }

#else

namespace {

// Which file a number stands for; none when it stands for nothing.
struct Identity {
  bool is_open = false;
  dev_t device = 0;
  ino_t number = 0;
  bool operator==(const Identity&) const = default;
};

Identity IdentityOf(int descriptor) {
  struct stat status {};
  if (fstat(descriptor, &status) != 0) return {};
  return {true, status.st_dev, status.st_ino};
}

// When this library was loaded.
const Identity at_load = IdentityOf(STDOUT_FILENO);

// 0 when a text may go to the file; else why it may not.
int WhyNot(int descriptor) {
  const Identity now = IdentityOf(descriptor);
  if (!now.is_open) return EBADF;
  if (now == at_load) return kWritten;
  const int flags = fcntl(descriptor, F_GETFD);
  return flags >= 0 && (flags & FD_CLOEXEC) != 0 ? kStandsForAnother : kWritten;
}

// How long a file that does not block may take nothing, ms. Its reader can be this very thread.
constexpr int kPatience = 10'000;

// A file that does not block takes what it can, and the rest when its reader has taken that. False
// when nobody reads, or nobody can tell, with the reason in errno.
bool WaitFor(int descriptor) {
  pollfd file = {descriptor, POLLOUT, 0};
  const int ready = poll(&file, 1, kPatience);
  if (ready == 0) errno = EAGAIN;
  return ready > 0 || (ready < 0 && errno == EINTR);
}

// C gives up what such a file does not take at once.
bool CanFlush(int descriptor) {
  const int flags = fcntl(descriptor, F_GETFL);
  return flags < 0 || (flags & O_NONBLOCK) == 0 || WaitFor(descriptor);
}

int WriteAll(int descriptor, std::string_view text) {
  while (!text.empty()) {
    const ssize_t size = write(descriptor, text.data(), text.size());
    if (size >= 0) {
      text.remove_prefix(static_cast<std::size_t>(size));
    } else if (errno == EAGAIN || errno == EWOULDBLOCK) {
      if (!WaitFor(descriptor)) return errno;
    } else if (errno != EINTR) {
      return errno;
    }
  }
  return kWritten;
}

// Keeps other threads from printing.
class Locked {
 public:
  explicit Locked(std::FILE* file) : file_(file) { flockfile(file_); }
  ~Locked() { funlockfile(file_); }
  Locked(const Locked&) = delete;
  Locked& operator=(const Locked&) = delete;

 private:
  std::FILE* file_;
};

}  // namespace

int WriteToStandardOutput(std::string_view text) {
  const Locked locked(stdout);
  const int descriptor = fileno(stdout);
  if (descriptor >= 0) {
    if (const int why = WhyNot(descriptor); why != kWritten) return why;
    if (!CanFlush(descriptor) || std::fflush(stdout) != 0) return errno;
    return WriteAll(descriptor, text);
  }
  return WriteAsC(text);  // a stream in memory
}

#endif  // _WIN32

}  // namespace Ip
