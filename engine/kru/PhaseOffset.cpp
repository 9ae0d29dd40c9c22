// The phase offset: the KRU_SP shifts all its outputs by one fine phase, and each pin adds a
// fixed phase of its own. This stage finds the one offset that, added to fixed phases, gives
// every requested phase.
//
// Each request is split in two ways: the offset above the fixed phase below it, and the
// negative offset below the fixed phase above it. One of the two must be common to all outputs.
//
// Tested by kru_phase_offset_test.cpp.

#include <array>

#include "engine/Numbers.h"
#include "engine/kru/Stages.h"
#include "hardware/Kru.h"

namespace Ip::Kru {

namespace {

constexpr double kPhaseShiftSteps = 255.0;  // in a full turn, as this engine counts them
constexpr int kLargestPhaseShift = 255;
static_assert(kPhaseShiftSteps == hardware::kShiftSteps &&
              kLargestPhaseShift == hardware::kShiftSteps);

// A requested phase against the fixed phases. What no rule covers is 0.
struct Split {
  double offset = 0.0;
  double negOffset = 0.0;
  bool onBase = false;  // the request is a fixed phase itself
};

// The fixed phases are 0 and 180 with the synthesiser's pins alone, and 0, 90, 180 and 270 with
// all pins. With all pins the last of them serves every phase above it, too; with the
// synthesiser's alone a phase from 360 on is left as it is.
Split SplitPhase(double phase, bool allPins) {
  const double distance = allPins ? 90.0 : 180.0;
  const double last = 360.0 - distance;
  for (double base = 0.0; base <= last; base += distance) {
    if (phase == base) return {0.0, 0.0, true};
  }
  if (phase < 0.0) return {-phase, phase, false};
  for (double base = 0.0; base <= last; base += distance) {
    const double next = base + distance;
    const bool open = allPins && base == last;
    if (phase >= base && (phase < next || open)) return {phase - base, phase - next, false};
  }
  return {};
}

using Offsets = std::array<double, kKruOutputs>;

// The number of the first output whose offset differs from that of output 0, or 0.
int FirstDifferent(const Offsets& offsets, int numOut) {
  for (int n = 1; n < numOut; ++n) {
    if (offsets[static_cast<std::size_t>(n)] != offsets[0]) return n;
  }
  return 0;
}

// Takes over the common offset if the attribute can hold it. The range begins at 0 for negative
// offsets, too, so that of those only the ones that round to 0 pass; that is meant so.
bool TakeOffset(VorkelImp& imp, double offset, const Trace& trace) {
  const int phaseShift = PhaseShift(offset);
  if (offset == 0.0 || (phaseShift >= 0 && phaseShift <= kLargestPhaseShift)) {
    imp.kru._kruPhaseOffset = offset;
    return true;
  }
  TRACE(trace, "DLL ---- PHASE_SHIFT = %3.3f from offset %f is out of valid range!\n",
        static_cast<double>(phaseShift), offset);
  return false;
}

// Some output sits on a fixed phase: there is no offset, and no other output may need one.
bool RequireNoOffset(VorkelImp& imp, const Offsets& offsets, const Run& run) {
  for (int n = 0; n < run.numOut; ++n) {
    const double offset = offsets[static_cast<std::size_t>(n)];
    if (offset != 0.0) {
      TRACE(run.trace, "DLL ---- found non-zero offset for clkunm %d = %f\n", n, offset);
      return false;
    }
  }
  imp.kru._kruPhaseOffset = 0.0;
  TRACE(run.trace, "DLL ---- all phases have 0 offset\n");
  return true;
}

}  // namespace

int PhaseShift(double offset) {
  return offset == 0.0 ? 0 : RoundToInt(offset / 360.0 * kPhaseShiftSteps);
}

bool FindPhaseOffset(VorkelImp& imp, const Run& run) {
  TRACE(run.trace, "DLL -- determining if a phase offset is used for KRU\n");
  Offsets offsets{};
  Offsets negOffsets{};
  bool anyOnBase = false;
  for (int n = 0; n < run.numOut; ++n) {
    const auto output = static_cast<std::size_t>(n);
    const Split split = SplitPhase(imp.requests.reqPhase[output], run.feedbackUsed);
    offsets[output] = split.offset;
    negOffsets[output] = split.negOffset;
    anyOnBase = anyOnBase || split.onBase;
  }
  if (anyOnBase) return RequireNoOffset(imp, offsets, run);

  if (const int n = FirstDifferent(offsets, run.numOut); n != 0) {
    TRACE(run.trace,
          "DLL ---- both %3.3f offset and %3.3f offset were used, so offsets won't work!\n",
          offsets[0], offsets[static_cast<std::size_t>(n)]);
  } else if (TakeOffset(imp, offsets[0], run.trace)) {
    TRACE(run.trace, "DLL ---- %3.3f offset was used for all outclks\n", offsets[0]);
    return true;
  }
  if (const int n = FirstDifferent(negOffsets, run.numOut); n != 0) {
    TRACE(run.trace,
          "DLL ---- both %3.3f negOffset and %3.3f negOffset were used, so negOffsets won't "
          "work!\n",
          negOffsets[0], negOffsets[static_cast<std::size_t>(n)]);
    return false;
  }
  if (!TakeOffset(imp, negOffsets[0], run.trace)) return false;
  TRACE(run.trace, "DLL ---- %3.3f offset (should be negative) was used for all outclks\n",
        negOffsets[0]);
  return true;
}

}  // namespace Ip::Kru
