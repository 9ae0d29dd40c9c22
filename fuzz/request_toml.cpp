// Requests in TOML.

#include "fuzz/Requests.h"
#include "planner/read/RequestToml.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  planner::read::Mistakes mistakes;
  const planner::read::Draft draft =
      planner::read::ReadToml(fuzz::TextOf(data, size), "request.toml", &mistakes);
  fuzz::FinishDraft(draft, std::move(mistakes));
  return 0;
}
