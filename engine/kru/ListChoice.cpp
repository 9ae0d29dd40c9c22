// The choice between the two pin lists: the first that is filled, that gets along with one
// CLKDV value, and whose CLKFX outputs have a common M and D.
//
// Tested by kru_list_choice_test.cpp.

#include <algorithm>

#include "engine/kru/Stages.h"

namespace Ip::Kru {

namespace {

// The first output without a pin, or numOut.
int FirstUnfilled(const KruPinList& pins, int numOut) {
  const auto end = pins.begin() + numOut;
  return static_cast<int>(std::find(pins.begin(), end, KruPin::NONE) - pins.begin());
}

// The primitive has one CLKDV. The first value stands; outputs that need another go to CLKFX,
// of which the search for M and D will see whether it can serve them. `list` is the name of
// the list in the trace.
double MakeClkdvConsistent(KruPinList& pins, const ClkdvList& values, char list,
                           const Run& run) {
  double value = values[0];
  for (int n = 1; n < run.numOut; ++n) {
    const auto output = static_cast<std::size_t>(n);
    if (value == 0.0) {
      value = values[output];
    } else if (values[output] != 0.0) {
      TRACE(run.trace, "DLL ------ CLKDV is used, with this value: %f\n", value);
      if (values[output] == value) continue;
      TRACE(run.trace,
            "DLL -------- non-matching CLKDVs used: value: %f; changing divBy2%c[%d] to CLKFX\n",
            values[output], list, n);
      pins[output] = KruPin::CLKFX;
    }
  }
  return value;
}

// True when the list needs no M and D, or when they are found.
bool SynthesiserServes(VorkelImp& imp, const KruPinList& pins, bool divBy2, const Run& run) {
  if (!std::any_of(pins.begin(), pins.begin() + run.numOut, UsesSynthesiser)) return true;
  return FindMAndD(imp, pins, divBy2, run);
}

void Take(KruState& kru, const KruPinList& pins, bool divBy2, double clkdv) {
  kru._kruChosenPin = pins;
  kru._kruChosenDivBy2 = divBy2;
  kru._kruChosenClkdv = clkdv;
}

bool TryListF(VorkelImp& imp, const ClkdvList& values, const Run& run) {
  KruPinList& pins = imp.kru._kruPinsDivBy2F;
  if (const int n = FirstUnfilled(pins, run.numOut); n < run.numOut) {
    TRACE(run.trace,
          "DLL -------- _kruPinsDivby2F[%d] isn't filled, so KRU won't work for DivBy2 = F\n", n);
    return false;
  }
  const double clkdv = MakeClkdvConsistent(pins, values, 'F', run);
  if (!SynthesiserServes(imp, pins, false, run)) return false;
  TRACE(run.trace, "DLL --    _kruPinsDivBy2F list works!\n");
  Take(imp.kru, pins, false, clkdv);
  return true;
}

bool TryListT(VorkelImp& imp, const ClkdvList& values, const Run& run) {
  KruPinList& pins = imp.kru._kruPinsDivBy2T;
  if (const int n = FirstUnfilled(pins, run.numOut); n < run.numOut) {
    TRACE(run.trace,
          "DLL -------- _kruPinsDivby2T[%d] isn't filled, so KRU won't work for DivyBy2 = T\n", n);
    return false;
  }
  const double clkdv = MakeClkdvConsistent(pins, values, 'T', run);
  if (!SynthesiserServes(imp, pins, true, run)) return false;
  TRACE(run.trace, "DLL ---------- _kruPinsDivBy2T list works!\n");
  Take(imp.kru, pins, true, clkdv);
  return true;
}

}  // namespace

bool ChooseList(VorkelImp& imp, const ClkdvLists& clkdv, const Run& run) {
  if (TryListF(imp, clkdv.f, run)) return true;
  TRACE(run.trace, "DLL ---------- checking 2nd list: _kruPinsDivBy2T \n");
  return TryListT(imp, clkdv.t, run);
}

}  // namespace Ip::Kru
