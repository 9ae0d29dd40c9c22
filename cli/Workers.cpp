#include "cli/Workers.h"

#include <fcntl.h>
#include <poll.h>
#include <sys/socket.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <csignal>
#include <cstring>
#include <system_error>
#include <utility>

#include "cli/Output.h"

namespace cli {

namespace {

using planner::batch::Line;

// What a process gets and sends: a head, and then so many bytes.
struct LineHead {
  std::int64_t number;
  std::uint64_t digest;
  std::uint64_t size;
  bool is_too_long;
};
struct DoneHead {
  std::int64_t number;
  std::uint64_t size;
  int status;
  int primitive;  // -1: none
};

// A process has so much in hand at most: enough that it need not wait for more.
constexpr std::size_t kMostLines = 32;
constexpr std::size_t kMostBytes = 256 * 1024;
// And all together; a line that takes long holds up those behind it.
constexpr std::size_t kMostInHand = 8192;
constexpr std::size_t kMostBytesInHand = 32 * 1024 * 1024;

constexpr std::size_t kPiece = 64 * 1024;

template <typename Head>
void Append(const Head& head, std::string_view bytes, std::string* text) {
  text->append(reinterpret_cast<const char*>(&head), sizeof head);
  text->append(bytes);
}

// Takes the first message of a text from a place on; null when not all of it is there.
template <typename Head>
bool TakeMessage(const std::string& text, std::size_t* place, Head* head, std::string* bytes) {
  if (text.size() - *place < sizeof *head) return false;
  std::memcpy(head, text.data() + *place, sizeof *head);
  if (text.size() - *place - sizeof *head < head->size) return false;
  bytes->assign(text, *place + sizeof *head, head->size);
  *place += sizeof *head + head->size;
  return true;
}

// Reads a piece; the number of bytes, 0 at the end, below 0 when there is nothing now.
ssize_t ReadPiece(int descriptor, std::string* text) {
  char piece[kPiece];
  for (;;) {
    const ssize_t count = read(descriptor, piece, sizeof piece);
    if (count > 0) text->append(piece, static_cast<std::size_t>(count));
    if (count >= 0) return count;
    if (errno == EINTR) continue;
    // The end of a socket whose other side has died with something unread.
    return errno == EAGAIN ? -1 : 0;
  }
}

}  // namespace

Workers::Workers(int count, Work work, Work died)
    : work_(std::move(work)), died_(std::move(died)), workers_(static_cast<std::size_t>(count)) {}

Workers::~Workers() {
  for (Worker& worker : workers_) {
    if (worker.process < 0) continue;
    close(worker.socket);
    kill(worker.process, SIGKILL);
    while (waitpid(worker.process, nullptr, 0) < 0 && errno == EINTR) continue;
  }
}

void Workers::Start(Worker* worker) {
  int ends[2];
  if (socketpair(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0, ends) != 0) {
    throw std::system_error(errno, std::generic_category(), "no socket for another process");
  }
  const pid_t process = fork();
  if (process < 0) {
    const int error = errno;
    close(ends[0]);
    close(ends[1]);
    throw std::system_error(error, std::generic_category(), "no other process");
  }
  if (process == 0) {
    close(ends[0]);
    Serve(ends[1]);
  }
  close(ends[1]);
  fcntl(ends[0], F_SETFL, fcntl(ends[0], F_GETFL) | O_NONBLOCK);
  worker->process = process;
  worker->socket = ends[0];
}

// Another process: answers lines until there are no more.
void Workers::Serve(int socket) {
  // What the parent has open must end when the parent does: what it sends the others, its input and
  // its output, the lock of that.
  const int nothing = open("/dev/null", O_RDWR | O_CLOEXEC);
  dup2(nothing, STDIN_FILENO);
  dup2(nothing, STDOUT_FILENO);
  constexpr int kOwn = STDERR_FILENO + 1;
  if (socket != kOwn) socket = dup2(socket, kOwn);
  close_range(kOwn + 1, ~0U, 0);
  std::string in;
  std::string out;
  std::size_t place = 0;
  LineHead head{};
  Line line;
  for (;;) {
    while (TakeMessage(in, &place, &head, &line.text)) {
      line.number = head.number;
      line.digest = head.digest;
      line.is_too_long = head.is_too_long;
      const Done done = work_(line);
      Append(DoneHead{done.line, done.text.size(), static_cast<int>(done.status),
                      done.primitive ? static_cast<int>(*done.primitive) : -1},
             done.text, &out);
      if (out.size() < kPiece) continue;
      if (WriteAll(socket, out) != 0) _exit(0);
      out.clear();
    }
    in.erase(0, place);
    place = 0;
    if (WriteAll(socket, out) != 0 || ReadPiece(socket, &in) == 0) _exit(0);
    out.clear();
  }
}

void Workers::Give(Line line) {
  order_.push_back(line.number);
  waiting_bytes_ += line.text.size();
  waiting_.push_back({std::move(line), false});
}

bool Workers::IsFull() const {
  return waiting_.size() >= workers_.size() * kMostLines || waiting_bytes_ >= kMostBytes ||
         order_.size() >= kMostInHand || done_bytes_ >= kMostBytesInHand;
}

// Whether a process gets the next line that waits.
bool Workers::CanTake(const Worker& worker) const {
  const Held& next = waiting_.front();
  // The one for which the answers behind it wait goes always.
  if (done_bytes_ >= kMostBytesInHand && next.line.number != order_.front()) return false;
  if (worker.held.empty()) return true;
  if (next.is_suspect || worker.held.front().is_suspect) return false;
  // Towards the end, and of few lines that take long, each gets its share.
  const std::size_t share =
      std::clamp(waiting_.size() / (2 * workers_.size()), std::size_t{1}, kMostLines);
  return worker.held.size() < share && worker.bytes < kMostBytes;
}

void Workers::GiveNext(Worker* worker) {
  Held held = std::move(waiting_.front());
  waiting_.pop_front();
  waiting_bytes_ -= held.line.text.size();
  worker->bytes += held.line.text.size();
  Append(LineHead{held.line.number, held.line.digest, held.line.text.size(), held.line.is_too_long},
         held.line.text, &worker->out);
  worker->held.push_back(std::move(held));
}

// Each in turn, so that all have something to do.
void Workers::Feed() {
  for (bool has_given = true; has_given;) {
    has_given = false;
    for (Worker& worker : workers_) {
      if (waiting_.empty()) return;
      if (!CanTake(worker)) continue;
      if (worker.process < 0) Start(&worker);
      GiveNext(&worker);
      has_given = true;
    }
  }
}

void Workers::Send(Worker* worker) {
  while (!worker->out.empty()) {
    const ssize_t count =
        send(worker->socket, worker->out.data(), worker->out.size(), MSG_NOSIGNAL);
    if (count >= 0) {
      worker->out.erase(0, static_cast<std::size_t>(count));
    } else if (errno != EINTR) {
      // One that has died is found out when it is read from.
      return;
    }
  }
}

void Workers::Receive(Worker* worker) {
  const ssize_t count = ReadPiece(worker->socket, &worker->in);
  std::size_t place = 0;
  DoneHead head{};
  Done done;
  while (TakeMessage(worker->in, &place, &head, &done.text)) {
    done.line = head.number;
    done.status = static_cast<planner::batch::Status>(head.status);
    done.primitive.reset();
    if (head.primitive >= 0) done.primitive = static_cast<planner::Primitive>(head.primitive);
    worker->bytes -= worker->held.front().line.text.size();
    worker->held.pop_front();
    Keep(std::move(done));
    done = {};
  }
  worker->in.erase(0, place);
  if (count == 0) Bury(worker);
}

// A process that has died: what it had in hand goes back to the front.
void Workers::Bury(Worker* worker) {
  close(worker->socket);
  while (waitpid(worker->process, nullptr, 0) < 0 && errno == EINTR) continue;
  std::deque<Held> held = std::move(worker->held);
  *worker = {};
  if (held.size() == 1 && held.front().is_suspect) {
    Keep(died_(held.front().line));
    return;
  }
  for (; !held.empty(); held.pop_back()) {
    held.back().is_suspect = true;
    waiting_bytes_ += held.back().line.text.size();
    waiting_.push_front(std::move(held.back()));
  }
}

void Workers::Keep(Done done) {
  done_bytes_ += done.text.size();
  const std::int64_t line = done.line;
  done_.emplace(line, std::move(done));
}

bool Workers::Wait(int descriptor) {
  for (;;) {
    Feed();
    for (Worker& worker : workers_) {
      if (worker.process >= 0) Send(&worker);
    }
    std::vector<pollfd> polled;
    if (descriptor >= 0) polled.push_back({descriptor, POLLIN, 0});
    std::vector<Worker*> asked;
    for (Worker& worker : workers_) {
      if (worker.process < 0) continue;
      const int events = worker.out.empty() ? POLLIN : POLLIN | POLLOUT;
      polled.push_back({worker.socket, static_cast<short>(events), 0});
      asked.push_back(&worker);
    }
    if (order_.empty() && descriptor < 0) return false;
    if (poll(polled.data(), polled.size(), -1) < 0) continue;
    const std::size_t first = descriptor >= 0 ? 1 : 0;
    for (std::size_t i = 0; i < asked.size(); ++i) {
      const int seen = polled[first + i].revents;
      if ((seen & ~POLLOUT) != 0) Receive(asked[i]);
    }
    const bool is_readable = descriptor >= 0 && polled.front().revents != 0;
    if (is_readable || (!order_.empty() && done_.count(order_.front()) > 0)) return is_readable;
  }
}

std::optional<Done> Workers::Take() {
  if (order_.empty()) return std::nullopt;
  const auto found = done_.find(order_.front());
  if (found == done_.end()) return std::nullopt;
  Done done = std::move(found->second);
  done_.erase(found);
  done_bytes_ -= done.text.size();
  order_.pop_front();
  return done;
}

}  // namespace cli
