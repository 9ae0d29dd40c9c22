#include "tests/compare/PllPair.h"

#include <optional>

#include "tests/compare/Difference.h"
#include "tests/engine/EngineTest.h"
#include "tests/plain/plain_lists.h"
#include "tests/support/CaptureTrace.h"
#include "tests/support/FakeHost.h"

namespace compare {

plain::PllLimits PublishLimits(const plain::PllLimits& wanted, int prim) {
  FakeHost& host = FakeHost::Instance();
  host.devices[kComparedPart].clear();
  host.reads.clear();
  host.messages.clear();
  plain::PllLimits limits = wanted;
  auto asRead = [](double& value) { value = FigureFor(value) * 1e9; };
  for (double* value :
       {&limits.vcoMin, &limits.vcoMax, &limits.clkoutMin, &limits.clkoutMax, &limits.pfdMin,
        &limits.pfdMax, &limits.clkoutMaxIo, &limits.maxHighLowCount, &limits.vcoTarget,
        &limits.maxPfdLowB}) {
    asRead(*value);
  }
  if (!wanted.readable) return limits;
  if (prim == plain::kPrimPll) {
    SetPll(kComparedPart, {wanted.vcoMin, wanted.vcoMax, wanted.clkoutMin, wanted.clkoutMax,
                   wanted.pfdMin, wanted.pfdMax, wanted.maxHighLowCount, wanted.clkoutMaxIo});
  } else {
    SetTsyn(kComparedPart, {wanted.vcoMin, wanted.vcoMax, wanted.clkoutMin, wanted.clkoutMax,
                    wanted.pfdMin, wanted.pfdMax, wanted.vcoTarget, wanted.maxHighLowCount,
                    wanted.maxPfdLowB});
  }
  return limits;
}

bool GoesFar(const Case& drawn) {
  plain::RequestLists lists;
  plain::PllState state;
  plain::Trace trace(false);
  const int prepared =
      plain::PrepareVcoRange(drawn.request, drawn.limits, lists, state, trace);
  if (prepared != plain::kSolved) return false;
  if (drawn.request.closest) {
    plain::ParseList(drawn.request.phases, drawn.request.count, plain::kMaxOutputs, lists.phase);
    plain::ParseList(drawn.request.dutyCycles, drawn.request.count, plain::kMaxOutputs,
                     lists.dutyCycle);
  }
  double fudge = 0.0;
  for (int pass = 0; pass < 100; ++pass, fudge += 0.001) {
    if (plain::SolverPass(fudge, drawn.request, drawn.limits, lists, state, trace)) return false;
  }
  return true;
}

PllPair::PllPair() : imp_(engine_test::NewImp()) { imp_.SetDevice(kComparedPart); }

int PllPair::RunProduct(const plain::PllRequest& r, bool traced) {
  imp_.SetLowBandwidth(r.lowBandwidth);
  if (r.closest) {
    return imp_.GetClosestSolution(r.outFreqs.c_str(), r.phases.c_str(), r.dutyCycles.c_str(),
                                   r.inFreq, r.inFreq2, r.count, r.preferMaxVco, r.intDiv0Only,
                                   r.prim, traced);
  }
  return imp_.CalculateMinPowerOutFreqs(r.outFreqs.c_str(), r.inFreq, r.inFreq2, r.count,
                                        r.preferMaxVco, r.intDiv0Only, r.prim, traced);
}

std::string PllPair::CompareAnswers(int code) {
  Difference difference;
  difference.Ints("code", 0, code, answer_.code);
  difference.Doubles("vco", 0, imp_.GetChosenVCO(), answer_.vco);
  difference.Doubles("m", 0, imp_.GetChosenM(), answer_.m);
  difference.Ints("d", 0, imp_.GetChosenD(), answer_.d);
  difference.Doubles("div0", 0, imp_.GetChosenDiv0(), answer_.div0);
  for (int n = -1; n <= plain::kMaxOutputs; ++n) {
    const bool output = n >= 0 && n < plain::kMaxOutputs;
    difference.Ints("divN", n, imp_.GetChosenDivN(n), output ? answer_.divN[n] : 0);
    difference.Doubles("outFreq", n, imp_.GetChosenOutFreqN(n), output ? answer_.outFreq[n] : 0);
    difference.Doubles("phase", n, imp_.GetChosenPhaseN(n), output ? answer_.phase[n] : 0);
    difference.Doubles("dutyCycle", n, imp_.GetChosenDutyCycleN(n),
                       output ? answer_.dutyCycle[n] : 0);
    if (!output) continue;
    const auto slot = static_cast<std::size_t>(n);
    difference.Doubles("reqOutFreq", n, imp_.requests.reqOutFreq[slot], lists_.outFreq[n]);
    difference.Doubles("reqPhase", n, imp_.requests.reqPhase[slot], lists_.phase[n]);
    difference.Doubles("reqDutyCycle", n, imp_.requests.reqDutyCycle[slot], lists_.dutyCycle[n]);
  }
  return difference.Text();
}

std::string PllPair::FirstDifference(const Case& drawn, bool traced) {
  plain::PllLimits limits = PublishLimits(drawn.limits, drawn.request.prim);
  // A PLL run reads no low-bandwidth maximum and works with what an earlier TSYN run has read.
  if (drawn.request.prim == plain::kPrimPll) limits.maxPfdLowB = maxPfdLowB_;
  plain::Trace trace(traced);
  answer_ = plain::SolvePll(drawn.request, limits, lists_, trace);
  plainTrace_ = trace.Text();
  if (traced) {
    std::optional<CaptureTrace> capture(std::in_place);
    const int code = RunProduct(drawn.request, true);
    const std::string lines = capture->Text();
    capture.reset();
    Difference difference;
    difference.Texts(lines, trace.Text());
    if (!difference.Text().empty()) return difference.Text();
    if (std::string found = CompareAnswers(code); !found.empty()) return "traced " + found;
  }
  const std::string found = CompareAnswers(RunProduct(drawn.request, false));
  maxPfdLowB_ = imp_.pllLimits._maxPfdLowB;
  return found;
}

}  // namespace compare
