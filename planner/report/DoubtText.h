// Limits of a device that cannot be meant, as sentences.
#ifndef VORKEL_PLANNER_REPORT_DOUBTTEXT_H_
#define VORKEL_PLANNER_REPORT_DOUBTTEXT_H_

#include <string>

#include "planner/device/Check.h"

namespace planner::report {

// What is doubtful, without a full stop.
std::string DoubtText(const device::Doubt& doubt);

// What there is none of with such limits: "VCO frequency"; empty when there is still something.
std::string NothingWords(const device::Doubt& doubt);

// "grade 1", "grades 1 and 2".
std::string GradesWords(const device::Doubt& doubt);

}  // namespace planner::report

#endif  // VORKEL_PLANNER_REPORT_DOUBTTEXT_H_
