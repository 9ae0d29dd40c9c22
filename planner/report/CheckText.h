// What there is to say of a device file, as text.
#ifndef VORKEL_PLANNER_REPORT_CHECKTEXT_H_
#define VORKEL_PLANNER_REPORT_CHECKTEXT_H_

#include <string>

#include "planner/device/Check.h"
#include "planner/report/Style.h"

namespace planner::report {

// The mistakes of a file that has some, a line for each place, and then what is doubtful about the
// rest. `path` is the file as the user has named it.
std::string MistakesText(const device::Checked& checked, const std::string& path,
                         const Style& style);

// What a file without mistakes gives: for each grade the primitives, what each keyword that is not
// there costs, and limits that cannot be meant.
std::string CheckText(const device::Checked& checked, const std::string& path, const Style& style);

}  // namespace planner::report

#endif  // VORKEL_PLANNER_REPORT_CHECKTEXT_H_
