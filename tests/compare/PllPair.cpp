#include "tests/compare/PllPair.h"

#include <bit>
#include <cstdint>
#include <cstdio>
#include <optional>

#include "tests/support/CaptureTrace.h"
#include "tests/support/FakeHost.h"

namespace compare {

namespace {

constexpr const char* kPart = "dut";

// Gives the limits to the product as speed data, and takes them over as it reads them.
plain::PllLimits Publish(const plain::PllLimits& wanted, int prim) {
  FakeHost& host = FakeHost::Instance();
  host.devices[kPart].clear();
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
    SetPll(kPart, {wanted.vcoMin, wanted.vcoMax, wanted.clkoutMin, wanted.clkoutMax,
                   wanted.pfdMin, wanted.pfdMax, wanted.maxHighLowCount, wanted.clkoutMaxIo});
  } else {
    SetTsyn(kPart, {wanted.vcoMin, wanted.vcoMax, wanted.clkoutMin, wanted.clkoutMax,
                    wanted.pfdMin, wanted.pfdMax, wanted.vcoTarget, wanted.maxHighLowCount,
                    wanted.maxPfdLowB});
  }
  return limits;
}

// Collects the first difference.
class Difference {
 public:
  void Doubles(const char* name, int n, double product, double plainValue) {
    if (std::bit_cast<std::uint64_t>(product) == std::bit_cast<std::uint64_t>(plainValue)) return;
    char line[200];
    std::snprintf(line, sizeof line, "%s[%d]: product %.17g, plain %.17g", name, n, product,
                  plainValue);
    Set(line);
  }
  void Ints(const char* name, int n, int product, int plainValue) {
    if (product == plainValue) return;
    char line[200];
    std::snprintf(line, sizeof line, "%s[%d]: product %d, plain %d", name, n, product,
                  plainValue);
    Set(line);
  }
  // Two texts; names the first line that differs.
  void Texts(const std::string& product, const std::string& plainText) {
    if (product == plainText) return;
    std::size_t at = 0;
    while (at < product.size() && at < plainText.size() && product[at] == plainText[at]) ++at;
    const std::size_t line = at == 0 ? 0 : product.rfind('\n', at - 1) + 1;
    auto lineOf = [line](const std::string& text) {
      return text.substr(line, text.find('\n', line) - line);
    };
    Set("trace: product \"" + lineOf(product) + "\", plain \"" + lineOf(plainText) + "\"");
  }
  const std::string& Text() const { return text_; }

 private:
  void Set(const std::string& text) {
    if (text_.empty()) text_ = text;
  }
  std::string text_;
};

}  // namespace

PllPair::PllPair() : imp_(nullptr) { imp_.SetDevice(kPart); }

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
  plain::PllLimits limits = Publish(drawn.limits, drawn.request.prim);
  // A PLL run reads no low-bandwidth maximum and works with what an earlier TSYN run has read.
  if (drawn.request.prim == plain::kPrimPll) limits.maxPfdLowB = maxPfdLowB_;
  plain::Trace trace(traced);
  answer_ = plain::SolvePll(drawn.request, limits, lists_, trace);
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
