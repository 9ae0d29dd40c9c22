// Colour for a terminal that shows it.
#ifndef VORKEL_PLANNER_REPORT_COLOUR_H_
#define VORKEL_PLANNER_REPORT_COLOUR_H_

#include <string>

#include "planner/report/Style.h"

namespace planner::report {

enum class Role { kNone, kHeading, kOff, kGood, kNote };

// A text in the colour of its role, when the style has colour.
std::string Paint(const Style& style, Role role, const std::string& text);

}  // namespace planner::report

#endif  // VORKEL_PLANNER_REPORT_COLOUR_H_
