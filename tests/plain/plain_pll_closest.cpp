// The choice by phases and duty cycles among several candidates of the plain PLL/TSYN solver.
//
// Gathers the candidates whose output 0 is close enough, widening the tolerance until there are
// some; drops those whose further outputs are not close enough; narrows the rest down output by
// output; lets the VCO frequency decide at last.

#include <cmath>
#include <functional>

#include "plain_numbers.h"
#include "plain_pll.h"
#include "plain_pll_stages.h"

namespace plain {
namespace {

constexpr int kAttempts = 60;
constexpr double kExactTolerance = 0.0001;
constexpr double kWorstDifference = 100.0;

using Slot = std::optional<std::size_t>;

const VcoCandidate& CandidateOf(const PllState& state, const Slot& solution) {
  return *state.candidates[*solution];
}

int GatherSolutions(double tolerance, PllState& state) {
  for (Slot& solution : state.solutions) solution.reset();
  if (tolerance == 0.0) tolerance = kExactTolerance;
  std::size_t gathered = 0;
  for (std::size_t k = 0; k < state.candidates.size(); ++k) {
    const std::optional<VcoCandidate>& candidate = state.candidates[k];
    if (!candidate || !candidate->Accepted()) continue;
    if (!(candidate->phaseDiff[0] <= tolerance && candidate->dutyDiff[0] <= tolerance)) continue;
    state.solutions[gathered] = k;
    ++gathered;
    if (gathered == state.solutions.size()) break;
  }
  return static_cast<int>(gathered);
}

// The tolerance of output 0 in the given attempt, from that of the attempt before.
double NextTolerance(int attempt, double previous) {
  switch (attempt) {
    case 0: return 0.0;
    case 1: return 0.001;
    case 2: return 0.01;
    case 3: return 0.1;
    case 4: return 0.5;
    default: return previous + 0.5;
  }
}

// The same of the further outputs, whose first attempt is wide: 0.5, 0.001, 0.01, 0.1, 0.5, 1 ...
double NextTolerance2(int attempt, double previous) {
  return attempt == 0 ? previous + 0.5 : NextTolerance(attempt, previous);
}

// Marks the solutions whose output n is within the tolerance. Returns how many there are.
int MarkClose(int n, double tolerance, const PllState& state, std::vector<bool>& marked) {
  marked.assign(state.solutions.size(), true);
  int close = 0;
  for (std::size_t i = 0; i < state.solutions.size(); ++i) {
    if (!state.solutions[i]) continue;
    const VcoCandidate& candidate = CandidateOf(state, state.solutions[i]);
    if (candidate.phaseDiff[n] > tolerance || candidate.dutyDiff[n] > tolerance) {
      marked[i] = false;
    } else {
      ++close;
    }
  }
  return close;
}

void DropUnmarked(const std::vector<bool>& marked, PllState& state) {
  for (std::size_t i = 0; i < state.solutions.size(); ++i) {
    if (!marked[i]) state.solutions[i].reset();
  }
}

void FilterByOutput(int n, PllState& state, Trace& trace) {
  double tolerance = 0.0;
  trace.Print("DLL-------- looking for clk%d phase solutions with threshold2 = %f\n", n, tolerance);
  std::vector<bool> marked;
  for (int attempt = 0; attempt < kAttempts; ++attempt) {
    tolerance = NextTolerance2(attempt, tolerance);
    const int close = MarkClose(n, tolerance, state, marked);
    if (close == 1) {
      trace.Print("DLL--------- only one exact solution left, so use it\n");
      break;
    }
    if (close > 1) {
      trace.Print("DLL--------- %d solutions for clk%d, so test other oclks\n", close, n);
      break;
    }
    trace.Print("DLL--------- no matches for clk%d, so try with higher threshold\n", n);
  }
  DropUnmarked(marked, state);
}

void ListSolutions(const PllState& state, Trace& trace) {
  for (std::size_t i = 0; i < state.solutions.size(); ++i) {
    if (!state.solutions[i]) continue;
    const VcoCandidate& candidate = CandidateOf(state, state.solutions[i]);
    trace.Print("DLL  _solutions[%d] VCO = %3.3f; clk0 phase = %3.3f, dc = %3.3f\n",
                static_cast<int>(i), candidate.vco, candidate.phase[0], candidate.dutyCycle[0]);
  }
}

// Marks the solutions whose value is the smallest, give or take the tolerance of what was smallest
// when their turn came. `best` is both where the walk starts and where it ended. Returns how many
// are marked.
int MarkBest(const std::function<double(const VcoCandidate&)>& value_of, double& best,
             const PllState& state, std::vector<bool>& marked) {
  marked.assign(state.solutions.size(), false);
  int count = 0;
  for (std::size_t i = 0; i < state.solutions.size(); ++i) {
    if (!state.solutions[i]) continue;
    const double x = value_of(CandidateOf(state, state.solutions[i]));
    if (Matches(x, best, kExactTolerance)) {
      marked[i] = true;
      ++count;
    } else if (x < best) {
      marked.assign(state.solutions.size(), false);
      marked[i] = true;
      count = 1;
      best = x;
    }
  }
  return count;
}

Slot MarkedSolution(const PllState& state, const std::vector<bool>& marked) {
  for (std::size_t i = 0; i < state.solutions.size(); ++i) {
    if (marked[i]) return state.solutions[i];
  }
  return std::nullopt;
}

// Narrows the solutions down by output n. Gives the solution when exactly one is best.
Slot NarrowByOutput(int n, PllState& state, Trace& trace) {
  trace.Print("DLL- narrowing down top choices for clk%d\n", n);
  std::vector<bool> marked;
  double best = kWorstDifference;

  if (n >= 1) {
    const int count =
        MarkBest([n](const VcoCandidate& c) { return c.freqDiff[n]; }, best, state, marked);
    if (count == 1) {
      trace.Print("DLL------ using the unique clk%d solution with the closest outFreq\n", n);
      return MarkedSolution(state, marked);
    }
    if (count == 0) return std::nullopt;
    trace.Print("DLL--------- have %d solutions after clk%d divN check\n", count, n);
    DropUnmarked(marked, state);
    ListSolutions(state, trace);
  }

  // `best` goes on from the frequencies: phases further off than the best frequency, number
  // against number, count as no match at all.
  int count = MarkBest([n](const VcoCandidate& c) { return c.phaseDiff[n]; }, best, state, marked);
  if (count == 1) {
    trace.Print("DLL------ using the unique clk%d solution with the closest phase\n", n);
    return MarkedSolution(state, marked);
  }
  if (count == 0) return std::nullopt;
  trace.Print("DLL------ have %d solutions after clk%d phase check\n", count, n);
  DropUnmarked(marked, state);
  ListSolutions(state, trace);

  best = kWorstDifference;
  count = MarkBest([n](const VcoCandidate& c) { return c.dutyDiff[n]; }, best, state, marked);
  if (count == 1) {
    trace.Print(
        "DLL------ using the unique clk%d solution with the closest phase and closest duty "
        "cycle\n",
        n);
    return MarkedSolution(state, marked);
  }
  if (count == 0) return std::nullopt;
  trace.Print("DLL------ have %d solutions after clk%d duty cycle check\n", count, n);
  DropUnmarked(marked, state);
  ListSolutions(state, trace);
  return std::nullopt;
}

Slot LargestVco(const PllState& state) {
  Slot chosen;
  double largest = 0.0;
  for (const Slot& solution : state.solutions) {
    if (!solution) continue;
    const double vco = CandidateOf(state, solution).vco;
    if (vco > largest) {
      largest = vco;
      chosen = solution;
    }
  }
  return chosen;
}

// The solution with the smallest value; the first of several equal ones.
Slot SmallestBy(const std::function<double(const VcoCandidate&)>& value_of,
                const PllState& state) {
  Slot chosen;
  double smallest = 0.0;
  for (const Slot& solution : state.solutions) {
    if (!solution) continue;
    const double value = value_of(CandidateOf(state, solution));
    if (!chosen || value < smallest) {
      smallest = value;
      chosen = solution;
    }
  }
  return chosen;
}

Slot ChooseFinally(const PllRequest& request, const PllLimits& limits, PllState& state,
                   Trace& trace) {
  trace.Print("DLL-------- looking for best clk0 solution\n");
  if (request.preferMaxVco) {
    trace.Print("DLL----------- finding the largest VCO\n");
    return LargestVco(state);
  }
  for (int n = 0; n < request.count; ++n) {
    const Slot unique = NarrowByOutput(n, state, trace);
    if (unique) return unique;
  }
  if (request.prim != kPrimTsyn) {
    trace.Print("DLL------------ finding the smallest VCO\n");
    return SmallestBy([](const VcoCandidate& c) { return c.vco; }, state);
  }
  const double target = limits.vcoTarget;
  trace.Print("DLL------------ finding the target VCO (closest to %3.3f)\n", target);
  return SmallestBy([target](const VcoCandidate& c) { return std::fabs(c.vco - target); }, state);
}

}  // namespace

std::optional<std::size_t> SelectPhaseSolution(const PllRequest& request, const PllLimits& limits,
                                               PllState& state, Trace& trace) {
  int gathered = 0;
  double tolerance = 0.0;
  for (int attempt = 0; attempt < kAttempts && gathered == 0; ++attempt) {
    tolerance = NextTolerance(attempt, tolerance);
    trace.Print("DLL---- looking for the clk0 phase solutions with threshold = %f\n", tolerance);
    gathered = GatherSolutions(tolerance, state);
    if (gathered == 1) {
      trace.Print("DLL------- only one exact solution for clk0, so use it\n");
      return state.solutions[0];
    }
    if (gathered == 0) {
      trace.Print("DLL------- no matches for clk0, so try with higher threshold\n");
    }
  }
  if (gathered == 0) return std::nullopt;

  if (request.count < 2) {
    trace.Print("DLL------- %d solutions for clk0; no other oclks used\n", gathered);
  } else {
    trace.Print("DLL------- %d solutions for clk0, so check other outclks\n", gathered);
  }
  for (int n = 1; n < request.count; ++n) FilterByOutput(n, state, trace);
  trace.Print("DLL------ Multiple solutions found, so pick the best for clk0.\n");
  ListSolutions(state, trace);
  return ChooseFinally(request, limits, state, trace);
}

}  // namespace plain
