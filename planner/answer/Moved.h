// Outputs at other places than those of the request.
//
// With any_order an answer can have the outputs of a request in another order: where only some
// place can make a frequency, the output that needs it goes there. Such an answer is one to the
// request in that order: everything of it, settings, outputs and findings, goes by places. Its note
// kMoved tells which output of the request stands at each place.
//
// Tested by moved_test.cpp.
#ifndef VORKEL_PLANNER_ANSWER_MOVED_H_
#define VORKEL_PLANNER_ANSWER_MOVED_H_

#include <vector>

#include "planner/Answer.h"
#include "planner/Request.h"

namespace planner::answer {

// For each place the index of the output in the request.
using PlaceOrder = std::vector<int>;

// Each output at its own place.
PlaceOrder AsRequested(const Request& request);

// The request with its outputs in an order, which has each of them once.
Request Placed(const Request& request, const PlaceOrder& order);

// Notes in an answer to Placed(request, order) that its outputs have moved; nothing when all are at
// their own place.
void NoteMoved(const PlaceOrder& order, Answer* answer);

// The order that an answer to a request has, and the request in that order, with which its outputs
// are to be compared.
PlaceOrder OrderOf(const Request& request, const Answer& answer);
Request Placed(const Request& request, const Answer& answer);

}  // namespace planner::answer

#endif  // VORKEL_PLANNER_ANSWER_MOVED_H_
