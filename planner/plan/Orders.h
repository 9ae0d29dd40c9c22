// The orders in which the outputs of a request can stand at the places of a primitive.
//
// Most places of a primitive are alike. One can differ: output 1 of a PLL, which may run faster;
// output 0 of a TSYN with fractions, whose divider can have one; output 0 of a KRU_CLKGEN, which is
// on CLKFX; output 0 of a KRU_SP, from which the feedback is taken. So two orders differ only in
// which outputs stand at such places, and to try these is to try all.
//
// Tested by orders_test.cpp.
#ifndef VORKEL_PLANNER_PLAN_ORDERS_H_
#define VORKEL_PLANNER_PLAN_ORDERS_H_

#include <vector>

#include "planner/Device.h"
#include "planner/Request.h"
#include "planner/answer/Moved.h"

namespace planner::plan {

// The first is that of the request. Each other one has as many outputs as can be at their own
// place; those that lose it to another one go, in their order, to the places that are left.
// Outputs of which the same is demanded are not told apart.
std::vector<answer::PlaceOrder> OrdersOf(const Request& request, const Device& device,
                                         Primitive primitive);

}  // namespace planner::plan

#endif  // VORKEL_PLANNER_PLAN_ORDERS_H_
