// Devices and their limits, as text and as JSON.
#ifndef VORKEL_PLANNER_REPORT_DEVICESTEXT_H_
#define VORKEL_PLANNER_REPORT_DEVICESTEXT_H_

#include <optional>
#include <string>
#include <vector>

#include "planner/device/Describe.h"
#include "planner/report/Style.h"

namespace planner::report {

// Counts up when an entry goes, is added, or changes its meaning or type.
inline constexpr int kDevicesVersion = 1;

// A row for each primitive of each device, in its default grade. A device that cannot be used does
// not hide the others.
std::string DevicesText(const std::vector<device::Listed>& devices, const Style& style);

// All that is known of some grades of a device: a row for each limit, a column for each grade.
std::string DeviceText(const device::Description& description,
                       const std::vector<std::string>& grades, const Style& style);

// Devices with all their grades, or with some: doc/planner-json.md, doc/devices.schema.json.
std::string DevicesJson(const std::vector<device::Listed>& devices);
std::string DeviceJson(const device::Description& description,
                       const std::vector<std::string>& grades);
// The same as Tcl dicts.
std::string DevicesTcl(const std::vector<device::Listed>& devices);
std::string DeviceTcl(const device::Description& description,
                      const std::vector<std::string>& grades);

// The grade that is faster than each other in some limit and slower in none; nothing when there is
// no such one, as where grades have different primitives.
std::optional<std::string> FastestGrade(const device::Description& description);

}  // namespace planner::report

#endif  // VORKEL_PLANNER_REPORT_DEVICESTEXT_H_
