// Where the package finds device files.
#ifndef VORKEL_TCL_FOLDERS_H_
#define VORKEL_TCL_FOLDERS_H_

#include <memory>

#include "planner/device/Files.h"

namespace tcl {

// Those of the folders in VORKEL_DEVICES, and those of the package Ip_vorkel, which stands beside
// this one.
std::unique_ptr<const planner::device::Files> DeviceFiles();

}  // namespace tcl

#endif  // VORKEL_TCL_FOLDERS_H_
