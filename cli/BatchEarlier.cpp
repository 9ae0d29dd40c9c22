#include "cli/BatchEarlier.h"

#include <fcntl.h>
#include <fmt/format.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <optional>

#include "cli/Failure.h"
#include "cli/Output.h"
#include "planner/read/Shown.h"

namespace cli {

using planner::batch::Head;
using planner::batch::Line;

BatchEarlier::BatchEarlier(const std::string& name) : name_(name) {
  const std::string target = TargetOf(name);
  for (const std::string& path : {Stream::PathOfLeft(target), target}) {
    path_ = path;
    is_target_ = path == target;
    descriptor_ = open(path.c_str(), O_RDONLY | O_CLOEXEC);
    if (descriptor_ >= 0) break;
    if (errno != ENOENT) Refuse("it cannot be read: " + SystemReason(errno));
  }
  struct stat status {};
  if (descriptor_ >= 0 && fstat(descriptor_, &status) == 0 && !S_ISREG(status.st_mode)) {
    Refuse("it is no plain file");
  }
}

BatchEarlier::~BatchEarlier() {
  if (descriptor_ >= 0) close(descriptor_);
}

void BatchEarlier::Refuse(const std::string& reason) const {
  throw Failure::OfUsage(fmt::format("--resume: {}: {}", planner::read::ShownWhole(path_), reason),
                         false);
}

bool BatchEarlier::HasNext() {
  if (descriptor_ < 0) return false;
  char piece[65536];
  while (next_.empty()) {
    const ssize_t count = read(descriptor_, piece, sizeof piece);
    if (count < 0 && errno == EINTR) continue;
    if (count < 0) Refuse("it cannot be read: " + SystemReason(errno));
    // A line without an end was cut.
    if (count == 0) return false;
    read_ += count;
    lines_.Add(std::string_view(piece, static_cast<std::size_t>(count)),
               [this](Line line) { next_.push_back(std::move(line)); });
  }
  return true;
}

Head BatchEarlier::Take(const Line& line) {
  const Line answer = std::move(next_.front());
  next_.pop_front();
  const std::optional<Head> head = planner::batch::ReadHead(answer.text);
  if (!head) Refuse(fmt::format("line {} is no answer of a batch", answer.number));
  if (head->line != line.number || head->digest != line.digest) {
    Refuse(
        fmt::format("line {} answers line {} of another input, or was made with other options; "
                    "here line {} comes next",
                    answer.number, head->line, line.number));
  }
  size_ += static_cast<long long>(answer.size) + 1;
  return *head;
}

void BatchEarlier::End() {
  if (!HasNext()) return;
  Refuse(fmt::format("line {} answers what the input does not have", next_.front().number));
}

std::optional<Stream::Left> BatchEarlier::Left() const {
  if (descriptor_ < 0) return std::nullopt;
  return Stream::Left{path_, size_};
}

}  // namespace cli
