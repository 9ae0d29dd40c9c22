// The request of a document.
//
// Tested by verify_test.cpp.
#ifndef VORKEL_PLANNER_VERIFY_READREQUEST_H_
#define VORKEL_PLANNER_VERIFY_READREQUEST_H_

#include <optional>

#include "planner/Device.h"
#include "planner/Request.h"
#include "planner/read/Tree.h"
#include "planner/verify/Difference.h"

namespace planner::verify {

// Nothing when it cannot be read, or is not one for the device: that is added.
std::optional<Request> ReadRequest(const read::Node& document, const Device& device,
                                   Discrepancies* discrepancies);

// Names numbers of the request to which all answers of the document are for another one: inputs,
// their jitter, frequencies, phases and duty cycles.
void HoldRequest(const Request& request, const read::Node& document, Discrepancies* discrepancies);

}  // namespace planner::verify

#endif  // VORKEL_PLANNER_VERIFY_READREQUEST_H_
