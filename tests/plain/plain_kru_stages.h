// Stages of the plain KRU_SP solver, in the order in which a request runs them.

#ifndef TESTS_PLAIN_PLAIN_KRU_STAGES_H_
#define TESTS_PLAIN_PLAIN_KRU_STAGES_H_

#include "plain_kru.h"

namespace plain {

// CLKDV values that the outputs would need in the two lists; 0 for none.
struct KruClkdvValues {
  double f[kKruOutputs]{};  // CLKIN_DIVIDE_BY_2 = FALSE
  double t[kKruOutputs]{};  // CLKIN_DIVIDE_BY_2 = TRUE
};

// Finds the phase offset common to all outputs. False when there is none; the state then keeps the
// offset that it had.
bool FindKruPhaseOffset(const KruRequest& request, const RequestLists& lists, KruState& state,
                        Trace& trace);

// Fills both pin lists, and the CLKDV values that they need.
KruClkdvValues AssignKruPins(const KruRequest& request, const KruLimits& limits,
                             const RequestLists& lists, KruState& state, Trace& trace);

// Makes the lists consistent, finds M and D where needed and chooses a list. False when neither
// list works.
bool ChooseKruList(const KruRequest& request, const RequestLists& lists,
                   const KruClkdvValues& clkdv, KruState& state, Trace& trace);

}  // namespace plain

#endif  // TESTS_PLAIN_PLAIN_KRU_STAGES_H_
