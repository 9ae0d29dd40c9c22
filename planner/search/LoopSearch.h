// The search over all settings of a PLL or a TSYN.
//
// What meets all demands is looked for first, among the spans that they leave of the VCO
// (VcoSpans.h). Where a bandwidth has nothing that does, all M and D are gone through for what
// comes nearest. Most of them end with the first output: with its nearest divider it is further off
// than something that has less jitter (Staircase.h), so that they can be neither the best nor a
// trade-off.
//
// Tested by search_test.cpp.
#ifndef VORKEL_PLANNER_SEARCH_LOOPSEARCH_H_
#define VORKEL_PLANNER_SEARCH_LOOPSEARCH_H_

#include "planner/search/Search.h"

namespace planner::search {

Found SearchLoop(const Request& request, const Device& device, Primitive primitive, const Aim& aim);

}  // namespace planner::search

#endif  // VORKEL_PLANNER_SEARCH_LOOPSEARCH_H_
