// Pin lists of the plain KRU_SP solver: which pin could make each output, without and with
// CLKIN_DIVIDE_BY_2.

#include <vector>

#include "plain_kru.h"
#include "plain_kru_stages.h"
#include "plain_numbers.h"

namespace plain {
namespace {

constexpr double kFrequencyTolerance = 0.001;  // MHz

// What a run of the assignment works on.
struct Assignment {
  const KruRequest& request;
  const KruLimits& limits;
  KruState& state;
  Trace& trace;
  KruClkdvValues clkdv{};
  // Feedback runs at 2X in the list: output 0 is on CLK2X there.
  bool flagF = false;
  bool flagT = false;
};

// One output of it.
struct Output {
  int n;
  double f;    // requested frequency, MHz
  double p;    // requested phase, degrees
  double off;  // phase offset common to all outputs, degrees
};

bool MatchesFrequency(double f, double center) { return Matches(f, center, kFrequencyTolerance); }

void TraceCannotUse(const char* pin, double f, Trace& trace) {
  trace.Print("DLL -!!!!!! Can't use %s because requested freq %3.3f is out of range\n", pin, f);
}

void TraceCannotPotentiallyUse(const char* pin, double f, Trace& trace) {
  trace.Print("DLL -!!!!!! Can't potentially use %s because requested freq %3.3f is out of range\n",
              pin, f);
}

bool InClk0Range(const Assignment& a, double f, bool flag) {
  return InRange(f, a.limits.clk0Min, flag ? a.limits.clk0Max2x : a.limits.clk0Max);
}

bool InClk90Range(const Assignment& a, double f, bool flag) {
  return InRange(f, a.limits.clk90Min, flag ? a.limits.clk90Max2x : a.limits.clk90Max);
}

bool InClk2xRange(const Assignment& a, double f) {
  return InRange(f, a.limits.clk2xMin, a.limits.clk2xMax);
}

bool InClkdvRange(const Assignment& a, double f, bool flag) {
  return InRange(f, a.limits.clkdvMin, flag ? a.limits.clkdvMax2x : a.limits.clkdvMax);
}

bool InClkfxRange(const Assignment& a, double f) {
  return InRange(f, a.limits.clkfxMin, a.limits.clkfxMax);
}

// Sets an entry of a list when the range test of the pin has passed. Returns whether it has.
bool SetIf(bool in_range, int& entry, KruPin pin, double f, Trace& trace) {
  if (in_range) {
    entry = pin;
  } else {
    TraceCannotUse(KruPinText(pin), f, trace);
  }
  return in_range;
}

// Both lists get a synthesised pin.
void SetFxBoth(const Output& o, KruPin pin, Assignment& a) {
  if (InClkfxRange(a, o.f)) {
    a.state.pinsF[o.n] = pin;
    a.state.pinsT[o.n] = pin;
  } else {
    TraceCannotPotentiallyUse(KruPinText(pin), o.f, a.trace);
  }
}

// Without feedback only CLKFX and CLKFX180 are there, whatever simple multiple is asked.
void AssignWithoutFeedback(const Output& o, Assignment& a) {
  if (o.p == o.off) {
    SetFxBoth(o, kPinClkfx, a);
  } else if (o.p == o.off + 180.0) {
    SetFxBoth(o, kPinClkfx180, a);
  }
}

void AssignInputFrequency(const Output& o, Assignment& a) {
  int& pin_f = a.state.pinsF[o.n];
  int& pin_t = a.state.pinsT[o.n];
  if (o.p == o.off) {
    SetIf(InClk0Range(a, o.f, a.flagF), pin_f, kPinClk0, o.f, a.trace);
    const bool on_clk2x = SetIf(InClk2xRange(a, o.f), pin_t, kPinClk2x, o.f, a.trace);
    if (on_clk2x && o.n == 0) a.flagT = true;
  } else if (o.p == o.off + 90.0) {
    // Goes by the flag of the other list.
    SetIf(InClk90Range(a, o.f, a.flagT), pin_f, kPinClk90, o.f, a.trace);
  } else if (o.p == o.off + 180.0) {
    SetIf(InClk0Range(a, o.f, a.flagF), pin_f, kPinClk180, o.f, a.trace);
    SetIf(InClk2xRange(a, o.f), pin_t, kPinClk2x180, o.f, a.trace);
  } else if (o.p == o.off + 270.0) {
    SetIf(InClk90Range(a, o.f, a.flagF), pin_f, kPinClk270, o.f, a.trace);
  }
}

void AssignHalfFrequency(const Output& o, Assignment& a) {
  int& pin_f = a.state.pinsF[o.n];
  int& pin_t = a.state.pinsT[o.n];
  if (o.p == o.off) {
    SetIf(InClk0Range(a, o.f, a.flagT), pin_t, kPinClk0, o.f, a.trace);
    SetIf(InClkdvRange(a, o.f, a.flagF), pin_f, kPinClkdv, o.f, a.trace);
    a.clkdv.f[o.n] = 2.0;
  } else if (o.p == o.off + 90.0) {
    SetIf(InClk90Range(a, o.f, a.flagT), pin_t, kPinClk90, o.f, a.trace);
  } else if (o.p == o.off + 180.0) {
    SetIf(InClk0Range(a, o.f, a.flagT), pin_t, kPinClk180, o.f, a.trace);
  } else if (o.p == o.off + 270.0) {
    SetIf(InClk90Range(a, o.f, a.flagT), pin_t, kPinClk270, o.f, a.trace);
  }
}

void AssignDoubleFrequency(const Output& o, Assignment& a) {
  int& pin_f = a.state.pinsF[o.n];
  int& pin_t = a.state.pinsT[o.n];
  if (o.p == o.off) {
    const bool on_clk2x = SetIf(InClk2xRange(a, o.f), pin_f, kPinClk2x, o.f, a.trace);
    if (on_clk2x && o.n == 0) a.flagF = true;
    if (InClkfxRange(a, o.f)) {
      pin_t = kPinClkfx;
    } else {
      TraceCannotPotentiallyUse("CLKFX", o.f, a.trace);
    }
  } else if (o.p == o.off + 180.0) {
    SetIf(InClk2xRange(a, o.f), pin_f, kPinClk2x180, o.f, a.trace);
  }
}

// CLKDV values in the order of the search: halves up to 8, then whole numbers up to 17.
std::vector<double> ClkdvSearchValues() {
  std::vector<double> values;
  for (int halves = 4; halves <= 16; ++halves) values.push_back(halves * 0.5);
  for (int whole = 9; whole <= 17; ++whole) values.push_back(whole);
  return values;
}

struct Found {
  bool f = false;
  bool t = false;
};

// Looks for CLKDV values that make the output in either list.
Found SearchClkdv(const Output& o, Assignment& a) {
  Found found;
  const double half = a.request.inFreq * 0.5;
  for (const double dv : ClkdvSearchValues()) {
    if (!found.f && MatchesFrequency(o.f, a.request.inFreq / dv)) {
      if (o.p != o.off) continue;
      if (SetIf(InClkdvRange(a, o.f, a.flagF), a.state.pinsF[o.n], kPinClkdv, o.f, a.trace)) {
        a.clkdv.f[o.n] = dv;
        found.f = true;
      }
    } else if (!found.t && MatchesFrequency(o.f, half / dv)) {
      if (o.p != o.off) {
        TraceCannotUse("CLKDV", o.f, a.trace);
      } else if (InClkdvRange(a, o.f, a.flagT)) {
        a.state.pinsT[o.n] = kPinClkdv;
        a.clkdv.t[o.n] = dv;
        found.t = true;
      }
    }
    if (found.f && found.t) break;
  }
  return found;
}

void AssignOtherFrequency(const Output& o, Assignment& a) {
  Found found;
  if (a.request.feedbackUsed) found = SearchClkdv(o, a);
  if (found.f && found.t) return;

  if (o.p == o.off) {
    if (InClkfxRange(a, o.f)) {
      if (!found.f) a.state.pinsF[o.n] = kPinClkfx;
      if (!found.t) a.state.pinsT[o.n] = kPinClkfx;
    } else {
      TraceCannotPotentiallyUse("CLKFX", o.f, a.trace);
    }
  }
  if (o.p == o.off + 180.0) {
    if (InClkfxRange(a, o.f)) {
      a.state.pinsT[o.n] = kPinClkfx180;
      if (a.request.feedbackUsed) a.state.pinsF[o.n] = kPinClkfx180;
    } else {
      TraceCannotPotentiallyUse("CLKFX180", o.f, a.trace);
    }
  }
}

void AssignOutput(const Output& o, Assignment& a) {
  a.trace.Print("DLL ------ Clk_Out%d ofreq = %3.3f; phase = %3.3f\n", o.n, o.f, o.p);
  const double in_freq = a.request.inFreq;
  const bool is_input = MatchesFrequency(o.f, in_freq);
  const bool is_half = MatchesFrequency(o.f, in_freq * 0.5);
  const bool is_double = MatchesFrequency(o.f, in_freq * 2.0);
  if (!is_input && !is_half && !is_double) {
    AssignOtherFrequency(o, a);
  } else if (!a.request.feedbackUsed) {
    AssignWithoutFeedback(o, a);
  } else if (is_input) {
    AssignInputFrequency(o, a);
  } else if (is_half) {
    AssignHalfFrequency(o, a);
  } else {
    AssignDoubleFrequency(o, a);
  }
}

}  // namespace

KruClkdvValues AssignKruPins(const KruRequest& request, const KruLimits& limits,
                             const RequestLists& lists, KruState& state, Trace& trace) {
  state.m = 0;
  state.d = 0;
  trace.Print("DLL ---- Checking if KRU will work\n");
  for (int i = 0; i < kKruOutputs; ++i) {
    state.chosenPin[i] = kPinNone;
    state.pinsF[i] = kPinNone;
    state.pinsT[i] = kPinNone;
  }
  Assignment assignment{request, limits, state, trace};
  for (int n = 0; n < request.numOut; ++n) {
    AssignOutput({n, lists.outFreq[n], lists.phase[n], state.phaseOffset}, assignment);
  }
  for (int n = 0; n < request.numOut; ++n) {
    trace.Print("DLL --------- _kruPinsDivBy2False[%d] = %s\n", n, KruPinText(state.pinsF[n]));
  }
  for (int n = 0; n < request.numOut; ++n) {
    trace.Print("DLL --------- _kruPinsDivBy2True[%d] = %s\n", n, KruPinText(state.pinsT[n]));
  }
  return assignment.clkdv;
}

}  // namespace plain
