// The filter of the fudge loop: no pass that it leaves out would have succeeded.
//
// Every pass that the filter says "no" to is run by the plain search, for requests that a
// first pass has not answered.

#include "engine/pll/PassFilter.h"

#include <gtest/gtest.h>

#include <cstdlib>

#include "tests/compare/PllPair.h"
#include "tests/engine/EngineTest.h"
#include "tests/plain/plain_lists.h"

namespace compare {
namespace {

constexpr double kFudgeStep = 0.001;

struct Counts {
  int requests = 0;
  int hopeless = 0;
  long leftOut = 0;
  long run = 0;
};

// Compares `passes` passes of one request, if the first pass does not answer it. Returns false
// at the first pass that is wrongly left out.
bool CheckRequest(const Case& drawn, int passes, Ip::VorkelImp& imp, Counts& counts) {
  const plain::PllRequest& request = drawn.request;
  plain::PllLimits limits = PublishLimits(drawn.limits, request.prim);
  if (request.prim == plain::kPrimPll) limits.maxPfdLowB = imp.pllLimits._maxPfdLowB;

  plain::RequestLists lists;
  plain::PllState state;
  plain::Trace plainTrace(false);
  if (plain::PrepareVcoRange(request, limits, lists, state, plainTrace) != plain::kSolved) {
    return true;
  }
  imp.requests = Ip::Requests{};
  if (request.closest) {
    const int count = request.count;
    if (!imp.ParsePhases(count, request.phases.c_str()) ||
        !imp.ParseDutyCycles(count, request.dutyCycles.c_str())) {
      return true;
    }
    plain::ParseList(request.phases, count, plain::kMaxOutputs, lists.phase);
    plain::ParseList(request.dutyCycles, count, plain::kMaxOutputs, lists.dutyCycle);
  }

  const Ip::Trace trace(false);
  const Ip::Pll::Run run = {request.inFreq, request.count, request.prim, trace};
  imp.SetLowBandwidth(request.lowBandwidth);
  imp.pll._preferMaxVco = request.preferMaxVco;
  imp.pll._intDiv0Only = request.intDiv0Only;
  imp.pll._minPowerMode = !request.closest;
  EXPECT_EQ(PrepareVcoRange(imp, request.outFreqs.c_str(), request.inFreq2, run),
            Ip::Pll::kSolved);
  if (SolverPass(imp, 0.0, run)) return true;

  ++counts.requests;
  Ip::Pll::PassFilter filter(imp, run, kFudgeStep);
  if (filter.IsHopeless()) ++counts.hopeless;
  double fudge = 0.0;
  for (int pass = 0; pass < passes; ++pass) {
    fudge += kFudgeStep;
    if (!filter.IsHopeless() && filter.MaySucceed(fudge)) {
      ++counts.run;
      continue;
    }
    ++counts.leftOut;
    if (plain::SolverPass(fudge, request, limits, lists, state, plainTrace)) {
      ADD_FAILURE() << "left out the pass at " << fudge << " of " << Describe(drawn);
      return false;
    }
  }
  return true;
}

class PassFilterProperty : public testing::TestWithParam<Kind> {};

TEST_P(PassFilterProperty, LeavesOutNoPassThatSucceeds) {
  const bool longRun = std::getenv("VORKEL_TEST_LONG") != nullptr;
  const int requests = longRun ? 1500 : 250;
  const int passes = longRun ? 600 : 150;
  Ip::VorkelImp& imp = engine_test::NewImp();
  imp.SetDevice(kComparedPart);
  Counts counts;
  int wrong = 0;
  for (int i = 0; i < requests && wrong < 3; ++i) {
    Random random(static_cast<std::uint64_t>(GetParam()) * 7'000'003 + static_cast<unsigned>(i));
    const Case drawn = DrawCase(GetParam(), random);
    if (!drawn.limits.readable) continue;
    if (!CheckRequest(drawn, passes, imp, counts)) ++wrong;
  }
  std::printf("%d requests, %d hopeless; %ld passes left out, %ld to be run\n", counts.requests,
              counts.hopeless, counts.leftOut, counts.run);
  EXPECT_GT(counts.requests, 10);
  EXPECT_GT(counts.leftOut, counts.run);
}

INSTANTIATE_TEST_SUITE_P(Kinds, PassFilterProperty,
                         testing::Values(Kind::kCommon, Kind::kConstructed, Kind::kShifted,
                                         Kind::kRangeEnds, Kind::kInfeasible, Kind::kWild),
                         [](const testing::TestParamInfo<Kind>& parameter) {
                           return KindName(parameter.param);
                         });

}  // namespace
}  // namespace compare
