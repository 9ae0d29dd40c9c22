// A request to a primitive of a device, with something changed or left out, and whether it goes.
//
// Tested by changes_test.cpp.
#ifndef VORKEL_PLANNER_EXPLAIN_QUESTION_H_
#define VORKEL_PLANNER_EXPLAIN_QUESTION_H_

#include <optional>

#include "planner/Answer.h"
#include "planner/Device.h"
#include "planner/Request.h"
#include "planner/Settings.h"
#include "planner/search/Within.h"

namespace planner::explain {

// A value of its own: changes do not reach what it was made of.
struct Question {
  Request request;
  Device device;
  Primitive primitive = Primitive::kPll;
  search::Relaxed relaxed;
  // The question before something was changed, which outlives this one; or null. Most of what it
  // has prepared is right here, too.
  const search::Within* unchanged = nullptr;

  // Settings that meet all that is left of the demands and limits; the first that are found.
  std::optional<Settings> Ask() const;
  // What settings make of the request.
  Answer Judge(const Settings& settings) const;
  // The limits of the loop, to be changed. The primitive is a PLL or a TSYN.
  LoopLimits& Limits();
};

}  // namespace planner::explain

#endif  // VORKEL_PLANNER_EXPLAIN_QUESTION_H_
