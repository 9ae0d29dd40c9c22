// A plan as create_clock alone, for readers that know no other command: the period and the edges of
// each clock, as if it came from nowhere. What such a reader makes of two clocks is its own.
#ifndef VORKEL_PLANNER_REPORT_SDCPLAIN_H_
#define VORKEL_PLANNER_REPORT_SDCPLAIN_H_

#include <string>

#include "planner/Answer.h"
#include "planner/Device.h"
#include "planner/Request.h"

namespace planner::report {

std::string SdcPlain(const Request& request, const Device& device, const Answer& answer);

}  // namespace planner::report

#endif  // VORKEL_PLANNER_REPORT_SDCPLAIN_H_
