#include "cli/Stream.h"

#include <fcntl.h>
#include <fmt/format.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>

#include "cli/Output.h"
#include "planner/read/Shown.h"

namespace cli {

namespace {

std::string FolderOf(const std::string& path) {
  const std::size_t slash = path.rfind('/');
  return slash == std::string::npos ? "./" : path.substr(0, slash + 1);
}

}  // namespace

std::string Stream::PathOfLeft(const std::string& target) { return target + ".part"; }

Stream::Stream(const std::string& name, Draft draft, const std::optional<Left>& left)
    : name_(name == "-" ? "" : name) {
  if (name_.empty()) {
    descriptor_ = STDOUT_FILENO;
    return;
  }
  target_ = TargetOf(name_);
  struct stat status {};
  const bool is_there = stat(target_.c_str(), &status) == 0;
  if (!is_there && errno != ENOENT) RefuseFile(name_, SystemReason(errno), true);
  if (is_there && S_ISDIR(status.st_mode)) RefuseFile(name_, "it is a directory", true);
  if (target_.back() == '/') RefuseFile(name_, "there is no such directory", true);
  if (is_there && !S_ISREG(status.st_mode)) {
    // Such as /dev/null: it has nothing to keep whole.
    descriptor_ = open(target_.c_str(), O_WRONLY | O_CLOEXEC);
    if (descriptor_ < 0) RefuseFile(name_, SystemReason(errno), true);
    return;
  }
  if (is_there && access(target_.c_str(), W_OK) != 0) RefuseFile(name_, SystemReason(errno), true);
  OpenDraft(draft, left);
  constexpr mode_t kRights = 07777;
  if (is_there) fchmod(descriptor_, status.st_mode & kRights);
}

void Stream::OpenDraft(Draft draft, const std::optional<Left>& left) {
  constexpr mode_t kMode = 0666;  // without what the user masks
  is_kept_ = draft == Draft::kKept;
  const std::string path =
      is_kept_ ? PathOfLeft(target_) : FolderOf(target_) + ".vorkel." + std::to_string(getpid());
  if (left && left->path != path && rename(left->path.c_str(), path.c_str()) != 0) {
    RefuseFile(name_, SystemReason(errno), true);
  }
  const int how = left ? O_WRONLY : O_WRONLY | O_CREAT | O_EXCL;
  descriptor_ = open(path.c_str(), how | O_CLOEXEC, kMode);
  if (descriptor_ < 0) {
    if (errno == EEXIST && is_kept_) {
      RefuseFile(name_,
                 fmt::format("{} is there, of a run that was interrupted or is still at work; "
                             "--resume goes on with it, or remove it to begin afresh",
                             planner::read::ShownWhole(path)),
                 true);
    }
    RefuseFile(name_, SystemReason(errno), true);
  }
  draft_ = path;
  if (!is_kept_) return;
  if (flock(descriptor_, LOCK_EX | LOCK_NB) != 0) {
    RefuseFile(name_, "another run is writing to " + planner::read::ShownWhole(path), true);
  }
  if (left && (ftruncate(descriptor_, left->size) != 0 || lseek(descriptor_, 0, SEEK_END) < 0)) {
    RefuseFile(name_, SystemReason(errno), false);
  }
}

Stream::~Stream() {
  if (name_.empty() || descriptor_ < 0) return;
  close(descriptor_);
  if (!draft_.empty() && !is_kept_) unlink(draft_.c_str());
}

bool Stream::Write(std::string_view text) {
  const int error = WriteAll(descriptor_, text);
  if (error == 0) return true;
  if (!name_.empty()) RefuseFile(name_, SystemReason(error), false);
  if (error == EPIPE) return false;
  RefuseOut(error);
}

void Stream::Finish() {
  if (name_.empty()) return;
  if (!draft_.empty()) {
    // Some file systems have no such call, and then nothing to wait for.
    if (fsync(descriptor_) != 0 && errno != EINVAL && errno != ENOSYS) {
      RefuseFile(name_, SystemReason(errno), false);
    }
    if (rename(draft_.c_str(), target_.c_str()) != 0) {
      RefuseFile(name_, SystemReason(errno), false);
    }
    draft_.clear();
  }
  const int closed = close(descriptor_);
  descriptor_ = -1;
  // Some file systems tell only now that there was no room.
  if (closed != 0) RefuseFile(name_, SystemReason(errno), false);
}

}  // namespace cli
