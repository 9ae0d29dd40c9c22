// Plain PLL/TSYN solver: the search for VCO, M, D and output dividers written down step by step,
// without any of the shortcuts that a fast solver takes. It is kept to be compared with.
//
// A request asks for up to seven output frequencies. With an input clock F the VCO runs at
// F x M / D and output n at VCO / divider n. The search
//   1. takes every divider of output 0 whose VCO = frequency x divider is in the VCO range,
//   2. finds for each such VCO a whole divider of every further output,
//   3. finds the smallest M, and its D, that make this VCO from the input clock,
//   4. chooses among what is left: the smallest VCO, or the one whose phases and duty cycles come
//      closest to the request.
// When nothing is left, the frequency of output 0 is fudged by 0.001 MHz up and down, then by
// 0.002 MHz, and so on.

#ifndef TESTS_PLAIN_PLAIN_PLL_H_
#define TESTS_PLAIN_PLAIN_PLL_H_

#include <cstddef>
#include <optional>
#include <string>
#include <vector>

#include "plain_lists.h"
#include "plain_trace.h"

namespace plain {

// Primitive codes. Any other code has no limits and ends with kNoLimits.
inline constexpr int kPrimTsyn = 0;
inline constexpr int kPrimPll = 1;

// Result codes of a request.
inline constexpr int kSolved = 1;
inline constexpr int kNoLimits = 2;          // the device limits could not be read
inline constexpr int kEmptyRange = 3;        // VCO or M range empty: input clocks too far apart
inline constexpr int kBadRequest = 4;        // a list is empty or short, or the input clock is 0
inline constexpr int kNoConfiguration = 5;   // no VCO, M and D for any fudge

// Device limits; frequencies in MHz, maxHighLowCount in VCO cycles.
struct PllLimits {
  double vcoMin = 400.0;
  double vcoMax = 1200.0;
  double clkoutMin = 3.125;
  double clkoutMax = 375.0;
  double pfdMin = 10.0;
  double pfdMax = 550.0;
  double clkoutMaxIo = 1000.0;
  double maxHighLowCount = 64.0;
  double vcoTarget = 0.0;
  double maxPfdLowB = 300.0;
  bool readable = true;  // false: the limits could not be read
};

struct PllRequest {
  bool closest = false;    // choose by phases and duty cycles; false: by the smallest VCO
  std::string outFreqs;    // MHz, separated by blanks
  std::string phases;      // degrees; read only when `closest` is set
  std::string dutyCycles;  // percent; read only when `closest` is set
  double inFreq = 0;       // MHz
  double inFreq2 = 0;      // MHz; 0: there is no second input clock
  int count = 0;           // outputs, 1 to 7
  bool preferMaxVco = false;
  bool intDiv0Only = false;
  int prim = kPrimTsyn;
  bool lowBandwidth = false;
};

// What a request ends with. Without a chosen configuration all chosen values are 0.
struct PllAnswer {
  int code = 0;
  bool chosen = false;
  double vco = 0;                     // MHz
  double m = 0;                       // feedback multiplier
  int d = 0;                          // input divider
  double div0 = 0;                    // divider of output 0
  int divN[kMaxOutputs]{};            // dividers of the further outputs; [0] stays 0
  double outFreq[kMaxOutputs]{};      // MHz
  double phase[kMaxOutputs]{};        // degrees
  double dutyCycle[kMaxOutputs]{};    // fraction: 0.5 for 50 percent
  double minAdjVco = 400.0;           // MHz, working VCO range; as here when never worked out
  double maxAdjVco = 1200.0;
  double minM = 0;                    // the working VCO range divided by the input clock
  double maxM = 0;
  double fudge = 0;                   // MHz, of the pass that succeeded
};

// Answers one request. `lists` is read and written as RequestLists says.
PllAnswer SolvePll(const PllRequest& request, const PllLimits& limits, RequestLists& lists,
                   Trace& trace);

// True when the search finds nothing within the first `passes` fudges: it can go on for up to
// seconds, and its trace for tens of megabytes, so that tests can afford few of these.
bool GoesFar(const PllRequest& request, const PllLimits& limits, RequestLists lists,
             int passes = 100);

// ---- Single stages, for comparing stage by stage ----

// One configuration under search.
struct VcoCandidate {
  double vco = 0;   // MHz
  double div0 = 0;  // whole, or a multiple of 0.125
  double m = 0;     // 0 until the M/D search has accepted the candidate
  int d = 0;
  int divN[kMaxOutputs]{};            // [0] stays 0
  double freqDiff[kMaxOutputs]{};     // MHz, |actual - requested|; [0] stays 0
  double phase[kMaxOutputs]{};        // degrees
  double phaseDiff[kMaxOutputs]{};    // degrees, |requested - phase|
  double dutyCycle[kMaxOutputs]{};    // fraction
  double dutyDiff[kMaxOutputs]{};     // fraction, |requested - dutyCycle|

  bool Accepted() const { return m != 0.0; }
};

inline constexpr std::size_t kMaxVcoCandidates = 1010;
inline constexpr std::size_t kMaxSolutions = 100;

// What the stages of one request hand on to each other.
struct PllState {
  double minAdjVco = 400.0;  // MHz
  double maxAdjVco = 1200.0;
  double minM = 0;
  double maxM = 0;
  int prim = -1;
  // The slot is the index of the output-0 divider step, so the table rises with div0.
  std::vector<std::optional<VcoCandidate>> candidates =
      std::vector<std::optional<VcoCandidate>>(kMaxVcoCandidates);
  // Slots of `candidates` that the choice by phases still considers.
  std::vector<std::optional<std::size_t>> solutions =
      std::vector<std::optional<std::size_t>>(kMaxSolutions);
  std::optional<std::size_t> chosen;  // slot of `candidates`
};

// Parses the frequency list and works out the VCO range. Returns kSolved when the range is valid,
// else kNoLimits, kEmptyRange or kBadRequest.
int PrepareVcoRange(const PllRequest& request, const PllLimits& limits, RequestLists& lists,
                    PllState& state, Trace& trace);

// One pass of the search at one fudge (MHz, 0 or more), upward and downward. Starts from an empty
// table, so passes do not depend on each other. Needs the range of PrepareVcoRange in `state` and
// the parsed requests in `lists`. Returns true when a configuration was chosen; `state.chosen` then
// tells which.
bool SolverPass(double fudge, const PllRequest& request, const PllLimits& limits,
                const RequestLists& lists, PllState& state, Trace& trace);

// The phase (degrees) nearest to `request` that an output divider can make: a multiple of 45
// degrees / divider, from -360 to 360. 0 for a request of 0 or NaN. The divider is 1 to 128; any
// other gives 0.
double PhaseForRequest(double request, double divider);

// The duty cycle (fraction) nearest to `requestPercent` that an output divider can make, in half
// VCO cycles, with neither the high nor the low time above `maxHighLowCount` VCO cycles. 0 for a
// request of 0. The divider is 1 to 128; any other gives 0.
double DutyCycleForRequest(double requestPercent, double divider, double maxHighLowCount);

}  // namespace plain

#endif  // TESTS_PLAIN_PLAIN_PLL_H_
