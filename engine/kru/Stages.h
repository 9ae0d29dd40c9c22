// The stages of the KRU_SP solver, in the order in which a request flows through them.
//
//   FindPhaseOffset   requested phases  ->  the one fine phase shift of the primitive
//   AssignPins        which pin could serve each output, with CLKIN_DIVIDE_BY_2 FALSE and TRUE
//   ChooseList        one CLKDV value, an M and D for CLKFX, and so the first list that works
//
// Example: 100 MHz in, outputs 100 MHz at 0, 50 MHz at 0 and 150 MHz at 0 degrees, feedback
// used. Without the halved input: CLK0, CLKDV with 2 and CLKFX; M = 3 and D = 2 make 150 MHz.
//
// The KRU_CLKGEN solver (engine/kru_clkgen/) shares the state, the limits and the helpers.
#ifndef VORKEL_ENGINE_KRU_STAGES_H_
#define VORKEL_ENGINE_KRU_STAGES_H_

#include <array>

#include "engine/Ip_VorkelImp.h"
#include "engine/Trace.h"

namespace Ip::Kru {

// What a run answers.
enum ResultCode : int {
  kSolved = 1,
  kNoSpeedData = 2,      // the device limits could not be read
  kNoConfiguration = 3,  // the primitive cannot serve the request, or the request is bad
};

// One run of the solver.
struct Run {
  double inFreq;  // MHz; not 0 once the request is parsed
  int numOut;     // outputs, 1 to kKruOutputs then
  bool feedbackUsed;
  const Trace& trace;
};

// The CLKDV value that each output would need in a list; 0: none.
using ClkdvList = std::array<double, kKruOutputs>;
struct ClkdvLists {
  ClkdvList f{};  // with CLKIN_DIVIDE_BY_2 FALSE
  ClkdvList t{};  // with CLKIN_DIVIDE_BY_2 TRUE
};

// Driver.cpp: parses frequencies (MHz) and phases (degrees) of a KRU_SP or KRU_CLKGEN request.
// False when a list is empty or short, or numOut is outside 1 to kKruOutputs; nothing is stored
// in the latter case.
bool ParseRequest(VorkelImp& imp, int numOut, const Port::StringBase& outFreqs,
                  const Port::StringBase& phases);

// OutputRanges.cpp: prints the ranges of the pin families.
void TraceOutputRanges(const KruLimits& limits, const Trace& trace);

// PhaseOffset.cpp: finds the offset that, with the fixed phases of the pins, gives every
// requested phase. Sets _kruPhaseOffset, or returns false and leaves it.
bool FindPhaseOffset(VorkelImp& imp, const Run& run);

// PhaseOffset.cpp: the PHASE_SHIFT attribute of an offset in degrees.
int PhaseShift(double offset);

// PinAssignment.cpp: fills both pin lists, and returns the CLKDV values that they need.
ClkdvLists AssignPins(VorkelImp& imp, const Run& run);

// ListChoice.cpp: chooses the first list that works. Sets the chosen pins, M, D,
// CLKIN_DIVIDE_BY_2 and CLKDV, or returns false.
bool ChooseList(VorkelImp& imp, const ClkdvLists& clkdv, const Run& run);

// MultiplierSearch.cpp: finds the M and D that serve every CLKFX and CLKFX180 of a list. Sets
// _kruChosenM and _kruChosenD, or returns false and leaves them.
bool FindMAndD(VorkelImp& imp, const KruPinList& pins, bool divBy2, const Run& run);

// ChosenValues.cpp: prints the chosen configuration.
void TraceChosenValues(const VorkelImp& imp, const Run& run);

// min <= f <= max; false for NaN.
inline bool InRange(double f, double min, double max) { return min <= f && f <= max; }

// True when `f` is `x`, or within `tolerance` of it: x - tolerance <= f <= x + tolerance.
inline bool Matches(double f, double x, double tolerance) {
  return f == x || InRange(f, x - tolerance, x + tolerance);
}

// True for the pins of a KRU_SP that need an M and a D.
inline bool UsesSynthesiser(KruPin pin) {
  return pin == KruPin::CLKFX || pin == KruPin::CLKFX180;
}

}  // namespace Ip::Kru

#endif  // VORKEL_ENGINE_KRU_STAGES_H_
