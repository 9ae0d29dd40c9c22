// PLL and TSYN: what they can be set to, and what comes out.
//
//   input -> / D -> detector (PFD) -> VCO -> / divider of each output -> outputs
//                      ^-- / M --------|
//
// The VCO runs at input x M / D, the detector at input / D, an output at VCO / divider. M and
// dividers are counted in eighths, so that 62.375 is 499: only a TSYN has fractions, of M and of
// the divider of output 0, and only with up to five outputs.
//
// An output can start at any eighth of a VCO period and be high for any number of halves of it,
// as far as its counters go. Beside a fraction nothing of that can be set: all phases are 0 and
// all duty cycles 50 percent.
//
// Tested by loop_test.cpp.
#ifndef VORKEL_HARDWARE_LOOP_H_
#define VORKEL_HARDWARE_LOOP_H_

#include "hardware/Exact.h"
#include "hardware/Primitive.h"

namespace hardware {

inline constexpr int kEighths = 8;  // in a whole
inline constexpr int kLargestM = 64;
inline constexpr int kLargestD = 80;
inline constexpr int kLargestDivider = 128;
// Where the fractions begin: no M of a TSYN is between 1 and 5, no divider between 1 and 2.
inline constexpr int kSmallestTsynM = 5;
inline constexpr int kSmallestFractionalDivider = 2;
// With so many outputs and more, M and the divider of output 0 are whole.
inline constexpr int kWholeOutputs = 6;
// The PFD of a PLL with bandwidth LOW goes up to this, MHz; device files have it for a TSYN only.
inline constexpr int kPllLowBandwidthPfd = 300;

// Whether a primitive can have fractions of M and of the divider of output 0. `whole` says that
// the user does not want any.
bool HasFractions(Primitive primitive, int outputs, bool whole);

// Whether an M or an output divider, in eighths, can be set. `fractions` is that of HasFractions;
// `largest` is that of LargestDivider.
bool IsM(Primitive primitive, int eighths, bool fractions);
bool IsD(int d);
bool IsDivider(int eighths, int output, bool fractions, int largest);

// The largest divider whose high and low time the counters can make; `count` is the largest of
// either, in VCO periods (O_MAX_HT_LT).
int LargestDivider(int count);

// The ratio of VCO and output to the input.
Rational VcoRatio(int m_eighths, int d);
Rational OutputRatio(int m_eighths, int d, int divider_eighths);

// --- Phase, in steps of an eighth of a VCO period ---------------------------------------

// The phase of a step, degrees of the output.
Rational PhaseOfStep(int step, int divider_eighths);
// The step that is nearest to a phase from -360 to 360 degrees; of two that are equally near the
// later one. A phase below 0 has a step below 0.
int NearestPhaseStep(const Rational& degrees, int divider_eighths);

// --- Duty cycle, in halves of a VCO period for which the output is high ------------------

// A divider of 1 passes the VCO on: 50 percent, one half. Any other is high for one period at
// least and low for half of one; neither takes longer than `count` VCO periods, but the high time
// may be half a period more.
struct HighTimes {
  int shortest;
  int longest;
};
HighTimes HighTimesOf(int divider, int count);
// The duty cycle of a high time behind a whole divider, percent.
Rational DutyOfHighTime(int halves, int divider);
// The high time that is nearest to a duty cycle in percent; of two the longer one.
int NearestHighTime(const Rational& percent, int divider, int count);

}  // namespace hardware

#endif  // VORKEL_HARDWARE_LOOP_H_
