// What settings make of a request, worked out again.
//
// Tested by recompute_test.cpp.
#ifndef VORKEL_PLANNER_VERIFY_RECOMPUTE_H_
#define VORKEL_PLANNER_VERIFY_RECOMPUTE_H_

#include <optional>
#include <vector>

#include "planner/Answer.h"
#include "planner/Device.h"
#include "planner/Request.h"
#include "planner/Settings.h"

namespace planner::verify {

// Where settings come from, and what the engine counted with, MHz.
struct Origin {
  Source source = {};
  std::optional<double> vco = {};
  std::vector<std::optional<double>> outputs = {};  // as many as the request has, or none
};

// For each place the output of the request that stands there.
using PlaceOrder = std::vector<int>;
PlaceOrder OwnPlaces(const Request& request);
Request InOrder(const Request& request, const PlaceOrder& order);

// `order` is how the outputs of `request` stand in the settings. The primitive is one of the
// device, and the settings are some that it can be set to; a limit of the device may be broken.
Answer Recompute(const Request& request, const Device& device, const Settings& settings,
                 const PlaceOrder& order, const Origin& origin);

}  // namespace planner::verify

#endif  // VORKEL_PLANNER_VERIFY_RECOMPUTE_H_
