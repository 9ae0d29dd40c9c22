// The smallest changes of single demands with which a request goes. Each has been found by asking
// for it: the settings that it leads to are its proof.
//
// Tested by changes_test.cpp.
#ifndef VORKEL_PLANNER_EXPLAIN_CHANGES_H_
#define VORKEL_PLANNER_EXPLAIN_CHANGES_H_

#include <vector>

#include "planner/Settings.h"
#include "planner/explain/Demand.h"
#include "planner/explain/Question.h"

namespace planner::explain {

enum class ChangeKind {
  kWithout,         // the demand goes
  kTolerance,       // a tolerance of `value` ppm: of the output, or of all when it is -1
  kFrequency,       // a frequency of `value` MHz
  kPhase,           // a phase of `value` degrees
  kDuty,            // a duty cycle of `value` percent
  kJitter,          // a jitter of at most `value` ps: of the output, or of all that have a limit
  kLowest,          // of a range of the device: a minimum of `value` MHz
  kHighest,         // and a maximum
  kBandwidth,       // another bandwidth: that of the settings
  kInputTolerance,  // an input that is off by `value` ppm at most
};

struct Change {
  ChangeKind kind = ChangeKind::kWithout;
  Demand demand;
  Rational value = 0;
  Rational before = 0;  // what stands in place of `value` today
  Settings settings;    // what it leads to
};

// The smallest changes of one demand of a question with which all of it goes, each side of a value
// by itself; and the loss of the demand where that is all that helps, or none where nothing does.
std::vector<Change> ChangesOf(const Question& question, const Demand& demand);

// The smallest tolerance for all frequencies, ppm, with which it goes; its settings make the
// frequencies that the outputs would have together. Empty when no tolerance is enough.
std::vector<Change> CommonTolerance(const Question& question);

// The smallest jitter, ps, to which all limits of outputs that are below it can be moved so that it
// goes; empty when no jitter is enough, and when less than two outputs have a limit.
std::vector<Change> CommonJitter(const Question& question);

}  // namespace planner::explain

#endif  // VORKEL_PLANNER_EXPLAIN_CHANGES_H_
