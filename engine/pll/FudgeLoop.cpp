// The fudge: when the requested output-0 frequency has no solution, the search shifts it, up
// and down, by 0.001 MHz more in every pass until one is found.
//
// Tested by fudge_loop_test.cpp.

#include <algorithm>
#include <optional>

#include "engine/pll/Div0Steps.h"
#include "engine/pll/Fudges.h"
#include "engine/pll/filter/PassFilter.h"
#include "engine/pll/Stages.h"

namespace Ip::Pll {

namespace {

// What is worth spending before the filter is made, in candidates that passes try. It is less than
// half of what its windows and its first chunk cost, and the ranking of each output after output 0:
// a pass takes a fraction of what it takes the plain search, so that even a request that the next
// pass would have solved is answered sooner than by that.
constexpr int kBudget = 120;
constexpr int kBudgetOfRankedOutput = 110;
// What a pass costs beside its candidates.
constexpr int kCostOfPass = 16;

// The passes to be run before the filter is made. Most fudges are so small that it would come too
// late. With a trace all passes run, since each has its lines.
int PassesBeforeFilter(const VorkelImp& imp, const Run& run) {
  if (run.trace.On()) return kPasses;
  const Div0Steps steps(HasIntegerDiv0(imp, run));
  const double outFreq0 = imp.requests.reqOutFreq[0];
  const int first = steps.FirstWorthTrying(outFreq0, imp.pll.minAdjVco);
  const int last = outFreq0 > 0.0 ? steps.Below(imp.pll.maxAdjVco / outFreq0) : 0;
  const int candidates = std::max(last - first + 1, 0);
  const int budget = kBudget + kBudgetOfRankedOutput * (run.count - 1);
  return 1 + budget / (2 * candidates + kCostOfPass);
}

}  // namespace

bool FudgeLoop(VorkelImp& imp, const Run& run) {
  const int beforeFilter = PassesBeforeFilter(imp, run);
  std::optional<PassFilter> filter;
  for (int pass = 0; pass < kPasses; ++pass) {
    if (pass >= beforeFilter) {
      if (!filter) filter.emplace(imp, run);
      pass = filter->NextFrom(pass);
      if (pass == kPasses) break;
    }
    if (SolverPass(imp, FudgeOf(pass), run)) return true;
    if (pass == 0 && !run.trace.On() && IsHopelessAtOnce(imp, run)) return false;
    TRACE(run.trace, "DLL- NO VALID VCOs found, so upping div0 fudge to %1.3f!\n",
          FudgeOf(pass + 1));
  }
  TRACE(run.trace, "DLL- NO VALID VCOs found for all possible div0 fudges!\n");
  return false;
}

}  // namespace Ip::Pll
