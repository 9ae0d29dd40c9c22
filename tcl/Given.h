// The words of a command: a request as a dict, options, and other words.
#ifndef VORKEL_TCL_GIVEN_H_
#define VORKEL_TCL_GIVEN_H_

#include <tcl.h>

#include <initializer_list>
#include <map>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "planner/Device.h"
#include "planner/read/Draft.h"

namespace tcl {

// The words behind the name of a command.
using Words = std::span<Tcl_Obj* const>;

// A request and the device that it is for.
struct Given {
  planner::read::Draft draft;  // what both say, before a request is made of it
  planner::read::Reading reading;
  planner::Device device;
  // The options of the command itself, without their dash: "pick".
  std::map<std::string, Tcl_Obj*, std::less<>> own;

  const planner::Request& request() const { return reading.request; }
  // An option that is a whole number from `lowest` on; `usual` when it is not given.
  std::size_t Count(std::string_view name, std::size_t lowest, std::size_t usual) const;
};

// Reads `?request? ?-option value ...?`: what options say goes before what the dict says. A switch
// can stand without its value. `own` are the names of options that are not of a request. Throws
// Failure.
Given ReadGiven(Words words, std::initializer_list<std::string_view> own);

// The same without making a request of it: `reading` and `device` are not there.
Given ReadDraft(Words words, std::initializer_list<std::string_view> own);

// The device that a request is for, which has its primitive. Throws Failure.
planner::Device DeviceOf(const planner::read::Reading& reading);

}  // namespace tcl

#endif  // VORKEL_TCL_GIVEN_H_
