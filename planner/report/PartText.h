// Why a name stands for no part, as one line.
#ifndef VORKEL_PLANNER_REPORT_PARTTEXT_H_
#define VORKEL_PLANNER_REPORT_PARTTEXT_H_

#include <string>

#include "planner/Device.h"
#include "planner/device/Catalogue.h"

namespace planner::report {

std::string PartText(const device::PartError& error);
std::string ComplaintText(const device::FileComplaint& complaint);

// That a device has no such primitive, or none at all.
std::string LacksText(const Device& device, Primitive primitive);
std::string LacksAllText(const Device& device);

}  // namespace planner::report

#endif  // VORKEL_PLANNER_REPORT_PARTTEXT_H_
