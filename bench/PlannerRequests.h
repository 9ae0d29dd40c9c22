// Requests to the planner: those of README.md, ordinary ones, and any.
#ifndef VORKEL_BENCH_PLANNERREQUESTS_H_
#define VORKEL_BENCH_PLANNERREQUESTS_H_

#include <string>
#include <vector>

#include "planner/Device.h"
#include "planner/Request.h"
#include "tests/planner/search/drawn.h"

namespace bench {

struct Named {
  std::string name;
  planner::Request request;
};

// Those of README.md and examples/requests.
std::vector<Named> ReadmeRequests();
// Some that take their time.
std::vector<Named> SlowRequests();

// A request as people make them: up to five usual frequencies from a usual input, half of them
// quotients of one that the input makes; some with phases or duty cycles.
planner::Request OrdinaryRequest(drawn::Random& random);
// Anything, with up to four outputs.
planner::Request AnyRequest(drawn::Random& random, const planner::Device& device);

}  // namespace bench

#endif  // VORKEL_BENCH_PLANNERREQUESTS_H_
