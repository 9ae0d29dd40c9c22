// Requests in JSON.

#include "fuzz/Requests.h"
#include "planner/read/RequestJson.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  planner::read::Mistakes mistakes;
  const planner::read::Draft draft =
      planner::read::ReadJson(fuzz::TextOf(data, size), "request.json", &mistakes);
  fuzz::FinishDraft(draft, std::move(mistakes));
  return 0;
}
