// The stages of the PLL/TSYN search, in the order in which a request flows through them.
//
//   PrepareVcoRange           request and device limits  ->  working VCO range
//   for each fudge of the output-0 frequency, up and down (FudgeLoop, SolverPass):
//     EnumerateVcoCandidates  output-0 dividers whose VCO lies in the range
//     FindOutputDividers      dividers of the further outputs
//     CalculateMAndD          feedback multiplier and input divider
//     GetPhasesAndDutyCycles  what the dividers can do for phases and duty cycles
//     choice                  smallest VCO, or SelectPhaseSolution
//
// Example: 100 MHz in, outputs 200 and 50 MHz, VCO 400 to 1080 MHz, whole dividers. Output 0
// gives the candidates 400 / 2, 600 / 3, 800 / 4 and 1000 / 5. All four have a divider for
// 50 MHz (8, 12, 16, 20) and an M with D = 1 (4, 6, 8, 10). The smallest VCO wins: 400 MHz.
//
// All stages work on the candidate table of the implementation object. What they read of the
// request beside its lists is in Run, the primitive among it; that of the process
// (VorkelImp::_prim), which every pass sets to the same, is for the trace.
#ifndef VORKEL_ENGINE_PLL_STAGES_H_
#define VORKEL_ENGINE_PLL_STAGES_H_

#include <cstdint>

#include "engine/Ip_VorkelImp.h"
#include "engine/Trace.h"
#include "engine/pll/Div0Steps.h"

namespace Ip::Pll {

// Primitive codes.
inline constexpr int kTsyn = 0;
inline constexpr int kPll = 1;

// What a run answers.
enum ResultCode : int {
  kSolved = 1,
  kNoSpeedData = 2,   // the device limits could not be read
  kEmptyRange = 3,    // no VCO or no M serves both input clocks
  kBadRequest = 4,    // a request list is empty or short, or the input frequency is 0
  kNoSolution = 5,    // no VCO, M and D for any fudge
};

// One run of the search.
struct Run {
  double inFreq;  // first input clock, MHz; not 0
  int count;      // outputs, 1 to MAX_OUTPUTS
  int prim;       // kPll or kTsyn
  const Trace& trace;
};

// VcoRange.cpp: parses the frequencies, loads the limits and sets minAdjVco, maxAdjVco, minM
// and maxM. kSolved when the range is good, else kNoSpeedData, kEmptyRange or kBadRequest.
ResultCode PrepareVcoRange(VorkelImp& imp, const Port::StringBase& outFreqs, double inFreq2,
                           const Run& run);

// VcoEnumeration.cpp: makes a candidate of every output-0 divider whose VCO, for the requested
// output-0 frequency plus `fudge` (both MHz), lies in the working range. Slots of other dividers
// stay as they are. Returns the number of candidates made.
int EnumerateVcoCandidates(VorkelImp& imp, double reqOutFreq0, double fudge,
                           const Div0Steps& steps, const Trace& trace);

// OutputDividers.cpp: finds the dividers of outputs 1 to count - 1 and drops the candidates
// that have none. False when an output has no divider on any candidate within the largest
// tolerance; the table then holds what that output met.
bool FindOutputDividers(VorkelImp& imp, const Run& run);

// MultiplierSearch.cpp: finds M and D of every candidate and drops those that have none.
// False when none is left. `integerStep`: M takes whole values, else steps of 0.125. When it has
// accepted as many as are `enough`, it drops the others unseen.
bool CalculateMAndD(VorkelImp& imp, bool integerStep, const Run& run,
                    int enough = MAX_VCO_CANDIDATES);

// EnumerateVcoCandidates and CalculateMAndD in one, for a single output without a trace: makes a
// candidate of each VCO that has a whole M and a D, by rising dividers, until there are `enough`.
// `outFreq0`, MHz, has the fudge in it.
void FindFirstValidVcos(VorkelImp& imp, double outFreq0, const Div0Steps& steps, const Run& run,
                        int enough);

// The M and D of one candidate: the smallest M with inFreq x M / D equal to the candidate's VCO
// within the remainder, and inFreq / D in [pfdMin, pfdMax] (MHz, inclusive). Sets m and d, or
// returns false.
bool SearchMAndD(VcoCandidate& candidate, double pfdMin, double pfdMax, bool integerStep,
                 const Run& run);

// The widest tolerance of the closest-solution mode: degrees of phase, or a fraction of duty cycle.
inline constexpr double kWidestTolerance = 28.0;

// PhaseAndDuty.cpp: works out the phase and duty cycle nearest to the request, and the
// distances, of every candidate and output. Of several candidates none is chosen that is further
// off on output 0 than the widest tolerance; of such a one the rest stays 0.
void GetPhasesAndDutyCycles(VorkelImp& imp, const Run& run);

// ClosestSolution.cpp: the candidate whose phases and duty cycles come closest, or null.
// GetPhasesAndDutyCycles has run over the table.
const VcoCandidate* SelectPhaseSolution(VorkelImp& imp, const Run& run);

// SolverPass.cpp: one pass of the search, with `fudge` (MHz) up and, when it is not 0, down.
// True when it has chosen a candidate.
bool SolverPass(VorkelImp& imp, double fudge, const Run& run);

// SolverPass.cpp: true when output 0 has whole dividers only: on a PLL, and on a TSYN with six
// or more outputs or when the caller forces it.
bool HasIntegerDiv0(const VorkelImp& imp, const Run& run);

// FudgeLoop.cpp: passes with the fudges of Fudges.h until one succeeds. Without a trace, passes
// that fail for certain (PassFilter.h) are left out.
bool FudgeLoop(VorkelImp& imp, const Run& run);

// ChosenValues.cpp: prints the chosen configuration.
void TraceChosenValues(const VorkelImp& imp, const Run& run);

}  // namespace Ip::Pll

#endif  // VORKEL_ENGINE_PLL_STAGES_H_
