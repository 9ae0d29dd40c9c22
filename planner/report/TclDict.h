// Data as a Tcl dict.
#ifndef VORKEL_PLANNER_REPORT_TCLDICT_H_
#define VORKEL_PLANNER_REPORT_TCLDICT_H_

#include <nlohmann/json_fwd.hpp>
#include <string>

namespace planner::report {

// An object as a dict: objects are dicts, arrays lists, null is empty. Each entry has a line of its
// own, where a dict does not mind, and so has each object in an array.
std::string TclDict(const nlohmann::ordered_json& object);

// A text as one word of a list.
std::string TclWord(const std::string& text);

}  // namespace planner::report

#endif  // VORKEL_PLANNER_REPORT_TCLDICT_H_
