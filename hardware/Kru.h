// KRU_SP and KRU_CLKGEN: what they can be set to, and what comes out.
//
// A KRU_SP puts its input, or half of it (CLKIN_DIVIDE_BY_2), through a delay line. Its pins have
// that frequency at four phases (CLK0 to CLK270), twice of it at two (CLK2X, CLK2X180), a
// quotient of it (CLKDV), or M / D of it at two phases (CLKFX, CLKFX180). PHASE_SHIFT moves all of
// them alike. Without feedback there are only CLKFX and CLKFX180. A KRU_CLKGEN has CLKFX and
// CLKFX180, and CLKFXDV, a quotient of CLKFX; its output 0 is always on CLKFX.
//
// Any number of outputs can be on the same pin.
//
// Tested by kru_test.cpp.
#ifndef VORKEL_HARDWARE_KRU_H_
#define VORKEL_HARDWARE_KRU_H_

#include <array>
#include <cstddef>
#include <span>
#include <string_view>

#include "hardware/Exact.h"
#include "hardware/Primitive.h"

namespace hardware {

// The codes are those of the search; 0 is no pin.
enum class Pin {
  kNone,
  kClk0,
  kClk90,
  kClk180,
  kClk270,
  kClkdv,
  kClk2x,
  kClk2x180,
  kClkfx,
  kClkfx180,
  kClkfxdv
};

// Where the clock of a pin comes from.
enum class PinSource { kLine, kDoubler, kDivider, kSynthesiser, kDividedSynthesiser };

struct PinFacts {
  Pin pin;
  std::string_view name;
  PinSource source;
  int phase;                // degrees
  std::string_view limits;  // the pin whose limits it has
  bool is_sp;               // a KRU_SP has it
  bool is_clkgen;           // a KRU_CLKGEN has it
  bool needs_feedback;
};

inline constexpr std::array<PinFacts, 10> kPins = {{
    {Pin::kClk0, "CLK0", PinSource::kLine, 0, "CLK0", true, false, true},
    {Pin::kClk90, "CLK90", PinSource::kLine, 90, "CLK90", true, false, true},
    {Pin::kClk180, "CLK180", PinSource::kLine, 180, "CLK0", true, false, true},
    {Pin::kClk270, "CLK270", PinSource::kLine, 270, "CLK90", true, false, true},
    {Pin::kClkdv, "CLKDV", PinSource::kDivider, 0, "CLKDV", true, false, true},
    {Pin::kClk2x, "CLK2X", PinSource::kDoubler, 0, "CLK2X", true, false, true},
    {Pin::kClk2x180, "CLK2X180", PinSource::kDoubler, 180, "CLK2X", true, false, true},
    {Pin::kClkfx, "CLKFX", PinSource::kSynthesiser, 0, "CLKFX", true, true, false},
    {Pin::kClkfx180, "CLKFX180", PinSource::kSynthesiser, 180, "CLKFX", true, true, false},
    {Pin::kClkfxdv, "CLKFXDV", PinSource::kDividedSynthesiser, 0, "CLKFXDV", false, true, false},
}};

// The facts of a pin; that of kNone is not asked for.
const PinFacts& FactsOf(Pin pin);

// M and D of the synthesiser.
inline constexpr int kSmallestKruM = 2;
constexpr int LargestKruRatioPart(Primitive primitive) {
  return primitive == Primitive::kKruSp ? 32 : 256;
}

// The divides of CLKDV, in halves: 2 to 8 by halves, and 9 to 17. There is no 1.5.
inline constexpr std::array<int, 22> kClkdvHalves = {4,  5,  6,  7,  8,  9,  10, 11, 12, 13, 14,
                                                     15, 16, 18, 20, 22, 24, 26, 28, 30, 32, 34};
// Those of CLKFXDV, in halves.
inline constexpr std::array<int, 5> kClkfxdvHalves = {4, 8, 16, 32, 64};

// PHASE_SHIFT: 0 to 255 steps of 360/255 degrees.
inline constexpr int kShiftSteps = 255;

// What is set of a KRU beside its pins. M and D are 0 where no pin needs them, and so is the
// divide, in halves, of CLKDV or CLKFXDV.
struct KruRatios {
  bool divide_by_2 = false;
  int m = 0;
  int d = 0;
  int divide_halves = 0;
};

// The ratio of a pin to the input.
Rational PinRatio(Pin pin, const KruRatios& ratios);
// Its phase with a PHASE_SHIFT, from 0 to below 360 degrees.
Rational PinPhase(Pin pin, int shift);
// Its duty cycle, percent. A divide between whole numbers is one half longer low than high.
Rational PinDuty(Pin pin, int divide_halves);

}  // namespace hardware

#endif  // VORKEL_HARDWARE_KRU_H_
