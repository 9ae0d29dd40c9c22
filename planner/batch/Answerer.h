// Lines of a batch to plans.
//
// A line is a request in JSON (read/RequestJson.h), which can have an "id" beside its other
// entries: a text or a number, by which its answer is known.
//
// Tested by answerer_test.cpp.
#ifndef VORKEL_PLANNER_BATCH_ANSWERER_H_
#define VORKEL_PLANNER_BATCH_ANSWERER_H_

#include <string>

#include "planner/batch/Devices.h"
#include "planner/batch/Lines.h"
#include "planner/batch/Outcome.h"
#include "planner/read/Draft.h"

namespace planner::batch {

struct Task {
  std::string file;     // how mistakes name the batch
  read::Draft options;  // replaces what the lines say
  std::string device;   // of lines that name none
  plan::Options plan = {};
};

class Answerer {
 public:
  // The files of devices must outlive it.
  Answerer(Task task, const device::Files& files) : task_(std::move(task)), devices_(files) {}

  // Never throws: what fails is an outcome, too.
  Outcome Answer(const Line& line);

 private:
  void Make(const Line& line, Outcome* outcome);
  bool FindDevice(const read::Reading& reading, Outcome* outcome);

  Task task_;
  Devices devices_;
};

}  // namespace planner::batch

#endif  // VORKEL_PLANNER_BATCH_ANSWERER_H_
