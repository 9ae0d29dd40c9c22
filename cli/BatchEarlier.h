// What an earlier run of a batch has answered.
//
// Tested by batch.test.
#ifndef VORKEL_CLI_BATCHEARLIER_H_
#define VORKEL_CLI_BATCHEARLIER_H_

#include <deque>
#include <string>

#include "cli/Stream.h"
#include "planner/batch/Lines.h"
#include "planner/batch/Resumed.h"

namespace cli {

class BatchEarlier {
 public:
  // What there is of the file of -o: FILE.part of a run that was interrupted, or the file itself.
  // Throws Failure when it cannot be read, or is no file.
  explicit BatchEarlier(const std::string& name);
  ~BatchEarlier();
  BatchEarlier(const BatchEarlier&) = delete;
  BatchEarlier& operator=(const BatchEarlier&) = delete;

  // Whether there is another whole answer. Throws Failure when it is none.
  bool HasNext();
  // That it is the answer to a line. Throws Failure when it is that to another one.
  planner::batch::Head Take(const planner::batch::Line& line);
  // That there is none that is left. Throws Failure.
  void End();

  // What of it is right: the answers that were taken. Nothing when there is no file.
  std::optional<Stream::Left> Left() const;
  // Whether all of the file of -o is right, as it stands there.
  bool IsWhole() const { return is_target_ && size_ == read_; }

 private:
  [[noreturn]] void Refuse(const std::string& reason) const;

  std::string name_;
  std::string path_;
  bool is_target_ = false;
  int descriptor_ = -1;
  planner::batch::Lines lines_{planner::batch::kMostOfHead};
  std::deque<planner::batch::Line> next_;
  long long size_ = 0;  // of the answers that were taken
  long long read_ = 0;
};

}  // namespace cli

#endif  // VORKEL_CLI_BATCHEARLIER_H_
