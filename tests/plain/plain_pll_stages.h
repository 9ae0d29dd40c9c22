// Stages of a pass of the plain PLL/TSYN solver, in the order in which the pass runs them.

#ifndef TESTS_PLAIN_PLAIN_PLL_STAGES_H_
#define TESTS_PLAIN_PLAIN_PLL_STAGES_H_

#include <cstddef>
#include <optional>

#include "plain_pll.h"

namespace plain {

// Fills a slot for every divider step of output 0 whose VCO frequency, for `outFreq0` + `fudge`
// (MHz), is in the working range. Other slots stay as they are. Returns how many were filled.
int EnumerateVcoCandidates(double outFreq0, double fudge, bool integerMode, PllState& state,
                           Trace& trace);

// Finds dividers of outputs 1 to count - 1 and drops the candidates that have none. Returns false
// when some output has no divider on any candidate; the table then keeps what it held when that
// output's turn came.
bool FindOutputDividers(int count, const PllLimits& limits, const RequestLists& lists,
                        PllState& state, Trace& trace);

// Finds M and D of every candidate and drops the candidates that have none. Returns false when
// none is left. `integerStep` makes M a whole number, else a multiple of 0.125.
bool CalculateMAndD(const PllRequest& request, const PllLimits& limits, bool integerStep,
                    PllState& state, Trace& trace);

// Works out phase and duty cycle of every candidate and output.
void GetPhasesAndDutyCycles(const PllRequest& request, const PllLimits& limits,
                            const RequestLists& lists, PllState& state, Trace& trace);

// Chooses the candidate whose phases and duty cycles come closest to the request; none when no
// candidate comes close enough. Gives its slot in the candidate table.
std::optional<std::size_t> SelectPhaseSolution(const PllRequest& request, const PllLimits& limits,
                                               PllState& state, Trace& trace);

}  // namespace plain

#endif  // TESTS_PLAIN_PLAIN_PLL_STAGES_H_
