#include "cli/BatchCommand.h"

#include <fcntl.h>
#include <fmt/format.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <memory>
#include <optional>
#include <thread>
#include <utility>

#include "cli/BatchEarlier.h"
#include "cli/Call.h"
#include "cli/Devices.h"
#include "cli/Failure.h"
#include "cli/Output.h"
#include "cli/Progress.h"
#include "cli/Stream.h"
#include "cli/Words.h"
#include "cli/Workers.h"
#include "planner/PlanVersion.h"
#include "planner/batch/Answerer.h"
#include "planner/read/Options.h"
#include "planner/read/Shown.h"
#include "planner/report/BatchText.h"

namespace cli {

namespace {

using planner::batch::Line;
using planner::batch::Shard;
using planner::batch::Status;
using planner::read::Option;

// As of a request in a file of its own.
constexpr std::size_t kLongestLine = 100'000;
constexpr int kMostJobs = 1000;

// What the words of the command say.
struct Task {
  std::string input = "-";
  std::string output;  // of -o
  int jobs = 1;
  Shard shard;
  bool resume = false;
  bool quiet = false;
  planner::report::BatchForm form;
  planner::batch::Task answers;
  std::string options;  // all that makes a difference to the answers
};

Shard ReadShard(const std::string& text) {
  constexpr std::size_t kMostDigits = 9;
  const std::size_t slash = text.find('/');
  std::int64_t numbers[2] = {0, 0};
  if (slash != std::string::npos) {
    const std::string parts[2] = {text.substr(0, slash), text.substr(slash + 1)};
    for (const int i : {0, 1}) {
      const bool is_whole = !parts[i].empty() && parts[i].size() <= kMostDigits &&
                            parts[i].find_first_not_of("0123456789") == std::string::npos;
      if (is_whole) numbers[i] = std::stoll(parts[i]);
    }
  }
  if (numbers[0] >= 1 && numbers[0] <= numbers[1]) return {numbers[0], numbers[1]};
  throw Failure::OfUsage(
      fmt::format("--shard: \"{}\" must be I/N, part I of N parts, such as 1/8 to 8/8",
                  planner::read::Shown(text)));
}

// The options of the batch itself; all others are of the requests.
bool IsOfBatch(const std::string& name) {
  for (const char* own : {"-o", "--jobs", "--shard", "--resume", "--quiet", "--csv", "--all"}) {
    if (name == own) return true;
  }
  return false;
}

// The options that replace what the lines say.
void ReadRequestOptions(const Given& given, Task* task) {
  std::vector<Option> options;
  for (const Option& option : given.options) {
    if (!IsOfBatch(option.name)) options.push_back(option);
  }
  std::sort(options.begin(), options.end(),
            [](const Option& a, const Option& b) { return a.name < b.name; });
  planner::read::Mistakes mistakes;
  task->answers.options = ReadOptions(options, &mistakes);
  if (!mistakes.empty()) Refuse(mistakes);
  task->options = fmt::format("{} {}\n", planner::kPlanVersion, task->form.all);
  for (const Option& option : options) {
    task->options += option.name + "=" + option.value + "\n";
  }
}

Task ReadTask(std::string_view command, const std::vector<std::string>& words) {
  const Given given = ReadWords(command, words, 1);
  Task task;
  if (!given.operands.empty()) task.input = given.operands.front();
  if (task.input.empty()) throw Failure::OfUsage("the name of the file is empty");
  task.output = given.Value("-o").value_or("");
  if (task.output.empty() && given.Has("-o")) {
    throw Failure::OfUsage("-o: the name of the file is empty");
  }
  task.jobs = WholeNumber(given, "--jobs", 0, kMostJobs).value_or(1);
  if (task.jobs == 0) {
    task.jobs = std::max(1, static_cast<int>(std::thread::hardware_concurrency()));
  }
  if (const auto shard = given.Value("--shard")) task.shard = ReadShard(*shard);
  task.resume = given.Has("--resume");
  task.quiet = given.Has("--quiet");
  task.form = {given.Has("--csv"), given.Has("--all"), kLongestLine};
  task.answers.plan.first_only = !task.form.all;
  if (task.resume && (task.output.empty() || task.output == "-")) {
    throw Failure::OfUsage("--resume goes on with a file: name it with -o");
  }
  if (task.resume && task.form.csv) {
    throw Failure::OfUsage("--resume goes on with lines of JSON, not with --csv");
  }
  task.answers.file = task.input;
  task.answers.device = kDefaultDevice;
  ReadRequestOptions(given, &task);
  return task;
}

// The file with the requests.
class Input {
 public:
  explicit Input(const std::string& name) : name_(name) {
    if (name == "-") {
      descriptor_ = STDIN_FILENO;
    } else {
      descriptor_ = open(name.c_str(), O_RDONLY | O_CLOEXEC);
      if (descriptor_ < 0) Refuse(SystemReason(errno));
    }
    struct stat status {};
    if (fstat(descriptor_, &status) != 0) return;
    if (S_ISDIR(status.st_mode)) Refuse("it is a directory");
    if (!S_ISREG(status.st_mode)) return;
    size_ = status.st_size;
    file_ = {status.st_dev, status.st_ino};
  }
  ~Input() {
    if (descriptor_ != STDIN_FILENO) close(descriptor_);
  }
  Input(const Input&) = delete;
  Input& operator=(const Input&) = delete;

  int descriptor() const { return descriptor_; }
  // Whether a name is that of the same file, perhaps by a link.
  bool IsAt(const std::string& name) const {
    struct stat status {};
    return file_ && stat(name.c_str(), &status) == 0 &&
           *file_ == std::pair(status.st_dev, status.st_ino);
  }
  // The next piece, empty at the end. The bytes are there until the next one.
  std::string_view Read() {
    for (;;) {
      const ssize_t count = read(descriptor_, piece_, sizeof piece_);
      if (count < 0 && errno == EINTR) continue;
      if (count < 0) Refuse(SystemReason(errno));
      place_ += count;
      return {piece_, static_cast<std::size_t>(count)};
    }
  }
  // How much of it is read; unknown of a pipe.
  std::optional<int> Percent() const {
    if (size_ <= 0) return std::nullopt;
    return static_cast<int>(std::min<long long>(100, place_ * 100 / size_));
  }

 private:
  [[noreturn]] void Refuse(const std::string& reason) const {
    throw Failure::OfUsage(
        fmt::format("{} cannot be read: {}", planner::read::Shown(name_), reason), false);
  }

  std::string name_;
  int descriptor_ = -1;
  std::optional<std::pair<dev_t, ino_t>> file_;
  long long size_ = 0;
  long long place_ = 0;
  char piece_[65536];
};

// What becomes of a line of which a process dies.
Done Died(const Line& line, const planner::report::BatchForm& form) {
  planner::batch::Outcome outcome;
  outcome.line = line.number;
  outcome.digest = line.digest;
  outcome.failure = planner::report::DiedText();
  return {line.number, outcome.status, std::nullopt, BatchLines(outcome, form)};
}

class Batch {
 public:
  Batch(Task task, const planner::device::Files& files)
      : task_(std::move(task)),
        answerer_(task_.answers, files),
        input_(task_.input),
        lines_(kLongestLine, planner::batch::Digest(task_.options)),
        progress_(!task_.quiet && isatty(STDERR_FILENO) != 0 &&
                  !(WritesOut() && isatty(STDOUT_FILENO) != 0)) {
    if (!WritesOut() && input_.IsAt(task_.output)) {
      throw Failure::OfUsage(
          fmt::format("-o: {} has the requests, which the answers would replace",
                      planner::read::Shown(task_.output)),
          false);
    }
    if (task_.resume)
      earlier_ = std::make_unique<BatchEarlier>(task_.output);
    else
      Open();
    if (task_.jobs > 1) {
      workers_ = std::make_unique<Workers>(
          task_.jobs, [this](const Line& line) { return Answer(line); },
          [this](const Line& line) { return Died(line, task_.form); });
    }
  }

  void Run() {
    while (!has_ended_ && !is_unread_) {
      if (!workers_ || WaitForInput()) ReadPiece();
      Flush();
    }
    while (workers_ && !is_unread_ && !workers_->IsIdle()) {
      workers_->Wait(-1);
      TakeAnswers();
      Flush();
    }
    if (!is_unread_) Finish();
    progress_.Clear();
  }

  const planner::batch::Counts& counts() const { return counts_; }

 private:
  bool WritesOut() const { return task_.output.empty() || task_.output == "-"; }

  void Open() {
    const std::optional<Stream::Left> left =
        earlier_ ? earlier_->Left() : std::optional<Stream::Left>();
    stream_ = std::make_unique<Stream>(task_.output, Stream::Draft::kKept, left);
    if (counts_.All() == 0) out_ += planner::report::BatchHeading(task_.form);
  }

  Done Answer(const Line& line) {
    const planner::batch::Outcome outcome = answerer_.Answer(line);
    return {line.number, outcome.status, outcome.Best(), BatchLines(outcome, task_.form)};
  }

  // Whether there is some input, and a use for it.
  bool WaitForInput() {
    const bool is_readable = workers_->Wait(workers_->IsFull() ? -1 : input_.descriptor());
    TakeAnswers();
    return is_readable;
  }

  void ReadPiece() {
    const std::string_view piece = input_.Read();
    const auto take = [this](const Line& line) { Take(line); };
    if (!piece.empty()) return lines_.Add(piece, take);
    has_ended_ = true;
    lines_.End(take);
  }

  void Take(const Line& line) {
    if (is_unread_ || line.IsBlank() || !task_.shard.Has(line)) return;
    if (!stream_) {
      if (earlier_->HasNext()) {
        const planner::batch::Head head = earlier_->Take(line);
        return counts_.Add(head.line, head.status, head.primitive);
      }
      Open();
    }
    if (workers_) return workers_->Give(line);
    Put(Answer(line));
  }

  void TakeAnswers() {
    while (const auto done = workers_->Take()) Put(*done);
  }

  void Put(const Done& done) {
    constexpr std::size_t kMostUnwritten = 256 * 1024;
    counts_.Add(done.line, done.status, done.primitive);
    out_ += done.text;
    if (out_.size() >= kMostUnwritten) Flush();
    if (progress_.IsDue()) progress_.Show(ProgressText());
  }

  // Answers go out whenever there is to be waited for something: who has written one request gets
  // its answer before he writes the next.
  void Flush() {
    if (out_.empty()) return;
    is_unread_ = is_unread_ || !stream_->Write(out_);
    out_.clear();
  }

  void Finish() {
    if (!stream_) {
      earlier_->End();
      // All was done already, and stands where it should.
      if (earlier_->IsWhole()) return;
      Open();
    }
    Flush();
    stream_->Finish();
  }

  std::string ProgressText() const {
    const std::int64_t all = counts_.All();
    std::string text =
        fmt::format("{} requests, {} not within", all, all - counts_.Of(Status::kWithin));
    if (const auto percent = input_.Percent()) text += fmt::format(", {} % of the input", *percent);
    return text;
  }

  Task task_;
  planner::batch::Answerer answerer_;
  Input input_;
  planner::batch::Lines lines_;
  Progress progress_;
  std::unique_ptr<BatchEarlier> earlier_;
  std::unique_ptr<Stream> stream_;  // not while there are earlier answers
  std::unique_ptr<Workers> workers_;
  planner::batch::Counts counts_;
  std::string out_;
  bool has_ended_ = false;
  bool is_unread_ = false;  // nobody reads the answers any more
};

// The status of the line that is worst off.
int StatusOf(const planner::batch::Counts& counts) {
  constexpr std::pair<Status, int> kStatuses[] = {{Status::kFailed, kFailed},
                                                  {Status::kWrong, kWrong},
                                                  {Status::kUnsolved, kUnsolved},
                                                  {Status::kOff, kOff}};
  for (const auto& [status, number] : kStatuses) {
    if (counts.Of(status) > 0) return number;
  }
  return kDone;
}

}  // namespace

int RunBatch(std::string_view command, const std::vector<std::string>& words,
             const Setting& setting) {
  const Task task = ReadTask(command, words);
  const auto files = DeviceFiles(setting);
  // A device that no line can have is told at once.
  if (task.answers.options.device) {
    FindDevice({{}, task.answers.options.device, {}, {}}, setting);
  }
  Batch batch(task, *files);
  batch.Run();
  if (!task.quiet) {
    WriteError(planner::report::BatchSummary(batch.counts(), {false, setting.err_width}));
  }
  return StatusOf(batch.counts());
}

}  // namespace cli
