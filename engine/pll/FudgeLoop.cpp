// The fudge: when the requested output-0 frequency has no solution, the search shifts it, up
// and down, by 0.001 MHz more in every pass until one is found.
//
// Tested by fudge_loop_test.cpp.

#include <optional>

#include "engine/pll/PassFilter.h"
#include "engine/pll/Stages.h"

namespace Ip::Pll {

namespace {

constexpr double kFudgeStep = 0.001;       // MHz
constexpr double kLargestFudge = 10.999;   // MHz; by repeated addition 11000 passes

}  // namespace

bool FudgeLoop(VorkelImp& imp, const Run& run) {
  double fudge = 0.0;
  if (SolverPass(imp, fudge, run)) return true;
  // The filter knows which of the other passes are worth running. With a trace all of them
  // run, since each has its lines.
  std::optional<PassFilter> filter;
  if (!run.trace.On()) {
    filter.emplace(imp, run, kFudgeStep);
    if (filter->IsHopeless()) return false;
  }
  for (;;) {
    fudge += kFudgeStep;
    TRACE(run.trace, "DLL- NO VALID VCOs found, so upping div0 fudge to %1.3f!\n", fudge);
    if (fudge > kLargestFudge) break;
    if (filter && !filter->MaySucceed(fudge)) continue;
    if (SolverPass(imp, fudge, run)) return true;
  }
  TRACE(run.trace, "DLL- NO VALID VCOs found for all possible div0 fudges!\n");
  return false;
}

}  // namespace Ip::Pll
