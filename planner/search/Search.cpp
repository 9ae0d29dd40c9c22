// Tested by search_test.cpp.
#include "planner/search/Search.h"

#include <cstddef>

#include "planner/search/KruSearch.h"
#include "planner/search/LoopSearch.h"

namespace planner::search {

Found Search(const Request& request, const Device& device, Primitive primitive) {
  const auto inputs = static_cast<std::size_t>(hardware::MostInputs(primitive));
  const auto outputs = static_cast<std::size_t>(hardware::MostOutputs(primitive));
  if (request.inputs.size() > inputs || request.outputs.size() > outputs ||
      !device.Has(primitive)) {
    return {};
  }
  return hardware::IsLoop(primitive) ? SearchLoop(request, device, primitive)
                                     : SearchKru(request, device, primitive);
}

}  // namespace planner::search
