// Processes that work on the lines of a batch, for one that hands them out and takes the answers
// back in order.
//
// Processes share nothing, and one that dies - of a fault, or because the system has no memory left -
// is replaced, and what it had in hand is done again, line by line. Only a line with which alone a
// process dies once more has failed.
//
// What is in hand is bounded, in lines and in bytes, however slow a line is.
//
// Tested by workers_test.cpp and batch.test.
#ifndef VORKEL_CLI_WORKERS_H_
#define VORKEL_CLI_WORKERS_H_

#include <sys/types.h>

#include <cstddef>
#include <cstdint>
#include <deque>
#include <functional>
#include <optional>
#include <string>
#include <unordered_map>
#include <vector>

#include "planner/batch/Lines.h"
#include "planner/batch/Outcome.h"

namespace cli {

// What becomes of a line.
struct Done {
  std::int64_t line = 0;
  planner::batch::Status status = planner::batch::Status::kFailed;
  std::optional<planner::Primitive> primitive;
  std::string text;
};

class Workers {
 public:
  using Work = std::function<Done(const planner::batch::Line&)>;

  // `work` is called in the processes. What it does to memory stays there, and it must not throw.
  // `died` tells what becomes of a line of which a process dies; it is called in this one.
  Workers(int count, Work work, Work died);
  // Ends the processes, whatever they are doing.
  ~Workers();
  Workers(const Workers&) = delete;
  Workers& operator=(const Workers&) = delete;

  // Lines are given in the order in which they are taken back.
  void Give(planner::batch::Line line);
  // Whether there is so much in hand that no more should be given.
  bool IsFull() const;
  // Whether all that was given is taken back.
  bool IsIdle() const { return order_.empty(); }

  // Waits until something can be taken back, or until there is something to read from a file
  // descriptor; answers whether that is so. -1 is for none. Returns at once when nothing is in
  // hand. Throws std::system_error when there can be no more processes.
  bool Wait(int descriptor);
  // The next one, when it is done.
  std::optional<Done> Take();

 private:
  struct Held {
    planner::batch::Line line;
    bool is_suspect = false;  // a process has died that had it in hand
  };
  struct Worker {
    pid_t process = -1;
    int socket = -1;
    std::string out;        // what it is still to be sent
    std::string in;         // what it has sent
    std::deque<Held> held;  // what it has in hand
    std::size_t bytes = 0;  // of these lines
  };

  void Start(Worker* worker);
  [[noreturn]] void Serve(int socket);
  void Feed();
  bool CanTake(const Worker& worker) const;
  void GiveNext(Worker* worker);
  void Send(Worker* worker);
  void Receive(Worker* worker);
  void Bury(Worker* worker);
  void Keep(Done done);

  Work work_;
  Work died_;
  std::vector<Worker> workers_;
  std::deque<Held> waiting_;  // for a process
  std::size_t waiting_bytes_ = 0;
  std::deque<std::int64_t> order_;  // all that is in hand
  std::unordered_map<std::int64_t, Done> done_;
  std::size_t done_bytes_ = 0;
};

}  // namespace cli

#endif  // VORKEL_CLI_WORKERS_H_
