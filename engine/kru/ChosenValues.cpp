// The chosen KRU configuration, read back and traced.
//
// Tested by kru_chosen_values_test.cpp.

#include "engine/kru/Stages.h"

namespace Ip {

namespace {

// The pin behind an index of the accessors, which go one further than the primitive has
// outputs: index 6 is the first pin of the list for CLKIN_DIVIDE_BY_2 = TRUE. Outside of
// 0 to 6 there is none.
KruPin PinAt(const KruState& kru, int n) {
  if (n < 0 || n > kKruOutputs) return KruPin::NONE;
  if (n == kKruOutputs) return kru._kruPinsDivBy2T[0];
  return kru._kruChosenPin[static_cast<std::size_t>(n)];
}

// Index 6 can meet a pin whose divider was never chosen.
double Quotient(double dividend, double divisor) {
  return divisor == 0.0 ? 0.0 : dividend / divisor;
}

}  // namespace

int VorkelImp::GetKruChosenPhaseShift() const { return Kru::PhaseShift(kru._kruPhaseOffset); }

Port::StringBase VorkelImp::GetKruChosenPinname(int n) const { return KruPinName(PinAt(kru, n)); }

double VorkelImp::GetKruChosenOutFreqN(double inputFreq, int n) const {
  if (inputFreq == 0.0) return 0.0;
  const double c = kru._kruChosenDivBy2 ? inputFreq * 0.5 : inputFreq;
  switch (PinAt(kru, n)) {
    case KruPin::CLK0:
    case KruPin::CLK90:
    case KruPin::CLK180:
    case KruPin::CLK270: return c;
    case KruPin::CLK2X:
    case KruPin::CLK2X180: return kru._kruChosenDivBy2 ? inputFreq : inputFreq * 2.0;
    case KruPin::CLKDV: return Quotient(c, kru._kruChosenClkdv);
    case KruPin::CLKFX:
    case KruPin::CLKFX180: return Quotient(c * kru._kruChosenM, kru._kruChosenD);
    case KruPin::NONE:
    case KruPin::CLKFXDV: break;
  }
  return 0.0;
}

namespace Kru {

void TraceChosenValues(const VorkelImp& imp, const Run& run) {
  const Trace& trace = run.trace;
  if (!trace.On()) return;
  for (int n = 0; n < run.numOut; ++n) {
    trace.Print("DLL - for CLK_OUT%d, chosen KRU pin = %s\n", n,
                imp.GetKruChosenPinname(n).CStr());
  }
  trace.Print("DLL - chosen CLKIN_DIVIDE_BY_2 = %d\n", imp.GetKruChosenDivBy2() ? 1 : 0);
  trace.Print("DLL - chosen M = %d\n", imp.GetKruChosenM());
  trace.Print("DLL - chosen D = %d\n", imp.GetKruChosenD());
  trace.Print("DLL - chosen phase offset = %f\n", imp.GetKruChosenPhaseOffset());
  trace.Print("DLL - chosen PHASE_SHIFT = %d\n", imp.GetKruChosenPhaseShift());
  if (imp.GetKruChosenClkdv() != 0.0) {
    trace.Print("DLL - chosen CLKDV = %f\n", imp.GetKruChosenClkdv());
  }
}

}  // namespace Kru

}  // namespace Ip
