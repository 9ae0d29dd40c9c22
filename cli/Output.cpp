#include "cli/Output.h"

#include <fcntl.h>
#include <fmt/format.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <csignal>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <optional>
#include <string_view>
#include <utility>

#include "cli/Failure.h"
#include "planner/read/Letters.h"
#include "planner/read/Shown.h"

namespace cli {

namespace {

// Why a file cannot be written, and whether the name was to blame or what happened later.
struct FileError {
  std::string reason;
  bool name_is_wrong = true;
};

[[noreturn]] void Throw(int error, bool name_is_wrong = true) {
  throw FileError{SystemReason(error), name_is_wrong};
}

// A file descriptor, closed at the end of its scope.
class Descriptor {
 public:
  explicit Descriptor(int number) : number_(number) {}
  ~Descriptor() {
    if (number_ >= 0) close(number_);
  }
  Descriptor(const Descriptor&) = delete;
  Descriptor& operator=(const Descriptor&) = delete;
  int number() const { return number_; }
  // Some file systems tell only now that there was no room.
  int Close() { return close(std::exchange(number_, -1)); }

 private:
  int number_;
};

std::string FolderOf(const std::string& path) {
  const std::size_t slash = path.rfind('/');
  if (slash == std::string::npos) return "./";
  return path.substr(0, slash + 1);
}

// The path of a file behind links, also where there is no such file yet.
std::string Target(std::string path) {
  constexpr int kMostLinks = 40;
  for (int links = 0; links < kMostLinks; ++links) {
    struct stat status {};
    if (lstat(path.c_str(), &status) != 0 || !S_ISLNK(status.st_mode)) return path;
    std::string link(4096, '\0');
    const ssize_t size = readlink(path.c_str(), link.data(), link.size());
    if (size < 0) Throw(errno);
    link.resize(static_cast<std::size_t>(size));
    path = !link.empty() && link.front() == '/' ? link : FolderOf(path) + link;
  }
  Throw(ELOOP);
}

void WriteTo(int descriptor, const std::string& text) {
  const int error = WriteAll(descriptor, text);
  if (error != 0) Throw(error, false);
}

// What stands at the path is no plain file, and takes what is written.
void WriteThrough(const std::string& text, const std::string& path) {
  Descriptor file(open(path.c_str(), O_WRONLY | O_CLOEXEC));
  if (file.number() < 0) Throw(errno);
  WriteTo(file.number(), text);
  if (file.Close() != 0) Throw(errno, false);
}

// What a file can be read and written by, and whose it is.
struct Rights {
  mode_t mode;
  std::optional<std::pair<uid_t, gid_t>> owners;  // those of a file that was there
};

// Of a file that was not there: what the user does not mask.
mode_t UsualMode() {
  constexpr mode_t kAll = 0666;
  const mode_t masked = umask(0);
  umask(masked);
  return kAll & ~masked;
}

// A file beside another one, with a name of its own, that is gone unless it takes the other's
// place. Until then nobody else can read it. One that was left by a process that was killed is in
// nobody's way.
class Draft {
 public:
  explicit Draft(const std::string& path) : path_(path) {
    name_ = FolderOf(path) + ".vorkel.XXXXXX";
    descriptor_.emplace(mkostemp(name_.data(), O_CLOEXEC));
    if (descriptor_->number() < 0) {
      name_.clear();
      Throw(errno);
    }
  }
  ~Draft() {
    if (!name_.empty()) unlink(name_.c_str());
  }
  Draft(const Draft&) = delete;
  Draft& operator=(const Draft&) = delete;

  void Write(const std::string& text, const Rights& rights) {
    WriteTo(descriptor_->number(), text);
    // Who may not give a file away keeps it.
    if (rights.owners &&
        fchown(descriptor_->number(), rights.owners->first, rights.owners->second) != 0 &&
        errno != EPERM) {
      Throw(errno, false);
    }
    // Some file systems have the same rights for all files.
    if (fchmod(descriptor_->number(), rights.mode) != 0 && errno != EPERM) Throw(errno, false);
    // Some file systems have no such call, and then nothing to wait for.
    if (fsync(descriptor_->number()) != 0 && errno != EINVAL && errno != ENOSYS) {
      Throw(errno, false);
    }
    if (descriptor_->Close() != 0) Throw(errno, false);
  }

  void TakePlace() {
    if (rename(name_.c_str(), path_.c_str()) != 0) Throw(errno);
    name_.clear();
    const Descriptor folder(open(FolderOf(path_).c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
    if (folder.number() >= 0) fsync(folder.number());
  }

 private:
  std::string path_;
  std::string name_;
  std::optional<Descriptor> descriptor_;
};

void WriteWhole(const std::string& text, const std::string& name) {
  const std::string path = Target(name);
  struct stat status {};
  const bool is_there = stat(path.c_str(), &status) == 0;
  if (!is_there && errno != ENOENT) Throw(errno);
  if (is_there && S_ISDIR(status.st_mode)) throw FileError{"it is a directory"};
  if (is_there && !S_ISREG(status.st_mode)) return WriteThrough(text, path);
  if (path.back() == '/') throw FileError{"there is no such directory"};
  if (is_there && access(path.c_str(), W_OK) != 0) Throw(errno);
  if (path != name && access(FolderOf(path).c_str(), F_OK) != 0) {
    throw FileError{fmt::format("it is a link to {}, whose folder there is not",
                                planner::read::ShownWhole(path))};
  }
  constexpr mode_t kRights = 07777;
  Draft draft(path);
  draft.Write(text, is_there ? Rights{status.st_mode & kRights, {{status.st_uid, status.st_gid}}}
                             : Rights{UsualMode(), {}});
  draft.TakePlace();
}

}  // namespace

int WriteAll(int descriptor, std::string_view text) {
  while (!text.empty()) {
    const ssize_t count = write(descriptor, text.data(), text.size());
    if (count >= 0) {
      text.remove_prefix(static_cast<std::size_t>(count));
    } else if (errno != EINTR) {
      return errno;
    }
  }
  return 0;
}

void RefuseOut(int error) {
  throw Failure(kWrong, fmt::format("vorkel: standard output cannot be written: {}\n",
                                    error == EBADF ? "it is closed" : SystemReason(error)));
}

std::string TargetOf(const std::string& name) {
  try {
    return Target(name);
  } catch (const FileError& error) {
    RefuseFile(name, error.reason, error.name_is_wrong);
  }
}

void RefuseFile(const std::string& name, const std::string& reason, bool name_is_wrong) {
  throw Failure::OfUsage(
      fmt::format("-o: {} cannot be written: {}", planner::read::Shown(name), reason),
      name_is_wrong);
}

void PrepareStreams() {
  std::signal(SIGPIPE, SIG_IGN);
  // A file that grows beyond the limit of its size is an error, too.
  std::signal(SIGXFSZ, SIG_IGN);
  for (const int stream : {STDIN_FILENO, STDOUT_FILENO, STDERR_FILENO}) {
    if (fcntl(stream, F_GETFD) >= 0) continue;
    // The lowest number that is free is this one.
    const int opened = open("/dev/null", stream == STDIN_FILENO ? O_WRONLY : O_RDONLY);
    if (opened >= 0 && opened != stream) close(opened);
  }
}

void WriteOut(const std::string& text) {
  // What has gone wrong in the stream is told by what goes wrong now.
  const bool is_lost = std::fflush(stdout) != 0 || std::ferror(stdout) != 0;
  const int error = WriteAll(STDOUT_FILENO, text);
  if (error == EPIPE) return;
  if (error != 0 || is_lost) RefuseOut(error != 0 ? error : EIO);
}

void WriteError(const std::string& text) { WriteAll(STDERR_FILENO, text); }

void WriteFile(const std::string& text, const std::string& name) {
  if (name == "-") return WriteOut(text);
  try {
    WriteWhole(text, name);
  } catch (const FileError& error) {
    RefuseFile(name, error.reason, error.name_is_wrong);
  }
}

std::string SystemReason(int error) {
  std::string reason = std::strerror(error);
  if (!reason.empty()) reason[0] = planner::read::Lower(reason[0]);
  return reason;
}

}  // namespace cli
