// A pass of the search allocates nothing: all it works on stands in the implementation object, or
// is made once for a thread.
//
// The program has an allocator of its own, which counts.

#include <gtest/gtest.h>

#include <cstddef>
#include <new>
#include <ostream>
#include <string>
#include <vector>

#include "engine/pll/Stages.h"
#include "tests/engine/CountingAllocator.h"
#include "tests/engine/EngineTest.h"

namespace {

using Ip::Trace;
using Ip::VorkelImp;

constexpr int kTsyn = 0;
constexpr int kPll = 1;
constexpr double kFudgeStep = 0.001;  // MHz

// Frequencies in MHz, phases in degrees.
struct Request {
  const char* name;
  int prim;
  bool closest;
  double inFreq;
  std::vector<double> outFreqs;
  double phase;  // of output 0
};

void PrintTo(const Request& request, std::ostream* out) { *out << request.name; }

// An object that has read and worked out what a pass needs.
VorkelImp& Prepared(const Request& request) {
  VorkelImp& imp = engine_test::NewImp();
  const bool pll = request.prim == kPll;
  imp.pllLimits.vcoTarget = pll ? 0 : 1000;
  imp.pllLimits.clkoutMin = pll ? 3.125 : 4.6875;
  imp.pllLimits.clkoutMax = pll ? 400 : 800;
  imp.pllLimits.clkoutMaxIo = 1080;
  imp.pllLimits.pfdMin = pll ? 19 : 10;
  imp.pllLimits.pfdMax = 500;
  imp.pll.minAdjVco = pll ? 400 : 600;
  imp.pll.maxAdjVco = pll ? 1080 : 1440;
  imp.pll._minPowerMode = !request.closest;
  for (std::size_t n = 0; n < request.outFreqs.size(); ++n) {
    imp.requests.reqOutFreq[n] = request.outFreqs[n];
    imp.requests.reqDutyCycle[n] = 50;
  }
  imp.requests.reqPhase[0] = request.phase;
  imp.pll._vcoCandidates.EmptyAll();  // takes the records of the thread, which makes them once
  return imp;
}

class AllocationFreePass : public testing::TestWithParam<Request> {};

TEST_P(AllocationFreePass, AtAnyFudge) {
  constexpr int kPasses = 300;
  const Request& request = GetParam();
  VorkelImp& imp = Prepared(request);
  const Trace trace(false);
  const Ip::Pll::Run run = {request.inFreq, static_cast<int>(request.outFreqs.size()),
                            request.prim, trace};
  int chosen = 0;
  double fudge = 0.0;
  const std::size_t before = Allocations();
  for (int pass = 0; pass < kPasses; ++pass, fudge += kFudgeStep) {
    if (Ip::Pll::SolverPass(imp, fudge, run)) ++chosen;
  }
  const std::size_t made = Allocations() - before;
  EXPECT_EQ(made, 0u);
  // Passes that succeed and passes that fail are among them.
  EXPECT_GT(chosen, 0);
  EXPECT_LT(chosen, kPasses);
}

INSTANTIATE_TEST_SUITE_P(
    Requests, AllocationFreePass,
    testing::Values(Request{"PllOne", kPll, false, 100, {200}, 0},
                    Request{"PllOneClosest", kPll, true, 100, {200}, 90},
                    Request{"PllSeven", kPll, false, 50, {200, 100, 50, 25, 40, 80, 10}, 0},
                    Request{"PllSevenClosest", kPll, true, 50, {200, 100, 50, 25, 40, 80, 10}, 90},
                    Request{"TsynOne", kTsyn, false, 25, {300}, 0},
                    Request{"TsynOneClosest", kTsyn, true, 25, {300}, 45},
                    Request{"TsynThree", kTsyn, false, 19.2, {80, 50, 333}, 0},
                    Request{"TsynThreeClosest", kTsyn, true, 19.2, {80, 50, 333}, 90},
                    Request{"TsynSeven", kTsyn, false, 50, {200, 100, 50, 25, 40, 80, 10}, 0},
                    Request{"TsynSevenClosest", kTsyn, true, 50, {200, 100, 50, 25, 40, 80, 10},
                            90}),
    [](const testing::TestParamInfo<Request>& parameter) {
      return std::string(parameter.param.name);
    });

// The widest table: a low frequency and steps of 1/8 make 600 candidates. Dozens of them have an
// M and a D, so that the choice by phases has something to choose from.
TEST(AllocationFreeTable, WithHundredsOfCandidates) {
  for (const bool closest : {false, true}) {
    const Request request = {"", kTsyn, closest, 100, {11.25}, 90};
    VorkelImp& imp = Prepared(request);
    const Trace trace(false);
    const Ip::Pll::Run run = {request.inFreq, 1, kTsyn, trace};
    const std::size_t before = Allocations();
    const int candidates =
        Ip::Pll::EnumerateVcoCandidates(imp, request.outFreqs[0], 0.0, Ip::Pll::Div0Steps(false), trace);
    const bool chosen = Ip::Pll::SolverPass(imp, 0.0, run);
    EXPECT_EQ(Allocations() - before, 0u);
    EXPECT_TRUE(chosen);
    EXPECT_GT(candidates, 500);
    // For the smallest VCO, two tell which one it is.
    EXPECT_GT(imp.pll._vcoCandidates.Occupied().Count(), closest ? 12 : 1);
  }
}

// Around the passes, a call makes its lists of VCO windows, and those only.
TEST(AllocationsOfACall, DoNotGrowWithItsPasses) {
  const Request request = {"", kTsyn, false, 19.2, {12, 155.52, 40}, 0};
  VorkelImp& imp = Prepared(request);
  const Trace trace(false);
  const std::size_t before = Allocations();
  const bool chosen = Ip::Pll::FudgeLoop(imp, {request.inFreq, 3, kTsyn, trace});
  const std::size_t made = Allocations() - before;
  EXPECT_FALSE(chosen);  // after 22000 attempts
  EXPECT_GT(made, 0u);
  EXPECT_LT(made, 100u);
}

// Without this, the tests above could pass because nothing is counted.
TEST(CountingAllocator, SeesEveryForm) {
  struct alignas(64) Aligned {
    char bytes[64];
  };
  const std::size_t before = Allocations();
  // Called by name: an expression may be left out by the compiler, and a call may not.
  ::operator delete(::operator new(8));
  ::operator delete[](::operator new[](8));
  ::operator delete(::operator new(8, std::nothrow), std::nothrow);
  ::operator delete(::operator new(sizeof(Aligned), std::align_val_t(alignof(Aligned))),
                    std::align_val_t(alignof(Aligned)));
  EXPECT_EQ(Allocations() - before, 4u);
  std::string text(1000, 'x');
  EXPECT_EQ(Allocations() - before, 5u) << text;
}

}  // namespace
