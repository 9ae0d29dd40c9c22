// Requests in TOML.

#include "fuzz/Requests.h"
#include "planner/read/RequestToml.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  return fuzz::ReadRequest(planner::read::ReadToml, fuzz::TextOf(data, size));
}
