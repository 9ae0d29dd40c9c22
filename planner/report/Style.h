// How a text is to look.
#ifndef VORKEL_PLANNER_REPORT_STYLE_H_
#define VORKEL_PLANNER_REPORT_STYLE_H_

#include <string>

namespace planner::report {

struct Style {
  bool colour = false;  // with the control sequences of a terminal
  int width = 80;       // columns that no line of prose and no table is wider than
};

// Calls of other commands about the same request, for hints, as they can be pasted into a shell.
// Of an empty one there is no hint.
struct Calls {
  std::string explain;
  std::string best;  // with the trade-offs
  std::string pick;  // of one row of the ranking: "./vorkel plan ... --pick N"
};

}  // namespace planner::report

#endif  // VORKEL_PLANNER_REPORT_STYLE_H_
