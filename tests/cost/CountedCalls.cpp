#include "tests/cost/CountedCalls.h"

#include "tests/cost/Blocks.h"
#include "tests/cost/Device.h"
#include "tests/engine/EngineTest.h"

namespace cost {

CountedCalls::CountedCalls(const std::string& deviceFile)
    : path_(folder_.path()), imp_(engine_test::NewImp()) {
  folder_.Write(std::string(kName) + ".toml", deviceFile);
  imp_.SetDevice(kName);
}

std::uint64_t CountedCalls::WorkOf(const plain::PllRequest& r) {
  imp_.SetLowBandwidth(r.lowBandwidth);
  const std::uint64_t before = Blocks();
  if (r.closest) {
    imp_.GetClosestSolution(r.outFreqs.c_str(), r.phases.c_str(), r.dutyCycles.c_str(), r.inFreq,
                            r.inFreq2, r.count, r.preferMaxVco, r.intDiv0Only, r.prim, false);
  } else {
    imp_.CalculateMinPowerOutFreqs(r.outFreqs.c_str(), r.inFreq, r.inFreq2, r.count,
                                   r.preferMaxVco, r.intDiv0Only, r.prim, false);
  }
  return Blocks() - before;
}

std::uint64_t CountedCalls::WorkOf(const compare::KruCase& drawn) {
  const plain::KruRequest& r = drawn.request;
  const std::uint64_t before = Blocks();
  if (drawn.clkgen) {
    imp_.KruClkgenCalculateActuals(r.outFreqs.c_str(), r.phases.c_str(), r.inFreq, r.numOut, false);
  } else {
    imp_.KruCalculateActuals(r.outFreqs.c_str(), r.phases.c_str(), r.inFreq, r.numOut,
                             r.feedbackUsed, false);
  }
  return Blocks() - before;
}

}  // namespace cost
