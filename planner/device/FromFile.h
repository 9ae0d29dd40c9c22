// A device at one speed grade, from its device file.
//
// Tested by from_file_test.cpp.
#ifndef VORKEL_PLANNER_DEVICE_FROMFILE_H_
#define VORKEL_PLANNER_DEVICE_FROMFILE_H_

#include <string_view>

#include "planner/Device.h"

namespace Device {
struct DeviceFile;
}

namespace planner::device {

// The device of `file` in a package and a grade of it; an empty package is none. Throws
// std::invalid_argument when the file does not have them.
//
// Every limit is the decimal of the file, exactly. A period of P ns is a limit of 1000 / P MHz.
// The lowest of a range can be above its highest: what the file says is not judged here (see
// Check.h).
//
// What is answered owns all that it needs; the file can go. It never changes and can be shared
// between threads; what is behind `speed_data` keeps to that, see SpeedData.h.
planner::Device FromFile(const ::Device::DeviceFile& file, std::string_view package,
                         std::string_view grade);

}  // namespace planner::device

#endif  // VORKEL_PLANNER_DEVICE_FROMFILE_H_
