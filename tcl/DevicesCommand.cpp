// Tested by devices.test.
#include "planner/device/Describe.h"
#include "planner/report/DevicesText.h"
#include "tcl/Commands.h"
#include "tcl/Failure.h"
#include "tcl/Folders.h"
#include "tcl/Objects.h"

namespace tcl {

std::string Devices(Words words) {
  if (words.size() > 1) {
    throw Failure::OfUsage("too_many_words", Text(words[1]),
                           "wrong # args: should be \"vorkel::devices ?name?\"");
  }
  const auto files = DeviceFiles();
  if (words.empty()) return planner::report::DevicesTcl(planner::device::List(*files));
  try {
    const auto selection = planner::device::Catalogue(*files).Select(Text(words.front()));
    return planner::report::DeviceTcl(planner::device::Describe(selection.file), selection.grades);
  } catch (const planner::device::PartError& error) {
    throw Failure::OfPart(error);
  }
}

}  // namespace tcl
