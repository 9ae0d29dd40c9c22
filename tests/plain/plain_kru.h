// Plain KRU_SP solver: pins, M, D, CLKDV divide and phase shift found step by step, kept to be
// compared with.
//
// The KRU has a fixed set of output pins, each a fixed multiple or fraction of the input clock at a
// fixed phase, or the synthesised CLKFX = input x M / D. One fine phase shift is common to all
// pins. The solver finds that shift, then for each output the pin that could serve it, once without
// and once with CLKIN_DIVIDE_BY_2, and takes the first of the two lists for which one CLKDV value
// and one pair of M and D serve all outputs.

#ifndef TESTS_PLAIN_PLAIN_KRU_H_
#define TESTS_PLAIN_PLAIN_KRU_H_

#include <string>

#include "plain_lists.h"
#include "plain_trace.h"

namespace plain {

inline constexpr int kKruOutputs = 6;

// Result codes of a KRU request.
inline constexpr int kKruSolved = 1;
inline constexpr int kKruNoLimits = 2;        // the device limits could not be read
inline constexpr int kKruNoConfiguration = 3; // unusable lists or input clock, or no configuration

// Output pins. CLKFXDV is the KRU_CLKGEN's alone.
enum KruPin : int {
  kPinNone = 0,
  kPinClk0 = 1,
  kPinClk90 = 2,
  kPinClk180 = 3,
  kPinClk270 = 4,
  kPinClkdv = 5,
  kPinClk2x = 6,
  kPinClk2x180 = 7,
  kPinClkfx = 8,
  kPinClkfx180 = 9,
  kPinClkfxdv = 10,
};

// Output frequency limits in MHz. "2x" maxima hold when the feedback comes from CLK2X. These values
// stand in for a device until its own are known.
struct KruLimits {
  double clk0Min = 5.0;  // CLK0 and CLK180
  double clk0Max = 280.112;
  double clk0Max2x = 187.617;
  double clk90Min = 5.0;  // CLK90 and CLK270
  double clk90Max = 200.0;
  double clk90Max2x = 187.617;
  double clk2xMin = 10.0;  // CLK2X and CLK2X180
  double clk2xMax = 374.532;
  double clkdvMin = 0.3125;
  double clkdvMax = 185.874;
  double clkdvMax2x = 125.0;
  double clkfxMin = 5.0;  // CLKFX and CLKFX180
  double clkfxMax = 374.532;
  double clkfxdvMin = 0.156;
  double clkfxdvMax = 187.266;
  bool readable = true;  // false: the limits could not be read
};

// What requests leave behind. It persists: a failed request leaves part of what it did.
struct KruState {
  int chosenPin[kKruOutputs]{};  // pin codes
  int pinsF[kKruOutputs]{};      // list for CLKIN_DIVIDE_BY_2 = FALSE
  int pinsT[kKruOutputs]{};      // list for CLKIN_DIVIDE_BY_2 = TRUE
  int m = 0;                     // 0: no synthesised output
  int d = 0;
  bool divBy2 = false;
  double clkdv = 0;        // CLKDV divide, or DV of a KRU_CLKGEN; 0: not used
  double phaseOffset = 0;  // degrees
};

struct KruRequest {
  std::string outFreqs;  // MHz, separated by blanks
  std::string phases;    // degrees
  double inFreq = 0;     // MHz
  int numOut = 0;        // 1 to 6
  bool feedbackUsed = false;
};

// Answers one request. Returns a result code; the configuration is in `state`.
int SolveKru(const KruRequest& request, const KruLimits& limits, RequestLists& lists,
             KruState& state, Trace& trace);

// Name of the pin with the given code; "NONE" for a code that is no pin.
const char* KruPinText(int pin);

// Name of the pin chosen for output n. Index 6 reads the first entry of the
// CLKIN_DIVIDE_BY_2 = TRUE list; below 0 and above 6 the name is "NONE".
std::string KruPinName(const KruState& state, int n);

// Frequency (MHz) that output n delivers for the given input clock (MHz). Index 6 as above; 0 for
// an index without a pin and for a pin whose divider is 0.
double KruOutFreq(const KruState& state, double inputFreq, int n);

// PHASE_SHIFT attribute, in 1/255 of a turn, of the chosen phase offset.
int KruPhaseShift(const KruState& state);

}  // namespace plain

#endif  // TESTS_PLAIN_PLAIN_KRU_H_
