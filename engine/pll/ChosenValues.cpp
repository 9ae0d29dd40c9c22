// The chosen configuration, read back and traced.
//
// Tested by chosen_values_test.cpp.

#include <cstddef>

#include "engine/Numbers.h"
#include "engine/pll/Stages.h"

namespace Ip {

namespace {

bool IsOutput(int n) { return n >= 0 && n < MAX_OUTPUTS; }

}  // namespace

double VorkelImp::GetChosenVCO() const { return pll.chosen == nullptr ? 0.0 : pll.chosen->vco; }

double VorkelImp::GetChosenM() const { return pll.chosen == nullptr ? 0.0 : pll.chosen->m; }

std::int32_t VorkelImp::GetChosenD() const {
  return pll.chosen == nullptr ? 0 : static_cast<std::int32_t>(pll.chosen->d);
}

double VorkelImp::GetChosenDiv0() const { return pll.chosen == nullptr ? 0.0 : pll.chosen->div0; }

std::int32_t VorkelImp::GetChosenDivN(int n) const {
  if (pll.chosen == nullptr || n == 0 || !IsOutput(n)) return 0;
  return static_cast<std::int32_t>(pll.chosen->divN[static_cast<std::size_t>(n)]);
}

double VorkelImp::GetChosenOutFreqN(int n) const {
  if (pll.chosen == nullptr || !IsOutput(n)) return 0.0;
  const double divider = pll.chosen->Divider(n);
  if (divider == 0.0 || pll.chosen->vco == 0.0) return 0.0;
  return pll.chosen->vco / divider;
}

double VorkelImp::GetChosenPhaseN(int n) const {
  if (pll.chosen == nullptr || !IsOutput(n)) return 0.0;
  return pll.chosen->phase[static_cast<std::size_t>(n)];
}

double VorkelImp::GetChosenDutyCycleN(int n) const {
  if (pll.chosen == nullptr || !IsOutput(n)) return 0.0;
  return pll.chosen->dutyCycle[static_cast<std::size_t>(n)];
}

namespace Pll {

void TraceChosenValues(const VorkelImp& imp, const Run& run) {
  const Trace& trace = run.trace;
  if (!trace.On()) return;
  const Requests& requests = imp.requests;
  trace.Print("DLL - chosen VCO = %f\n", imp.GetChosenVCO());
  trace.Print("DLL - chosen M = %f\n", imp.GetChosenM());
  trace.Print("DLL - chosen D = %d\n", imp.GetChosenD());
  trace.Print("DLL - chosen CLKOUT0_DIVIDE_F = %f\n", imp.GetChosenDiv0());
  for (int n = 1; n < run.count; ++n) {
    trace.Print("DLL - chosen CLKOUT%d_DIVIDE = %d\n", n, imp.GetChosenDivN(n));
  }
  for (int n = 0; n < run.count; ++n) {
    const auto output = static_cast<std::size_t>(n);
    trace.Print("DLL-- chosen clkout%d output freq = %f (req = %3.3f)\n", n,
                imp.GetChosenOutFreqN(n), requests.reqOutFreq[output]);
    if (imp.pll._minPowerMode) continue;
    trace.Print("DLL -   chosen clkout%d phase = %f (req = %3.3f)\n", n, imp.GetChosenPhaseN(n),
                requests.reqPhase[output]);
    trace.Print("DLL -   chosen clkout%d duty cycle = %f (req = %3.3f)\n", n,
                imp.GetChosenDutyCycleN(n), requests.reqDutyCycle[output]);
  }
}

}  // namespace Pll

}  // namespace Ip
