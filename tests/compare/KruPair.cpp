#include "tests/compare/KruPair.h"

#include <optional>

#include "tests/compare/Difference.h"
#include "tests/plain/plain_kru_clkgen.h"
#include "tests/engine/EngineTest.h"
#include "tests/support/CaptureTrace.h"
#include "tests/support/FakeHost.h"

namespace compare {

namespace {

constexpr const char* kPart = "kru";

// Where the limit of each keyword goes, in the order of kKruKeywords.
double plain::KruLimits::* const kFields[] = {
    &plain::KruLimits::clk0Max,   &plain::KruLimits::clk0Min,    &plain::KruLimits::clk0Max2x,
    &plain::KruLimits::clk90Max,  &plain::KruLimits::clk90Min,   &plain::KruLimits::clk90Max2x,
    &plain::KruLimits::clk2xMax,  &plain::KruLimits::clk2xMin,   &plain::KruLimits::clkdvMax,
    &plain::KruLimits::clkdvMin,  &plain::KruLimits::clkdvMax2x, &plain::KruLimits::clkfxMax,
    &plain::KruLimits::clkfxMin};

// True when a KRU_SP run of this request gets as far as reading its limits.
bool ReadsLimits(const KruCase& drawn) {
  const plain::KruRequest& request = drawn.request;
  double scratch[plain::kMaxOutputs];
  return !drawn.clkgen && request.inFreq != 0.0 &&
         plain::ParseList(request.outFreqs, request.numOut, plain::kKruOutputs, scratch) &&
         plain::ParseList(request.phases, request.numOut, plain::kKruOutputs, scratch);
}

// Gives the speed data to the product, and takes over what it reads of them.
void Publish(const KruCase& drawn, plain::KruLimits& limits) {
  FakeHost& host = FakeHost::Instance();
  auto& keys = host.devices[kPart];
  keys.clear();
  host.reads.clear();
  host.messages.clear();
  const bool read = ReadsLimits(drawn);
  for (std::size_t i = 0; i < kKruKeywords.size(); ++i) {
    if (!drawn.readable && i + 1 == kKruKeywords.size()) break;
    const double figure = FigureFor(drawn.periods[i]);
    keys[kKruKeywords[i]] = figure;
    if (read) limits.*kFields[i] = 1000.0 / (figure * 1e9);
  }
  limits.readable = drawn.readable;
}

}  // namespace

KruPair::KruPair() : imp_(engine_test::NewImp()) {
  FakeHost::Instance().devices[kPart];
  imp_.SetDevice(kPart);
}

std::string KruPair::CompareState(int code) const {
  Difference difference;
  difference.Ints("code", 0, code, code_);
  difference.Ints("m", 0, imp_.GetKruChosenM(), state_.m);
  difference.Ints("d", 0, imp_.GetKruChosenD(), state_.d);
  difference.Ints("divBy2", 0, imp_.GetKruChosenDivBy2(), state_.divBy2);
  difference.Ints("phaseShift", 0, imp_.GetKruChosenPhaseShift(), plain::KruPhaseShift(state_));
  difference.Doubles("phaseOffset", 0, imp_.GetKruChosenPhaseOffset(), state_.phaseOffset);
  difference.Doubles("clkdv", 0, imp_.GetKruChosenClkdv(), state_.clkdv);
  difference.Doubles("clkfxdv", 0, imp_.GetKruChosenClkfxdv(), state_.clkdv);
  for (int n = -1; n <= 7; ++n) {
    difference.Texts(imp_.GetKruChosenPinname(n).CStr(), plain::KruPinName(state_, n));
    for (const double inputFreq : {100.0, 33.333, 0.0, -7.0}) {
      difference.Doubles("outFreq", n, imp_.GetKruChosenOutFreqN(inputFreq, n),
                         plain::KruOutFreq(state_, inputFreq, n));
    }
  }
  for (int n = 0; n < plain::kMaxOutputs; ++n) {
    const auto slot = static_cast<std::size_t>(n);
    difference.Doubles("reqOutFreq", n, imp_.requests.reqOutFreq[slot], lists_.outFreq[n]);
    difference.Doubles("reqPhase", n, imp_.requests.reqPhase[slot], lists_.phase[n]);
  }
  return difference.Text();
}

std::string KruPair::FirstDifference(const KruCase& drawn) {
  Publish(drawn, limits_);
  const plain::KruRequest& r = drawn.request;
  plain::Trace trace(true);
  code_ = drawn.clkgen ? plain::SolveKruClkgen(r, limits_, lists_, state_, trace)
                       : plain::SolveKru(r, limits_, lists_, state_, trace);
  plainTrace_ = trace.Text();

  std::optional<CaptureTrace> capture(std::in_place);
  const int code =
      drawn.clkgen
          ? imp_.KruClkgenCalculateActuals(r.outFreqs.c_str(), r.phases.c_str(), r.inFreq,
                                           r.numOut, true)
          : imp_.KruCalculateActuals(r.outFreqs.c_str(), r.phases.c_str(), r.inFreq, r.numOut,
                                     r.feedbackUsed, true);
  const std::string lines = capture->Text();
  capture.reset();
  Difference difference;
  difference.Texts(lines, plainTrace_);
  return difference.Text().empty() ? CompareState(code) : difference.Text();
}

}  // namespace compare
