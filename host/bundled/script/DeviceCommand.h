// The command ::Vorkel::Devices, by which scripts ask what devices there are.
//
//   ::Vorkel::Devices names
//       the names of the devices on the search path, sorted. No file is opened.
//   ::Vorkel::Devices describe NAME
//       a dictionary: name, description, file, packages, default_package, grades,
//       default_grade, primitives, limits. A default that the device lacks is empty. A
//       primitive is listed when the default grade (without a default, the first) has all of
//       its keywords. limits maps grade to keyword to number, in natural units.
//   ::Vorkel::Devices keywords
//       a list of {keyword unit primitives}, the keywords of device files.
//
// Tested by device_command_test.cpp.
#ifndef VORKEL_HOST_BUNDLED_SCRIPT_DEVICECOMMAND_H_
#define VORKEL_HOST_BUNDLED_SCRIPT_DEVICECOMMAND_H_

#include <tcl.h>

namespace Script {

// Creates the command in the interpreter, in place of any command of that name.
void CreateDeviceCommand(Tcl_Interp* interp);

}  // namespace Script

#endif  // VORKEL_HOST_BUNDLED_SCRIPT_DEVICECOMMAND_H_
