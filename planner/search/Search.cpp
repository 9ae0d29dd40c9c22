// Tested by search_test.cpp.
#include "planner/search/Search.h"

#include "planner/answer/Corners.h"
#include "planner/answer/Evaluate.h"
#include "planner/search/KruSearch.h"
#include "planner/search/LoopSearch.h"

namespace planner::search {

Found Search(const Request& request, const Device& device, Primitive primitive, const Aim& aim) {
  if (!device.Has(primitive) || !answer::Refusals(request, primitive).empty()) return {};
  const auto search = hardware::IsLoop(primitive) ? SearchLoop : SearchKru;
  if (request.input_tolerance == 0) return search(request, device, primitive, aim);
  return search(request, answer::Narrowed(device, request.input_tolerance), primitive, aim);
}

}  // namespace planner::search
