// Tested by moved_test.cpp.
#include "planner/answer/Moved.h"

#include <algorithm>
#include <numeric>

namespace planner::answer {

PlaceOrder AsRequested(const Request& request) {
  PlaceOrder order(request.outputs.size());
  std::iota(order.begin(), order.end(), 0);
  return order;
}

Request Placed(const Request& request, const PlaceOrder& order) {
  Request placed = request;
  for (std::size_t i = 0; i < order.size(); ++i) {
    placed.outputs[i] = request.outputs[static_cast<std::size_t>(order[i])];
  }
  return placed;
}

void NoteMoved(const PlaceOrder& order, Answer* answer) {
  if (std::is_sorted(order.begin(), order.end())) return;
  answer->notes.push_back(
      {.kind = FindingKind::kMoved, .primitive = answer->primitive, .outputs = order});
}

PlaceOrder OrderOf(const Request& request, const Answer& answer) {
  for (const Finding& note : answer.notes) {
    if (note.kind == FindingKind::kMoved) return note.outputs;
  }
  return AsRequested(request);
}

Request Placed(const Request& request, const Answer& answer) {
  return Placed(request, OrderOf(request, answer));
}

}  // namespace planner::answer
