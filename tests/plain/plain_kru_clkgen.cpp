// M, D and DV of the plain KRU_CLKGEN solver.

#include "plain_kru_clkgen.h"

#include <cmath>
#include <vector>

#include "plain_numbers.h"

namespace plain {
namespace {

constexpr int kMinM = 2;
constexpr int kMaxM = 256;
constexpr int kMaxD = 256;
constexpr double kTolerance = 0.0001;
constexpr int kDvValues[] = {2, 4, 8, 16, 32};

// The pairs that are still possible, by M. d 0: not possible; dv 0: no DV bound to it yet.
struct PairTable {
  int d[kMaxM + 1]{};
  int dv[kMaxM + 1]{};
  int count = 0;

  void Clear(int m) {
    d[m] = 0;
    dv[m] = 0;
    --count;
  }
};

// What a run of the search works on.
struct Search {
  const KruRequest& request;
  const KruLimits& limits;
  KruState& state;
  Trace& trace;
  PairTable table{};
  bool failed = false;
};

bool InClkfxRange(const Search& s, double f) {
  return InRange(f, s.limits.clkfxMin, s.limits.clkfxMax);
}

void TraceNoMAndD(Search& s) { s.trace.Print("DLL -- couldn't find an M and D\n"); }

void TraceClkfxOutOfRange(Search& s, double f) {
  s.trace.Print("DLL -!!!!!! Can't use CLKFX because requested freq %3.3f is out of range\n", f);
}

void SeedPairs(Search& s, double f0) {
  for (int m = kMinM; m <= kMaxM; ++m) {
    const double x = m * s.request.inFreq / f0;
    const int d = WholeNumber(x + 0.5);
    if (!(std::fabs(d - x) < kTolerance)) continue;
    if (d < 1 || d > kMaxD) continue;
    s.table.d[m] = d;
    ++s.table.count;
  }
}

// Tries CLKFX or CLKFX180 for output n. True when some pair serves it; the others are dropped.
bool TryClkfx(Search& s, int n, double f, double p) {
  std::vector<bool> marked(kMaxM + 1, false);
  int marks = 0;
  if (p == 0.0 || p == 180.0) {
    for (int m = kMinM; m <= kMaxM; ++m) {
      if (s.table.d[m] == 0) continue;
      if (!Matches(m * s.request.inFreq / f, s.table.d[m], kTolerance)) continue;
      marked[static_cast<std::size_t>(m)] = true;
      ++marks;
    }
  }
  if (marks == 0) return false;

  s.state.chosenPin[n] = p == 180.0 ? kPinClkfx180 : kPinClkfx;
  s.trace.Print("DLL ----- for clk%d, found match: %s\n", n, KruPinText(s.state.chosenPin[n]));
  for (int m = kMinM; m <= kMaxM; ++m) {
    const int d = s.table.d[m];
    if (d == 0 || marked[static_cast<std::size_t>(m)]) continue;
    s.table.Clear(m);
    s.trace.Print("DLL ----- removed possible M = %d, D = %d\n", m, d);
  }
  s.trace.Print("DLL ----- for clk%d, found %d possible M/D pairs that work for CLKFX\n", n,
                s.table.count);
  return true;
}

bool MakesClkfxdv(const Search& s, int m, int d, int dv, double f) {
  return Matches(s.request.inFreq * m / (dv * d), f, kTolerance);
}

// The first DV with which the pair makes f; 0 for none.
int FindDv(const Search& s, int m, int d, double f) {
  for (const int dv : kDvValues) {
    if (MakesClkfxdv(s, m, d, dv, f)) return dv;
  }
  return 0;
}

void TryClkfxdvOnPair(Search& s, int n, int m, double f) {
  const int d = s.table.d[m];
  const int bound_dv = s.table.dv[m];
  if (bound_dv != 0) {
    if (MakesClkfxdv(s, m, d, bound_dv, f)) {
      s.state.chosenPin[n] = kPinClkfxdv;
    } else {
      s.table.Clear(m);
      s.trace.Print(
          "DLL ----- for clk %d, existing DV = %d didn't work, so remove M = %d, D = %d\n", n,
          bound_dv, m, d);
    }
    return;
  }
  const int dv = FindDv(s, m, d, f);
  if (dv != 0) {
    s.table.dv[m] = dv;
    s.state.chosenPin[n] = kPinClkfxdv;
  } else {
    s.table.Clear(m);
    s.trace.Print("DLL ----- for clk %d, not a CLKFXDV solution, so remove M = %d, D = %d\n", n, m,
                  d);
  }
}

void TryClkfxdv(Search& s, int n, double f, double p) {
  bool possible = true;
  if (p != 0.0) {
    s.trace.Print("DLL -!!!!!! Can't use CLKFXDV because phase is set to %3.3f, not 0\n", p);
    possible = false;
  }
  if (!InRange(f, s.limits.clkfxdvMin, s.limits.clkfxdvMax)) {
    s.trace.Print("DLL -!!!!!! Can't use CLKFXDV because requested freq %3.3f is out of range\n",
                  f);
    possible = false;
  }
  if (!possible) {
    s.failed = true;
    return;
  }
  for (int m = kMinM; m <= kMaxM; ++m) {
    if (s.table.d[m] != 0) TryClkfxdvOnPair(s, n, m, f);
  }
}

void ServeOutput(Search& s, int n, double f, double p) {
  s.trace.Print("DLL ------ Clk_Out%d ofreq = %3.3f; phase = %3.3f\n", n, f, p);
  if (InClkfxRange(s, f)) {
    if (TryClkfx(s, n, f, p)) return;
  } else {
    TraceClkfxOutOfRange(s, f);
  }
  s.trace.Print("DLL ----- for clk%d, CLKFX doesn't work, so trying CLKFXDV\n", n);
  TryClkfxdv(s, n, f, p);
}

bool SeedFromOutput0(Search& s, double f0) {
  s.trace.Print("DLL ------ Clk_Out0 ofreq = %3.3f\n", f0);
  if (!InClkfxRange(s, f0)) {
    TraceClkfxOutOfRange(s, f0);
    TraceNoMAndD(s);
    return false;
  }
  SeedPairs(s, f0);
  if (s.table.count == 0) {
    TraceNoMAndD(s);
    return false;
  }
  if (s.request.numOut >= 2) {
    s.trace.Print("DLL -- Found %d possible M/D pairs for CLK_OUT1\n", s.table.count);
  }
  s.state.chosenPin[0] = kPinClkfx;
  return true;
}

bool ChoosePair(Search& s) {
  s.trace.Print("DLL ----- found %d possible M and Ds\n", s.table.count);
  int best_m = kMinM;
  int best_d = kMaxD + 1;
  for (int m = kMinM; m <= kMaxM; ++m) {
    if (s.table.d[m] != 0 && s.table.d[m] < best_d) {
      best_m = m;
      best_d = s.table.d[m];
    }
  }
  if (best_d > kMaxD) {
    TraceNoMAndD(s);
    return false;
  }
  s.state.m = best_m;
  s.state.d = best_d;
  s.state.clkdv = s.table.dv[best_m];
  s.trace.Print("DLL -- found M = %d, D = %d, DV = %d\n", best_m, best_d, s.table.dv[best_m]);
  return true;
}

bool Run(Search& s, const RequestLists& lists) {
  s.state.m = 0;
  s.state.d = 0;
  s.state.clkdv = 0.0;
  for (int i = 0; i < kKruOutputs; ++i) {
    s.state.chosenPin[i] = kPinNone;
    s.state.pinsF[i] = kPinNone;
    s.state.pinsT[i] = kPinNone;
  }
  s.trace.Print("DLL ---- Calculating KRU_CLKGEN actuals \n");
  if (!SeedFromOutput0(s, lists.outFreq[0])) return false;
  for (int n = 1; n < s.request.numOut; ++n) {
    ServeOutput(s, n, lists.outFreq[n], lists.phase[n]);
    if (s.table.count < 1 || s.failed) {
      s.trace.Print("DLL --- couldn't find any M and Ds for clknum %d\n", n);
      break;
    }
  }
  if (s.table.count < 1 || s.failed) {
    TraceNoMAndD(s);
    return false;
  }
  return ChoosePair(s);
}

void TraceRanges(const KruLimits& limits, Trace& trace) {
  trace.Print("DLL --- KRU_CLKGEN output clock valid freq ranges:\n");
  trace.Print("DLL ------> CLKFX min = %3.3f; max = %3.3f\n", limits.clkfxMin, limits.clkfxMax);
  trace.Print("DLL ------> CLKFXDV min = %3.3f; max = %3.3f\n", limits.clkfxdvMin,
              limits.clkfxdvMax);
}

void TraceChosen(int numOut, const KruState& state, Trace& trace) {
  for (int n = 0; n < numOut; ++n) {
    trace.Print("DLL - for CLK_OUT%d, chosen KRU_CLKGEN pin = %s\n", n,
                KruPinText(state.chosenPin[n]));
  }
  trace.Print("DLL - chosen M = %d\n", state.m);
  trace.Print("DLL - chosen D = %d\n", state.d);
  if (state.clkdv != 0.0) trace.Print("DLL - chosen DV = %f\n", state.clkdv);
}

bool Solve(const KruRequest& request, const KruLimits& limits, RequestLists& lists,
           KruState& state, Trace& trace) {
  const bool freqs_read =
      ParseList(request.outFreqs, request.numOut, kKruOutputs, lists.outFreq);
  const bool phases_read = ParseList(request.phases, request.numOut, kKruOutputs, lists.phase);
  if (!freqs_read || !phases_read || request.inFreq == 0.0) return false;
  TraceRanges(limits, trace);
  Search search{request, limits, state, trace};
  return Run(search, lists);
}

}  // namespace

int SolveKruClkgen(const KruRequest& request, const KruLimits& limits, RequestLists& lists,
                   KruState& state, Trace& trace) {
  state.clkdv = 0.0;
  trace.Print("DLL- starting to calculate KRU_CLKGEN actuals \n");
  if (!Solve(request, limits, lists, state, trace)) {
    trace.Print("DLL ---- KRU_CLKGEN won't work!!\n");
    return kKruNoConfiguration;
  }
  TraceChosen(request.numOut, state, trace);
  return kKruSolved;
}

}  // namespace plain
