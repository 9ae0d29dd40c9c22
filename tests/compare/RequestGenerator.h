// Random requests to the PLL/TSYN solver, and random device limits, for comparing solvers.
//
// The same seed gives the same requests on every machine.
#ifndef VORKEL_TESTS_COMPARE_REQUESTGENERATOR_H_
#define VORKEL_TESTS_COMPARE_REQUESTGENERATOR_H_

#include <ostream>
#include <string>

#include "tests/compare/Random.h"
#include "tests/plain/plain_pll.h"

namespace compare {

// What kind of request to draw. The kinds differ in how far the search has to go.
enum class Kind {
  kCommon,       // frequencies that designs use
  kConstructed,  // made from a setting: solved at a fudge of 0, or nearly so
  kShifted,      // made from a setting, then output 0 moved: needs a fudge
  kRangeEnds,    // limits that lie exactly on what the request needs
  kMeetingEnds,  // several limits that lie exactly on one VCO frequency
  kRoundFigures,  // round figures beside the round limits of devices
  kInfeasible,   // nothing serves it: the search goes through all fudges
  kLowOutput,    // an output so low that only the lower VCO frequencies serve it
  kWild,         // zero, negative, huge, inf, nan, text, short and long lists, odd counts
  kSlowVco,      // a VCO so slow that outputs are below 1 MHz
  kBelowZero,    // a second input below 0, which leaves the VCO no lower limit; output 0 near 0
};
const char* KindName(Kind kind);

// What GoogleTest shows of a kind.
inline void PrintTo(Kind kind, std::ostream* out) { *out << KindName(kind); }

struct Case {
  plain::PllLimits limits;
  plain::PllRequest request;
};

// Draws one case.
Case DrawCase(Kind kind, Random& random);

// A case in words, to be read in the message of a failed comparison.
std::string Describe(const Case& drawn);

}  // namespace compare

#endif  // VORKEL_TESTS_COMPARE_REQUESTGENERATOR_H_
