// Tested by search_test.cpp.
#include "planner/search/Search.h"

#include "planner/answer/Evaluate.h"
#include "planner/search/KruSearch.h"
#include "planner/search/LoopSearch.h"

namespace planner::search {

Found Search(const Request& request, const Device& device, Primitive primitive) {
  if (!device.Has(primitive) || !answer::Refusals(request, primitive).empty()) return {};
  return hardware::IsLoop(primitive) ? SearchLoop(request, device, primitive)
                                     : SearchKru(request, device, primitive);
}

}  // namespace planner::search
