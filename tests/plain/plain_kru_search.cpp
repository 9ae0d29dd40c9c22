// Choice of a pin list, and M and D, of the plain KRU_SP solver.

#include <cmath>
#include <optional>

#include "plain_kru.h"
#include "plain_kru_stages.h"
#include "plain_numbers.h"

namespace plain {
namespace {

constexpr int kMinM = 2;
constexpr int kMaxM = 32;
constexpr double kMaxD = 32.0;
constexpr double kSeedTolerance = 0.0005;
constexpr double kFilterTolerance = 0.0001;

bool IsSynthesised(int pin) { return pin == kPinClkfx || pin == kPinClkfx180; }

// The divisors D that are still possible, by M; 0 for none.
struct DivisorTable {
  int d[kMaxM + 1]{};
  int count = 0;
};

// x = M x input / f, which D must come close to.
double RealDivisor(int m, double input, double f) { return m * input / f; }

void SeedDivisors(double input, double f, DivisorTable& table, Trace& trace) {
  for (int m = kMinM; m <= kMaxM; ++m) {
    const double x = RealDivisor(m, input, f);
    if (!InRange(x, 1.0, kMaxD)) continue;
    const int d = WholeNumber(x + 0.5);
    if (!(std::fabs(d - x) < kSeedTolerance)) continue;
    table.d[m] = d;
    ++table.count;
    trace.Print("DLL ----- a possible M = %d, D = %d\n", m, d);
  }
}

void FilterDivisors(double input, double f, DivisorTable& table, Trace& trace) {
  for (int m = kMinM; m <= kMaxM; ++m) {
    const int d = table.d[m];
    if (d == 0) continue;
    trace.Print("DLL ----- testing M = %d, D = %d\n", m, d);
    if (Matches(RealDivisor(m, input, f), d, kFilterTolerance)) continue;
    table.d[m] = 0;
    --table.count;
    trace.Print("DLL ----- removed possible M = %d, D = %d\n", m, d);
  }
}

void StoreSmallestDivisor(const DivisorTable& table, KruState& state) {
  int best_m = kMinM;
  int best_d = kMaxM + 1;
  for (int m = kMinM; m <= kMaxM; ++m) {
    if (table.d[m] != 0 && table.d[m] < best_d) {
      best_m = m;
      best_d = table.d[m];
    }
  }
  state.m = best_m;
  state.d = best_d;
}

// Finds one M and D for all synthesised outputs of the list.
bool SearchMAndD(const int* pins, bool divBy2, const KruRequest& request,
                 const RequestLists& lists, KruState& state, Trace& trace) {
  const double input = divBy2 ? request.inFreq * 0.5 : request.inFreq;
  DivisorTable table;
  bool seeded = false;
  for (int n = 0; n < request.numOut; ++n) {
    if (!IsSynthesised(pins[n])) continue;
    const double f = lists.outFreq[n];
    trace.Print("DLL ----- looking for M/D for requested ofreq = %f\n", f);
    if (seeded) {
      FilterDivisors(input, f, table, trace);
    } else {
      SeedDivisors(input, f, table, trace);
      seeded = true;
    }
    if (table.count < 1) {
      trace.Print("DLL ----- couldn't find and M and Ds for clknum %d\n", n);
      break;
    }
  }
  if (table.count < 1) {
    trace.Print("DLL -- couldn't find an M and D\n");
    return false;
  }
  trace.Print("DLL ----- found %d possible M and Ds\n", table.count);
  StoreSmallestDivisor(table, state);
  trace.Print("DLL -- found M = %d, D = %d\n", state.m, state.d);
  return true;
}

std::optional<int> FirstUnfilled(const int* pins, int numOut) {
  for (int n = 0; n < numOut; ++n) {
    if (pins[n] == kPinNone) return n;
  }
  return std::nullopt;
}

bool AnySynthesised(const int* pins, int numOut) {
  for (int n = 0; n < numOut; ++n) {
    if (IsSynthesised(pins[n])) return true;
  }
  return false;
}

// A KRU has one CLKDV value: the first one stays, outputs that need another go to CLKFX. Returns
// the value that stays, 0 for none. `list` names the list in the trace.
double MakeClkdvConsistent(const double* values, int numOut, char list, int* pins, Trace& trace) {
  double v = values[0];
  for (int i = 1; i < numOut; ++i) {
    if (v == 0.0) {
      v = values[i];
      continue;
    }
    if (values[i] == 0.0) continue;
    trace.Print("DLL ------ CLKDV is used, with this value: %f\n", v);
    if (values[i] == v) continue;
    trace.Print(
        "DLL -------- non-matching CLKDVs used: value: %f; changing divBy2%c[%d] to CLKFX\n",
        values[i], list, i);
    pins[i] = kPinClkfx;
  }
  return v;
}

void TakeList(const int* pins, bool divBy2, double clkdv, KruState& state) {
  for (int i = 0; i < kKruOutputs; ++i) state.chosenPin[i] = pins[i];
  state.divBy2 = divBy2;
  state.clkdv = clkdv;
}

bool TryListF(const KruRequest& request, const RequestLists& lists, const KruClkdvValues& clkdv,
              KruState& state, Trace& trace) {
  const std::optional<int> unfilled = FirstUnfilled(state.pinsF, request.numOut);
  if (unfilled) {
    trace.Print(
        "DLL -------- _kruPinsDivby2F[%d] isn't filled, so KRU won't work for DivBy2 = F\n",
        *unfilled);
    return false;
  }
  const double v = MakeClkdvConsistent(clkdv.f, request.numOut, 'F', state.pinsF, trace);
  if (AnySynthesised(state.pinsF, request.numOut) &&
      !SearchMAndD(state.pinsF, false, request, lists, state, trace)) {
    return false;
  }
  trace.Print("DLL --    _kruPinsDivBy2F list works!\n");
  TakeList(state.pinsF, false, v, state);
  return true;
}

bool TryListT(const KruRequest& request, const RequestLists& lists, const KruClkdvValues& clkdv,
              KruState& state, Trace& trace) {
  const std::optional<int> unfilled = FirstUnfilled(state.pinsT, request.numOut);
  if (unfilled) {
    trace.Print(
        "DLL -------- _kruPinsDivby2T[%d] isn't filled, so KRU won't work for DivyBy2 = T\n",
        *unfilled);
    return false;
  }
  const double v = MakeClkdvConsistent(clkdv.t, request.numOut, 'T', state.pinsT, trace);
  if (AnySynthesised(state.pinsT, request.numOut) &&
      !SearchMAndD(state.pinsT, true, request, lists, state, trace)) {
    return false;
  }
  trace.Print("DLL ---------- _kruPinsDivBy2T list works!\n");
  TakeList(state.pinsT, true, v, state);
  return true;
}

}  // namespace

bool ChooseKruList(const KruRequest& request, const RequestLists& lists,
                   const KruClkdvValues& clkdv, KruState& state, Trace& trace) {
  if (TryListF(request, lists, clkdv, state, trace)) return true;
  trace.Print("DLL ---------- checking 2nd list: _kruPinsDivBy2T \n");
  return TryListT(request, lists, clkdv, state, trace);
}

}  // namespace plain
