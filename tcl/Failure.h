// Why a command fails: its sentence, and its errorCode as data.
#ifndef VORKEL_TCL_FAILURE_H_
#define VORKEL_TCL_FAILURE_H_

#include <tcl.h>

#include <string>
#include <vector>

#include "planner/device/Catalogue.h"
#include "planner/plan/Plan.h"
#include "planner/read/Mistake.h"

namespace tcl {

struct Failure {
  std::string sentence;
  std::vector<std::string> code;  // the words of errorCode

  // {VORKEL USAGE mistakes}: each mistake is a dict with `kind`, `entry`, `index`, `key`, `text`,
  // `known` and `message`. Options have one dash.
  static Failure OfMistakes(const planner::read::Mistakes& mistakes);
  // The same for one that is none of a request.
  static Failure OfUsage(const std::string& kind, const std::string& text,
                         const std::string& message);
  static Failure OfPart(const planner::device::PartError& error);
  // {VORKEL UNSOLVED reasons}: each is a dict with `primitive`, `message` and
  // `refusals`, which are findings.
  static Failure OfUnsolved(const planner::plan::Plan& plan, const planner::Device& device);

  // Sets the result and errorCode of an interpreter.
  int Set(Tcl_Interp* interp) const;
};

}  // namespace tcl

#endif  // VORKEL_TCL_FAILURE_H_
