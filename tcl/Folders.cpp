#include "tcl/Folders.h"

namespace tcl {

std::unique_ptr<const planner::device::Files> DeviceFiles() { return planner::device::HostFiles(); }

}  // namespace tcl
