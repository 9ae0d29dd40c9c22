// Phase offset, request and answers of the plain KRU_SP solver.

#include "plain_kru.h"

#include "plain_kru_stages.h"
#include "plain_numbers.h"

namespace plain {
namespace {

constexpr int kMaxPhaseShift = 255;

int PhaseShiftOf(double offset) {
  if (offset == 0.0) return 0;
  return WholeNumber(offset / 360.0 * 255.0 + 0.5);
}

bool IsPossibleOffset(double offset) {
  if (offset == 0.0) return true;
  const int phase_shift = PhaseShiftOf(offset);
  return phase_shift >= 0 && phase_shift <= kMaxPhaseShift;
}

// How far the phases of the outputs are from what the pins alone can make.
struct PhaseOffsets {
  double positive[kKruOutputs]{};  // from the pin phase below
  double negative[kKruOutputs]{};  // to the pin phase above
  bool anyExact = false;           // some output needs no offset
};

void SplitPhase(int n, double p, double below, double above, PhaseOffsets& offsets) {
  offsets.positive[n] = p - below;
  offsets.negative[n] = p - above;
}

// Without feedback only the pins at 0 and 180 degrees exist. Phases from 360 up stay as if they
// needed no offset.
void SplitPhaseWithoutFeedback(int n, double p, PhaseOffsets& offsets) {
  if (p == 0.0 || p == 180.0) {
    offsets.anyExact = true;
  } else if (p < 0.0) {
    offsets.positive[n] = -p;
    offsets.negative[n] = p;
  } else if (p < 180.0) {
    SplitPhase(n, p, 0.0, 180.0, offsets);
  } else if (p < 360.0) {
    SplitPhase(n, p, 180.0, 360.0, offsets);
  }
}

void SplitPhaseWithFeedback(int n, double p, PhaseOffsets& offsets) {
  if (p == 0.0 || p == 90.0 || p == 180.0 || p == 270.0) {
    offsets.anyExact = true;
  } else if (p < 0.0) {
    offsets.positive[n] = -p;
    offsets.negative[n] = p;
  } else if (p < 90.0) {
    SplitPhase(n, p, 0.0, 90.0, offsets);
  } else if (p < 180.0) {
    SplitPhase(n, p, 90.0, 180.0, offsets);
  } else if (p < 270.0) {
    SplitPhase(n, p, 180.0, 270.0, offsets);
  } else if (p >= 270.0) {
    SplitPhase(n, p, 270.0, 360.0, offsets);
  }
}

// The first output whose offset differs from that of output 0; 0 when none does.
int FirstDifferent(const double* offsets, int numOut) {
  for (int n = 1; n < numOut; ++n) {
    if (offsets[n] != offsets[0]) return n;
  }
  return 0;
}

void TraceBadPhaseShift(double offset, Trace& trace) {
  trace.Print("DLL ---- PHASE_SHIFT = %3.3f from offset %f is out of valid range!\n",
              static_cast<double>(PhaseShiftOf(offset)), offset);
}

bool TakeZeroOffset(const PhaseOffsets& offsets, int numOut, KruState& state, Trace& trace) {
  for (int n = 0; n < numOut; ++n) {
    if (offsets.positive[n] == 0.0) continue;
    trace.Print("DLL ---- found non-zero offset for clkunm %d = %f\n", n, offsets.positive[n]);
    return false;
  }
  state.phaseOffset = 0.0;
  trace.Print("DLL ---- all phases have 0 offset\n");
  return true;
}

bool TakePositiveOffset(const PhaseOffsets& offsets, int numOut, KruState& state, Trace& trace) {
  const double offset = offsets.positive[0];
  const int different = FirstDifferent(offsets.positive, numOut);
  if (different != 0) {
    trace.Print(
        "DLL ---- both %3.3f offset and %3.3f offset were used, so offsets won't work!\n", offset,
        offsets.positive[different]);
    return false;
  }
  if (!IsPossibleOffset(offset)) {
    TraceBadPhaseShift(offset, trace);
    return false;
  }
  state.phaseOffset = offset;
  trace.Print("DLL ---- %3.3f offset was used for all outclks\n", offset);
  return true;
}

bool TakeNegativeOffset(const PhaseOffsets& offsets, int numOut, KruState& state, Trace& trace) {
  const double offset = offsets.negative[0];
  const int different = FirstDifferent(offsets.negative, numOut);
  if (different != 0) {
    trace.Print(
        "DLL ---- both %3.3f negOffset and %3.3f negOffset were used, so negOffsets won't work!\n",
        offset, offsets.negative[different]);
    return false;
  }
  if (!IsPossibleOffset(offset)) {
    TraceBadPhaseShift(offset, trace);
    return false;
  }
  state.phaseOffset = offset;
  trace.Print("DLL ---- %3.3f offset (should be negative) was used for all outclks\n", offset);
  return true;
}

void TraceRanges(const KruLimits& limits, Trace& trace) {
  trace.Print("DLL --- KRU output clock valid freq ranges:\n");
  trace.Print("DLL ------> CLK0, CLK180 min = %3.3f; max = %3.3f\n", limits.clk0Min,
              limits.clk0Max);
  trace.Print("DLL ------> CLK90, CLK270 min = %3.3f; max = %3.3f\n", limits.clk90Min,
              limits.clk90Max);
  trace.Print("DLL ------> CLK2X min = %3.3f; max = %3.3f\n", limits.clk2xMin, limits.clk2xMax);
  trace.Print("DLL ------> CLKDV min = %3.3f; max = %3.3f\n", limits.clkdvMin, limits.clkdvMax);
  trace.Print("DLL ------> CLKFX min = %3.3f; max = %3.3f\n", limits.clkfxMin, limits.clkfxMax);
}

void TraceChosen(int numOut, const KruState& state, Trace& trace) {
  for (int n = 0; n < numOut; ++n) {
    trace.Print("DLL - for CLK_OUT%d, chosen KRU pin = %s\n", n, KruPinText(state.chosenPin[n]));
  }
  trace.Print("DLL - chosen CLKIN_DIVIDE_BY_2 = %d\n", state.divBy2 ? 1 : 0);
  trace.Print("DLL - chosen M = %d\n", state.m);
  trace.Print("DLL - chosen D = %d\n", state.d);
  trace.Print("DLL - chosen phase offset = %f\n", state.phaseOffset);
  trace.Print("DLL - chosen PHASE_SHIFT = %d\n", PhaseShiftOf(state.phaseOffset));
  if (state.clkdv != 0.0) trace.Print("DLL - chosen CLKDV = %f\n", state.clkdv);
}

int Run(const KruRequest& request, const KruLimits& limits, RequestLists& lists, KruState& state,
        Trace& trace) {
  const bool freqs_read =
      ParseList(request.outFreqs, request.numOut, kKruOutputs, lists.outFreq);
  const bool phases_read = ParseList(request.phases, request.numOut, kKruOutputs, lists.phase);
  if (!freqs_read || !phases_read) return kKruNoConfiguration;
  if (request.inFreq == 0.0) return kKruNoConfiguration;
  if (!limits.readable) return kKruNoLimits;
  TraceRanges(limits, trace);
  if (!FindKruPhaseOffset(request, lists, state, trace)) return kKruNoConfiguration;
  const KruClkdvValues clkdv = AssignKruPins(request, limits, lists, state, trace);
  return ChooseKruList(request, lists, clkdv, state, trace) ? kKruSolved : kKruNoConfiguration;
}

// The pin that index n reads. There is one index more than outputs: it reaches the list that
// follows the chosen pins.
int PinAt(const KruState& state, int n) {
  if (n >= 0 && n < kKruOutputs) return state.chosenPin[n];
  if (n == kKruOutputs) return state.pinsT[0];
  return kPinNone;
}

}  // namespace

bool FindKruPhaseOffset(const KruRequest& request, const RequestLists& lists, KruState& state,
                        Trace& trace) {
  trace.Print("DLL -- determining if a phase offset is used for KRU\n");
  PhaseOffsets offsets;
  for (int n = 0; n < request.numOut; ++n) {
    if (request.feedbackUsed) {
      SplitPhaseWithFeedback(n, lists.phase[n], offsets);
    } else {
      SplitPhaseWithoutFeedback(n, lists.phase[n], offsets);
    }
  }
  if (offsets.anyExact) return TakeZeroOffset(offsets, request.numOut, state, trace);
  return TakePositiveOffset(offsets, request.numOut, state, trace) ||
         TakeNegativeOffset(offsets, request.numOut, state, trace);
}

int SolveKru(const KruRequest& request, const KruLimits& limits, RequestLists& lists,
             KruState& state, Trace& trace) {
  trace.Print("DLL- starting to calculate KRU actuals \n");
  const int code = Run(request, limits, lists, state, trace);
  if (code == kKruSolved) {
    TraceChosen(request.numOut, state, trace);
  } else {
    trace.Print("DLL ---- KRU won't work!!\n");
  }
  return code;
}

const char* KruPinText(int pin) {
  switch (pin) {
    case kPinClk0: return "CLK0";
    case kPinClk90: return "CLK90";
    case kPinClk180: return "CLK180";
    case kPinClk270: return "CLK270";
    case kPinClkdv: return "CLKDV";
    case kPinClk2x: return "CLK2X";
    case kPinClk2x180: return "CLK2X180";
    case kPinClkfx: return "CLKFX";
    case kPinClkfx180: return "CLKFX180";
    case kPinClkfxdv: return "CLKFXDV";
    default: return "NONE";
  }
}

std::string KruPinName(const KruState& state, int n) { return KruPinText(PinAt(state, n)); }

double KruOutFreq(const KruState& state, double inputFreq, int n) {
  if (inputFreq == 0.0) return 0.0;
  const double halved = state.divBy2 ? inputFreq * 0.5 : inputFreq;
  switch (PinAt(state, n)) {
    case kPinClk0:
    case kPinClk90:
    case kPinClk180:
    case kPinClk270:
      return halved;
    case kPinClk2x:
    case kPinClk2x180:
      return state.divBy2 ? inputFreq : inputFreq * 2.0;
    case kPinClkdv:
      return state.clkdv == 0.0 ? 0.0 : halved / state.clkdv;
    case kPinClkfx:
    case kPinClkfx180:
      return state.d == 0 ? 0.0 : halved * state.m / state.d;
    default:
      return 0.0;
  }
}

int KruPhaseShift(const KruState& state) { return PhaseShiftOf(state.phaseOffset); }

}  // namespace plain
