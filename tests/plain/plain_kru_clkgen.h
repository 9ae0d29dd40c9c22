// Plain KRU_CLKGEN solver: M, D and DV found step by step, kept to be compared with.
//
// Output 0 is CLKFX = input x M / D. Every further output is CLKFX or CLKFX180 again, or CLKFXDV,
// which is CLKFX divided by DV = 2, 4, 8, 16 or 32. One M, D and DV serve all outputs.

#ifndef TESTS_PLAIN_PLAIN_KRU_CLKGEN_H_
#define TESTS_PLAIN_PLAIN_KRU_CLKGEN_H_

#include "plain_kru.h"

namespace plain {

// Answers one request. Returns kKruSolved or kKruNoConfiguration; the configuration is in `state`,
// with DV as its `clkdv`. Feedback is not looked at, and the limits are taken as they are, readable
// or not.
int SolveKruClkgen(const KruRequest& request, const KruLimits& limits, RequestLists& lists,
                   KruState& state, Trace& trace);

}  // namespace plain

#endif  // TESTS_PLAIN_PLAIN_KRU_CLKGEN_H_
