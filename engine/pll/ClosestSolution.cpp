// The choice of the closest-solution mode: the candidate whose phases and duty cycles come
// closest to the request.
//
//   Gather      candidates close to the request on output 0, within a tolerance that widens
//   Filter      output by output, those close to the request there, likewise
//   Narrow      output by output, those that are best in frequency, phase, duty cycle
//   by VCO      largest, smallest or closest to the target
//
// One number serves as tolerance of phases, in degrees, and of duty cycles, as a fraction.
//
// Tested by closest_solution_test.cpp.

#include <algorithm>
#include <cmath>
#include <cstddef>
#include <limits>

#include "engine/pll/Stages.h"

namespace Ip::Pll {

namespace {

using Slots = SolutionTable::Slots;

constexpr int kAttempts = 60;
constexpr double kToleranceStep = 0.5;
constexpr double kZeroTolerance = 0.0001;  // what a gathering tolerance of 0 stands for
constexpr double kSame = 0.0001;           // values of a narrowing pass this close are one
constexpr double kInfinity = std::numeric_limits<double>::infinity();
constexpr double kNarrowingStart = 100.0;  // best value before a pass; degrees, MHz, fraction

// The tolerance of an attempt, given that of the attempt before: both schedules have these
// four fixed entries and otherwise grow by steps.
constexpr double NextTolerance(int attempt, double previous) {
  switch (attempt) {
    case 1: return 0.001;
    case 2: return 0.01;
    case 3: return 0.1;
    case 4: return 0.5;
    default: return previous + kToleranceStep;
  }
}

constexpr double LastTolerance() {
  double tolerance = 0.0;
  for (int attempt = 1; attempt < kAttempts; ++attempt) {
    tolerance = NextTolerance(attempt, tolerance);
  }
  return tolerance;
}
static_assert(LastTolerance() == kWidestTolerance);

// The tolerance from which on a candidate is close on an output. A difference that is no number
// counts as `ofNan`.
double ToleranceFor(const VcoCandidate& candidate, std::size_t output, double ofNan) {
  const double phase = candidate.phaseDiff[output];
  const double duty = candidate.dutyDiff[output];
  return std::max(std::isnan(phase) ? ofNan : phase, std::isnan(duty) ? ofNan : duty);
}

// Fills _solutions, in slot order and as far as it goes, with the candidates within the
// tolerance on output 0.
int Gather(PllState& pll, double tolerance) {
  int gathered = 0;
  for (const int slot : pll._vcoCandidates.Occupied()) {
    VcoCandidate& candidate = pll._vcoCandidates[slot];
    if (!(candidate.phaseDiff[0] <= tolerance && candidate.dutyDiff[0] <= tolerance)) continue;
    pll._solutions.Put(gathered, &candidate);
    if (++gathered == SolutionTable::MAX_SOLUTIONS) break;
  }
  return gathered;
}

// Keeps the solutions within a tolerance on output n. The first attempt already works with
// one step and the second starts over with the fixed entries; that is meant so.
void FilterByOutput(SolutionTable& solutions, int n, const Trace& trace) {
  const auto output = static_cast<std::size_t>(n);
  double enough = kInfinity;
  for (const int slot : solutions.Occupied()) {
    enough = std::min(enough, ToleranceFor(*solutions[slot], output, 0.0));
  }
  double tolerance = 0.0;
  TRACE(trace, "DLL-------- looking for clk%d phase solutions with threshold2 = %f\n", n,
        tolerance);
  Slots kept;
  for (int attempt = 0; attempt < kAttempts; ++attempt) {
    tolerance = NextTolerance(attempt, tolerance);
    if (enough > tolerance) {
      TRACE(trace, "DLL--------- no matches for clk%d, so try with higher threshold\n", n);
      continue;
    }
    kept = solutions.Occupied();
    for (const int slot : solutions.Occupied()) {
      const VcoCandidate& solution = *solutions[slot];
      if (solution.phaseDiff[output] > tolerance || solution.dutyDiff[output] > tolerance) {
        kept.Erase(slot);
      }
    }
    const int count = kept.Count();
    if (count == 1) {
      TRACE(trace, "DLL--------- only one exact solution left, so use it\n");
    } else {
      TRACE(trace, "DLL--------- %d solutions for clk%d, so test other oclks\n", count, n);
    }
    break;
  }
  solutions.KeepOnly(kept);
}

void TraceSolutions(const SolutionTable& solutions, const Trace& trace) {
  if (!trace.On()) return;
  for (const int slot : solutions.Occupied()) {
    const VcoCandidate& solution = *solutions[slot];
    trace.Print("DLL  _solutions[%d] VCO = %3.3f; clk0 phase = %3.3f, dc = %3.3f\n", slot,
                solution.vco, solution.phase[0], solution.dutyCycle[0]);
  }
}

// The solutions whose value is best, or as good as the best. `best` is the value to beat and
// then the one found.
Slots MarkBest(const SolutionTable& solutions, double (*value)(const VcoCandidate&, int), int n,
               double* best) {
  Slots marked;
  for (const int slot : solutions.Occupied()) {
    const double x = value(*solutions[slot], n);
    if (x == *best || (x >= *best - kSame && x <= *best + kSame)) {
      marked.Insert(slot);
    } else if (x < *best) {
      marked.Clear();
      marked.Insert(slot);
      *best = x;
    }
  }
  return marked;
}

double FreqDiff(const VcoCandidate& c, int n) { return c.freqDiff[static_cast<std::size_t>(n)]; }
double PhaseDiff(const VcoCandidate& c, int n) { return c.phaseDiff[static_cast<std::size_t>(n)]; }
double DutyDiff(const VcoCandidate& c, int n) { return c.dutyDiff[static_cast<std::size_t>(n)]; }

// A pass of a narrowing: what it looks at, and the words of its trace lines.
struct Pass {
  double (*value)(const VcoCandidate&, int n);
  const char* closest;
  const char* dashes;
  const char* check;
};

constexpr Pass kFrequencyPass = {FreqDiff, "outFreq", "---------", "divN"};
constexpr Pass kPhasePass = {PhaseDiff, "phase", "------", "phase"};
constexpr Pass kDutyPass = {DutyDiff, "phase and closest duty cycle", "------", "duty cycle"};

// Keeps the solutions that are best in one respect and counts them; none are dropped when no
// solution comes up to `best`.
int NarrowBy(const Pass& pass, SolutionTable& solutions, int n, double* best,
             const Trace& trace) {
  const Slots marked = MarkBest(solutions, pass.value, n, best);
  const int count = marked.Count();
  if (count == 0) return 0;
  solutions.KeepOnly(marked);
  if (count == 1) {
    TRACE(trace, "DLL------ using the unique clk%d solution with the closest %s\n", n,
          pass.closest);
  } else {
    TRACE(trace, "DLL%s have %d solutions after clk%d %s check\n", pass.dashes, count, n,
          pass.check);
    TraceSolutions(solutions, trace);
  }
  return count;
}

const VcoCandidate* First(const SolutionTable& solutions) {
  return solutions[*solutions.Occupied().begin()];
}

// Drops what is not best on output n. Returns the one solution left, or null when several
// are, or when a pass finds none.
const VcoCandidate* Narrow(SolutionTable& solutions, int n, const Trace& trace) {
  TRACE(trace, "DLL- narrowing down top choices for clk%d\n", n);
  double best = kNarrowingStart;
  if (n >= 1) {
    const int count = NarrowBy(kFrequencyPass, solutions, n, &best, trace);
    if (count == 0) return nullptr;
    if (count == 1) return First(solutions);
  }
  // The phase pass goes on from the best frequency difference as if it were one of phases.
  // That is meant so, and means that it may find nothing.
  for (const Pass& pass : {kPhasePass, kDutyPass}) {
    const int count = NarrowBy(pass, solutions, n, &best, trace);
    if (count == 0) return nullptr;
    if (count == 1) return First(solutions);
    best = kNarrowingStart;
  }
  return nullptr;
}

const VcoCandidate* LargestVco(const SolutionTable& solutions) {
  const VcoCandidate* largest = nullptr;
  double largestVco = 0.0;
  for (const int slot : solutions.Occupied()) {
    if (solutions[slot]->vco > largestVco) {
      largest = solutions[slot];
      largestVco = largest->vco;
    }
  }
  return largest;
}

// The solution with the smallest `measure`; the first of several, null when there is none.
template <typename Measure>
const VcoCandidate* Smallest(const SolutionTable& solutions, Measure measure) {
  const VcoCandidate* smallest = nullptr;
  for (const int slot : solutions.Occupied()) {
    if (smallest == nullptr || measure(*solutions[slot]) < measure(*smallest)) {
      smallest = solutions[slot];
    }
  }
  return smallest;
}

const VcoCandidate* FinalChoice(VorkelImp& imp, const Run& run) {
  SolutionTable& solutions = imp.pll._solutions;
  TRACE(run.trace, "DLL-------- looking for best clk0 solution\n");
  if (imp.pll._preferMaxVco) {
    TRACE(run.trace, "DLL----------- finding the largest VCO\n");
    return LargestVco(solutions);
  }
  for (int n = 0; n < run.count; ++n) {
    if (const VcoCandidate* unique = Narrow(solutions, n, run.trace)) return unique;
  }
  if (run.prim != kTsyn) {
    TRACE(run.trace, "DLL------------ finding the smallest VCO\n");
    return Smallest(solutions, [](const VcoCandidate& c) { return c.vco; });
  }
  const double target = imp.pllLimits.vcoTarget;
  TRACE(run.trace, "DLL------------ finding the target VCO (closest to %3.3f)\n", target);
  return Smallest(solutions,
                  [target](const VcoCandidate& c) { return std::fabs(c.vco - target); });
}

// Gathers with widening tolerance until there is a solution; their number. The candidates are
// looked at once for the tolerance that is enough, and not at each of those that are not.
int GatherFirst(PllState& pll, const Trace& trace) {
  double enough = kInfinity;
  for (const int slot : pll._vcoCandidates.Occupied()) {
    enough = std::min(enough, ToleranceFor(pll._vcoCandidates[slot], 0, kInfinity));
  }
  pll._solutions.EmptyAll();
  double tolerance = 0.0;
  for (int attempt = 0; attempt < kAttempts; ++attempt) {
    if (attempt > 0) tolerance = NextTolerance(attempt, tolerance);
    TRACE(trace, "DLL---- looking for the clk0 phase solutions with threshold = %f\n",
          tolerance);
    const double used = tolerance == 0.0 ? kZeroTolerance : tolerance;
    if (enough <= used) return Gather(pll, used);
    TRACE(trace, "DLL------- no matches for clk0, so try with higher threshold\n");
  }
  return 0;
}

}  // namespace

const VcoCandidate* SelectPhaseSolution(VorkelImp& imp, const Run& run) {
  SolutionTable& solutions = imp.pll._solutions;
  const int gathered = GatherFirst(imp.pll, run.trace);
  if (gathered == 0) return nullptr;
  if (gathered == 1) {
    TRACE(run.trace, "DLL------- only one exact solution for clk0, so use it\n");
    return First(solutions);
  }
  if (run.count < 2) {
    TRACE(run.trace, "DLL------- %d solutions for clk0; no other oclks used\n", gathered);
  } else {
    TRACE(run.trace, "DLL------- %d solutions for clk0, so check other outclks\n", gathered);
  }
  for (int n = 1; n < run.count; ++n) FilterByOutput(solutions, n, run.trace);
  TRACE(run.trace, "DLL------ Multiple solutions found, so pick the best for clk0.\n");
  TraceSolutions(solutions, run.trace);
  return FinalChoice(imp, run);
}

}  // namespace Ip::Pll
