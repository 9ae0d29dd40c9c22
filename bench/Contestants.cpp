#include "bench/Contestants.h"

#include <cmath>

#include "tests/compare/PllPair.h"
#include "tests/support/FakeHost.h"

namespace bench {

Product::Product() : imp_(nullptr) {
  FakeHost::Instance().devices[compare::kComparedPart];
  imp_.SetDevice(compare::kComparedPart);
}

int Product::Run(const plain::PllRequest& r, bool traced) {
  FakeHost::Instance().reads.clear();  // else its log would grow from call to call
  imp_.SetLowBandwidth(r.lowBandwidth);
  if (r.closest) {
    return imp_.GetClosestSolution(r.outFreqs.c_str(), r.phases.c_str(), r.dutyCycles.c_str(),
                                   r.inFreq, r.inFreq2, r.count, r.preferMaxVco, r.intDiv0Only,
                                   r.prim, traced);
  }
  return imp_.CalculateMinPowerOutFreqs(r.outFreqs.c_str(), r.inFreq, r.inFreq2, r.count,
                                        r.preferMaxVco, r.intDiv0Only, r.prim, traced);
}

Outcome Product::Found(int code) const {
  if (imp_.pll.chosen == nullptr) return {code, 0.0};
  const Ip::Pll::VcoCandidate& chosen = *imp_.pll.chosen;
  return {code, std::fabs(chosen.vco / chosen.div0 - imp_.requests.reqOutFreq[0])};
}

int Plain::Run(const plain::PllRequest& request) {
  plain::Trace trace(false);
  answer_ = plain::SolvePll(request, limits_, lists_, trace);
  return answer_.code;
}

int Plain::RunTraced(const plain::PllRequest& request, std::size_t* characters) {
  plain::Trace trace(true);
  answer_ = plain::SolvePll(request, limits_, lists_, trace);
  *characters = trace.Text().size();
  return answer_.code;
}

}  // namespace bench
