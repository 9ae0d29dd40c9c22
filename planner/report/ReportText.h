// The report on an answer as text: the settings, a table of the outputs, one of what they have
// with a second input, one of phases and duty cycles, one of the limits where margins count, and
// notes.
#ifndef VORKEL_PLANNER_REPORT_REPORTTEXT_H_
#define VORKEL_PLANNER_REPORT_REPORTTEXT_H_

#include <string>

#include "planner/Answer.h"
#include "planner/Device.h"
#include "planner/Request.h"
#include "planner/report/Style.h"

namespace planner::report {

// The report on an answer that is solved. Frequencies are those of the hardware, worked out from
// the settings; where the engine has counted with others that can be told from them, the report
// says so.
std::string ReportText(const Request& request, const Device& device, const Answer& answer,
                       const Style& style);

// The same on settings that have been given, with what its jitter is.
std::string EvaluationText(const Request& request, const Device& device, const Answer& answer,
                           const Style& style);

}  // namespace planner::report

#endif  // VORKEL_PLANNER_REPORT_REPORTTEXT_H_
