// The search over all settings of a KRU_SP or a KRU_CLKGEN.
//
// The settings are gone through by CLKIN_DIVIDE_BY_2 and feedback, M and D of the synthesiser, and
// the divide; KruSolver finds the pins and PHASE_SHIFT. First only what meets all demands is looked
// for; where there is nothing, what comes nearest. Most M and D are left out: some output has no
// pin that comes as near as something with less jitter does. Jitter rises with M and with D.
//
// Tested by search_test.cpp.
#ifndef VORKEL_PLANNER_SEARCH_KRUSEARCH_H_
#define VORKEL_PLANNER_SEARCH_KRUSEARCH_H_

#include "planner/search/Search.h"

namespace planner::search {

Found SearchKru(const Request& request, const Device& device, Primitive primitive, const Aim& aim);

}  // namespace planner::search

#endif  // VORKEL_PLANNER_SEARCH_KRUSEARCH_H_
