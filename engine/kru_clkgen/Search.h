// The search of the KRU_CLKGEN solver.
#ifndef VORKEL_ENGINE_KRU_CLKGEN_SEARCH_H_
#define VORKEL_ENGINE_KRU_CLKGEN_SEARCH_H_

#include "engine/Ip_VorkelImp.h"
#include "engine/Trace.h"

namespace Ip::KruClkgen {

// One run of the solver.
struct Run {
  double inFreq;  // MHz; not 0 once the request is parsed
  int numOut;     // outputs, 1 to kKruOutputs then
  const Trace& trace;
};

// Finds the M, D and DV that serve all outputs: output 0 on CLKFX, each further one on CLKFX or
// CLKFX180 with the same M and D, or on CLKFXDV, which divides CLKFX by 2, 4, 8, 16 or 32.
// Among several pairs the smallest D wins, then the smallest M. Sets the chosen pins, M, D and
// DV, or returns false.
//
// Example: 100 MHz in, outputs 150 and 75 MHz: M = 3, D = 2 and DV = 2.
bool FindMDAndDv(VorkelImp& imp, const Run& run);

}  // namespace Ip::KruClkgen

#endif  // VORKEL_ENGINE_KRU_CLKGEN_SEARCH_H_
