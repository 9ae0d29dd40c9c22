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

// One of the two lists, and what its trace lines call it.
struct List {
  KruPinList& pins;
  const ClkdvList& clkdv;
  bool divBy2;
  char name;
  const char* setting;  // as the trace spells it
  const char* dashes;
};

bool TryList(VorkelImp& imp, const List& list, const Run& run) {
  if (const int n = FirstUnfilled(list.pins, run.numOut); n < run.numOut) {
    TRACE(run.trace,
          "DLL -------- _kruPinsDivby2%c[%d] isn't filled, so KRU won't work for %s = %c\n",
          list.name, n, list.setting, list.name);
    return false;
  }
  const double clkdv = MakeClkdvConsistent(list.pins, list.clkdv, list.name, run);
  if (!SynthesiserServes(imp, list.pins, list.divBy2, run)) return false;
  TRACE(run.trace, "DLL %s _kruPinsDivBy2%c list works!\n", list.dashes, list.name);
  imp.kru._kruChosenPin = list.pins;
  imp.kru._kruChosenDivBy2 = list.divBy2;
  imp.kru._kruChosenClkdv = clkdv;
  return true;
}

}  // namespace

bool ChooseList(VorkelImp& imp, const ClkdvLists& clkdv, const Run& run) {
  KruState& kru = imp.kru;
  if (TryList(imp, {kru._kruPinsDivBy2F, clkdv.f, false, 'F', "DivBy2", "--   "}, run)) {
    return true;
  }
  TRACE(run.trace, "DLL ---------- checking 2nd list: _kruPinsDivBy2T \n");
  return TryList(imp, {kru._kruPinsDivBy2T, clkdv.t, true, 'T', "DivyBy2", "----------"}, run);
}

}  // namespace Ip::Kru
