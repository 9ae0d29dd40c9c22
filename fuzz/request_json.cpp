// Requests in JSON.

#include "fuzz/Requests.h"
#include "planner/read/RequestJson.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  return fuzz::ReadRequest(planner::read::ReadJson, fuzz::TextOf(data, size));
}
