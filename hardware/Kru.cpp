// Tested by kru_test.cpp.
#include "hardware/Kru.h"

#include <cassert>

namespace hardware {

const PinFacts& FactsOf(Pin pin) {
  for (const PinFacts& facts : kPins) {
    if (facts.pin == pin) return facts;
  }
  return (assert(false), kPins.front());  // not reached: those are all pins but kNone
}

Rational PinRatio(Pin pin, const KruRatios& ratios) {
  Rational line = ratios.divide_by_2 ? Rational(1, 2) : Rational(1);
  switch (FactsOf(pin).source) {
    case PinSource::kLine:
      return line;
    case PinSource::kDoubler:
      return 2 * line;
    case PinSource::kDivider:
      return 2 * line / ratios.divide_halves;
    case PinSource::kSynthesiser:
      return line * ratios.m / ratios.d;
    case PinSource::kDividedSynthesiser:
      break;
  }
  return 2 * line * ratios.m / (ratios.d * ratios.divide_halves);
}

Rational PinPhase(Pin pin, int shift) {
  return TurnedToFull(FactsOf(pin).phase + Rational(360 * shift, kShiftSteps));
}

Rational PinDuty(Pin pin, int divide_halves) {
  if (FactsOf(pin).source != PinSource::kDivider) return 50;
  return Rational(100 * (divide_halves / 2), divide_halves);
}

}  // namespace hardware
