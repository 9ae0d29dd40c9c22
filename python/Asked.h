// A request and the device that it is for, of a text in JSON.
#ifndef VORKEL_PYTHON_ASKED_H_
#define VORKEL_PYTHON_ASKED_H_

#include <optional>
#include <string>

#include "planner/Device.h"
#include "planner/Request.h"
#include "planner/read/Draft.h"

namespace python {

struct Asked {
  planner::read::Reading reading;
  planner::Device device;
  const planner::Request& request() const { return reading.request; }
};

// Each throws Refused when there is something wrong.
Asked Read(const std::string& json);
planner::read::Draft ReadDraft(const std::string& json);
// The device with a name, or the usual one; it has the primitive, or any.
planner::Device DeviceOf(const planner::read::Entry<std::string>& name,
                         const std::optional<planner::Primitive>& primitive);

}  // namespace python

#endif  // VORKEL_PYTHON_ASKED_H_
